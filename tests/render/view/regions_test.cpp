// Regions and custom tracks in the audio view: reviewed pictures, the
// pixels of narrow and selected regions, the region rectangle, the redraw
// of a moved region and the layers drawn while a region is held.
#include <gtest/gtest.h>

#include <QColor>
#include <cmath>
#include <functional>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "edit/velmcustomtrack.h"
#include "edit/velmedit.h"
#include "edit/velmregion.h"
#include "edit/velmselection.h"
#include "render/view/drawer_internal.hpp"
#include "render/view/velmoverlays.h"
#include "testaudio.hpp"
#include "view_support.hpp"

namespace {

constexpr int kRate = 16000;
constexpr int kWidth = 640, kHeight = 240;
// Waveform lanes, vertical scales (the tracks' labels stand there), no
// horizontal scale strip.
constexpr uint32_t kView = 0x1 | 0x4;
// The same without grid lines, for exact background pixels.
constexpr uint32_t kPlainView = kView | 0x200 | 0x400;

// Track colours (0x00BBGGRR).
constexpr int kOrange = 0x3090F0;
constexpr int kBlue = 0xE08030;

class RegionView : public ::testing::Test {
protected:
    void SetUp() override
    {
        doc = viewtest::open_audio(dir.file("speech.wav"), viewtest::speech_like(kRate, 1, seconds()), kRate, 1);
        ASSERT_NE(doc, nullptr);
        words = VELMAUDIO_AddCustomTrack(doc, "words");
        ASSERT_GT(words, 0);
        ASSERT_TRUE(VELMAUDIO_ShowCustomTrack(doc, "default"));
        ASSERT_TRUE(VELMAUDIO_ShowCustomTrack(doc, "words"));
        track_setting("default", "color", kOrange);
        track_setting("words", "color", kBlue);
        track_setting("default", "alpha", 0xC0);
        track_setting("words", "alpha", 0xC0);
    }
    void TearDown() override
    {
        if (doc) VELMAUDIO_Close(doc);
    }
    virtual double seconds() const { return 2.0; }

    void track_setting(const char *track, const char *key, int value)
    {
        ASSERT_TRUE(VELMAUDIO_ChangeSetting(doc, "libvelm.customtrack.%s.%s=%d", track, key, value));
    }
    void track_options(const char *track, const char *options)
    {
        ASSERT_TRUE(VELMAUDIO_ChangeSetting(doc, "libvelm.customtrack.%s.options=%s", track, options));
    }
    AUDIOREGION *add(const char *track, int64_t begin, int64_t end, const char *label = nullptr,
                     const char *comment = nullptr)
    {
        AUDIOREGION *r = VELMAUDIO_CreateRegionEx(doc, track, begin, end, label, comment, 0);
        EXPECT_NE(r, nullptr);
        return r;
    }
    QImage draw(viewtest::Canvas &canvas, uint32_t flags, _VELMRECT *changed = nullptr)
    {
        EXPECT_TRUE(VELMAUDIO_SetDrawProperty(doc, 2, static_cast<int32_t>(flags)));
        EXPECT_TRUE(canvas.draw(doc, changed));
        return canvas.output();
    }
    void expect_golden(uint32_t flags, const char *name)
    {
        viewtest::Canvas canvas(kWidth, kHeight);
        EXPECT_EQ(viewtest::compare_golden(draw(canvas, flags), name), "");
    }
    // The first sample of a display column after a draw.
    int64_t sample_at(int column) const
    {
        return static_cast<int64_t>(std::ceil(VELMDRAW_ConvertDisplayXtoRealX(doc->renderer, column)));
    }
    // A region over exactly `width` columns from `column` on.
    AUDIOREGION *add_columns(const char *track, int column, int width)
    {
        return add(track, sample_at(column), sample_at(column + width - 1) + 1);
    }
    _VELMRECT rect_of(const AUDIOREGION *region)
    {
        _VELMRECT r{};
        EXPECT_TRUE(VELMAUDIO_GetRegionDrawRect(doc, region, &r));
        return r;
    }
    const _VELMRECT &track_area(int track) const { return doc->renderer->trackAreas[static_cast<size_t>(track)]; }

