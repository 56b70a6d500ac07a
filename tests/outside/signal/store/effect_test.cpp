// Effect scripts over ranges, and whole-signal transforms.
#include <cmath>

#include "outside/signal/audioregion.h"
#include "store_test_support.hpp"

using namespace store_test;

namespace {

TEST(SignalStoreEffect, EffectsChangeTheRangeOfTheActiveChannels)
{
    const Channels samples = random_channels(2, 100000, 51);
    AUDIOSIGNAL *signal = make_signal(samples);
    AUDIOSIGNAL_DisableChannel(signal, 1);
    const uint64_t stamp = AUDIOSIGNAL_GetTimeStamp(signal, 0);
    ASSERT_EQ(AUDIOSIGNAL_ApplyEffectEx(signal, AUDIOSIGNAL_FLAG_SERIES, 1000, 90000, "invert"), 1);
    EXPECT_GT(AUDIOSIGNAL_GetTimeStamp(signal, 0), stamp);
    Channels expected = samples;
    for (int i = 1000; i < 90000; ++i) expected[0][size_t(i)] = -expected[0][size_t(i)];
    EXPECT_EQ(read_all(signal), expected);

    AUDIOSIGNAL_EnableChannel(signal, 1);
    ASSERT_EQ(AUDIOSIGNAL_ApplyEffectEx(signal, 0, 0, AUDIOSIGNAL_END, "GAIN[offsets=[0.25,-0.5]]"), 1);
    const Channels shifted = read_all(signal);
    for (size_t i = 0; i < 100000; i += 101) {
        EXPECT_NEAR(shifted[0][i], expected[0][i] + 0.25f, 1e-6);
        EXPECT_NEAR(shifted[1][i], expected[1][i] - 0.5f, 1e-6);
    }
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreEffect, BadScriptsChangeNothing)
{
    const Channels samples = random_channels(1, 5000, 52);
    AUDIOSIGNAL *signal = make_signal(samples);
    const uint64_t stamp = AUDIOSIGNAL_GetTimeStamp(signal, 0);
    EXPECT_EQ(AUDIOSIGNAL_ApplyEffectEx(signal, 0, 0, 100, "nosuchstage"), 0);
    EXPECT_EQ(AUDIOSIGNAL_ApplyEffectEx(signal, 0, 0, 100, "fmtconv[sr=8000]"), 0);  // not in place
    EXPECT_EQ(AUDIOSIGNAL_ApplyEffectEx(signal, 0, 0, 100, nullptr), 0);
    EXPECT_EQ(AUDIOSIGNAL_ApplyTransform(signal, "GAIN[offsets=[1,2,3"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetTimeStamp(signal, 0), stamp);
    EXPECT_EQ(read_all(signal), samples);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreEffect, TransformsMakeANewSignalKeepingTheSound)
{
    const int rate = 44100;
    Channels sine(2, std::vector<float>(size_t(rate)));
    for (int i = 0; i < rate; ++i) sine[0][size_t(i)] = sine[1][size_t(i)] = float(0.5 * std::sin(2 * M_PI * 1000.0 * i / rate));
    AUDIOSIGNAL *signal = make_signal(sine);
    ASSERT_NE(AUDIOSIGNAL_AddRegionToTrackEx(signal, 0, 0.25, 0.5, "mark", nullptr, 0), nullptr);

    AUDIOSIGNAL *converted = AUDIOSIGNAL_ApplyTransform(signal, "fmtconv[sr=48000,nc=1]");
    ASSERT_NE(converted, nullptr);
    EXPECT_EQ(AUDIOSIGNAL_SampleRate(converted), 48000);
    EXPECT_EQ(AUDIOSIGNAL_NumChannels(converted), 1);
    EXPECT_NEAR(double(AUDIOSIGNAL_NumSamples(converted)), 48000.0, 50.0);
    EXPECT_EQ(AUDIOSIGNAL_CountRegions(converted, 0, 0, 0, 0, nullptr), 1);
    // 1 kHz: 2000 sign changes a second, away from the edges.
    std::vector<float> out(40000);
    AUDIOSIGNAL_GetChannelSamples(converted, 0, 4000, out.data(), 40000);
    int crossings = 0;
    for (size_t i = 1; i < out.size(); ++i) crossings += (out[i] < 0) != (out[i - 1] < 0);
    EXPECT_NEAR(crossings, 40000.0 / 48000 * 2000, 2);
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(signal), rate);  // the source is untouched
    AUDIOSIGNAL_Destroy(converted);
    AUDIOSIGNAL_Destroy(signal);
}

}  // namespace
