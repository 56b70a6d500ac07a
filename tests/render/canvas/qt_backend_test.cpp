// The Qt back-end's behaviour, checked on the pixels it produces.
#include "outside/base/blbase.h"
#include "render/canvas/qt_fixture.h"

#include <QBuffer>
#include <QTemporaryDir>

#include <cstring>
#include <limits>
#include <string>
#include <vector>

using velm::test::Opaque;
using velm::test::QtCanvas;

namespace {

constexpr uint32_t kRed = 0x0000FF;
constexpr uint32_t kGreen = 0x00FF00;
constexpr uint32_t kBlue = 0xFF0000;

QByteArray PngOf(const QImage &image)
{
    QByteArray bytes;
    QBuffer buffer(&bytes);
    buffer.open(QIODevice::WriteOnly);
    image.save(&buffer, "PNG");
    return bytes;
}

TEST(QtCanvasLife, EveryOneOfTheFiftySevenSlotsIsFilled)
{
    VELMCANVAS canvas = VELMCANVAS_CreateCanvasQT(nullptr, 10, 10);
    ASSERT_NE(canvas, nullptr);
    static_assert(sizeof(_VELMCANVASOPS) == 57 * sizeof(void (*)()));
    void (*table[57])();
    std::memcpy(table, canvas->ops, sizeof table);
    for (int i = 0; i < 57; ++i) EXPECT_NE(table[i], nullptr) << "slot " << i;
    EXPECT_EQ(VELMCANVAS_DestroyCanvas(canvas), 1);
}

TEST(QtCanvasLife, SizesAreCheckedAndTheVisibleSizeFollowsResizes)
{
    EXPECT_EQ(VELMCANVAS_CreateCanvasQT(nullptr, 0, 10), nullptr);
    EXPECT_EQ(VELMCANVAS_CreateCanvasQT(nullptr, 10, -1), nullptr);
    EXPECT_EQ(VELMCANVAS_CreateCanvasQT(nullptr, 100000, 100000), nullptr);

    VELMCANVAS canvas = VELMCANVAS_CreateCanvasQT(nullptr, 400, 200);
    ASSERT_NE(canvas, nullptr);
    int w = -1, h = -1;
    EXPECT_EQ(VELMCANVAS_GetDimension(canvas, &w, &h), 1);
    EXPECT_EQ(w, 0);
    EXPECT_EQ(h, 0);
    EXPECT_EQ(VELMCANVAS_ResizeCanvas(canvas, 300, 20), 1);
    VELMCANVAS_GetDimension(canvas, &w, &h);
    EXPECT_EQ(w, 300);
    EXPECT_EQ(h, 80);
    EXPECT_EQ(VELMCANVAS_ResizeCanvas(canvas, 500, 100), 1);
    VELMCANVAS_GetDimension(canvas, &w, &h);
    EXPECT_EQ(w, 500);
    EXPECT_EQ(h, 100);
    VELMCANVAS_GetMaxDimension(canvas, &w, &h);
    EXPECT_EQ(w, 500);
    EXPECT_EQ(h, 200);
    EXPECT_EQ(static_cast<QPixmap *>(VELMCANVAS_GetOutputHandle(canvas))->size(), QSize(500, 200));
    // Too big to re-create: the canvas is left inert, not broken.
    EXPECT_EQ(VELMCANVAS_ResizeCanvas(canvas, 100000, 100), 0);
    EXPECT_EQ(VELMCANVAS_GetDimension(canvas, &w, &h), 0);
    EXPECT_EQ(VELMCANVAS_DestroyCanvas(canvas), 1);
}

TEST(QtCanvasLife, NothingPaintsOutsideBeginAndEndDraw)
{
    VELMCANVAS canvas = VELMCANVAS_CreateCanvasQT(nullptr, 50, 80);
    ASSERT_NE(canvas, nullptr);
    VELMCANVAS_ResizeCanvas(canvas, 50, 80);
    EXPECT_EQ(VELMCANVAS_SelectTarget(canvas, VELMCANVASTARGET_OUTPUT), 0);
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, 0, 0, 10, 10, 0), 0);
    EXPECT_EQ(VELMCANVAS_TextWidth(canvas, "abc"), 0);
    QPainter painter;
    ASSERT_EQ(VELMCANVAS_BeginDraw(canvas, &painter), 1);
    // Begun but no target selected yet.
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, 0, 0, 10, 10, 0), 0);
    ASSERT_EQ(VELMCANVAS_SelectTarget(canvas, VELMCANVASTARGET_OUTPUT), 1);
    EXPECT_TRUE(painter.isActive());
    EXPECT_EQ(VELMCANVAS_SelectColor(canvas, kRed), 1);
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, 0, 0, 10, 10, 0), 1);
    EXPECT_EQ(VELMCANVAS_EndDraw(canvas), 1);
    EXPECT_FALSE(painter.isActive());
    EXPECT_EQ(VELMCANVAS_FillRect(canvas, 0, 0, 10, 10, 0), 0);
    const QImage shown = static_cast<QPixmap *>(VELMCANVAS_GetOutputHandle(canvas))->toImage();
    EXPECT_EQ(shown.pixel(5, 5), Opaque(kRed));
    EXPECT_EQ(shown.pixel(15, 5), 0u);
    VELMCANVAS_DestroyCanvas(canvas);
}

