// Reading samples, exact extremes and sums.
#include <algorithm>
#include <cstdlib>
#include <cstring>

#include "outside/signal/store/signal_internal.hpp"

using namespace velmsig;

namespace {

// Visits [first, first + count) of a channel in pieces of at most one chunk.
template <typename Visit>
bool visit_samples(const Segments &segments, int64_t first, int64_t count, Visit visit)
{
    thread_local std::vector<float> buffer;
    buffer.resize(size_t(kChunkFrames));
    for (int64_t at = first; at < first + count; at += kChunkFrames) {
        const int64_t n = std::min(kChunkFrames, first + count - at);
        if (!segments.read(at, n, buffer.data())) return false;
        visit(buffer.data(), n);
    }
    return true;
}

// The part of [first, first + count) inside the signal, as first and count.
bool inside(int64_t length, int64_t &first, int64_t &count)
{
    int64_t end = first > AUDIOSIGNAL_END - count ? AUDIOSIGNAL_END : first + count;
    first = std::max<int64_t>(first, 0);
    end = std::min(end, length);
    count = end - first;
    return count > 0;
}

bool channel_sums(AUDIOSIGNAL *signal, int channel, int64_t first, int64_t count, double &sum, double &sum2)
{
    sum = sum2 = 0.0;
    if (!valid_channel(signal, channel) || count < 0) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return false;
    }
    SegmentsPtr segments = channel_segments(*signal, channel);
    if (!inside(segments->length(), first, count)) return true;
    const bool ok = visit_samples(*segments, first, count, [&](const float *x, int64_t n) {
        for (int64_t i = 0; i < n; ++i) {
            sum += x[i];
            sum2 += double(x[i]) * x[i];
        }
    });
    if (!ok) set_last_error(AUDIO_ERROR_READ);
    return ok;
}

}  // namespace

extern "C" {

int64_t AUDIOSIGNAL_GetChannelSamples(AUDIOSIGNAL *signal, int channel, int64_t first, float *out, int64_t count)
{
    if (!valid_channel(signal, channel) || !out || count < 0) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return -1;
    }
    SegmentsPtr segments = channel_segments(*signal, channel);
    int64_t from = first, n = count;
    if (!inside(segments->length(), from, n)) {
        std::fill(out, out + count, 0.0f);
        return 0;
    }
    const int64_t before = from - first;
    std::fill(out, out + before, 0.0f);
    std::fill(out + before + n, out + count, 0.0f);
    if (!segments->read(from, n, out + before)) {
        set_last_error(AUDIO_ERROR_READ);
        return -1;
    }
    return n;
}

int64_t AUDIOSIGNAL_GetMaskedSamplesWithStep(AUDIOSIGNAL *signal, uint32_t mask, int64_t first, float *out,
                                             int64_t count, int step)
{
    if (!signal || !out || count < 0) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return -1;
    }
    if (step == 0) step = 1;
    mask &= all_channels_mask(signal->format.numChannels);
    const std::vector<SegmentsPtr> segments = all_segments(*signal);
    const int64_t length = segments.empty() ? 0 : segments[0]->length();
    if (first < 0 || first >= length || mask == 0) return 0;
    // Frames until the signal's end in the direction of the step.
    const int64_t reach = step > 0 ? (length - 1 - first) / step + 1 : first / -int64_t(step) + 1;
    const int64_t frames = std::min(count, reach);
    const int width = __builtin_popcount(mask);
    // Pieces of at most one chunk of frames keep the buffer small.
    const int64_t piece = std::max<int64_t>(1, kChunkFrames / std::abs(int64_t(step)));
    thread_local std::vector<float> buffer;
    for (int64_t done = 0; done < frames; done += piece) {
        const int64_t n = std::min(piece, frames - done);
        const int64_t start = first + done * step, last = start + (n - 1) * step;
        const int64_t low = std::min(start, last), span = std::max(start, last) - low + 1;
        buffer.resize(size_t(span));
        int slot = 0;
        for (size_t c = 0; c < segments.size(); ++c) {
            if (!(mask >> c & 1u)) continue;
            if (!segments[c]->read(low, span, buffer.data())) {
                set_last_error(AUDIO_ERROR_READ);
                return -1;
            }
            float *to = out + done * width + slot++;
            for (int64_t k = 0; k < n; ++k) to[k * width] = buffer[size_t(start + k * step - low)];
        }
    }
    return frames;
}

int64_t AUDIOSIGNAL_GetMaskedSamples(AUDIOSIGNAL *signal, uint32_t mask, int64_t first, float *out, int64_t count)
{
    return AUDIOSIGNAL_GetMaskedSamplesWithStep(signal, mask, first, out, count, 1);
}

int AUDIOSIGNAL_InitAudioPointer(AUDIOSIGNAL *signal, AUDIOPOINTER *pointer, int64_t start, int channel)
{
    if (!valid_channel(signal, channel) || !pointer) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return 0;
    }
    pointer->signal = signal;
    pointer->position = start;
    pointer->channel = channel;
    pointer->cache_count = 0;
    pointer->cache_block = 0;
    pointer->cache_window = -1;
    return 1;
}

int64_t AUDIOSIGNAL_GetChannelMinMaxFromAudioPointer(AUDIOSIGNAL *signal, AUDIOPOINTER *pointer, int64_t count,
                                                     float *min, float *max)
{
    if (!pointer || pointer->signal != signal || !valid_channel(signal, pointer->channel) || count < 0) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return -1;
    }
    SegmentsPtr segments = channel_segments(*signal, pointer->channel);
    int64_t first = pointer->position, n = count;
    pointer->position = first > AUDIOSIGNAL_END - count ? AUDIOSIGNAL_END : first + count;
    MinMax result{0.0f, 0.0f};
    if (inside(segments->length(), first, n)) {
        WindowCache cache{pointer->cache_block, pointer->cache_window, pointer->cache_count, pointer->cache};
        result = segments->minmax(first, n, cache);
        pointer->cache_block = cache.chunk_id;
        pointer->cache_window = cache.window;
        pointer->cache_count = cache.count;
    } else {
        n = 0;
    }
    if (min) *min = result.min;
    if (max) *max = result.max;
    return n;
}

int AUDIOSIGNAL_GetChannelMinMax(AUDIOSIGNAL *signal, int channel, int64_t first, int64_t count, float *min,
                                 float *max)
{
    AUDIOPOINTER pointer;
    if (!AUDIOSIGNAL_InitAudioPointer(signal, &pointer, first, channel)) return 0;
    return AUDIOSIGNAL_GetChannelMinMaxFromAudioPointer(signal, &pointer, count, min, max) > 0 ? 1 : 0;
}

double AUDIOSIGNAL_GetChannelSamplesSum(AUDIOSIGNAL *signal, int channel, int64_t first, int64_t count)
{
    double sum, sum2;
    channel_sums(signal, channel, first, count, sum, sum2);
    return sum;
}

double AUDIOSIGNAL_GetChannelSamplesSum2(AUDIOSIGNAL *signal, int channel, int64_t first, int64_t count)
{
    double sum, sum2;
    channel_sums(signal, channel, first, count, sum, sum2);
    return sum2;
}

}  // extern "C"
