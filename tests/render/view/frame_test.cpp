// Frames: partial redraws, the draw entry point's rules and its events.
#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <functional>
#include <string>
#include <thread>

#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "testaudio.hpp"
#include "view_support.hpp"

namespace {

constexpr int kRate = 8000;

struct Events {
    std::vector<uint32_t> codes;
    int answer = 1;
    std::function<void()> on_before_draw;
    static int handler(const BLNotifyEvent *event, void *user)
    {
        auto *self = static_cast<Events *>(user);
        self->codes.push_back(event->event);
        if (event->event == 0x2001E && self->on_before_draw) self->on_before_draw();
        return event->event == 0x2001E ? self->answer : 1;
    }
    long count(uint32_t code) const { return std::count(codes.begin(), codes.end(), code); }
};

struct LogCapture {
    std::vector<std::string> lines;
    LogCapture() { BLDEBUG_SetSink(sink, this); }
    ~LogCapture() { BLDEBUG_SetSink(nullptr, nullptr); }
    static void sink(int, int, const char *message, void *user) { static_cast<LogCapture *>(user)->lines.emplace_back(message); }
    bool saw(const std::string &text) const { return std::find(lines.begin(), lines.end(), text) != lines.end(); }
};

class Frame : public ::testing::Test {
protected:
    void SetUp() override
    {
        path = dir.file("speech.wav");
        ASSERT_TRUE(velmtest::write_audio(path, viewtest::speech_like(kRate, 2, 4.0), kRate, 2));
        doc = VELMAUDIO_Open(path.c_str(), "AUTO");
        ASSERT_NE(doc, nullptr);
        VELMAUDIO_AddEventHandler(doc, Events::handler, &events);
    }
    void TearDown() override { VELMAUDIO_Close(doc); }