TEST(QtCanvasLife, PaintingWithoutAPainterIsLoggedAndGrowingIsReported)
{
    std::vector<std::string> messages;
    const int level = BLDEBUG_GetLevel();
    BLDEBUG_SetLevel(BLDEBUG_LEVEL_ALL);
    BLDEBUG_SetSink([](int, int, const char *message, void *user) {
        static_cast<std::vector<std::string> *>(user)->push_back(message);
    }, &messages);
    VELMCANVAS canvas = VELMCANVAS_CreateCanvasQT(nullptr, 50, 80);
    EXPECT_EQ(VELMCANVAS_DrawLine(canvas, 0, 0, 5, 5), 0);
    EXPECT_EQ(VELMCANVAS_ResizeCanvas(canvas, 60, 90), 1);
    EXPECT_EQ(VELMCANVAS_ResizeCanvas(canvas, 20000, 90), 0);
    VELMCANVAS_DestroyCanvas(canvas);
    BLDEBUG_SetSink(nullptr, nullptr);
    BLDEBUG_SetLevel(level);
    ASSERT_EQ(messages.size(), 4u);
    EXPECT_EQ(messages[0], "VELM CANVAS QT: Missing VELMCANVAS_BeginDraw(...)");
    EXPECT_EQ(messages[1], "VELMCANVAS_ResizeCanvas: Canvas resized (60,90)");
    EXPECT_EQ(messages[2], "VELM CANVAS QT: Refused canvas dimensions (20000,90)");
    EXPECT_EQ(messages[3], "VELMCANVAS_ResizeCanvas: Unable to create new canvas with dimensions = (20000,90)");
}

TEST(QtCanvasLife, DestroyingACanvasReleasesTheHostsPainter)
{
    VELMCANVAS canvas = VELMCANVAS_CreateCanvasQT(nullptr, 50, 80);
    QPainter painter;
    VELMCANVAS_BeginDraw(canvas, &painter);
    VELMCANVAS_SelectTarget(canvas, VELMCANVASTARGET_MEMORY);
    EXPECT_TRUE(painter.isActive());
    VELMCANVAS_DestroyCanvas(canvas);
    EXPECT_FALSE(painter.isActive());
}

TEST(QtCanvasLife, DestroyingACanvasLeavesThePainterOnAnotherCanvasAlone)
{
    VELMCANVAS first = VELMCANVAS_CreateCanvasQT(nullptr, 50, 80);
    VELMCANVAS second = VELMCANVAS_CreateCanvasQT(nullptr, 50, 80);
    QPainter painter;
    VELMCANVAS_BeginDraw(first, &painter);
    VELMCANVAS_SelectTarget(first, VELMCANVASTARGET_OUTPUT);
    VELMCANVAS_BeginDraw(second, &painter);
    VELMCANVAS_SelectTarget(second, VELMCANVASTARGET_OUTPUT);
    VELMCANVAS_DestroyCanvas(first);
    EXPECT_TRUE(painter.isActive());
    VELMCANVAS_DestroyCanvas(second);
    EXPECT_FALSE(painter.isActive());
}

