// The scales: horizontal steps chosen at several zooms and rates, tick
// layout, labels and the column of a sample; vertical steps and rows of the
// value and spectral scales.
#include <gtest/gtest.h>

#include <QPainter>
#include <cstdio>
#include <memory>

#include "core/document_internal.hpp"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "core/velmtimeconv.h"
#include "render/view/drawer_internal.hpp"
#include "render/view/velmscales.h"
#include "testaudio.hpp"
#include "view_support.hpp"

namespace {

constexpr int kWidth = 640, kHeight = 200;

class HorzScale : public ::testing::Test {
protected:
    VELMAUDIO open(int rate, double seconds)
    {
        doc = viewtest::open_audio(dir.file("sound.wav"), viewtest::speech_like(rate, 1, seconds), rate, 1);
        EXPECT_NE(doc, nullptr);
        return doc;
    }
    // Draws the window start .. end in the kind; the drawer afterwards.
    VELMDRAW draw(int kind, int64_t start, int64_t end)
    {
        EXPECT_TRUE(VELMAUDIO_SetDrawProperty(doc, 5, kind));
        EXPECT_TRUE(VELMAUDIO_SetDrawProperty(doc, 2, 0x1));
        EXPECT_TRUE(VELMAUDIO_Zoom(doc, start, end));
        EXPECT_TRUE(canvas.draw(doc));
        return doc->renderer;
    }
    // Half of the width of the label of the view end, plus 12: the closest
    // two ticks may stand.
    double min_spacing()
    {
        VELMDRAWCONFIG config{};
        VELMCONFIG_InitDrawConfig(&config);
        _VELMCANVASFONT font{};
        std::snprintf(font.name, sizeof font.name, "%s", config.scaleFont.familyName);
        font.size = config.scaleFont.size;
        font.style = static_cast<uint32_t>(config.scaleFont.properties);
        char text[64] = "";
        VELMAUDIO_SampleToTimeString(doc, doc->state->viewEnd, text, sizeof text);
        QPainter painter;
        VELMCANVAS_BeginDraw(canvas.get(), &painter);
        VELMCANVAS_SelectTarget(canvas.get(), VELMCANVASTARGET_MEMORY);
        VELMCANVAS_SelectFont(canvas.get(), &font);
        const int width = VELMCANVAS_TextWidth(canvas.get(), text);
        VELMCANVAS_EndDraw(canvas.get());
        return (width + 12) / 2.0;
    }
    // Columns per sample of the current view.
    double pixels_per_sample()
    {
        const VELMSTATE *s = doc->state;
        return doc->renderer->columns / static_cast<double>(s->viewEnd - s->viewBegin);
    }
    void TearDown() override
    {
        if (doc) {
            VELMAUDIO_SetDrawProperty(doc, 5, VELMDRAW_HORZ_TIME);
            VELMAUDIO_Close(doc);
        }
    }

