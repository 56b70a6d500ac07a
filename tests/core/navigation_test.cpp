// The visible window, limits, ranges and the edit cursor of a document.
#include "core/velmaudio.h"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "core/velmtimeconv.h"
#include "edit/velmselection.h"

#include <gtest/gtest.h>

#include <limits>
#include <string>
#include <vector>

namespace {

// A document of `frames` silent samples at `rate` Hz, with the view on all of it.
struct Doc : ::testing::Test {
    VELMAUDIO doc = nullptr;
    void make(int64_t frames, int rate = 8000, int channels = 1)
    {
        const _audio_format f = AUDIO_InitFormat(rate, channels, 16);
        AUDIOSIGNAL *signal = AUDIOSIGNAL_CreateSilence(&f, frames);
        ASSERT_NE(signal, nullptr);
        doc = VELMAUDIO_NewFromSignal(signal, 0);
        ASSERT_NE(doc, nullptr);
        ASSERT_EQ(VELMAUDIO_ViewEnd(doc), frames);
    }
    void SetUp() override { make(1000); }
    void TearDown() override { VELMAUDIO_Close(doc); }
};

// Rewrites the requested window of a 0x20014 event and records 0x20015.
struct WindowRewriter {
    int64_t begin = -1, end = -1;
    std::vector<std::pair<int64_t, int64_t>> after;
    static int handler(const BLNotifyEvent *e, void *user)
    {
        auto *self = static_cast<WindowRewriter *>(user);
        auto *lo = static_cast<int64_t *>(e->data1);
        auto *hi = static_cast<int64_t *>(e->data2);
        if (e->event == 0x20014 && self->begin >= 0) {
            *lo = self->begin;
            *hi = self->end;
        }
        if (e->event == 0x20015) self->after.emplace_back(*lo, *hi);
        return 1;
    }
};

int refuse(const BLNotifyEvent *e, void *code)
{
    return e->event == *static_cast<uint32_t *>(code) ? 0 : 1;
}

} // namespace

TEST_F(Doc, TinyAndEmptyWindows)
{
    EXPECT_TRUE(VELMAUDIO_Zoom(doc, 100, 102));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 0);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 1000);
    EXPECT_FALSE(VELMAUDIO_Zoom(doc, 50, 50));
    EXPECT_TRUE(VELMAUDIO_Zoom(doc, 300, 100));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 100);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 300);
    EXPECT_TRUE(VELMAUDIO_Zoom(doc, -50, 5000)); // clamped to the signal
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 0);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 1000);
}

TEST_F(Doc, HandlersMayRewriteOrRefuseTheWindow)
{
    WindowRewriter w;
    w.begin = 10;
    w.end = 90;
    VELMAUDIO_AddEventHandler(doc, WindowRewriter::handler, &w);
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 200, 400));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 10);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 90);
    ASSERT_EQ(w.after.size(), 1u);
    EXPECT_EQ(w.after[0], (std::pair<int64_t, int64_t>{10, 90}));
    VELMAUDIO_DelEventHandler(doc, WindowRewriter::handler, &w);

    uint32_t code = 0x20014;
    VELMAUDIO_AddEventHandler(doc, refuse, &code);
    EXPECT_FALSE(VELMAUDIO_Zoom(doc, 200, 400));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 10);
    VELMAUDIO_DelEventHandler(doc, refuse, &code);
}

TEST_F(Doc, ScrollingStopsAtTheLimits)
{
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 200, 400));
    ASSERT_TRUE(VELMAUDIO_ZoomOffset(doc, -500));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 0);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 200);
    EXPECT_FALSE(VELMAUDIO_ZoomOffset(doc, -1));
    EXPECT_TRUE(VELMAUDIO_ZoomOffset(doc, 0));
    ASSERT_TRUE(VELMAUDIO_ZoomOffset(doc, 5000));
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 1000);
    EXPECT_FALSE(VELMAUDIO_ZoomOffset(doc, 1));
}