TEST_F(QtCanvas, LinesLeaveOutTheirLastPixelGoingRightAndStartPastTheFirstGoingLeft)
{
    VELMCANVAS_SelectColor(canvas, kRed);
    VELMCANVAS_DrawLine(canvas, 2, 5, 10, 5);
    VELMCANVAS_DrawLine(canvas, 10, 8, 2, 8);
    VELMCANVAS_DrawLine(canvas, 20, 2, 20, 6);
    const QImage out = Output();
    for (int x = 0; x < 14; ++x) {
        EXPECT_EQ(out.pixel(x, 5) == Opaque(kRed), x >= 2 && x <= 9) << "x " << x;
        EXPECT_EQ(out.pixel(x, 8) == Opaque(kRed), x >= 2 && x <= 11) << "x " << x;
        EXPECT_EQ(qAlpha(out.pixel(x, 4)), 0) << "x " << x;
    }
    for (int y = 0; y < 8; ++y) EXPECT_EQ(out.pixel(20, y) == Opaque(kRed), y >= 2 && y <= 5) << "y " << y;
}

TEST_F(QtCanvas, LineToDrawsOnlyInsideAnOpenPath)
{
    VELMCANVAS_SelectColor(canvas, kBlue);
    EXPECT_EQ(VELMCANVAS_MoveTo(canvas, 5, 5), 1);
    EXPECT_EQ(VELMCANVAS_LineTo(canvas, 30, 5), 0);
    EXPECT_EQ(VELMCANVAS_ClosePath(canvas), 0);
    EXPECT_EQ(VELMCANVAS_InitPath(canvas), 1);
    EXPECT_EQ(VELMCANVAS_InitPath(canvas), 0);
    EXPECT_EQ(VELMCANVAS_LineTo(canvas, 5, 20), 1);
    EXPECT_EQ(VELMCANVAS_LineTo(canvas, 15, 20), 1);
    EXPECT_EQ(VELMCANVAS_ClosePath(canvas), 1);
    EXPECT_EQ(VELMCANVAS_LineTo(canvas, 15, 40), 0);
    const QImage out = Output();
    EXPECT_EQ(qAlpha(out.pixel(20, 5)), 0);
    EXPECT_EQ(out.pixel(5, 5), Opaque(kBlue));
    EXPECT_EQ(out.pixel(5, 20), Opaque(kBlue));
    EXPECT_EQ(out.pixel(15, 20), Opaque(kBlue));
    EXPECT_EQ(qAlpha(out.pixel(15, 30)), 0);
}

TEST_F(QtCanvas, RestoringOverlappingOverlaysBringsBackTheOldestPixels)
{
    Background(kGreen);
    VELMCANVAS_SelectColor(canvas, kRed);
    VELMCANVAS_FillRect(canvas, 20, 20, 40, 30, 12);
    const QImage before = Output();

    EXPECT_EQ(VELMCANVAS_SaveOverlay(canvas, 10, 10, 30, 30), 1);
    VELMCANVAS_SelectColor(canvas, kBlue);
    VELMCANVAS_FillRect(canvas, 10, 10, 30, 30, 0);
    EXPECT_EQ(VELMCANVAS_SaveOverlay(canvas, 25, 25, 30, 30), 1);
    VELMCANVAS_SelectColor(canvas, 0xFFFFFF);
    VELMCANVAS_FillRect(canvas, 25, 25, 30, 30, 0);
    _VELMRECT saved{};
    ASSERT_EQ(VELMCANVAS_GetOverlayRect(canvas, &saved), 1);
    EXPECT_EQ(saved.left, 10);
    EXPECT_EQ(saved.top, 10);
    EXPECT_EQ(saved.width, 45);
    EXPECT_EQ(saved.height, 45);
    EXPECT_EQ(saved.right, 54);
    EXPECT_EQ(saved.bottom, 54);
    EXPECT_NE(Output(), before);

    EXPECT_EQ(VELMCANVAS_RestoreOverlay(canvas), 1);
    EXPECT_EQ(Output(), before);
    EXPECT_EQ(VELMCANVAS_GetOverlayRect(canvas, &saved), 0);
    EXPECT_EQ(VELMCANVAS_RestoreOverlay(canvas), 1);
}

