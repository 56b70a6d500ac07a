// Helpers shared by the overlays.
#include <algorithm>
#include <cmath>

#include "core/document_internal.hpp"
#include "core/velmtimeconv.h"
#include "render/view/overlay_internal.hpp"

namespace velm::view {

int column_of(const VELMTIMEBASE *base, double sample)
{
    const double column = VELMDRAW_TBConvertRealXtoDisplayX(base, sample);
    if (!base || base->step <= 0.0 || !std::isfinite(column)) return -kColumnReach;
    const double reach = static_cast<double>(kColumnReach);
    return static_cast<int>(std::floor(std::clamp(column + 0.5, -reach, reach)));
}

int column_of_time(VELMDRAW d, const VELMTIMEBASE *base, double seconds)
{
    return column_of(base, static_cast<double>(VELMAUDIO_TimeToSample(d->document, seconds)));
}

bool active_main_lane(const Lane &lane)
{
    return lane.shown && lane.active &&
           (lane.kind == VELMDRAW_LANE_WAVEFORM || lane.kind == VELMDRAW_LANE_SPECTROGRAM);
}

bool track_shown(VELMDRAW d, int track)
{
    const auto t = static_cast<size_t>(track);
    return d->trackShown[t] && d->trackAreas[t].width > 0 && d->trackAreas[t].height > 0;
}

_VELMRECT overlay_band(VELMDRAW d)
{
    int32_t bottom = d->lanesArea.bottom;
    for (int t = 0; t < VELM_MAX_CUSTOM_TRACKS; ++t)
        if (track_shown(d, t)) bottom = std::max(bottom, d->trackAreas[static_cast<size_t>(t)].bottom);
    return make_rect(d->display.left, d->display.top, d->display.width, bottom - d->display.top + 1);
}

void fill_alpha(VELMCANVAS canvas, const _VELMRECT &r, uint32_t color, float alpha, int corner)
{
    if (r.width <= 0 || r.height <= 0) return;
    VELMCANVAS_SetAlphaFactor(canvas, std::clamp(alpha, 0.0f, 1.0f));
    VELMCANVAS_SelectColor(canvas, color & 0xFFFFFFu);
    VELMCANVAS_FillRect(canvas, r.left, r.top, r.width, r.height, static_cast<uint32_t>(corner));
    VELMCANVAS_SetAlphaFactor(canvas, 1.0f);
}

void fill_translucent(VELMCANVAS canvas, const _VELMRECT &r, uint32_t color, int corner)
{
    fill_alpha(canvas, r, color, static_cast<float>(color >> 24) / 255.0f, corner);
}

_VELMRECT handle_rect(VELMDRAW d, VELMCANVASIMAGE image, int x)
{
    const int width = VELMCANVAS_ImageWidth(d->canvas, image);
    const int height = VELMCANVAS_ImageHeight(d->canvas, image);
    // Without a horizontal scale there is no row for handles.
    if (width <= 0 || height <= 0 || is_empty(d->horzScale)) return _VELMRECT{};
    return make_rect(x - width / 2, d->horzScale.top - 1 - height / 2, width, height);
}

void paste_handle(VELMDRAW d, VELMCANVASIMAGE image, const _VELMRECT &r)
{
    if (is_empty(r)) return;
    VELMCANVAS_SaveOverlayRect(d->canvas, &r);
    VELMCANVAS_PasteImage(d->canvas, image, r.left, r.top);
    mark_dirty_rect(d, r);
}

void restore_band(VELMDRAW d, int first, int last)
{
    first = std::max(first, 0);
    last = std::min(last, d->columns - 1);
    if (last < first) return;
    const _VELMRECT band = overlay_band(d);
    const _VELMRECT r = make_rect(band.left + first, band.top, last - first + 1, band.height);
    VELMCANVAS_MoveBlock2(d->canvas, VELMCANVASTARGET_MEMORY, r.left, r.top, r.width, r.height,
                          VELMCANVASTARGET_OUTPUT, r.left, r.top);
    mark_dirty_rect(d, r);
}

void mark_dirty_rect(VELMDRAW d, const _VELMRECT &r)
{
    if (r.width > 0 && r.height > 0) mark_dirty(d, r.left, r.top, r.right, r.bottom);
}

_VELMRECT intersect(const _VELMRECT &a, const _VELMRECT &b)
{
    const int32_t left = std::max(a.left, b.left), top = std::max(a.top, b.top);
    const int32_t right = std::min(a.right, b.right), bottom = std::min(a.bottom, b.bottom);
    if (right < left || bottom < top || is_empty(a) || is_empty(b)) return _VELMRECT{};
    return make_rect(left, top, right - left + 1, bottom - top + 1);
}

bool is_empty(const _VELMRECT &r)
{
    return r.width <= 0 || r.height <= 0;
}

} // namespace velm::view
