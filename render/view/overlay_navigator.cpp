// The navigator's overlays: the selections over the whole signal, the
// darkened outside of the visible window and the window's edges.
#include <algorithm>

#include "render/view/overlay_internal.hpp"
#include "render/view/velmoverlays.h"

using namespace velm::view;

namespace {

// The union of the shown navigator lanes.
_VELMRECT navigator_lanes(VELMDRAW d)
{
    int32_t top = 0, bottom = -1;
    for (int i = 0; i < d->laneCount; ++i) {
        const Lane &lane = d->lanes[static_cast<size_t>(i)];
        if (!lane.shown || lane.kind != VELMDRAW_LANE_NAVIGATOR || is_empty(lane.area)) continue;
        top = bottom < top ? lane.area.top : std::min(top, lane.area.top);
        bottom = std::max(bottom, lane.area.bottom);
    }
    if (bottom < top) return _VELMRECT{};
    return make_rect(d->display.left, top, d->display.width, bottom - top + 1);
}

bool has_navigator(VELMDRAW d)
{
    return d && d->canvas && d->state && d->laidOut && d->navigatorPosition && d->columns > 0;
}

} // namespace

int VELMDRAW_UpdateNavigator(VELMDRAW drawer)
{
    if (!drawer || !drawer->state || !drawer->laidOut) return 0;
    drawer->overlay.navigatorBox = _VELMRECT{};
    if (!drawer->navigatorPosition) return 1;
    const _VELMRECT lanes = navigator_lanes(drawer);
    if (is_empty(lanes)) return 1;
    const VELMTIMEBASE *base = &drawer->navigatorBase;
    const int first = std::max(0, column_of(base, static_cast<double>(drawer->state->viewBegin)));
    const int last = std::min(drawer->columns - 1, column_of(base, static_cast<double>(drawer->state->viewEnd)));
    if (last >= first)
        drawer->overlay.navigatorBox = make_rect(lanes.left + first, lanes.top, last - first + 1, lanes.height);
    return 1;
}

int VELMDRAW_DrawNavigatorState(VELMDRAW drawer)
{
    if (!drawer || !drawer->canvas || !drawer->state) return 0;
    if (!has_navigator(drawer)) return 1;
    int ok = VELMDRAW_UpdateNavigator(drawer);
    ok &= draw_navigator_selections(drawer);
    const _VELMRECT lanes = navigator_lanes(drawer);
    const _VELMRECT &box = drawer->overlay.navigatorBox;
    if (is_empty(lanes) || is_empty(box)) return ok;
    VELMCANVAS canvas = drawer->canvas;
    VELMCANVAS_SetDrawArea(canvas, &lanes);
    fill_alpha(canvas, make_rect(lanes.left, lanes.top, box.left - lanes.left, lanes.height), 0, 0.5f);
    fill_alpha(canvas, make_rect(box.right + 1, lanes.top, lanes.right - box.right, lanes.height), 0, 0.5f);
    fill_alpha(canvas, make_rect(box.left - 1, box.top, 1, box.height), 0, 0.9f);
    fill_alpha(canvas, make_rect(box.right + 1, box.top, 1, box.height), 0, 0.9f);
    VELMCANVAS_SelectShadowColor(canvas, 0);
    VELMCANVAS_ShadowRect(canvas, box.left - 1, box.top, box.width + 2, box.height, 10, 0x33AFF000u);
    VELMCANVAS_ClearDrawArea(canvas);
    mark_dirty_rect(drawer, lanes);
    return ok;
}

int VELMDRAW_UpdateNavigatorSelecting(VELMDRAW drawer)
{
    if (!drawer || !drawer->canvas || !drawer->state) return 0;
    if (!has_navigator(drawer)) return 1;
    const _VELMRECT lanes = navigator_lanes(drawer);
    if (is_empty(lanes)) return 1;
    // The navigator is small: its whole state is drawn again over the slow
    // picture.
    VELMCANVAS_MoveBlock2(drawer->canvas, VELMCANVASTARGET_MEMORY, lanes.left, lanes.top, lanes.width, lanes.height,
                          VELMCANVASTARGET_OUTPUT, lanes.left, lanes.top);
    mark_dirty_rect(drawer, lanes);
    return VELMDRAW_DrawNavigatorState(drawer);
}