TEST_F(QtCanvas, DrawAreasClipAndNestAndSurviveCrossTargetCopies)
{
    Background(kGreen);
    const _VELMRECT area{10, 10, 50, 40, 59, 49};
    const _VELMRECT hole{20, 20, 10, 10, 29, 29};
    VELMCANVAS_SetDrawArea(canvas, &area);
    VELMCANVAS_ProtectDrawArea(canvas, &hole);
    // The overlay copy restarts the painter; the clip must come back.
    VELMCANVAS_SaveOverlay(canvas, 0, 0, 5, 5);
    VELMCANVAS_SelectColor(canvas, kRed);
    VELMCANVAS_FillRect(canvas, 0, 0, kWidth, kHeight, 0);
    VELMCANVAS_ClearDrawArea(canvas); // back to the draw area
    VELMCANVAS_SelectColor(canvas, kBlue);
    VELMCANVAS_FillRect(canvas, 20, 20, 5, 5, 0);
    VELMCANVAS_ClearDrawArea(canvas); // no clip at all
    VELMCANVAS_FillRect(canvas, 100, 80, 5, 5, 0);
    const QImage out = Output();
    EXPECT_EQ(out.pixel(5, 5), Opaque(kGreen));
    EXPECT_EQ(out.pixel(15, 15), Opaque(kRed));
    EXPECT_EQ(out.pixel(27, 27), Opaque(kGreen));
    EXPECT_EQ(out.pixel(22, 22), Opaque(kBlue));
    EXPECT_EQ(out.pixel(70, 15), Opaque(kGreen));
    EXPECT_EQ(out.pixel(102, 82), Opaque(kBlue));
}

TEST_F(QtCanvas, BlocksMoveIntactAcrossOverlapAndBetweenTargets)
{
    Background(kGreen);
    VELMCANVAS_SelectColor(canvas, kRed);
    VELMCANVAS_FillRect(canvas, 10, 10, 10, 10, 0);
    VELMCANVAS_SelectColor(canvas, kBlue);
    VELMCANVAS_FillRect(canvas, 20, 10, 10, 10, 0);
    EXPECT_EQ(VELMCANVAS_MoveBlock(canvas, 10, 10, 20, 10, 15, 10), 1);
    QImage out = Output();
    EXPECT_EQ(out.pixel(16, 15), Opaque(kRed));
    EXPECT_EQ(out.pixel(24, 15), Opaque(kRed));
    EXPECT_EQ(out.pixel(25, 15), Opaque(kBlue));
    EXPECT_EQ(out.pixel(34, 15), Opaque(kBlue));

    EXPECT_EQ(VELMCANVAS_CopyCanvas(canvas, VELMCANVASTARGET_OUTPUT, VELMCANVASTARGET_MEMORY), 1);
    Background(0x000000);
    EXPECT_EQ(VELMCANVAS_MoveBlock2(canvas, VELMCANVASTARGET_MEMORY, 15, 10, 20, 10, VELMCANVASTARGET_OUTPUT, 100, 50),
              1);
    out = Output();
    EXPECT_EQ(out.pixel(101, 55), Opaque(kRed));
    EXPECT_EQ(out.pixel(119, 55), Opaque(kBlue));
    EXPECT_EQ(out.pixel(16, 15), Opaque(0x000000));

    // Areas reaching past the surface move only the part on it, to where
    // that part belongs.
    EXPECT_EQ(VELMCANVAS_MoveBlock(canvas, -10, 50, 100000, 100000, 30, 20), 1);
    EXPECT_EQ(Output().pixel(141, 25), Opaque(kRed));

    // Drawing keeps going to the current target after cross-target copies.
    VELMCANVAS_SelectColor(canvas, kBlue);
    VELMCANVAS_FillRect(canvas, 0, 0, 3, 3, 0);
    EXPECT_EQ(Output().pixel(1, 1), Opaque(kBlue));
}

