// The exported guards: what reaches the operations table, and what never does.
#include "render/canvas/recording_backend.h"

#include <gtest/gtest.h>

#include <limits>

using velm::test::AsImage;
using velm::test::FakeImage;
using velm::test::Recorder;

namespace {

class Guards : public velm::test::RecordingCanvas {
protected:
    FakeImage image{"img", 30, 20};
    _VELMRECT rect{10, 10, 50, 40, 59, 49};
    _VELMCANVASFONT font{"Tahoma", 9.0f, 0, {0, 0, 0, 0}};
    int xs[4] = {0, 1, 2, 3};
    int ys[4] = {3, 2, 1, 0};
    unsigned pixels[4] = {};
};

// Calls every exported operation once; returns how many answered something
// other than their failure value.
int CallEverything(VELMCANVAS canvas, VELMCANVASIMAGE image, const _VELMRECT *rect, const _VELMCANVASFONT *font,
                   const int *xs, const int *ys, const void *pixels)
{
    int w = 0, h = 0;
    _VELMRECT out{};
    int painter = 0;
    int answered = 0;
    auto count = [&answered](bool non_failure) { answered += non_failure; };
    count(VELMCANVAS_GetOutputHandle(canvas) != nullptr);
    count(VELMCANVAS_GetDrawObject(canvas) != nullptr);
    count(VELMCANVAS_SetDrawObject(canvas, &painter) != 0);
    count(VELMCANVAS_SelectTarget(canvas, 1) != 0);
    count(VELMCANVAS_BeginDraw(canvas, &painter) != 0);
    count(VELMCANVAS_EndDraw(canvas) != 0);
    count(VELMCANVAS_UseLowProfile(canvas, 1) != 0);
    count(VELMCANVAS_ResizeCanvas(canvas, 100, 100) != 0);
    count(VELMCANVAS_CopyCanvas(canvas, 1, 2) != 0);
    count(VELMCANVAS_InitPath(canvas) != 0);
    count(VELMCANVAS_ClosePath(canvas) != 0);
    count(VELMCANVAS_Clear(canvas) != 0);
    count(VELMCANVAS_ProtectDrawArea(canvas, rect) != 0);
    count(VELMCANVAS_SetDrawArea(canvas, rect) != 0);
    count(VELMCANVAS_ClearDrawArea(canvas) != 0);
    count(VELMCANVAS_GetDimension(canvas, &w, &h) != 0);
    count(VELMCANVAS_GetMaxDimension(canvas, &w, &h) != 0);
    count(VELMCANVAS_DrawPoint(canvas, 1, 1, 0xFF) != 0);
    count(VELMCANVAS_MoveTo(canvas, 1, 1) != 0);
    count(VELMCANVAS_LineTo(canvas, 2, 2) != 0);
    count(VELMCANVAS_DrawPolygon(canvas, xs, ys, 4, 0) != 0);
    count(VELMCANVAS_DrawPolyline(canvas, xs, ys, 4) != 0);
    count(VELMCANVAS_DrawLine(canvas, 0, 0, 5, 5) != 0);
    count(VELMCANVAS_TextOut(canvas, 0, 0, "a") != 0);
    count(VELMCANVAS_TextOutVertical(canvas, 0, 0, "a") != 0);
    count(VELMCANVAS_SaveOverlay(canvas, 0, 0, 5, 5) != 0);
    count(VELMCANVAS_SaveOverlayRect(canvas, rect) != 0);
    count(VELMCANVAS_GetOverlayRect(canvas, &out) != 0);
    count(VELMCANVAS_RestoreOverlay(canvas) != 0);
    count(VELMCANVAS_CreateImage(canvas, 4, 4) != nullptr);
    count(VELMCANVAS_CopyImage(canvas, 0, 0, 4, 4, image) != 0);
    count(VELMCANVAS_PasteImage(canvas, image, 0, 0) != 0);
    count(VELMCANVAS_PasteImageScaled(canvas, image, 0, 0, 8, 8) != 0);
    count(VELMCANVAS_ImageWidth(canvas, image) != 0);
    count(VELMCANVAS_ImageHeight(canvas, image) != 0);
    count(VELMCANVAS_PutImage(canvas, 0, 0, 2, 2, pixels, 2, 2, 0, 0, 0, 2, 2) != 0);
    count(VELMCANVAS_FillRect(canvas, 0, 0, 5, 5, 0) != 0);
    count(VELMCANVAS_BorderRect(canvas, 0, 0, 5, 5, 0) != 0);
    count(VELMCANVAS_FillHorzGradientRect(canvas, 0, 0, 5, 5, 0) != 0);
    count(VELMCANVAS_FillVertGradientRect(canvas, 0, 0, 5, 5, 0) != 0);
    count(VELMCANVAS_ShadowRect(canvas, 0, 0, 5, 5, 3, 0) != 0);
    count(VELMCANVAS_SelectColor(canvas, 0xFF) != 0);
    count(VELMCANVAS_SelectColorMap(canvas, &VELMCOLORMAP_CE2K) != 0);
    count(VELMCANVAS_SelectShadowColor(canvas, 0) != 0);
    count(VELMCANVAS_SelectFont(canvas, font) != 0);
    count(VELMCANVAS_SelectFontColor(canvas, 0) != 0);
    count(VELMCANVAS_SelectGradient(canvas, 0, 0xFFFFFF) != 0);
    count(VELMCANVAS_SetAlphaFactor(canvas, 0.5f) != -1.0f);
    count(VELMCANVAS_MoveBlock(canvas, 0, 0, 5, 5, 1, 1) != 0);
    count(VELMCANVAS_MoveBlock2(canvas, 1, 0, 0, 5, 5, 2, 1, 1) != 0);
    count(VELMCANVAS_TextWidth(canvas, "abc") != 0);
    count(VELMCANVAS_TextHeight(canvas, "abc") != 0);
    count(VELMCANVAS_DrawAlphaRect(canvas, 0, 0, 5, 5, VELMCANVASALPHA_DARKLEFT) != 0);
    count(VELMCANVAS_DrawImage(canvas, 0, 0, 5, 5, "/nonexistent.png") != 0);
    count(VELMCANVAS_TileImage(canvas, image, rect) != 0);
    count(VELMCANVAS_FillRectangleText(canvas, rect, "text", 0) != 0);
    count(VELMCANVAS_DrawChar(canvas, 3, 0, 'a', 0) != 0);
    count(VELMCANVAS_BevelRect(canvas, 10, 10, 50, 40) != 0);
    count(VELMCANVAS_DestroyImage(canvas, image) != 0);
    return answered;
}

TEST_F(Guards, EveryOperationReachesTheTableOfAUsableCanvas)
{
    EXPECT_EQ(CallEverything(canvas, AsImage(image), &rect, &font, xs, ys, pixels), 59);
}

TEST_F(Guards, NullCanvasOpsOrDataAnswerFailureAndCallNothing)
{
    EXPECT_EQ(CallEverything(nullptr, AsImage(image), &rect, &font, xs, ys, pixels), 0);

    _VELMCANVAS without_data = *canvas;
    without_data.data = nullptr;
    EXPECT_EQ(CallEverything(&without_data, AsImage(image), &rect, &font, xs, ys, pixels), 0);

    _VELMCANVAS without_ops = *canvas;
    without_ops.ops = nullptr;
    EXPECT_EQ(CallEverything(&without_ops, AsImage(image), &rect, &font, xs, ys, pixels), 0);
    EXPECT_TRUE(rec.calls.empty()) << rec.calls.front();

    EXPECT_EQ(VELMCANVAS_DestroyCanvas(nullptr), 0);
    EXPECT_EQ(VELMCANVAS_SetAlphaFactor(nullptr, 0.5f), -1.0f);
}

TEST_F(Guards, EmptySlotsAnswerFailure)
{
    _VELMCANVASOPS sparse = rec.ops;
    sparse.UseLowProfile = nullptr;
    sparse.SaveOverlay = nullptr;
    sparse.GetOverlayRect = nullptr;
    sparse.RestoreOverlay = nullptr;
    sparse.PasteImageScaled = nullptr;
    sparse.ImageWidth = nullptr;
    sparse.ImageHeight = nullptr;
    sparse.DrawImage = nullptr;
    canvas->ops = &sparse;
    _VELMRECT out{};
    EXPECT_EQ(VELMCANVAS_UseLowProfile(canvas, 1), 0);
    EXPECT_EQ(VELMCANVAS_SaveOverlay(canvas, 0, 0, 4, 4), 0);
    EXPECT_EQ(VELMCANVAS_SaveOverlayRect(canvas, &rect), 0);
    EXPECT_EQ(VELMCANVAS_GetOverlayRect(canvas, &out), 0);
    EXPECT_EQ(VELMCANVAS_RestoreOverlay(canvas), 0);
    EXPECT_EQ(VELMCANVAS_PasteImageScaled(canvas, AsImage(image), 0, 0, 4, 4), 0);
    EXPECT_EQ(VELMCANVAS_ImageWidth(canvas, AsImage(image)), 0);
    EXPECT_EQ(VELMCANVAS_ImageHeight(canvas, AsImage(image)), 0);
    EXPECT_EQ(VELMCANVAS_DrawImage(canvas, 0, 0, 4, 4, "/x.png"), 0);
    // Tiling needs the image size.
    EXPECT_EQ(VELMCANVAS_TileImage(canvas, AsImage(image), &rect), 0);
    EXPECT_TRUE(rec.calls.empty()) << rec.calls.front();
    canvas->ops = &rec.ops;
}

TEST_F(Guards, BadArgumentsAreRefusedBeforeTheTable)
{
    int w = 0;
    EXPECT_EQ(VELMCANVAS_SetDrawObject(canvas, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_ProtectDrawArea(canvas, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_SetDrawArea(canvas, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_GetDimension(canvas, &w, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_GetMaxDimension(canvas, nullptr, &w), 0);
    EXPECT_EQ(VELMCANVAS_DrawPoint(canvas, -1, 0, 0), 0);
    EXPECT_EQ(VELMCANVAS_DrawPoint(canvas, 0, -1, 0), 0);
    EXPECT_EQ(VELMCANVAS_DrawPolygon(canvas, nullptr, ys, 4, 0), 0);
    EXPECT_EQ(VELMCANVAS_DrawPolyline(canvas, xs, ys, 0), 0);
    EXPECT_EQ(VELMCANVAS_TextOut(canvas, 0, 0, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_TextOutVertical(canvas, 0, 0, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_SaveOverlayRect(canvas, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_GetOverlayRect(canvas, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_CreateImage(canvas, 0, 5), nullptr);
    EXPECT_EQ(VELMCANVAS_CreateImage(canvas, 5, 0), nullptr);
    EXPECT_EQ(VELMCANVAS_CopyImage(canvas, 0, 0, 4, 4, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_CopyImage(canvas, 0, 0, 0, 4, AsImage(image)), 0);
    EXPECT_EQ(VELMCANVAS_PasteImage(canvas, nullptr, 0, 0), 0);
    EXPECT_EQ(VELMCANVAS_PasteImageScaled(canvas, nullptr, 0, 0, 4, 4), 0);
    EXPECT_EQ(VELMCANVAS_DestroyImage(canvas, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_PutImage(canvas, 0, 0, 2, 2, nullptr, 2, 2, 0, 0, 0, 2, 2), 0);
    EXPECT_EQ(VELMCANVAS_ShadowRect(canvas, 0, 0, 5, 5, 0, 0), 0);
    EXPECT_EQ(VELMCANVAS_SelectColorMap(canvas, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_SelectFont(canvas, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_MoveBlock(canvas, 0, 0, 0, 5, 1, 1), 0);
    EXPECT_EQ(VELMCANVAS_MoveBlock2(canvas, 1, 0, 0, 5, 0, 2, 1, 1), 0);
    EXPECT_EQ(VELMCANVAS_TextWidth(canvas, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_TextHeight(canvas, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_DrawAlphaRect(canvas, 0, 0, 5, 0, VELMCANVASALPHA_DARKTOP), 0);
    EXPECT_EQ(VELMCANVAS_DrawImage(canvas, 0, 0, 5, 5, nullptr), 0);
    EXPECT_EQ(VELMCANVAS_TileImage(canvas, AsImage(image), nullptr), 0);
    EXPECT_EQ(VELMCANVAS_FillRectangleText(canvas, &rect, nullptr, 0), 0);
    EXPECT_TRUE(rec.calls.empty()) << rec.calls.front();
}

TEST_F(Guards, ColoursLoseTheirTopByteWhereThePartSaysSo)
{
    VELMCANVAS_SelectColor(canvas, 0xAA123456);
    VELMCANVAS_SelectShadowColor(canvas, 0xBB654321);
    VELMCANVAS_SelectGradient(canvas, 0xCC000001, 0xDD000002);
    EXPECT_EQ(rec.calls, (std::vector<std::string>{"SelectColor(0x123456)", "SelectShadowColor(0x654321)",
                                                   "SelectGradient(0xCC000001,0xDD000002)"}));
}

TEST_F(Guards, SaveOverlayRectPassesTheFirstFourFields)
{
    EXPECT_EQ(VELMCANVAS_SaveOverlayRect(canvas, &rect), 1);
    EXPECT_EQ(rec.calls, std::vector<std::string>{"SaveOverlay(10,10,50,40)"});
}

TEST_F(Guards, AlphaFactorOutsideZeroToOneIsRefused)
{
    EXPECT_EQ(VELMCANVAS_SetAlphaFactor(canvas, 1.5f), -1.0f);
    EXPECT_EQ(VELMCANVAS_SetAlphaFactor(canvas, -0.1f), -1.0f);
    EXPECT_EQ(VELMCANVAS_SetAlphaFactor(canvas, std::numeric_limits<float>::quiet_NaN()), -1.0f);
    EXPECT_TRUE(rec.calls.empty());
    EXPECT_EQ(VELMCANVAS_SetAlphaFactor(canvas, 0.25f), 1.0f);
    EXPECT_EQ(VELMCANVAS_SetAlphaFactor(canvas, 1.0f), 0.25f);
}

TEST_F(Guards, ImageQueriesAndDestructionTakeNoBackEndData)
{
    EXPECT_EQ(VELMCANVAS_ImageWidth(canvas, AsImage(image)), 30);
    EXPECT_EQ(VELMCANVAS_ImageHeight(canvas, AsImage(image)), 20);
    EXPECT_EQ(VELMCANVAS_DestroyImage(canvas, AsImage(image)), 1);
    EXPECT_EQ(rec.calls, (std::vector<std::string>{"ImageWidth(img)", "ImageHeight(img)", "DestroyImage(img)"}));
}

} // namespace
