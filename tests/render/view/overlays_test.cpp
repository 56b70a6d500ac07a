// What the view draws over the finished picture: cursors, selections and the
// selection being made, the navigator's window, zoom-limit bars and the
// quick box; drawn from real documents and checked on real pixels.
#include <gtest/gtest.h>

#include <QImage>
#include <string>
#include <utility>
#include <vector>

#include "core/document_internal.hpp"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "core/velmtimeconv.h"
#include "edit/velmcustomtrack.h"
#include "edit/velmregion.h"
#include "edit/velmselection.h"
#include "render/view/drawer_internal.hpp"
#include "render/view/velmoverlays.h"
#include "testaudio.hpp"
#include "view_support.hpp"

namespace {

constexpr int kRate = 8000;
constexpr int kStep = 20;                       // samples per column once zoomed
constexpr uint32_t kWave = 0x1 | 0x8;           // waveform lanes, no vertical scales
constexpr int kWidth = 640, kHeight = 240;

class Overlays : public ::testing::Test {
protected:
    VELMAUDIO open(uint32_t flags, int channels = 1)
    {
        VELMAUDIO doc = viewtest::open_audio(dir.file("speech" + std::to_string(docs.size()) + ".wav"),
                                             viewtest::speech_like(kRate, channels, 4.0), kRate, channels);
        EXPECT_NE(doc, nullptr);
        if (!doc) return nullptr;
        docs.push_back(doc);
        VELMAUDIO_SetDrawProperty(doc, 2, static_cast<int32_t>(flags));
        return doc;
    }

    // Draws once to lay out, then zooms so that column c shows samples
    // c * kStep onwards.
    void zoom_to_grid(viewtest::Canvas &canvas, VELMAUDIO doc, int64_t first_column = 0)
    {
        ASSERT_TRUE(canvas.draw(doc));
        ASSERT_TRUE(VELMAUDIO_GetDrawAreaRect(doc, VELMDRAW_AREA_DISPLAY, &display));
        const int64_t begin = first_column * kStep;
        ASSERT_TRUE(VELMAUDIO_Zoom(doc, begin, begin + int64_t{display.width - 1} * kStep));
        ASSERT_TRUE(canvas.draw(doc));
    }

    int64_t sample_at(int column) const { return int64_t{column} * kStep; }
    int x_of(int column) const { return display.left + column; }

    static void set_play_cursor(VELMAUDIO doc, int64_t position)
    {
        doc->state->playCursor.position = position;
        doc->state->playCursor.shown = 1;
        VELMSTATE_NotifyChanges(doc, 0);
    }

    void TearDown() override
    {
        for (VELMAUDIO doc : docs) VELMAUDIO_Close(doc);
    }

    velmtest::TempDir dir;
    std::vector<VELMAUDIO> docs;
    _VELMRECT display{};
};

// Columns where two images differ, in the rows of the given rectangle.
std::vector<int> differing_columns(const QImage &a, const QImage &b)
{
    std::vector<int> columns;
    for (int x = 0; x < a.width(); ++x)
        for (int y = 0; y < a.height(); ++y)
            if (a.pixel(x, y) != b.pixel(x, y)) {
                columns.push_back(x);
                break;
            }
    return columns;
}

int brightness(QRgb p)
{
    return qRed(p) + qGreen(p) + qBlue(p);
}

// A settings value changed for one test and put back afterwards.
class SettingOverride {
public:
    SettingOverride(const char *key, int value) : key_(key)
    {
        BLSETTINGS_ChangeEx(nullptr, "%s=%d", key, value);
    }
    ~SettingOverride() { BLSETTINGS_DeleteEx(nullptr, "%s", key_); }
    SettingOverride(const SettingOverride &) = delete;
    SettingOverride &operator=(const SettingOverride &) = delete;

private:
    const char *key_;
};

TEST_F(Overlays, EditAndPlayCursorsWithShadowsAndSliders)
{
    VELMAUDIO doc = open(kWave);
    viewtest::Canvas canvas(kWidth, kHeight);
    zoom_to_grid(canvas, doc);
    const QImage bare = canvas.output();
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, sample_at(150)));
    set_play_cursor(doc, sample_at(400));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage image = canvas.output();
    EXPECT_EQ(viewtest::compare_golden(image, "overlay_cursors"), "");

    // The play cursor's handle is red; the edit cursor's line is white.
    _VELMRECT horz{};
    ASSERT_TRUE(VELMAUDIO_GetDrawAreaRect(doc, VELMDRAW_AREA_HORZSCALE, &horz));
    const QRgb handle = image.pixel(x_of(400), horz.top - 1);
    EXPECT_GT(qRed(handle), qGreen(handle) + 60);
    EXPECT_GT(brightness(image.pixel(x_of(150), display.top + 5)), brightness(bare.pixel(x_of(150), display.top + 5)));
    // The edit cursor's shadow darkens the columns beside it; the play
    // cursor has none by default.
    EXPECT_LT(brightness(image.pixel(x_of(147), display.top + 5)), brightness(bare.pixel(x_of(147), display.top + 5)));
    EXPECT_EQ(image.pixel(x_of(397), display.top + 5), bare.pixel(x_of(397), display.top + 5));
}

