// The edit and play cursors: a one-pixel line in every lane and custom
// track, with an optional soft shadow and a handle under the lanes; the
// navigator repeats them through its own time base.
#include <algorithm>

#include "render/view/overlay_internal.hpp"
#include "widgets/resources/velmresources.h"

namespace velm::view {
namespace {

struct CursorStyle {
    uint32_t active = 0, inactive = 0;
    bool shadow = false, slider = false;
};

CursorStyle style_of(VELMDRAW d, const VELMCURSOR &cursor)
{
    const VELMDRAWCONFIG &c = d->config;
    if (cursor.kind == 1)
        return {c.playCursorActiveColor, c.playCursorInactiveColor, c.playCursorDrawShadow != 0,
                c.playCursorDrawSlider != 0};
    return {c.mainCursorActiveColor, c.mainCursorInactiveColor, c.mainCursorDrawShadow != 0,
            c.mainCursorDrawSlider != 0};
}

// Whether a cursor is drawn at all; the main lanes also need it in the view
// window, the navigator shows the whole sound.
bool cursor_enabled(VELMDRAW d, const VELMCURSOR &cursor)
{
    return !(d->state->viewFlags & 0x400000u) && (cursor.shown || cursor.flag);
}

bool cursor_wanted(VELMDRAW d, const VELMCURSOR &cursor)
{
    const VELMSTATE *s = d->state;
    return cursor_enabled(d, cursor) && cursor.position >= s->viewBegin && cursor.position <= s->viewEnd;
}

// The shadow reaches this far on each side of a cursor line.
constexpr int kShadowReach = 10;

// One cursor line over one area.
void _DrawCursorSegment(VELMCANVAS canvas, const CursorStyle &style, const _VELMRECT &area, int x, bool shown)
{
    if (area.height <= 0) return;
    const uint32_t color = shown ? style.active : style.inactive;
    fill_translucent(canvas, make_rect(x, area.top, 1, area.height), color);
    if (shown && style.shadow) {
        VELMCANVAS_SelectShadowColor(canvas, 0);
        VELMCANVAS_ShadowRect(canvas, x, area.top, 1, area.height, kShadowReach, 0x33AFF000u);
    }
}

} // namespace

int draw_cursor(VELMDRAW d, const VELMCURSOR &cursor)
{
    if (!cursor_wanted(d, cursor)) return 1;
    const int column = column_of(&d->mainBase, static_cast<double>(cursor.position));
    if (column < 0 || column >= d->columns) return 1;
    const CursorStyle style = style_of(d, cursor);
    const int x = d->display.left + column;
    const _VELMRECT band = overlay_band(d);
    const int reach = style.shadow ? kShadowReach : 0;
    const _VELMRECT covered = intersect(make_rect(x - reach, band.top, 1 + 2 * reach, band.height), band);
    VELMCANVAS_SaveOverlayRect(d->canvas, &covered);
    mark_dirty_rect(d, covered);

    const bool edit = cursor.kind != 1;
    _VELMRECT &slider = d->overlay.cursorSliders[edit ? 0 : 1];
    if (style.slider) {
        slider = handle_rect(d, Img_TopCursorSlider, x);
        VELMCANVAS_SaveOverlayRect(d->canvas, &slider);
    }

    VELMCANVAS_SetDrawArea(d->canvas, &band);
    for (int i = 0; i < d->laneCount; ++i) {
        const Lane &lane = d->lanes[static_cast<size_t>(i)];
        if (active_main_lane(lane)) _DrawCursorSegment(d->canvas, style, lane.area, x, cursor.shown);
    }
    if ((d->state->viewFlags & 0x1800u) != 0x1800u)
        for (int t = 0; t < VELM_MAX_CUSTOM_TRACKS; ++t)
            if (track_shown(d, t))
                _DrawCursorSegment(d->canvas, style, d->trackAreas[static_cast<size_t>(t)], x, cursor.shown);
    VELMCANVAS_ClearDrawArea(d->canvas);

    if (cursor.shown && style.slider && !is_empty(slider)) {
        VELMCANVAS_PasteImage(d->canvas, edit ? Img_BottomCursorSlider : Img_RedCursorSlider, slider.left,
                              slider.top);
        mark_dirty_rect(d, slider);
    }
    return 1;
}

int draw_navigator_cursor(VELMDRAW d, const VELMCURSOR &cursor)
{
    if (!d->navigatorPosition || !cursor_enabled(d, cursor)) return 1;
    const int column = column_of(&d->navigatorBase, static_cast<double>(cursor.position));
    if (column < 0 || column >= d->columns) return 1;
    const CursorStyle style = style_of(d, cursor);
    const int x = d->display.left + column;
    const int reach = style.shadow ? kShadowReach : 0;
    const _VELMRECT covered =
        intersect(make_rect(x - reach, d->navigator.top, 1 + 2 * reach, d->navigator.height), d->navigator);
    VELMCANVAS_SaveOverlayRect(d->canvas, &covered);
    mark_dirty_rect(d, covered);
    VELMCANVAS_SetDrawArea(d->canvas, &d->navigator);
    for (int i = 0; i < d->laneCount; ++i) {
        const Lane &lane = d->lanes[static_cast<size_t>(i)];
        if (lane.shown && lane.kind == VELMDRAW_LANE_NAVIGATOR)
            _DrawCursorSegment(d->canvas, style, lane.area, x, cursor.shown);
    }
    VELMCANVAS_ClearDrawArea(d->canvas);
    return 1;
}

} // namespace velm::view
