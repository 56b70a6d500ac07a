// Layout rectangles, minimum sizes and the wave height conversions.
#include <gtest/gtest.h>

#include "core/velmconfig.h"
#include "testaudio.hpp"
#include "view_support.hpp"

namespace {

class Layout : public ::testing::Test {
protected:
    void SetUp() override
    {
        doc = viewtest::open_audio(dir.file("a.wav"), viewtest::speech_like(8000, 2, 1.0), 8000, 2);
        ASSERT_NE(doc, nullptr);
    }
    void TearDown() override { VELMAUDIO_Close(doc); }

    // Lays the view out at 800 x 400 with the flags.
    void lay_out(uint32_t flags)
    {
        VELMAUDIO_SetDrawProperty(doc, 2, static_cast<int32_t>(flags));
        ASSERT_TRUE(canvas.draw(doc));
    }
    _VELMRECT area(int which)
    {
        _VELMRECT r{};
        EXPECT_TRUE(VELMAUDIO_GetDrawAreaRect(doc, which, &r)) << which;
        return r;
    }

    velmtest::TempDir dir;
    viewtest::Canvas canvas{800, 400};
    VELMAUDIO doc = nullptr;
};

void expect_rect(const _VELMRECT &r, int left, int top, int width, int height)
{
    EXPECT_EQ(r.left, left);
    EXPECT_EQ(r.top, top);
    EXPECT_EQ(r.width, width);
    EXPECT_EQ(r.height, height);
    EXPECT_EQ(r.right, left + width - 1);
    EXPECT_EQ(r.bottom, top + height - 1);
}

TEST_F(Layout, FramedWaveformsShareTheHeight)
{
    lay_out(0x1);
    expect_rect(area(VELMDRAW_AREA_FRAME), 6, 6, 788, 388);
    // 1 + 2 pixels of border; 4 + 2 of width; 55 + 1 for the vertical scale.
    // Height: 388 - (2 * 2 + 4 + 1 + 1) - 20 for the horizontal scale = 358.
    // Between lanes: a border, the separator and the next lane's border.
    expect_rect(area(0), 9, 9, 726, 179);
    expect_rect(area(1), 9, 9 + 179 + 3, 726, 179);
    expect_rect(area(VELMDRAW_AREA_HORZSCALE), 9, 9 + 2 * 179 + 3 + 3, 726, 20);
    EXPECT_EQ(area(2).height, 0); // spectrograms are not shown
}

TEST_F(Layout, BareViewUsesEveryPixel)
{
    lay_out(0x1 | 0x4 | 0x8 | 0x40 | 0x80 | 0x100);
    expect_rect(area(VELMDRAW_AREA_FRAME), 0, 0, 800, 400);
    expect_rect(area(0), 0, 0, 800, 200);
    expect_rect(area(1), 0, 200, 800, 199); // n - 1 = 1 pixel is kept for the gaps
}

TEST_F(Layout, BothKindsSplitByTheWaveHeightFraction)
{
    lay_out(0x3 | 0x4 | 0x8 | 0x40 | 0x100);
    // Height left: 400 - (2 * 4 + 3) = 389; waveforms get trunc(387 * 0.5).
    const _VELMRECT w0 = area(0), w1 = area(1), s0 = area(2), s1 = area(3);
    EXPECT_EQ(w0.height + w1.height, 193);
    EXPECT_EQ(s0.height + s1.height, 194);
    EXPECT_EQ(w1.top, w0.bottom + 4);  // borders around the channel separator
    EXPECT_EQ(s0.top, w1.bottom + 6);  // borders around the 3-pixel divider strip
    EXPECT_EQ(s1.top, s0.bottom + 4);
    EXPECT_EQ(VELMAUDIO_GetDrawProperty(doc, 6), 193);

    // Property 6 sets the waveform share in pixels, kept within 20 % .. 80 %.
    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 6, 1000));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_EQ(area(0).height + area(1).height, static_cast<int>(387 * 0.8f));
    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 6, 120));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_NEAR(VELMAUDIO_GetDrawProperty(doc, 6), 120, 1);
}

TEST_F(Layout, NavigatorTakesItsStripFromTheFrame)
{
    lay_out(0x1 | 0x2000);
    const _VELMRECT nav = area(VELMDRAW_AREA_NAVIGATOR);
    expect_rect(nav, 6, 6, 788, 44);
    EXPECT_EQ(area(VELMDRAW_AREA_FRAME).top, 50);
    EXPECT_EQ(area(4).height, 20); // navigator lanes: 40 / 2 channels
    EXPECT_EQ(area(5).top, area(4).bottom + 1);
    lay_out(0x1 | 0x4000);
    EXPECT_EQ(area(VELMDRAW_AREA_NAVIGATOR).bottom, 393);
    EXPECT_EQ(area(VELMDRAW_AREA_FRAME).top, 6);
}

