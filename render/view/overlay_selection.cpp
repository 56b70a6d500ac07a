// Selections over the lanes and custom tracks: translucent columns with soft
// edges and separators, the selection being made redrawn column by column,
// and the rectangles the controller asks for.
#include <algorithm>

#include "core/document_internal.hpp"
#include "render/view/overlay_internal.hpp"
#include "render/view/velmoverlays.h"

namespace velm::view {
namespace {

constexpr int kSoftEdge = 10;

bool drawable(VELMDRAW d)
{
    return d && d->canvas && d->state && d->laidOut && d->columns > 0;
}

bool selections_hidden(VELMDRAW d)
{
    return (d->state->viewFlags & 0x800000u) != 0;
}

bool empty_selection(const VELMSELECTION &s)
{
    return s.begin == s.end;
}

// Draws the list over columns first .. last of one area.  Every shape is
// placed from the selections alone and only clipped to the columns, so that
// redrawing a few columns gives the same pixels as drawing all of them.
void draw_over_area(VELMDRAW d, const VELMTIMEBASE *base, const _VELMRECT &area, const VELMSELECTION *list,
                    int first, int last, int mode, bool soft_edges)
{
    if (area.width <= 0 || area.height <= 0) return;
    const _VELMRECT clip = make_rect(area.left + first, area.top, last - first + 1, area.height);
    VELMCANVAS canvas = d->canvas;
    VELMCANVAS_SetDrawArea(canvas, &clip);
    const uint32_t color = VELMDRAW_SelectTransparencyColor(d, mode);
    int limit = 0;            // first column a left soft edge may cover
    bool joined = false;      // the previous selection ended at a separator
    for (const VELMSELECTION *s = list; s && !empty_selection(*s); s = s->next) {
        const int b = column_of_time(d, base, s->begin), e = column_of_time(d, base, s->end);
        const VELMSELECTION *next = s->next && !empty_selection(*s->next) ? s->next : nullptr;
        const int next_begin = next ? column_of_time(d, base, next->begin) : d->columns;
        const bool tight = next && next_begin <= e + 2;
        const int x0 = std::max(first, b), x1 = std::min(last, e);
        if (x0 <= x1) fill_translucent(canvas, make_rect(area.left + x0, area.top, x1 - x0 + 1, area.height), color);
        if (soft_edges) {
            const int left = std::min(kSoftEdge, b - limit);
            if (!joined && left > 0)
                VELMCANVAS_DrawAlphaRect(canvas, area.left + b - left, area.top, left, area.height,
                                         VELMCANVASALPHA_DARKRIGHT);
            const int right = std::min(kSoftEdge, next_begin - e - 1);
            if (!tight && right > 0)
                VELMCANVAS_DrawAlphaRect(canvas, area.left + e + 1, area.top, right, area.height,
                                         VELMCANVASALPHA_DARKLEFT);
        }
        if (tight && e >= 0 && e < d->columns)
            fill_translucent(canvas, make_rect(area.left + e, area.top, 2, area.height), d->config.darkTransparency);
        limit = e + 1;
        joined = tight;
    }
    VELMCANVAS_ClearDrawArea(canvas);
    mark_dirty_rect(d, clip);
}

bool any_inactive_lane(VELMDRAW d)
{
    for (int i = 0; i < d->laneCount; ++i) {
        const Lane &lane = d->lanes[static_cast<size_t>(i)];
        if (lane.shown && lane.kind != VELMDRAW_LANE_NAVIGATOR && !lane.active) return true;
    }
    return false;
}

int draw_list(VELMDRAW d, const VELMSELECTION *list, int first, int last, int mode, bool soft_edges,
              bool tracks_only = false)
{
    if (selections_hidden(d) || !list) return 1;
    first = std::max(first, 0);
    last = std::min(last, d->columns - 1);
    if (last < first) return 1;
    for (int i = 0; i < d->laneCount && !tracks_only; ++i) {
        const Lane &lane = d->lanes[static_cast<size_t>(i)];
        if (active_main_lane(lane)) draw_over_area(d, &d->mainBase, lane.area, list, first, last, mode, soft_edges);
    }
    if ((d->state->viewFlags & 0x800u) || any_inactive_lane(d)) return 1;
    for (int t = 0; t < VELM_MAX_CUSTOM_TRACKS; ++t)
        if (track_shown(d, t) && !(d->state->tracks[t].options & 0x10u))
            draw_over_area(d, &d->mainBase, d->trackAreas[static_cast<size_t>(t)], list, first, last, mode,
                           soft_edges);
    return 1;
}

// The selection being made alone, as a list of one.
VELMSELECTION selecting_of(const VELMSTATE *state)
{
    VELMSELECTION one = state ? state->selecting : VELMSELECTION{};
    one.next = nullptr;
    return one;
}

int draw_selecting(VELMDRAW d, const VELMSTATE *state, int first, int last, bool tracks_only = false)
{
    const VELMSELECTION one = selecting_of(state);
    if (empty_selection(one) || last < first) return 1;
    return draw_list(d, &one, first, last, state->selectingKind, false, tracks_only);
}

// Columns first .. last lose the selection being made: back to the slow
// picture, then the committed selections again.
int restore_columns(VELMDRAW d, const VELMSTATE *state, int first, int last)
{
    if (last < first) return 1;
    restore_band(d, first, last);
    return draw_list(d, state->selections, first, last, 0, true);
}

} // namespace

int draw_selection_list(VELMDRAW d, const VELMSTATE *state, int first, int last)
{
    int ok = draw_list(d, state->selections, first, last, 0, true);
    ok &= draw_selecting(d, state, first, last);
    return ok;
}

int draw_track_selections(VELMDRAW d, const VELMSTATE *state, int first, int last)
{
    int ok = draw_list(d, state->selections, first, last, 0, true, true);
    ok &= draw_selecting(d, state, first, last, true);
    return ok;
}

int update_selecting(VELMDRAW d, const VELMSTATE *drawn, const VELMSTATE *state)
{
    const VELMSELECTION was = selecting_of(drawn), now = selecting_of(state);
    const bool had = !empty_selection(was), has = !empty_selection(now);
    const VELMTIMEBASE *base = &d->mainBase;
    const int b0 = had ? column_of_time(d, base, was.begin) : 0, e0 = had ? column_of_time(d, base, was.end) : -1;
    const int b1 = has ? column_of_time(d, base, now.begin) : 0, e1 = has ? column_of_time(d, base, now.end) : -1;
    if (!had) return has ? draw_selecting(d, state, b1, e1) : 1;
    if (!has) return restore_columns(d, state, b0, e0);
    // A flip over the anchor, a jump to columns the old one never met or a
    // new colour: start again from the slow picture.
    if (b0 == e1 || e0 == b1 || e1 < b0 || b1 > e0 || drawn->selectingKind != state->selectingKind) {
        int ok = restore_columns(d, state, b0, e0);
        return draw_selecting(d, state, b1, e1) && ok;
    }
    int ok = 1;
    if (e1 > e0) ok &= draw_selecting(d, state, e0 + 1, e1);
    if (e1 < e0) ok &= restore_columns(d, state, e1 + 1, e0);
    if (b1 < b0) ok &= draw_selecting(d, state, b1, b0 - 1);
    if (b1 > b0) ok &= restore_columns(d, state, b0, b1 - 1);
    return ok;
}

int draw_navigator_selections(VELMDRAW d)
{
    if (selections_hidden(d) || !d->navigatorPosition) return 1;
    const VELMSELECTION one = selecting_of(d->state);
    for (int i = 0; i < d->laneCount; ++i) {
        const Lane &lane = d->lanes[static_cast<size_t>(i)];
        if (!lane.shown || lane.kind != VELMDRAW_LANE_NAVIGATOR) continue;
        draw_over_area(d, &d->navigatorBase, lane.area, d->state->selections, 0, d->columns - 1, 0, true);
        if (!empty_selection(one))
            draw_over_area(d, &d->navigatorBase, lane.area, &one, 0, d->columns - 1, d->state->selectingKind, false);
    }
    return 1;
}

} // namespace velm::view

