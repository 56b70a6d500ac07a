// The value scales beside the lanes: sample values, decibels, percent and
// normalised amplitudes for waveforms, hertz or Mels for spectrograms, with
// their horizontal grid lines through the waveform lanes.
#include <algorithm>
#include <cmath>
#include <cstdio>
#include <span>

#include "core/document_internal.hpp"
#include "render/view/drawer_internal.hpp"
#include "render/view/velmscales.h"

using namespace velm::view;

namespace {

constexpr double kSampleSteps[] = {500000, 200000, 100000, 50000, 20000, 10000, 7500, 5000, 2500, 2000, 1000,
                                   500,    250,    200,    100,   50,    25,    20,   10,   5,    2,    1};
constexpr double kPercentSteps[] = {50, 25, 20, 10, 5, 2.5, 2, 1, 0.75, 0.5, 0.25, 0.2, 0.1, 0.05, 0.025, 0.01, 0.005};
constexpr double kAmplitudeSteps[] = {1, 0.5, 0.25, 0.2, 0.1, 0.05, 0.025, 0.01, 0.005, 0.0025, 0.002, 0.001};
constexpr double kHertzSteps[] = {500000, 200000, 100000, 50000, 20000, 10000, 5000, 2500, 2000, 1000, 500,
                                  250,    200,    100,    50,    25,    20,    10,   5,    2,    1};
constexpr double kMelSteps[] = {2000, 1000, 500, 250, 200, 100, 50, 25, 20, 10, 5};

// Pixels between grid lines aimed at.
constexpr double kTarget = 30.0;

// The candidate times a decade whose span is closest to the target; the
// decade grows while the first candidate spans less than twice the target.
// pixels_per_unit is the span of one unit of the kind.
double closest_step(std::span<const double> steps, double pixels_per_unit)
{
    if (!(pixels_per_unit > 0.0) || !std::isfinite(pixels_per_unit)) return 0.0;
    double m = 1.0;
    for (int decade = 0; decade < 30 && std::abs(steps[0] * m * pixels_per_unit - kTarget) < kTarget; ++decade) m *= 10.0;
    double best = 0.0, distance = 0.0;
    for (const double c : steps) {
        const double d = std::abs(c * m * pixels_per_unit - kTarget);
        if (best == 0.0 || d <= distance) {
            best = c * m;
            distance = d;
        }
    }
    return best;
}

int bits_per_sample(VELMDRAW d)
{
    _audio_format format{};
    return AUDIOSIGNAL_GetFormat(d->document->signal, &format) && format.bitsPerSample > 0 ? format.bitsPerSample : 16;
}

// Amplitude of one unit of a waveform kind.
double unit_amplitude(int kind, int bits)
{
    switch (kind) {
    case VELMDRAW_VERT_SAMPLE: return 1.0 / std::ldexp(1.0, std::clamp(bits, 1, 64) - 1);
    case VELMDRAW_VERT_PERCENT: return 0.01;
    case VELMDRAW_VERT_DECIBEL:
    case VELMDRAW_VERT_NORMALIZED: return 1.0;
    default: return 0.0;
    }
}

const Lane *scale_lane(VELMDRAW d, int lane)
{
    if (!d || !d->laidOut || lane < 0 || lane >= d->laneCount) return nullptr;
    return &d->lanes[static_cast<size_t>(lane)];
}

// Row inside the lane of a value in lane units (amplitude or scale units).
double lane_row(const Lane &lane, double value)
{
    const double extent = lane.rangeTop - lane.rangeBottom;
    if (extent == 0.0) return lane.area.height / 2.0;
    return (lane.rangeTop - value) * lane.area.height / extent;
}

// Label of a waveform value given in the kind's units.  Decibels are those of
// the amplitude; silence reads "-inf".
void wave_label(int kind, double value, double amplitude, char *text, size_t size)
{
    switch (kind) {
    case VELMDRAW_VERT_PERCENT:
        std::snprintf(text, size, value >= 0.0 ? "+%5.1f" : "-%5.1f", std::abs(value));
        break;
    case VELMDRAW_VERT_NORMALIZED: std::snprintf(text, size, "%+3.2f", value); break;
    case VELMDRAW_VERT_SAMPLE: std::snprintf(text, size, "%+g", value); break;
    case VELMDRAW_VERT_DECIBEL:
        if (amplitude == 0.0)
            std::snprintf(text, size, "-inf");
        else
            std::snprintf(text, size, "%.1f", 20.0 * std::log10(std::abs(amplitude)));
        break;
    default: std::snprintf(text, size, "##error##"); break;
    }
}

const char *unit_name(const Lane &lane, int vert_kind, int spec_kind)
{
    if (lane.kind == VELMDRAW_LANE_SPECTROGRAM) return spec_kind == VELMDRAW_SPEC_MELS ? "Mels" : "Hz";
    static const char *const names[] = {"smpl", "dB", "perc", "norm"};
    return vert_kind >= 0 && vert_kind <= 3 ? names[vert_kind] : "##error##";
}

// The values of a lane's scale: multiples of the step from the bottom of its
// range to the top, in the kind's units, with their amplitude or lane unit.
struct ScaleValues {
    double first = 0.0, step = 0.0, unit = 1.0, top = 0.0;
};

ScaleValues scale_values(VELMDRAW d, int index, const Lane &lane)
{
    ScaleValues v;
    if (lane.kind == VELMDRAW_LANE_SPECTROGRAM) {
        v.step = VELMDRAW_CalculateSpecScaleStep(d, index, d->state->spectralScaleKind);
    } else {
        const int bits = bits_per_sample(d);
        v.step = VELMDRAW_CalculateVertScaleStep(d, index, d->state->vertScaleKind, bits);
        v.unit = unit_amplitude(d->state->vertScaleKind, bits);
    }
    if (v.step <= 0.0 || v.unit <= 0.0) return ScaleValues{};
    const double low = std::min(lane.rangeBottom, lane.rangeTop) / v.unit;
    v.top = std::max(lane.rangeBottom, lane.rangeTop) / v.unit;
    // Round multiples of the step, so that zero is one of them.
    v.first = std::ceil(low / v.step - 1e-9) * v.step;
    return v;
}

// At most this many lines per lane: a range far wider than the lane is
// drawn without most of them rather than looped over forever.
constexpr int kMaxLines = 4096;

void draw_lane_scale(VELMDRAW d, int index, const Lane &lane, int text_height)
{
    const _VELMRECT &r = lane.vertScale;
    const VELMDRAWCONFIG &c = d->config;
    const VELMSTATE *s = d->state;
    if (!(s->viewFlags & 0x1000000u)) {
        VELMCANVAS_SelectColor(d->canvas, c.scaleBgBrush);
        VELMCANVAS_FillRect(d->canvas, r.left, r.top, r.width, r.height, 0);
    }
    const int t = text_height, h = lane.area.height;
    if (t + 10 < r.height) VELMCANVAS_TextOut(d->canvas, r.left + 6, r.top + 1, unit_name(lane, s->vertScaleKind, s->spectralScaleKind));
    char text[64];
    const bool wave = lane.kind != VELMDRAW_LANE_SPECTROGRAM;
    if (wave && lane.zeroRow > 0 && lane.zeroRow < h && t + 3 < lane.zeroRow - t / 2) {
        wave_label(s->vertScaleKind, 0.0, 0.0, text, sizeof text);
        VELMCANVAS_TextOut(d->canvas, r.left + 6, r.top + lane.zeroRow - t / 2, text);
    }
    const ScaleValues v = scale_values(d, index, lane);
    if (v.step <= 0.0) return;
    VELMCANVAS_SelectColor(d->canvas, c.scaleTickPen);
    for (int k = 0; k < kMaxLines; ++k) {
        const double value = v.first + k * v.step;
        if (value > v.top + 1e-9 * v.step) break;
        const double row = lane_row(lane, value * v.unit);
        const int y = static_cast<int>(std::lround(row));
        // Minor ticks at fifths of the way to the next value.
        const double next = lane_row(lane, (value + v.step) * v.unit);
        for (int i = 1; i <= 4; ++i) {
            const int minor = static_cast<int>(std::lround(row + (next - row) * i / 5.0));
            if (minor >= 0 && minor < h)
                draw_hline(d->canvas, r.left + 1, r.left + 2, r.top + minor);
        }
        if (y < t / 2 || y > h - t / 2) continue;
        draw_hline(d->canvas, r.left + 1, r.left + 4, r.top + y);
        // Zero has its own label.
        const bool zero = wave && std::abs(value) < 1e-9 * v.step;
        if (zero || t + 3 >= y - t / 2) continue;
        if (wave)
            wave_label(s->vertScaleKind, value, value * v.unit, text, sizeof text);
        else
            std::snprintf(text, sizeof text, "%d", static_cast<int>(std::lround(value)));
        VELMCANVAS_TextOut(d->canvas, r.left + 6, r.top + y - t / 2, text);
    }
    VELMCANVAS_ShadowRect(d->canvas, r.left, r.top, 1, r.height, 15, 0x3FBFF000u);
}

} // namespace

