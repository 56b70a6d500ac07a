// Starting, stopping, pausing and resuming a player, waiting for it, moving
// its read position and changing its device.
#include <algorithm>
#include <cstdint>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "sound/player_internal.hpp"

namespace velm::play {

namespace {

// Where reading begins, and the matching position bookkeeping.
void place_start(Player *p)
{
    if (p->fixedRange()) {
        p->basePosition = p->rangeBegin;
    } else if (p->blocks) {
        p->basePosition = p->blocks->begin;
    } else if (p->doc && p->requestedPosition < 0) {
        const int64_t start = start_position(p);
        p->requestedPosition = p->readPosition = p->basePosition = start;
        if (p->movesCursors()) VELMAUDIO_UpdatePlayCursorPosition(p->doc, start);
    } else if (p->requestedPosition >= 0) {
        p->readPosition = p->basePosition = p->requestedPosition;
    }
    p->playCursor = p->basePosition;
    // Reading starts where decided above; an earlier cursor move is no
    // longer news for the follow-cursor rule.
    if (p->doc && VELMAUDIO_CursorPositionChanged(p->doc)) VELMAUDIO_GetCursorChangedPosition(p->doc);
}

bool open_stream(Player *p)
{
    p->stream = VELMSOUND_OpenPlayback(p->device, static_cast<float>(p->deviceBufferTime), buffer_callback, p,
                                       &p->outputFormat);
    if (!p->stream) return false;
    p->status = VELMPLAY_STATUS_OPENED;
    return VELMSOUND_Start(p->stream) != 0;
}

bool path_fits_device(const Player *p)
{
    return p->last->format.sampleRate == p->outputFormat.sampleRate &&
           p->last->format.numChannels == p->outputFormat.numChannels;
}

// Whether the shell lets the step go ahead: false when a handler refused,
// or destroyed the player meanwhile.
bool agreed(Player *p, uint32_t event)
{
    const VELMPLAYER handle = to_handle(p);
    if (!p->announces()) return true;
    return announce(p, event, handle, nullptr) && live(handle);
}

int move_to(Player *p, int64_t requested)
{
    if (!p->doc) return 0;
    const int64_t low = VELMAUDIO_ViewBeginLimit(p->doc), high = VELMAUDIO_ViewEndLimit(p->doc);
    std::lock_guard guard(p->lock);
    p->requestedPosition = std::clamp(requested, low, std::max(low, high));
    return 1;
}

} // namespace

} // namespace velm::play

using namespace velm::play;

int VELMPLAY_Start(VELMPLAYER handle)
{
    Player *p = live(handle);
    if (!p || p->stream) return 0;
    if (p->status != VELMPLAY_STATUS_CREATED && p->status != VELMPLAY_STATUS_FAILED) return 0;
    const char *name = BLSETTINGS_GetStringEx(nullptr, "libvelm.playback.devicename=[%s]", "default");
    _audio_format format = p->last->format;
    format.bitsPerSample = 16;
    VELMSOUNDDEVICE device = VELMSOUND_SelectPlaybackDevice(VELMSOUND_GetSoundDeviceByName(name, 0), &format);
    if (!device) {
        p->status = VELMPLAY_STATUS_FAILED;
        return 0;
    }
    if (!agreed(p, VELMPLAY_NOTIFY_START)) return 0;
    p->device = device;
    p->outputFormat = format;
    rebuild_path(p);
    if (!path_fits_device(p)) {
        p->status = VELMPLAY_STATUS_FAILED;
        return 0;
    }
    place_start(p);
    p->jumpMarks.clear();
    p->cursorAtStart = p->doc ? VELMAUDIO_GetCursorPosition(p->doc) : 0;
    refresh_view(p);
    if (!open_stream(p)) {
        p->status = VELMPLAY_STATUS_FAILED;
        return 0;
    }
    start_update_timer(p);
    p->status = VELMPLAY_STATUS_PLAYING;
    return 1;
}

int VELMPLAY_Stop(VELMPLAYER handle)
{
    Player *p = live(handle);
    if (!p || !p->stream) return 0;
    if (p->status != VELMPLAY_STATUS_PLAYING && p->status != VELMPLAY_STATUS_OPENED) return 0;
    if (!agreed(p, VELMPLAY_NOTIFY_STOP)) return 0;
    if (p->movesCursors() && p->moveCursorOnStop && VELMAUDIO_GetCursorPosition(p->doc) == p->cursorAtStart)
        VELMAUDIO_SetCursorPosition(p->doc, position(p));
    // A handler of the cursor's move may have ended the player already.
    if (!live(handle)) return 1;
    VELMSOUND_Stop(p->stream);
    p->status = VELMPLAY_STATUS_STOPPED;
    return 1;
}

