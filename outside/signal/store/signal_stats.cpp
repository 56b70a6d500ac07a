// Statistics accumulators: one pass per range, merged across ranges.
#include <algorithm>
#include <cmath>
#include <cstring>

#include "outside/signal/store/signal_internal.hpp"

using namespace velmsig;

namespace {

constexpr int kDefaultWindowMs = 50;

float to_db(double amplitude)
{
    return amplitude > 1e-10 ? float(20.0 * std::log10(amplitude)) : -200.0f;
}

void start_channel(AUDIOSIGNAL_CHANNELSTATSACC &acc)
{
    std::memset(&acc, 0, sizeof acc);
    acc.min = __builtin_inff();
    acc.max = -__builtin_inff();
    acc.window_min = __builtin_inf();
    acc.window_max = -__builtin_inf();
}

// Running state of one channel over one contiguous range.
class ChannelPass {
public:
    ChannelPass(AUDIOSIGNAL_CHANNELSTATSACC &acc, int64_t window, int64_t position)
        : acc_(acc), window_(window), position_(position)
    {
    }
    void add(const float *x, int64_t n)
    {
        for (int64_t i = 0; i < n; ++i, ++position_) {
            const float v = x[i];
            acc_.sum += v;
            acc_.sum2 += double(v) * v;
            if (v < acc_.min) {
                acc_.min = v;
                acc_.min_pos = position_;
            }
            if (v > acc_.max) {
                acc_.max = v;
                acc_.max_pos = position_;
            }
            if (std::fabs(v) >= 1.0f) ++acc_.clipped;
            if (started_ && (v < 0.0f) != (last_ < 0.0f)) ++acc_.zero_crossings;
            started_ = true;
            last_ = v;
            window_sum2_ += double(v) * v;
            if (++window_fill_ == window_) close_window();
        }
        acc_.count += n;
    }
    void finish()
    {
        if (window_fill_ > 0) close_window();
    }

private:
    void close_window()
    {
        const double rms = std::sqrt(window_sum2_ / double(window_fill_));
        ++acc_.windows;
        acc_.window_sum += rms;
        acc_.window_min = std::min(acc_.window_min, rms);
        acc_.window_max = std::max(acc_.window_max, rms);
        window_sum2_ = 0.0;
        window_fill_ = 0;
    }

    AUDIOSIGNAL_CHANNELSTATSACC &acc_;
    int64_t window_;
    int64_t position_;
    bool started_ = false;
    float last_ = 0.0f;
    double window_sum2_ = 0.0;
    int64_t window_fill_ = 0;
};

void merge_channel(AUDIOSIGNAL_CHANNELSTATSACC &total, const AUDIOSIGNAL_CHANNELSTATSACC &part)
{
    total.count += part.count;
    total.sum += part.sum;
    total.sum2 += part.sum2;
    if (part.min < total.min) {
        total.min = part.min;
        total.min_pos = part.min_pos;
    }
    if (part.max > total.max) {
        total.max = part.max;
        total.max_pos = part.max_pos;
    }
    total.clipped += part.clipped;
    total.zero_crossings += part.zero_crossings;
    total.windows += part.windows;
    total.window_sum += part.window_sum;
    total.window_min = std::min(total.window_min, part.window_min);
    total.window_max = std::max(total.window_max, part.window_max);
}

}  // namespace

