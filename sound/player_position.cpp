// The position being heard, and the 33 ms update that moves the document's
// play cursor, applies the stop rules and tells the shell.
#include <algorithm>
#include <cmath>

#include "control/velmcontrol.h"
#include "core/velmnavigation.h"
#include "sound/player_internal.hpp"

namespace velm::play {

namespace {

constexpr uint32_t kUpdateInterval = 33;

// Once the position lies well inside the view and the user leaves the view
// alone, playback from the view begin stops at the view's right edge.
void apply_stop_rules(Player *p, int64_t at)
{
    const int64_t view_begin = VELMAUDIO_ViewBegin(p->doc), view_end = VELMAUDIO_ViewEnd(p->doc);
    if (p->stopMode == 1 && at > view_end) {
        VELMPLAY_Stop(to_handle(p));
    } else if (p->stopMode == 2 && at <= view_end && at >= view_begin + (view_end - view_begin) / 10 &&
               !VELMAUDIO_IsInteracting(p->doc)) {
        p->stopMode = 1;
    }
}

} // namespace

int64_t position(Player *p)
{
    int64_t frames = std::max<int64_t>(VELMSOUND_PlayCursorPosition(p->stream), 0);
    std::lock_guard guard(p->lock);
    // From the device's frames back to the source's, through each effect.
    const Stage *stages[] = {&p->conversion, &p->effect};
    for (const Stage *s : stages)
        if (s->valid && s->effect) frames = std::max<int64_t>(AUDIOFX_MapOutputToInput(s->effect, frames), 0);
    while (!p->jumpMarks.empty() && frames > p->jumpMarks.front().frames) {
        const JumpMark &mark = p->jumpMarks.front();
        p->basePosition = mark.basePosition;
        p->baseFrames = mark.baseFrames;
        p->displaySpeed = mark.speed;
        p->jumpMarks.pop();
    }
    int64_t at = std::llround(static_cast<double>(frames - p->baseFrames) * p->displaySpeed) + p->basePosition;
    if (p->rangeBegin <= p->rangeEnd) at = std::clamp(at, p->rangeBegin, p->rangeEnd);
    return at;
}

int update(Player *p, bool *destroyed)
{
    *destroyed = false;
    if (p->updateBusy) return 1;
    const VELMPLAYER handle = to_handle(p);
    if (p->status == VELMPLAY_STATUS_STOPPED || !VELMSOUND_IsPlaying(p->stream)) {
        p->status = VELMPLAY_STATUS_STOPPED;
        VELMPLAY_DestroyPlayer(handle);
        *destroyed = true;
        return 1;
    }
    p->updateBusy = true;
    refresh_view(p);
    // The device goes on counting the silence after the end: the position
    // stays within what is played.
    int64_t at = position(p);
    // Handlers of what follows may destroy the player; it is not touched
    // after that.
    if (p->movesCursors()) {
        VELMAUDIO doc = p->doc;
        VELMAUDIO_ShowPlayCursor(doc);
        VELMAUDIO_UpdatePlayCursorPosition(doc, at);
        if (live(handle)) apply_stop_rules(p, at);
    }
    int result = 1;
    if (live(handle) && p->notifies()) result = announce(p, VELMPLAY_NOTIFY_POSITION, &at, handle);
    if (!live(handle)) {
        *destroyed = true;
        return result;
    }
    p->updateBusy = false;
    return result;
}

int update_callback(void *user)
{
    Player *p = live(static_cast<VELMPLAYER>(user));
    bool destroyed = false;
    return p ? update(p, &destroyed) : 0;
}

namespace {

int timer_tick(void *user)
{
    Player *p = live(static_cast<VELMPLAYER>(user));
    return p && p->updateCallback ? p->updateCallback(p->updateUser) : 0;
}

} // namespace

bool start_update_timer(Player *p)
{
    if (!p->updateCallback) return false;
    if (!p->updateTimer) p->updateTimer = VELMTIMER_CreateTimer(kUpdateInterval, timer_tick, p);
    return p->updateTimer != nullptr;
}

void kill_update_timer(Player *p)
{
    if (p->updateTimer) VELMTIMER_KillTimer(p->updateTimer);
    p->updateTimer = nullptr;
}

} // namespace velm::play

using namespace velm::play;

int64_t VELMPLAY_PlayPosition(VELMPLAYER handle)
{
    Player *p = live(handle);
    return p ? position(p) : -1;
}
