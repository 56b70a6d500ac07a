// The digit read-outs drawn on a real Qt canvas: their pictures, their cell
// widths, and which cells come out dim or bright.
#include <QImage>
#include <QPainter>
#include <QRect>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <functional>
#include <gtest/gtest.h>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include "../render/view/view_support.hpp"
#include "guiapp.h"
#include "widgets/display/velmdrawcommon.h"

namespace {

constexpr uint32_t kBright = 0x0000FFu; // red
constexpr uint32_t kDim = 0xFF0000u;    // blue
constexpr int kLeft = 10;
constexpr int kTop = 6;

VELMCONFIGFONT test_font(float size = 20.0f)
{
    VELMCONFIGFONT font{};
    std::snprintf(font.familyName, sizeof font.familyName, "%s", "DejaVu Sans");
    font.size = size;
    font.color = kBright;
    font.inactiveColor = kDim;
    return font;
}

// A black canvas painted by `paint`, returned as an image.
QImage paint(int width, int height, const std::function<void(VELMCANVAS)> &paint)
{
    MakeGuiApplication();
    viewtest::Canvas canvas(width, height);
    QPainter painter;
    VELMCANVAS_BeginDraw(canvas.get(), &painter);
    VELMCANVAS_SelectTarget(canvas.get(), VELMCANVASTARGET_OUTPUT);
    VELMCANVAS_SelectColor(canvas.get(), 0);
    VELMCANVAS_FillRect(canvas.get(), 0, 0, width, height, 0);
    paint(canvas.get());
    VELMCANVAS_EndDraw(canvas.get());
    return canvas.output();
}

// Widths measured directly on the canvas with the font selected.
struct Measured {
    int digit, separator, sign, period, small_digit, small_separator;
};

Measured measure(const VELMCONFIGFONT &config)
{
    Measured m{};
    paint(40, 40, [&](VELMCANVAS canvas) {
        _VELMCANVASFONT font{};
        std::snprintf(font.name, sizeof font.name, "%s", config.familyName);
        font.size = config.size;
        VELMCANVAS_SelectFont(canvas, &font);
        m.digit = VELMCANVAS_TextWidth(canvas, "0");
        m.separator = VELMCANVAS_TextWidth(canvas, ":");
        m.sign = VELMCANVAS_TextWidth(canvas, "-");
        m.period = VELMCANVAS_TextWidth(canvas, ".");
        font.size = config.size * 0.75f;
        VELMCANVAS_SelectFont(canvas, &font);
        m.small_digit = VELMCANVAS_TextWidth(canvas, "0");
        m.small_separator = VELMCANVAS_TextWidth(canvas, ":");
    });
    return m;
}

enum class Ink { None, Dim, Bright, Mixed };

// The colour of the ink in columns [from, to) of the image.
Ink ink_between(const QImage &image, int from, int to)
{
    long dim = 0, bright = 0;
    for (int y = 0; y < image.height(); ++y)
        for (int x = from; x < to; ++x) {
            const QRgb p = image.pixel(x, y);
            bright += qRed(p) > 96 && qBlue(p) < 48;
            dim += qBlue(p) > 96 && qRed(p) < 48;
        }
    if (!dim && !bright) return Ink::None;
    if (dim && bright) return Ink::Mixed;
    return dim ? Ink::Dim : Ink::Bright;
}

// Ink colour of each cell of a text laid out from kLeft, sign cell first.
std::vector<Ink> cell_inks(const QImage &image, const Measured &m, const std::string &text, size_t small_from = std::string::npos)
{
    std::vector<Ink> inks{ink_between(image, kLeft, kLeft + m.sign)};
    int pen = kLeft + m.sign;
    for (size_t i = 0; i < text.size(); ++i) {
        const bool small = i >= small_from;
        const bool digit = text[i] >= '0' && text[i] <= '9';
        const int cell = small ? (digit ? m.small_digit : m.small_separator) : (digit ? m.digit : m.separator);
        inks.push_back(ink_between(image, pen, pen + cell));
        pen += cell;
    }
    return inks;
}

// "D" dim, "B" bright, "." no ink, "?" both, one letter per cell.
std::string pattern(const std::vector<Ink> &inks)
{
    std::string out;
    for (Ink ink : inks) out += ink == Ink::Dim ? 'D' : ink == Ink::Bright ? 'B' : ink == Ink::None ? '.' : '?';
    return out;
}

QImage time_image(uint32_t options, double seconds)
{
    const VELMCONFIGFONT font = test_font();
    return paint(260, 40, [&](VELMCANVAS c) { VELMDRAWCOMMON_DrawDisplayTime(c, &font, options, kLeft, kTop, seconds); });
}

QImage sample_image(uint32_t options, int64_t sample)
{
    const VELMCONFIGFONT font = test_font();
    return paint(260, 40, [&](VELMCANVAS c) { VELMDRAWCOMMON_DrawDisplaySample(c, &font, options, kLeft, kTop, sample); });
}

QImage frame_image(uint32_t options, int64_t frame, int64_t offset)
{
    const VELMCONFIGFONT font = test_font();
    return paint(260, 40, [&](VELMCANVAS c) { VELMDRAWCOMMON_DrawDisplayFrame(c, &font, options, kLeft, kTop, frame, offset); });
}

// Bounding box of the ink within columns [from, to); empty without ink.
QRect ink_box(const QImage &image, int from = 0, int to = -1)
{
    QRect box;
    for (int y = 0; y < image.height(); ++y)
        for (int x = from; x < (to < 0 ? image.width() : to); ++x)
            if (qRed(image.pixel(x, y)) > 24 || qBlue(image.pixel(x, y)) > 24) box |= QRect(x, y, 1, 1);
    return box;
}

TEST(DrawCommonGolden, EveryUnitInItsOptionCombinations)
{
    struct Row {
        int kind; // 0 time, 1 sample, 2 frame
        uint32_t options;
    };
    const std::vector<Row> rows = {{0, 0x0}, {0, 0x1}, {0, 0x4}, {0, 0x8}, {0, 0x10}, {0, 0x18}, {0, 0x2},
                                   {1, 0x0}, {1, 0x1}, {1, 0x4}, {1, 0x2}, {2, 0x0}, {2, 0x1}, {2, 0x4}, {2, 0x2}};
    VELMCONFIGFONT font = test_font(16.0f);
    font.color = 0x40F0FFu;
    font.inactiveColor = 0x505050u;
    const QImage image = paint(260, 26 * static_cast<int>(rows.size()) + 4, [&](VELMCANVAS c) {
        int y = 4;
        for (const Row &row : rows) {
            if (row.kind == 0) VELMDRAWCOMMON_DrawDisplayTime(c, &font, row.options, 6, y, 3723.456);
            if (row.kind == 1) VELMDRAWCOMMON_DrawDisplaySample(c, &font, row.options, 6, y, 48000);
            if (row.kind == 2) VELMDRAWCOMMON_DrawDisplayFrame(c, &font, row.options, 6, y, 125, 37);
            y += 26;
        }
    });
    EXPECT_EQ(viewtest::compare_golden(image, "drawcommon_readouts"), "");
}

TEST(DrawCommonWidth, FollowsTheCellRules)
{
    const VELMCONFIGFONT font = test_font();
    const Measured m = measure(font);
    ASSERT_GT(m.digit, 0);
    ASSERT_GT(m.separator, 0);
    ASSERT_GT(m.sign, 0);
    int time = 0, time_unsigned = 0, sample = 0, sample_unsigned = 0, frame = 0, frame_unsigned = 0;
    int drawn_time = 0, drawn_sample = 0;
    paint(300, 40, [&](VELMCANVAS c) {
        time = VELMDRAWCOMMON_DrawDisplayTimeWidth(c, &font, 0);
        time_unsigned = VELMDRAWCOMMON_DrawDisplayTimeWidth(c, &font, 0x4);
        sample = VELMDRAWCOMMON_DrawDisplaySampleWidth(c, &font, 0x1);
        sample_unsigned = VELMDRAWCOMMON_DrawDisplaySampleWidth(c, &font, 0x4);
        frame = VELMDRAWCOMMON_DrawDisplayFrameWidth(c, &font, 0);
        frame_unsigned = VELMDRAWCOMMON_DrawDisplayFrameWidth(c, &font, 0x6);
        drawn_time = VELMDRAWCOMMON_DrawDisplayTime(c, &font, 0x18, 0, 0, 12.5);
        drawn_sample = VELMDRAWCOMMON_DrawDisplaySample(c, &font, 0x4, 0, 0, 7);
    });
    EXPECT_EQ(time, 9 * m.digit + 3 * m.separator + m.sign);
    EXPECT_EQ(time_unsigned, 9 * m.digit + 3 * m.separator);
    EXPECT_EQ(sample, 10 * m.digit + m.sign);
    EXPECT_EQ(sample_unsigned, 10 * m.digit);
    EXPECT_EQ(frame, 10 * m.digit + m.period + m.sign);
    EXPECT_EQ(frame_unsigned, 10 * m.digit + m.period);
    // The draw calls advance by exactly the announced widths.
    EXPECT_EQ(drawn_time, time);
    EXPECT_EQ(drawn_sample, sample_unsigned);
}

TEST(DrawCommonWidth, InkStaysInsideTheAnnouncedWidth)
{
    const VELMCONFIGFONT font = test_font();
    int widths[3] = {};
    paint(300, 40, [&](VELMCANVAS c) {
        widths[0] = VELMDRAWCOMMON_DrawDisplayTimeWidth(c, &font, 0x1);
        widths[1] = VELMDRAWCOMMON_DrawDisplaySampleWidth(c, &font, 0x1);
        widths[2] = VELMDRAWCOMMON_DrawDisplayFrameWidth(c, &font, 0x1);
    });
    const QImage images[3] = {time_image(0x1, 86399.999), sample_image(0x1, 8888888888), frame_image(0x1, 8888888, 8888)};
    for (int i = 0; i < 3; ++i) {
        const QRect ink = ink_box(images[i]);
        EXPECT_GE(ink.left(), kLeft) << i;
        EXPECT_LT(ink.right(), kLeft + widths[i]) << i;
        // Full-width values use most of it.
        EXPECT_GT(ink.right() - kLeft, widths[i] * 3 / 4) << i;
    }
}

TEST(DrawCommonDigits, ZeroTimeIsDimUpToTheZeroBeforeThePoint)
{
    const Measured m = measure(test_font());
    // Sign, "00:00:0" dim; "0.000" bright.
    EXPECT_EQ(pattern(cell_inks(time_image(0, 0.0), m, "00:00:00.000")), "DDDDDDDDBBBBB");
    EXPECT_EQ(pattern(cell_inks(time_image(0, 3723.456), m, "01:02:03.456")), "DDBBBBBBBBBBB");
    EXPECT_EQ(pattern(cell_inks(time_image(0x8, 83.5), m, " 0001:23.500")), "D.DDDBBBBBBBB");
    EXPECT_EQ(pattern(cell_inks(time_image(0x10, 0.25), m, "  000000.250")), "D..DDDDDBBBBB");
}

TEST(DrawCommonDigits, SignCellIsBrightOnlyForRemainingTime)
{
    const Measured m = measure(test_font());
    EXPECT_EQ(cell_inks(time_image(0x1, 5.0), m, "00:00:05.000")[0], Ink::Bright);
    EXPECT_EQ(cell_inks(time_image(0x0, 5.0), m, "00:00:05.000")[0], Ink::Dim);
    // Remaining time shown blank keeps a dim sign.
    EXPECT_EQ(cell_inks(time_image(0x3, 5.0), m, "00:00:05.000")[0], Ink::Dim);
    // Without the sign cell the first digit starts at x.
    const QImage unsigned_time = time_image(0x5, 5.0);
    EXPECT_EQ(ink_between(unsigned_time, kLeft, kLeft + m.digit), Ink::Dim);
    EXPECT_LT(ink_box(unsigned_time).left(), kLeft + m.sign);
}

TEST(DrawCommonDigits, SamplesBrightenFromTheFirstSignificantDigit)
{
    const Measured m = measure(test_font());
    EXPECT_EQ(pattern(cell_inks(sample_image(0, 48000), m, "0000048000")), "DDDDDDBBBBB");
    EXPECT_EQ(pattern(cell_inks(sample_image(0, 0), m, "0000000000")), "DDDDDDDDDDB");
    // Blank draws the zeros whatever the value.
    EXPECT_EQ(sample_image(0x2, 123456), sample_image(0, 0));
    // The sign has its own cell: a negative count draws its magnitude.
    EXPECT_EQ(sample_image(0, -48000), sample_image(0, 48000));
}

TEST(DrawCommonDigits, FrameOffsetIsSmallerAndLower)
{
    const Measured m = measure(test_font());
    const QImage image = frame_image(0, 125, 37);
    EXPECT_EQ(pattern(cell_inks(image, m, "0000125 0037", 8)), "DDDDDBBB.BBBB");
    const int frame_from = kLeft + m.sign + 4 * m.digit;
    const int offset_from = kLeft + m.sign + 7 * m.digit + m.separator;
    const QRect frame_ink = ink_box(image, frame_from, frame_from + 3 * m.digit);
    const QRect offset_ink = ink_box(image, offset_from + 2 * m.small_digit, offset_from + 4 * m.small_digit);
    EXPECT_LT(offset_ink.height(), frame_ink.height());
    EXPECT_GT(offset_ink.top(), frame_ink.top());
    EXPECT_EQ(frame_image(0x2, 125, 37), frame_image(0, 0, 0));
}

TEST(DrawCommonDigits, TimeRoundsToTheNearestMillisecond)
{
    EXPECT_EQ(time_image(0, 0.0004), time_image(0, 0.0));
    EXPECT_EQ(time_image(0, 0.0005), time_image(0, 0.001));
    EXPECT_NE(time_image(0, 0.001), time_image(0, 0.0));
    EXPECT_EQ(time_image(0, 59.9996), time_image(0, 60.0));
    EXPECT_EQ(time_image(0, -1.5), time_image(0, 1.5));
    EXPECT_EQ(time_image(0, std::nan("")), time_image(0, 0.0));
}

TEST(DrawCommonDigits, AbsurdValuesStillDrawInsideTheCanvas)
{
    const Measured m = measure(test_font());
    const QImage huge_time = time_image(0, 1e300);
    const QImage infinite = time_image(0, std::numeric_limits<double>::infinity());
    EXPECT_EQ(huge_time, infinite);
    EXPECT_EQ(ink_between(huge_time, kLeft + m.sign, kLeft + m.sign + m.digit), Ink::Bright);
    const QImage lowest = sample_image(0, std::numeric_limits<int64_t>::min());
    EXPECT_EQ(ink_between(lowest, kLeft + m.sign, kLeft + m.sign + m.digit), Ink::Bright);
}

TEST(DrawCommonArguments, NullCanvasOrFontDrawsNothing)
{
    const VELMCONFIGFONT font = test_font();
    EXPECT_EQ(VELMDRAWCOMMON_DrawDisplayTime(nullptr, &font, 0, 0, 0, 1.0), 0);
    EXPECT_EQ(VELMDRAWCOMMON_DrawDisplaySample(nullptr, &font, 0, 0, 0, 1), 0);
    EXPECT_EQ(VELMDRAWCOMMON_DrawDisplayFrame(nullptr, &font, 0, 0, 0, 1, 1), 0);
    EXPECT_EQ(VELMDRAWCOMMON_DrawDisplayTimeWidth(nullptr, &font, 0), 0);
    EXPECT_EQ(VELMDRAWCOMMON_DrawDisplaySampleWidth(nullptr, &font, 0), 0);
    EXPECT_EQ(VELMDRAWCOMMON_DrawDisplayFrameWidth(nullptr, &font, 0), 0);
    const QImage image = paint(100, 30, [&](VELMCANVAS c) {
        EXPECT_EQ(VELMDRAWCOMMON_DrawDisplayTime(c, nullptr, 0, 0, 0, 1.0), 0);
        EXPECT_EQ(VELMDRAWCOMMON_DrawDisplaySample(c, nullptr, 0, 0, 0, 1), 0);
        EXPECT_EQ(VELMDRAWCOMMON_DrawDisplayFrame(c, nullptr, 0, 0, 0, 1, 1), 0);
        EXPECT_EQ(VELMDRAWCOMMON_DrawDisplayFrameWidth(c, nullptr, 0), 0);
    });
    EXPECT_TRUE(ink_box(image).isEmpty());
}

// A family name that fills its whole array without an ending NUL is read
// no further than the array: the font is used with the name cut there.
TEST(DrawCommonArguments, UnterminatedFamilyNameIsCutAtTheArrayEnd)
{
    VELMCONFIGFONT cut = test_font();
    std::memset(cut.familyName, 'A', sizeof cut.familyName - 1);
    cut.familyName[sizeof cut.familyName - 1] = '\0';
    // On the heap, every byte set, so a read past the record is caught.
    auto unterminated = std::make_unique<VELMCONFIGFONT>(cut);
    std::memset(unterminated->familyName, 'A', sizeof unterminated->familyName);
    unterminated->size = 20.1f;
    unterminated->properties = 0x01010101;
    unterminated->color = 0x011010FF;
    unterminated->inactiveColor = 0x01FF1010;
    std::memcpy(&cut.size, &unterminated->size, sizeof cut - sizeof cut.familyName);
    int widths[2] = {};
    const QImage expected = paint(300, 40, [&](VELMCANVAS c) {
        widths[0] = VELMDRAWCOMMON_DrawDisplaySample(c, &cut, 0, kLeft, kTop, 123456);
    });
    const QImage got = paint(300, 40, [&](VELMCANVAS c) {
        widths[1] = VELMDRAWCOMMON_DrawDisplaySample(c, unterminated.get(), 0, kLeft, kTop, 123456);
    });
    EXPECT_GT(widths[1], 0);
    EXPECT_EQ(widths[1], widths[0]);
    EXPECT_EQ(ink_box(got), ink_box(expected));
}

} // namespace