TEST_F(Overlays, CursorsWithoutShadowOrSlider)
{
    SettingOverride shadow("libvelm.draw.maincursor.drawshadow", 0);
    SettingOverride slider("libvelm.draw.maincursor.drawslider", 0);
    SettingOverride play_slider("libvelm.draw.playcursor.drawslider", 0);
    VELMAUDIO doc = open(kWave);
    viewtest::Canvas canvas(kWidth, kHeight);
    zoom_to_grid(canvas, doc);
    ASSERT_TRUE(VELMAUDIO_UpdateConfig(doc));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage bare = canvas.output();
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, sample_at(150)));
    set_play_cursor(doc, sample_at(400));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage image = canvas.output();
    EXPECT_EQ(viewtest::compare_golden(image, "overlay_cursors_plain"), "");
    // Only the cursor columns changed: the edit cursor left column 0.
    EXPECT_EQ(differing_columns(bare, image), (std::vector<int>{x_of(0), x_of(150), x_of(400)}));
}

TEST_F(Overlays, MovingTheCursorRepaintsOnlyItsOldAndNewColumns)
{
    VELMAUDIO doc = open(kWave | 0x80000);
    viewtest::Canvas canvas(kWidth, kHeight);
    zoom_to_grid(canvas, doc);
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, sample_at(100)));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage before = canvas.output();
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, sample_at(300)));
    _VELMRECT changed{};
    ASSERT_TRUE(canvas.draw(doc, &changed));
    const QImage after = canvas.output();
    // Shadow (10 columns each side) and handle (11 wide) included.
    const std::vector<int> columns = differing_columns(before, after);
    ASSERT_FALSE(columns.empty());
    for (int x : columns) {
        const bool near_old = x >= x_of(100) - 10 && x <= x_of(100) + 10;
        const bool near_new = x >= x_of(300) - 10 && x <= x_of(300) + 10;
        EXPECT_TRUE(near_old || near_new) << "column " << x;
    }
    EXPECT_NE(before.pixel(x_of(100), display.top + 5), after.pixel(x_of(100), display.top + 5));
    EXPECT_NE(before.pixel(x_of(300), display.top + 5), after.pixel(x_of(300), display.top + 5));
    // The reported rectangle spans both cursors and no more.
    EXPECT_EQ(changed.left, x_of(100) - 10);
    EXPECT_EQ(changed.right, x_of(300) + 10);
}

TEST_F(Overlays, CursorPastTheViewEndDrawsAndSavesNothing)
{
    VELMAUDIO doc = open(kWave);
    viewtest::Canvas canvas(kWidth, kHeight);
    zoom_to_grid(canvas, doc);
    const int64_t end = VELMAUDIO_ViewEnd(doc);
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, end));
    ASSERT_TRUE(canvas.draw(doc));
    _VELMRECT saved{};
    EXPECT_TRUE(VELMCANVAS_GetOverlayRect(canvas.get(), &saved));
    const QImage at_end = canvas.output();

    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, end + 1));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_FALSE(VELMCANVAS_GetOverlayRect(canvas.get(), &saved));
    const QImage past = canvas.output();
    ASSERT_TRUE(VELMAUDIO_HideMainCursor(doc));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_EQ(viewtest::count_differences(past, canvas.output()), 0);
    EXPECT_GT(viewtest::count_differences(at_end, past), 0);
}

TEST_F(Overlays, OneSelection)
{
    VELMAUDIO doc = open(kWave);
    viewtest::Canvas canvas(kWidth, kHeight);
    zoom_to_grid(canvas, doc);
    const QImage bare = canvas.output();
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, sample_at(200), sample_at(320)));
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, sample_at(200)));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage image = canvas.output();
    EXPECT_EQ(viewtest::compare_golden(image, "overlay_selection"), "");
    // Brighter inside, soft dark edges outside both ends, untouched further out.
    const int y = display.top + 3;
    EXPECT_GT(brightness(image.pixel(x_of(260), y)), brightness(bare.pixel(x_of(260), y)));
    EXPECT_LT(brightness(image.pixel(x_of(199), y)), brightness(bare.pixel(x_of(199), y)));
    EXPECT_LT(brightness(image.pixel(x_of(321), y)), brightness(bare.pixel(x_of(321), y)));
    EXPECT_EQ(image.pixel(x_of(180), y), bare.pixel(x_of(180), y));
    EXPECT_EQ(image.pixel(x_of(340), y), bare.pixel(x_of(340), y));

    _VELMRECT rect{};
    ASSERT_TRUE(VELMAUDIO_GetSelectionRect(&rect, doc));
    EXPECT_EQ(rect.left, x_of(200));
    EXPECT_EQ(rect.right, x_of(320));
    EXPECT_EQ(rect.top, display.top);
}