    velmtest::TempDir dir;
    viewtest::Canvas canvas{kWidth, kHeight};
    VELMAUDIO doc = nullptr;
};

TEST_F(HorzScale, TimeTicksOneSecondApartAt44100Hz)
{
    open(44100, 20.0);
    VELMDRAW d = draw(VELMDRAW_HORZ_TIME, 0, 17 * 44100);
    // One second spans about 33 columns, half a second too few for a label.
    const double pps = pixels_per_sample(), spacing = min_spacing();
    ASSERT_LE(22050 * pps, spacing);
    ASSERT_GE(44100 * pps, spacing);
    EXPECT_EQ(VELMDRAW_GetHorzScaleStep(d), 44100);
    const velm::view::HorzScale &h = d->horzTicks;
    ASSERT_GE(h.count, 10);
    for (int64_t i = 0; i < h.count; ++i) {
        const velm::view::HorzTick &tick = h.ticks[static_cast<size_t>(i)];
        EXPECT_EQ(tick.sample % 44100, 0);
        EXPECT_EQ(tick.major != 0, tick.sample % 88200 == 0) << tick.sample;
        EXPECT_GE(tick.x, -4.0 * spacing);
        EXPECT_LT(tick.x, d->columns);
    }
    EXPECT_NEAR(static_cast<double>(h.spacing), 44100 * pps, 1.0);
    // The sentinel stands one spacing further and is never labelled.
    const velm::view::HorzTick &sentinel = h.ticks[static_cast<size_t>(h.count)];
    EXPECT_EQ(sentinel.x, h.ticks[static_cast<size_t>(h.count - 1)].x + h.spacing);
    EXPECT_EQ(sentinel.major, 0);
}

TEST_F(HorzScale, TimeStepsFollowTheZoom)
{
    open(44100, 12.0);
    // About 0.36 ms per column: ticks 10 ms apart.
    VELMDRAW d = draw(VELMDRAW_HORZ_TIME, 44100, 44100 + 9000);
    const double pps = pixels_per_sample(), spacing = min_spacing();
    ASSERT_LT(5 * 44.1 * pps, spacing);
    ASSERT_GE(10 * 44.1 * pps, spacing);
    EXPECT_EQ(VELMDRAW_GetHorzScaleStep(d), 441); // 10 ms
    // Zoomed out to the whole 12 s.
    d = draw(VELMDRAW_HORZ_TIME, 0, 12 * 44100);
    EXPECT_EQ(VELMDRAW_GetHorzScaleStep(d) % 22050, 0); // whole half seconds
    EXPECT_GE(VELMDRAW_GetHorzScaleStep(d) * pixels_per_sample(), min_spacing());
}

TEST_F(HorzScale, SampleStepsComeFromTheTableByDecades)
{
    open(8000, 4.0);
    // 100 samples over the lanes: about 5.7 columns per sample.
    VELMDRAW d = draw(VELMDRAW_HORZ_SAMPLE, 1000, 1100);
    double pps = pixels_per_sample(), spacing = min_spacing();
    ASSERT_GT(spacing, 2 * pps);
    ASSERT_LE(spacing, 5 * pps);
    EXPECT_EQ(VELMDRAW_GetHorzScaleStep(d), 5);
    // 24000 samples, about 42 samples per column.
    d = draw(VELMDRAW_HORZ_SAMPLE, 0, 24000);
    pps = pixels_per_sample();
    spacing = min_spacing();
    ASSERT_GT(spacing, 500 * pps);
    ASSERT_LE(spacing, 1000 * pps);
    EXPECT_EQ(VELMDRAW_GetHorzScaleStep(d), 1000);
}

TEST_F(HorzScale, FrameStepsAreWholeFramesOrHalves)
{
    open(8000, 4.0);
    const int64_t frame = VELMAUDIO_ScaleFrameLength(doc); // 20 ms
    ASSERT_EQ(frame, 160);
    VELMDRAW d = draw(VELMDRAW_HORZ_FRAME, 0, 32000);
    const int64_t step = VELMDRAW_GetHorzScaleStep(d);
    EXPECT_EQ((2 * step) % frame, 0) << step;
    EXPECT_GE(step * pixels_per_sample(), min_spacing());
    // A frame label: frame number and sample within it.
    char text[64] = "";
    ASSERT_TRUE(VELMAUDIO_SampleToTimeString(doc, 3 * frame + 7, text, sizeof text));
    EXPECT_STREQ(text, "3/0007");
}

TEST_F(HorzScale, ViewKindsCountFromTheViewStart)
{
    open(8000, 4.0);
    VELMDRAW d = draw(VELMDRAW_HORZ_SAMPLE_VIEW, 1234, 1234 + 600);
    const velm::view::HorzScale &h = d->horzTicks;
    EXPECT_EQ(h.origin, 1234);
    ASSERT_GE(h.count, 2);
    // The tick at the view start is labelled.
    int64_t labelled = -1;
    for (int64_t i = 0; i < h.count; ++i)
        if (h.ticks[static_cast<size_t>(i)].sample == 1234) labelled = i;
    ASSERT_GE(labelled, 0);
    EXPECT_TRUE(h.ticks[static_cast<size_t>(labelled)].major);
    EXPECT_EQ(h.ticks[static_cast<size_t>(labelled)].x, 0);
    EXPECT_EQ(VELMDRAW_GetHorzScaleStep(d) % 5, 0);
}

TEST_F(HorzScale, DisplayPositionBetweenTicks)
{
    open(44100, 12.0);
    VELMDRAW d = draw(VELMDRAW_HORZ_TIME, 0, 441000);
    const velm::view::HorzScale &h = d->horzTicks;
    ASSERT_GE(h.count, 3);
    const velm::view::HorzTick &tick = h.ticks[1];
    EXPECT_EQ(VELMDRAW_HorzScaleGetDisplayXPos(d, tick.sample), tick.x);
    EXPECT_EQ(VELMDRAW_HorzScaleGetDisplayXPos(d, tick.sample + h.step / 2), tick.x + h.spacing / 2);
    EXPECT_EQ(VELMDRAW_HorzScaleGetDisplayXPos(d, h.ticks[0].sample - 1), -1);
    EXPECT_EQ(VELMDRAW_HorzScaleGetDisplayXPos(d, h.ticks[static_cast<size_t>(h.count - 1)].sample + 1), -1);
}

TEST_F(HorzScale, NullDrawerAnswersFailure)
{
    EXPECT_EQ(VELMDRAW_HorzScalePrepareDisplayData(nullptr), 0);
    EXPECT_EQ(VELMDRAW_GetHorzScaleStep(nullptr), 0);
    EXPECT_EQ(VELMDRAW_HorzScaleGetDisplayXPos(nullptr, 0), -1);
    EXPECT_EQ(VELMDRAW_DrawHorzScale(nullptr, 0, 10), 0);
    EXPECT_EQ(VELMDRAW_DrawHorzScaleGrid(nullptr, 0, 10), 0);
}

// A mono 16-bit sound at 16000 Hz drawn with waveform and spectrogram
// lanes 300 pixels high each, showing amplitudes -1 .. +1.
class VertScale : public ::testing::Test {
protected:
    void SetUp() override
    {
        doc = viewtest::open_audio(dir.file("sound.wav"), viewtest::speech_like(16000, 1, 1.0), 16000, 1);
        ASSERT_NE(doc, nullptr);
        ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 2, 0x3));
        // The layout takes a fixed amount around the lanes, and the two
        // lanes share the rest: measure it and grow by twice what is missing.
        int height = 700;
        for (int attempt = 0; attempt < 3; ++attempt) {
            canvas = std::make_unique<viewtest::Canvas>(kWidth, height);
            ASSERT_TRUE(canvas->draw(doc));
            _VELMRECT lane{};
            ASSERT_TRUE(VELMDRAW_GetDrawAreaRect(doc->renderer, 0, &lane));
            height += 2 * (300 - lane.height);
        }
        ASSERT_TRUE(VELMDRAW_GetDrawAreaRect(doc->renderer, 0, &wave));
        ASSERT_TRUE(VELMDRAW_GetDrawAreaRect(doc->renderer, 1, &spectral));
        ASSERT_EQ(wave.height, 300);
        ASSERT_EQ(spectral.height, 300);
        d = doc->renderer;
    }
    void TearDown() override
    {
        if (doc) {
            VELMAUDIO_SetDrawProperty(doc, 4, VELMDRAW_SPEC_HERTZ);
            VELMAUDIO_Close(doc);
        }
    }

    velmtest::TempDir dir;
    std::unique_ptr<viewtest::Canvas> canvas;
    VELMAUDIO doc = nullptr;
    VELMDRAW d = nullptr;
    _VELMRECT wave{}, spectral{};
};

