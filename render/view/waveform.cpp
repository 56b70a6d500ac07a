// Waveform display data: exact column extremes (digital) or a spline through
// the samples (analog), and their drawing.
#include <algorithm>
#include <cmath>
#include <cstring>
#include <vector>

#include "core/document_internal.hpp"
#include "core/velmqueries.h"
#include "render/view/drawer_internal.hpp"

using namespace velm::view;

namespace {

// The column's row of a value in the lane's vertical range.
int32_t value_row(const Lane &lane, double value)
{
    const double extent = lane.rangeTop - lane.rangeBottom;
    if (extent == 0.0) return lane.zeroRow;
    return static_cast<int32_t>(lane.zeroRow - lane.area.height * value / extent);
}

void *digital_body(void *arguments)
{
    auto *order = static_cast<WorkOrder *>(arguments);
    Lane *lane = order->lane;
    WaveData *w = lane->wave;
    AUDIOSIGNAL *signal = order->drawer->document->signal;
    const double *position = lane->timeBase->positions;
    AUDIOPOINTER pointer;
    AUDIOSIGNAL_InitAudioPointer(signal, &pointer, static_cast<int64_t>(position[order->first]), lane->channel);
    for (int i = order->first; i <= order->last; ++i) {
        const auto begin = static_cast<int64_t>(position[i]);
        const int64_t n = static_cast<int64_t>(position[i + 1]) - begin;
        float low = 0.0f, high = 0.0f;
        if (n > 0)
            AUDIOSIGNAL_GetChannelMinMaxFromAudioPointer(signal, &pointer, n, &low, &high);
        else
            AUDIOSIGNAL_GetChannelMinMax(signal, lane->channel, begin, 1, &low, &high);
        w->first[i] = low;
        w->second[i] = high;
    }
    w->analog = 0;
    w->key = key_for(lane->timeBase, order->changeTime);
    if (order->threaded) ThreadChildNotifyExit(0);
    return nullptr;
}

void *analog_body(void *arguments)
{
    auto *order = static_cast<WorkOrder *>(arguments);
    Lane *lane = order->lane;
    WaveData *w = lane->wave;
    const VELMTIMEBASE *base = lane->timeBase;
    w->analog = 1;
    w->key = key_for(base, order->changeTime);
    const auto s0 = static_cast<int64_t>(lane->viewStart);
    const auto length = static_cast<int64_t>(lane->viewLength);
    const int64_t n = std::min<int64_t>(length + 2 * kSplineMargin, w->capacity + 2 * kSplineMargin);
    std::vector<float> xs(static_cast<size_t>(n)), ys(static_cast<size_t>(n)), d2(static_cast<size_t>(n));
    for (int64_t k = 0; k < n; ++k)
        xs[static_cast<size_t>(k)] =
            static_cast<float>(VELMDRAW_TBConvertRealXtoDisplayX(base, static_cast<double>(s0 - kSplineMargin + k)));
    AUDIOSIGNAL_GetChannelSamples(order->drawer->document->signal, lane->channel, s0 - kSplineMargin, ys.data(), n);
    if (DSPBSPLINE_Estimate(xs.data(), ys.data(), n, 0.0, 0.0, d2.data())) {
        for (int c = 0; c < base->count && c < w->capacity; ++c)
            w->first[c] = DSPBSPLINE_Interpolate(xs.data(), ys.data(), d2.data(), n, c);
    }
    // All the samples read, so that dots just outside the view are drawn
    // as a scrolled picture would show them.
    std::copy_n(ys.begin(), n, w->second);
    w->samples = static_cast<int32_t>(n);
    if (order->threaded) ThreadChildNotifyExit(0);
    return nullptr;
}

bool is_analog(VELMDRAW d, const Lane &lane)
{
    return lane.viewLength < d->columns;
}

void draw_envelope(VELMDRAW d, const Lane &lane, int first, int last, uint32_t fill)
{
    WaveData *w = lane.wave;
    const int k = last - first + 1;
    const int count = std::min(2 * (k + 4), w->polygonCapacity);
    const int half = count / 2;
    int *x = w->polygonX, *y = w->polygonY;
    const int32_t left = lane.area.left, top = lane.area.top;
    // Top half left to right, bottom half back.  Each end reaches two
    // pixels outside the columns: first the neighbour column's values (where
    // there is one), then the closing point at the same heights, so that
    // a strip drawn alone joins its neighbours exactly as a whole lane would
    // and the closing line stays outside the clip.
    const int computed = w->key.count;
    for (int j = 0; j < half; ++j) {
        const int column = first + j - 2;
        const int c = std::clamp(std::clamp(column, first - 1, last + 1), 0, computed - 1);
        x[j] = left + column;
        y[j] = top + value_row(lane, w->first[c]);
        x[count - 1 - j] = x[j];
        y[count - 1 - j] = top + value_row(lane, w->second[c]);
    }
    VELMCANVAS_DrawPolygon(d->canvas, x, y, count, fill);
}

void draw_curve(VELMDRAW d, const Lane &lane, int first, int last)
{
    WaveData *w = lane.wave;
    // One column more on each side: the clip keeps the strip, the curve
    // enters it as it would in a whole lane.
    first = std::max(first - 1, 0);
    last = std::min(last + 1, w->key.count - 1);
    const int count = std::min(last - first + 1, w->polygonCapacity);
    for (int j = 0; j < count; ++j) {
        w->polygonX[j] = lane.area.left + first + j;
        w->polygonY[j] = lane.area.top + value_row(lane, w->first[first + j]);
    }
    VELMCANVAS_DrawPolyline(d->canvas, w->polygonX, w->polygonY, count);
}

// Dots on the real samples once they are far enough apart.
void draw_sample_dots(VELMDRAW d, const Lane &lane, int first, int last, uint32_t fill)
{
    const auto length = static_cast<int64_t>(lane.viewLength);
    const int64_t spacing = d->columns / std::max<int64_t>(1, length);
    if (spacing < 9) return;
    const int size = spacing >= 17 ? 7 : 5;
    VELMCANVAS_SelectColor(d->canvas, fill);
    if (size == 7) VELMCANVAS_SelectShadowColor(d->canvas, fill);
    // Dots centred just outside the columns still reach into them.
    for (int j = 0; j < lane.wave->samples; ++j) {
        const double sample = lane.viewStart - kSplineMargin + j;
        const auto x = static_cast<int>(std::floor(VELMDRAW_TBConvertRealXtoDisplayX(lane.timeBase, sample)));
        if (x < first - size || x > last + size) continue;
        const int32_t y = value_row(lane, lane.wave->second[j]);
        VELMCANVAS_FillRect(d->canvas, lane.area.left + x - size / 2, lane.area.top + y - size / 2, size, size,
                            static_cast<uint32_t>(size - 1));
    }
    if (size == 7) VELMCANVAS_SelectShadowColor(d->canvas, 0);
}

} // namespace