TEST_F(Overlays, AdjacentSelectionsGetASeparatorDistantOnesSoftEdges)
{
    VELMAUDIO doc = open(kWave);
    viewtest::Canvas canvas(kWidth, kHeight);
    zoom_to_grid(canvas, doc);
    const QImage bare = canvas.output();
    // One column between the first two, twenty between the second and third.
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, sample_at(100), sample_at(200)));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, sample_at(202), sample_at(300)));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, sample_at(321), sample_at(400)));
    ASSERT_EQ(VELMAUDIO_SelectionChunkCount(doc), 3);
    ASSERT_TRUE(canvas.draw(doc));
    const QImage image = canvas.output();
    EXPECT_EQ(viewtest::compare_golden(image, "overlay_selections"), "");

    const int y = display.top + 3;
    const int inside = brightness(image.pixel(x_of(150), y)) - brightness(bare.pixel(x_of(150), y));
    // The separator is two columns darker than the selection around it.
    for (int c : {200, 201})
        EXPECT_LT(brightness(image.pixel(x_of(c), y)) - brightness(bare.pixel(x_of(c), y)), inside) << c;
    // Both sides of the wide gap are darkened, soft edges of ten columns.
    EXPECT_LT(brightness(image.pixel(x_of(301), y)), brightness(bare.pixel(x_of(301), y)));
    EXPECT_LT(brightness(image.pixel(x_of(320), y)), brightness(bare.pixel(x_of(320), y)));
    EXPECT_EQ(image.pixel(x_of(310), y), bare.pixel(x_of(310), y));
}

// Drags a selection through growing, shrinking and flipping over its anchor
// and compares each frame with a fresh full draw of the same state.
TEST_F(Overlays, IncrementalSelectingEqualsAFullRedraw)
{
    VELMAUDIO dragged = open(kWave | 0x20000);
    VELMAUDIO fresh = open(kWave | 0x20000);
    viewtest::Canvas a(kWidth, kHeight), b(kWidth, kHeight);
    zoom_to_grid(a, dragged);
    ASSERT_TRUE(VELMAUDIO_SelectAudio(dragged, sample_at(40), sample_at(90)));
    ASSERT_TRUE(VELMAUDIO_AddSelection(dragged, sample_at(500), sample_at(560)));
    ASSERT_TRUE(a.draw(dragged));
    ASSERT_TRUE(VELMAUDIO_SetSelectingKind(dragged, SELECTING_ADD));
    const int anchor = 250;
    for (int end : {300, 360, 320, 200, 120, 80, 95, 270, 540}) {
        const int64_t lo = sample_at(std::min(anchor, end)), hi = sample_at(std::max(anchor, end));
        ASSERT_TRUE(VELMAUDIO_UpdateSelecting(dragged, lo, hi));
        ASSERT_TRUE(a.draw(dragged));

        VELMAUDIO_Close(fresh);
        docs.pop_back();
        fresh = open(kWave | 0x20000);
        ASSERT_TRUE(b.draw(fresh));
        ASSERT_TRUE(VELMAUDIO_Zoom(fresh, 0, int64_t{display.width - 1} * kStep));
        ASSERT_TRUE(VELMAUDIO_SelectAudio(fresh, sample_at(40), sample_at(90)));
        ASSERT_TRUE(VELMAUDIO_AddSelection(fresh, sample_at(500), sample_at(560)));
        ASSERT_TRUE(VELMAUDIO_SetSelectingKind(fresh, SELECTING_ADD));
        ASSERT_TRUE(VELMAUDIO_UpdateSelecting(fresh, lo, hi));
        ASSERT_TRUE(b.draw(fresh));
        EXPECT_EQ(viewtest::count_differences(a.output(), b.output()), 0) << "selecting to column " << end;
    }
    ASSERT_TRUE(VELMAUDIO_UpdateSelecting(dragged, sample_at(anchor), sample_at(330)));
    ASSERT_TRUE(a.draw(dragged));
    EXPECT_EQ(viewtest::compare_golden(a.output(), "overlay_selecting"), "");
}

