// One frame: the change mask decides between overlays only, a scroll by
// whole columns and a full redraw of the memory target.
#include <algorithm>
#include <cmath>

#include "core/document_internal.hpp"
#include "core/state_internal.hpp"
#include "core/velmqueries.h"
#include "core/velmnavigation.h"
#include "control/velmcontrol.h"
#include "render/view/drawer_internal.hpp"
#include "render/view/overlay_internal.hpp"
#include "render/view/velmoverlays.h"
#include "render/view/velmscales.h"

using namespace velm::view;

void velm::view::mark_dirty(VELMDRAW d, int32_t left, int32_t top, int32_t right, int32_t bottom)
{
    // Overlays may reach past the view's edges; only the view is reported.
    if (d->state) {
        left = std::max(left, 0);
        top = std::max(top, 0);
        right = std::min(right, d->state->drawWidth - 1);
        bottom = std::min(bottom, d->state->drawHeight - 1);
    }
    if (right < left || bottom < top) return;
    d->dirty.left = std::min(d->dirty.left, left);
    d->dirty.top = std::min(d->dirty.top, top);
    d->dirty.right = std::max(d->dirty.right, right);
    d->dirty.bottom = std::max(d->dirty.bottom, bottom);
}

namespace {

constexpr uint32_t kEverything = 0x80001C18u;
// Larger views cannot be painted (the canvas back-end's limit) and would only
// size the buffers absurdly.
constexpr int32_t kMaxViewSize = 32767;

void reset_dirty(VELMDRAW d)
{
    d->dirty = _VELMRECT{d->state ? d->state->drawWidth : 0, d->state ? d->state->drawHeight : 0, 0, 0, 0, 0};
}

bool main_lane(const Lane &lane)
{
    return lane.shown && lane.kind != VELMDRAW_LANE_NAVIGATOR;
}

// Runs fn on every shown lane (only the main ones when asked).
template <typename Fn>
int for_lanes(VELMDRAW d, bool main_only, Fn fn)
{
    int ok = 1;
    for (int i = 0; i < d->laneCount; ++i) {
        Lane &lane = d->lanes[static_cast<size_t>(i)];
        if (!lane.shown || (main_only && !main_lane(lane))) continue;
        if (!fn(lane)) ok = 0;
    }
    return ok;
}

int process_lanes(VELMDRAW d, int first, int last, bool main_only)
{
    return for_lanes(d, main_only, [&](Lane &lane) {
        return lane.kind == VELMDRAW_LANE_SPECTROGRAM ? process_spectral(d, &lane, first, last)
                                                      : process_wave(d, &lane, first, last);
    });
}

int draw_lanes(VELMDRAW d, int first, int last, bool main_only)
{
    join_workers(d);
    return for_lanes(d, main_only, [&](Lane &lane) {
        return lane.kind == VELMDRAW_LANE_SPECTROGRAM ? draw_spectral(d, &lane, first, last)
                                                      : draw_wave(d, &lane, first, last);
    });
}

int draw_lane_backgrounds(VELMDRAW d, int first, int last, bool main_only)
{
    const int ok = for_lanes(d, main_only, [&](Lane &lane) { return draw_wave_background(d, &lane, first, last); });
    return VELMDRAW_DrawCustomCanvas(d, first, last) && ok;
}

// The "default" track's regions over the lanes, then every track's regions.
int draw_regions(VELMDRAW d, int first, int last)
{
    const int ok = VELMDRAW_DrawRegionsAndCues(d, first, last);
    return VELMDRAW_DrawCustomTrackRegions(d, first, last) && ok;
}

// The slow steps for columns first .. last on the memory target.
int draw_columns(VELMDRAW d, int first, int last, bool main_only)
{
    int ok = process_lanes(d, first, last, main_only);
    ok &= VELMDRAW_UpdateVisibleRegion(d);
    ok &= draw_horz_scale(d);
    ok &= draw_lane_backgrounds(d, first, last, main_only);
    ok &= draw_scale_grids(d, first, last);
    ok &= draw_regions(d, first, last);
    ok &= draw_lanes(d, first, last, main_only);
    return ok;
}

bool prepare_bases(VELMDRAW d)
{
    const int64_t length = AUDIOSIGNAL_NumSamples(d->document->signal);
    const VELMSTATE *s = d->state;
    bool ok = prepare_time_base(&d->mainBase, static_cast<double>(s->viewBegin), static_cast<double>(s->viewEnd),
                                d->columns, length);
    if (d->navigatorPosition)
        ok = prepare_time_base(&d->navigatorBase, 0.0, static_cast<double>(std::max<int64_t>(length, 1)), d->columns,
                               length) && ok;
    return ok;
}

int full_redraw(VELMDRAW d, uint32_t mask)
{
    int ok = VELMDRAW_UpdateDrawAreas(d, 0x80000000u);
    ok &= prepare_bases(d) ? 1 : 0;
    ok &= VELMDRAW_UpdateVisibleRegion(d);
    VELMCANVAS_SelectTarget(d->canvas, VELMCANVASTARGET_MEMORY);
    const int last = d->columns - 1;
    ok &= process_lanes(d, 0, last, false);
    if (mask & 0x400u) ok &= VELMDRAW_DrawBackground(d);
    if (mask & 0x8u) ok &= VELMDRAW_DrawVertScale(d);
    ok &= VELMDRAW_DrawVertCustomTracks(d);
    if (mask & 0x10u) ok &= draw_horz_scale(d);
    ok &= draw_lane_backgrounds(d, 0, last, false);
    ok &= draw_scale_grids(d, 0, last);
    ok &= draw_regions(d, 0, last);
    ok &= draw_lanes(d, 0, last, false);
    ok &= VELMDRAW_DrawChannelSeparators(d);
    ok &= VELMDRAW_FullRedrawFromMemory(d);
    VELMCANVAS_SelectTarget(d->canvas, VELMCANVASTARGET_OUTPUT);
    ok &= VELMDRAW_DrawRegionOnFocus(d, 0, last);
    return ok;
}

// Output target after a restore from memory: the selections, the quick box
// while one is being dragged (it is not an overlay: only a restore erases
// it) and the navigator's state over the slow picture.
int draw_selection_overlays(VELMDRAW d)
{
    int ok = draw_selection_list(d, d->state, 0, d->columns - 1);
    const VELMQUICKBOX &box = d->state->quickBox;
    if (box.width != 0 && box.height != 0) ok &= VELMDRAW_ShowQuickBox(d, &box);
    return VELMDRAW_DrawNavigatorState(d) && ok;
}

// The output from memory, the held region's tint and the selections over it.
int redraw_focus_layers(VELMDRAW d)
{
    int ok = VELMDRAW_FullRedrawFromMemory(d);
    ok &= VELMDRAW_DrawRegionOnFocus(d, 0, d->columns - 1);
    return draw_selection_overlays(d) && ok;
}

// Whether the tint of a held region shows over the lanes.  It saves what it
// covers, so the restore at the start of every frame takes it away.
bool region_held(VELMDRAW d)
{
    return d->state->focusedRegion.region && VELMCONTROL_IsGrabbingRegion(d);
}

// The partial or full redraw that the change mask asks for; `drawn` is the
// state the pixels showed before.
int dispatch(VELMDRAW d, uint32_t mask, const VELMSTATE *drawn)
{
    VELMCANVAS canvas = d->canvas;
    int ok = 1;
    uint32_t work = mask & ~0x1000u;
    // While a region is held its tint is drawn again in every frame, under
    // the selections as a full redraw puts it.
    const bool held = region_held(d);
    if (held && (work == 0 || work == 0x2 || work == 0x4 || work == 0x6 || work == 0x42)) work = 0x40;
    switch (work) {
    case 0: break;
    case 0x2:
        ok &= update_selecting(d, drawn, d->state);
        ok &= VELMDRAW_UpdateNavigatorSelecting(d);
        break;
    case 0x4: case 0x6: case 0x42:
        ok &= VELMDRAW_FullRedrawFromMemory(d);
        ok &= draw_selection_overlays(d);
        break;
    case 0x40: ok &= redraw_focus_layers(d); break;
    case 0x80: case 0x100: case 0x180: {
        // -1: the region also shows over the lanes, which only a full redraw repaints.
        // Otherwise the region layers copy columns of the tracks out of the
        // memory target and mark just those dirty: the selections over them
        // are drawn there again.
        const _VELMRECT before = d->dirty;
        reset_dirty(d);
        const int redrawn = VELMDRAW_UpdateChangedRegion(d, &d->state->focusedRegion);
        const _VELMRECT copied = d->dirty;
        d->dirty = before;
        if (copied.right >= copied.left) mark_dirty(d, copied.left, copied.top, copied.right, copied.bottom);
        if (redrawn >= 0) {
            ok &= redrawn;
            if (held)
                ok &= redraw_focus_layers(d);
            else if (copied.right >= copied.left)
                ok &= draw_track_selections(d, d->state, copied.left - d->display.left,
                                            copied.right - d->display.left);
            break;
        }
        ok &= full_redraw(d, kEverything);
        ok &= draw_selection_overlays(d);
        break;
    }
    case 0x200:
        ok &= VELMDRAW_FullRedrawFromMemory(d);
        ok &= draw_selection_overlays(d);
        break;
    case 0x4000: ok &= VELMDRAW_DrawVertScale(d); break;
    case 0x811: case 0x813:
        ok &= VELMDRAW_UpdateViewWindow(d);
        ok &= VELMDRAW_UpdateNavigator(d);
        ok &= VELMDRAW_DrawChannelSeparators(d);
        ok &= VELMDRAW_FullRedrawFromMemory(d);
        VELMCANVAS_SelectTarget(canvas, VELMCANVASTARGET_OUTPUT);
        ok &= VELMDRAW_DrawRegionOnFocus(d, 0, d->columns - 1);
        ok &= draw_selection_overlays(d);
        break;
    default:
        ok &= full_redraw(d, mask);
        ok &= draw_selection_overlays(d);
        break;
    }
    VELMCANVAS_SelectTarget(canvas, VELMCANVASTARGET_OUTPUT);
    return ok;
}

// What every frame draws last on the output target, each piece saving the
// pixels it covers.
int draw_overlay_tail(VELMDRAW d, bool empty)
{
    const VELMSTATE *s = d->state;
    OverlayLayout &layout = d->overlay;
    int ok = 1;
    layout.zoomLimitHandles = {};
    if (!empty) ok &= draw_selecting_label(d, s);
    if (VELMAUDIO_HasZoomLimit(d->document) && (s->controls & 0x2u)) {
        ok &= draw_zoom_limit_bar(d, 1);
        ok &= draw_zoom_limit_bar(d, 2);
    }
    ok &= draw_gain_buttons(d);
    layout.cursorSliders = {};
    if (empty) {
        layout.selectionSliderCount = 0;
        VELMCANVAS_SetAlphaFactor(d->canvas, 0.5f);
        VELMCANVAS_SelectColor(d->canvas, 0);
        VELMCANVAS_FillRect(d->canvas, 0, 0, s->drawWidth, s->drawHeight, 0);
        VELMCANVAS_SetAlphaFactor(d->canvas, 1.0f);
        mark_dirty(d, 0, 0, s->drawWidth - 1, s->drawHeight - 1);
        return ok;
    }
    ok &= VELMDRAW_DrawZoomButton(d);
    ok &= VELMDRAW_DrawCustomTrackRegionShadows(d);
    ok &= VELMDRAW_DrawSelectionsSlider(d, 0, d->columns - 1);
    ok &= draw_navigator_cursor(d, s->cursor);
    ok &= draw_navigator_cursor(d, s->playCursor);
    ok &= draw_cursor(d, s->cursor);
    ok &= draw_cursor(d, s->playCursor);
    return ok;
}

// The view-size notification, once per change.
void notify_size(VELMDRAW d)
{
    int32_t width = d->state->drawWidth, height = d->state->drawHeight;
    BLNOTIFY_SendEvent(d->document->dispatcher, nullptr, 0, 0x20031, &width, &height);
}

} // namespace