    velmtest::TempDir dir;
    VELMAUDIO doc = nullptr;
    int words = -1;
};

TEST_F(RegionView, TwoTracksWithNestedRegionsLabelsAndComments)
{
    track_options("default", "SHOWRGNLABEL");
    track_options("words", "SHOWRGNCOMMENT|ALIGNCOMMENTLEFT");
    track_setting("words", "numlines", 2);
    ASSERT_TRUE(VELMAUDIO_SetCustomTrackLabel(doc, "words", "Words"));
    add("default", 2000, 9000, "intro");
    add("default", 12000, 26000, "middle");
    AUDIOREGION *sentence = add("words", 3000, 20000, nullptr, "a whole sentence");
    AUDIOREGION *word = add("words", 14000, 19000, nullptr, "word");
    ASSERT_TRUE(AUDIOREGION_SetParent(word, sentence));
    add("words", 24000, 30000, nullptr, "alone");
    expect_golden(kView, "regions_two_tracks");
}

TEST_F(RegionView, SquareAndRoundSelectedRegionsAndCutText)
{
    track_options("default", "SHOWRGNLABEL|ALLOWPARTIALTEXT");
    track_options("words", "SHOWRGNLABEL|RGNSQUARECORNER");
    const char *long_label = "A label far too long for this little region";
    for (const char *track : {"default", "words"}) {
        add(track, 1000, 7000, "plain");
        add(track, 9000, 13000, long_label);
        ASSERT_TRUE(VELMAUDIO_SelectRegion(doc, add(track, 16000, 24000, "picked")));
    }
    expect_golden(kView, "regions_styles");
}

TEST_F(RegionView, DefaultTrackRegionsOverTheLanes)
{
    add("default", 4000, 10000, "one");
    add("default", 18000, 22000, "two");
    add("words", 12000, 14000, "not over the lanes");
    expect_golden(kView | 0x2000000, "regions_over_lanes");
}

TEST_F(RegionView, TrackBackgroundsShadeTheOuterEdgesOfTheBlock)
{
    ASSERT_GT(VELMAUDIO_AddCustomTrack(doc, "notes"), words);
    ASSERT_TRUE(VELMAUDIO_ShowCustomTrack(doc, "notes"));
    viewtest::Canvas canvas(kWidth, kHeight + 60);
    const QImage image = draw(canvas, kPlainView);
    const int notes = VELMAUDIO_FindCustomTrackId(doc, "notes");
    auto green = [&](int track, int row) {
        const _VELMRECT &a = track_area(track);
        return QColor(image.pixel(a.left + 20, row)).green();
    };
    auto top = [&](int t) { return green(t, track_area(t).top); };
    auto middle = [&](int t) { return green(t, track_area(t).top + track_area(t).height / 2); };
    auto bottom = [&](int t) { return green(t, track_area(t).bottom); };
    const int first = VELMAUDIO_FindCustomTrackId(doc, "default");
    // First track: dark at its top only; last: dark at its bottom only.
    EXPECT_LT(top(first) + 16, middle(first));
    EXPECT_NEAR(bottom(first), middle(first), 2);
    EXPECT_LT(bottom(notes) + 16, middle(notes));
    EXPECT_NEAR(top(notes), middle(notes), 2);
    // A track between them is one solid colour.
    EXPECT_EQ(top(words), middle(words));
    EXPECT_EQ(bottom(words), middle(words));
}

TEST_F(RegionView, DrawRectIsWhereTheRegionsPixelsAre)
{
    viewtest::Canvas canvas(kWidth, kHeight);
    _VELMRECT r{};
    EXPECT_FALSE(VELMAUDIO_GetRegionDrawRect(doc, nullptr, &r));
    const QImage empty = draw(canvas, kPlainView);
    AUDIOREGION *region = add_columns("words", 200, 10);
    const QImage image = draw(canvas, kPlainView);

    r = rect_of(region);
    EXPECT_EQ(r.left, doc->renderer->display.left + 200);
    EXPECT_EQ(r.width, 10);
    EXPECT_EQ(r.top, track_area(words).top);
    EXPECT_EQ(r.height, track_area(words).height);
    // Every pixel of its middle row changed, and nothing outside it.
    const int row = r.top + r.height / 2;
    for (int x = r.left; x <= r.right; ++x) EXPECT_NE(image.pixel(x, row), empty.pixel(x, row)) << x;
    long outside_changes = 0;
    for (int y = 0; y < image.height(); ++y)
        for (int x = 0; x < image.width(); ++x) {
            const bool inside = x >= r.left && x <= r.right && y >= r.top && y <= r.bottom;
            if (!inside && image.pixel(x, y) != empty.pixel(x, y)) ++outside_changes;
        }
    EXPECT_EQ(outside_changes, 0);
    // A copy of the region finds it too.
    const AUDIOREGION copy = *region;
    _VELMRECT from_copy{};
    ASSERT_TRUE(VELMAUDIO_GetRegionDrawRect(doc, &copy, &from_copy));
    EXPECT_EQ(from_copy.left, r.left);

    // Out of the view, it has no rectangle.
    AUDIOREGION *later = add("words", 24000, 26000);
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 0, 16000));
    draw(canvas, kPlainView);
    EXPECT_FALSE(VELMAUDIO_GetRegionDrawRect(doc, later, &r));
    EXPECT_TRUE(VELMAUDIO_GetRegionDrawRect(doc, region, &r));
}

