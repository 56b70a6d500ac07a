#include "core/velmutil.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

TEST(UtilRect, DefineComposeAndCompare)
{
    _VELMRECT a, b, c;
    VELMUTIL_DefineRect(&a, 10, 20, 30, 40);
    EXPECT_EQ(a.right, 39);
    EXPECT_EQ(a.bottom, 59);
    VELMUTIL_DefineRect(&b, 0, 50, 5, 100);
    ASSERT_EQ(VELMUTIL_ComposeRect(&c, &a, &b), &c);
    EXPECT_EQ(c.left, 0);
    EXPECT_EQ(c.top, 20);
    EXPECT_EQ(c.width, 40);
    EXPECT_EQ(c.height, 130);
    EXPECT_TRUE(VELMUTIL_CompareRect(&a, &a));
    EXPECT_FALSE(VELMUTIL_CompareRect(&a, &b));
    EXPECT_FALSE(VELMUTIL_CompareRect(&a, nullptr));
    VELMUTIL_ComposeRect(&a, &a, &b); // the output may be an input
    EXPECT_TRUE(VELMUTIL_CompareRect(&a, &c));
    EXPECT_EQ(VELMUTIL_ExtractRectFromArea(&c, nullptr)->right, -1);
}

TEST(UtilRect, InsideAndBorders)
{
    _VELMRECT r;
    VELMUTIL_DefineRect(&r, 0, 0, 3, 10);
    EXPECT_TRUE(VELMUTIL_IsInsideRect(&r, 2, 9));
    EXPECT_FALSE(VELMUTIL_IsInsideRect(&r, 3, 0));
    EXPECT_FALSE(VELMUTIL_IsInsideRect(nullptr, 0, 0));
    // The left edge is tried first: the middle column of a narrow rectangle is on it.
    EXPECT_TRUE(VELMUTIL_IsOverRectBorder(&r, VELMUTIL_BORDER_LEFT | VELMUTIL_BORDER_RIGHT, 1, 5));
    VELMUTIL_DefineRect(&r, 100, 100, 50, 50);
    EXPECT_TRUE(VELMUTIL_IsOverRectBorder(&r, VELMUTIL_BORDER_RIGHT, 149, 120));
    EXPECT_FALSE(VELMUTIL_IsOverRectBorder(&r, VELMUTIL_BORDER_LEFT, 149, 120));
    EXPECT_TRUE(VELMUTIL_IsOverRectBorder(&r, VELMUTIL_BORDER_BOTTOM, 120, 148));
    EXPECT_FALSE(VELMUTIL_IsOverRectBorder(&r, VELMUTIL_BORDER_TOP, 120, 110));
    VELMAREA narrow{};
    VELMUTIL_DefineRect(&narrow.rect, 0, 0, 30, 30);
    EXPECT_FALSE(VELMUTIL_IsOverAreaBorder(&narrow, VELMUTIL_BORDER_LEFT, 0, 5));
    narrow.rect.width = 31;
    EXPECT_TRUE(VELMUTIL_IsOverAreaBorder(&narrow, VELMUTIL_BORDER_LEFT, 0, 5));
}

TEST(UtilRect, EvalDimensionsModes)
{
    _VELMRECT r{5, 5, 0, 0, 4, 9};
    EXPECT_FALSE(VELMUTIL_EvalDimensions(&r, 2)); // right < left
    r = _VELMRECT{0, 0, 10, 20, 0, 0};
    EXPECT_TRUE(VELMUTIL_EvalDimensions(&r, 4));
    EXPECT_EQ(r.bottom, 19);
    r.right = 50;
    EXPECT_TRUE(VELMUTIL_EvalDimensions(&r, 1));
    EXPECT_EQ(r.left, 41);
    EXPECT_FALSE(VELMUTIL_EvalDimensions(&r, 3));
    EXPECT_FALSE(VELMUTIL_EvalDimensions(nullptr, 2));
}

TEST(UtilRect, EdgesOfHugeRectanglesSaturate)
{
    constexpr int kMax = std::numeric_limits<int>::max(), kMin = std::numeric_limits<int>::min();
    _VELMRECT r;
    VELMUTIL_DefineRect(&r, 10, -10, kMax, kMax);
    EXPECT_EQ(r.right, kMax);
    EXPECT_EQ(r.bottom, kMax - 11);
    r = _VELMRECT{kMin, 0, 0, 0, kMax, 5};
    EXPECT_TRUE(VELMUTIL_EvalDimensions(&r, 2));
    EXPECT_EQ(r.width, kMax);
    EXPECT_EQ(r.height, 6);
    r = _VELMRECT{0, 0, kMax, 2, kMin, 1};
    EXPECT_TRUE(VELMUTIL_EvalDimensions(&r, 1));
    EXPECT_EQ(r.left, kMin);
    EXPECT_EQ(r.top, 0);
    _VELMRECT a, b, c;
    VELMUTIL_DefineRect(&a, kMin, 0, 1, 1);
    VELMUTIL_DefineRect(&b, kMax - 1, 0, 1, 1);
    VELMUTIL_ComposeRect(&c, &a, &b);
    EXPECT_EQ(c.width, kMax);
    VELMUTIL_DefineRect(&r, kMin, kMin, 10, 10);
    EXPECT_TRUE(VELMUTIL_IsOverRectBorder(&r, VELMUTIL_BORDER_LEFT, kMin, kMin + 5));
    EXPECT_TRUE(VELMUTIL_IsOverRectBorder(&r, VELMUTIL_BORDER_TOP, kMin + 5, kMin));
}

namespace {
double twice(double v) { return 2 * v; }
}

TEST(UtilRect, RealAndDisplayCoordinatesRoundTrip)
{
    VELMAREA a{};
    VELMUTIL_DefineRect(&a.rect, 0, 0, 200, 100);
    a.yOrigin = 50;   // real 0 in the middle row
    a.yExtent = 2.0;  // -1 .. 1 over the height
    a.xOrigin = 0;
    a.xExtent = 1000; // samples across the width
    EXPECT_EQ(VELMUTIL_ConvertRealYtoDisplayY(&a, 1.0), 0);
    EXPECT_EQ(VELMUTIL_ConvertRealYtoDisplayY(&a, -1.0), 100);
    EXPECT_DOUBLE_EQ(VELMUTIL_ConvertDisplayYtoRealY(&a, 25), 0.5);
    EXPECT_EQ(VELMUTIL_ConvertRealXtoDisplayX(&a, 500.0), 100);
    EXPECT_DOUBLE_EQ(VELMUTIL_ConvertDisplayXtoRealX(&a, 100), 500.0);
    a.realToDisplayX = twice;
    EXPECT_EQ(VELMUTIL_ConvertRealXtoDisplayX(&a, 500.0), 200);
    // A degenerate area maps to its origin instead of dividing by zero.
    a.yExtent = 0.0;
    EXPECT_EQ(VELMUTIL_ConvertRealYtoDisplayY(&a, 1.0), 50);
    a.rect.height = 0;
    EXPECT_DOUBLE_EQ(VELMUTIL_ConvertDisplayYtoRealY(&a, 25), 0.0);
    EXPECT_EQ(VELMUTIL_ConvertRealYtoDisplayY(nullptr, 1.0), 0);
}
