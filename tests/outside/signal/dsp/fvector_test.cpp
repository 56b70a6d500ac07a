// Vector extremes.
#include "outside/signal/dspb.h"

#include <gtest/gtest.h>

#include <cmath>

TEST(SignalDspVector, MinimumAndMaximum)
{
    const float v[] = {0.5f, -3.25f, 7.0f, 2.0f, -1.0f};
    EXPECT_EQ(FVectorMin(v, 5), -3.25f);
    EXPECT_EQ(FVectorMax(v, 5), 7.0f);
    EXPECT_EQ(FVectorMin(v, 1), 0.5f);
    EXPECT_EQ(FVectorMax(v + 3, 2), 2.0f);
}

TEST(SignalDspVector, NaNsAreSkipped)
{
    const float v[] = {NAN, 4.0f, NAN, -2.0f, NAN};
    EXPECT_EQ(FVectorMin(v, 5), -2.0f);
    EXPECT_EQ(FVectorMax(v, 5), 4.0f);
    const float only[] = {NAN, NAN};
    EXPECT_EQ(FVectorMin(only, 2), 0.0f);
    EXPECT_EQ(FVectorMax(only, 2), 0.0f);
}

TEST(SignalDspVector, EmptyOrNullGiveZero)
{
    const float v[] = {5.0f};
    EXPECT_EQ(FVectorMin(nullptr, 3), 0.0f);
    EXPECT_EQ(FVectorMax(nullptr, 3), 0.0f);
    EXPECT_EQ(FVectorMin(v, 0), 0.0f);
    EXPECT_EQ(FVectorMax(v, -1), 0.0f);
}