    velmtest::TempDir dir;
    std::string path;
    VELMAUDIO doc = nullptr;
    Events events;
};

// Draws the document scrolled from one window to another, and a fresh
// document drawn straight at the second window: the pictures must agree.
void expect_scroll_matches_full_draw(const std::string &path, uint32_t flags, int64_t from, int64_t to, int64_t length)
{
    VELMAUDIO scrolled = VELMAUDIO_Open(path.c_str(), "AUTO");
    VELMAUDIO direct = VELMAUDIO_Open(path.c_str(), "AUTO");
    ASSERT_TRUE(scrolled && direct);
    viewtest::Canvas a(700, 300), b(700, 300);
    for (VELMAUDIO doc : {scrolled, direct}) VELMAUDIO_SetDrawProperty(doc, 2, static_cast<int32_t>(flags));
    ASSERT_TRUE(VELMAUDIO_Zoom(scrolled, from, from + length));
    ASSERT_TRUE(a.draw(scrolled));
    ASSERT_TRUE(VELMAUDIO_Zoom(scrolled, to, to + length));
    _VELMRECT changed{};
    ASSERT_TRUE(a.draw(scrolled, &changed));
    EXPECT_EQ(changed.width, 700);
    ASSERT_TRUE(VELMAUDIO_Zoom(direct, to, to + length));
    ASSERT_TRUE(b.draw(direct));
    const long differences = viewtest::count_differences(a.output(), b.output());
    EXPECT_EQ(differences, 0) << "flags " << flags << " from " << from << " to " << to;
    if (differences) {
        a.output().save(VELM_TEST_BINARY_DIR "/scrolled.actual.png");
        b.output().save(VELM_TEST_BINARY_DIR "/scrolled.expected.png");
    }
    VELMAUDIO_Close(scrolled);
    VELMAUDIO_Close(direct);
}

TEST_F(Frame, ScrollingWaveformsEqualsAFullRedraw)
{
    expect_scroll_matches_full_draw(path, 0x1 | 0xC, 4000, 4900, 8000);   // left
    expect_scroll_matches_full_draw(path, 0x1 | 0xC, 9000, 7777, 8000);   // right
    expect_scroll_matches_full_draw(path, 0x1, 2000, 2061, 5000);         // a few columns
}

TEST_F(Frame, ScrollingSpectrogramsAndNavigatorEqualsAFullRedraw)
{
    expect_scroll_matches_full_draw(path, 0x3 | 0xC | 0x4000, 4000, 5200, 8000);
    expect_scroll_matches_full_draw(path, 0x2 | 0xC, 12000, 11000, 6000);
}

// A transparent view paints no backgrounds: the columns a scroll uncovers
// must be cleared, not keep the pixels that moved away.
TEST_F(Frame, ScrollingATransparentViewEqualsAFullRedraw)
{
    expect_scroll_matches_full_draw(path, 0x1 | 0xC | 0x1000000, 4000, 4900, 8000);
    expect_scroll_matches_full_draw(path, 0x1 | 0xC | 0x1000000, 9000, 7777, 8000);
}

TEST_F(Frame, ScrollingAtSampleLevelEqualsAFullRedraw)
{
    expect_scroll_matches_full_draw(path, 0x1 | 0xC, 3000, 3003, 60);
}

TEST_F(Frame, RedrawIsNeededUntilDrawnAndAfterAResize)
{
    viewtest::Canvas canvas(500, 200);
    EXPECT_TRUE(VELMAUDIO_RedrawNeeded(canvas.get(), doc));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_FALSE(VELMAUDIO_RedrawNeeded(canvas.get(), doc));
    EXPECT_FALSE(VELMAUDIO_RedrawNeeded(nullptr, doc));
    ASSERT_TRUE(VELMCANVAS_ResizeCanvas(canvas.get(), 400, 200));
    EXPECT_TRUE(VELMAUDIO_RedrawNeeded(canvas.get(), doc));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_FALSE(VELMAUDIO_RedrawNeeded(canvas.get(), doc));
    VELMSTATE_NotifyChanges(doc, 0);
    EXPECT_TRUE(VELMAUDIO_RedrawNeeded(canvas.get(), doc));
}

TEST_F(Frame, DrawWithoutChangesTouchesNothing)
{
    viewtest::Canvas canvas(500, 200);
    _VELMRECT changed{};
    ASSERT_TRUE(canvas.draw(doc, &changed));
    EXPECT_EQ(changed.width, 500);
    EXPECT_EQ(changed.height, 200);
    events.codes.clear();
    changed = _VELMRECT{1, 2, 3, 4, 5, 6};
    ASSERT_TRUE(canvas.draw(doc, &changed));
    EXPECT_EQ(changed.left + changed.top + changed.width + changed.height + changed.right + changed.bottom, 0);
    EXPECT_EQ(events.count(0x2001E), 0);
    EXPECT_EQ(events.count(0x2001F), 0);
}

TEST_F(Frame, VetoedDrawKeepsTheChangePending)
{
    viewtest::Canvas canvas(500, 200);
    events.answer = 0;
    EXPECT_FALSE(canvas.draw(doc));
    EXPECT_TRUE(VELMAUDIO_RedrawNeeded(canvas.get(), doc));
    events.answer = 1;
    EXPECT_TRUE(canvas.draw(doc));
    EXPECT_FALSE(VELMAUDIO_RedrawNeeded(canvas.get(), doc));
    EXPECT_EQ(events.count(0x2001F), 1);
}

TEST_F(Frame, RecursiveDrawIsRefusedWithAWarning)
{
    viewtest::Canvas canvas(500, 200);
    LogCapture log;
    int inner = -1;
    events.on_before_draw = [&] { inner = VELMAUDIO_Draw(canvas.get(), doc, nullptr); };
    EXPECT_TRUE(canvas.draw(doc));
    EXPECT_EQ(inner, 0);
    EXPECT_TRUE(log.saw("VELMAUDIO_Draw: Recursive call to VELMAUDIO_Draw!"));
    EXPECT_FALSE(VELMAUDIO_RedrawNeeded(canvas.get(), doc));
}

TEST_F(Frame, DrawDeclinesWhileAWriterHoldsTheSignal)
{
    viewtest::Canvas canvas(500, 200);
    ASSERT_TRUE(canvas.draw(doc));
    LogCapture log;
    AUDIOSIGNAL *signal = VELMAUDIO_GetAudioSignal(doc);
    AUDIOSIGNAL_PIPE *pipe = AUDIOSIGNAL_CreatePipe(signal, 0);
    ASSERT_NE(pipe, nullptr);
    const std::vector<float> block(2 * 400000, 0.25f);
    // Appends hold the signal for writing; draw until one draw meets one.
    bool declined = false;
    for (int attempt = 0; attempt < 40 && !declined; ++attempt) {
        std::atomic<bool> done{false};
        std::thread writer([&] {
            AUDIOSIGNAL_AppendToPipe(pipe, block.data(), 400000);
            done = true;
        });
        while (!done && !declined) {
            VELMSTATE_NotifyChanges(doc, 0);
            const size_t before = log.lines.size();
            const int drawn = canvas.draw(doc);
            declined = !drawn && log.lines.size() > before &&
                       log.lines.back() == "VELMAUDIO_Draw: Audio Signal Object locked ... re-scheduling draw!";
        }
        writer.join();
    }
    AUDIOSIGNAL_ClosePipe(pipe);
    ASSERT_TRUE(declined);
    // The change stays pending, and the next draw renders.
    EXPECT_TRUE(VELMAUDIO_RedrawNeeded(canvas.get(), doc));
    EXPECT_TRUE(canvas.draw(doc));
    EXPECT_FALSE(VELMAUDIO_RedrawNeeded(canvas.get(), doc));
}

TEST_F(Frame, SizeChangesAreNotifiedOnce)
{
    viewtest::Canvas canvas(500, 200);
    ASSERT_TRUE(canvas.draw(doc));
    VELMSTATE_NotifyChanges(doc, 0);
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_EQ(events.count(0x20031), 1);
    ASSERT_TRUE(VELMCANVAS_ResizeCanvas(canvas.get(), 450, 200));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_EQ(events.count(0x20031), 2);
}

TEST_F(Frame, ANewCanvasGetsTheWholePicture)
{
    viewtest::Canvas first(500, 200), second(500, 200);
    ASSERT_TRUE(first.draw(doc));
    VELMSTATE_NotifyChanges(doc, 0); // a change that alone would redraw nothing
    ASSERT_TRUE(second.draw(doc));
    EXPECT_EQ(viewtest::count_differences(first.output(), second.output()), 0);
}

TEST_F(Frame, FreeingMemoryDropsTheRenderer)
{
    viewtest::Canvas canvas(500, 200);
    const int64_t before = VELMAUDIO_SizeInMemory(doc);
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_GT(VELMAUDIO_SizeInMemory(doc), before);
    EXPECT_TRUE(VELMAUDIO_FreeMemory(doc));
    EXPECT_TRUE(VELMAUDIO_RedrawNeeded(canvas.get(), doc));
    EXPECT_TRUE(canvas.draw(doc));
}

TEST_F(Frame, EditsAreRedrawnEvenWhenTheViewStays)
{
    viewtest::Canvas canvas(500, 200);
    VELMAUDIO_SetDrawProperty(doc, 2, 0x1 | 0xC);
    ASSERT_TRUE(canvas.draw(doc));
    const QImage before = canvas.output();
    AUDIOSIGNAL_PIPE *pipe = AUDIOSIGNAL_CreatePipe(VELMAUDIO_GetAudioSignal(doc), 0);
    const std::vector<float> loud(2 * 4000, 0.95f);
    ASSERT_EQ(AUDIOSIGNAL_AppendToPipe(pipe, loud.data(), 4000), 4000);
    AUDIOSIGNAL_ClosePipe(pipe);
    VELMSTATE_NotifyChanges(doc, 0);
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_GT(viewtest::count_differences(before, canvas.output()), 1000);
}

} // namespace