TEST_F(Doc, ZoomLimitsBoundTheWindow)
{
    ASSERT_TRUE(VELMAUDIO_SetZoomLimits(doc, 600, 200));
    EXPECT_EQ(VELMAUDIO_ViewBeginLimit(doc), 200);
    EXPECT_EQ(VELMAUDIO_ViewEndLimit(doc), 600);
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 200);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 600);
    EXPECT_TRUE(VELMAUDIO_HasZoomLimit(doc));
    EXPECT_TRUE(VELMAUDIO_Zoom(doc, 0, 1000));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 200);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 600);
    EXPECT_FALSE(VELMAUDIO_HasZoom(doc));

    EXPECT_TRUE(VELMAUDIO_ChangeControlVisibility(doc, 2, 1));
    EXPECT_TRUE(VELMAUDIO_IsControlVisible(doc, 2));
    EXPECT_FALSE(VELMAUDIO_ResetZoomLimits(doc)); // the empty zoom of a reset reports false
    EXPECT_EQ(VELMAUDIO_ViewEndLimit(doc), 1000);
    EXPECT_FALSE(VELMAUDIO_HasZoomLimit(doc));
    EXPECT_TRUE(VELMAUDIO_ChangeControlVisibility(doc, 2, 0));
    EXPECT_FALSE(VELMAUDIO_IsControlVisible(doc, 2));
    EXPECT_TRUE(VELMAUDIO_ChangeControlVisibility(doc, 2, 1)); // no limits: nothing changes
    EXPECT_FALSE(VELMAUDIO_IsControlVisible(doc, 2));
    EXPECT_FALSE(VELMAUDIO_ChangeControlVisibility(doc, 1, 1));
}

TEST_F(Doc, LimitsLeavingNoWindowAreRefused)
{
    EXPECT_FALSE(VELMAUDIO_SetZoomLimits(doc, 2000, 3000)); // wholly past the end
    EXPECT_FALSE(VELMAUDIO_SetZoomLimits(doc, 500, 0));
    EXPECT_EQ(VELMAUDIO_ViewBeginLimit(doc), 0);
    EXPECT_EQ(VELMAUDIO_ViewEndLimit(doc), 1000);
    EXPECT_FALSE(VELMAUDIO_HasZoomLimit(doc));
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 100, 200));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 100);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 200);
}

TEST_F(Doc, ExtremeWindowRequestsWithinLimits)
{
    constexpr int64_t kMax = std::numeric_limits<int64_t>::max(), kMin = std::numeric_limits<int64_t>::min();
    ASSERT_TRUE(VELMAUDIO_SetZoomLimits(doc, 300, 700));
    EXPECT_TRUE(VELMAUDIO_Zoom(doc, kMin, kMin)); // wholly below the limits: nothing to show, nothing changes
    EXPECT_TRUE(VELMAUDIO_Zoom(doc, kMax, kMax));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 300);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 700);
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 400, 500));
    EXPECT_TRUE(VELMAUDIO_Zoom(doc, kMin, kMax));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 300);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 700);
}

TEST_F(Doc, CentringOnTheCursorKeepsTheLength)
{
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 0, 200));
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, 950));
    ASSERT_TRUE(VELMAUDIO_ZoomCursor(doc));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 800);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 1000);
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, 30));
    ASSERT_TRUE(VELMAUDIO_ZoomCursor(doc));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 0);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 200);
}

TEST_F(Doc, StepZoomAroundTheVisibleCursor)
{
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, 500));
    ASSERT_TRUE(VELMAUDIO_ZoomIn(doc));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 50);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 950);
    ASSERT_TRUE(VELMAUDIO_ZoomOut(doc));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 5);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 995);
    VELMAUDIO_HideMainCursor(doc);
    ASSERT_TRUE(VELMAUDIO_ZoomIn(doc));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 104);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 896);
}

TEST_F(Doc, ZoomFactorsBeyondThePositionsSaturate)
{
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 400, 600));
    VELMAUDIO_ZoomByFactor(doc, 500, std::numeric_limits<double>::quiet_NaN());
    VELMAUDIO_ZoomByFactor(doc, 500, std::numeric_limits<double>::infinity());
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 400);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 600);
    // Growing the window by an absurd factor shows everything the limits allow.
    VELMAUDIO_ZoomByFactor(doc, 500, -1e30);
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 0);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 1000);
}