TEST_F(QtCanvas, AbsurdCoordinatesAreSurvivedWithoutDrawing)
{
    constexpr int kFar = std::numeric_limits<int>::max();
    constexpr int kNear = std::numeric_limits<int>::min();
    const _VELMRECT far_area{kFar - 5, kNear, kFar, kFar, 0, 0};
    const unsigned char index = 7;
    VELMCANVAS_SelectColor(canvas, kRed);
    VELMCANVAS_SaveOverlay(canvas, kFar - 1, kFar - 1, kFar, kFar);
    VELMCANVAS_MoveBlock(canvas, kNear, kNear, kFar, kFar, kFar, kFar);
    VELMCANVAS_MoveBlock2(canvas, 1, kFar, kFar, kFar, kFar, 2, kNear, kNear);
    VELMCANVAS_DrawLine(canvas, kFar, kNear, kNear, kFar);
    VELMCANVAS_DrawAlphaRect(canvas, kFar, kFar, kFar, kFar, VELMCANVASALPHA_DARKTOP);
    VELMCANVAS_PutImage(canvas, kFar, kFar, kFar, kFar, &index, 1, 1, 1, kNear, kFar, kFar, kFar);
    VELMCANVAS_TextOut(canvas, kFar, kFar, "far");
    VELMCANVAS_FillRect(canvas, kNear, kNear, kFar, kFar, 0);
    VELMCANVAS_FillRect(canvas, -10, -10, kFar, kFar, 0);
    VELMCANVAS_ShadowRect(canvas, kFar, kFar, kFar, kFar, kFar, 0xFF000010);
    VELMCANVAS_SetDrawArea(canvas, &far_area);
    VELMCANVAS_ProtectDrawArea(canvas, &far_area);
    VELMCANVAS_ClearDrawArea(canvas);
    VELMCANVAS_ClearDrawArea(canvas);
    VELMCANVAS_RestoreOverlay(canvas);
    // The far fill was cut to the surface, which it covers.
    EXPECT_EQ(Output().pixel(80, 50), Opaque(kRed));
}

TEST_F(QtCanvas, ClearMakesTheTargetTransparent)
{
    Background(kRed);
    EXPECT_EQ(VELMCANVAS_Clear(canvas), 1);
    EXPECT_EQ(Output().pixel(50, 50), 0u);
}

TEST_F(QtCanvas, PointsMustLieOnTheSurface)
{
    EXPECT_EQ(VELMCANVAS_DrawPoint(canvas, 3, 4, kBlue), 1);
    EXPECT_EQ(VELMCANVAS_DrawPoint(canvas, kWidth, 4, kBlue), 0);
    EXPECT_EQ(VELMCANVAS_DrawPoint(canvas, 3, kHeight, kBlue), 0);
    const QImage out = Output();
    EXPECT_EQ(out.pixel(3, 4), Opaque(kBlue));
    EXPECT_EQ(qAlpha(out.pixel(4, 4)), 0);
}

TEST_F(QtCanvas, AlphaFactorLightensFillsOnly)
{
    Background(0x000000);
    VELMCANVAS_SelectColor(canvas, 0xFFFFFF);
    EXPECT_EQ(VELMCANVAS_SetAlphaFactor(canvas, 0.5f), 1.0f);
    VELMCANVAS_FillRect(canvas, 0, 0, 10, 10, 0);
    VELMCANVAS_DrawLine(canvas, 0, 20, 10, 20);
    EXPECT_EQ(VELMCANVAS_SetAlphaFactor(canvas, 1.0f), 0.5f);
    const QImage out = Output();
    EXPECT_NEAR(qRed(out.pixel(5, 5)), 128, 2);
    EXPECT_EQ(out.pixel(5, 20), Opaque(0xFFFFFF));
}