TEST_F(VertScale, StepsPutGridLinesAbout30PixelsApart)
{
    // 1.5 pixels per percent: 20 % spans exactly 30 pixels.
    EXPECT_DOUBLE_EQ(VELMDRAW_CalculateVertScaleStep(d, 0, VELMDRAW_VERT_PERCENT, 16), 20.0);
    // 150 pixels per unit amplitude.
    EXPECT_DOUBLE_EQ(VELMDRAW_CalculateVertScaleStep(d, 0, VELMDRAW_VERT_NORMALIZED, 16), 0.2);
    EXPECT_DOUBLE_EQ(VELMDRAW_CalculateVertScaleStep(d, 0, VELMDRAW_VERT_DECIBEL, 16), 0.2);
    // 7500 of 32768 sample values span 34.3 pixels, 5000 span 22.9.
    EXPECT_DOUBLE_EQ(VELMDRAW_CalculateVertScaleStep(d, 0, VELMDRAW_VERT_SAMPLE, 16), 7500.0);
    // 24-bit values are 256 times finer: the decade grows.
    EXPECT_DOUBLE_EQ(VELMDRAW_CalculateVertScaleStep(d, 0, VELMDRAW_VERT_SAMPLE, 24), 2000000.0);
    EXPECT_EQ(VELMDRAW_CalculateVertScaleStep(d, 0, 7, 16), 0.0);
}

