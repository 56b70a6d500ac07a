// 16-bit and float samples.
#include <gtest/gtest.h>

#include <cmath>
#include <cstring>

#include "outside/signal/audioformat.h"

namespace {

TEST(Sample16, FloatScaleIs32768) {
    const int16_t in[] = {0, 1, -1, 16384, -32768, 32767};
    float out[6];
    ASSERT_EQ(AUDIO_Word16ToFloatIEEE(in, out, 6), 6);
    EXPECT_EQ(out[0], 0.0f);
    EXPECT_EQ(out[1], 1.0f / 32768);
    EXPECT_EQ(out[3], 0.5f);
    EXPECT_EQ(out[4], -1.0f);
    EXPECT_EQ(out[5], 32767.0f / 32768);
}

TEST(Sample16, RoundsClampsAndRoundTrips) {
    const float in[] = {0.5f, 1.0f, 2.0f, -1.0f, -3.0f, 0.4f / 32768, 0.6f / 32768, -0.6f / 32768, NAN, INFINITY};
    int16_t out[10];
    ASSERT_EQ(AUDIO_IEEEFloatToWord16(in, out, 10), 10);
    const int16_t expected[] = {16384, 32767, 32767, -32768, -32768, 0, 1, -1, 0, 32767};
    for (int i = 0; i < 10; ++i) EXPECT_EQ(out[i], expected[i]) << i;

    int16_t all[65536], back[65536];
    float f[65536];
    for (int i = 0; i < 65536; ++i) all[i] = static_cast<int16_t>(i - 32768);
    AUDIO_Word16ToFloatIEEE(all, f, 65536);
    AUDIO_IEEEFloatToWord16(f, back, 65536);
    EXPECT_EQ(std::memcmp(all, back, sizeof all), 0);
}

TEST(Sample16, BadArgumentsAndFrameCounts) {
    float f[1];
    int16_t s[1];
    EXPECT_EQ(AUDIO_Word16ToFloatIEEE(nullptr, f, 1), 0);
    EXPECT_EQ(AUDIO_IEEEFloatToWord16(f, nullptr, 1), 0);
    EXPECT_EQ(AUDIO_IEEEFloatToWord16(f, s, -1), 0);
    _audio_format stereo = AUDIO_InitFormat(44100, 2, 16);
    EXPECT_EQ(AUDIO_SamplesSize16(&stereo, 4096), 1024);
    EXPECT_EQ(AUDIO_SamplesSize16(&stereo, 4095), 1023);
    EXPECT_EQ(AUDIO_SamplesSize16(nullptr, 4096), -1);
}

}  // namespace
