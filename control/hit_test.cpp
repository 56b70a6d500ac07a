// The hit test: which object of the last drawn layout lies under the pointer.
// Objects drawn over the view (buttons, sliders, the navigator) answer
// alone; below them the code is built from every area the pointer is in.
#include <algorithm>
#include <cmath>

#include "control/velmcontrol.h"
#include "core/document_internal.hpp"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "core/velmutil.h"
#include "edit/velmregion.h"
#include "edit/velmselection.h"
#include "render/view/drawer_internal.hpp"
#include "sound/velmplay.h"

namespace {

using velm::view::Lane;

constexpr uint32_t kIndexBits = 0xFFFu;
constexpr uint32_t kDisplay = 0x1000u;
constexpr uint32_t kChannel = 0x2000u;
constexpr uint32_t kSelectBand = 0x100000u;
constexpr uint32_t kVertScale = 0x4200u;
constexpr uint32_t kHorzScale = 0x4100u;
constexpr uint32_t kKindBox = 0x4400u;
constexpr uint32_t kChannelButton = 0x2000000u;
constexpr uint32_t kDivider = 0x200000u;
constexpr uint32_t kCustomTrack = 0x8000u;
constexpr uint32_t kRegionBody = 0x10000u, kRegionBegin = 0x20000u, kRegionEnd = 0x40000u;
constexpr uint32_t kZoomLimitZone = 0x1000000u;
constexpr uint32_t kZoomLimitBegin = 0x1000100u, kZoomLimitEnd = 0x1000200u;
constexpr uint32_t kSmartZoom = 0x800000u;
constexpr uint32_t kDraggableSelection = 0x4000000u;
constexpr uint32_t kNavigator = 0x400000u;

// Rows of a vertical scale and columns of the time scale that pick the
// scale kind.
constexpr int kVertKindBoxRows = 14;
constexpr int kHorzKindBoxColumns = 30;

bool inside(const _VELMRECT &r, int x, int y)
{
    return VELMUTIL_IsInsideRect(&r, x, y) != 0;
}

uint32_t with_index(uint32_t code, uint32_t kind, uint32_t index)
{
    return (code & ~kIndexBits) | kind | (index & kIndexBits);
}

// The first sample of the display column under x (the mapping answers -1
// before the first layout).
int64_t sample_at(VELMDRAW d, int x)
{
    const double s = std::floor(VELMDRAW_ConvertDisplayXtoRealX(d, VELMDRAW_ConvertCanvasXtoAreaX(d, x)));
    return std::fabs(s) < 9.0e18 ? static_cast<int64_t>(s) : 0;
}

bool playing(VELMDRAW d)
{
    return VELMAUDIO_IsPlaying(d->document) != 0;
}

bool hit_lane(const Lane &lane)
{
    return lane.shown && lane.kind != VELMDRAW_LANE_NAVIGATOR;
}

// The band that selects a lane's channel: at the top of the lane for
// channel 0, at the bottom for the others.
bool in_select_band(VELMDRAW d, const Lane &lane, int index, int x, int y)
{
    const _VELMRECT &a = lane.area;
    int32_t height = a.height * 3 / 10;
    if (playing(d)) {
        if (!VELMAUDIO_IsChannelControlVisible(d->document, index, 3)) return false;
        height = a.height <= 70 ? a.height - 10 : 60;
    }
    const _VELMRECT top = velm::view::make_rect(a.left, a.top, a.width, height);
    const _VELMRECT bottom = velm::view::make_rect(a.left, a.top + a.height - height, a.width, height);
    if (playing(d) && VELMAUDIO_NumActiveChannels(d->document) == 1) return inside(top, x, y) || inside(bottom, x, y);
    return inside(lane.channel == 0 ? top : bottom, x, y);
}

uint32_t overlay_button(VELMDRAW d, int x, int y)
{
    if (!VELMAUDIO_ChkDrawOption(d->document, 0x8000u)) return 0;
    for (uint32_t i = 0; i < d->buttons.size(); ++i)
        if (inside(d->buttons[i].rect, x, y)) return 0x80000u | i;
    return 0;
}

uint32_t cursor_slider(VELMDRAW d, int x, int y)
{
    const auto &sliders = d->overlay.cursorSliders;
    if (d->state->playCursor.shown && inside(sliders[1], x, y)) return 0x8000401u;
    if (d->state->cursor.shown && inside(sliders[0], x, y)) return 0x8000400u;
    return 0;
}

uint32_t selection_slider(VELMDRAW d, int x, int y)
{
    const auto &layout = d->overlay;
    const int count = std::clamp(layout.selectionSliderCount, 0, velm::view::kMaxSelectionSliders);
    for (int i = 0; i < count; ++i) {
        const velm::view::SelectionSlider &s = layout.selectionSliders[static_cast<size_t>(i)];
        if (inside(s.end, x, y)) return 0x8000A00u | static_cast<uint32_t>(i);
        if (inside(s.begin, x, y)) return 0x8000900u | static_cast<uint32_t>(i);
    }
    return 0;
}

bool on_smart_zoom(VELMDRAW d, int x, int y)
{
    return (d->state->controls & 0x1u) && inside(d->zoomButton, x, y);
}

// The smart-zoom button stands inside the navigator strip; it is left to
// the area tests so that it can be reached at all.
uint32_t navigator(VELMDRAW d, int x, int y)
{
    if (!d->navigatorPosition || !inside(d->navigator, x, y) || on_smart_zoom(d, x, y)) return 0;
    const _VELMRECT &box = d->overlay.navigatorBox;
    if (VELMUTIL_IsOverRectBorder(&box, VELMUTIL_BORDER_LEFT, x, y)) return kNavigator | 2u;
    if (VELMUTIL_IsOverRectBorder(&box, VELMUTIL_BORDER_RIGHT, x, y)) return kNavigator | 3u;
    if (inside(box, x, y) && VELMAUDIO_HasZoom(d->document)) return kNavigator | 1u;
    return kNavigator;
}

uint32_t lanes_and_scales(VELMDRAW d, uint32_t code, int x, int y)
{
    for (int c = 0; c < d->laneCount; ++c) {
        const Lane &lane = d->lanes[static_cast<size_t>(c)];
        if (!hit_lane(lane)) continue;
        if (inside(lane.area, x, y)) {
            code |= kChannel | static_cast<uint32_t>(c);
            if (in_select_band(d, lane, c, x, y)) code |= kSelectBand;
        } else if (inside(lane.vertScale, x, y)) {
            code |= kVertScale | static_cast<uint32_t>(c);
            if (y < lane.vertScale.top + kVertKindBoxRows) code |= kKindBox;
        }
    }
    return code;
}

uint32_t channel_buttons(VELMDRAW d, uint32_t code, int x, int y)
{
    for (int c = 0; c < d->laneCount; ++c) {
        const Lane &lane = d->lanes[static_cast<size_t>(c)];
        if (!hit_lane(lane)) continue;
        if (VELMAUDIO_IsChannelControlVisible(d->document, c, 1) && inside(lane.buttons[0], x, y))
            code = (code & ~(kDisplay | kChannel)) | kChannelButton;
        else if (VELMAUDIO_IsChannelControlVisible(d->document, c, 2) && inside(lane.buttons[1], x, y))
            code = (code & ~(kDisplay | kChannel)) | kChannelButton | 1u;
    }
    return code;
}

// Divider strips are 3 pixels high; they grab 2 more pixels on each side.
uint32_t dividers(VELMDRAW d, uint32_t code, int x, int y)
{
    for (int j = 0; j < d->dividers.count; ++j) {
        _VELMRECT strip = d->dividers.rect[static_cast<size_t>(j)];
        strip.top -= 2;
        strip.height += 4;
        if (inside(strip, x, y)) code = with_index(code, kDivider, static_cast<uint32_t>(j));
    }
    return code;
}

uint32_t time_scale(VELMDRAW d, uint32_t code, int x, int y)
{
    if (!inside(d->horzScale, x, y)) return code;
    code |= kHorzScale;
    if (x < d->horzScale.left + kHorzKindBoxColumns) code |= kKindBox;
    return code;
}

uint32_t custom_track(VELMDRAW d, uint32_t code, int x, int y)
{
    for (uint32_t t = 0; t < VELM_MAX_CUSTOM_TRACKS; ++t)
        if (d->trackShown[t] && inside(d->trackAreas[t], x, y)) return with_index(code, kCustomTrack, t);
    return code;
}

uint32_t region(VELMDRAW d, uint32_t code, int x, int y)
{
    const velm::view::RegionLayer &layer = d->regionLayer;
    if (!(code & kCustomTrack) || !layer.names_regions_of(d->document->signal)) return code;
    // Later entries are drawn over earlier ones (children over their
    // parents): the topmost region under the pointer is met first.  Only
    // the entries that the code's index bits can name take part.
    const int count = std::min({layer.count, layer.capacity, static_cast<int>(kIndexBits) + 1});
    for (int r = count - 1; r >= 0; --r) {
        const velm::view::RegionEntry &entry = layer.entries[r];
        if (VELMAUDIO_IsRegionDeleted(d->document, entry.region)) continue;
        const auto index = static_cast<uint32_t>(r);
        if (VELMUTIL_IsOverRectBorder(&entry.area, VELMUTIL_BORDER_LEFT, x, y)) return with_index(code, kRegionBegin, index);
        if (VELMUTIL_IsOverRectBorder(&entry.area, VELMUTIL_BORDER_RIGHT, x, y)) return with_index(code, kRegionEnd, index);
        if (inside(entry.area, x, y)) return with_index(code, kRegionBody, index);
    }
    return code;
}

// The zones are the cursor-slider strips at both ends of the display: the
// pointer near an edge of the view reveals the zoom-limit handles.
uint32_t zoom_limits(VELMDRAW d, uint32_t code, int x, int y)
{
    if (!(code & kChannel) || !VELMAUDIO_HasZoomLimit(d->document)) return code;
    if (inside(d->sliders[0], x, y) || inside(d->sliders[1], x, y)) code |= kZoomLimitZone;
    if (!VELMAUDIO_IsControlVisible(d->document, 2)) return code;
    const auto &handles = d->overlay.zoomLimitHandles;
    if (inside(handles[0], x, y)) return code | kZoomLimitBegin;
    if (inside(handles[1], x, y)) return code | kZoomLimitEnd;
    return code;
}

uint32_t draggable_selection(VELMDRAW d, uint32_t code)
{
    velm::control::Interaction &c = d->control;
    const uint32_t keys = c.keyState & 0x1Fu;
    if (!c.audioDragActive || !(code & kDisplay) || (keys != 2 && keys != 4)) return code;
    c.selectionUnderPointer = VELMAUDIO_SelectionOverSample(d->document, c.pointerSample);
    return c.selectionUnderPointer ? code | kDraggableSelection : code;
}

uint32_t object_under(VELMDRAW d, int x, int y)
{
    for (auto test : {overlay_button, cursor_slider, selection_slider, navigator})
        if (const uint32_t code = test(d, x, y)) return code;
    uint32_t code = inside(d->display, x, y) ? kDisplay : 0;
    for (auto step : {lanes_and_scales, channel_buttons, dividers, time_scale, custom_track, region, zoom_limits})
        code = step(d, code, x, y);
    if (on_smart_zoom(d, x, y)) code |= kSmartZoom;
    return draggable_selection(d, code);
}

} // namespace

int VELMCONTROL_UpdateMouseOverObject(VELMDRAW drawer)
{
    if (!drawer || !drawer->state || !drawer->document) return 0;
    velm::control::Interaction &c = drawer->control;
    c.pointerSample = sample_at(drawer, c.pointerX);
    c.selectionUnderPointer = nullptr;
    uint32_t code = object_under(drawer, c.pointerX, c.pointerY);
    if (code == c.mouseOver) return 1;
    if (c.buttonReleased) {
        uint32_t old = c.mouseOver;
        BLNOTIFY_SendEvent(drawer->document->dispatcher, nullptr, 0, 0x20032, &code, &old);
    }
    c.mouseOver = code;
    return 1;
}

int VELMCONTROL_SetPointer(VELMDRAW drawer, int x, int y)
{
    if (!drawer || drawer->control.busy) return 0;
    velm::control::Interaction &c = drawer->control;
    c.busy = 1;
    c.pointerX = x;
    c.pointerY = y;
    const int result = VELMCONTROL_UpdateMouseOverObject(drawer);
    c.busy = 0;
    return result;
}
