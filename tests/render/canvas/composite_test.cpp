// Rectangle constraint, resizing and the composite operations, seen through
// the calls they make on a recording back-end.
#include "render/canvas/recording_backend.h"

#include <gtest/gtest.h>

using velm::test::AsImage;
using velm::test::FakeImage;
using velm::test::Recorder;
using Calls = std::vector<std::string>;

namespace {

class Composite : public velm::test::RecordingCanvas {
protected:
    Calls Drawn() const
    {
        Calls drawn;
        for (const std::string &call : rec.calls) {
            const bool query = call.rfind("TextWidth", 0) == 0 || call.rfind("TextHeight", 0) == 0 ||
                               call.rfind("Get", 0) == 0 || call.rfind("Image", 0) == 0;
            if (!query) drawn.push_back(call);
        }
        return drawn;
    }

};

TEST_F(Composite, SharpRectanglesMayReachJustPastTheEdges)
{
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, 0, 0, -1, 10, 0), 0);
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, -10, 5, 20, 10, 0), 1);
    EXPECT_EQ(VELMCANVAS_BorderRect(canvas, 390, -9, 50, 500, 0), 1);
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, 500, 5, 20, 10, 0), 0);
    EXPECT_EQ(Drawn(), (Calls{"FillRect(-2,5,12,10,0,0x0,0x0)", "BorderRect(390,-1,11,202,0,0x0,0x0)"}));
}

TEST_F(Composite, RoundedRectanglesMayReachTheirCornerSizePastTheEdges)
{
    // 21 is limited to the smaller side, 10, which is already even.
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, 20, 20, 10, 30, 21), 1);
    // 16 stays; the rectangle is cut to start 16 before the edge.
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, -40, 0, 100, 50, 0x50010), 1);
    // 15 becomes 14; the right side is cut to end 14 past the edge.
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, 380, 0, 100, 50, 15), 1);
    EXPECT_EQ(Drawn(), (Calls{"FillRect(20,20,10,30,10,0x0,0x0)", "FillRect(-16,0,76,50,16,0x50000,0x50000)",
                              "FillRect(380,0,34,50,14,0x0,0x0)"}));
}

TEST_F(Composite, OptionWordsAreSplitForEachSlot)
{
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, 10, 10, 50, 50, 0x7F155010), 1);
    EXPECT_EQ(VELMCANVAS_FillHorzGradientRect(canvas, 10, 10, 50, 50, 0x7F155410), 1);
    EXPECT_EQ(VELMCANVAS_FillVertGradientRect(canvas, 10, 10, 8, 50, 0x410), 1);
    EXPECT_EQ(VELMCANVAS_ShadowRect(canvas, 10, 10, 50, 50, 7, 0x7F155010), 1);
    EXPECT_EQ(Drawn(), (Calls{"FillRect(10,10,50,50,16,0x50000,0x7F155000)",
                              "FillHorzGradientRect(10,10,50,50,0x55410)", "FillVertGradientRect(10,10,8,50,0x408)",
                              "ShadowRect(10,10,50,50,7,16,0x55000,0x100000,127)"}));
}

TEST_F(Composite, ShapesNeedTheCanvasSize)
{
    rec.failing.insert("GetDimension");
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, 10, 10, 5, 5, 0), 0);
    EXPECT_EQ(VELMCANVAS_BevelRect(canvas, 10, 10, 50, 40), 0);
    EXPECT_TRUE(Drawn().empty());
}

TEST_F(Composite, ResizeWithinTheAllocationOnlyChangesTheVisibleSize)
{
    EXPECT_EQ(VELMCANVAS_ResizeCanvas(canvas, 300, 20), 1);
    EXPECT_EQ(rec.calls, Calls{"ResizeCanvas(300,80)"});
    EXPECT_EQ(VELMCANVAS_ResizeCanvas(canvas, 0, 100), 0);
    EXPECT_EQ(VELMCANVAS_ResizeCanvas(canvas, 100, -5), 0);
    EXPECT_EQ(rec.calls.size(), 1u);
}