extern "C" {

AUDIOSIGNAL_STATSACC AUDIOSIGNAL_CalculateStatStart(AUDIOSIGNAL *signal)
{
    AUDIOSIGNAL_STATSACC acc;
    std::memset(&acc, 0, sizeof acc);
    for (AUDIOSIGNAL_CHANNELSTATSACC &channel : acc.channel) start_channel(channel);
    if (signal) acc.sampleRate = AUDIOSIGNAL_SampleRate(signal);
    return acc;
}

int AUDIOSIGNAL_CalculateStatsAcc(AUDIOSIGNAL_STATSACC *acc, AUDIOSIGNAL *signal, const AUDIOSIGNAL_STATSRANGE *range)
{
    if (!acc || !signal || !range) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return 0;
    }
    const uint32_t mask = range->active_only ? AUDIOSIGNAL_GetActiveChannelMask(signal)
                                             : all_channels_mask(signal->format.numChannels);
    std::vector<int> channels;
    for (int c = 0; c < signal->format.numChannels && int(channels.size()) < AUDIOSIGNAL_STATS_CHANNELS; ++c) {
        if (mask >> c & 1u) channels.push_back(c);
    }
    const int rate = AUDIOSIGNAL_SampleRate(signal);
    const int window_ms = range->window > 0 ? range->window : kDefaultWindowMs;
    const int64_t window = std::max<int64_t>(1, int64_t(rate) * window_ms / 1000);
    if (acc->numChannels == 0 && acc->window == 0) {
        acc->numChannels = int32_t(channels.size());
        acc->sampleRate = rate;
        acc->window = int32_t(window);
    } else if (acc->numChannels != int32_t(channels.size())) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);  // accumulated over another channel layout
        return 0;
    }
    const std::vector<SegmentsPtr> segments = all_segments(*signal);
    int64_t begin = range->begin, end = range->end;
    clamp_range(segments[0]->length(), begin, end);
    std::vector<float> buffer(size_t(std::min(kChunkFrames, std::max<int64_t>(end - begin, 1))));
    for (size_t i = 0; i < channels.size(); ++i) {
        ChannelPass pass(acc->channel[i], window, begin);
        for (int64_t at = begin; at < end; at += int64_t(buffer.size())) {
            const int64_t n = std::min(int64_t(buffer.size()), end - at);
            if (!segments[size_t(channels[i])]->read(at, n, buffer.data())) {
                set_last_error(AUDIO_ERROR_READ);
                return 0;
            }
            pass.add(buffer.data(), n);
        }
        pass.finish();
    }
    return 1;
}

int AUDIOSIGNAL_MergeStatsAcc(AUDIOSIGNAL_STATSACC *total, const AUDIOSIGNAL_STATSACC *part)
{
    if (!total || !part) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return 0;
    }
    if (part->numChannels == 0 && part->window == 0) return 1;  // nothing accumulated
    if (total->numChannels == 0 && total->window == 0) {
        *total = *part;
        return 1;
    }
    if (total->numChannels != part->numChannels) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return 0;
    }
    for (int c = 0; c < total->numChannels; ++c) merge_channel(total->channel[c], part->channel[c]);
    return 1;
}

int AUDIOSIGNAL_GetStatisticsFromAcc(AUDIOSIGNAL_STATISTICS *out, AUDIOSIGNAL *signal, const AUDIOSIGNAL_STATSACC *acc)
{
    if (!out || !signal || !acc || acc->numChannels < 0 || acc->numChannels > AUDIOSIGNAL_STATS_CHANNELS) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return 0;
    }
    std::memset(out, 0, sizeof *out);
    out->numChannels = acc->numChannels;
    out->window = acc->sampleRate > 0 ? int32_t(int64_t(acc->window) * 1000 / acc->sampleRate) : 0;
    out->numSamples = acc->numChannels > 0 ? acc->channel[0].count : 0;
    for (int c = 0; c < acc->numChannels; ++c) {
        const AUDIOSIGNAL_CHANNELSTATSACC &a = acc->channel[c];
        AUDIOSIGNAL_CHANNELSTATS &s = out->channel[c];
        if (a.count == 0) {
            s.peak_db = s.rms_db = s.window_rms_min_db = s.window_rms_max_db = s.window_rms_mean_db = -200.0f;
            continue;
        }
        s.min = a.min;
        s.max = a.max;
        s.mean = a.sum / double(a.count);
        s.rms = std::sqrt(a.sum2 / double(a.count));
        const bool low_peak = std::fabs(a.min) > std::fabs(a.max);
        s.peak_db = to_db(low_peak ? std::fabs(a.min) : std::fabs(a.max));
        s.peak_pos = low_peak ? a.min_pos : a.max_pos;
        s.rms_db = to_db(s.rms);
        s.window_rms_min_db = to_db(a.window_min);
        s.window_rms_max_db = to_db(a.window_max);
        s.window_rms_mean_db = to_db(a.windows > 0 ? a.window_sum / double(a.windows) : 0.0);
        s.clipped = a.clipped;
        s.zero_crossings = a.zero_crossings;
    }
    return 1;
}

}  // extern "C"