double VELMDRAW_CalculateVertScaleStep(VELMDRAW d, int lane, int kind, int bits)
{
    const Lane *l = scale_lane(d, lane);
    if (!l || l->kind == VELMDRAW_LANE_SPECTROGRAM) return 0.0;
    const double extent = std::abs(l->rangeTop - l->rangeBottom);
    if (extent <= 0.0) return 0.0;
    const double ppu = l->area.height / extent * unit_amplitude(kind, bits);
    switch (kind) {
    case VELMDRAW_VERT_SAMPLE: return closest_step(kSampleSteps, ppu);
    case VELMDRAW_VERT_PERCENT: return closest_step(kPercentSteps, ppu);
    case VELMDRAW_VERT_DECIBEL:
    case VELMDRAW_VERT_NORMALIZED: return closest_step(kAmplitudeSteps, ppu);
    default: return 0.0;
    }
}

double VELMDRAW_CalculateSpecScaleStep(VELMDRAW d, int lane, int kind)
{
    const Lane *l = scale_lane(d, lane);
    if (!l || l->kind != VELMDRAW_LANE_SPECTROGRAM) return 0.0;
    const double extent = std::abs(l->rangeTop - l->rangeBottom);
    if (extent <= 0.0) return 0.0;
    const double ppu = l->area.height / extent;
    switch (kind) {
    case VELMDRAW_SPEC_HERTZ: return closest_step(kHertzSteps, ppu);
    case VELMDRAW_SPEC_MELS: return closest_step(kMelSteps, ppu);
    default: return 0.0;
    }
}