TEST_F(Layout, ButtonColumnNarrowsTheFrame)
{
    lay_out(0x1 | 0x8000);
    EXPECT_EQ(area(VELMDRAW_AREA_FRAME).width, 768);
    EXPECT_EQ(area(0).width, 726 - 20);
}

TEST_F(Layout, MinimumSizesFollowTheFlags)
{
    lay_out(0x1);
    // 30 + 56 + 2 + 4 + 12; height 30 per lane + 2 + 16 + 21.
    VELMAUDIO_SetDrawProperty(doc, 0, 10);
    VELMAUDIO_SetDrawProperty(doc, 1, 10);
    EXPECT_EQ(VELMAUDIO_GetDrawProperty(doc, 0), 104);
    EXPECT_EQ(VELMAUDIO_GetDrawProperty(doc, 1), 60 + 2 + 16 + 21);
    VELMAUDIO_SetDrawProperty(doc, 2, 0x3 | 0x8 | 0x80 | 0x100 | 0x10);
    EXPECT_EQ(VELMAUDIO_GetDrawProperty(doc, 0), 104); // only raised, never lowered
    VELMAUDIO_SetDrawProperty(doc, 0, 10);
    VELMAUDIO_SetDrawProperty(doc, 1, 10);
    EXPECT_EQ(VELMAUDIO_GetDrawProperty(doc, 0), 30);
    EXPECT_EQ(VELMAUDIO_GetDrawProperty(doc, 1), 120);
}

TEST_F(Layout, TinyViewsStillLayOut)
{
    viewtest::Canvas small(40, 30);
    VELMAUDIO_SetDrawProperty(doc, 2, 0x3);
    EXPECT_TRUE(small.draw(doc));
    const _VELMRECT r = area(0);
    EXPECT_GE(r.height, 0);
    EXPECT_GE(r.width, 0);
}

TEST(LayoutChannels, EightChannelsShowSix)
{
    velmtest::TempDir dir;
    VELMAUDIO doc = viewtest::open_audio(dir.file("eight.wav"), viewtest::speech_like(8000, 8, 0.5), 8000, 8);
    ASSERT_NE(doc, nullptr);
    viewtest::Canvas canvas(600, 600);
    VELMAUDIO_SetDrawProperty(doc, 2, 0x3 | 0x4000);
    ASSERT_TRUE(canvas.draw(doc));
    _VELMRECT r{};
    EXPECT_TRUE(VELMAUDIO_GetDrawAreaRect(doc, 17, &r)); // the sixth navigator lane
    EXPECT_GT(r.height, 0);
    EXPECT_FALSE(VELMAUDIO_GetDrawAreaRect(doc, 18, &r));
    VELMAUDIO_Close(doc);
}

TEST_F(Layout, AbsurdViewSizesAreRefused)
{
    VELMDRAW drawer = VELMDRAW_Create(doc);
    ASSERT_NE(drawer, nullptr);
    VELMSTATE *state = VELMSTATE_CreateCopy(nullptr, VELMAUDIO_GetState(doc));
    state->drawWidth = 1 << 30;
    state->drawHeight = 300;
    EXPECT_EQ(VELMDRAW_UpdateDraw(drawer, canvas.get(), state, nullptr), 0);
    state->drawWidth = 300;
    state->drawHeight = -4;
    EXPECT_EQ(VELMDRAW_UpdateDraw(drawer, canvas.get(), state, nullptr), 0);
    EXPECT_LT(VELMDRAW_SizeInMemory(drawer), 1 << 20);
    VELMSTATE_Destroy(state);
    EXPECT_EQ(VELMDRAW_Destroy(drawer), 1);
}

TEST(LayoutGuards, NullArgumentsFail)
{
    _VELMRECT r{};
    EXPECT_EQ(VELMDRAW_Create(nullptr), nullptr);
    EXPECT_EQ(VELMDRAW_Destroy(nullptr), 0);
    EXPECT_EQ(VELMDRAW_GetDrawAreaRect(nullptr, 0, &r), 0);
    EXPECT_EQ(VELMDRAW_SamplesPerPixel(nullptr), -1);
    EXPECT_EQ(VELMAUDIO_Draw(nullptr, nullptr, &r), 0);
    EXPECT_EQ(VELMAUDIO_RedrawNeeded(nullptr, nullptr), 0);
    EXPECT_EQ(VELMAUDIO_GetDrawAreaRect(nullptr, 0, &r), 0);
    EXPECT_EQ(VELMDRAW_UpdateDraw(nullptr, nullptr, nullptr, &r), 0);
}

} // namespace