TEST_F(Overlays, SelectionBeingMadeTakesTheColourOfItsKind)
{
    VELMAUDIO doc = open(kWave);
    viewtest::Canvas canvas(kWidth, kHeight);
    zoom_to_grid(canvas, doc);
    const QImage bare = canvas.output();
    const int x = x_of(250), y = display.top + 3;
    ASSERT_TRUE(VELMAUDIO_SetSelectingKind(doc, SELECTING_SUBTRACT));
    ASSERT_TRUE(VELMAUDIO_UpdateSelecting(doc, sample_at(200), sample_at(300)));
    ASSERT_TRUE(canvas.draw(doc));
    const QRgb red = canvas.output().pixel(x, y);
    EXPECT_GT(qRed(red) - qRed(bare.pixel(x, y)), 60);
    EXPECT_LE(qBlue(red), qBlue(bare.pixel(x, y)));

    // Same columns, another kind: the columns are painted again.
    ASSERT_TRUE(VELMAUDIO_SetSelectingKind(doc, SELECTING_ADD));
    ASSERT_TRUE(VELMAUDIO_UpdateSelecting(doc, sample_at(200), sample_at(300)));
    ASSERT_TRUE(canvas.draw(doc));
    const QRgb green = canvas.output().pixel(x, y);
    EXPECT_GT(qBlue(green), qBlue(bare.pixel(x, y)));
    EXPECT_LE(qRed(green), qRed(bare.pixel(x, y)));
}

TEST_F(Overlays, NavigatorShowsTheVisibleWindow)
{
    VELMAUDIO doc = open(kWave | 0x4000);
    viewtest::Canvas canvas(kWidth, 300);
    ASSERT_TRUE(canvas.draw(doc));
    const QImage whole = canvas.output();
    _VELMRECT navigator{}, shown{};
    ASSERT_TRUE(VELMAUDIO_GetDrawAreaRect(doc, VELMDRAW_AREA_NAVIGATOR, &navigator));
    ASSERT_TRUE(VELMAUDIO_GetDrawAreaRect(doc, VELMDRAW_AREA_DISPLAY, &shown));
    const int64_t length = VELMAUDIO_ViewEnd(doc);
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, length / 4, length / 2));
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, length / 3, length * 3 / 4));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage zoomed = canvas.output();
    EXPECT_EQ(viewtest::compare_golden(zoomed, "overlay_navigator"), "");

    // Outside the window the navigator is darkened; inside it is not.
    const int y = navigator.top + navigator.height / 2;
    const int left_part = shown.left + shown.width / 8, inside = shown.left + shown.width * 5 / 16;
    EXPECT_LT(brightness(zoomed.pixel(left_part, y)), brightness(whole.pixel(left_part, y)));
    EXPECT_EQ(zoomed.pixel(inside, y), whole.pixel(inside, y));
}

// The navigator shows the whole sound, so it shows the cursor wherever it is,
// also outside the visible window.
TEST_F(Overlays, NavigatorShowsTheCursorOutsideTheWindow)
{
    VELMAUDIO doc = open(kWave | 0x4000);
    viewtest::Canvas canvas(kWidth, 300);
    ASSERT_TRUE(canvas.draw(doc));
    const int64_t length = VELMAUDIO_ViewEnd(doc);
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, length / 4, length / 2));
    ASSERT_TRUE(VELMAUDIO_HideMainCursor(doc));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage hidden = canvas.output();
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, length * 3 / 4));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage shown = canvas.output();

    _VELMRECT navigator{};
    ASSERT_TRUE(VELMAUDIO_GetDrawAreaRect(doc, VELMDRAW_AREA_NAVIGATOR, &navigator));
    const std::vector<int> columns = differing_columns(hidden, shown);
    ASSERT_FALSE(columns.empty());
    const int x = navigator.left + navigator.width * 3 / 4;
    EXPECT_LE(columns.front(), x);
    EXPECT_GE(columns.back(), x);
    EXPECT_NE(hidden.pixel(x, navigator.top + navigator.height / 2), shown.pixel(x, navigator.top + navigator.height / 2));
}

TEST_F(Overlays, ZoomLimitBars)
{
    VELMAUDIO doc = open(kWave);
    viewtest::Canvas canvas(kWidth, kHeight);
    zoom_to_grid(canvas, doc);
    // The view is kept inside the limits: the bars stand at its two ends.
    ASSERT_TRUE(VELMAUDIO_SetZoomLimits(doc, sample_at(100), sample_at(500)));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage bare = canvas.output();
    ASSERT_TRUE(VELMAUDIO_ChangeControlVisibility(doc, 2, 1));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage image = canvas.output();
    EXPECT_EQ(viewtest::compare_golden(image, "overlay_zoomlimits"), "");
    // Nine-column bars: the begin bar from its limit rightwards, the end bar
    // up to its limit; their shadows fall inside the view.
    const int y = display.top + display.height / 2;
    for (int x : {display.left, display.left + 4, display.left + 8, display.right - 8, display.right - 4, display.right})
        EXPECT_GT(brightness(image.pixel(x, y)), brightness(bare.pixel(x, y))) << x;
    const int light = display.top + 5; // the lane's lighter top rows
    EXPECT_LT(brightness(image.pixel(display.left + 10, light)), brightness(bare.pixel(display.left + 10, light)));
    EXPECT_LT(brightness(image.pixel(display.right - 10, light)), brightness(bare.pixel(display.right - 10, light)));
    const std::vector<int> columns = differing_columns(bare, image);
    ASSERT_FALSE(columns.empty());
    EXPECT_GE(columns.front(), display.left);
    EXPECT_LE(columns.back(), display.right);
    for (int x : columns) EXPECT_TRUE(x < display.left + 15 || x > display.right - 15) << x;

    ASSERT_TRUE(VELMAUDIO_ChangeControlVisibility(doc, 2, 0));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_EQ(viewtest::count_differences(canvas.output(), bare), 0);
}