TEST_F(Composite, GrowingRecreatesTheBackEndAtTheLargerSize)
{
    EXPECT_EQ(VELMCANVAS_ResizeCanvas(canvas, 500, 100), 1);
    EXPECT_EQ(rec.calls, (Calls{"DestroyCanvas()", "CreateCanvas(500,200)", "ResizeCanvas(500,100)"}));
    EXPECT_EQ(canvas->width, 500);
    EXPECT_EQ(canvas->height, 200);
}

TEST_F(Composite, AFailedRecreationLeavesTheCanvasInert)
{
    rec.failing.insert("CreateCanvas");
    EXPECT_EQ(VELMCANVAS_ResizeCanvas(canvas, 400, 300), 0);
    EXPECT_EQ(canvas->data, nullptr);
    rec.calls.clear();
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, 0, 0, 5, 5, 0), 0);
    EXPECT_EQ(VELMCANVAS_ResizeCanvas(canvas, 100, 100), 0);
    EXPECT_TRUE(rec.calls.empty());
}

TEST_F(Composite, CreationFailsWithoutASizeOrWhenTheBackEndFails)
{
    EXPECT_EQ(VELMCANVAS_CreateCanvas(&rec.ops, nullptr, 0, 10), nullptr);
    EXPECT_EQ(VELMCANVAS_CreateCanvas(&rec.ops, nullptr, 10, -1), nullptr);
    EXPECT_EQ(VELMCANVAS_CreateCanvas(nullptr, nullptr, 10, 10), nullptr);
    EXPECT_TRUE(rec.calls.empty());
    rec.failing.insert("CreateCanvas");
    EXPECT_EQ(VELMCANVAS_CreateCanvas(&rec.ops, nullptr, 10, 10), nullptr);
    EXPECT_EQ(rec.calls, Calls{"CreateCanvas(10,10)"});
}

TEST_F(Composite, TilingPastesOverTheRectangleInsideItsDrawArea)
{
    FakeImage tile{"tile", 30, 20};
    const _VELMRECT rect{10, 5, 70, 45, 79, 49};
    EXPECT_EQ(VELMCANVAS_TileImage(canvas, AsImage(tile), &rect), 1);
    EXPECT_EQ(Drawn(), (Calls{"SetDrawArea({10,5,70,45})", "PasteImage(tile,10,5)", "PasteImage(tile,10,25)",
                              "PasteImage(tile,10,45)", "PasteImage(tile,40,5)", "PasteImage(tile,40,25)",
                              "PasteImage(tile,40,45)", "PasteImage(tile,70,5)", "PasteImage(tile,70,25)",
                              "PasteImage(tile,70,45)", "ClearDrawArea()"}));
}

TEST_F(Composite, AFailedPasteStopsTilingButLiftsTheDrawArea)
{
    FakeImage tile{"tile", 30, 20};
    const _VELMRECT rect{0, 0, 70, 45, 69, 44};
    rec.failing.insert("PasteImage");
    EXPECT_EQ(VELMCANVAS_TileImage(canvas, AsImage(tile), &rect), 0);
    EXPECT_EQ(Drawn(), (Calls{"SetDrawArea({0,0,70,45})", "PasteImage(tile,0,0)", "ClearDrawArea()"}));

    FakeImage empty{"empty", 0, 20};
    rec.calls.clear();
    EXPECT_EQ(VELMCANVAS_TileImage(canvas, AsImage(empty), &rect), 0);
    EXPECT_TRUE(Drawn().empty());
}

TEST_F(Composite, TilingAHugeRectangleStopsAtTheSurface)
{
    FakeImage dot{"dot", 1, 1};
    const _VELMRECT rect{3990, 2995, 1000000, 1000000, 0, 0};
    EXPECT_EQ(VELMCANVAS_TileImage(canvas, AsImage(dot), &rect), 1);
    EXPECT_EQ(rec.CallsOf("PasteImage").size(), 10u * 5u);
}

TEST_F(Composite, DrawCharCentresTheCharacterInItsCell)
{
    EXPECT_EQ(VELMCANVAS_DrawChar(canvas, 100, 7, '5', 11), 111);
    EXPECT_EQ(VELMCANVAS_DrawChar(canvas, 100, 7, 'W', 2), 106);
    EXPECT_EQ(Drawn(), (Calls{"TextOut(102,7,\"5\")", "TextOut(100,7,\"W\")"}));
}

