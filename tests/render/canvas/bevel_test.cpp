// The region frame of VELMCANVAS_BevelRect.  The library reaches the
// picture set weakly, so this executable supplies its own set: the frame's
// geometry shows in the recorded pastes.
#include "render/canvas/recording_backend.h"

#include <gtest/gtest.h>

using velm::test::AsImage;
using velm::test::FakeImage;
using velm::test::Recorder;
using Calls = std::vector<std::string>;

namespace {

FakeImage round_top_left{"RoundTopLeftOpen", 12, 12}, round_left{"RoundLeftOpen", 12, 1},
    round_bottom_left{"RoundBottomLeftOpen", 12, 16}, round_top_right{"RoundTopRightOpen", 12, 12},
    round_right{"RoundRightOpen", 12, 1}, round_bottom_right{"RoundBottomRightOpen", 12, 16},
    rect_top_open{"RectTopOpen", 1, 12}, rect_bottom_open{"RectBottomOpen", 1, 16},
    rect_top_left{"RectTopLeft", 2, 12}, rect_left{"RectLeft", 2, 1}, rect_bottom_left{"RectBottomLeft", 2, 16},
    rect_top_right{"RectTopRight", 2, 12}, rect_right{"RectRight", 2, 1},
    rect_bottom_right{"RectBottomRight", 2, 16};

} // namespace

extern "C" {
#define PICTURE __attribute__((visibility("default"))) VELMCANVASIMAGE
PICTURE Img_RegionRoundTopLeftOpen = AsImage(round_top_left);
PICTURE Img_RegionRoundLeftOpen = AsImage(round_left);
PICTURE Img_RegionRoundBottomLeftOpen = AsImage(round_bottom_left);
PICTURE Img_RegionRoundTopRightOpen = AsImage(round_top_right);
PICTURE Img_RegionRoundRightOpen = AsImage(round_right);
PICTURE Img_RegionRoundBottomRightOpen = AsImage(round_bottom_right);
PICTURE Img_RegionRectTopOpen = AsImage(rect_top_open);
PICTURE Img_RegionRectBottomOpen = AsImage(rect_bottom_open);
PICTURE Img_RegionRectTopLeft = AsImage(rect_top_left);
PICTURE Img_RegionRectLeft = AsImage(rect_left);
PICTURE Img_RegionRectBottomLeft = AsImage(rect_bottom_left);
PICTURE Img_RegionRectTopRight = AsImage(rect_top_right);
PICTURE Img_RegionRectRight = AsImage(rect_right);
PICTURE Img_RegionRectBottomRight = AsImage(rect_bottom_right);
#undef PICTURE
}

namespace {

using Bevel = velm::test::RecordingCanvas;

TEST_F(Bevel, WideRegionsGetRoundedPiecesAroundThem)
{
    EXPECT_EQ(VELMCANVAS_BevelRect(canvas, 50, 20, 100, 60), 1);
    EXPECT_EQ(rec.CallsOf("Paste"),
              (Calls{"PasteImage(RoundTopLeftOpen,44,17)", "PasteImageScaled(RoundLeftOpen,44,29,12,43)",
                     "PasteImage(RoundBottomLeftOpen,44,72)", "PasteImage(RoundTopRightOpen,144,17)",
                     "PasteImageScaled(RoundRightOpen,144,29,12,43)", "PasteImage(RoundBottomRightOpen,144,72)",
                     "PasteImageScaled(RectTopOpen,56,17,88,12)", "PasteImageScaled(RectBottomOpen,56,72,88,16)"}));
}

TEST_F(Bevel, NarrowRegionsGetSquarePieces)
{
    EXPECT_EQ(VELMCANVAS_BevelRect(canvas, 50, 20, 10, 60), 1);
    EXPECT_EQ(rec.CallsOf("Paste"),
              (Calls{"PasteImage(RectTopLeft,50,17)", "PasteImageScaled(RectLeft,50,29,2,43)",
                     "PasteImage(RectBottomLeft,50,72)", "PasteImage(RectTopRight,58,17)",
                     "PasteImageScaled(RectRight,58,29,2,43)", "PasteImage(RectBottomRight,58,72)",
                     "PasteImageScaled(RectTopOpen,52,17,6,12)", "PasteImageScaled(RectBottomOpen,52,72,6,16)"}));
}

TEST_F(Bevel, TheFrameFollowsTheConstrainedRectangle)
{
    // Cut to start 32 pixels before the left edge.
    EXPECT_EQ(VELMCANVAS_BevelRect(canvas, -100, 20, 200, 60), 1);
    EXPECT_EQ(rec.CallsOf("PasteImage(RoundTopLeftOpen"), Calls{"PasteImage(RoundTopLeftOpen,-38,17)"});
    rec.calls.clear();
    EXPECT_EQ(VELMCANVAS_BevelRect(canvas, 10, 10, -3, 40), 0);
    EXPECT_TRUE(rec.CallsOf("Paste").empty());
}

} // namespace
