// The renderer's pictures of real audio, compared with reviewed images.
#include <gtest/gtest.h>

#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "testaudio.hpp"
#include "view_support.hpp"

namespace {

constexpr int kRate = 16000;
constexpr uint32_t kNoScales = 0xC; // the scale strips stay empty; grids still show

class Golden : public ::testing::Test {
protected:
    VELMAUDIO open(const std::vector<float> &frames, int channels)
    {
        VELMAUDIO doc = viewtest::open_audio(dir.file("sound.wav"), frames, kRate, channels);
        EXPECT_NE(doc, nullptr);
        docs.push_back(doc);
        return doc;
    }
    VELMAUDIO speech(int channels = 1) { return open(viewtest::speech_like(kRate, channels, 2.0), channels); }

    void expect_golden(VELMAUDIO doc, uint32_t flags, const char *name, int width = 640, int height = 240)
    {
        viewtest::Canvas canvas(width, height);
        ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 2, static_cast<int32_t>(flags)));
        ASSERT_TRUE(canvas.draw(doc));
        EXPECT_EQ(viewtest::compare_golden(canvas.output(), name), "");
    }

    void TearDown() override
    {
        for (VELMAUDIO doc : docs) VELMAUDIO_Close(doc);
    }

    velmtest::TempDir dir;
    std::vector<VELMAUDIO> docs;
};

TEST_F(Golden, SpeechAsWaveform)
{
    expect_golden(speech(), kNoScales | 0x1, "speech_waveform");
}

TEST_F(Golden, SpeechAsSpectrogram)
{
    expect_golden(speech(), kNoScales | 0x2, "speech_spectrogram");
}

TEST_F(Golden, SpeechAsBothWithNavigator)
{
    expect_golden(speech(), kNoScales | 0x3 | 0x4000, "speech_both_navigator", 640, 320);
}

TEST_F(Golden, SpeechOnMelScaleWithButtons)
{
    VELMAUDIO doc = speech();
    VELMAUDIO_SetDrawProperty(doc, 4, 1);
    expect_golden(doc, kNoScales | 0x3 | 0x8000, "speech_mels_buttons", 640, 320);
    VELMAUDIO_SetDrawProperty(doc, 4, 0);
}

TEST_F(Golden, SampleLevelShowsTheSplineWithSmallDots)
{
    VELMAUDIO doc = speech();
    // 40 samples over about 600 columns: 15 columns per sample.
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 1000, 1040));
    expect_golden(doc, kNoScales | 0x1, "speech_samples_small_dots");
}

TEST_F(Golden, SampleLevelShowsLargeDotsFurtherIn)
{
    VELMAUDIO doc = speech();
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 1000, 1030));
    expect_golden(doc, kNoScales | 0x1, "speech_samples_large_dots");
}

TEST_F(Golden, SilenceIsAFlatLine)
{
    VELMAUDIO doc = open(std::vector<float>(kRate, 0.0f), 1);
    expect_golden(doc, kNoScales | 0x3, "silence_both");
}

TEST_F(Golden, SixChannelsWithThreePixelNavigatorLanes)
{
    VELMAUDIO doc = speech(6);
    // 18 pixels of navigator for six channels: lanes of 3 pixels are bars.
    VELMAUDIO_SetDrawProperty(doc, 7, 18);
    expect_golden(doc, kNoScales | 0x3 | 0x2000, "six_channels_navigator", 640, 480);
}

TEST_F(Golden, FramedStereoWaveform)
{
    expect_golden(speech(2), 0x1, "stereo_framed");
}

// The horizontal scale in each kind, zoomed out and in.
class HorzScaleGolden : public Golden {
protected:
    void expect_kind(int kind, int64_t start, int64_t end, const char *name)
    {
        VELMAUDIO doc = speech();
        ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 5, kind));
        ASSERT_TRUE(VELMAUDIO_Zoom(doc, start, end));
        expect_golden(doc, 0x8 | 0x1, name, 640, 160);
        VELMAUDIO_SetDrawProperty(doc, 5, 1);
    }
};

TEST_F(HorzScaleGolden, TimeWholeSound)
{
    expect_kind(1, 0, 2 * kRate, "horz_time_whole");
}

TEST_F(HorzScaleGolden, TimeMilliseconds)
{
    expect_kind(1, 8000, 8400, "horz_time_ms");
}

TEST_F(HorzScaleGolden, SamplesZoomedIn)
{
    expect_kind(0, 1000, 1100, "horz_sample_zoomed");
}

TEST_F(HorzScaleGolden, FramesWholeSound)
{
    expect_kind(2, 0, 2 * kRate, "horz_frame_whole");
}

TEST_F(HorzScaleGolden, TimeFromTheViewStart)
{
    expect_kind(4, 4321, 4321 + 6000, "horz_time_view");
}

TEST_F(HorzScaleGolden, NoGridWithFlag)
{
    VELMAUDIO doc = speech();
    expect_golden(doc, 0x8 | 0x200 | 0x1, "horz_time_no_grid", 640, 160);
}

} // namespace

namespace {

// The value scales beside the lanes in each kind.
class VertScaleGolden : public Golden {
protected:
    void expect_kind(int property, int kind, uint32_t flags, const char *name, int height = 240)
    {
        VELMAUDIO doc = speech(2);
        ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, property, kind));
        expect_golden(doc, flags, name, 640, height);
        VELMAUDIO_SetDrawProperty(doc, property, 0);
    }
};

TEST_F(VertScaleGolden, SampleValues)
{
    expect_kind(3, 0, 0x1, "vert_sample");
}

TEST_F(VertScaleGolden, Decibels)
{
    expect_kind(3, 1, 0x1, "vert_decibel");
}

TEST_F(VertScaleGolden, Percent)
{
    expect_kind(3, 2, 0x1, "vert_percent", 400);
}

TEST_F(VertScaleGolden, Normalised)
{
    expect_kind(3, 3, 0x1, "vert_normalized");
}

TEST_F(VertScaleGolden, HertzBesideSpectrograms)
{
    expect_kind(4, 0, 0x3, "vert_hertz", 400);
}

TEST_F(VertScaleGolden, MelsBesideSpectrograms)
{
    expect_kind(4, 1, 0x3, "vert_mels", 400);
}

} // namespace