using namespace velm::view;

uint32_t VELMDRAW_SelectTransparencyColor(VELMDRAW drawer, int mode)
{
    if (!drawer) return 0;
    switch (mode) {
    case 1: case 2: return drawer->config.greenTransparency;
    case 3: return drawer->config.redTransparency;
    default: return drawer->config.defaultTransparency;
    }
}

int VELMDRAW_DrawSelections(VELMDRAW drawer, const VELMSELECTION *list, int first, int last, int mode)
{
    if (!drawable(drawer)) return 0;
    return draw_list(drawer, list, first, last, mode, mode == 0);
}

int VELMDRAW_UpdateSelections(VELMDRAW drawer, const VELMSTATE *state)
{
    if (!drawable(drawer) || !state) return 0;
    restore_band(drawer, 0, drawer->columns - 1);
    return draw_selection_list(drawer, state, 0, drawer->columns - 1);
}

int VELMDRAW_UpdateSelecting(VELMDRAW drawer, const VELMSTATE *state)
{
    if (!drawable(drawer) || !state) return 0;
    return update_selecting(drawer, drawer->state, state);
}

namespace {

// Columns of one selection cut to the view, over the lanes; false when it
// lies outside.
bool selection_columns(VELMDRAW d, const VELMSELECTION &s, int *first, int *last)
{
    *first = std::max(0, column_of_time(d, &d->mainBase, s.begin));
    *last = std::min(d->columns - 1, column_of_time(d, &d->mainBase, s.end));
    return !empty_selection(s) && *first <= *last;
}

_VELMRECT lanes_columns(VELMDRAW d, int first, int last)
{
    return make_rect(d->display.left + first, d->lanesArea.top, last - first + 1, d->lanesArea.height);
}

} // namespace

int VELMDRAW_SelectionRect(VELMDRAW drawer, _VELMRECT *out)
{
    if (!out) return 0;
    *out = _VELMRECT{};
    if (!drawable(drawer)) return 0;
    int lo = drawer->columns, hi = -1;
    for (const VELMSELECTION *s = drawer->state->selections; s && !empty_selection(*s); s = s->next) {
        int first = 0, last = 0;
        if (!selection_columns(drawer, *s, &first, &last)) continue;
        lo = std::min(lo, first);
        hi = std::max(hi, last);
    }
    if (hi < lo) return 0;
    *out = lanes_columns(drawer, lo, hi);
    return 1;
}

int VELMDRAW_SelectionDragAreaRect(VELMDRAW drawer, const VELMSELECTION *selection, _VELMRECT *out)
{
    if (!out) return 0;
    *out = _VELMRECT{};
    int first = 0, last = 0;
    if (!drawable(drawer) || !selection || !selection_columns(drawer, *selection, &first, &last)) return 0;
    *out = lanes_columns(drawer, first, last);
    return 1;
}

int VELMAUDIO_GetSelectionRect(_VELMRECT *out, VELMAUDIO doc)
{
    if (!out) return 0;
    *out = _VELMRECT{};
    if (!doc || !doc->renderer) return 0;
    return VELMDRAW_SelectionRect(doc->renderer, out);
}
