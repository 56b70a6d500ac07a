// The play cursor as the view shows it, and the mute indicators of the
// channel displays.
#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "outside/signal/audiosignal.h"
#include "render/view/velmdraw.h"

namespace {

bool loaded(VELMAUDIO doc)
{
    return doc && doc->signal && doc->state;
}

void show_channel_control(VELMAUDIO doc, int slot, int control, bool show)
{
    VELMAUDIO_ChangeChannelControlVisibility(doc, slot, control, show ? 1 : 0);
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
    // Only playback mutes a channel, and nothing plays here: unless forced,
    // the indicators go away.
    const bool muted = force != 0;
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
            show_channel_control(doc, slot, 1, muted);
        else if (channel != 0)
            show_channel_control(doc, slot, 2, muted);
        else
            show_channel_control(doc, slot, 1, muted);
    }
    return 1;
}