int VELMDRAW_ConvertVertScaleKindRealYtoDisplayY(VELMDRAW d, int lane, int kind, double value)
{
    const Lane *l = scale_lane(d, lane);
    if (!l || l->kind == VELMDRAW_LANE_SPECTROGRAM) return -1;
    const double unit = unit_amplitude(kind, bits_per_sample(d));
    if (unit <= 0.0) return -1;
    return static_cast<int>(std::lround(lane_row(*l, value * unit)));
}

int VELMDRAW_ConvertSpecScaleKindRealYtoDisplayY(VELMDRAW d, int lane, int kind, double value)
{
    const Lane *l = scale_lane(d, lane);
    if (!l || l->kind != VELMDRAW_LANE_SPECTROGRAM || (kind != VELMDRAW_SPEC_HERTZ && kind != VELMDRAW_SPEC_MELS))
        return -1;
    // The lane's range is in the units of the kind it was laid out with.
    const bool lane_mels = d->state->spectralScaleKind == VELMDRAW_SPEC_MELS;
    const double hertz = kind == VELMDRAW_SPEC_MELS ? DSPBUTIL_Mels2Freq(value) : value;
    return static_cast<int>(std::lround(lane_row(*l, lane_mels ? DSPBUTIL_Freq2Mels(hertz) : hertz)));
}

int VELMDRAW_DrawVertScale(VELMDRAW d)
{
    if (!d || !d->canvas || !d->state || !d->laidOut) return 0;
    if (d->state->viewFlags & 0x8u) return 1;
    const _VELMCANVASFONT font = canvas_font(d->config.scaleFont);
    VELMCANVAS_SelectFont(d->canvas, &font);
    VELMCANVAS_SelectFontColor(d->canvas, d->config.scaleFont.color);
    const int t = VELMCANVAS_TextHeight(d->canvas, "0");
    for (int i = 0; i < d->laneCount; ++i) {
        const Lane &lane = d->lanes[static_cast<size_t>(i)];
        const _VELMRECT &r = lane.vertScale;
        if (!lane.shown || lane.kind == VELMDRAW_LANE_NAVIGATOR || r.width <= 0 || r.height <= 0) continue;
        draw_lane_scale(d, i, lane, t);
        mark_dirty(d, r.left, r.top, r.right, r.bottom);
    }
    return 1;
}

int VELMDRAW_DrawVertScaleGrid(VELMDRAW d, int first, int last)
{
    if (!d || !d->canvas || !d->state || !d->laidOut) return 0;
    if (d->state->viewFlags & 0x400u) return 1;
    first = std::max(first, 0);
    last = std::min(last, d->columns - 1);
    if (last < first) return 1;
    const _VELMCANVASFONT font = canvas_font(d->config.scaleFont);
    VELMCANVAS_SelectFont(d->canvas, &font);
    const int t = VELMCANVAS_TextHeight(d->canvas, "0");
    for (int i = 0; i < d->laneCount; ++i) {
        const Lane &lane = d->lanes[static_cast<size_t>(i)];
        if (!lane.shown || !lane.drawsScale) continue;
        const _VELMRECT &a = lane.area;
        const int x1 = a.left + first, x2 = a.left + last;
        if (lane.zeroRow > 0 && lane.zeroRow < a.height) {
            VELMCANVAS_SelectColor(d->canvas, lane.active ? d->config.zeroLinePen : d->config.inactiveZeroLinePen);
            draw_hline(d->canvas, x1, x2, a.top + lane.zeroRow);
        }
        const ScaleValues v = scale_values(d, i, lane);
        if (v.step <= 0.0) continue;
        VELMCANVAS_SelectColor(d->canvas, d->config.scaleLinePen);
        for (int k = 0; k < kMaxLines; ++k) {
            const double value = v.first + k * v.step;
            if (value > v.top + 1e-9 * v.step) break;
            const int y = static_cast<int>(std::lround(lane_row(lane, value * v.unit)));
            if (y < t / 2 || y > a.height - t / 2) continue;
            draw_hline(d->canvas, x1, x2, a.top + y);
        }
    }
    return 1;
}
