// The release handler: finishes the drag by its state.
#include "control/gesture_internal.hpp"
#include "core/velmnavigation.h"
#include "edit/velmregion.h"
#include "edit/velmselection.h"
#include "render/view/velmoverlays.h"

namespace velm::control {

namespace {

void click_region(VELMDRAW d, uint32_t flags)
{
    VELMAUDIO doc = d->document;
    AUDIOREGION *focused = VELMAUDIO_GetRegionOnFocus(doc);
    AUDIOREGION *current = VELMAUDIO_GetCurrentRegion(doc);
    VELMAUDIO_EventOverFocusedRegion(doc);
    if (!focused) return;
    if (flags & 0x04u) {
        VELMAUDIO_UnselectAllRegions(doc);
        const int64_t b = VELMAUDIO_GetRegionBeginSample(doc, focused), e = VELMAUDIO_GetRegionEndSample(doc, focused);
        if ((flags & 0x0Au) == 0x0Au) VELMAUDIO_DelSelection(doc, b, e);
        else if (flags & 0x02u) VELMAUDIO_AddSelection(doc, b, e);
        else if (!(flags & 0x08u)) VELMAUDIO_SelectAudio(doc, b, e);
    } else {
        if ((flags & 0x08u) && current && (AUDIOREGION_GetTrackId(current) & 0xF) == (AUDIOREGION_GetTrackId(focused) & 0xF)) {
            VELMAUDIO_ClearSelection(doc);
            VELMAUDIO_SelectRegions(doc, current, focused);
        } else if (flags & 0x02u) {
            if (AUDIOREGION_IsSelected(focused)) VELMAUDIO_UnselectRegion(doc, focused);
            else VELMAUDIO_SelectRegion(doc, focused);
        } else {
            VELMAUDIO_UnselectAllRegions(doc);
            VELMAUDIO_SelectRegion(doc, focused);
        }
        VELMAUDIO_ClearSelection(doc);
    }
    send(d, 0x20039, focused, nullptr);
}

void zoom_to_box(VELMDRAW d)
{
    const Interaction &c = d->control;
    VELMAUDIO doc = d->document;
    VELMAUDIO_ClearQuickBox(doc);
    VELMQUICKBOX box{c.pressX, c.pressY, c.pointerX - c.pressX + 1, c.pointerY - c.pressY + 1, c.pointerX, c.pointerY};
    _VELMRECT out{};
    const int lane = lane_of(d, c.grabbed);
    if (lane < 0 || !VELMDRAW_AdjustQuickBox(d, &box, &out, 1)) return;
    // The adjusted box is relative to the grabbed lane.
    const _VELMRECT &area = d->lanes[static_cast<size_t>(lane)].area;
    const int left = area.left + out.left, top = area.top + out.top;
    VELMAUDIO_Zoom(doc, display_sample(d, left), display_sample(d, left + out.width - 1));
    const double high = lane_value(d, lane, top), low = lane_value(d, lane, top + out.height - 1);
    const int kind = VELMDRAW_ChannelKind(d, lane);
    if (kind == 1) VELMAUDIO_ZoomVertical(doc, static_cast<float>(high), static_cast<float>(low));
    else if (kind == 2) VELMAUDIO_ZoomSpectral(doc, static_cast<float>(high), static_cast<float>(low));
}

void release_idle(VELMDRAW d, uint32_t flags)
{
    Interaction &c = d->control;
    VELMAUDIO doc = d->document;
    const bool primary = (c.pressFlags & kPrimary) != 0;
    const uint32_t g = c.grabbed;
    if (g == 0x8000400u && primary) VELMAUDIO_SetCursorPosition(doc, VELMAUDIO_GetCursorPosition(doc));
    else if ((g & 0x800000u) && primary) {
        if (c.repeatTimer) kill_timer(c.repeatTimer);
        else if (d->state->smartZoomAction == 1) VELMAUDIO_ZoomSelection(doc);
        else if (d->state->smartZoomAction == 4) VELMAUDIO_ZoomFullReset(doc);
    } else if ((g & 0x10000u) && primary) click_region(d, flags);
    else if (g & 0x8000u) VELMAUDIO_UnselectAllRegions(doc);
}

int release(VELMDRAW d, int x, int y, uint32_t flags)
{
    Interaction &c = d->control;
    c.buttonReleased = 1;
    point_at(d, x, y);
    send(d, 0x20034, &c.mouseOver, nullptr);
    VELMAUDIO doc = d->document;
    const int64_t sample = display_sample(d, c.pointerX);
    switch (c.dragState) {
    case kIdle: release_idle(d, flags); break;
    case kSelecting:
        VELMAUDIO_UpdateSelecting(doc, c.selectionAnchor, sample);
        c.lastDragSample = sample;
        VELMAUDIO_CommitSelecting(doc);
        break;
    case kSlidingSelection:
        VELMAUDIO_UndoSelecting(doc);
        VELMAUDIO_DelSelection(doc, c.selectionAnchor, c.selectionOtherEnd);
        VELMAUDIO_AddSelection(doc, c.selectionAnchor, sample);
        break;
    case kMovingCursor: VELMAUDIO_SetCursorPosition(doc, sample); break;
    case kMovingPlayCursor: VELMAUDIO_SetPlayCursorPosition(doc, sample); break;
    case kMovingRegions: VELMAUDIO_EventOverFocusedRegion(doc); break;
    case kZoomBox: zoom_to_box(d); break;
    case kVertScaleSelection:
        VELMAUDIO_ZoomVertical(doc, static_cast<float>(d->state->vertSelectionStart), static_cast<float>(d->state->vertSelectionEnd));
        VELMAUDIO_StartVerticalScaleSelection(doc, 0.0);
        break;
    case kSpecScaleSelection:
        VELMAUDIO_ZoomSpectral(doc, static_cast<float>(d->state->spectralSelectionStart),
                               static_cast<float>(d->state->spectralSelectionEnd));
        VELMAUDIO_StartSpecScaleSelection(doc, 0.0);
        break;
    case kMovingSelection: {
        const int64_t delta = sample - c.lastDragSample;
        const int64_t b = VELMSELECTION_GetBegin(doc, c.slidSelection), e = VELMSELECTION_GetEnd(doc, c.slidSelection);
        VELMAUDIO_UpdateSelecting(doc, b + delta, e + delta);
        VELMAUDIO_DelSelection(doc, b, e);
        VELMAUDIO_CommitSelecting(doc);
        break;
    }
    default: break;
    }
    kill_timer(c.repeatTimer);
    c.dragState = kIdle;
    c.grabbed = 0;
    c.slidSelection = nullptr;
    return smart_zoom_update(d);
}

} // namespace

} // namespace velm::control

int VELMCONTROL_MouseUp(VELMDRAW drawer, int x, int y, uint32_t flags)
{
    velm::control::Busy busy(drawer);
    return busy.ok() ? velm::control::release(drawer, x, y, flags) : 0;
}
