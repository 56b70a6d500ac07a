// Cubic splines through known polynomials.
#include "outside/signal/dspb.h"

#include <gtest/gtest.h>

#include <cmath>
#include <vector>

namespace {

struct Points {
    std::vector<float> x, y, d2;
};

template <typename F>
Points sample(const std::vector<float> &xs, F f)
{
    Points p{xs, {}, std::vector<float>(xs.size(), 99.0f)};
    for (float x : xs)
        p.y.push_back(float(f(x)));
    return p;
}

// Unevenly spaced knots, as the columns of zoomed samples can be.
const std::vector<float> kKnots = {-2.0f, -1.5f, -0.25f, 0.0f, 0.6f, 1.0f, 1.8f, 2.5f, 3.0f};

double cubic(double x) { return 0.5 * x * x * x - 2.0 * x * x + x + 1.0; }
double cubic_d2(double x) { return 3.0 * x - 4.0; }

}  // namespace

TEST(SignalDspSpline, CubicIsReproducedWithItsEndSecondDerivatives)
{
    auto p = sample(kKnots, cubic);
    const auto n = int64_t(kKnots.size());
    ASSERT_EQ(DSPBSPLINE_Estimate(p.x.data(), p.y.data(), n, cubic_d2(kKnots.front()),
                                  cubic_d2(kKnots.back()), p.d2.data()),
              1);
    for (size_t i = 0; i < p.d2.size(); ++i)
        EXPECT_NEAR(p.d2[i], cubic_d2(kKnots[i]), 1e-4) << i;
    for (double x = -2.0; x <= 3.0; x += 0.01)
        EXPECT_NEAR(DSPBSPLINE_Interpolate(p.x.data(), p.y.data(), p.d2.data(), n, x), cubic(x),
                    1e-4)
            << x;
}

TEST(SignalDspSpline, NaturalEndsHaveNoCurvature)
{
    // Zero end conditions give the natural spline: it passes every point,
    // its ends are straight, and a straight line is reproduced exactly.
    auto p = sample(kKnots, cubic);
    const auto n = int64_t(kKnots.size());
    ASSERT_EQ(DSPBSPLINE_Estimate(p.x.data(), p.y.data(), n, 0, 0, p.d2.data()), 1);
    EXPECT_EQ(p.d2.front(), 0.0f);
    EXPECT_EQ(p.d2.back(), 0.0f);
    for (size_t i = 0; i < kKnots.size(); ++i)
        EXPECT_NEAR(DSPBSPLINE_Interpolate(p.x.data(), p.y.data(), p.d2.data(), n, kKnots[i]),
                    p.y[i], 1e-5);
    // Not the cubic itself: the ends were bent straight.
    EXPECT_GT(std::fabs(DSPBSPLINE_Interpolate(p.x.data(), p.y.data(), p.d2.data(), n, -1.75) -
                        cubic(-1.75)),
              1e-3);

    auto line = sample(kKnots, [](double x) { return 3.0 - 1.25 * x; });
    ASSERT_EQ(DSPBSPLINE_Estimate(line.x.data(), line.y.data(), n, 0, 0, line.d2.data()), 1);
    for (double x = -2.0; x <= 3.0; x += 0.05)
        EXPECT_NEAR(DSPBSPLINE_Interpolate(line.x.data(), line.y.data(), line.d2.data(), n, x),
                    3.0 - 1.25 * x, 1e-5);
}

TEST(SignalDspSpline, BeyondTheEndsTheCurveGoesOnStraight)
{
    auto p = sample(kKnots, [](double x) { return x * x; });
    const auto n = int64_t(kKnots.size());
    ASSERT_EQ(DSPBSPLINE_Estimate(p.x.data(), p.y.data(), n, 2.0, 2.0, p.d2.data()), 1);
    auto at = [&](double x) {
        return DSPBSPLINE_Interpolate(p.x.data(), p.y.data(), p.d2.data(), n, x);
    };
    // x^2 has slope 6 at 3 and -4 at -2.
    EXPECT_NEAR(at(4.0), 9.0 + 6.0, 1e-4);
    EXPECT_NEAR(at(5.0), 9.0 + 12.0, 1e-4);
    EXPECT_NEAR(at(-3.0), 4.0 + 4.0, 1e-4);
}

TEST(SignalDspSpline, TwoPointsAndOnePoint)
{
    const float x2[] = {0.0f, 2.0f}, y2[] = {1.0f, 5.0f};
    float d2[2];
    ASSERT_EQ(DSPBSPLINE_Estimate(x2, y2, 2, 0, 0, d2), 1);
    EXPECT_NEAR(DSPBSPLINE_Interpolate(x2, y2, d2, 2, 0.5), 2.0, 1e-6);

    const float x1[] = {4.0f}, y1[] = {-3.0f};
    float d1[1] = {7.0f};
    ASSERT_EQ(DSPBSPLINE_Estimate(x1, y1, 1, 0, 0, d1), 1);
    EXPECT_EQ(DSPBSPLINE_Interpolate(x1, y1, d1, 1, 100.0), -3.0f);
}

TEST(SignalDspSpline, BadPointsAreRefused)
{
    const float x[] = {0.0f, 1.0f, 1.0f, 2.0f}, y[] = {0, 1, 2, 3};
    float d2[4] = {5, 5, 5, 5};
    EXPECT_EQ(DSPBSPLINE_Estimate(x, y, 4, 0, 0, d2), 0);  // repeated x
    const float down[] = {3.0f, 2.0f, 1.0f, 0.0f};
    EXPECT_EQ(DSPBSPLINE_Estimate(down, y, 4, 0, 0, d2), 0);
    const float holes[] = {0.0f, NAN, 2.0f, 3.0f};
    EXPECT_EQ(DSPBSPLINE_Estimate(holes, y, 4, 0, 0, d2), 0);
    EXPECT_EQ(DSPBSPLINE_Estimate(y, holes, 4, 0, 0, d2), 0);
    EXPECT_EQ(DSPBSPLINE_Estimate(y, y, 4, NAN, 0, d2), 0);
    EXPECT_EQ(DSPBSPLINE_Estimate(y, y, 0, 0, 0, d2), 0);
    EXPECT_EQ(DSPBSPLINE_Estimate(nullptr, y, 4, 0, 0, d2), 0);
    EXPECT_EQ(DSPBSPLINE_Estimate(y, y, 4, 0, 0, nullptr), 0);
    for (float v : d2)
        EXPECT_EQ(v, 5.0f);

    ASSERT_EQ(DSPBSPLINE_Estimate(y, y, 4, 0, 0, d2), 1);
    EXPECT_EQ(DSPBSPLINE_Interpolate(nullptr, y, d2, 4, 1.0), 0.0f);
    EXPECT_EQ(DSPBSPLINE_Interpolate(y, y, d2, 0, 1.0), 0.0f);
    EXPECT_TRUE(std::isnan(DSPBSPLINE_Interpolate(y, y, d2, 4, NAN)));
}