TEST_F(VertScale, SpectralStepsInHertzAndMels)
{
    // 8000 Hz over 300 pixels: 1000 Hz span 37.5 pixels, 500 Hz 18.75.
    EXPECT_DOUBLE_EQ(VELMDRAW_CalculateSpecScaleStep(d, 1, VELMDRAW_SPEC_HERTZ), 1000.0);
    // A waveform lane has no spectral step, nor a spectrogram a value step.
    EXPECT_EQ(VELMDRAW_CalculateSpecScaleStep(d, 0, VELMDRAW_SPEC_HERTZ), 0.0);
    EXPECT_EQ(VELMDRAW_CalculateVertScaleStep(d, 1, VELMDRAW_VERT_PERCENT, 16), 0.0);

    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 4, VELMDRAW_SPEC_MELS));
    ASSERT_TRUE(canvas->draw(doc));
    // About 2840 Mels at 8000 Hz: 250 Mels span 26.4 pixels, 500 span 52.8.
    EXPECT_DOUBLE_EQ(VELMDRAW_CalculateSpecScaleStep(d, 1, VELMDRAW_SPEC_MELS), 250.0);
    EXPECT_EQ(VELMDRAW_ConvertSpecScaleKindRealYtoDisplayY(d, 1, VELMDRAW_SPEC_HERTZ, 8000.0), 0);
    EXPECT_EQ(VELMDRAW_ConvertSpecScaleKindRealYtoDisplayY(d, 1, VELMDRAW_SPEC_HERTZ, 0.0), 300);
}

TEST_F(VertScale, RowsOfValuesInEachKind)
{
    EXPECT_EQ(VELMDRAW_ConvertVertScaleKindRealYtoDisplayY(d, 0, VELMDRAW_VERT_PERCENT, 100.0), 0);
    EXPECT_EQ(VELMDRAW_ConvertVertScaleKindRealYtoDisplayY(d, 0, VELMDRAW_VERT_PERCENT, 0.0), 150);
    EXPECT_EQ(VELMDRAW_ConvertVertScaleKindRealYtoDisplayY(d, 0, VELMDRAW_VERT_NORMALIZED, -1.0), 300);
    EXPECT_EQ(VELMDRAW_ConvertVertScaleKindRealYtoDisplayY(d, 0, VELMDRAW_VERT_SAMPLE, 16384.0), 75);
    // 4000 Hz is half way up the hertz scale.
    EXPECT_EQ(VELMDRAW_ConvertSpecScaleKindRealYtoDisplayY(d, 1, VELMDRAW_SPEC_HERTZ, 4000.0), 150);
    EXPECT_EQ(VELMDRAW_ConvertVertScaleKindRealYtoDisplayY(d, 0, 9, 1.0), -1);
    EXPECT_EQ(VELMDRAW_ConvertVertScaleKindRealYtoDisplayY(d, 1, VELMDRAW_VERT_PERCENT, 1.0), -1);
}