TEST_F(QtCanvas, OnlyTheFourAlphaObjectsDraw)
{
    EXPECT_EQ(VELMCANVAS_DrawAlphaRect(canvas, 0, 0, 10, 10, 300), 0);
    EXPECT_EQ(VELMCANVAS_DrawAlphaRect(canvas, 0, 0, 100, 10, VELMCANVASALPHA_DARKRIGHT), 1);
    const QImage out = Output();
    EXPECT_LT(qAlpha(out.pixel(2, 5)), 5);
    EXPECT_NEAR(qAlpha(out.pixel(98, 5)), 50, 3);
}

TEST_F(QtCanvas, RawImagesCountSourceRowsFromTheBottom)
{
    // Two columns, four rows: red, green, blue, white from the top.
    const uint32_t pixels[8] = {0xFFFF0000, 0xFFFF0000, 0xFF00FF00, 0xFF00FF00,
                                0xFF0000FF, 0xFF0000FF, 0xFFFFFFFF, 0xFFFFFFFF};
    EXPECT_EQ(VELMCANVAS_PutImage(canvas, 10, 10, 2, 2, pixels, 2, 4, 0, 0, 0, 2, 2), 1);
    EXPECT_EQ(VELMCANVAS_PutImage(canvas, 20, 10, 2, 2, pixels, 2, 4, 2, 0, 0, 2, 2), 0);
    EXPECT_EQ(VELMCANVAS_PutImage(canvas, 20, 10, 2, 2, pixels, 0, 4, 0, 0, 0, 2, 2), 0);
    const QImage out = Output();
    EXPECT_EQ(out.pixel(10, 10), qRgb(0, 0, 255));
    EXPECT_EQ(out.pixel(11, 11), qRgb(255, 255, 255));
}

TEST_F(QtCanvas, IndexedImagesTakeTheirColoursFromTheSelectedMap)
{
    const unsigned char indices[4] = {0, 100, 200, 255};
    VELMCANVAS_PutImage(canvas, 0, 0, 4, 1, indices, 4, 1, 1, 0, 0, 4, 1);
    EXPECT_EQ(VELMCANVAS_SelectColorMap(canvas, &VELMCOLORMAP_CE2K), 1);
    VELMCANVAS_PutImage(canvas, 0, 1, 4, 1, indices, 4, 1, 1, 0, 0, 4, 1);
    const QImage out = Output();
    // A new canvas starts with the inverted linear grey scale.
    EXPECT_EQ(out.pixel(0, 0), qRgb(255, 255, 255));
    EXPECT_EQ(out.pixel(1, 0), qRgb(155, 155, 155));
    for (int i = 0; i < 4; ++i) {
        const VELMCOLORMAPENTRY &e = VELMCOLORMAP_CE2K.entry[indices[i]];
        EXPECT_EQ(out.pixel(i, 1), qRgb(e.red, e.green, e.blue)) << "index " << int(indices[i]);
    }
}

TEST_F(QtCanvas, ImagesAreDecodedCopiedAndPasted)
{
    QImage source(6, 4, QImage::Format_ARGB32);
    source.fill(qRgb(10, 200, 30));
    const QByteArray png = PngOf(source);
    VELMCANVASIMAGE image = VELMCANVAS_LoadImageQT(png.constData(), png.size());
    ASSERT_NE(image, nullptr);
    EXPECT_EQ(VELMCANVAS_ImageWidth(canvas, image), 6);
    EXPECT_EQ(VELMCANVAS_ImageHeight(canvas, image), 4);
    EXPECT_EQ(VELMCANVAS_LoadImageQT("not an image", 12), nullptr);
    EXPECT_EQ(VELMCANVAS_LoadImageQT(png.constData(), 0), nullptr);

    EXPECT_EQ(VELMCANVAS_PasteImage(canvas, image, 1, 1), 1);
    EXPECT_EQ(VELMCANVAS_PasteImageScaled(canvas, image, 20, 20, 30, 2), 1);
    VELMCANVASIMAGE copy = VELMCANVAS_CreateImage(canvas, 3, 3);
    ASSERT_NE(copy, nullptr);
    EXPECT_EQ(VELMCANVAS_CopyImage(canvas, 0, 0, 3, 3, copy), 1);
    EXPECT_EQ(VELMCANVAS_PasteImage(canvas, copy, 100, 50), 1);
    const QImage out = Output();
    EXPECT_EQ(out.pixel(3, 3), qRgb(10, 200, 30));
    EXPECT_EQ(out.pixel(49, 21), qRgb(10, 200, 30));
    EXPECT_EQ(qAlpha(out.pixel(49, 22)), 0);
    EXPECT_EQ(qAlpha(out.pixel(100, 50)), 0);
    EXPECT_EQ(out.pixel(101, 51), qRgb(10, 200, 30));
    EXPECT_EQ(VELMCANVAS_DestroyImage(canvas, copy), 1);
    EXPECT_EQ(VELMCANVAS_DestroyImage(canvas, image), 1);
}

