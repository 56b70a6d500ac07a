// The move handler: hover and focus while the button is up, the drag of the
// grabbed object while it is held.
#include <algorithm>
#include <cmath>

#include "control/gesture_internal.hpp"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "core/velmtimeconv.h"
#include "edit/velmregion.h"
#include "edit/velmselection.h"
#include "sound/velmplay.h"

namespace velm::control {

namespace {

constexpr uint32_t kNavigator = 0x400000u;

void hover(VELMDRAW d)
{
    Interaction &c = d->control;
    if (c.pointerX != c.hoverX || c.pointerY != c.hoverY) {
        kill_timer(c.hoverTimer);
        c.hoverX = c.pointerX;
        c.hoverY = c.pointerY;
        c.hoverTimer = VELMTIMER_CreateTimer(static_cast<uint32_t>(std::max(1, c.hoverTime)), hover_tick, d);
    }
    VELMAUDIO doc = d->document;
    const uint32_t code = c.mouseOver;
    const int index = static_cast<int>(code & 0xFFFu);
    // Entries drawn for a replaced signal name freed regions: focus nothing.
    const bool onRegion = (code & 0x70000u) && d->regionLayer.names_regions_of(doc->signal) &&
                          index < std::min(d->regionLayer.count, d->regionLayer.capacity);
    VELMAUDIO_SetFocusOnRegion(doc, onRegion ? d->regionLayer.entries[index].region : nullptr);
    VELMAUDIO_ChangeControlVisibility(doc, 2, (code & 0x1000000u) != 0);
    if (VELMAUDIO_IsPlaying(doc)) VELMAUDIO_UpdateMuteChannelControlsVisibility(doc, (code & 0x100000u) != 0);
}

// A rule may leave idle only when the named coordinate moved from the press.
bool may_enter(const Interaction &c, uint32_t state, bool moved)
{
    return c.dragState == state || (c.dragState == kIdle && moved);
}

void extend_selecting(VELMDRAW d, uint32_t state)
{
    Interaction &c = d->control;
    if (c.dragState == kIdle) {
        if (c.pointerSample == VELMAUDIO_GetCursorPosition(d->document)) return;
        VELMAUDIO_UpdateSelecting(d->document, c.selectionAnchor, c.pointerSample);
        c.lastDragSample = c.pointerSample;
        c.dragState = state;
        return;
    }
    if (c.dragState != state) return;
    const int64_t step = autoscroll_step(d, c.pointerX);
    c.lastDragSample = c.pointerSample + step;
    VELMAUDIO_UpdateSelecting(d->document, c.selectionAnchor, c.lastDragSample);
}

void move_selection(VELMDRAW d)
{
    Interaction &c = d->control;
    VELMAUDIO doc = d->document;
    const uint32_t keys = c.pressFlags & 0x1Fu;
    if (c.dragState == kIdle && keys == 2) {
        if (std::abs(c.pointerX - c.pressX) + std::abs(c.pointerY - c.pressY) <= 4) return;
        if (BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x2003B, &c.selectionUnderPointer, nullptr)) {
            c.dragState = kIdle;
            c.buttonReleased = 1;
            c.keyState = 0;
        }
        return;
    }
    const int64_t begin = VELMSELECTION_GetBegin(doc, c.slidSelection), end = VELMSELECTION_GetEnd(doc, c.slidSelection);
    if (c.dragState == kIdle && keys == 4) {
        c.dragState = kMovingSelection;
        c.lastDragSample = c.pointerSample;
        VELMAUDIO_UpdateSelecting(doc, begin, end);
        return;
    }
    if (c.dragState != kMovingSelection) return;
    const int64_t delta = c.pointerSample - c.lastDragSample;
    VELMAUDIO_UpdateSelecting(doc, begin + delta, end + delta);
    const int64_t viewBegin = VELMAUDIO_ViewBegin(doc), viewEnd = VELMAUDIO_ViewEnd(doc);
    if (begin + delta > VELMAUDIO_ViewBeginLimit(doc) && begin + delta < viewBegin)
        shift_view(d, begin + delta - viewBegin);
    else if (end + delta > viewEnd && end + delta < VELMAUDIO_ViewEndLimit(doc))
        shift_view(d, end + delta - viewEnd);
}

void pan(VELMDRAW d)
{
    const Interaction &c = d->control;
    const _VELMRECT &area = d->display;
    const int right = area.left + area.width - 1;
    const int64_t spp = -std::llround(VELMDRAW_ConvertDisplayXtoRealX(d, 1) - VELMDRAW_ConvertDisplayXtoRealX(d, 0));
    int64_t offset = c.pressSample - c.pointerSample;
    if (c.pointerX > right) offset = spp * (c.pointerX - right - 1);
    else if (c.pointerX < area.left) offset = spp * (c.pointerX - area.left);
    VELMAUDIO_ZoomOffset(d->document, offset);
}

void drag_navigator_window(VELMDRAW d)
{
    const Interaction &c = d->control;
    int64_t delta = c.pressSample - c.pointerSample;
    delta = std::min(std::max(delta, c.navigatorEnd - VELMAUDIO_ViewEndLimit(d->document)), c.navigatorBegin);
    VELMAUDIO_Zoom(d->document, c.navigatorBegin - delta, c.navigatorEnd - delta);
}

void drag_navigator_border(VELMDRAW d, bool left)
{
    VELMAUDIO doc = d->document;
    const int64_t begin = VELMAUDIO_ViewBegin(doc), end = VELMAUDIO_ViewEnd(doc);
    const int64_t sample = d->control.pointerSample;
    if (left) VELMAUDIO_Zoom(doc, std::min(sample, end - 2), end);
    else VELMAUDIO_Zoom(doc, begin, std::max(sample, begin + 2));
}

void drag_divider(VELMDRAW d)
{
    Interaction &c = d->control;
    const int32_t height = VELMAUDIO_GetDrawProperty(d->document, 6);
    VELMAUDIO_SetDrawProperty(d->document, 6, height - (c.pressY - c.pointerY));
    c.pressY = c.pointerY;
}

void drag_region_body(VELMDRAW d)
{
    Interaction &c = d->control;
    const int64_t delta = c.pressSample - c.pointerSample;
    if (!delta) return;
    c.pressSample = c.pointerSample;
    VELMAUDIO_OffsetRegions(d->document, -delta);
    c.dragState = kMovingRegions;
}

void select_scale_range(VELMDRAW d, int lane)
{
    Interaction &c = d->control;
    const int kind = VELMDRAW_ChannelKind(d, lane);
    if (c.dragState == kIdle) {
        if (kind == 1) VELMAUDIO_StartVerticalScaleSelection(d->document, c.pressValue), c.dragState = kVertScaleSelection;
        else if (kind == 2) VELMAUDIO_StartSpecScaleSelection(d->document, c.pressValue), c.dragState = kSpecScaleSelection;
        else return;
    }
    const double value = lane_value(d, lane, c.pointerY);
    if (c.dragState == kVertScaleSelection) VELMAUDIO_EndVerticalScaleSelection(d->document, value);
    else if (c.dragState == kSpecScaleSelection) VELMAUDIO_EndSpecScaleSelection(d->document, value);
}

void scroll_scale(VELMDRAW d, int lane)
{
    Interaction &c = d->control;
    c.dragState = kVerticalScrolling;
    const _VELMRECT &scale = d->lanes[static_cast<size_t>(lane)].vertScale;
    if (c.pointerY < scale.top || c.pointerY >= scale.top + scale.height) return;
    const auto delta = static_cast<float>(lane_value(d, lane, c.pressY) - lane_value(d, lane, c.pointerY));
    c.pressY = c.pointerY;
    if (delta == 0.0f) return;
    if (VELMDRAW_ChannelKind(d, lane) == 1) VELMAUDIO_ScrollVertical(d->document, delta);
    else if (VELMDRAW_ChannelKind(d, lane) == 2) VELMAUDIO_ScrollSpectral(d->document, delta);
}

void drag_region_border(VELMDRAW d, bool begin, uint32_t flags)
{
    Interaction &c = d->control;
    VELMAUDIO doc = d->document;
    const int64_t delta = c.pressSample - c.pointerSample;
    AUDIOREGION *region = VELMAUDIO_GetRegionOnFocus(doc);
    if (!delta || !region) return;
    c.pressSample = c.pointerSample;
    c.pressX = c.pointerX;
    const double shift = VELMAUDIO_SampleToTime(doc, delta);
    const auto mode = static_cast<int>(flags & 0x02u);
    if (begin) VELMAUDIO_ChangeRegionOnFocusBegin(doc, AUDIOREGION_Begin(region) - shift, mode);
    else VELMAUDIO_ChangeRegionOnFocusEnd(doc, AUDIOREGION_End(region) - shift, mode);
    c.dragState = kResizingRegion;
}

void drag(VELMDRAW d, uint32_t flags)
{
    Interaction &c = d->control;
    const uint32_t g = c.grabbed;
    const bool primary = (c.pressFlags & kPrimary) != 0;
    const bool movedX = c.pointerX != c.pressX, movedY = c.pointerY != c.pressY;
    c.pointerSample = (g & kNavigator) ? navigator_sample(d, c.pointerX) : display_sample(d, c.pointerX);
    if ((g & 0x4000000u) && c.slidSelection) return move_selection(d);
    if ((g == 0x1000100u || g == 0x1000200u) && primary && may_enter(c, kMovingZoomLimit, movedX)) {
        c.dragState = kMovingZoomLimit;
        const double spp = VELMDRAW_ConvertDisplayXtoRealX(d, 1) - VELMDRAW_ConvertDisplayXtoRealX(d, 0);
        const auto delta = static_cast<int64_t>(std::llround((c.pointerX - c.pressX) * -0.1 * spp));
        const int64_t b = VELMAUDIO_ViewBeginLimit(d->document), e = VELMAUDIO_ViewEndLimit(d->document);
        VELMAUDIO_SetZoomLimits(d->document, g == 0x1000100u ? b - delta : b, g == 0x1000200u ? e - delta : e);
        return;
    }
    if ((g & ~1u) == 0x8000400u && primary) {
        const bool play = (g & 1u) && VELMAUDIO_IsPlaying(d->document);
        const uint32_t state = play ? kMovingPlayCursor : kMovingCursor;
        if (!may_enter(c, state, movedX)) return;
        c.dragState = state;
        if (play) VELMAUDIO_SetPlayCursorPosition(d->document, c.pointerSample);
        else VELMAUDIO_SetCursorPosition(d->document, c.pointerSample);
        return;
    }
    if ((g & 0x8000800u) == 0x8000800u && primary) return extend_selecting(d, kSlidingSelection);
    if ((g & 0x2000u) && (c.pressFlags & 0x82u) == 0x82u) {
        if (!may_enter(c, kZoomBox, movedX || movedY)) return;
        if (c.dragState == kIdle) VELMAUDIO_StartQuickBox(d->document, c.pressX, c.pressY);
        c.dragState = kZoomBox;
        VELMAUDIO_UpdateQuickBox(d->document, c.pointerX, c.pointerY);
        return;
    }
    if ((g & 0x200000u) && primary) {
        if (may_enter(c, kResizingDivider, movedY)) c.dragState = kResizingDivider, drag_divider(d);
        return;
    }
    if (g == 0x400001u && primary) {
        if (may_enter(c, kPanning, movedX)) c.dragState = kPanning, drag_navigator_window(d);
        return;
    }
    if ((g == 0x400002u || g == 0x400003u) && primary) {
        if (may_enter(c, kResizingNavigatorWindow, movedX))
            c.dragState = kResizingNavigatorWindow, drag_navigator_border(d, g == 0x400002u);
        return;
    }
    if (((g & 0x4100u) == 0x4100u && primary) || ((g & 0x1000u) && (c.pressFlags & 0x50u))) {
        if (may_enter(c, kPanning, movedX)) c.dragState = kPanning, pan(d);
        return;
    }
    const int lane = lane_of(d, g);
    if ((g & 0x4200u) == 0x4200u && (c.pressFlags & 0x80u) && lane >= 0) {
        if (may_enter(c, kVertScaleSelection, movedY) || c.dragState == kSpecScaleSelection) select_scale_range(d, lane);
        return;
    }
    if ((g & 0x4200u) == 0x4200u && primary && lane >= 0) {
        if (may_enter(c, kVerticalScrolling, movedY)) scroll_scale(d, lane);
        return;
    }
    if ((g & 0x10000u) && primary) {
        if (may_enter(c, kMovingRegions, movedX)) drag_region_body(d);
        return;
    }
    if ((g & 0x60000u) && primary) {
        if (may_enter(c, kResizingRegion, movedX)) drag_region_border(d, (g & 0x20000u) != 0, flags);
        return;
    }
    if ((g & 0xA000u) && primary) {
        if (c.dragState == kSelecting && (c.mouseOver & 0x1000u)) set_channel_mask(d, c.mouseOver);
        extend_selecting(d, kSelecting);
    }
}

} // namespace

int move(VELMDRAW d, int x, int y, uint32_t flags)
{
    if (!point_at(d, x, y)) return 0;
    if (d->control.buttonReleased) hover(d);
    else drag(d, flags);
    return smart_zoom_update(d);
}

} // namespace velm::control

int VELMCONTROL_MouseMove(VELMDRAW drawer, int x, int y, uint32_t flags)
{
    velm::control::Busy busy(drawer);
    return busy.ok() ? velm::control::move(drawer, x, y, flags) : 0;
}
