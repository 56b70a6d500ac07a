// Each operation drawn into a canvas and compared with a reviewed reference
// image (see golden.h to regenerate them).
#include "render/canvas/golden.h"
#include "render/canvas/qt_fixture.h"

#include <vector>

using velm::test::kStrict;
using velm::test::kTextTolerant;
using velm::test::MatchesGolden;
using velm::test::QtCanvas;

namespace {

// The default view colours: a dark teal ground and light drawing.
constexpr uint32_t kGround = 0x504020;
constexpr uint32_t kLight = 0xE0F0C0;
constexpr uint32_t kOrange = 0x2080F0;
constexpr uint32_t kPurple = 0x802070;

using Golden = QtCanvas;

TEST_F(Golden, FilledAndBorderedRectangles)
{
    Background(kGround);
    VELMCANVAS_SelectColor(canvas, kLight);
    VELMCANVAS_FillRect(canvas, 8, 8, 40, 30, 0);
    VELMCANVAS_FillRect(canvas, 56, 8, 40, 30, 16);
    VELMCANVAS_FillRect(canvas, 104, 8, 48, 30, 0x50010); // square on the left
    VELMCANVAS_SelectColor(canvas, kOrange);
    VELMCANVAS_BorderRect(canvas, 8, 50, 40, 40, 0);
    VELMCANVAS_BorderRect(canvas, 56, 50, 40, 40, 12);
    VELMCANVAS_BorderRect(canvas, -10, -10, 5, 5, 0); // cut away entirely
    VELMCANVAS_SetAlphaFactor(canvas, 0.4f);
    VELMCANVAS_FillRect(canvas, 80, 60, 76, 36, 0xA0008); // two square corners
    VELMCANVAS_SetAlphaFactor(canvas, 1.0f);
    EXPECT_TRUE(MatchesGolden(Output(), "rectangles", kStrict));
}

TEST_F(Golden, GradientFills)
{
    Background(kGround);
    VELMCANVAS_SelectGradient(canvas, kOrange, kPurple);
    VELMCANVAS_FillHorzGradientRect(canvas, 8, 8, 144, 24, 0);
    VELMCANVAS_FillVertGradientRect(canvas, 8, 40, 60, 52, 20);
    // Alphas from the colours' top bytes: opaque orange to a faint light.
    VELMCANVAS_SelectGradient(canvas, 0xFF000000 | kOrange, 0x20000000 | kLight);
    VELMCANVAS_FillHorzGradientRect(canvas, 80, 40, 72, 52, 0x400 | 0x20000 | 24);
    EXPECT_TRUE(MatchesGolden(Output(), "gradients", kStrict));
}

TEST_F(Golden, SoftShadows)
{
    Background(kLight);
    VELMCANVAS_SelectShadowColor(canvas, 0x000000);
    VELMCANVAS_SelectColor(canvas, 0xFFFFFF);
    VELMCANVAS_ShadowRect(canvas, 16, 16, 40, 28, 10, 0xC0000000);
    VELMCANVAS_FillRect(canvas, 16, 16, 40, 28, 0);
    VELMCANVAS_ShadowRect(canvas, 88, 16, 48, 28, 7, 0x4C00000C); // rounded, as a focused region
    VELMCANVAS_FillRect(canvas, 88, 16, 48, 28, 12);
    VELMCANVAS_SelectShadowColor(canvas, kPurple);
    VELMCANVAS_ShadowRect(canvas, 16, 70, 130, 1, 15, 0x3F7FF000); // bottom side only
    VELMCANVAS_ShadowRect(canvas, 80, 56, 1, 40, 12, 0x7F155010 & ~0x100000u); // every side, square left
    EXPECT_TRUE(MatchesGolden(Output(), "shadows", kStrict));
}

TEST_F(Golden, AlphaRectangles)
{
    Background(kLight);
    VELMCANVAS_DrawAlphaRect(canvas, 4, 4, 72, 44, VELMCANVASALPHA_DARKRIGHT);
    VELMCANVAS_DrawAlphaRect(canvas, 84, 4, 72, 44, VELMCANVASALPHA_DARKLEFT);
    VELMCANVAS_DrawAlphaRect(canvas, 4, 52, 72, 44, VELMCANVASALPHA_DARKTOP);
    VELMCANVAS_DrawAlphaRect(canvas, 84, 52, 72, 44, VELMCANVASALPHA_DARKBOTTOM);
    EXPECT_TRUE(MatchesGolden(Output(), "alpha_rectangles", kStrict));
}

TEST_F(Golden, LinesPathsPolylinesAndEnvelopes)
{
    Background(kGround);
    VELMCANVAS_SelectColor(canvas, kLight);
    VELMCANVAS_DrawLine(canvas, 4, 4, 60, 4);
    VELMCANVAS_DrawLine(canvas, 60, 8, 4, 8);
    VELMCANVAS_DrawLine(canvas, 4, 12, 60, 30);
    VELMCANVAS_MoveTo(canvas, 70, 30);
    VELMCANVAS_InitPath(canvas);
    for (int i = 1; i <= 8; ++i) VELMCANVAS_LineTo(canvas, 70 + i * 10, (i % 2) ? 5 : 30);
    VELMCANVAS_ClosePath(canvas);
    // An envelope: the top edge left to right, then the bottom edge back.
    std::vector<int> xs, ys;
    for (int i = 0; i < 70; ++i) {
        xs.push_back(10 + i * 2);
        ys.push_back(60 - (i * 7) % 13);
    }
    for (int i = 69; i >= 0; --i) {
        xs.push_back(10 + i * 2);
        ys.push_back(66 + (i * 5) % 11);
    }
    VELMCANVAS_SelectColor(canvas, kOrange);
    VELMCANVAS_DrawPolygon(canvas, xs.data(), ys.data(), static_cast<int>(xs.size()), 0x80000000 | kPurple);
    const int px[] = {4, 30, 50, 90, 156};
    const int py[] = {96, 84, 94, 82, 92};
    VELMCANVAS_SelectColor(canvas, kLight);
    VELMCANVAS_DrawPolyline(canvas, px, py, 5);
    for (int i = 0; i < 10; ++i) VELMCANVAS_DrawPoint(canvas, 100 + i * 5, 40, kOrange);
    EXPECT_TRUE(MatchesGolden(Output(), "lines", kStrict));
}

TEST_F(Golden, TextStylesDirectionsAndPhoneticSymbols)
{
    Background(kGround);
    _VELMCANVASFONT font{"Tahoma", 9.0f, 0, {0xE0, 0xF0, 0xC0, 0}};
    VELMCANVAS_SelectFont(canvas, &font);
    VELMCANVAS_TextOut(canvas, 4, 2, "Waveform 0:01.250");
    font.style = VELMCANVASFONT_BOLD | VELMCANVASFONT_SHADOW;
    VELMCANVAS_SelectFont(canvas, &font);
    VELMCANVAS_SelectFontColor(canvas, 0x40C0FF);
    VELMCANVAS_TextOut(canvas, 4, 20, "Bold with shadow");
    font.style = VELMCANVASFONT_ITALIC | VELMCANVASFONT_UNDERLINE;
    font.size = 11.0f;
    VELMCANVAS_SelectFont(canvas, &font);
    VELMCANVAS_TextOut(canvas, 4, 40, "Italic underlined");
    font.style = 0;
    VELMCANVAS_SelectFont(canvas, &font);
    VELMCANVAS_TextOut(canvas, 4, 64, "\\shi\\:f \\'1f\\ef\\ng \\tf\\ae\\ng\\ks");
    font.size = 8.0f;
    VELMCANVAS_SelectFont(canvas, &font);
    VELMCANVAS_TextOutVertical(canvas, 150, 4, "dB scale");
    EXPECT_TRUE(MatchesGolden(Output(), "text", kTextTolerant));
}

TEST_F(Golden, WrappedTextInRectangles)
{
    Background(kGround);
    _VELMCANVASFONT font{"Tahoma", 8.0f, 0, {0xE0, 0xF0, 0xC0, 0}};
    VELMCANVAS_SelectFont(canvas, &font);
    const _VELMRECT boxes[] = {{4, 4, 72, 44, 0, 0}, {84, 4, 72, 44, 0, 0}, {4, 52, 72, 44, 0, 0}, {84, 52, 72, 44, 0, 0}};
    const char *texts[] = {"Region label centred", "A long comment that needs more lines than fit here",
                           "Left aligned words wrap", "Unbreakablewordthatistoowide"};
    const int flags[] = {VELMCANVASTEXT_CENTER, VELMCANVASTEXT_ELLIPSIS, VELMCANVASTEXT_LEFT,
                         VELMCANVASTEXT_RIGHT | VELMCANVASTEXT_ELLIPSIS};
    VELMCANVAS_SelectColor(canvas, kOrange);
    for (int i = 0; i < 4; ++i) {
        VELMCANVAS_BorderRect(canvas, boxes[i].left, boxes[i].top, boxes[i].width, boxes[i].height, 0);
        VELMCANVAS_FillRectangleText(canvas, &boxes[i], texts[i], flags[i]);
    }
    EXPECT_TRUE(MatchesGolden(Output(), "text_boxes", kTextTolerant));
}

TEST_F(Golden, RawAndPastedImages)
{
    Background(kGround);
    // A premultiplied ramp whose rows fade from opaque to clear.
    std::vector<uint32_t> ramp(64 * 32);
    for (int y = 0; y < 32; ++y) {
        for (int x = 0; x < 64; ++x) {
            const uint32_t a = 255 - y * 8, r = x * 4 * a / 255, b = (63 - x) * 4 * a / 255;
            ramp[y * 64 + x] = (a << 24) | (r << 16) | b;
        }
    }
    VELMCANVAS_PutImage(canvas, 4, 4, 64, 32, ramp.data(), 64, 32, 0, 0, 0, 64, 32);
    VELMCANVAS_PutImage(canvas, 72, 4, 84, 32, ramp.data(), 64, 32, 0, 16, 0, 32, 16); // upper half, scaled
    VELMCANVASIMAGE tile = VELMCANVAS_CreateImage(canvas, 10, 8);
    VELMCANVAS_CopyImage(canvas, 20, 8, 10, 8, tile);
    const _VELMRECT area{4, 44, 70, 52, 73, 95};
    VELMCANVAS_TileImage(canvas, tile, &area);
    VELMCANVAS_PasteImageScaled(canvas, tile, 80, 44, 76, 52);
    VELMCANVAS_DestroyImage(canvas, tile);
    EXPECT_TRUE(MatchesGolden(Output(), "images", kStrict));
}

TEST_F(Golden, ColourMapsThroughIndexedImages)
{
    std::vector<unsigned char> ramp(256);
    for (int i = 0; i < 256; ++i) ramp[i] = static_cast<unsigned char>(i);
    const VELMCOLORMAP *maps[] = {&VELMCOLORMAP_CE2K, &VELMCOLORMAP_GRAYSCALE, &VELMCOLORMAP_INVGRAYSCALE,
                                  &VELMCOLORMAP_LINEARGRAYSCALE, &VELMCOLORMAP_INVLINEARGRAYSCALE};
    for (int m = 0; m < 5; ++m) {
        VELMCANVAS_SelectColorMap(canvas, maps[m]);
        VELMCANVAS_PutImage(canvas, 0, m * 20, kWidth, 18, ramp.data(), 256, 1, 1, 0, 0, 256, 1);
    }
    EXPECT_TRUE(MatchesGolden(Output(), "colormaps", kStrict));
}

TEST_F(Golden, LowProfileShapes)
{
    Background(kGround);
    VELMCANVAS_UseLowProfile(canvas, 1);
    VELMCANVAS_SelectColor(canvas, kLight);
    VELMCANVAS_FillRect(canvas, 8, 8, 60, 40, 20);
    VELMCANVAS_DrawLine(canvas, 80, 8, 152, 92);
    VELMCANVAS_SelectShadowColor(canvas, 0x000000);
    VELMCANVAS_ShadowRect(canvas, 20, 64, 40, 20, 8, 0xA0000008);
    EXPECT_TRUE(MatchesGolden(Output(), "low_profile", kStrict));
}

} // namespace
