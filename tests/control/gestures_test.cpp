// Pointer gestures on a real drawn view: a stereo waveform document with a
// navigator, driven through the document's input entry points.
#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <limits>
#include <memory>
#include <thread>
#include <vector>

#include "control/velmcontrol.h"
#include "control/velminput.h"
#include "core/document_internal.hpp"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "edit/velmselection.h"
#include "platform/nativetimer.h"
#include "render/view/drawer_internal.hpp"
#include "render/view/view_support.hpp"
#include "sound/sound_support.hpp"
#include "sound/velmplay.h"
#include "testaudio.hpp"
#include "widgets/guiapp.h"

namespace {

constexpr uint32_t kWaveNavigator = 0x1 | 0x4000;
constexpr uint32_t kPrimary = 0x20, kAdd = 0x02, kExtend = 0x08;
constexpr int64_t kSamples = 16000;

// The document's events of one kind, with the first data word's code when
// it points to one.
struct Events {
    std::vector<uint32_t> kinds;
    static int handle(const BLNotifyEvent *e, void *user)
    {
        static_cast<Events *>(user)->kinds.push_back(e->event);
        return 1;
    }
    int count(uint32_t kind) const
    {
        int n = 0;
        for (uint32_t k : kinds) n += k == kind;
        return n;
    }
};

// The pumped timers' clock, moved by hand.
uint64_t clock_now(void *user) { return *static_cast<uint64_t *>(user); }

class Gestures : public ::testing::Test {
protected:
    void SetUp() override
    {
        MakeGuiApplication();
        VELMNATIVE_SetClock(clock_now, &now);
        canvas = std::make_unique<viewtest::Canvas>(800, 420);
        doc = viewtest::open_audio(dir.file("a.wav"), viewtest::speech_like(8000, 2, 2.0), 8000, 2);
        ASSERT_NE(doc, nullptr);
        VELMAUDIO_SetDrawProperty(doc, 2, static_cast<int32_t>(kWaveNavigator));
        draw();
        ASSERT_TRUE(VELMAUDIO_AddEventHandler(doc, Events::handle, &events));
    }
    void TearDown() override
    {
        VELMAUDIO_Close(doc);
        VELMNATIVE_SetClock(nullptr, nullptr);
    }
    void draw() { ASSERT_TRUE(canvas->draw(doc)); }
    VELMDRAW drawer() const { return doc->renderer; }
    const velm::view::Lane &lane(int i) const { return drawer()->lanes[static_cast<size_t>(i)]; }
    const _VELMRECT &area() const { return lane(0).area; }
    // The first sample of canvas column x of the display.
    int64_t sample_at(int x) const
    {
        return static_cast<int64_t>(std::floor(VELMDRAW_ConvertDisplayXtoRealX(drawer(), x - drawer()->display.left)));
    }
    int mid_y() const { return area().top + area().height / 2; }
    void drag(int x0, int x1, int y, uint32_t flags)
    {
        ASSERT_TRUE(VELMAUDIO_MouseDown(doc, x0, y, flags));
        ASSERT_TRUE(VELMAUDIO_MouseMove(doc, (x0 + x1) / 2, y, flags));
        ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x1, y, flags));
        ASSERT_TRUE(VELMAUDIO_MouseUp(doc, x1, y, flags));
    }
    int pump(uint64_t ms)
    {
        now += ms;
        return VELMNATIVE_PumpTimers();
    }

    uint64_t now = 1000;
    velmtest::TempDir dir;
    std::unique_ptr<viewtest::Canvas> canvas;
    VELMAUDIO doc = nullptr;
    Events events;
};

TEST_F(Gestures, ClickMovesTheCursorAndClearsSelections)
{
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 100, 900));
    const int x = area().left + 200;
    ASSERT_TRUE(VELMAUDIO_MouseDown(doc, x, mid_y(), kPrimary));
    EXPECT_FALSE(VELMAUDIO_HasSelection(doc));
    ASSERT_TRUE(VELMAUDIO_MouseUp(doc, x, mid_y(), kPrimary));
    EXPECT_FALSE(VELMAUDIO_IsInteracting(doc));
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), sample_at(x));
    EXPECT_EQ(events.count(0x20033), 1);
    EXPECT_EQ(events.count(0x20034), 1);
}