TEST_F(RegionView, NarrowRegionsAreABarOrOnlyAShadow)
{
    viewtest::Canvas canvas(kWidth, kHeight);
    const QImage empty = draw(canvas, kPlainView);
    AUDIOREGION *bar = add_columns("words", 100, 4);
    AUDIOREGION *wide = add_columns("words", 150, 40);
    AUDIOREGION *thin_selected = add_columns("words", 250, 6);
    AUDIOREGION *wide_selected = add_columns("words", 300, 40);
    ASSERT_TRUE(VELMAUDIO_SelectRegion(doc, thin_selected));
    ASSERT_TRUE(VELMAUDIO_SelectRegion(doc, wide_selected));
    const QImage image = draw(canvas, kPlainView);

    // The 4-pixel region is a plain bar: square corners, no lighter inside,
    // darker than the inside of a wide region.
    const _VELMRECT b = rect_of(bar);
    ASSERT_EQ(b.width, 4);
    const _VELMRECT w = rect_of(wide);
    const int middle = b.top + b.height / 2;
    const QColor inside(image.pixel(w.left + w.width / 2, middle));
    for (int y = b.top; y <= b.bottom; ++y)
        for (int x = b.left; x <= b.right; ++x) {
            EXPECT_NEAR(QColor(image.pixel(x, y)).lightness(), QColor(image.pixel(b.left, y)).lightness(), 2) << x << "," << y;
            EXPECT_NE(image.pixel(x, y), empty.pixel(x, y)) << x << "," << y;
        }
    EXPECT_LT(QColor(image.pixel(b.left, middle)).lightness() + 8, inside.lightness());

    // A wide selected region is filled in the track colour itself; a 6-pixel
    // one is not filled at all, only shadowed.
    const QColor track(kBlue & 0xFF, (kBlue >> 8) & 0xFF, (kBlue >> 16) & 0xFF);
    const _VELMRECT s = rect_of(wide_selected);
    EXPECT_EQ(QColor(image.pixel(s.left + s.width / 2, s.top + s.height / 2)), track);
    const _VELMRECT t = rect_of(thin_selected);
    ASSERT_EQ(t.width, 6);
    int changed = 0;
    for (int y = t.top; y <= t.bottom; ++y)
        for (int x = t.left; x <= t.right; ++x) {
            EXPECT_NE(QColor(image.pixel(x, y)), track) << x << "," << y;
            if (image.pixel(x, y) != empty.pixel(x, y)) ++changed;
        }
    EXPECT_GT(changed, t.height);
}

