// The contact sheet: every picture drawn through a canvas on the default
// window colour, then a strip showing them at work (region frames, a gain
// button, a cursor with its handle, a selection's handles, the tiled
// background), compared with the reviewed image in golden/.
//
// VELM_UPDATE_GOLDEN=1 rewrites the reference; a failed comparison leaves
// contactsheet-actual.png and contactsheet-difference.png beside the test.
#include "widgets/resources/velmresources.h"
#include "widgets/expected_pictures.h"
#include "widgets/guiapp.h"

#include <gtest/gtest.h>

#include <QImage>
#include <QPainter>
#include <QPixmap>

#include <algorithm>
#include <cstdlib>
#include <string>
#include <vector>

namespace {

constexpr uint32_t kWindowColour = 0x404000;  // 0x00BBGGRR
constexpr uint32_t kOuterBorder = 0x606000;
constexpr uint32_t kRegionColour = 0x808040;
constexpr int kColumns = 10;
constexpr int kCell = 64;
constexpr int kPictureRows = 5;
constexpr int kStripHeight = 100;
constexpr int kWidth = kColumns * kCell;
constexpr int kHeight = kPictureRows * kCell + kStripHeight;

// Pixels whose channels differ by more than this count as different; a few
// of them are allowed, for antialiasing that may vary between Qt builds.
constexpr int kChannelTolerance = 16;
constexpr double kDifferentShare = 0.002;

std::vector<VELMCANVASIMAGE> AllHandles()
{
#define VELM_HANDLE(name, width, height) Img_##name,
    return {VELM_EXPECTED_PICTURES(VELM_HANDLE)};
#undef VELM_HANDLE
}

void PasteCentred(VELMCANVAS canvas, VELMCANVASIMAGE image, int cx, int cy)
{
    VELMCANVAS_PasteImage(canvas, image, cx - VELMCANVAS_ImageWidth(canvas, image) / 2,
                          cy - VELMCANVAS_ImageHeight(canvas, image) / 2);
}

void DrawPictureGrid(VELMCANVAS canvas)
{
    const std::vector<VELMCANVASIMAGE> handles = AllHandles();
    for (size_t i = 0; i < handles.size(); ++i) {
        const int column = static_cast<int>(i) % kColumns, row = static_cast<int>(i) / kColumns;
        PasteCentred(canvas, handles[i], column * kCell + kCell / 2, row * kCell + kCell / 2);
    }
}

// The pictures as the view uses them.
void DrawStrip(VELMCANVAS canvas)
{
    const int top = kPictureRows * kCell;
    VELMCANVAS_SelectColor(canvas, kOuterBorder);
    VELMCANVAS_FillRect(canvas, 0, top, kWidth, kStripHeight, 0);

    // A wide and a narrow region with their frames.
    VELMCANVAS_SelectColor(canvas, kRegionColour);
    VELMCANVAS_FillRect(canvas, 20, top + 20, 110, 56, 14);
    VELMCANVAS_BevelRect(canvas, 20, top + 20, 110, 56);
    VELMCANVAS_FillRect(canvas, 150, top + 20, 9, 56, 0);
    VELMCANVAS_BevelRect(canvas, 150, top + 20, 9, 56);

    // A gain button while playing: dark, rounded, the glyph at 3/4 height.
    VELMCANVAS_SelectColor(canvas, 0);
    VELMCANVAS_SetAlphaFactor(canvas, 0.35f);
    VELMCANVAS_FillRect(canvas, 190, top + 28, 48, 40, 20);
    VELMCANVAS_SetAlphaFactor(canvas, 1.0f);
    VELMCANVAS_PasteImageScaled(canvas, Img_Volume66, 190 + 8, top + 28 + 5, 30, 30);

    // A cursor and its handle on the scale's top edge, and a selection's.
    const int scale_top = top + 70;
    VELMCANVAS_SelectColor(canvas, 0x282800);
    VELMCANVAS_FillRect(canvas, 260, scale_top, 240, 20, 0);
    VELMCANVAS_SelectColor(canvas, 0xFFFFFF);
    VELMCANVAS_FillRect(canvas, 290, top + 10, 1, scale_top - top - 10, 0);
    PasteCentred(canvas, Img_BottomCursorSlider, 290, scale_top - 1);
    VELMCANVAS_SelectColor(canvas, 0x1921FF);
    VELMCANVAS_FillRect(canvas, 330, top + 10, 1, scale_top - top - 10, 0);
    PasteCentred(canvas, Img_RedCursorSlider, 330, scale_top - 1);
    VELMCANVAS_SelectColor(canvas, 0xFFFFFF);
    VELMCANVAS_SetAlphaFactor(canvas, 0.19f);
    VELMCANVAS_FillRect(canvas, 370, top + 10, 100, scale_top - top - 10, 0);
    VELMCANVAS_SetAlphaFactor(canvas, 1.0f);
    PasteCentred(canvas, Img_LeftSelectionSlider, 370, scale_top - 1);
    PasteCentred(canvas, Img_RightSelectionSlider, 469, scale_top - 1);

    // The smart-zoom button and the tiled window background.
    VELMCANVAS_PasteImage(canvas, Img_ZoomSelection, 520, top + 20);
    const _VELMRECT tiled = {550, top + 20, 70, 56, 550 + 70 - 1, top + 20 + 56 - 1};
    VELMCANVAS_TileImage(canvas, Img_Background, &tiled);
}

QImage DrawContactSheet()
{
    VELMCANVAS canvas = VELMCANVAS_CreateCanvasQT(nullptr, kWidth, kHeight);
    if (!canvas) return {};
    VELMCANVAS_ResizeCanvas(canvas, kWidth, kHeight);
    QPainter painter;
    VELMCANVAS_BeginDraw(canvas, &painter);
    VELMCANVAS_SelectTarget(canvas, VELMCANVASTARGET_OUTPUT);
    VELMCANVAS_SelectColor(canvas, kWindowColour);
    VELMCANVAS_FillRect(canvas, 0, 0, kWidth, kHeight, 0);
    DrawPictureGrid(canvas);
    DrawStrip(canvas);
    VELMCANVAS_EndDraw(canvas);
    const QImage sheet = static_cast<QPixmap *>(VELMCANVAS_GetOutputHandle(canvas))->toImage();
    VELMCANVAS_DestroyCanvas(canvas);
    return sheet.convertToFormat(QImage::Format_ARGB32);
}

// Marks differing pixels in red over a faded copy of the reference.
QImage DifferenceImage(const QImage &actual, const QImage &reference, int *different)
{
    QImage difference = reference.copy();
    *different = 0;
    for (int y = 0; y < reference.height(); ++y) {
        for (int x = 0; x < reference.width(); ++x) {
            const QRgb a = actual.pixel(x, y), r = reference.pixel(x, y);
            const int delta = std::max({std::abs(qRed(a) - qRed(r)), std::abs(qGreen(a) - qGreen(r)),
                                        std::abs(qBlue(a) - qBlue(r)), std::abs(qAlpha(a) - qAlpha(r))});
            if (delta > kChannelTolerance) {
                ++*different;
                difference.setPixel(x, y, qRgb(255, 0, 0));
            } else {
                difference.setPixel(x, y, qRgb(qGray(r) / 3, qGray(r) / 3, qGray(r) / 3));
            }
        }
    }
    return difference;
}

TEST(ContactSheet, MatchesTheReviewedImage)
{
    MakeGuiApplication();
    ASSERT_EQ(VELMRESOURCES_Load(), 1);
    const QImage actual = DrawContactSheet();
    ASSERT_FALSE(actual.isNull());
    const std::string golden = std::string(VELM_GOLDEN_DIR) + "/contactsheet.png";
    const char *update = std::getenv("VELM_UPDATE_GOLDEN");
    if (update && std::string(update) == "1") {
        ASSERT_TRUE(actual.save(QString::fromStdString(golden), "PNG"));
        GTEST_SKIP() << "reference rewritten: " << golden;
    }
    const QImage reference = QImage(QString::fromStdString(golden)).convertToFormat(QImage::Format_ARGB32);
    ASSERT_FALSE(reference.isNull()) << "no reference image " << golden << " (VELM_UPDATE_GOLDEN=1 makes it)";
    ASSERT_EQ(actual.size(), reference.size());
    int different = 0;
    const QImage difference = DifferenceImage(actual, reference, &different);
    const int allowed = static_cast<int>(kDifferentShare * actual.width() * actual.height());
    if (different > allowed) {
        const QString folder = QStringLiteral(VELM_TEST_BINARY_DIR);
        actual.save(folder + QStringLiteral("/contactsheet-actual.png"), "PNG");
        difference.save(folder + QStringLiteral("/contactsheet-difference.png"), "PNG");
    }
    EXPECT_LE(different, allowed) << "see contactsheet-actual.png and contactsheet-difference.png in "
                                  << VELM_TEST_BINARY_DIR;
}

} // namespace