TEST_F(Gestures, DragsSelectExtendAddAndSubtract)
{
    const int a = area().left + 100, b = area().left + 300, c = area().left + 400, e = area().left + 500;
    drag(a, b, mid_y(), kPrimary);
    EXPECT_EQ(VELMAUDIO_SelectionChunkCount(doc), 1);
    EXPECT_EQ(VELMAUDIO_SelectionBegin(doc), sample_at(a));
    EXPECT_EQ(VELMAUDIO_SelectionEnd(doc), sample_at(b));
    // Extend: a press alone already selects, from the nearest border.
    ASSERT_TRUE(VELMAUDIO_MouseDown(doc, c, mid_y(), kPrimary | kExtend));
    EXPECT_TRUE(VELMAUDIO_IsSelecting(doc));
    ASSERT_TRUE(VELMAUDIO_MouseUp(doc, c, mid_y(), kPrimary | kExtend));
    EXPECT_EQ(VELMAUDIO_SelectionBegin(doc), sample_at(a));
    EXPECT_EQ(VELMAUDIO_SelectionEnd(doc), sample_at(c));
    // Add a second range, then cut a hole into the first.
    drag(e, e + 50, mid_y(), kPrimary | kAdd);
    ASSERT_EQ(VELMAUDIO_SelectionChunkCount(doc), 2);
    EXPECT_EQ(VELMAUDIO_SelectionChunkBegin(doc, 1), sample_at(e));
    drag(b - 20, b + 20, mid_y(), kPrimary | kAdd | kExtend);
    EXPECT_EQ(VELMAUDIO_SelectionChunkCount(doc), 3);
}

TEST_F(Gestures, DraggingPastTheRightEdgeScrollsUpToTheLimit)
{
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 0, 4000));
    draw();
    const int64_t spp = std::llround(VELMDRAW_ConvertDisplayXtoRealX(drawer(), 1)) -
                        std::llround(VELMDRAW_ConvertDisplayXtoRealX(drawer(), 0));
    ASSERT_GT(spp, 0);
    const int right = drawer()->display.left + drawer()->display.width - 1;
    const int64_t anchor = sample_at(area().left + 100);
    ASSERT_TRUE(VELMAUDIO_MouseDown(doc, area().left + 100, mid_y(), kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, right - 10, mid_y(), kPrimary));
    const int64_t before = VELMAUDIO_ViewBegin(doc);
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, right + 11, mid_y(), kPrimary));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc) - before, spp * 10);
    // The view is drawn between moves, as the shell does.
    for (int i = 0; i < 12; ++i) {
        draw();
        ASSERT_TRUE(VELMAUDIO_MouseMove(doc, right + 300, mid_y(), kPrimary));
        ASSERT_LE(VELMAUDIO_ViewEnd(doc), VELMAUDIO_ViewEndLimit(doc));
    }
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), VELMAUDIO_ViewEndLimit(doc));
    draw();
    ASSERT_TRUE(VELMAUDIO_MouseUp(doc, right, mid_y(), kPrimary));
    // The selection followed to the end of the signal.
    EXPECT_EQ(VELMAUDIO_SelectionBegin(doc), anchor);
    EXPECT_GE(VELMAUDIO_SelectionEnd(doc), kSamples - 2 * spp);
}

TEST_F(Gestures, NavigatorWindowBordersAndDoubleClick)
{
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 4000, 8000));
    draw();
    const _VELMRECT box = drawer()->overlay.navigatorBox;
    const int y = box.top + box.height / 2;
    // The left border follows the pointer; the right one stays.
    ASSERT_TRUE(VELMAUDIO_MouseDown(doc, box.left, y, kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, box.left + 10, y, kPrimary));
    const int64_t moved = VELMAUDIO_ViewBegin(doc);
    EXPECT_GT(moved, 4000);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 8000);
    // Dragged past the right border it never crosses it.
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, box.left + box.width + 40, y, kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseUp(doc, box.left + box.width + 40, y, kPrimary));
    EXPECT_LE(VELMAUDIO_ViewBegin(doc), 8000 - 2);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 8000);
    // A double click near the start keeps the width and begins at 0.
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 4000, 8000));
    draw();
    ASSERT_TRUE(VELMAUDIO_MouseDblClick(doc, drawer()->display.left + 2, y, kPrimary));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 0);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 4000);
}

TEST_F(Gestures, NavigatorWindowDragKeepsItsWidthWithinTheSignal)
{
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 4000, 8000));
    draw();
    const _VELMRECT box = drawer()->overlay.navigatorBox;
    const int x = box.left + box.width / 2, y = box.top + box.height / 2;
    ASSERT_TRUE(VELMAUDIO_MouseDown(doc, x, y, kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x + 50, y, kPrimary));
    EXPECT_GT(VELMAUDIO_ViewBegin(doc), 4000);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc) - VELMAUDIO_ViewBegin(doc), 4000);
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x - 2000, y, kPrimary));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 0);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 4000);
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x + 2000, y, kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseUp(doc, x + 2000, y, kPrimary));
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), kSamples);
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), kSamples - 4000);
}

