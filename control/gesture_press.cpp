// The press handler: records the press and starts what a press starts.
#include "control/gesture_internal.hpp"
#include "core/velmnavigation.h"
#include "edit/velmregion.h"
#include "edit/velmselection.h"
#include "sound/velmplay.h"

namespace velm::control {

namespace {

constexpr uint32_t kRepeatMs = 50;

int zoom_in(void *doc) { return VELMAUDIO_ZoomIn(static_cast<VELMAUDIO>(doc)); }
int zoom_out(void *doc) { return VELMAUDIO_ZoomOut(static_cast<VELMAUDIO>(doc)); }
int zoom_vertical_in(void *doc) { return VELMAUDIO_ZoomVerticalIn(static_cast<VELMAUDIO>(doc)); }
int zoom_vertical_out(void *doc) { return VELMAUDIO_ZoomVerticalOut(static_cast<VELMAUDIO>(doc)); }

void start_repeat(VELMDRAW d, VELMTIMER_Callback tick, void *user)
{
    kill_timer(d->control.repeatTimer);
    d->control.repeatTimer = VELMTIMER_CreateTimer(kRepeatMs, tick, user);
}

void smart_zoom_repeat(VELMDRAW d)
{
    VELMAUDIO doc = d->document;
    switch (d->state->smartZoomAction) {
    case 2: start_repeat(d, zoom_in, doc); break;
    case 3: start_repeat(d, zoom_out, doc); break;
    case 5: start_repeat(d, zoom_vertical_in, doc); break;
    case 6: start_repeat(d, zoom_vertical_out, doc); break;
    default: break;
    }
}

// Mutes a playing channel, or restores a muted one.
void toggle_gain(VELMDRAW d, int channel)
{
    VELMPLAYER player = VELMAUDIO_Player(d->document);
    VELMPLAY_SetChannelGain(player, channel, VELMPLAY_GetChannelGain(player, channel) <= 0.0 ? 1.0 : 0.0);
}

int grab_object(VELMDRAW d, uint32_t code)
{
    Interaction &c = d->control;
    const bool primary = (c.pressFlags & kPrimary) != 0;
    if (code & 0x400000u) {
        c.pressSample = navigator_sample(d, c.pointerX);
        c.navigatorBegin = VELMAUDIO_ViewBegin(d->document);
        c.navigatorEnd = VELMAUDIO_ViewEnd(d->document);
        if (c.pressSample < c.navigatorBegin || c.pressSample > c.navigatorEnd)
            start_repeat(d, navigator_scroll_tick, d);
    } else {
        c.pressSample = display_sample(d, c.pointerX);
    }
    c.grabbed = code;
    c.pressValue = (code & 0x4200u) == 0x4200u || (code & 0x2000u) ? lane_value(d, lane_of(d, code), c.pointerY) : 0.0;
    if ((code & 0x800000u) && (c.pressFlags & 0x30u) == 0x20u) smart_zoom_repeat(d);
    if ((code & 0x70000u) && primary) {
        c.hoverX = c.pointerX;
        c.hoverY = c.pointerY;
        kill_timer(c.hoverTimer);
        c.hoverTimer = VELMTIMER_CreateTimer(static_cast<uint32_t>(c.pressTime > 0 ? c.pressTime : 1), press_tick, d);
    }
    return 1;
}

int press_channel(VELMDRAW d, uint32_t code)
{
    Interaction &c = d->control;
    VELMAUDIO doc = d->document;
    set_channel_mask(d, code);
    const int64_t sample = c.pointerSample;
    const uint32_t f = c.pressFlags;
    if ((f & 0x0Au) == 0x0Au) {
        VELMAUDIO_SetSelectingKind(doc, SELECTING_SUBTRACT);
        c.selectionAnchor = sample;
        VELMAUDIO_SetCursorPosition(doc, sample);
    } else if (f & 0x08u) {
        VELMAUDIO_SetSelectingKind(doc, SELECTING_REPLACE);
        c.selectionAnchor = VELMAUDIO_GetSelectionResizeBorder(doc, sample);
        VELMAUDIO_UpdateSelecting(doc, c.selectionAnchor, sample);
        c.lastDragSample = sample;
        c.dragState = kSelecting;
    } else if (f & 0x02u) {
        VELMAUDIO_SetSelectingKind(doc, SELECTING_ADD);
        c.selectionAnchor = sample;
        VELMAUDIO_SetCursorPosition(doc, sample);
    } else {
        VELMAUDIO_ClearSelection(doc);
        VELMAUDIO_UnselectAllRegions(doc);
        VELMAUDIO_SetSelectingKind(doc, SELECTING_REPLACE);
        c.selectionAnchor = sample;
        VELMAUDIO_SetCursorPosition(doc, sample);
    }
    c.grabbed = code;
    return 1;
}

int press(VELMDRAW d, int x, int y, uint32_t flags)
{
    if (!move(d, x, y, flags)) return 0;
    Interaction &c = d->control;
    c.buttonReleased = 0;
    c.grabbed = 0;
    c.lastDragSample = 0;
    c.pressX = c.pointerX;
    c.pressY = c.pointerY;
    c.pressFlags = flags;
    send(d, 0x20033, &c.mouseOver, nullptr);
    kill_timer(c.hoverTimer);
    const uint32_t code = c.mouseOver;
    const bool primary = (flags & kPrimary) != 0;
    if ((code & 0x4000000u) && primary) {
        c.slidSelection = const_cast<VELMSELECTION *>(c.selectionUnderPointer);
        c.grabbed = 0x4000000u;
        return 1;
    }
    if ((code & 0x80000u) && primary) {
        c.grabbed = code;
        const size_t i = code & 0xFu;
        return i < d->buttons.size() && VELMAUDIO_SetDrawKindOption(d->document, static_cast<uint32_t>(d->buttons[i].id));
    }
    if (code) {
        grab_object(d, code);
        if ((code & 0x70000u) || code == 0x1000100u || code == 0x1000200u) return 1;
    }
    if (code & 0x2000000u) {
        toggle_gain(d, static_cast<int>(code & 0xFFu));
        return 1;
    }
    if ((code & 0x8000800u) == 0x8000800u && primary) {
        const int index = static_cast<int>(code & 0xFFu);
        if (index >= d->overlay.selectionSliderCount) return 1;
        const VELMSELECTION *s = d->overlay.selectionSliders[static_cast<size_t>(index)].selection;
        c.slidSelection = const_cast<VELMSELECTION *>(s);
        VELMAUDIO_SetSelectingKind(d->document, SELECTING_REPLACE);
        const int64_t b = VELMSELECTION_GetBegin(d->document, s), e = VELMSELECTION_GetEnd(d->document, s);
        const bool beginHandle = (code & 0x8000A00u) != 0x8000A00u;
        c.selectionAnchor = beginHandle ? e : b;
        c.selectionOtherEnd = beginHandle ? b : e;
        VELMAUDIO_UpdateSelecting(d->document, c.selectionAnchor, c.pointerSample);
        c.lastDragSample = c.pointerSample;
        c.dragState = kSlidingSelection;
        return 1;
    }
    if ((code & 0xA000u) && primary) return press_channel(d, code);
    c.pressArea = (code & 0x400000u) ? 1 : (code & 0x4200u) == 0x4200u ? 3 : (code & 0x4100u) == 0x4100u ? 2 : (code & 0x8000u) ? 4 : 0;
    return 1;
}

} // namespace

} // namespace velm::control

int VELMCONTROL_MouseDown(VELMDRAW drawer, int x, int y, uint32_t flags)
{
    velm::control::Busy busy(drawer);
    return busy.ok() ? velm::control::press(drawer, x, y, flags) : 0;
}
