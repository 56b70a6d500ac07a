// Comparison of drawn images with reviewed reference images kept in
// tests/render/canvas/golden.  With VELM_UPDATE_GOLDEN=1 in the environment
// the references are rewritten from what is drawn instead.  A mismatch
// writes NAME.actual.png and NAME.diff.png (red: pixels beyond tolerance)
// into golden-failures/ beside the test binary.
#ifndef VELM_TEST_GOLDEN_H
#define VELM_TEST_GOLDEN_H

#include <QImage>

#include <gtest/gtest.h>

namespace velm::test {

struct Tolerance {
    int channel;           // largest accepted difference of one channel
    double outlier_share;  // share of pixels that may exceed it
};

// Shapes must match to rounding; text may differ where fonts render a
// pixel differently between machines.
inline constexpr Tolerance kStrict{2, 0.0};
inline constexpr Tolerance kTextTolerant{96, 0.03};

::testing::AssertionResult MatchesGolden(const QImage &actual, const char *name, Tolerance tolerance);

} // namespace velm::test

#endif // VELM_TEST_GOLDEN_H