TEST_F(Gestures, WheelNotchesAndRemainders)
{
    const int x = area().left + area().width / 2;
    const int64_t width = VELMAUDIO_ViewEnd(doc) - VELMAUDIO_ViewBegin(doc);
    ASSERT_TRUE(VELMAUDIO_MouseWheel(doc, x, mid_y(), 120.0, 0));
    const int64_t zoomed = VELMAUDIO_ViewEnd(doc) - VELMAUDIO_ViewBegin(doc);
    EXPECT_LT(zoomed, width);
    // 4 eighths wait; the second 4 make 1/15 of a notch.
    draw();
    ASSERT_TRUE(VELMAUDIO_MouseWheel(doc, x, mid_y(), 4.0, 0));
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc) - VELMAUDIO_ViewBegin(doc), zoomed);
    ASSERT_TRUE(VELMAUDIO_MouseWheel(doc, x, mid_y(), 4.0, 0));
    EXPECT_LT(VELMAUDIO_ViewEnd(doc) - VELMAUDIO_ViewBegin(doc), zoomed);
    // The horizontal wheel scrolls a tenth of the view per notch.
    draw();
    const int64_t begin = VELMAUDIO_ViewBegin(doc), w = VELMAUDIO_ViewEnd(doc) - begin;
    ASSERT_TRUE(VELMAUDIO_MouseHWheel(doc, x, mid_y(), -120.0, 0));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc) - begin, std::llround(0.1 * static_cast<double>(w)));
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc) - VELMAUDIO_ViewBegin(doc), w);
}

TEST_F(Gestures, BadInputIsRefused)
{
    const int x = area().left + 50;
    EXPECT_FALSE(VELMAUDIO_MouseDown(nullptr, x, mid_y(), kPrimary));
    EXPECT_FALSE(VELMAUDIO_MouseWheel(nullptr, x, mid_y(), 120.0, 0));
    EXPECT_FALSE(VELMAUDIO_ZoomGesture(doc, x, mid_y(), std::numeric_limits<double>::quiet_NaN()));
    const int64_t begin = VELMAUDIO_ViewBegin(doc), end = VELMAUDIO_ViewEnd(doc);
    // Not-a-number and huge deltas change nothing or stay within the signal.
    EXPECT_TRUE(VELMAUDIO_MouseWheel(doc, x, mid_y(), std::numeric_limits<double>::quiet_NaN(), 0));
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), begin);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), end);
    EXPECT_TRUE(VELMAUDIO_MouseWheel(doc, x, mid_y(), static_cast<double>(INT_MIN), 0));
    EXPECT_TRUE(VELMAUDIO_MouseHWheel(doc, x, mid_y(), -1e300, 0));
    EXPECT_GE(VELMAUDIO_ViewBegin(doc), 0);
    EXPECT_LE(VELMAUDIO_ViewEnd(doc), kSamples);
    // Absurd coordinates.
    EXPECT_TRUE(VELMAUDIO_MouseDown(doc, INT_MIN, INT_MAX, kPrimary));
    EXPECT_TRUE(VELMAUDIO_MouseMove(doc, INT_MAX, INT_MIN, kPrimary));
    EXPECT_TRUE(VELMAUDIO_MouseUp(doc, INT_MAX, INT_MAX, kPrimary));
    EXPECT_FALSE(VELMAUDIO_IsInteracting(doc));
}

TEST_F(Gestures, HoverTimerReportsEachNewPositionOnce)
{
    // Timers made on the Qt thread come from its event loop: the gestures
    // run on a thread of their own, whose timers the test pumps.
    const int x = area().left + 60;
    std::vector<int> seen;
    std::thread shell([&] {
        VELMAUDIO_MouseMove(doc, x, mid_y(), 0);
        pump(600);
        pump(600);
        seen.push_back(events.count(0x20037));
        VELMAUDIO_MouseMove(doc, x, mid_y(), 0); // same place: not re-armed
        pump(600);
        seen.push_back(events.count(0x20037));
        VELMAUDIO_MouseMove(doc, x + 5, mid_y(), 0);
        pump(100);
        seen.push_back(events.count(0x20037));
        pump(600);
        seen.push_back(events.count(0x20037));
        // A timer armed before the document closes never fires into it.
        VELMAUDIO_MouseMove(doc, x + 9, mid_y(), 0);
        VELMAUDIO_Close(doc);
        doc = nullptr;
        pump(600);
        seen.push_back(events.count(0x20037));
    });
    shell.join();
    EXPECT_EQ(seen, (std::vector<int>{1, 1, 1, 2, 2}));
}

