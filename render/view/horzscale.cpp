// The horizontal (time) scale: tick steps that keep labels readable at every
// zoom, the ticks of the view, the scale strip and the vertical grid lines.
#include <algorithm>
#include <cmath>

#include "core/document_internal.hpp"
#include "core/velmtimeconv.h"
#include "render/view/drawer_internal.hpp"
#include "render/view/velmscales.h"

using namespace velm::view;

namespace {

// Steps in units (samples or frames), largest first.
constexpr double kUnitSteps[] = {50000, 25000, 20000, 10000, 5000, 2500, 2000, 1000, 500, 250,
                                 200,   100,   50,    25,    20,   10,   5,    2,    1};
// Steps in milliseconds, largest first.
constexpr double kTimeSteps[] = {
    90000000, 72000000, 36000000, 18000000, 9800000, 7200000, 3600000, 1800000, 1200000, 600000, 450000, 300000,
    150000,   120000,   90000,    60000,    30000,   20000,   15000,   10000,   5000,    2000,   1000,   500,
    250,      200,      100,      50,       25,      20,      10,      5,       2,       1,      0.5,    0.2,
    0.1,      0.05,     0.02,     0.01,     0.005,   0.002,   0.001,   0.0005,  0.0002,  0.0001};

bool is_frame_kind(int kind)
{
    return kind == VELMDRAW_HORZ_FRAME || kind == VELMDRAW_HORZ_FRAME_VIEW;
}

bool is_view_kind(int kind)
{
    return kind >= VELMDRAW_HORZ_SAMPLE_VIEW && kind <= VELMDRAW_HORZ_FRAME_VIEW;
}

// The smallest candidate (each step times unit) at least min_spacing columns
// wide, or 0 when none is.
double smallest_wide_enough(const double *steps, size_t count, double unit, double pixels_per_sample,
                            double min_spacing)
{
    double chosen = 0.0;
    for (size_t i = 0; i < count; ++i) {
        const double step = steps[i] * unit;
        if (step * pixels_per_sample >= min_spacing) chosen = step;
    }
    return chosen;
}

// Unit tables grow by decades until a step of 100000 units covers 80
// columns; when even the largest step is then too narrow for its label, the
// next decade is tried, so that labels never overlap.
double unit_step(double unit, double pixels_per_sample, double min_spacing)
{
    double m = 1.0;
    for (int decade = 0; decade < 18; ++decade) {
        const double q = m * 100000.0 * unit * pixels_per_sample;
        if (std::abs(q - 40.0) < 40.0) {
            m *= 10.0;
            continue;
        }
        const double step = smallest_wide_enough(kUnitSteps, std::size(kUnitSteps), m * unit, pixels_per_sample,
                                                  min_spacing);
        if (step > 0.0) return step;
        m *= 10.0;
    }
    return 0.0;
}

// Frame steps of the table may be halved while they stay above one frame and
// wide enough.
double refine_frame_step(double step, double frame, double pixels_per_sample, double min_spacing)
{
    while (step / 2.0 > frame && step / 2.0 * pixels_per_sample >= min_spacing) step /= 2.0;
    return step;
}

void select_scale_font(VELMDRAW d)
{
    const _VELMCANVASFONT font = canvas_font(d->config.scaleFont);
    VELMCANVAS_SelectFont(d->canvas, &font);
    VELMCANVAS_SelectFontColor(d->canvas, d->config.scaleFont.color);
}

// The label of a sample.  The document's own text of the _view kinds counts
// from its zoom lower limit, not from where these ticks start, so they are
// written in the absolute kind from the scale's origin.
bool tick_label(VELMDRAW d, int64_t sample, char *text, int size)
{
    if (!is_view_kind(d->state->horzScaleKind)) return VELMAUDIO_SampleToTimeString(d->document, sample, text, size);
    const VELMSTATE *s = d->state;
    const int64_t reference = std::max({s->viewEnd, s->zoomUpperLimit, AUDIOSIGNAL_NumSamples(d->document->signal)});
    return VELMAUDIO_RealSampleToTimeString(d->document, sample - d->horzTicks.origin, reference, text, size);
}

double min_spacing(VELMDRAW d)
{
    char text[64] = "";
    tick_label(d, d->state->viewEnd, text, sizeof text);
    return (VELMCANVAS_TextWidth(d->canvas, text) + 12) / 2.0;
}

// Four minor ticks at fifths of the way right of x, strictly inside the
// columns first .. last.
void minor_ticks(VELMDRAW d, double x, double spacing, int first, int last)
{
    const _VELMRECT &strip = d->horzScale;
    for (int i = 1; i <= 4; ++i) {
        const int column = static_cast<int>(std::floor(x + i * spacing / 5.0 + 0.5));
        if (column > first && column < last)
            draw_vline(d->canvas, strip.left + column, strip.top + 1, strip.top + 2);
    }
}

bool grid_track(VELMDRAW d, int track)
{
    return d->trackShown[static_cast<size_t>(track)] && !(d->state->tracks[track].options & 1);
}

} // namespace