// Moving or resizing a region redraws only the tracks' band over its
// columns, unless it shows over the lanes; either way the result is the
// picture a full redraw gives.
class ChangedRegion : public RegionView {
protected:
    void SetUp() override
    {
        RegionView::SetUp();
        track_options("words", "SHOWRGNLABEL");
        moving = add("words", 8000, 12000, "moving");
        still = add("words", 20000, 24000, "still");
        below = add("default", 9000, 15000, "below");
        ASSERT_TRUE(VELMAUDIO_SetFocusOnRegion(doc, moving));
        // The cursor is an overlay that every frame draws again over the lanes.
        ASSERT_TRUE(VELMAUDIO_HideMainCursor(doc));
    }
    // The output pixels the frame after the change touched.
    _VELMRECT redraw_after(uint32_t flags, const std::function<void()> &change)
    {
        viewtest::Canvas canvas(kWidth, kHeight), fresh(kWidth, kHeight);
        draw(canvas, flags);
        const QImage before = draw(canvas, flags);
        change();
        _VELMRECT dirty{};
        const QImage after = draw(canvas, flags, &dirty);
        EXPECT_GT(viewtest::count_differences(before, after), 0);
        VELMSTATE_NotifyChanges(doc, 0); // a fresh canvas is drawn only with a change pending
        EXPECT_EQ(viewtest::count_differences(after, draw(fresh, flags)), 0);
        return dirty;
    }
    // No full redraw: the lanes' top row and the frame above stay untouched.
    void expect_partial(const _VELMRECT &dirty)
    {
        EXPECT_GT(dirty.height, 0);
        EXPECT_GE(dirty.top, doc->renderer->lanesArea.top - 1);
    }

    AUDIOREGION *moving = nullptr, *still = nullptr, *below = nullptr;
};

TEST_F(ChangedRegion, OffsetFocusedRegion)
{
    const int64_t end = AUDIOREGION_EndSample(moving);
    expect_partial(redraw_after(kView, [&] { ASSERT_TRUE(VELMAUDIO_OffsetRegions(doc, 2500)); }));
    EXPECT_EQ(AUDIOREGION_EndSample(moving), end + 2500);
}

TEST_F(ChangedRegion, LongerFocusedRegion)
{
    expect_partial(redraw_after(kView, [&] { ASSERT_TRUE(VELMAUDIO_ChangeRegionEnd(doc, moving, 1.0, 0)); }));
}

TEST_F(ChangedRegion, EdgeOfAnotherRegion)
{
    expect_partial(redraw_after(kView, [&] { ASSERT_TRUE(VELMAUDIO_ChangeRegionBegin(doc, still, 1.0, 0)); }));
    EXPECT_EQ(AUDIOREGION_BeginSample(still), kRate);
}

// The selections lie over the tracks too; the redrawn columns keep them.
TEST_F(ChangedRegion, SelectionOverTheTracksStays)
{
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 6000, 16000));
    expect_partial(redraw_after(kView, [&] { ASSERT_TRUE(VELMAUDIO_OffsetRegions(doc, 2500)); }));
}

// A held region's tint over the lanes follows it as it is dragged.
TEST_F(ChangedRegion, TintOfTheHeldRegionFollowsIt)
{
    viewtest::Canvas first(kWidth, kHeight);
    draw(first, kView); // the renderer, and with it the controller, exist from the first draw
    VELMSTATE_NotifyChanges(doc, 0);
    velm::control::Interaction &control = doc->renderer->control;
    control.buttonReleased = 0;
    control.dragState = velm::control::kMovingRegions;
    // While a region is held the frame restores the whole output to draw its tint.
    redraw_after(kView, [&] { ASSERT_TRUE(VELMAUDIO_ChangeRegionEnd(doc, moving, 1.0, 0)); });
    control = velm::control::Interaction{};
}

