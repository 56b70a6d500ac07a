// Statistics, sums and extremes over a document's selections or its whole signal.
#include <cmath>
#include <cstdint>
#include <limits>

#include "core/document_internal.hpp"
#include "core/velmqueries.h"
#include "edit/velmselection.h"

namespace {

// The channel read for a channel argument counted from the lowest active channel; -1 when none.
int actual_channel(VELMAUDIO doc, int channel)
{
    const uint32_t mask = AUDIOSIGNAL_GetActiveChannelMask(doc->signal);
    if (mask == 0 || channel < 0) return -1;
    const int first = __builtin_ctz(mask);
    return channel < AUDIOSIGNAL_NumChannels(doc->signal) - first ? first + channel : -1;
}

// Calls f(begin, count) for each selection, or once for the whole signal.
template <typename F>
bool for_each_range(VELMAUDIO doc, F f)
{
    const VELMSELECTION *s = doc->state->selections;
    if (!s) return f(int64_t{0}, AUDIOSIGNAL_NumSamples(doc->signal));
    for (; s; s = s->next)
        if (!f(VELMSELECTION_GetBegin(doc, s), VELMSELECTION_GetDuration(doc, s))) return false;
    return true;
}

template <typename Sum>
double channel_sum(VELMAUDIO doc, int channel, Sum sum)
{
    if (!doc || !doc->signal) return 0.0;
    const int c = actual_channel(doc, channel);
    if (c < 0) return 0.0;
    double total = 0.0;
    for_each_range(doc, [&](int64_t begin, int64_t count) {
        total += sum(doc->signal, c, begin, count);
        return true;
    });
    return total;
}

} // namespace

int VELMAUDIO_GetSignalStats(VELMAUDIO doc, AUDIOSIGNAL_STATISTICS *out, double window, uint8_t flag)
{
    if (!doc || !doc->signal) return 0;
    // The window travels in whole milliseconds in 32 bits.
    const double window_ms = std::trunc(window * 1000.0);
    if (!(window_ms >= INT32_MIN && window_ms <= INT32_MAX)) return 0;
    AUDIOSIGNAL_STATSACC total = AUDIOSIGNAL_CalculateStatStart(doc->signal);
    AUDIOSIGNAL_STATSRANGE range{};
    range.window = static_cast<int32_t>(window_ms);
    range.active_only = flag;
    bool first = true;
    for_each_range(doc, [&](int64_t begin, int64_t count) {
        range.begin = begin;
        range.end = begin + count;
        if (first) {
            AUDIOSIGNAL_CalculateStatsAcc(&total, doc->signal, &range);
            first = false;
        } else {
            AUDIOSIGNAL_STATSACC part = AUDIOSIGNAL_CalculateStatStart(doc->signal);
            AUDIOSIGNAL_CalculateStatsAcc(&part, doc->signal, &range);
            AUDIOSIGNAL_MergeStatsAcc(&total, &part);
        }
        return true;
    });
    AUDIOSIGNAL_STATISTICS stats{};
    if (!AUDIOSIGNAL_GetStatisticsFromAcc(&stats, doc->signal, &total)) return 0;
    if (out) *out = stats;
    return 1;
}

double VELMAUDIO_GetChannelSamplesSum(VELMAUDIO doc, int channel)
{
    return channel_sum(doc, channel, AUDIOSIGNAL_GetChannelSamplesSum);
}

double VELMAUDIO_GetChannelSamplesSum2(VELMAUDIO doc, int channel)
{
    return channel_sum(doc, channel, AUDIOSIGNAL_GetChannelSamplesSum2);
}

int VELMAUDIO_GetChannelMinMax(VELMAUDIO doc, int channel, float *min, float *max)
{
    if (!doc || !doc->signal) return 0;
    const int c = actual_channel(doc, channel);
    if (c < 0) return 0;
    float lo = std::numeric_limits<float>::infinity();
    float hi = -std::numeric_limits<float>::infinity();
    const bool ok = for_each_range(doc, [&](int64_t begin, int64_t count) {
        float a, b;
        if (!AUDIOSIGNAL_GetChannelMinMax(doc->signal, c, begin, count, &a, &b)) return false;
        lo = std::min(lo, a);
        hi = std::max(hi, b);
        return true;
    });
    if (!ok) return 0;
    if (min) *min = lo;
    if (max) *max = hi;
    return 1;
}