TEST_F(Overlays, QuickBoxIsOrderedAndCutToItsLane)
{
    VELMAUDIO doc = open(kWave, 2);
    viewtest::Canvas canvas(kWidth, 300);
    ASSERT_TRUE(canvas.draw(doc));
    _VELMRECT lane{};
    ASSERT_TRUE(VELMAUDIO_GetDrawAreaRect(doc, 0, &lane));
    VELMDRAW drawer = doc->renderer;

    // Dragged up and left from inside the first lane, past its top.
    const VELMQUICKBOX box{lane.left + 200, lane.top + 20, -99, -40, lane.left + 100, lane.top - 20};
    _VELMRECT out{};
    ASSERT_TRUE(VELMDRAW_AdjustQuickBox(drawer, &box, &out, 0));
    EXPECT_EQ(out.left, lane.left + 100);
    EXPECT_EQ(out.right, lane.left + 200);
    EXPECT_EQ(out.top, lane.top);
    EXPECT_EQ(out.bottom, lane.top + 20);
    ASSERT_TRUE(VELMDRAW_AdjustQuickBox(drawer, &box, &out, 1));
    EXPECT_EQ(out.left, 100);
    EXPECT_EQ(out.top, 0);

    const VELMQUICKBOX flat{lane.left + 10, lane.top + 10, 50, 0, 0, 0};
    EXPECT_FALSE(VELMDRAW_AdjustQuickBox(drawer, &flat, &out, 0));
    const VELMQUICKBOX outside{1, 1, 50, 50, 0, 0};
    EXPECT_FALSE(VELMDRAW_AdjustQuickBox(drawer, &outside, &out, 0));

    // Shown after a restore from memory: a white veil, dimmed again inside
    // the one-pixel border.
    const QImage bare = canvas.output();
    doc->state->quickBox = box;
    VELMSTATE_NotifyChanges(doc, 0);
    ASSERT_TRUE(canvas.draw(doc));
    const QImage image = canvas.output();
    const auto lift = [&](int x, int y) { return brightness(image.pixel(x, y)) - brightness(bare.pixel(x, y)); };
    EXPECT_GT(lift(lane.left + 150, lane.top + 20), lift(lane.left + 150, lane.top + 19));
    EXPECT_GT(lift(lane.left + 150, lane.top + 19), 0);
    EXPECT_EQ(image.pixel(lane.left + 150, lane.top + 40), bare.pixel(lane.left + 150, lane.top + 40));

    // A whole redraw in the middle of the drag (a new canvas) keeps the box.
    viewtest::Canvas other(kWidth, 300);
    VELMSTATE_NotifyChanges(doc, 0); // a fresh canvas is drawn only with a change pending
    ASSERT_TRUE(other.draw(doc));
    EXPECT_EQ(viewtest::count_differences(other.output(), image), 0);
}

TEST_F(Overlays, SelectionHandlesAreRecordedInDrawingOrder)
{
    VELMAUDIO doc = open(kWave);
    viewtest::Canvas canvas(kWidth, kHeight);
    zoom_to_grid(canvas, doc, 100);
    // The first begins before the view, the second follows it after one
    // column, the third runs past the view's end.
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, sample_at(60), sample_at(200)));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, sample_at(202), sample_at(300)));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, sample_at(400), sample_at(100 + display.width + 50)));
    ASSERT_TRUE(canvas.draw(doc));
    const auto &layout = doc->renderer->overlay;
    ASSERT_EQ(layout.selectionSliderCount, 3);
    const auto centre = [](const _VELMRECT &r) { return r.left + r.width / 2; };
    double previous = -1.0;
    for (int i = 0; i < 3; ++i) {
        const auto &slider = layout.selectionSliders[static_cast<size_t>(i)];
        ASSERT_NE(slider.selection, nullptr);
        EXPECT_GT(slider.selection->begin, previous);
        previous = slider.selection->begin;
        EXPECT_EQ(slider.display.left, display.left);
    }
    const auto &first = layout.selectionSliders[0], &second = layout.selectionSliders[1],
               &third = layout.selectionSliders[2];
    EXPECT_EQ(first.begin.width, 0);               // its begin is out of view
    EXPECT_EQ(centre(first.end), x_of(100));
    EXPECT_EQ(centre(second.begin), x_of(102));
    EXPECT_EQ(centre(second.end), x_of(200));
    EXPECT_EQ(centre(third.begin), x_of(300));
    EXPECT_EQ(third.end.width, 0);                 // its end is out of view
    // The handles stand on the row above the horizontal scale.
    _VELMRECT horz{};
    ASSERT_TRUE(VELMAUDIO_GetDrawAreaRect(doc, VELMDRAW_AREA_HORZSCALE, &horz));
    EXPECT_EQ(second.begin.top + second.begin.height / 2, horz.top - 1);
}

