// The exported colour maps.
#include "render/canvas/velmcanvas.h"

#include <gtest/gtest.h>

#include <cmath>

namespace {

void ExpectGrey(const VELMCOLORMAPENTRY &e, int level, int spare, int index)
{
    EXPECT_EQ(e.red, level) << "entry " << index;
    EXPECT_EQ(e.green, level) << "entry " << index;
    EXPECT_EQ(e.blue, level) << "entry " << index;
    EXPECT_EQ(e.spare, spare) << "entry " << index;
}

TEST(ColorMaps, EachHoldsTwoHundredFiftySixFourByteEntries)
{
    EXPECT_EQ(sizeof(VELMCOLORMAP), 1024u);
}

TEST(ColorMaps, LinearGreyScalesAndTheirSpareBytes)
{
    for (int i = 0; i < 256; ++i) {
        ExpectGrey(VELMCOLORMAP_LINEARGRAYSCALE.entry[i], i, 0, i);
        ExpectGrey(VELMCOLORMAP_INVLINEARGRAYSCALE.entry[i], 255 - i, 255, i);
    }
}

TEST(ColorMaps, GammaGreyScalesFollowThePowerRule)
{
    for (int i = 0; i < 256; ++i) {
        const int level = static_cast<int>(std::floor(255.0 * std::pow(i / 255.0, 1.8)));
        ExpectGrey(VELMCOLORMAP_GRAYSCALE.entry[i], level, 0, i);
        ExpectGrey(VELMCOLORMAP_INVGRAYSCALE.entry[i], VELMCOLORMAP_GRAYSCALE.entry[255 - i].red, 0, i);
    }
}

TEST(ColorMaps, HeatRampPassesThroughItsFixedPointsSmoothly)
{
    const struct {
        int index;
        unsigned rgb;
    } fixed[] = {{0, 0x000000},   {16, 0x01091B},  {32, 0x010323},  {48, 0x090130},  {64, 0x1C0140},  {80, 0x380252},
                 {96, 0x610269},  {112, 0x84026E}, {128, 0xA00360}, {144, 0xC20344}, {160, 0xE60519}, {176, 0xFB2F13},
                 {192, 0xFD8A3D}, {208, 0xFDC968}, {224, 0xFEF399}, {240, 0xF7FEC6}, {255, 0xF8FEEB}};
    for (const auto &f : fixed) {
        const VELMCOLORMAPENTRY &e = VELMCOLORMAP_CE2K.entry[f.index];
        EXPECT_EQ((e.red << 16) | (e.green << 8) | e.blue, f.rgb) << "entry " << f.index;
    }
    for (int i = 1; i < 256; ++i) {
        const VELMCOLORMAPENTRY &a = VELMCOLORMAP_CE2K.entry[i - 1], &b = VELMCOLORMAP_CE2K.entry[i];
        EXPECT_EQ(b.spare, 0);
        // Neighbours differ by no more than the steepest slope between fixed points.
        EXPECT_LE(std::abs(a.red - b.red), 3) << "entry " << i;
        EXPECT_LE(std::abs(a.green - b.green), 6) << "entry " << i;
        EXPECT_LE(std::abs(a.blue - b.blue), 4) << "entry " << i;
    }
}

} // namespace