int VELMDRAW_ProcessAudioToDisplay(VELMDRAW d, int first, int last)
{
    return d && d->laidOut ? process_lanes(d, first, last, false) : 0;
}

int VELMDRAW_DrawAudioForm(VELMDRAW d, int first, int last)
{
    return d && d->canvas && d->laidOut ? draw_lanes(d, first, last, false) : 0;
}

int VELMDRAW_DrawCanvas(VELMDRAW d, int first, int last)
{
    return d && d->canvas && d->laidOut ? draw_lane_backgrounds(d, first, last, false) : 0;
}

int VELMDRAW_FullRedrawFromMemory(VELMDRAW d)
{
    if (!d || !d->canvas || !d->state) return 0;
    const int ok = VELMCANVAS_CopyCanvas(d->canvas, VELMCANVASTARGET_MEMORY, VELMCANVASTARGET_OUTPUT);
    mark_dirty(d, 0, 0, d->state->drawWidth - 1, d->state->drawHeight - 1);
    return ok;
}

int VELMDRAW_RestoreMemoryCanvas(VELMDRAW d, int first, int last)
{
    if (!d || !d->canvas || !d->laidOut) return 0;
    first = std::max(first, 0);
    last = std::min(last, d->columns - 1);
    if (last < first) return 1;
    const _VELMRECT &a = d->display;
    const int x = a.left + first, width = last - first + 1;
    mark_dirty(d, x, a.top, x + width - 1, a.bottom);
    return VELMCANVAS_MoveBlock2(d->canvas, VELMCANVASTARGET_MEMORY, x, a.top, width, a.height, VELMCANVASTARGET_OUTPUT,
                                 x, a.top);
}