// Text is 6 pixels a character and 10 high on the recording back-end.
TEST_F(Composite, TextThatFitsIsDrawnOnOneAlignedLine)
{
    const _VELMRECT rect{100, 50, 60, 30, 0, 0};
    VELMCANVAS_FillRectangleText(canvas, &rect, "abcd", VELMCANVASTEXT_CENTER);
    VELMCANVAS_FillRectangleText(canvas, &rect, "abcd", VELMCANVASTEXT_LEFT);
    VELMCANVAS_FillRectangleText(canvas, &rect, "abcd", VELMCANVASTEXT_RIGHT);
    VELMCANVAS_FillRectangleText(canvas, &rect, "abcd", 3);
    EXPECT_EQ(Drawn(), (Calls{"TextOut(118,60,\"abcd\")", "TextOut(100,60,\"abcd\")", "TextOut(136,60,\"abcd\")",
                              "TextOut(100,60,\"abcd\")"}));
}

TEST_F(Composite, TextInALowRectangleIsNotDrawn)
{
    const _VELMRECT rect{0, 0, 100, 10, 0, 0};
    EXPECT_EQ(VELMCANVAS_FillRectangleText(canvas, &rect, "abcd", VELMCANVASTEXT_ELLIPSIS), 1);
    EXPECT_TRUE(Drawn().empty());
}

TEST_F(Composite, LongTextWrapsGreedilyAndCentresTheBlock)
{
    // 56 wide: "aaa bbb" is 42, and adding "cc" would make 54 > 56 - 6.
    const _VELMRECT rect{0, 0, 56, 50, 0, 0};
    VELMCANVAS_FillRectangleText(canvas, &rect, "aaa bbb cc  dddddddd e", VELMCANVASTEXT_LEFT);
    EXPECT_EQ(Drawn(), (Calls{"TextOut(0,5,\"aaa bbb\")", "TextOut(0,15,\"cc\")", "TextOut(0,25,\"dddddddd\")",
                              "TextOut(0,35,\"e\")"}));
    rec.calls.clear();
    VELMCANVAS_FillRectangleText(canvas, &rect, "aaa bbb cc  dddddddd e", VELMCANVASTEXT_RIGHT);
    EXPECT_EQ(Drawn(), (Calls{"TextOut(14,5,\"aaa bbb\")", "TextOut(44,15,\"cc\")", "TextOut(8,25,\"dddddddd\")",
                              "TextOut(50,35,\"e\")"}));
}

TEST_F(Composite, TooManyLinesEndInAnEllipsisOrDrawNothing)
{
    const _VELMRECT rect{0, 0, 56, 25, 0, 0};
    const char *text = "aaa bbb cc dddddddd e";
    VELMCANVAS_FillRectangleText(canvas, &rect, text, VELMCANVASTEXT_CENTER);
    EXPECT_TRUE(Drawn().empty());
    VELMCANVAS_FillRectangleText(canvas, &rect, text, VELMCANVASTEXT_CENTER | VELMCANVASTEXT_ELLIPSIS);
    EXPECT_EQ(Drawn(), (Calls{"TextOut(7,2,\"aaa bbb\")", "TextOut(13,12,\". . .\")"}));
}

TEST_F(Composite, AWordWiderThanTheRectangleShowsOnlyTheEllipsis)
{
    const _VELMRECT rect{0, 0, 40, 30, 0, 0};
    VELMCANVAS_FillRectangleText(canvas, &rect, "a bbbbbbbbbbbbb", VELMCANVASTEXT_LEFT);
    EXPECT_TRUE(Drawn().empty());
    VELMCANVAS_FillRectangleText(canvas, &rect, "a bbbbbbbbbbbbb", VELMCANVASTEXT_LEFT | VELMCANVASTEXT_ELLIPSIS);
    EXPECT_EQ(Drawn(), Calls{"TextOut(5,10,\". . .\")"});
}

TEST_F(Composite, ARectangleNarrowerThanTheEllipsisShowsNothingThatDoesNotFit)
{
    const _VELMRECT rect{0, 0, 24, 30, 0, 0};
    VELMCANVAS_FillRectangleText(canvas, &rect, "abcdefgh", VELMCANVASTEXT_ELLIPSIS);
    EXPECT_TRUE(Drawn().empty());
}

} // namespace