TEST_F(Overlays, ViewFlagsHideCursorsAndSelections)
{
    VELMAUDIO doc = open(kWave);
    viewtest::Canvas canvas(kWidth, kHeight);
    zoom_to_grid(canvas, doc);
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, sample_at(300)));
    ASSERT_TRUE(VELMAUDIO_HideMainCursor(doc));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage bare = canvas.output();

    ASSERT_TRUE(VELMAUDIO_ShowMainCursor(doc));
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, sample_at(100), sample_at(200)));
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, sample_at(300)));
    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 2, static_cast<int32_t>(kWave | 0x400000 | 0x800000)));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_EQ(viewtest::count_differences(bare, canvas.output()), 0);
    EXPECT_EQ(doc->renderer->overlay.selectionSliderCount, 0);

    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 2, static_cast<int32_t>(kWave)));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_GT(viewtest::count_differences(bare, canvas.output()), 0);
    EXPECT_EQ(doc->renderer->overlay.selectionSliderCount, 1);
}

TEST_F(Overlays, ScrollingKeepsSelectionsAsAFullDrawShowsThem)
{
    VELMAUDIO scrolled = open(kWave | 0x4000);
    VELMAUDIO direct = open(kWave | 0x4000);
    viewtest::Canvas a(kWidth, 300), b(kWidth, 300);
    zoom_to_grid(a, scrolled);
    for (VELMAUDIO doc : {scrolled, direct}) {
        ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, sample_at(150), sample_at(260)));
        ASSERT_TRUE(VELMAUDIO_AddSelection(doc, sample_at(400), sample_at(480)));
        ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, sample_at(420)));
    }
    ASSERT_TRUE(a.draw(scrolled));
    const int64_t length = int64_t{display.width - 1} * kStep;
    ASSERT_TRUE(VELMAUDIO_Zoom(scrolled, sample_at(37), sample_at(37) + length));
    ASSERT_TRUE(a.draw(scrolled));
    ASSERT_TRUE(b.draw(direct));
    ASSERT_TRUE(VELMAUDIO_Zoom(direct, sample_at(37), sample_at(37) + length));
    ASSERT_TRUE(b.draw(direct));
    EXPECT_EQ(viewtest::count_differences(a.output(), b.output()), 0);
}

TEST_F(Overlays, ZoomButtonShowsTheSmartZoomAction)
{
    VELMAUDIO doc = open(0x1 | 0x4000 | 0x40000);
    viewtest::Canvas canvas(kWidth, 300);
    ASSERT_TRUE(VELMAUDIO_ChangeSmartZoomAction(doc, 0));
    ASSERT_TRUE(canvas.draw(doc));
    const _VELMRECT button = doc->renderer->zoomButton;
    ASSERT_EQ(button.width, 20);
    const QImage none = canvas.output().copy(button.left, button.top, button.width, button.height);
    std::vector<QImage> faces;
    for (int action : {2, 3, 4}) {
        ASSERT_TRUE(VELMAUDIO_ChangeSmartZoomAction(doc, action));
        ASSERT_TRUE(canvas.draw(doc));
        faces.push_back(canvas.output().copy(button.left, button.top, button.width, button.height));
        EXPECT_GT(viewtest::count_differences(none, faces.back()), 0) << action;
    }
    EXPECT_GT(viewtest::count_differences(faces[0], faces[1]), 0);
    EXPECT_GT(viewtest::count_differences(faces[1], faces[2]), 0);
}

// The label's columns: where the picture with the label differs from the
// same state drawn without it.
std::pair<int, int> label_columns(viewtest::Canvas &canvas, VELMAUDIO doc, uint32_t flags)
{
    VELMAUDIO_SetDrawProperty(doc, 2, static_cast<int32_t>(flags));
    canvas.draw(doc);
    const QImage without = canvas.output();
    VELMAUDIO_SetDrawProperty(doc, 2, static_cast<int32_t>(flags | 0x20000));
    canvas.draw(doc);
    const std::vector<int> columns = differing_columns(without, canvas.output());
    return columns.empty() ? std::pair{-1, -1} : std::pair{columns.front(), columns.back()};
}