int VELMDRAW_MoveAudioCanvas(VELMDRAW d, int from, int to, int count)
{
    if (!d || !d->canvas || !d->laidOut || count <= 0) return 0;
    // The lanes and custom tracks move as one band; the separators between
    // them are the same in every column.
    int32_t bottom = d->lanesArea.bottom;
    for (int t = 0; t < VELM_MAX_CUSTOM_TRACKS; ++t)
        if (d->trackShown[static_cast<size_t>(t)]) bottom = std::max(bottom, d->trackAreas[static_cast<size_t>(t)].bottom);
    const _VELMRECT &a = d->display;
    int ok = VELMCANVAS_MoveBlock(d->canvas, a.left + from, a.top, count, bottom - a.top + 1, a.left + to, a.top);
    for (int i = 0; i < d->laneCount; ++i) {
        Lane &lane = d->lanes[static_cast<size_t>(i)];
        if (lane.kind == VELMDRAW_LANE_NAVIGATOR) continue;
        if (lane.wave) ok &= move_wave_data(lane.wave, from, to, count);
        if (lane.spectral) ok &= move_spectral_data(lane.spectral, from, to, count);
    }
    return ok;
}

int VELMDRAW_UpdateViewWindow(VELMDRAW d)
{
    if (!d || !d->canvas || !d->state || !d->laidOut) return 0;
    VELMTIMEBASE &base = d->mainBase;
    const VELMSTATE *s = d->state;
    const int columns = d->columns;
    const double length = static_cast<double>(s->viewEnd - s->viewBegin);
    const bool same_grid = base.count == columns && columns > 1 && base.step > 0.0 &&
                           std::abs(length / (columns - 1) - base.step) < 1e-9 * base.step;
    const int64_t k = same_grid ? std::llround(std::round(static_cast<double>(s->viewBegin)) / base.step) - base.origin : 0;
    if (!same_grid || k == 0 || std::llabs(k) >= columns) return full_redraw(d, kEverything);

    VELMCANVAS_SelectTarget(d->canvas, VELMCANVASTARGET_MEMORY);
    int ok = VELMDRAW_UpdateDrawAreas(d, 0x80000000u);
    offset_time_base(&base, static_cast<int>(k), static_cast<double>(s->viewBegin), static_cast<double>(s->viewEnd),
                     AUDIOSIGNAL_NumSamples(d->document->signal));
    const int shift = static_cast<int>(k);
    // Besides the new columns, the column beside them and the two at each
    // end are drawn again: their outline joined other neighbours before.
    if (shift > 0) {
        ok &= VELMDRAW_MoveAudioCanvas(d, shift, 0, columns - shift);
        ok &= draw_columns(d, std::max(columns - shift - 1, 0), columns - 1, true);
        ok &= draw_columns(d, 0, 1, true);
    } else {
        ok &= VELMDRAW_MoveAudioCanvas(d, 0, -shift, columns + shift);
        ok &= draw_columns(d, 0, std::min(-shift, columns - 1), true);
        ok &= draw_columns(d, columns - 2, columns - 1, true);
    }
    return ok;
}