namespace velm::view {

int64_t horz_scale_step(int kind, double rate, double columns, double view_length, double min_spacing)
{
    if (!(rate > 0.0) || !(columns > 0.0) || !(view_length > 0.0)) return 0;
    const double pps = columns / view_length;
    double step;
    switch (kind) {
    case VELMDRAW_HORZ_SAMPLE:
    case VELMDRAW_HORZ_SAMPLE_VIEW:
        step = unit_step(1.0, pps, min_spacing);
        if (step <= 0.0) step = 100000.0;
        break;
    case VELMDRAW_HORZ_TIME:
    case VELMDRAW_HORZ_TIME_VIEW:
        step = smallest_wide_enough(kTimeSteps, std::size(kTimeSteps), rate / 1000.0, pps, min_spacing);
        if (step <= 0.0) step = 1.8e8 * rate / 1000.0;
        break;
    case VELMDRAW_HORZ_FRAME:
    case VELMDRAW_HORZ_FRAME_VIEW:
        step = unit_step(rate, pps, min_spacing);
        step = step > 0.0 ? refine_frame_step(step, rate, pps, min_spacing) : 100000.0;
        break;
    default: return 0;
    }
    return std::max<int64_t>(1, static_cast<int64_t>(step + 0.5));
}

} // namespace velm::view

int VELMDRAW_HorzScalePrepareDisplayData(VELMDRAW d)
{
    if (!d || !d->canvas || !d->state || !d->laidOut) return 0;
    HorzScale &h = d->horzTicks;
    h.count = h.spacing = 0;
    const VELMSTATE *s = d->state;
    const int kind = s->horzScaleKind;
    h.origin = is_view_kind(kind) ? s->viewBegin : 0;
    select_scale_font(d);
    const double spacing = min_spacing(d);
    const double rate = is_frame_kind(kind) ? static_cast<double>(VELMAUDIO_ScaleFrameLength(d->document))
                                            : AUDIOSIGNAL_SampleRate(d->document->signal);
    h.step = horz_scale_step(kind, rate, d->columns, static_cast<double>(s->viewEnd - s->viewBegin), spacing);
    if (h.step <= 0) return 0;
    const int64_t step = h.step;
    const auto start = static_cast<double>(s->viewBegin - h.origin), end = static_cast<double>(s->viewEnd - h.origin);
    const int64_t first = step * (std::llround(start / step) - 1);
    const int64_t last = step * std::llround((end + step) / step);
    for (int64_t position = first; position < last && h.count < kMaxHorzTicks; position += step) {
        // A tick on a column boundary must land on that column whether the
        // time base was built for this window or shifted to it.
        const double x =
            std::floor(VELMDRAW_ConvertRealXtoDisplayX(d, static_cast<double>(h.origin + position)) + 1e-6);
        if (x < -4.0 * spacing) continue;
        if (x >= d->columns) break;
        h.ticks[static_cast<size_t>(h.count++)] = HorzTick{static_cast<int32_t>(x), h.origin + position,
                                                           static_cast<uint8_t>(position % (2 * step) == 0)};
    }
    if (h.count >= 2) h.spacing = h.ticks[1].x - h.ticks[0].x;
    const HorzTick &tail = h.ticks[static_cast<size_t>(std::max<int64_t>(h.count - 1, 0))];
    h.ticks[static_cast<size_t>(h.count)] =
        h.count ? HorzTick{static_cast<int32_t>(tail.x + h.spacing), tail.sample + step, 0} : HorzTick{};
    return 1;
}

int64_t VELMDRAW_GetHorzScaleStep(VELMDRAW d)
{
    return d && d->laidOut ? d->horzTicks.step : 0;
}