TEST_F(Doc, VerticalRange)
{
    ASSERT_TRUE(VELMAUDIO_ZoomVertical(doc, -0.5f, 1.0f));
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->vertMin, -0.5);
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->vertMax, 1.0);
    EXPECT_FALSE(VELMAUDIO_ZoomVertical(doc, 0.25f, 0.25f));
    ASSERT_TRUE(VELMAUDIO_ZoomVertical(doc, -1e9f, 1e9f));
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->vertMax, 32768.0);
    ASSERT_TRUE(VELMAUDIO_ZoomVerticalReset(doc));
    ASSERT_TRUE(VELMAUDIO_ZoomVerticalIn(doc));
    EXPECT_NEAR(VELMAUDIO_GetState(doc)->vertMax, 0.9, 1e-6);
    uint32_t code = 0x20018;
    VELMAUDIO_AddEventHandler(doc, refuse, &code);
    EXPECT_FALSE(VELMAUDIO_ZoomVerticalReset(doc));
    EXPECT_NEAR(VELMAUDIO_GetState(doc)->vertMax, 0.9, 1e-6);
    VELMAUDIO_DelEventHandler(doc, refuse, &code);
}

TEST_F(Doc, SpectralRange)
{
    VELMAUDIO_Close(doc);
    make(44100, 44100);
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->spectralMax, 22050.0);
    EXPECT_FALSE(VELMAUDIO_ZoomSpectral(doc, 100, 105));
    ASSERT_TRUE(VELMAUDIO_ZoomSpectral(doc, 1000, 2000));
    ASSERT_TRUE(VELMAUDIO_ZoomSpectral(doc, -50, 1e9f));
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->spectralMin, 0.0);
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->spectralMax, 22050.0);
    ASSERT_TRUE(VELMAUDIO_ZoomSpectral(doc, 1000, 2000));
    ASSERT_TRUE(VELMAUDIO_ScrollSpectral(doc, -5000));
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->spectralMin, 0.0);
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->spectralMax, 1000.0);
    ASSERT_TRUE(VELMAUDIO_ZoomSpectralFactorAround(doc, 500, 0.5));
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->spectralMin, 250.0);
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->spectralMax, 750.0);
    EXPECT_FALSE(VELMAUDIO_ZoomSpectralFactorAround(doc, 5000, 0.5));
}

TEST_F(Doc, RangesThatAreNotNumbersOrOutsideTheBoundsAreRefused)
{
    VELMAUDIO_Close(doc);
    make(44100, 44100);
    const float nan = std::numeric_limits<float>::quiet_NaN();
    const float inf = std::numeric_limits<float>::infinity();
    EXPECT_FALSE(VELMAUDIO_ZoomVertical(doc, nan, 1.0f));
    EXPECT_FALSE(VELMAUDIO_ZoomVertical(doc, -0.5f, nan));
    EXPECT_FALSE(VELMAUDIO_ScrollVertical(doc, inf));
    EXPECT_FALSE(VELMAUDIO_ZoomVertical(doc, 40000.0f, 50000.0f)); // wholly above the bounds
    EXPECT_FALSE(VELMAUDIO_ZoomVerticalFactor(doc, std::numeric_limits<double>::quiet_NaN()));
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->vertMin, -1.0);
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->vertMax, 1.0);
    EXPECT_FALSE(VELMAUDIO_ZoomSpectral(doc, nan, 1000.0f));
    EXPECT_FALSE(VELMAUDIO_ZoomSpectral(doc, 1000.0f, nan));
    EXPECT_FALSE(VELMAUDIO_ZoomSpectralFactorAround(doc, nan, 0.5));
    EXPECT_FALSE(VELMAUDIO_ScrollSpectral(doc, nan));
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->spectralMin, 0.0);
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->spectralMax, 22050.0);
}