int VELMDRAW_UpdateDraw(VELMDRAW d, VELMCANVAS canvas, const VELMSTATE *state, _VELMRECT *changed)
{
    if (!d || !canvas || !state || state->drawWidth <= 0 || state->drawHeight <= 0 ||
        state->drawWidth > kMaxViewSize || state->drawHeight > kMaxViewSize)
        return 0;
    MutexLock(d->lock);
    VELMSTATE *copy = VELMSTATE_CreateCopy(nullptr, state);
    if (!copy) {
        MutexUnlock(d->lock);
        return 0;
    }
    VELMSTATE *old = d->state;
    uint32_t mask;
    if (canvas != d->canvas || VELMCANVAS_GetDrawObject(canvas) != d) {
        mask = kEverything;
        VELMCANVAS_SetDrawObject(canvas, d);
        d->canvas = canvas;
    } else {
        mask = VELMSTATE_EvalChanges(d->document, copy, old);
    }
    mask |= copy->changes;
    // An edit changes the samples under an unchanged view; when only the
    // regions changed since the last frame, the region layers redraw what
    // the change touched.
    AUDIOSIGNAL *signal = d->document->signal;
    const uint64_t change_time = VELMAUDIO_GetChangeTime(d->document);
    const uint64_t samples_time = AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_SAMPLES);
    const bool regions_only = change_time == AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_REGIONS) &&
                              samples_time == d->drawnSamplesTime;
    if (change_time != d->drawnChangeTime && !regions_only) mask |= 0x80000000u;
    d->drawnChangeTime = change_time;
    d->drawnSamplesTime = samples_time;
    const bool size_changed = !old || old->drawWidth != copy->drawWidth || old->drawHeight != copy->drawHeight;
    if (!old || !d->laidOut) mask |= kEverything;

    int width = 0, height = 0;
    VELMCANVAS_GetMaxDimension(canvas, &width, &height);
    width = std::max(width, copy->drawWidth);
    int ok = reserve_time_base(d->pool, &d->mainBase, width) && reserve_time_base(d->pool, &d->navigatorBase, width);

    d->state = copy;
    VELMCANVAS_SetAlphaFactor(canvas, 1.0f);
    VELMCANVAS_UseLowProfile(canvas, d->config.lowGraphicsDetails);
    VELMCANVAS_SelectTarget(canvas, VELMCANVASTARGET_OUTPUT);
    reset_dirty(d);
    _VELMRECT overlay{};
    if (VELMCANVAS_GetOverlayRect(canvas, &overlay) && overlay.width > 0 && overlay.height > 0)
        mark_dirty(d, overlay.left, overlay.top, overlay.left + overlay.width - 1, overlay.top + overlay.height - 1);
    VELMCANVAS_RestoreOverlay(canvas);

    const bool empty = AUDIOSIGNAL_NumSamples(d->document->signal) <= 0 && (copy->viewFlags & 0x100000u);
    ok &= dispatch(d, mask, old);
    ok &= draw_overlay_tail(d, empty);

    if (changed) {
        const _VELMRECT &r = d->dirty;
        *changed = r.right >= r.left && r.bottom >= r.top
                       ? make_rect(r.left, r.top, r.right - r.left + 1, r.bottom - r.top + 1)
                       : _VELMRECT{};
    }
    reset_dirty(d);
    if (old) VELMSTATE_Destroy(old);
    velm::refresh_top_parent(d->state);
    if (size_changed) notify_size(d);
    VELMCONTROL_UpdateMouseOverObject(d);
    MutexUnlock(d->lock);
    if (!ok) BLDEBUG_Log(0, "VELMDRAW_UpdateDraw: Update operation failed in one or more steps!");
    return ok ? 1 : 0;
}
