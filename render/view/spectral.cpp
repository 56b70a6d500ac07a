// Spectrogram display data: one power spectrum per column as 16-bit levels,
// and the 8-bit image drawn through the view's colour map.
#include <algorithm>
#include <cmath>
#include <cstring>

#include "core/document_internal.hpp"
#include "core/velmqueries.h"
#include "render/view/drawer_internal.hpp"

using namespace velm::view;

namespace {

constexpr int kMaxFftLength = 1 << 16;

// Scratch space of one computation; the lane's single worker owns it.
struct SpectralScratch {
    float *buffer;
    float *spectrum;
};

SpectralScratch scratch_of(SpectralData *s)
{
    auto *base = reinterpret_cast<float *>(s->weights + s->fftLength);
    return SpectralScratch{base, base + s->fftLength};
}

bool allocate(SpectralData *s, int capacity)
{
    const size_t n = static_cast<size_t>(s->fftLength);
    const size_t cells = static_cast<size_t>(s->bins) * static_cast<size_t>(capacity);
    s->capacity = capacity;
    // window, weights, work buffer and spectrum in one block.
    s->window = static_cast<float *>(BLMEM_New(s->pool, 4 * n * sizeof(float)));
    s->weights = s->window ? s->window + n : nullptr;
    s->levels = static_cast<uint16_t *>(BLMEM_New(s->pool, cells * sizeof(uint16_t)));
    s->image = static_cast<uint8_t *>(BLMEM_New(s->pool, cells));
    return s->window && s->levels && s->image;
}

void make_window(SpectralData *s)
{
    std::fill_n(s->window, s->fftLength, 0.0f);
    DSPB_CreateWindow(s->windowKind, s->window, s->windowLength);
    s->windowNorm = DSPB_GetWindowNormFactor(s->window, s->windowLength);
}

void release(SpectralData *s)
{
    if (!s) return;
    if (s->fft) DSPB_FFTProcDestroy(s->fft);
    BLMEM pool = s->pool;
    s->~SpectralData();
    BLMEM_DisposeMemDescr(pool);
}

SpectralData *create_new(const VELMSTATE *state, int capacity)
{
    const VELMSPECTRALCONFIG &config = state->spectral;
    const int n = config.fftLength;
    if (n < 2 || n > kMaxFftLength) return nullptr;
    BLMEM pool = BLMEM_CreateMemDescrEx("Spectral Data Channel", 0, 0);
    if (!pool) return nullptr;
    auto *s = new (BLMEM_New(pool, sizeof(SpectralData))) SpectralData;
    s->pool = pool;
    s->fftLength = n;
    s->bins = n / 2 + 1;
    s->dynamicRange = config.dynamicRange;
    s->preEmphasis = config.preEmphasis;
    s->windowLength = std::clamp(config.windowSize, 1, n);
    s->normalize = config.normalize;
    s->windowKind = config.windowType;
    s->scaleKind = state->spectralScaleKind;
    if (!allocate(s, capacity)) {
        release(s);
        return nullptr;
    }
    make_window(s);
    DSPB_CreatePreEmphAdjust(s->weights, n, s->preEmphasis);
    return s;
}

void *spectral_body(void *arguments)
{
    auto *order = static_cast<WorkOrder *>(arguments);
    Lane *lane = order->lane;
    SpectralData *s = lane->spectral;
    AUDIOSIGNAL *signal = order->drawer->document->signal;
    const VELMTIMEBASE *base = lane->timeBase;
    const int last = std::min(order->last + 1, std::min(base->count, s->capacity - 1));
    const size_t stride = static_cast<size_t>(s->capacity);
    if (AUDIOSIGNAL_NumSamples(signal) <= 0) {
        std::fill_n(s->levels, stride * static_cast<size_t>(s->bins), uint16_t{0});
    } else {
        const SpectralScratch scratch = scratch_of(s);
        const double range = s->dynamicRange > 0.0 ? s->dynamicRange : 110.0;
        const double norm = s->windowNorm > 0.0 ? s->windowNorm : 1.0;
        for (int c = order->first; c <= last; ++c) {
            const auto start = static_cast<int64_t>(std::llround(base->positions[c] - s->windowLength / 2));
            std::fill_n(scratch.buffer, s->fftLength, 0.0f);
            AUDIOSIGNAL_GetChannelSamples(signal, lane->channel, start, scratch.buffer, s->windowLength);
            DSPB_ApplyWindow(s->window, scratch.buffer, s->windowLength);
            const int bins = DSPB_FFTProcExecutePSD(s->fft, scratch.buffer, scratch.spectrum);
            if (bins != s->bins || !DSPB_PSDtoDB(s->fftLength, scratch.spectrum, scratch.spectrum, s->weights, norm, range))
                std::fill_n(scratch.spectrum, s->bins, static_cast<float>(-range));
            for (int k = 0; k < s->bins; ++k) {
                const double level = 65535.0 * scratch.spectrum[k] / range + 65535.0;
                s->levels[static_cast<size_t>(s->bins - 1 - k) * stride + static_cast<size_t>(c)] =
                    static_cast<uint16_t>(std::clamp(std::lround(level), 0L, 65535L));
            }
        }
    }
    s->key = key_for(base, order->changeTime);
    s->dataStamp = std::max(BLtimeToBLtimeStamp(BLgetgmtime()), s->dataStamp + 1);
    if (order->threaded) ThreadChildNotifyExit(0);
    return nullptr;
}

// The source row of display row r (counted from the top) under the lane's
// scale: rows are spaced evenly in scale units, bins evenly in hertz.
int source_row(const Lane &lane, int bins, int r, int scale_kind)
{
    if (scale_kind != 1 || lane.nyquist <= 0.0) return r;
    const int from_bottom = bins - 1 - r;
    const double hertz = DSPBUTIL_Mels2Freq(from_bottom * lane.scaleTop / bins);
    const int bin = std::clamp(static_cast<int>(std::lround(hertz / lane.nyquist * bins)), 0, bins - 1);
    return bins - 1 - bin;
}

void build_image(const Lane &lane, SpectralData *s, int columns)
{
    const size_t stride = static_cast<size_t>(s->capacity);
    columns = std::min(columns, s->capacity);
    int lo = 0, range = 65535;
    if (s->normalize) {
        int low = 65535, high = 0;
        for (int r = 0; r < s->bins; ++r)
            for (int c = 0; c < columns; ++c) {
                const int v = s->levels[static_cast<size_t>(r) * stride + static_cast<size_t>(c)];
                low = std::min(low, v);
                high = std::max(high, v);
            }
        lo = low;
        range = high - low;
    }
    for (int r = 0; r < s->bins; ++r) {
        const uint16_t *source = s->levels + static_cast<size_t>(source_row(lane, s->bins, r, s->scaleKind)) * stride;
        uint8_t *row = s->image + static_cast<size_t>(r) * stride;
        for (int c = 0; c < columns; ++c)
            row[c] = range > 0 ? static_cast<uint8_t>(static_cast<double>(source[c] - lo) / range * 255.0) : 0;
    }
    s->imageStamp = s->dataStamp;
}

} // namespace