int VELMPLAY_Pause(VELMPLAYER handle)
{
    Player *p = live(handle);
    if (!p || p->status != VELMPLAY_STATUS_PLAYING) return 0;
    if (!agreed(p, VELMPLAY_NOTIFY_PAUSE)) return 0;
    if (!VELMSOUND_Pause(p->stream)) return 0;
    p->status = VELMPLAY_STATUS_OPENED;
    return 1;
}

int VELMPLAY_Resume(VELMPLAYER handle)
{
    Player *p = live(handle);
    if (!p || p->status != VELMPLAY_STATUS_OPENED || !p->stream) return 0;
    if (!agreed(p, VELMPLAY_NOTIFY_RESUME)) return 0;
    if (!VELMSOUND_Start(p->stream)) return 0;
    p->status = VELMPLAY_STATUS_PLAYING;
    return 1;
}

int VELMPLAY_Wait(VELMPLAYER handle)
{
    Player *p = live(handle);
    if (!p || !p->doc || !p->stream) return 0;
    if (p->movesCursors()) VELMAUDIO_ShowPlayCursor(p->doc);
    kill_update_timer(p);
    // The update destroys the player once the stream has ended; from then
    // on only the handle's liveness is asked.
    while (Player *q = live(handle)) {
        BLUTILS_sleep_msec(100);
        if (!q->updateCallback || !q->updateCallback(q->updateUser)) break;
    }
    return 1;
}

int VELMPLAY_Goto(VELMPLAYER handle, int64_t position)
{
    Player *p = live(handle);
    return p ? move_to(p, position) : 0;
}

int VELMPLAY_Offset(VELMPLAYER handle, int64_t delta)
{
    Player *p = live(handle);
    if (!p) return 0;
    int64_t from;
    {
        std::lock_guard guard(p->lock);
        from = p->requestedPosition >= 0 ? p->requestedPosition : p->readPosition;
    }
    // An offset past either end lands on it rather than wrapping around.
    int64_t to = 0;
    if (__builtin_add_overflow(from, delta, &to)) to = delta > 0 ? INT64_MAX : INT64_MIN;
    return move_to(p, to);
}

int VELMPLAY_ChangeDevice(VELMPLAYER handle, const char *device_name)
{
    Player *p = live(handle);
    if (!p || !device_name || !p->stream) return 0;
    // Only a running or paused player moves: a stopped one is never restarted.
    if (p->status != VELMPLAY_STATUS_PLAYING && p->status != VELMPLAY_STATUS_OPENED) return 0;
    _audio_format format = p->effect.valid ? p->effect.format : p->source.format;
    format.bitsPerSample = 16;
    VELMSOUNDDEVICE device = VELMSOUND_SelectPlaybackDevice(VELMSOUND_GetSoundDeviceByName(device_name, 0), &format);
    if (!device) return 0;
    if (device == p->device) return 1;
    const bool paused = p->status == VELMPLAY_STATUS_OPENED;
    if (!paused) VELMSOUND_Pause(p->stream);
    VELMSOUND_Stop(p->stream);
    VELMSOUND_Close(p->stream);
    p->stream = nullptr;
    {
        // The device thread is gone; start counting afresh from what was read.
        std::lock_guard guard(p->lock);
        p->pendingJump = -1;
        p->framesDelivered = p->baseFrames = p->framesAtChange = 0;
        const int64_t from = p->blocks ? p->blocks->current : p->readPosition;
        p->requestedPosition = p->basePosition = p->playCursor = from;
        p->jumpMarks.clear();
        p->device = device;
        p->outputFormat = format;
        rebuild_path(p);
        for (Stage *s = &p->source; s; s = s->next) s->fill = 0;
    }
    if (!path_fits_device(p) || !open_stream(p)) {
        p->status = VELMPLAY_STATUS_FAILED;
        return 0;
    }
    if (paused) {
        VELMSOUND_Pause(p->stream);
        p->status = VELMPLAY_STATUS_OPENED;
    } else {
        p->status = VELMPLAY_STATUS_PLAYING;
    }
    return 1;
}
