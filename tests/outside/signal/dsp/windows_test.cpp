// Window shapes, their norm factors and applying them.
#include "outside/signal/dspb.h"

#include <gtest/gtest.h>

#include <vector>

TEST(SignalDspWindows, ShortWindowsHaveTheirTextbookValues)
{
    float w[4];
    ASSERT_EQ(DSPB_CreateWindow(DSPB_WINDOW_HANNING, w, 4), 1);
    EXPECT_NEAR(w[0], 0.0, 1e-7);
    EXPECT_NEAR(w[1], 0.5, 1e-7);
    EXPECT_NEAR(w[2], 1.0, 1e-7);
    EXPECT_NEAR(w[3], 0.5, 1e-7);

    ASSERT_EQ(DSPB_CreateWindow(DSPB_WINDOW_TRIANGULAR, w, 4), 1);
    EXPECT_FLOAT_EQ(w[0], 0.0f);
    EXPECT_FLOAT_EQ(w[1], 0.5f);
    EXPECT_FLOAT_EQ(w[2], 1.0f);
    EXPECT_FLOAT_EQ(w[3], 0.5f);

    ASSERT_EQ(DSPB_CreateWindow(DSPB_WINDOW_HAMMING, w, 4), 1);
    EXPECT_NEAR(w[0], 0.08, 1e-7);
    EXPECT_NEAR(w[2], 1.0, 1e-7);

    ASSERT_EQ(DSPB_CreateWindow(DSPB_WINDOW_BLACKMAN, w, 4), 1);
    EXPECT_NEAR(w[0], 0.0, 1e-7);
    EXPECT_NEAR(w[2], 1.0, 1e-7);

    // Four-term windows peak at (almost exactly) 1 in the middle, near 0 at the edge.
    for (int kind : {DSPB_WINDOW_BLACKMAN_HARRIS, DSPB_WINDOW_BLACKMAN_NUTTALL}) {
        ASSERT_EQ(DSPB_CreateWindow(kind, w, 4), 1);
        EXPECT_NEAR(w[2], 1.0, 1e-6);
        EXPECT_LT(w[0], 4e-4);
    }
}

TEST(SignalDspWindows, NormFactorIsTheCoherentSum)
{
    // The periodic cosine windows sum to their constant term times the length.
    const struct { int kind; double a0; } cases[] = {
        {DSPB_WINDOW_RECTANGULAR, 1.0},      {DSPB_WINDOW_TRIANGULAR, 0.5},
        {DSPB_WINDOW_HANNING, 0.5},          {DSPB_WINDOW_HAMMING, 0.54},
        {DSPB_WINDOW_BLACKMAN, 0.42},        {DSPB_WINDOW_BLACKMAN_HARRIS, 0.35875},
        {DSPB_WINDOW_BLACKMAN_NUTTALL, 0.3635819},
    };
    std::vector<float> w(256);
    for (const auto &c : cases) {
        SCOPED_TRACE(c.kind);
        ASSERT_EQ(DSPB_CreateWindow(c.kind, w.data(), 256), 1);
        EXPECT_NEAR(DSPB_GetWindowNormFactor(w.data(), 256), c.a0 * 256, 1e-4);
    }
    float one;
    ASSERT_EQ(DSPB_CreateWindow(DSPB_WINDOW_HANNING, &one, 1), 1);
    EXPECT_EQ(DSPB_GetWindowNormFactor(&one, 1), 1.0);
}

TEST(SignalDspWindows, ApplyMultipliesOnlyTheWindowLength)
{
    float w[4] = {0.0f, 0.5f, 1.0f, 0.25f};
    float frame[6] = {2, 2, 2, 2, 2, 2};
    ASSERT_EQ(DSPB_ApplyWindow(w, frame, 4), 1);
    const float expected[6] = {0, 1, 2, 0.5f, 2, 2};
    for (int i = 0; i < 6; ++i)
        EXPECT_EQ(frame[i], expected[i]) << i;
}

TEST(SignalDspWindows, BadArgumentsAreRefusedAndLeaveTheBuffer)
{
    float w[4] = {9, 9, 9, 9};
    EXPECT_EQ(DSPB_CreateWindow(2, w, 4), 0);  // the unused kind
    EXPECT_EQ(DSPB_CreateWindow(8, w, 4), 0);
    EXPECT_EQ(DSPB_CreateWindow(-1, w, 4), 0);
    EXPECT_EQ(DSPB_CreateWindow(DSPB_WINDOW_HANNING, w, 0), 0);
    EXPECT_EQ(DSPB_CreateWindow(DSPB_WINDOW_HANNING, w, -4), 0);
    EXPECT_EQ(DSPB_CreateWindow(DSPB_WINDOW_HANNING, w, DSPB_MAX_WINDOW_LENGTH + 1), 0);
    EXPECT_EQ(DSPB_CreateWindow(DSPB_WINDOW_HANNING, nullptr, 4), 0);
    for (float v : w)
        EXPECT_EQ(v, 9.0f);
    EXPECT_EQ(DSPB_ApplyWindow(nullptr, w, 4), 0);
    EXPECT_EQ(DSPB_ApplyWindow(w, nullptr, 4), 0);
    EXPECT_EQ(DSPB_ApplyWindow(w, w, 0), 0);
    EXPECT_EQ(DSPB_GetWindowNormFactor(nullptr, 4), 0.0);
    EXPECT_EQ(DSPB_GetWindowNormFactor(w, -1), 0.0);
}