TEST_F(VertScale, ChangingKindsRedrawsLikeAFreshView)
{
    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 3, VELMDRAW_VERT_PERCENT));
    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 4, VELMDRAW_SPEC_MELS));
    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 5, VELMDRAW_HORZ_SAMPLE));
    ASSERT_TRUE(canvas->draw(doc));
    const QImage changed = canvas->output();
    VELMAUDIO fresh = VELMAUDIO_Open(dir.file("sound.wav").c_str(), "AUTO");
    ASSERT_NE(fresh, nullptr);
    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(fresh, 2, 0x3));
    int width = 0, height = 0;
    VELMCANVAS_GetDimension(canvas->get(), &width, &height);
    viewtest::Canvas other(width, height);
    ASSERT_TRUE(other.draw(fresh));
    EXPECT_EQ(viewtest::count_differences(changed, other.output()), 0);
    VELMAUDIO_Close(fresh);
    VELMAUDIO_SetDrawProperty(doc, 3, VELMDRAW_VERT_SAMPLE);
    VELMAUDIO_SetDrawProperty(doc, 5, VELMDRAW_HORZ_TIME);
}

TEST(VertScaleArguments, NullDrawerAndBadLanesAnswerFailure)
{
    EXPECT_EQ(VELMDRAW_DrawVertScale(nullptr), 0);
    EXPECT_EQ(VELMDRAW_DrawVertScaleGrid(nullptr, 0, 10), 0);
    EXPECT_EQ(VELMDRAW_CalculateVertScaleStep(nullptr, 0, 0, 16), 0.0);
    EXPECT_EQ(VELMDRAW_CalculateSpecScaleStep(nullptr, 0, 0), 0.0);
    EXPECT_EQ(VELMDRAW_ConvertVertScaleKindRealYtoDisplayY(nullptr, 0, 0, 0.0), -1);
    EXPECT_EQ(VELMDRAW_ConvertSpecScaleKindRealYtoDisplayY(nullptr, 0, 0, 0.0), -1);
}

} // namespace

TEST_F(HorzScale, PositionsStepAlongTheScale)
{
    open(44100, 20.0);
    EXPECT_EQ(VELMAUDIO_GetNextPosition(doc, 100), 0); // nothing drawn yet
    draw(VELMDRAW_HORZ_TIME, 0, 17 * 44100);
    ASSERT_EQ(VELMDRAW_GetHorzScaleStep(doc->renderer), 44100);
    // Fine steps are a tenth of the scale step; tick steps two of them.
    EXPECT_EQ(VELMAUDIO_GetNextPosition(doc, 100), 4410);
    EXPECT_EQ(VELMAUDIO_GetNextPosition(doc, 4410), 8820);
    EXPECT_EQ(VELMAUDIO_GetPrevPosition(doc, 4410), 0);
    EXPECT_EQ(VELMAUDIO_GetPrevPosition(doc, 5000), 4410);
    EXPECT_EQ(VELMAUDIO_GetNextTickPosition(doc, 1), 88200);
    EXPECT_EQ(VELMAUDIO_GetPrevTickPosition(doc, 88200), 0);
    // Keeping the cursor in sight leaves one scale step beside it.
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 0, 10 * 44100));
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, 12 * 44100));
    ASSERT_TRUE(VELMAUDIO_ScrollToKeepCursorVisible(doc));
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 13 * 44100);
}