namespace velm::view {

WaveData *create_wave_data(BLMEM pool, WaveData *old, int capacity)
{
    if (old && old->capacity >= capacity) return old;
    destroy_wave_data(pool, old);
    const size_t polygon = 2 * (static_cast<size_t>(capacity) + 4);
    const size_t values = static_cast<size_t>(capacity);
    const size_t bytes = sizeof(WaveData) + sizeof(float) * (2 * values + 2 * kSplineMargin) + 2 * sizeof(int32_t) * polygon;
    auto *block = static_cast<unsigned char *>(BLMEM_New(pool, bytes));
    if (!block) return nullptr;
    auto *w = new (block) WaveData;
    w->capacity = capacity;
    w->first = reinterpret_cast<float *>(block + sizeof(WaveData));
    w->second = w->first + capacity;
    w->polygonCapacity = static_cast<int32_t>(polygon);
    w->polygonX = reinterpret_cast<int32_t *>(w->second + capacity + 2 * kSplineMargin);
    w->polygonY = w->polygonX + polygon;
    return w;
}

void destroy_wave_data(BLMEM pool, WaveData *data)
{
    if (data) BLMEM_Delete(pool, data);
}

int move_wave_data(WaveData *data, int from, int to, int count)
{
    if (!data || count <= 0 || from < 0 || to < 0 || from + count > data->capacity || to + count > data->capacity) return 0;
    std::memmove(data->first + to, data->first + from, sizeof(float) * static_cast<size_t>(count));
    std::memmove(data->second + to, data->second + from, sizeof(float) * static_cast<size_t>(count));
    return 1;
}

int process_wave(VELMDRAW d, Lane *lane, int first, int last)
{
    finish_worker(lane);
    WaveData *w = lane->wave;
    if (!w || !lane->timeBase->positions || lane->timeBase->count > w->capacity) return 0;
    last = std::min(last, lane->timeBase->count - 1);
    if (first > last || key_matches(w->key, lane->timeBase, VELMAUDIO_GetChangeTime(d->document))) return 1;
    if (is_analog(d, *lane)) return run_order(d, lane, 0, lane->timeBase->count - 1, 19, analog_body);
    return run_order(d, lane, first, last, 19, digital_body);
}

int draw_wave(VELMDRAW d, Lane *lane, int first, int last)
{
    if (AUDIOSIGNAL_NumSamples(d->document->signal) <= 0) return 1;
    const VELMDRAWCONFIG &c = d->config;
    const uint32_t fill = lane->active ? c.digitalWaveformPen : c.inactiveWaveformPen;
    const uint32_t outline = lane->active ? c.digitalWaveformContourPen : c.inactiveWaveformContourPen;
    const _VELMRECT &a = lane->area;
    if (a.height < 4) {
        VELMCANVAS_SelectColor(d->canvas, c.digitalWaveformPen);
        return VELMCANVAS_FillRect(d->canvas, a.left + first, a.top, last - first + 1, a.height, 0);
    }
    WaveData *w = lane->wave;
    last = std::min(last, w ? w->key.count - 1 : -1);
    if (!w || last <= first) return 1;
    const _VELMRECT clip = make_rect(a.left + first, a.top, last - first + 1, a.height);
    if (!w->analog) {
        VELMCANVAS_SetDrawArea(d->canvas, &clip);
        VELMCANVAS_SelectColor(d->canvas, outline);
        draw_envelope(d, *lane, first, last, fill);
        VELMCANVAS_ClearDrawArea(d->canvas);
        return 1;
    }
    VELMCANVAS_SetDrawArea(d->canvas, &clip);
    VELMCANVAS_SelectColor(d->canvas, outline);
    draw_curve(d, *lane, first, last);
    if (lane->kind == VELMDRAW_LANE_WAVEFORM) draw_sample_dots(d, *lane, first, last, fill);
    VELMCANVAS_ClearDrawArea(d->canvas);
    return 1;
}

int draw_wave_background(VELMDRAW d, Lane *lane, int first, int last)
{
    const _VELMRECT &a = lane->area;
    first = std::max(first, 0);
    last = std::min(last, a.width - 1);
    if (last < first || a.height <= 0) return 1;
    if (d->state->viewFlags & 0x1000000u) {
        clear_rect(d->canvas, make_rect(a.left + first, a.top, last - first + 1, a.height));
        return 1;
    }
    const VELMDRAWCONFIG &c = d->config;
    const int32_t split = std::clamp(lane->zeroRow, 0, a.height);
    const int32_t x = a.left + first, width = last - first + 1;
    if (split > 0) {
        VELMCANVAS_SelectGradient(d->canvas, c.waveformBgGradientTopBegin, c.waveformBgGradientTopEnd);
        VELMCANVAS_FillVertGradientRect(d->canvas, x, a.top, width, split, 0);
    }
    if (split < a.height) {
        VELMCANVAS_SelectGradient(d->canvas, c.waveformBgGradientBottomBegin, c.waveformBgGradientBottomEnd);
        VELMCANVAS_FillVertGradientRect(d->canvas, x, a.top + split, width, a.height - split, 0);
    }
    return 1;
}

} // namespace velm::view