TEST_F(Doc, CursorClampsAndMarksItsChange)
{
    std::vector<int64_t> moves;
    auto record = [](const BLNotifyEvent *e, void *user) -> int {
        if (e->event == 0x2001C) static_cast<std::vector<int64_t> *>(user)->push_back(*static_cast<int64_t *>(e->data1));
        return 1;
    };
    VELMAUDIO_AddEventHandler(doc, record, &moves);
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, 5000));
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 1000);
    VELMAUDIO_GetCursorChangedPosition(doc);
    EXPECT_FALSE(VELMAUDIO_CursorPositionChanged(doc));
    EXPECT_FALSE(VELMAUDIO_SetCursorPosition(doc, 1000));
    EXPECT_TRUE(VELMAUDIO_CursorPositionChanged(doc));
    EXPECT_EQ(moves, (std::vector<int64_t>{1000}));
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, 500));
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->selecting.begin, 0.0625);
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetDisplayTime(doc), 0.0625);
    VELMAUDIO_DelEventHandler(doc, record, &moves);
}

TEST_F(Doc, KeepTheCursorVisible)
{
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 0, 200));
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, 400));
    ASSERT_TRUE(VELMAUDIO_ScrollToKeepCursorVisible(doc));
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 410);
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 210);
}

TEST_F(Doc, ChannelMaskNeedsItsViewOption)
{
    VELMAUDIO_Close(doc);
    make(100, 8000, 2);
    ASSERT_TRUE(VELMAUDIO_SetChannelMask(doc, 0x1));
    EXPECT_EQ(VELMAUDIO_ActiveChannelMask(doc), 0x3u);
    ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, 0x10000));
    ASSERT_TRUE(VELMAUDIO_SetChannelMask(doc, 0x1));
    EXPECT_EQ(VELMAUDIO_ActiveChannelMask(doc), 0x1u);
    EXPECT_EQ(VELMAUDIO_DisabledChannelMask(doc), 0x2u);
    EXPECT_EQ(VELMAUDIO_GetState(doc)->channelMask, 0x1u);
}

TEST_F(Doc, ScaleKindsAreGlobal)
{
    const _audio_format f = AUDIO_InitFormat(8000, 1, 16);
    VELMAUDIO other = VELMAUDIO_NewFromSignal(AUDIOSIGNAL_CreateSilence(&f, 10), 0);
    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 5, 2));
    EXPECT_EQ(VELMAUDIO_GetDrawProperty(other, 5), 2);
    VELMCONFIG_ApplyStateConfiguration(other, VELMAUDIO_GetState(other));
    EXPECT_EQ(VELMAUDIO_GetState(other)->horzScaleKind, 2);
    char label[16];
    ASSERT_TRUE(VELMAUDIO_HorzScaleLabelKindString(other, 0, label, sizeof label));
    EXPECT_STREQ(label, "frm");
    ASSERT_TRUE(VELMAUDIO_SelectNextVertScaleKind(doc));
    EXPECT_EQ(VELMAUDIO_GetDrawProperty(doc, 3), 3);
    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 5, 1));
    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 3, 0));
    VELMAUDIO_Close(other);
}

