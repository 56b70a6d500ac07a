// The embedded picture data: sizes the view relies on, agreement with the
// drawing code they were made from, and the properties that let the canvas
// stretch and join the region frame pieces.
#include "widgets/resources/generator/pictures.h"
#include "widgets/resources/picturedata.h"
#include "widgets/expected_pictures.h"

#include <gtest/gtest.h>

#include <QImage>

#include <map>
#include <string>
#include <vector>

namespace {

struct Expected {
    std::string name;
    int width, height;
    const velm::resources::EmbeddedPicture *data;
};

const std::vector<Expected> &ExpectedPictures()
{
#define VELM_EXPECT(name, width, height) {#name, width, height, &velm::resources::kPicture##name},
    static const std::vector<Expected> pictures = {VELM_EXPECTED_PICTURES(VELM_EXPECT)};
#undef VELM_EXPECT
    return pictures;
}

QImage Decode(const velm::resources::EmbeddedPicture &picture)
{
    return QImage::fromData(picture.bytes, static_cast<int>(picture.size), "PNG")
        .convertToFormat(QImage::Format_ARGB32);
}

QImage Embedded(const std::string &name)
{
    for (const Expected &expected : ExpectedPictures()) {
        if (expected.name == name) return Decode(*expected.data);
    }
    ADD_FAILURE() << "no picture " << name;
    return {};
}

bool RowsEqual(const QImage &image, int a, int b)
{
    for (int x = 0; x < image.width(); ++x) {
        if (image.pixel(x, a) != image.pixel(x, b)) return false;
    }
    return true;
}

bool ColumnsEqual(const QImage &image, int a, int b)
{
    for (int y = 0; y < image.height(); ++y) {
        if (image.pixel(a, y) != image.pixel(b, y)) return false;
    }
    return true;
}

// The largest difference of one channel between two pixels, as they would
// cover what lies below them (so a see-through pixel's colour counts little).
int Difference(QRgb a, QRgb b)
{
    a = qPremultiply(a);
    b = qPremultiply(b);
    return std::max({std::abs(qRed(a) - qRed(b)), std::abs(qGreen(a) - qGreen(b)),
                     std::abs(qBlue(a) - qBlue(b)), std::abs(qAlpha(a) - qAlpha(b))});
}

TEST(PictureData, DecodesToTheSizesTheViewExpects)
{
    ASSERT_EQ(ExpectedPictures().size(), 50u);
    for (const Expected &expected : ExpectedPictures()) {
        SCOPED_TRACE(expected.name);
        EXPECT_EQ(expected.data->name, expected.name);
        const QImage image = QImage::fromData(expected.data->bytes, static_cast<int>(expected.data->size), "PNG");
        ASSERT_FALSE(image.isNull());
        EXPECT_EQ(image.width(), expected.width);
        EXPECT_EQ(image.height(), expected.height);
        EXPECT_TRUE(image.hasAlphaChannel());
    }
}

TEST(PictureData, AreWhatTheGeneratorDraws)
{
    std::map<std::string, const Expected *> by_name;
    for (const Expected &expected : ExpectedPictures()) by_name[expected.name] = &expected;
    const auto pictures = velm::pictures::AllPictures();
    ASSERT_EQ(pictures.size(), by_name.size());
    for (const auto &picture : pictures) {
        SCOPED_TRACE(picture.name);
        const auto found = by_name.find(picture.name);
        ASSERT_NE(found, by_name.end());
        // A mismatch means the drawing code changed: run `ninja velm_pictures`.
        EXPECT_EQ(Decode(*found->second->data), picture.draw().convertToFormat(QImage::Format_ARGB32));
    }
}

// Every picture but the background tile lets what is below show through
// somewhere; the tile is opaque, in the default window colour.
TEST(PictureData, OnlyTheBackgroundTileIsOpaque)
{
    for (const Expected &expected : ExpectedPictures()) {
        SCOPED_TRACE(expected.name);
        const QImage image = Decode(*expected.data);
        int see_through = 0, visible = 0;
        for (int y = 0; y < image.height(); ++y) {
            for (int x = 0; x < image.width(); ++x) {
                const int alpha = qAlpha(image.pixel(x, y));
                see_through += alpha < 255;
                visible += alpha > 40;
            }
        }
        EXPECT_GT(visible, 0);
        if (expected.name == "Background") {
            EXPECT_EQ(see_through, 0);
            EXPECT_EQ(image.pixel(0, 0), qRgb(0, 64, 64));
        } else {
            EXPECT_GT(see_through, 0);
        }
    }
}

// The canvas stretches sides downwards and edges across, so those pieces
// must look the same wherever they are cut.
TEST(RegionFrame, StretchedPiecesAreUniformAlongTheStretch)
{
    for (const char *name : {"RegionRoundLeftOpen", "RegionRoundRightOpen", "RegionRectLeft", "RegionRectRight",
                             "SelRegionRoundLeftOpen", "SelRegionRoundRightOpen", "SelRegionRectLeft",
                             "SelRegionRectRight"}) {
        SCOPED_TRACE(name);
        const QImage image = Embedded(name);
        for (int y = 1; y < image.height(); ++y) EXPECT_TRUE(RowsEqual(image, 0, y)) << "row " << y;
    }
    for (const char *name : {"RegionRectTopOpen", "RegionRectBottomOpen", "SelRegionRectTopOpen",
                             "SelRegionRectBottomOpen"}) {
        SCOPED_TRACE(name);
        const QImage image = Embedded(name);
        for (int x = 1; x < image.width(); ++x) EXPECT_TRUE(ColumnsEqual(image, 0, x)) << "column " << x;
    }
}

// Where the canvas puts pieces side by side, the edge of one continues in
// the next: a corner's last row into its side, its inner column into the
// top or bottom edge.
TEST(RegionFrame, PiecesMeetWithoutSeams)
{
    constexpr int kTolerance = 24;
    struct Join {
        const char *corner, *neighbour;
        bool vertical; // the corner's last row meets the side's first
        int corner_line, neighbour_line;
    };
    const Join joins[] = {
        {"RegionRoundTopLeftOpen", "RegionRoundLeftOpen", true, 11, 0},
        {"RegionRoundTopRightOpen", "RegionRoundRightOpen", true, 11, 0},
        {"RegionRoundLeftOpen", "RegionRoundBottomLeftOpen", true, 11, 0},
        {"RegionRoundTopLeftOpen", "RegionRectTopOpen", false, 11, 0},
        {"RegionRectTopOpen", "RegionRoundTopRightOpen", false, 11, 0},
        {"RegionRoundBottomLeftOpen", "RegionRectBottomOpen", false, 11, 0},
        {"RegionRectTopLeft", "RegionRectLeft", true, 11, 0},
        {"RegionRectLeft", "RegionRectBottomLeft", true, 11, 0},
        {"SelRegionRoundTopLeftOpen", "SelRegionRoundLeftOpen", true, 11, 0},
        {"SelRegionRoundTopLeftOpen", "SelRegionRectTopOpen", false, 11, 0},
        {"SelRegionRoundBottomRightOpen", "SelRegionRectBottomOpen", false, 0, 11},
    };
    for (const Join &join : joins) {
        SCOPED_TRACE(std::string(join.corner) + " / " + join.neighbour);
        const QImage a = Embedded(join.corner), b = Embedded(join.neighbour);
        const int length = join.vertical ? a.width() : a.height();
        ASSERT_EQ(length, join.vertical ? b.width() : b.height());
        for (int i = 0; i < length; ++i) {
            const QRgb pa = join.vertical ? a.pixel(i, join.corner_line) : a.pixel(join.corner_line, i);
            const QRgb pb = join.vertical ? b.pixel(i, join.neighbour_line) : b.pixel(join.neighbour_line, i);
            EXPECT_LE(Difference(pa, pb), kTolerance) << "at " << i;
        }
    }
}

} // namespace
