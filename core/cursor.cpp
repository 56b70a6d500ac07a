// The edit cursor, channel masks and the optional view controls.
#include <algorithm>
#include <cmath>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "core/velmtimeconv.h"
#include "edit/velmselection.h"
#include "outside/signal/audiosignal.h"
#include "render/view/velmscales.h"
#include "sound/velmplay.h"

namespace {

constexpr double kCursorMarginFraction = 0.05;

bool loaded(VELMAUDIO doc)
{
    return doc && doc->signal && doc->state;
}

bool set_bit(uint32_t &bits, uint32_t bit, bool on)
{
    const uint32_t before = bits;
    bits = on ? (bits | bit) : (bits & ~bit);
    return bits != before;
}

} // namespace

int VELMAUDIO_SetCursorPosition(VELMAUDIO doc, int64_t p)
{
    if (!loaded(doc)) return 0;
    VELMSTATE *s = doc->state;
    s->cursor.changed = 1;
    p = std::clamp<int64_t>(p, 0, AUDIOSIGNAL_NumSamples(doc->signal));
    if (p == s->cursor.position && s->cursor.shown) return 0;
    s->cursor.position = p;
    s->cursor.shown = 1;
    VELMSELECTION_SetBegin(doc, &s->selecting, p);
    VELMSELECTION_SetEnd(doc, &s->selecting, p);
    VELMSTATE_NotifyChanges(doc, 0);
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x2001C, &p, nullptr);
    return 1;
}

int64_t VELMAUDIO_GetCursorPosition(VELMAUDIO doc)
{
    return loaded(doc) ? doc->state->cursor.position : -1;
}

int VELMAUDIO_CursorPositionChanged(VELMAUDIO doc)
{
    return doc && doc->state ? doc->state->cursor.changed : 0;
}

int64_t VELMAUDIO_GetCursorChangedPosition(VELMAUDIO doc)
{
    if (!doc || !doc->state) return 0;
    doc->state->cursor.changed = 0;
    return doc->state->cursor.position;
}

double VELMAUDIO_GetDisplayTime(VELMAUDIO doc)
{
    if (!loaded(doc)) return -1.0;
    return VELMAUDIO_SampleToTime(doc, doc->state->cursor.position);
}

int VELMAUDIO_CursorVisible(VELMAUDIO doc)
{
    if (!doc || !doc->state) return 0;
    const VELMSTATE *s = doc->state;
    return s->cursor.shown && s->viewBegin <= s->cursor.position && s->cursor.position <= s->viewEnd;
}

static int show_cursor(VELMAUDIO doc, bool shown)
{
    if (!loaded(doc)) return 0;
    if (doc->state->cursor.shown != (shown ? 1 : 0)) {
        doc->state->cursor.shown = shown ? 1 : 0;
        VELMSTATE_NotifyChanges(doc, 0);
    }
    return 1;
}

int VELMAUDIO_ShowMainCursor(VELMAUDIO doc)
{
    return show_cursor(doc, true);
}

int VELMAUDIO_HideMainCursor(VELMAUDIO doc)
{
    return show_cursor(doc, false);
}

int VELMAUDIO_ScrollToKeepCursorVisible(VELMAUDIO doc)
{
    if (!loaded(doc)) return 0;
    const VELMSTATE *s = doc->state;
    // One scale step once the view is drawn, else a twentieth of the window.
    const int64_t step = doc->renderer ? VELMDRAW_GetHorzScaleStep(doc->renderer) : 0;
    const auto margin = step > 0 ? step
                                 : static_cast<int64_t>(std::trunc(static_cast<double>(s->viewEnd - s->viewBegin) *
                                                                   kCursorMarginFraction));
    const int64_t c = s->cursor.position;
    int64_t delta = 0;
    if (c < s->viewBegin + margin) delta = c - (s->viewBegin + margin);
    if (c > s->viewEnd - margin) delta = c - (s->viewEnd - margin);
    return delta != 0 ? VELMAUDIO_ZoomOffset(doc, delta) : 1;
}

int VELMAUDIO_SetChannelMask(VELMAUDIO doc, uint32_t mask)
{
    if (!loaded(doc)) return 0;
    if (!(doc->state->viewFlags & 0x10000u)) return 1;
    bool changed = false;
    const int channels = AUDIOSIGNAL_NumChannels(doc->signal);
    for (int i = 0; i < channels && i < 32; ++i) {
        const bool on = (mask >> i) & 1u;
        if (!(on ? AUDIOSIGNAL_EnableChannel(doc->signal, i) : AUDIOSIGNAL_DisableChannel(doc->signal, i))) continue;
        changed = true;
        if (doc->player) VELMPLAY_SetChannelGain(VELMAUDIO_Player(doc), i, on ? 1.0 : 0.0);
    }
    if (changed || doc->state->channelMask != mask) {
        doc->state->channelMask = mask;
        VELMSTATE_NotifyChanges(doc, 0);
    }
    return 1;
}

uint32_t VELMAUDIO_ActiveChannelMask(VELMAUDIO doc)
{
    return loaded(doc) ? AUDIOSIGNAL_GetActiveChannelMask(doc->signal) : 0;
}

uint32_t VELMAUDIO_DisabledChannelMask(VELMAUDIO doc)
{
    return loaded(doc) ? AUDIOSIGNAL_GetDisabledChannelMask(doc->signal) : 0;
}

int VELMAUDIO_ChangeSmartZoomAction(VELMAUDIO doc, int action)
{
    if (!loaded(doc)) return 0;
    if (doc->state->smartZoomAction != action) {
        doc->state->smartZoomAction = action;
        VELMSTATE_NotifyChanges(doc, 0);
    }
    return 1;
}

int VELMAUDIO_ChangeControlVisibility(VELMAUDIO doc, int control, int show)
{
    if (!loaded(doc) || control != 2) return 0;
    const bool on = show && VELMAUDIO_HasZoomLimit(doc);
    if (!show || on) {
        if (set_bit(doc->state->controls, 2u, on)) VELMSTATE_NotifyChanges(doc, 0);
    }
    return 1;
}

int VELMAUDIO_IsControlVisible(VELMAUDIO doc, uint32_t mask)
{
    return doc && doc->state && (doc->state->controls & mask) ? 1 : 0;
}

int VELMAUDIO_ChangeChannelControlVisibility(VELMAUDIO doc, int slot, int control, int show)
{
    if (!loaded(doc) || (control != 1 && control != 2) || slot < 0 || slot >= VELM_MAX_CHANNEL_SLOTS) return 0;
    if (set_bit(doc->state->channelControls[slot], static_cast<uint32_t>(control), show != 0))
        VELMSTATE_NotifyChanges(doc, 0);
    return 1;
}

int VELMAUDIO_IsChannelControlVisible(VELMAUDIO doc, int slot, uint32_t mask)
{
    if (!doc || !doc->state || slot < 0 || slot >= VELM_MAX_CHANNEL_SLOTS) return 0;
    return (doc->state->channelControls[slot] & mask) ? 1 : 0;
}