TEST_F(Doc, PositionTextsInEveryScaleKind)
{
    VELMAUDIO_Close(doc);
    make(44100, 44100);
    VELMSTATE *s = VELMAUDIO_GetState(doc);
    char text[32] = "untouched";
    EXPECT_FALSE(VELMAUDIO_SampleToTimeString(doc, -1, text, sizeof text));
    EXPECT_STREQ(text, "untouched");
    s->horzScaleKind = 0;
    ASSERT_TRUE(VELMAUDIO_SampleToTimeString(doc, 22050, text, sizeof text));
    EXPECT_STREQ(text, "22050");
    s->horzScaleKind = 1;
    ASSERT_TRUE(VELMAUDIO_SampleToTimeString(doc, 22050, text, sizeof text));
    EXPECT_STREQ(text, "0.500");
    s->horzScaleKind = 2;
    ASSERT_TRUE(VELMAUDIO_SampleToTimeString(doc, 1000, text, sizeof text));
    EXPECT_STREQ(text, "1/0118");
    ASSERT_TRUE(VELMAUDIO_SetZoomLimits(doc, 1000, 44100));
    s = VELMAUDIO_GetState(doc);
    s->horzScaleKind = 3;
    ASSERT_TRUE(VELMAUDIO_SampleToTimeString(doc, 1500, text, sizeof text));
    EXPECT_STREQ(text, "500");
    ASSERT_TRUE(VELMAUDIO_RealSampleToTimeString(doc, 1500, 44100, text, sizeof text));
    EXPECT_STREQ(text, "1500");
    s->horzScaleKind = 9;
    EXPECT_FALSE(VELMAUDIO_SampleToTimeString(doc, 1500, text, sizeof text));
    EXPECT_STREQ(text, "##erro##");
    EXPECT_EQ(VELMAUDIO_TimeToFrame(doc, 1.0), 50);
    EXPECT_EQ(VELMAUDIO_TimeToFrameSample(doc, 1.0), 0);
    EXPECT_EQ(VELMAUDIO_ScaleFrameLength(doc), 882);
    EXPECT_DOUBLE_EQ(VELMAUDIO_Duration(doc), 1.0);
}

TEST_F(Doc, ScalePositionsStopAtTheEndsOfTheRange)
{
    VELMAUDIO_SetDrawProperty(doc, 6, 100); // attaches a renderer; nothing laid out, so steps of 1
    constexpr int64_t kMax = std::numeric_limits<int64_t>::max(), kMin = std::numeric_limits<int64_t>::min();
    EXPECT_EQ(VELMAUDIO_GetNextPosition(doc, 10), 11);
    EXPECT_EQ(VELMAUDIO_GetPrevPosition(doc, 10), 9);
    EXPECT_EQ(VELMAUDIO_GetNextPosition(doc, kMax), kMax);
    EXPECT_EQ(VELMAUDIO_GetNextTickPosition(doc, kMax - 1), kMax);
    EXPECT_EQ(VELMAUDIO_GetPrevPosition(doc, kMin), kMin);
    EXPECT_EQ(VELMAUDIO_GetPrevTickPosition(doc, kMin), kMin);
}

TEST(Navigation, WithoutASignalEverythingFails)
{
    VELMAUDIO link = VELMAUDIO_CreateUnresolvedLink();
    EXPECT_EQ(VELMAUDIO_Zoom(link, 0, 100), 0);
    EXPECT_EQ(VELMAUDIO_SetCursorPosition(link, 3), 0);
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(link), -1);
    EXPECT_EQ(VELMAUDIO_SampleToTime(link, 10), -1.0);
    EXPECT_EQ(VELMAUDIO_TimeToSample(link, 1.0), -1);
    EXPECT_EQ(VELMAUDIO_ViewBegin(nullptr), -1);
    EXPECT_EQ(VELMAUDIO_ZoomVertical(nullptr, 0, 1), 0);
    VELMAUDIO_Close(link);
}

TEST_F(Doc, ZoomAndLimitToTheSelection)
{
    EXPECT_FALSE(VELMAUDIO_ZoomSelection(doc));
    EXPECT_FALSE(VELMAUDIO_SetZoomLimitsToSelection(doc));
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 300, 700));
    ASSERT_TRUE(VELMAUDIO_ZoomSelection(doc));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 300);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 700);
    ASSERT_TRUE(VELMAUDIO_ZoomReset(doc));
    ASSERT_TRUE(VELMAUDIO_SetZoomLimitsToSelection(doc));
    EXPECT_EQ(VELMAUDIO_ViewBeginLimit(doc), 300);
    EXPECT_EQ(VELMAUDIO_ViewEndLimit(doc), 700);
    EXPECT_EQ(VELMAUDIO_SamplesPerPixel(doc), 0); // nothing drawn yet
    EXPECT_EQ(VELMAUDIO_SamplesPerPixel(nullptr), -1);
}
