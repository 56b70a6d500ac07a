// The play cursor as the view shows it, and the mute indicators of the
// channel displays.
#include <algorithm>
#include <cstdlib>

#include "control/velmcontrol.h"
#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "outside/signal/audiosignal.h"
#include "render/view/velmdraw.h"
#include "sound/velmplay.h"

namespace {

bool loaded(VELMAUDIO doc)
{
    return doc && doc->signal && doc->state;
}

void show_channel_control(VELMAUDIO doc, int slot, int control, bool show)
{
    VELMAUDIO_ChangeChannelControlVisibility(doc, slot, control, show ? 1 : 0);
}

// A player that has not stopped or closed.
bool player_running(VELMAUDIO doc)
{
    const int status = VELMAUDIO_GetPlayStatus(doc);
    return doc->player && status != VELMPLAY_STATUS_CLOSED && status != VELMPLAY_STATUS_STOPPED;
}

// Moving the play cursor needs it shown for a running player.
bool movable(VELMAUDIO doc)
{
    return loaded(doc) && player_running(doc) && doc->state->playCursor.shown;
}

bool muted(VELMAUDIO doc, int channel)
{
    return VELMAUDIO_IsPlaying(doc) && VELMPLAY_GetChannelGain(VELMAUDIO_Player(doc), channel) <= 0.0;
}

void announce_play_cursor(VELMAUDIO doc, int64_t position)
{
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x2001D, &position, nullptr);
}

} // namespace

int64_t VELMAUDIO_GetPlayCursorPosition(VELMAUDIO doc)
{
    return loaded(doc) && doc->state->playCursor.shown ? doc->state->playCursor.position : -1;
}

int VELMAUDIO_PlayCursorVisible(VELMAUDIO doc)
{
    return doc && doc->state ? doc->state->playCursor.shown : 0;
}

int VELMAUDIO_ShowPlayCursor(VELMAUDIO doc)
{
    if (!loaded(doc) || !player_running(doc)) return 0;
    if (!doc->state->playCursor.shown) {
        doc->state->playCursor.shown = 1;
        VELMAUDIO_UpdateMuteChannelControlsVisibility(doc, 0);
        VELMSTATE_NotifyChanges(doc, 0);
    }
    return 1;
}

int64_t VELMAUDIO_SetPlayCursorPosition(VELMAUDIO doc, int64_t position)
{
    if (!movable(doc)) return -1;
    VELMCURSOR &cursor = doc->state->playCursor;
    const int64_t p = std::clamp<int64_t>(position, 0, VELMAUDIO_NumSamples(doc));
    if (p == cursor.position) return 0;
    const int64_t previous = cursor.position;
    cursor.position = cursor.secondPosition = p;
    VELMPLAY_Goto(VELMAUDIO_Player(doc), p);
    VELMSTATE_NotifyChanges(doc, 0);
    announce_play_cursor(doc, p);
    return previous;
}

int64_t VELMAUDIO_UpdatePlayCursorPosition(VELMAUDIO doc, int64_t position)
{
    if (!movable(doc) || VELMAUDIO_IsMovingPlayCursor(doc)) return -1;
    VELMCURSOR &cursor = doc->state->playCursor;
    const int64_t p = std::clamp<int64_t>(position, 0, VELMAUDIO_NumSamples(doc));
    if (p == cursor.position) return 0;
    const int64_t previous = cursor.position;
    cursor.position = p;
    announce_play_cursor(doc, p);
    // Repaint about once per pixel of movement, not at every update.
    const int64_t half_pixel = doc->renderer ? VELMDRAW_SamplesPerPixel(doc->renderer) / 2 : 0;
    if (std::llabs(p - cursor.secondPosition) > half_pixel) {
        cursor.secondPosition = p;
        VELMSTATE_NotifyChanges(doc, 0);
    }
    return previous;
}

int VELMAUDIO_HidePlayCursor(VELMAUDIO doc)
{
    if (!loaded(doc)) return 0;
    if (doc->state->playCursor.shown) {
        doc->state->playCursor.shown = 0;
        VELMAUDIO_UpdateMuteChannelControlsVisibility(doc, 0);
        VELMSTATE_NotifyChanges(doc, 0);
    }
    return 1;
}

int VELMAUDIO_UpdateMuteChannelControlsVisibility(VELMAUDIO doc, int force)
{
    if (!loaded(doc) || !doc->renderer) return 0;
    const bool m0 = force || muted(doc, 0), m1 = force || muted(doc, 1);
    if (!(doc->state->viewFlags & 0x1u)) return 1;
    const int active = AUDIOSIGNAL_NumActiveChannels(doc->signal);
    for (int slot = 0; slot < VELM_MAX_CHANNEL_SLOTS; ++slot) {
        const int kind = VELMDRAW_ChannelKind(doc->renderer, slot);
        if (kind == 0) break;
        show_channel_control(doc, slot, 1, false);
        show_channel_control(doc, slot, 2, false);
        const int channel = VELMDRAW_ChannelNumber(doc->renderer, slot);
        if (kind != VELMDRAW_LANE_WAVEFORM || !AUDIOSIGNAL_ChannelActive(doc->signal, channel)) continue;
        if (active == 1)
            show_channel_control(doc, slot, 1, m0);
        else if (channel != 0)
            show_channel_control(doc, slot, 2, m1);
        else
            show_channel_control(doc, slot, 1, m0);
    }
    return 1;
}