TEST_F(Overlays, SelectingLabelStandsBesideTheBeginOrLeftOfTheCursor)
{
    VELMAUDIO doc = open(kWave);
    ASSERT_TRUE(VELMAUDIO_SetDrawProperty(doc, 5, 0)); // samples
    viewtest::Canvas canvas(kWidth, kHeight);
    zoom_to_grid(canvas, doc);
    ASSERT_TRUE(VELMAUDIO_SetSelectingKind(doc, SELECTING_ADD));
    // Dragged leftwards: the cursor follows the moving end, here the begin.
    ASSERT_TRUE(VELMAUDIO_UpdateSelecting(doc, sample_at(500), sample_at(100)));
    const auto [left, right] = label_columns(canvas, doc, kWave);
    EXPECT_EQ(left, x_of(100) + 5);
    ASSERT_GT(right, left + 40);
    const int width = right - left + 1;

    // With the cursor at the moving end the box keeps clear of it.
    ASSERT_TRUE(VELMAUDIO_UpdateSelecting(doc, sample_at(100), sample_at(500)));
    const auto [left2, right2] = label_columns(canvas, doc, kWave);
    EXPECT_EQ(right2, x_of(500) - 5 - 1);
    EXPECT_EQ(right2 - left2 + 1, width);

    // Never past the display's right end.
    ASSERT_TRUE(VELMAUDIO_UpdateSelecting(doc, sample_at(display.width - 2), sample_at(display.width - 20)));
    const auto [left3, right3] = label_columns(canvas, doc, kWave);
    EXPECT_EQ(right3, display.left + display.width - 5 - 1);
    EXPECT_EQ(right3 - left3 + 1, width);
}

TEST_F(Overlays, CursorsAndSelectionsCrossCustomTracksWithoutTrails)
{
    VELMAUDIO doc = open(kWave);
    ASSERT_TRUE(VELMAUDIO_AddCustomTrack(doc, "words"));
    ASSERT_TRUE(VELMAUDIO_ShowCustomTrack(doc, "words"));
    viewtest::Canvas canvas(kWidth, 300);
    zoom_to_grid(canvas, doc);
    const int id = VELMAUDIO_FindCustomTrackId(doc, "words");
    ASSERT_GE(id, 0);
    const _VELMRECT track = doc->renderer->trackAreas[static_cast<size_t>(id)];
    ASSERT_GT(track.height, 4);
    ASSERT_GT(track.top, display.bottom);
    const int y = track.top + track.height / 2;
    const QImage bare = canvas.output();

    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, sample_at(150)));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_NE(canvas.output().pixel(x_of(150), y), bare.pixel(x_of(150), y));
    EXPECT_NE(canvas.output().pixel(x_of(147), y), bare.pixel(x_of(147), y)); // its shadow

    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, sample_at(300)));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage moved = canvas.output();
    for (int c = 140; c <= 160; ++c) EXPECT_EQ(moved.pixel(x_of(c), y), bare.pixel(x_of(c), y)) << c;

    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, sample_at(200), sample_at(260)));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_GT(brightness(canvas.output().pixel(x_of(230), y)), brightness(bare.pixel(x_of(230), y)));
}

// A region edge moved under a selection: the columns the track redraws keep
// the selection over them, as a full draw shows it.
TEST_F(Overlays, SelectionStaysOverATrackWhoseRegionChanged)
{
    VELMAUDIO moved = open(kWave), direct = open(kWave);
    viewtest::Canvas a(kWidth, 300), b(kWidth, 300);
    AUDIOREGION *region = nullptr;
    for (VELMAUDIO doc : {moved, direct}) {
        ASSERT_TRUE(VELMAUDIO_AddCustomTrack(doc, "words"));
        ASSERT_TRUE(VELMAUDIO_ShowCustomTrack(doc, "words"));
        ASSERT_TRUE(VELMAUDIO_HideMainCursor(doc));
        region = VELMAUDIO_CreateRegionEx(doc, "words", sample_at(100), sample_at(200), "word", nullptr, 0);
        ASSERT_NE(region, nullptr);
        ASSERT_TRUE(VELMAUDIO_SetFocusOnRegion(doc, region));
    }
    zoom_to_grid(a, moved);
    ASSERT_TRUE(VELMAUDIO_SelectAudio(moved, sample_at(150), sample_at(300)));
    ASSERT_TRUE(a.draw(moved));
    AUDIOREGION *focused = VELMAUDIO_GetRegionOnFocus(moved);
    ASSERT_NE(focused, nullptr);
    ASSERT_TRUE(VELMAUDIO_ChangeRegionEnd(moved, focused, VELMAUDIO_SampleToTime(moved, sample_at(250)), 0));
    ASSERT_TRUE(a.draw(moved));

    ASSERT_TRUE(b.draw(direct));
    ASSERT_TRUE(VELMAUDIO_Zoom(direct, 0, int64_t{display.width - 1} * kStep));
    ASSERT_TRUE(VELMAUDIO_SelectAudio(direct, sample_at(150), sample_at(300)));
    ASSERT_TRUE(VELMAUDIO_ChangeRegionEnd(direct, region, VELMAUDIO_SampleToTime(direct, sample_at(250)), 0));
    ASSERT_TRUE(b.draw(direct));
    EXPECT_EQ(viewtest::count_differences(a.output(), b.output()), 0);
}