namespace velm::view {

SpectralData *create_spectral_data(VELMDRAW d, SpectralData *s, int capacity)
{
    capacity = (capacity + 15) / 16 * 16;
    const VELMSTATE *state = d->state;
    const VELMSPECTRALCONFIG &config = state->spectral;
    if (s && (s->fftLength != config.fftLength || s->capacity < capacity)) {
        release(s);
        s = nullptr;
    }
    if (!s) return create_new(state, capacity);
    const int window_length = std::clamp(config.windowSize, 1, s->fftLength);
    if (s->windowKind != config.windowType || s->windowLength != window_length) {
        s->windowKind = config.windowType;
        s->windowLength = window_length;
        make_window(s);
        s->dataStamp = 0;
    }
    if (s->preEmphasis != config.preEmphasis) {
        s->preEmphasis = config.preEmphasis;
        DSPB_CreatePreEmphAdjust(s->weights, s->fftLength, s->preEmphasis);
        s->dataStamp = 0;
    }
    if (s->dynamicRange != config.dynamicRange || s->normalize != config.normalize ||
        s->scaleKind != state->spectralScaleKind) {
        s->dynamicRange = config.dynamicRange;
        s->normalize = config.normalize;
        s->scaleKind = state->spectralScaleKind;
        s->dataStamp = 0;
    }
    return s;
}

void destroy_spectral_data(SpectralData *data)
{
    release(data);
}

int move_spectral_data(SpectralData *s, int from, int to, int count)
{
    if (!s || count <= 0 || from < 0 || to < 0 || from + count > s->capacity || to + count > s->capacity) return 0;
    const size_t stride = static_cast<size_t>(s->capacity);
    for (int r = 0; r < s->bins; ++r) {
        uint16_t *row = s->levels + static_cast<size_t>(r) * stride;
        std::memmove(row + to, row + from, sizeof(uint16_t) * static_cast<size_t>(count));
    }
    return 1;
}

int process_spectral(VELMDRAW d, Lane *lane, int first, int last)
{
    finish_worker(lane);
    SpectralData *s = lane->spectral;
    if (!s || !lane->timeBase->positions || lane->timeBase->count >= s->capacity) return 0;
    last = std::min(last, lane->timeBase->count - 1);
    if (first > last) return 1;
    if (s->dataStamp && key_matches(s->key, lane->timeBase, VELMAUDIO_GetChangeTime(d->document))) return 1;
    if (!s->fft) s->fft = DSPB_FFTProcCreate(s->fftLength);
    if (!s->fft) return 0;
    return run_order(d, lane, first, last, 1, spectral_body);
}

int draw_spectral(VELMDRAW d, Lane *lane, int, int)
{
    SpectralData *s = lane->spectral;
    const _VELMRECT &a = lane->area;
    if (!s || a.width <= 0 || a.height <= 0 || s->key.count <= 0) return 1;
    const int bins = s->bins;
    const double top = lane->scaleTop > 0.0 ? lane->scaleTop : 1.0;
    const int skip = lane->rangeBottom > 0.0 ? static_cast<int>(std::lround(lane->rangeBottom / top * bins)) : 0;
    int rows = bins - skip;
    if (lane->rangeTop < top) rows = std::max(1, static_cast<int>(std::lround(lane->rangeTop / top * bins - skip)));
    rows = std::clamp(rows, 1, bins - std::min(skip, bins - 1));
    if (s->imageStamp != s->dataStamp) build_image(*lane, s, s->key.count + 1);
    const VELMCOLORMAP *map = d->state->spectral.colorScheme ? d->state->spectral.colorScheme : &VELMCOLORMAP_GRAYSCALE;
    VELMCANVAS_SelectColorMap(d->canvas, map);
    VELMCANVAS_PutImage(d->canvas, a.left, a.top, a.width, a.height, s->image, s->capacity, bins,
                        VELMIMAGEFORMAT_INDEXED8, 0, std::min(skip, bins - 1), std::min(a.width, s->capacity), rows);
    if (!lane->active) {
        const float previous = VELMCANVAS_SetAlphaFactor(d->canvas, 0.3f);
        VELMCANVAS_SelectColor(d->canvas, 0xFFFFFF);
        VELMCANVAS_FillRect(d->canvas, a.left, a.top, a.width, a.height, 0);
        VELMCANVAS_SetAlphaFactor(d->canvas, 0.75f);
        VELMCANVAS_SelectColor(d->canvas, 0x000000);
        VELMCANVAS_FillRect(d->canvas, a.left, a.top, a.width, a.height, 0);
        VELMCANVAS_SetAlphaFactor(d->canvas, previous >= 0.0f ? previous : 1.0f);
    }
    return 1;
}

} // namespace velm::view
