// Reading: samples, masked frames, exact extremes, sums and statistics.
#include <algorithm>
#include <cmath>

#include "store_test_support.hpp"

using namespace store_test;

namespace {

TEST(SignalStoreRead, ChannelSamplesOutsideTheSignalReadAsZero)
{
    const Channels samples = random_channels(2, 1000, 1);
    AUDIOSIGNAL *signal = make_signal(samples);
    std::vector<float> out(30, 9.0f);
    EXPECT_EQ(AUDIOSIGNAL_GetChannelSamples(signal, 1, -10, out.data(), 30), 20);
    for (int i = 0; i < 10; ++i) EXPECT_EQ(out[size_t(i)], 0.0f);
    for (int i = 10; i < 30; ++i) EXPECT_EQ(out[size_t(i)], samples[1][size_t(i - 10)]);
    EXPECT_EQ(AUDIOSIGNAL_GetChannelSamples(signal, 0, 990, out.data(), 30), 10);
    EXPECT_EQ(out[9], samples[0][999]);
    EXPECT_EQ(out[10], 0.0f);
    EXPECT_EQ(AUDIOSIGNAL_GetChannelSamples(signal, 2, 0, out.data(), 30), -1);
    EXPECT_EQ(AUDIOSIGNAL_GetChannelSamples(signal, 0, 0, out.data(), -1), -1);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreRead, MaskedSamplesInterleaveTheChosenChannels)
{
    const Channels samples = random_channels(3, 5000, 2);
    AUDIOSIGNAL *signal = make_signal(samples);
    std::vector<float> out(2 * 100);
    EXPECT_EQ(AUDIOSIGNAL_GetMaskedSamples(signal, 0x5, 4950, out.data(), 100), 50);
    for (int k = 0; k < 50; ++k) {
        EXPECT_EQ(out[size_t(2 * k)], samples[0][size_t(4950 + k)]);
        EXPECT_EQ(out[size_t(2 * k + 1)], samples[2][size_t(4950 + k)]);
    }
    EXPECT_EQ(AUDIOSIGNAL_GetMaskedSamples(signal, 0x5, 5000, out.data(), 100), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetMaskedSamples(signal, 0, 0, out.data(), 100), 0);

    // Forward and backward steps stop at the signal's ends.
    EXPECT_EQ(AUDIOSIGNAL_GetMaskedSamplesWithStep(signal, 0x2, 4000, out.data(), 100, 32), 32);
    for (int k = 0; k < 32; ++k) EXPECT_EQ(out[size_t(k)], samples[1][size_t(4000 + 32 * k)]);
    EXPECT_EQ(AUDIOSIGNAL_GetMaskedSamplesWithStep(signal, 0x2, 50, out.data(), 100, -2), 26);
    for (int k = 0; k < 26; ++k) EXPECT_EQ(out[size_t(k)], samples[1][size_t(50 - 2 * k)]);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreRead, ExtremeStepsReadOneFrame)
{
    const Channels samples = random_channels(1, 5000, 3);
    AUDIOSIGNAL *signal = make_signal(samples);
    float out[2] = {0.0f, 0.0f};
    EXPECT_EQ(AUDIOSIGNAL_GetMaskedSamplesWithStep(signal, 0x1, 4999, out, 2, INT32_MIN), 1);
    EXPECT_EQ(out[0], samples[0][4999]);
    EXPECT_EQ(AUDIOSIGNAL_GetMaskedSamplesWithStep(signal, 0x1, 7, out, 2, INT32_MAX), 1);
    EXPECT_EQ(out[0], samples[0][7]);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreRead, LongMaskedReadsInPieces)
{
    const Channels samples = random_channels(2, 300000, 6);
    AUDIOSIGNAL *signal = make_signal(samples);
    std::vector<float> out(2 * 300000);
    ASSERT_EQ(AUDIOSIGNAL_GetMaskedSamples(signal, 0x3, 0, out.data(), int64_t(1) << 40), 300000);
    for (size_t k = 0; k < 300000; k += 7) {
        ASSERT_EQ(out[2 * k], samples[0][k]);
        ASSERT_EQ(out[2 * k + 1], samples[1][k]);
    }
    ASSERT_EQ(AUDIOSIGNAL_GetMaskedSamplesWithStep(signal, 0x1, 299999, out.data(), 300000, -3), 100000);
    for (size_t k = 0; k < 100000; ++k) ASSERT_EQ(out[k], samples[0][299999 - 3 * k]);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreRead, AudioPointerExtremesAreExact)
{
    const Channels samples = random_channels(2, 400000, 3);
    AUDIOSIGNAL *signal = make_signal(samples);
    AUDIOSIGNAL_ClearEx(signal, 0, 123457, 150000);  // fragment the blocks
    const Channels now = read_all(signal);
    const std::vector<float> &x = now[1];

    // Columns of uneven width over the whole channel, as a drawing reads them.
    AUDIOPOINTER pointer;
    ASSERT_EQ(AUDIOSIGNAL_InitAudioPointer(signal, &pointer, 0, 1), 1);
    int64_t at = 0;
    for (int column = 0; at < int64_t(x.size()); ++column) {
        const int64_t width = 37 + (column * 7919) % 3000;
        float lo, hi;
        const int64_t got = AUDIOSIGNAL_GetChannelMinMaxFromAudioPointer(signal, &pointer, width, &lo, &hi);
        const int64_t n = std::min<int64_t>(width, int64_t(x.size()) - at);
        ASSERT_EQ(got, n);
        const auto [a, b] = std::minmax_element(x.begin() + at, x.begin() + at + n);
        ASSERT_EQ(lo, *a) << "column " << column;
        ASSERT_EQ(hi, *b) << "column " << column;
        at += width;
    }
    float lo = 5, hi = 5;
    EXPECT_EQ(AUDIOSIGNAL_GetChannelMinMaxFromAudioPointer(signal, &pointer, 10, &lo, &hi), 0);
    EXPECT_EQ(lo, 0.0f);

    ASSERT_EQ(AUDIOSIGNAL_GetChannelMinMax(signal, 0, 0, AUDIOSIGNAL_END, &lo, &hi), 1);
    EXPECT_EQ(lo, *std::min_element(now[0].begin(), now[0].end()));
    EXPECT_EQ(hi, *std::max_element(now[0].begin(), now[0].end()));
    EXPECT_EQ(AUDIOSIGNAL_GetChannelMinMax(signal, 0, int64_t(x.size()), 5, &lo, &hi), 0);
    EXPECT_EQ(AUDIOSIGNAL_InitAudioPointer(signal, &pointer, 0, 2), 0);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreRead, SumsOverRanges)
{
    const Channels samples = random_channels(1, 70000, 4);
    AUDIOSIGNAL *signal = make_signal(samples);
    double sum = 0, sum2 = 0;
    for (int i = 1000; i < 69000; ++i) {
        sum += samples[0][size_t(i)];
        sum2 += double(samples[0][size_t(i)]) * samples[0][size_t(i)];
    }
    EXPECT_NEAR(AUDIOSIGNAL_GetChannelSamplesSum(signal, 0, 1000, 68000), sum, 1e-9);
    EXPECT_NEAR(AUDIOSIGNAL_GetChannelSamplesSum2(signal, 0, 1000, 68000), sum2, 1e-9);
    EXPECT_EQ(AUDIOSIGNAL_GetChannelSamplesSum(signal, 1, 0, 10), 0.0);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreRead, StatisticsMatchBruteForceAcrossMergedRanges)
{
    Channels samples = random_channels(2, 48000, 5);
    samples[0][100] = 1.5f;   // clipped, the peak
    samples[1][200] = -1.0f;  // clipped
    AUDIOSIGNAL *signal = make_signal(samples, 8000);
    AUDIOSIGNAL_DisableChannel(signal, 1);

    const int64_t ranges[2][2] = {{0, 20000}, {30000, 48000}};
    AUDIOSIGNAL_STATSACC total = AUDIOSIGNAL_CalculateStatStart(signal);
    AUDIOSIGNAL_STATSRANGE range{ranges[0][0], ranges[0][1], 100, 0};
    ASSERT_EQ(AUDIOSIGNAL_CalculateStatsAcc(&total, signal, &range), 1);
    AUDIOSIGNAL_STATSACC part = AUDIOSIGNAL_CalculateStatStart(signal);
    range = {ranges[1][0], ranges[1][1], 100, 0};
    ASSERT_EQ(AUDIOSIGNAL_CalculateStatsAcc(&part, signal, &range), 1);
    ASSERT_EQ(AUDIOSIGNAL_MergeStatsAcc(&total, &part), 1);
    AUDIOSIGNAL_STATISTICS stats;
    ASSERT_EQ(AUDIOSIGNAL_GetStatisticsFromAcc(&stats, signal, &total), 1);
    static_assert(sizeof(AUDIOSIGNAL_STATISTICS) == 106 * 4, "the statistics record is 106 words");

    EXPECT_EQ(stats.numChannels, 2);
    EXPECT_EQ(stats.window, 100);
    EXPECT_EQ(stats.numSamples, 38000);
    for (int c = 0; c < 2; ++c) {
        double sum = 0, sum2 = 0, wmin = 1e9, wmax = 0;
        float lo = 9, hi = -9;
        int64_t clipped = 0, crossings = 0, windows = 0;
        for (const auto &r : ranges) {
            for (int64_t i = r[0]; i < r[1]; ++i) {
                const float v = samples[size_t(c)][size_t(i)];
                sum += v;
                sum2 += double(v) * v;
                lo = std::min(lo, v);
                hi = std::max(hi, v);
                clipped += std::fabs(v) >= 1.0f;
                if (i > r[0]) crossings += (v < 0) != (samples[size_t(c)][size_t(i - 1)] < 0);
            }
            for (int64_t w = r[0]; w < r[1]; w += 800, ++windows) {
                double s2 = 0;
                const int64_t end = std::min(w + 800, r[1]);
                for (int64_t i = w; i < end; ++i) s2 += double(samples[size_t(c)][size_t(i)]) * samples[size_t(c)][size_t(i)];
                const double rms = std::sqrt(s2 / double(end - w));
                wmin = std::min(wmin, rms);
                wmax = std::max(wmax, rms);
            }
        }
        const AUDIOSIGNAL_CHANNELSTATS &s = stats.channel[c];
        EXPECT_EQ(s.min, lo);
        EXPECT_EQ(s.max, hi);
        EXPECT_NEAR(s.mean, sum / 38000, 1e-12);
        EXPECT_NEAR(s.rms, std::sqrt(sum2 / 38000), 1e-12);
        EXPECT_EQ(s.clipped, clipped);
        EXPECT_EQ(s.zero_crossings, crossings);
        EXPECT_NEAR(s.window_rms_min_db, 20 * std::log10(wmin), 1e-3);
        EXPECT_NEAR(s.window_rms_max_db, 20 * std::log10(wmax), 1e-3);
        EXPECT_EQ(total.channel[c].windows, windows);
    }
    EXPECT_EQ(stats.channel[0].peak_pos, 100);
    EXPECT_NEAR(stats.channel[0].peak_db, 20 * std::log10(1.5), 1e-4);

    // Only the active channel.
    AUDIOSIGNAL_STATSACC active = AUDIOSIGNAL_CalculateStatStart(signal);
    range = {0, AUDIOSIGNAL_END, 0, 1};
    ASSERT_EQ(AUDIOSIGNAL_CalculateStatsAcc(&active, signal, &range), 1);
    EXPECT_EQ(active.numChannels, 1);
    EXPECT_EQ(AUDIOSIGNAL_MergeStatsAcc(&total, &active), 0);  // another layout
    AUDIOSIGNAL_Destroy(signal);
}

}  // namespace