// A held region moved along its track: its tint over the lanes moves with
// it, as a full draw of the same state shows it.
TEST_F(Overlays, HeldRegionTintFollowsTheMovedRegion)
{
    VELMAUDIO moved = open(kWave), direct = open(kWave);
    viewtest::Canvas a(kWidth, 300), b(kWidth, 300);
    const auto prepare = [&](VELMAUDIO doc, viewtest::Canvas &canvas) {
        ASSERT_TRUE(VELMAUDIO_AddCustomTrack(doc, "words"));
        ASSERT_TRUE(VELMAUDIO_ShowCustomTrack(doc, "words"));
        ASSERT_TRUE(VELMAUDIO_HideMainCursor(doc));
        AUDIOREGION *region = VELMAUDIO_CreateRegionEx(doc, "words", sample_at(100), sample_at(200), "word", nullptr, 0);
        ASSERT_NE(region, nullptr);
        ASSERT_TRUE(VELMAUDIO_SetFocusOnRegion(doc, region));
        zoom_to_grid(canvas, doc);
        velm::control::Interaction &control = doc->renderer->control;
        control.buttonReleased = 0;
        control.dragState = velm::control::kMovingRegions;
        ASSERT_TRUE(VELMAUDIO_EventOverFocusedRegion(doc));
    };
    prepare(moved, a);
    ASSERT_TRUE(a.draw(moved));
    prepare(direct, b);
    for (VELMAUDIO doc : {moved, direct}) ASSERT_TRUE(VELMAUDIO_OffsetRegions(doc, 60 * kStep));
    ASSERT_TRUE(a.draw(moved));
    ASSERT_TRUE(b.draw(direct));
    EXPECT_EQ(viewtest::count_differences(a.output(), b.output()), 0);
    // Still held, a frame that only moves the play cursor keeps the tint.
    set_play_cursor(moved, sample_at(400));
    ASSERT_TRUE(a.draw(moved));
    const QImage held = a.output();
    ASSERT_TRUE(VELMSTATE_NotifyChanges(moved, 0x80000000u));
    ASSERT_TRUE(a.draw(moved));
    EXPECT_EQ(viewtest::count_differences(held, a.output()), 0);
}

TEST_F(Overlays, RefusesMissingHandlesAndRenderers)
{
    _VELMRECT rect{1, 2, 3, 4, 5, 6};
    EXPECT_FALSE(VELMAUDIO_GetSelectionRect(&rect, nullptr));
    EXPECT_EQ(rect.left + rect.top + rect.width + rect.height + rect.right + rect.bottom, 0);
    VELMAUDIO doc = open(kWave);
    rect = _VELMRECT{1, 2, 3, 4, 5, 6};
    EXPECT_FALSE(VELMAUDIO_GetSelectionRect(&rect, doc)); // not drawn yet
    EXPECT_EQ(rect.width, 0);
    EXPECT_FALSE(VELMAUDIO_GetSelectionRect(nullptr, doc));
    EXPECT_FALSE(VELMDRAW_DrawSelections(nullptr, nullptr, 0, 10, 0));
    EXPECT_FALSE(VELMDRAW_UpdateSelecting(nullptr, nullptr));
    EXPECT_FALSE(VELMDRAW_DrawSelectionsSlider(nullptr, 0, 10));
    EXPECT_FALSE(VELMDRAW_DrawNavigatorState(nullptr));
    EXPECT_FALSE(VELMDRAW_ShowQuickBox(nullptr, nullptr));
    EXPECT_EQ(VELMDRAW_SelectTransparencyColor(nullptr, 1), 0u);

    viewtest::Canvas canvas(kWidth, kHeight);
    ASSERT_TRUE(canvas.draw(doc));
    const VELMDRAWCONFIG &c = doc->renderer->config;
    EXPECT_EQ(VELMDRAW_SelectTransparencyColor(doc->renderer, 0), c.defaultTransparency);
    EXPECT_EQ(VELMDRAW_SelectTransparencyColor(doc->renderer, 2), c.greenTransparency);
    EXPECT_EQ(VELMDRAW_SelectTransparencyColor(doc->renderer, 3), c.redTransparency);
    EXPECT_FALSE(VELMAUDIO_GetSelectionRect(&rect, doc)); // nothing selected
}

} // namespace