// A transparent view still paints the tracks' backgrounds: a moved region
// leaves nothing behind.
TEST_F(ChangedRegion, MovedRegionInATransparentView)
{
    expect_partial(redraw_after(kView | 0x1000000, [&] { ASSERT_TRUE(VELMAUDIO_ChangeRegionEnd(doc, moving, 0.5, 0)); }));
}

// A change of the samples that asked for no redraw of its own, then a region
// change: the frame must not take the regions-only path.
TEST_F(ChangedRegion, SamplesChangedJustBeforeAreRedrawnToo)
{
    const _VELMRECT dirty = redraw_after(kView, [&] {
        ASSERT_TRUE(VELMAUDIO_SetSampleRate(doc, 2 * kRate, nullptr));
        ASSERT_TRUE(VELMAUDIO_ChangeRegionEnd(doc, still, 2.0, 0));
    });
    EXPECT_EQ(dirty.top, 0);
    EXPECT_EQ(dirty.height, kHeight);
}

TEST_F(ChangedRegion, RegionOverTheLanesRedrawsEverything)
{
    const _VELMRECT dirty =
        redraw_after(kView | 0x2000000, [&] { ASSERT_TRUE(VELMAUDIO_ChangeRegionEnd(doc, below, 1.5, 0)); });
    EXPECT_EQ(dirty.top, 0);
    EXPECT_EQ(dirty.height, kHeight);
}

TEST_F(RegionView, ScrollingRegionsEqualsAFullRedraw)
{
    track_options("words", "SHOWRGNLABEL");
    add("default", 3000, 9000, "left");
    add("words", 7000, 15000, "crossing");
    add("default", 14000, 20000, "right");
    const uint32_t flags = kView | 0x2000000;
    // The renderer measures text on the canvas it drew last: the canvases
    // live as long as the document is drawn.
    viewtest::Canvas left(kWidth, kHeight), right(kWidth, kHeight), direct(kWidth, kHeight);
    for (int64_t start : {3100, 1900}) {
        viewtest::Canvas &scrolled = start > 2500 ? left : right;
        ASSERT_TRUE(VELMAUDIO_Zoom(doc, 2500, 14500));
        draw(scrolled, flags);
        ASSERT_TRUE(VELMAUDIO_Zoom(doc, start, start + 12000));
        const QImage image = draw(scrolled, flags);
        VELMSTATE_NotifyChanges(doc, 0);
        EXPECT_EQ(viewtest::count_differences(image, draw(direct, flags)), 0) << start;
    }
}

// A long recording zoomed in to a few samples: its one region reaches
// millions of columns beyond both sides of the display.
class LongRegionView : public RegionView {
protected:
    double seconds() const override { return 20.0; }
};

TEST_F(LongRegionView, TextOfARegionFarWiderThanTheViewScrollsWithIt)
{
    track_options("words", "SHOWRGNLABEL");
    add("words", 0, 20 * kRate, "whole recording");
    const int64_t middle = 10 * kRate;
    viewtest::Canvas scrolled(kWidth, kHeight), direct(kWidth, kHeight);
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, middle - 2, middle + 2));
    const QImage centred = draw(scrolled, kView);
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, middle - 1, middle + 3));
    const QImage image = draw(scrolled, kView);
    VELMSTATE_NotifyChanges(doc, 0);
    const QImage full = draw(direct, kView);
    // The label moved with the region, and the scrolled picture of the
    // track is the one a full redraw gives.
    const _VELMRECT &a = track_area(words);
    long moved = 0, differences = 0;
    for (int y = a.top; y <= a.bottom; ++y)
        for (int x = a.left; x <= a.right; ++x) {
            if (centred.pixel(x, y) != image.pixel(x, y)) ++moved;
            if (image.pixel(x, y) != full.pixel(x, y)) ++differences;
        }
    EXPECT_GT(moved, 0);
    EXPECT_EQ(differences, 0);
}

