// The mel scale against published values, both ways.
#include "outside/signal/dspb.h"

#include <gtest/gtest.h>

#include <cmath>

TEST(SignalDspMels, FrequenciesGiveThePublishedMels)
{
    EXPECT_NEAR(DSPBUTIL_Freq2Mels(1000.0), 999.985, 1e-3);
    EXPECT_NEAR(DSPBUTIL_Freq2Mels(700.0), 2595.0 * std::log10(2.0), 1e-9);
    EXPECT_NEAR(DSPBUTIL_Freq2Mels(4000.0), 2146.065, 1e-3);
    EXPECT_NEAR(DSPBUTIL_Freq2Mels(8000.0), 2840.023, 1e-3);
    EXPECT_NEAR(DSPBUTIL_Freq2Mels(22050.0), 3923.337, 1e-3);
    EXPECT_EQ(DSPBUTIL_Freq2Mels(0.0), 0.0);
}

TEST(SignalDspMels, MelsGiveThePublishedFrequencies)
{
    EXPECT_NEAR(DSPBUTIL_Mels2Freq(1000.0), 1000.0211, 1e-3);
    EXPECT_NEAR(DSPBUTIL_Mels2Freq(2146.065), 4000.0, 1e-2);
    EXPECT_EQ(DSPBUTIL_Mels2Freq(0.0), 0.0);
}

TEST(SignalDspMels, ConversionsInvertEachOtherAndKeepOrder)
{
    double previous = -1e300;
    for (double f = -30000.0; f <= 96000.0; f += 37.5) {
        const double m = DSPBUTIL_Freq2Mels(f);
        EXPECT_GT(m, previous) << f;
        EXPECT_NEAR(DSPBUTIL_Mels2Freq(m), f, 1e-9 * (1.0 + std::fabs(f))) << f;
        previous = m;
    }
    // Below zero the scale mirrors: no NaN for any finite frequency.
    EXPECT_EQ(DSPBUTIL_Freq2Mels(-1000.0), -DSPBUTIL_Freq2Mels(1000.0));
    EXPECT_TRUE(std::isfinite(DSPBUTIL_Freq2Mels(-700.0)));
}
