// The picture set as the view's drawing code expects it: each picture's name
// and size.  X(name, width, height) is applied to every picture.
//
// Region frame pieces reach 3 rows above a region, 8 below it and 6 columns
// beside it (rounded) or 0 (square, 2 wide); side pieces are stretched down
// from 9 rows into the region, top and bottom edges are stretched across.
// Handles have odd sides so they centre on a column and a row.  The zoom
// button is 20 x 20 and the gain button's glyph three quarters of its 40
// rows.
#pragma once

#define VELM_EXPECTED_PICTURES(X)          \
    X(Background, 32, 32)                  \
    X(BottomCursorSlider, 11, 17)          \
    X(Cancel, 16, 16)                      \
    X(LeftSelectionSlider, 11, 17)         \
    X(Lupa, 16, 16)                        \
    X(LupaMenu, 24, 16)                    \
    X(Mouse, 16, 16)                       \
    X(PlayOverlay, 48, 48)                 \
    X(RedCursorSlider, 11, 17)             \
    X(RegionRaggedLeft, 12, 12)            \
    X(RegionRaggedRight, 12, 12)           \
    X(RegionRectBottomLeft, 2, 16)         \
    X(RegionRectBottomOpen, 12, 16)        \
    X(RegionRectBottomRight, 2, 16)        \
    X(RegionRectLeft, 2, 12)               \
    X(RegionRectOpen, 12, 28)              \
    X(RegionRectRight, 2, 12)              \
    X(RegionRectTopLeft, 2, 12)            \
    X(RegionRectTopOpen, 12, 12)           \
    X(RegionRectTopRight, 2, 12)           \
    X(RegionRoundBottomLeftOpen, 12, 16)   \
    X(RegionRoundBottomRightOpen, 12, 16)  \
    X(RegionRoundLeftOpen, 12, 12)         \
    X(RegionRoundRightOpen, 12, 12)        \
    X(RegionRoundTopLeftOpen, 12, 12)      \
    X(RegionRoundTopRightOpen, 12, 12)     \
    X(RightSelectionSlider, 11, 17)        \
    X(SelRegionRectBottomOpen, 12, 16)     \
    X(SelRegionRectLeft, 2, 12)            \
    X(SelRegionRectOpen, 12, 28)           \
    X(SelRegionRectRight, 2, 12)           \
    X(SelRegionRectTopOpen, 12, 12)        \
    X(SelRegionRoundBottomLeftOpen, 12, 16)  \
    X(SelRegionRoundBottomRightOpen, 12, 16) \
    X(SelRegionRoundLeftOpen, 12, 12)      \
    X(SelRegionRoundRightOpen, 12, 12)     \
    X(SelRegionRoundTopLeftOpen, 12, 12)   \
    X(SelRegionRoundTopRightOpen, 12, 12)  \
    X(TopCursorSlider, 11, 17)             \
    X(TransparentCursorSlider, 11, 17)     \
    X(Volume33, 30, 30)                    \
    X(Volume66, 30, 30)                    \
    X(VolumeOff, 30, 30)                   \
    X(VolumeOn, 30, 30)                    \
    X(ZoomFull, 20, 20)                    \
    X(ZoomIn, 20, 20)                      \
    X(ZoomOut, 20, 20)                     \
    X(ZoomSelection, 20, 20)               \
    X(ZoomVertIn, 20, 20)                  \
    X(ZoomVertOut, 20, 20)