TEST_F(RegionView, HeldRegionTintsItsColumnsOverTheLanes)
{
    AUDIOREGION *held = add("words", 8000, 16000);
    viewtest::Canvas canvas(kWidth, kHeight);
    ASSERT_TRUE(VELMAUDIO_SetFocusOnRegion(doc, held));
    const QImage resting = draw(canvas, kView);
    velm::control::Interaction &control = doc->renderer->control;
    control.buttonReleased = 0;
    control.dragState = velm::control::kMovingRegions;
    ASSERT_TRUE(VELMAUDIO_EventOverFocusedRegion(doc));
    const QImage grabbed = draw(canvas, kView);
    control = velm::control::Interaction{};

    const _VELMRECT r = rect_of(held);
    _VELMRECT lane{};
    ASSERT_TRUE(VELMDRAW_GetDrawAreaRect(doc->renderer, 0, &lane));
    const int row = lane.top + lane.height / 4;
    for (int x = r.left - 1; x <= r.right + 1; ++x) EXPECT_NE(grabbed.pixel(x, row), resting.pixel(x, row)) << x;
    for (int x : {r.left - 3, r.right + 3}) EXPECT_EQ(grabbed.pixel(x, row), resting.pixel(x, row)) << x;
    // The tracks are unchanged: the tint is over the lanes only.
    const int track_row = track_area(words).top + 2;
    for (int x = r.left; x <= r.right; ++x) EXPECT_EQ(grabbed.pixel(x, track_row), resting.pixel(x, track_row));

    // Released, the next frame takes the tint away again.
    ASSERT_TRUE(VELMAUDIO_EventOverFocusedRegion(doc));
    EXPECT_EQ(viewtest::count_differences(draw(canvas, kView), resting), 0);
}

// Track heights are measured on the canvas of the last frame; once the host
// destroys that canvas, they are not measured at all instead of on freed memory.
TEST_F(RegionView, TrackHeightsAreNotMeasuredOnADestroyedCanvas)
{
    {
        viewtest::Canvas canvas(kWidth, kHeight);
        draw(canvas, kView);
        EXPECT_GT(VELMDRAW_CustomTrackHeight(doc->renderer, words), 0);
    }
    EXPECT_EQ(VELMDRAW_CustomTrackHeight(doc->renderer, words), 0);
    EXPECT_TRUE(VELMAUDIO_SetDrawProperty(doc, 1, kHeight + 40));
    viewtest::Canvas again(kWidth, kHeight + 40);
    draw(again, kView);
    EXPECT_GT(VELMDRAW_CustomTrackHeight(doc->renderer, words), 0);
}

TEST_F(RegionView, TrackFontFollowsTheTrackSettings)
{
    VELMCONFIGFONT font{};
    EXPECT_EQ(VELMAUDIO_GetCustomTrackFont(doc, words, &font), nullptr); // nothing drawn yet
    ASSERT_TRUE(VELMAUDIO_ChangeSetting(doc, "libvelm.customtrack.words.fontsize=%d", 20));
    track_setting("words", "fontcolor", 0x123456);
    viewtest::Canvas canvas(kWidth, kHeight);
    draw(canvas, kView);
    ASSERT_EQ(VELMAUDIO_GetCustomTrackFont(doc, words, &font), &font);
    EXPECT_FLOAT_EQ(font.size, 15.0f);
    EXPECT_EQ(font.color, 0x123456u);
    EXPECT_STREQ(font.familyName, doc->renderer->config.regionTextFont.familyName);
    EXPECT_EQ(VELMAUDIO_GetCustomTrackFont(doc, 8, &font), nullptr);
    EXPECT_EQ(VELMAUDIO_GetCustomTrackFont(doc, words, nullptr), nullptr);
    EXPECT_EQ(VELMAUDIO_GetCustomTrackFont(nullptr, words, &font), nullptr);
    // The larger font makes its track taller than the default one.
    EXPECT_GT(track_area(words).height, track_area(0).height);
}

