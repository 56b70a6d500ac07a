// Playback gains that glide toward their targets.
#include "outside/signal/audiofx.h"

#include <gtest/gtest.h>

#include <vector>

TEST(GainFade, GainsMoveByOneStepPerFrame)
{
    std::vector<float> samples(2 * 12, 1.0f);
    const double target[2] = {1.0, 0.0};
    double current[2] = {0.0, 1.0};
    ASSERT_EQ(AUDIO_ChangeGainsWidthFade(samples.data(), 12, target, current, 0.1, 2), 1);
    for (int f = 0; f < 12; ++f) {
        const double rising = f < 10 ? 0.1 * (f + 1) : 1.0;
        EXPECT_NEAR(samples[2 * f], rising, 1e-6) << f;
        EXPECT_NEAR(samples[2 * f + 1], 1.0 - rising, 1e-6) << f;
    }
    EXPECT_EQ(current[0], 1.0);
    EXPECT_EQ(current[1], 0.0);
}

TEST(GainFade, AFullSwingTakesFiftyMillisecondsAtTwentyOverTheRate)
{
    const int rate = 44100;
    std::vector<float> samples(rate / 10, 1.0f);
    const double target[1] = {1.0};
    double current[1] = {0.0};
    ASSERT_EQ(AUDIO_ChangeGainsWidthFade(samples.data(), rate / 10, target, current, 20.0 / rate, 1), 1);
    EXPECT_LT(samples[rate / 20 - 2], 1.0f);
    EXPECT_NEAR(samples[rate / 20], 1.0, 1e-6);
}

TEST(GainFade, ChannelsBeyondSixKeepTheirSamples)
{
    std::vector<float> samples(8, 0.5f);
    const double target[AUDIO_GAIN_CHANNELS] = {0, 0, 0, 0, 0, 0};
    double current[AUDIO_GAIN_CHANNELS] = {0, 0, 0, 0, 0, 0};
    ASSERT_EQ(AUDIO_ChangeGainsWidthFade(samples.data(), 1, target, current, 0.1, 8), 1);
    EXPECT_EQ(samples, (std::vector<float>{0, 0, 0, 0, 0, 0, 0.5f, 0.5f}));
}

TEST(GainFade, BadArgumentsChangeNothing)
{
    float samples[2] = {1.0f, 1.0f};
    const double target[2] = {0.0, 0.0};
    double current[2] = {0.5, 0.5};
    EXPECT_EQ(AUDIO_ChangeGainsWidthFade(nullptr, 1, target, current, 0.1, 2), 0);
    EXPECT_EQ(AUDIO_ChangeGainsWidthFade(samples, -1, target, current, 0.1, 2), 0);
    EXPECT_EQ(AUDIO_ChangeGainsWidthFade(samples, 1, nullptr, current, 0.1, 2), 0);
    EXPECT_EQ(AUDIO_ChangeGainsWidthFade(samples, 1, target, nullptr, 0.1, 2), 0);
    EXPECT_EQ(AUDIO_ChangeGainsWidthFade(samples, 1, target, current, -0.1, 2), 0);
    EXPECT_EQ(AUDIO_ChangeGainsWidthFade(samples, 1, target, current, 0.1, 0), 0);
    EXPECT_EQ(samples[0], 1.0f);
    EXPECT_EQ(current[0], 0.5);
}