TEST_F(Gestures, NavigatorPressOutsideTheWindowScrollsTowardIt)
{
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 0, 2000));
    draw();
    const _VELMRECT box = drawer()->overlay.navigatorBox;
    const _VELMRECT strip = drawer()->navigator;
    const int x = strip.left + strip.width * 3 / 4, y = box.top + box.height / 2;
    ASSERT_GT(x, box.left + box.width);
    std::vector<int64_t> begins;
    std::thread shell([&] {
        VELMAUDIO_MouseDown(doc, x, y, kPrimary);
        for (int i = 0; i < 3; ++i) {
            pump(50);
            begins.push_back(VELMAUDIO_ViewBegin(doc));
        }
        VELMAUDIO_MouseUp(doc, x, y, kPrimary);
        pump(50); // released: the repeat is gone
        begins.push_back(VELMAUDIO_ViewBegin(doc));
    });
    shell.join();
    // Each tick moves the 2000-sample window a fifth of its width.
    EXPECT_EQ(begins, (std::vector<int64_t>{400, 800, 1200, 1200}));
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc) - VELMAUDIO_ViewBegin(doc), 2000);
}

TEST_F(Gestures, SelectionHandleSlides)
{
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 4000, 8000));
    draw();
    ASSERT_EQ(drawer()->overlay.selectionSliderCount, 1);
    const _VELMRECT handle = drawer()->overlay.selectionSliders[0].end;
    ASSERT_GT(handle.width, 0);
    const int x = handle.left + handle.width / 2, y = handle.top + handle.height / 2;
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x, y, 0));
    ASSERT_EQ(VELMCONTROL_GetMouseOverObject(drawer()), 0x8000A00u);
    ASSERT_TRUE(VELMAUDIO_MouseDown(doc, x, y, kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x + 60, y, kPrimary));
    EXPECT_TRUE(VELMCONTROL_IsSlidingSelection(drawer()));
    EXPECT_EQ(VELMCONTROL_GetSlidingSelectionSample(drawer()), sample_at(x + 60));
    ASSERT_TRUE(VELMAUDIO_MouseUp(doc, x + 60, y, kPrimary));
    EXPECT_EQ(VELMAUDIO_SelectionChunkCount(doc), 1);
    EXPECT_EQ(VELMAUDIO_SelectionBegin(doc), 4000);
    EXPECT_EQ(VELMAUDIO_SelectionEnd(doc), sample_at(x + 60));
}

TEST_F(Gestures, DraggingASelectionMovesIt)
{
    // Draggable selections are read when the drawer is made.
    soundtest::Setting drag{"libvelm.draw.AudioDragActive", "true"};
    ASSERT_TRUE(VELMCONTROL_Reset(drawer()));
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 4000, 6000));
    draw();
    const int x = drawer()->display.left + static_cast<int>(VELMDRAW_ConvertRealXtoDisplayX(drawer(), 5000.0));
    ASSERT_TRUE(VELMAUDIO_AccKeyDown(doc, 0x04));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x, mid_y(), 0x04));
    ASSERT_TRUE(VELMCONTROL_GetMouseOverObject(drawer()) & 0x4000000u);
    ASSERT_TRUE(VELMAUDIO_MouseDown(doc, x, mid_y(), kPrimary | 0x04));
    // The first movement picks the selection up; it follows from there.
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x + 10, mid_y(), kPrimary | 0x04));
    EXPECT_TRUE(VELMAUDIO_IsInteracting(doc));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x + 60, mid_y(), kPrimary | 0x04));
    const int64_t delta = sample_at(x + 60) - sample_at(x + 10);
    ASSERT_TRUE(VELMAUDIO_MouseUp(doc, x + 60, mid_y(), kPrimary | 0x04));
    ASSERT_TRUE(VELMAUDIO_AccKeyUp(doc, 0x04));
    EXPECT_EQ(VELMAUDIO_SelectionChunkCount(doc), 1);
    EXPECT_EQ(VELMAUDIO_SelectionBegin(doc), 4000 + delta);
    EXPECT_EQ(VELMAUDIO_SelectionEnd(doc), 6000 + delta);
}

TEST_F(Gestures, KeysChooseTheSmartZoomAction)
{
    ASSERT_TRUE(VELMAUDIO_AccKeyDown(doc, kExtend));
    EXPECT_EQ(doc->state->smartZoomAction, 3);
    ASSERT_TRUE(VELMAUDIO_AccKeyDown(doc, kAdd));
    EXPECT_EQ(doc->state->smartZoomAction, 4);
    ASSERT_TRUE(VELMAUDIO_AccKeyUp(doc, kAdd | kExtend));
    EXPECT_EQ(doc->state->smartZoomAction, 2);
    EXPECT_EQ(events.count(0x20035), 2);
    EXPECT_EQ(events.count(0x20036), 1);
}

} // namespace