TEST_F(RegionView, HiddenDefaultTrackShowsItsRegionsOverTheLanesOnly)
{
    AUDIOREGION *r = add("default", 6000, 12000);
    ASSERT_TRUE(VELMAUDIO_HideCustomTrack(doc, "default"));
    viewtest::Canvas canvas(kWidth, kHeight);
    const QImage plain = draw(canvas, kPlainView);
    _VELMRECT rect{};
    EXPECT_FALSE(VELMAUDIO_GetRegionDrawRect(doc, r, &rect));
    const QImage over = draw(canvas, kPlainView | 0x2000000);
    ASSERT_TRUE(VELMAUDIO_GetRegionDrawRect(doc, r, &rect));
    EXPECT_EQ(rect.top, doc->renderer->lanesArea.top);
    EXPECT_EQ(rect.height, doc->renderer->lanesArea.height);
    const int row = rect.top + 5;
    for (int x = rect.left + 6; x <= rect.right - 6; ++x) EXPECT_NE(over.pixel(x, row), plain.pixel(x, row)) << x;
    for (int x : {rect.left - 2, rect.right + 2}) EXPECT_EQ(over.pixel(x, row), plain.pixel(x, row)) << x;
}

TEST_F(RegionView, TextMarkedHiddenIsLeftOut)
{
    track_options("words", "SHOWRGNLABEL");
    AUDIOREGION *r = add("words", 4000, 12000, "spoken");
    viewtest::Canvas canvas(kWidth, kHeight);
    const QImage shown = draw(canvas, kPlainView);
    ASSERT_TRUE(VELMAUDIO_SetRegionTextHide(doc, r, 1));
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_EVERYTHING);
    const QImage hidden = draw(canvas, kPlainView);
    const _VELMRECT a = rect_of(r);
    const int row = a.top + a.height / 2;
    int text_pixels = 0;
    for (int x = a.left + 8; x <= a.right - 8; ++x) {
        EXPECT_EQ(hidden.pixel(x, row), hidden.pixel(a.left + 8, row)) << x;
        if (shown.pixel(x, row) != hidden.pixel(x, row)) ++text_pixels;
    }
    EXPECT_GT(text_pixels, 0);
}

TEST(RegionCalls, RefuseMissingArguments)
{
    _VELMRECT rect{};
    VELMCONFIGFONT font{};
    const VELMREGIONCOPY copy{};
    EXPECT_EQ(VELMDRAW_UpdateVisibleRegion(nullptr), 0);
    EXPECT_EQ(VELMDRAW_DrawCustomCanvas(nullptr, 0, 10), 0);
    EXPECT_EQ(VELMDRAW_DrawVertCustomTracks(nullptr), 0);
    EXPECT_EQ(VELMDRAW_DrawRegionsAndCues(nullptr, 0, 10), 0);
    EXPECT_EQ(VELMDRAW_DrawCustomTrackRegions(nullptr, 0, 10), 0);
    EXPECT_EQ(VELMDRAW_DrawRegionOnFocus(nullptr, 0, 10), 0);
    EXPECT_EQ(VELMDRAW_UpdateChangedRegion(nullptr, &copy), 0);
    EXPECT_EQ(VELMDRAW_DrawCustomTrackRegionShadows(nullptr), 0);
    EXPECT_EQ(VELMDRAW_GetVisibleRegionRect(nullptr, nullptr, &rect), 0);
    EXPECT_EQ(VELMDRAW_GetCustomTrackFont(nullptr, 0, &font), nullptr);
    EXPECT_EQ(VELMAUDIO_GetRegionDrawRect(nullptr, nullptr, &rect), 0);
}

} // namespace