TEST_F(QtCanvas, ImageFilesAreFittedKeepingTheirShape)
{
    QTemporaryDir dir;
    ASSERT_TRUE(dir.isValid());
    QImage wide(40, 10, QImage::Format_ARGB32);
    wide.fill(qRgb(255, 0, 0));
    const QString path = dir.filePath("wide.png");
    ASSERT_TRUE(wide.save(path));
    EXPECT_EQ(VELMCANVAS_DrawImage(canvas, 0, 0, 20, 20, path.toLocal8Bit().constData()), 1);
    EXPECT_EQ(VELMCANVAS_DrawImage(canvas, 0, 0, 20, 20, dir.filePath("missing.png").toLocal8Bit().constData()), 0);
    const QImage out = Output();
    EXPECT_EQ(out.pixel(10, 2), qRgb(255, 0, 0));
    EXPECT_EQ(qAlpha(out.pixel(10, 8)), 0);
}

TEST_F(QtCanvas, LowProfileDrawsWithoutAntialiasing)
{
    VELMCANVAS_UseLowProfile(canvas, 1);
    VELMCANVAS_SelectColor(canvas, kRed);
    VELMCANVAS_FillRect(canvas, 10, 10, 60, 60, 30);
    VELMCANVAS_DrawLine(canvas, 80, 10, 150, 40);
    const QImage out = Output();
    for (int y = 0; y < kHeight; ++y) {
        for (int x = 0; x < kWidth; ++x) {
            const int alpha = qAlpha(out.pixel(x, y));
            ASSERT_TRUE(alpha == 0 || alpha == 255) << x << "," << y;
        }
    }
}

TEST_F(QtCanvas, TextIsMeasuredInTheSelectedFont)
{
    _VELMCANVASFONT font{"Tahoma", 8.0f, 0, {0, 0, 0, 0}};
    ASSERT_EQ(VELMCANVAS_SelectFont(canvas, &font), 1);
    const int small_width = VELMCANVAS_TextWidth(canvas, "Waveform");
    const int small_height = VELMCANVAS_TextHeight(canvas, "Waveform");
    font.size = 16.0f;
    ASSERT_EQ(VELMCANVAS_SelectFont(canvas, &font), 1);
    EXPECT_GT(VELMCANVAS_TextWidth(canvas, "Waveform"), small_width * 3 / 2);
    EXPECT_GT(VELMCANVAS_TextHeight(canvas, "Waveform"), small_height);
    EXPECT_EQ(VELMCANVAS_TextWidth(canvas, ""), 0);
    // The escape reads as one character.
    EXPECT_EQ(VELMCANVAS_TextWidth(canvas, "\\c,a"), VELMCANVAS_TextWidth(canvas, "\xE7"
                                                                                  "a"));
    font.size = 0.0f;
    EXPECT_EQ(VELMCANVAS_SelectFont(canvas, &font), 0);
    font.size = std::numeric_limits<float>::quiet_NaN();
    EXPECT_EQ(VELMCANVAS_SelectFont(canvas, &font), 0);
}

} // namespace