int VELMDRAW_HorzScaleGetDisplayXPos(VELMDRAW d, int64_t sample)
{
    if (!d) return -1;
    const HorzScale &h = d->horzTicks;
    if (h.count <= 0 || h.step <= 0) return -1;
    const HorzTick &front = h.ticks[0], &back = h.ticks[static_cast<size_t>(h.count - 1)];
    if (sample < front.sample || sample > back.sample) return -1;
    const double f = static_cast<double>(sample - front.sample) / static_cast<double>(h.step);
    const auto index = static_cast<int64_t>(f);
    if (index >= h.count) return -1;
    return static_cast<int>(h.ticks[static_cast<size_t>(index)].x + (f - static_cast<double>(index)) * h.spacing);
}

int VELMDRAW_DrawHorzScale(VELMDRAW d, int first, int last)
{
    if (!d || !d->canvas || !d->state || !d->laidOut) return 0;
    const uint32_t f = d->state->viewFlags;
    if (f & 0x4u) return 1;
    first = std::max(first, 0);
    last = std::min(last, d->columns - 1);
    if (last < first) return 1;
    const _VELMRECT &strip = d->horzScale;
    const VELMDRAWCONFIG &c = d->config;
    const int left = strip.left + first, width = last - first + 1;
    VELMCANVAS_SelectColor(d->canvas, c.scaleTickPen);
    draw_hline(d->canvas, left, left + width - 1, strip.top);
    if (!(f & 0x1000000u)) {
        VELMCANVAS_SelectColor(d->canvas, c.scaleBgBrush);
        VELMCANVAS_FillRect(d->canvas, left, strip.top + 1, width, strip.height - 1, 0);
        VELMCANVAS_ShadowRect(d->canvas, left, strip.top, width, 1, 15, 0x3F7FF000u);
    }
    select_scale_font(d);
    const HorzScale &h = d->horzTicks;
    // Only these columns are drawn, so that a scroll may redraw a few of them
    // without labels of ticks further left being painted twice.
    const _VELMRECT clip = make_rect(left, strip.top + 1, width, strip.height - 1);
    VELMCANVAS_SetDrawArea(d->canvas, &clip);
    VELMCANVAS_SelectColor(d->canvas, c.scaleTickPen);
    if (h.count > 0) minor_ticks(d, h.ticks[0].x - static_cast<double>(h.spacing), static_cast<double>(h.spacing), first, last);
    for (int64_t i = 0; i < h.count; ++i) {
        const HorzTick &tick = h.ticks[static_cast<size_t>(i)];
        if (tick.x > last) break;
        const int x = strip.left + tick.x;
        draw_vline(d->canvas, x, strip.top, strip.top + 2);
        if (tick.major) {
            draw_vline(d->canvas, x, strip.top + 2, strip.top + 8);
            char text[64] = "";
            if (tick_label(d, tick.sample, text, sizeof text))
                VELMCANVAS_TextOut(d->canvas, x + 4, strip.top + 5, text);
        }
        minor_ticks(d, tick.x, h.ticks[static_cast<size_t>(i + 1)].x - tick.x, first, last);
    }
    VELMCANVAS_ClearDrawArea(d->canvas);
    mark_dirty(d, strip.left + first, strip.top, strip.left + last, strip.bottom);
    return 1;
}

int VELMDRAW_DrawHorzScaleGrid(VELMDRAW d, int first, int last)
{
    if (!d || !d->canvas || !d->state || !d->laidOut) return 0;
    const uint32_t f = d->state->viewFlags;
    if (f & 0x200u) return 1;
    VELMCANVAS_SelectColor(d->canvas, d->config.scaleLinePen);
    const HorzScale &h = d->horzTicks;
    for (int64_t i = 0; i < h.count; ++i) {
        const int32_t column = h.ticks[static_cast<size_t>(i)].x;
        if (column < first || column > last) continue;
        for (int l = 0; l < d->laneCount; ++l) {
            const Lane &lane = d->lanes[static_cast<size_t>(l)];
            if (!lane.shown || !lane.drawsGrid || lane.area.height <= 0) continue;
            draw_vline(d->canvas, lane.area.left + column, lane.area.top, lane.area.bottom);
        }
        if (f & 0x800u) continue;
        for (int t = 0; t < VELM_MAX_CUSTOM_TRACKS; ++t) {
            if (!grid_track(d, t)) continue;
            const _VELMRECT &a = d->trackAreas[static_cast<size_t>(t)];
            draw_vline(d->canvas, a.left + column, a.top, a.bottom);
        }
    }
    return 1;
}
