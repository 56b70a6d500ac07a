// The time display on real documents: what it shows, its edit mode and key
// reading, its pointer areas, its pictures, and following a playing document.
#include <QCoreApplication>
#include <QImage>
#include <QPainter>
#include <algorithm>
#include <gtest/gtest.h>
#include <string>
#include <vector>

#include "../render/view/view_support.hpp"
#include "../sound/sound_support.hpp"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "core/velmtimeconv.h"
#include "guiapp.h"
#include "sound/velmplay.h"
#include "widgets/display/velmdisplay.h"

namespace {

constexpr int kRate = 44100;
constexpr int kWidth = 320, kHeight = 48;

struct EventLog {
    std::vector<uint32_t> seen;
    int answer_before_edit = 1;
    static int Handle(const BLNotifyEvent *event, void *user)
    {
        auto *log = static_cast<EventLog *>(user);
        if (event->event >= 0x20048 && event->event <= 0x2004D) {
            log->seen.push_back(event->event);
            if (event->event == VELMDISPLAY_EVENT_BEFOREEDIT)
                return log->answer_before_edit;
        }
        return 1;
    }
};

// Polls until done() holds, delivering this thread's timer ticks (Qt
// delivers them once an application exists); false when it never did.
template <class Done> bool Settle(Done done)
{
    return soundtest::WaitFor([&] {
        QCoreApplication::processEvents();
        return done();
    });
}

class Display : public ::testing::Test {
protected:
    void SetUp() override
    {
        viewtest::ensure_application();
        display = VELMDISPLAY_Create();
        ASSERT_NE(display, nullptr);
        BLNOTIFY_AddDefaultHandler(EventLog::Handle, &log);
    }
    void TearDown() override
    {
        BLNOTIFY_DelDefaultHandler(EventLog::Handle, &log);
        VELMDISPLAY_Destroy(display);
        for (VELMAUDIO doc : docs)
            VELMAUDIO_Close(doc);
    }

    // A two-second stereo document attached to the display.
    VELMAUDIO Attach(int channels = 2, double seconds = 2.0)
    {
        const std::string path = dir.file("doc" + std::to_string(docs.size()) + ".wav");
        VELMAUDIO doc = viewtest::open_audio(path, viewtest::speech_like(kRate, channels, seconds), kRate, channels);
        if (doc) {
            docs.push_back(doc);
            VELMDISPLAY_SetVelmAudio(display, doc);
            VELMDISPLAY_Update(display);
        }
        return doc;
    }

    QImage Draw()
    {
        viewtest::Canvas canvas(kWidth, kHeight);
        QPainter painter;
        VELMCANVAS_BeginDraw(canvas.get(), &painter);
        _VELMRECT out{};
        EXPECT_TRUE(VELMDISPLAY_Draw(canvas.get(), display, &out));
        VELMCANVAS_EndDraw(canvas.get());
        int width = 0, height = 0;
        VELMCANVAS_GetDimension(canvas.get(), &width, &height);
        EXPECT_EQ(out.width, width);
        EXPECT_EQ(out.height, height);
        return canvas.output();
    }

    void Type(const std::string &keys)
    {
        for (char c : keys)
            ASSERT_TRUE(VELMDISPLAY_KeyPressed(display, c)) << "refused '" << c << "' of " << keys;
    }

    // Types a text from a fresh edit mode; whether every key was taken.
    bool TypeFresh(const std::string &keys)
    {
        VELMDISPLAY_CancelEdit(display);
        EXPECT_TRUE(VELMDISPLAY_EnterEdit(display));
        bool taken = true;
        for (char c : keys)
            taken = VELMDISPLAY_KeyPressed(display, c) && taken;
        return taken;
    }

    void Click(int x, int y)
    {
        VELMDISPLAY_MouseMove(display, x, y, 0);
        VELMDISPLAY_MouseDown(display, x, y, VELMDISPLAY_BUTTON_PRIMARY);
        VELMDISPLAY_MouseUp(display, x, y, 0);
    }

    velmtest::TempDir dir;
    VELMDISPLAY display = nullptr;
    std::vector<VELMAUDIO> docs;
    EventLog log;
};

TEST_F(Display, NullHandlesAreRefused)
{
    EXPECT_FALSE(VELMDISPLAY_Destroy(nullptr));
    EXPECT_FALSE(VELMDISPLAY_Update(nullptr));
    EXPECT_FALSE(VELMDISPLAY_EnterEdit(nullptr));
    EXPECT_FALSE(VELMDISPLAY_KeyPressed(nullptr, '1'));
    EXPECT_FALSE(VELMDISPLAY_Draw(nullptr, display, nullptr));
    EXPECT_FALSE(VELMDISPLAY_MouseDown(nullptr, 1, 1, VELMDISPLAY_BUTTON_PRIMARY));
}

TEST_F(Display, WithoutDocumentItShowsBlankZerosAt8000HzMono)
{
    EXPECT_EQ(VELMDISPLAY_GetPosition(display), 0);
    EXPECT_EQ(VELMDISPLAY_GetUnit(display), 1);
    EXPECT_TRUE(VELMDISPLAY_GetOptions(display) & VELMDISPLAY_OPTION_BLANK);
    EXPECT_FALSE(VELMDISPLAY_EnterEdit(display)) << "edit mode needs a document";
    EXPECT_FALSE(VELMDISPLAY_MouseWheel(display, 0, 0, 0));
    EXPECT_TRUE(VELMDISPLAY_RedrawNeeded(display));
    EXPECT_EQ(viewtest::compare_golden(Draw(), "display_nodoc"), "");
    EXPECT_FALSE(VELMDISPLAY_RedrawNeeded(display));
}

TEST_F(Display, DrawPropertiesZeroAndOneAreKeptOthersRefused)
{
    EXPECT_EQ(VELMDISPLAY_SetDrawProperty(display, 0, 7), 0);
    EXPECT_EQ(VELMDISPLAY_SetDrawProperty(display, 1, 9), 0);
    EXPECT_EQ(VELMDISPLAY_SetDrawProperty(display, 2, 11), 0);
    EXPECT_EQ(VELMDISPLAY_GetDrawProperty(display, 0), 7u);
    EXPECT_EQ(VELMDISPLAY_GetDrawProperty(display, 1), 9u);
    EXPECT_EQ(VELMDISPLAY_GetDrawProperty(display, 2), 0u);
}

TEST_F(Display, ShowsTheCursorAndRemainingTimeInEachUnit)
{
    VELMAUDIO doc = Attach();
    ASSERT_NE(doc, nullptr);
    VELMAUDIO_SetCursorPosition(doc, 30000);
    VELMDISPLAY_Update(display);
    EXPECT_EQ(VELMDISPLAY_GetPosition(display), 30000);
    EXPECT_FALSE(VELMDISPLAY_GetOptions(display) & VELMDISPLAY_OPTION_BLANK);
    EXPECT_TRUE(VELMDISPLAY_RedrawNeeded(display));
    VELMAUDIO_SetDrawProperty(doc, 5, 1);
    VELMDISPLAY_Update(display);
    EXPECT_EQ(viewtest::compare_golden(Draw(), "display_time"), "");
    VELMAUDIO_SetDrawProperty(doc, 5, 0);
    VELMDISPLAY_Update(display);
    EXPECT_TRUE(VELMDISPLAY_RedrawNeeded(display)) << "a unit change needs a redraw";
    EXPECT_EQ(viewtest::compare_golden(Draw(), "display_sample"), "");
    VELMAUDIO_SetDrawProperty(doc, 5, 2);
    VELMDISPLAY_Update(display);
    EXPECT_EQ(viewtest::compare_golden(Draw(), "display_frame"), "");

    VELMDISPLAY_MouseMove(display, 0, 0, 0);
    Draw(); // lays out the pointer areas
    VELMDISPLAY_MouseMove(display, 7, 10, 0);
    ASSERT_EQ(VELMDISPLAY_GetPointerArea(display), 0x8u) << "the sign cell";
    Click(7, 10);
    EXPECT_TRUE(VELMDISPLAY_GetOptions(display) & VELMDISPLAY_OPTION_REMAINING);
    EXPECT_EQ(VELMDISPLAY_GetPosition(display), VELMAUDIO_NumSamples(doc) - 30000);
    VELMAUDIO_SetDrawProperty(doc, 5, 1);
    VELMDISPLAY_Update(display);
    EXPECT_EQ(viewtest::compare_golden(Draw(), "display_remaining"), "");
    Click(7, 10);
    EXPECT_EQ(VELMDISPLAY_GetPosition(display), 30000);
}

TEST_F(Display, TheMillisecondsLabelStepsUnitsAndTheHoursLabelPicksTime)
{
    VELMAUDIO doc = Attach();
    ASSERT_NE(doc, nullptr);
    Draw();
    const int label_y = 2 + 26 + 4;
    // The first point of the label row over each area.
    auto find = [&](uint32_t mask) {
        for (int x = 0; x < kWidth; ++x) {
            VELMDISPLAY_MouseMove(display, x, label_y, 0);
            if (VELMDISPLAY_GetPointerArea(display) & mask)
                return x;
        }
        return -1;
    };
    const int ms_x = find(0x2), hms_x = find(0x4);
    ASSERT_GT(ms_x, hms_x);
    ASSERT_GT(hms_x, 0);
    const std::vector<std::pair<int, int>> steps = {{1, 0}, {0, 2}, {2, 3}, {3, 5}, {5, 0}, {4, 3}};
    for (auto [from, to] : steps) {
        VELMAUDIO_SetDrawProperty(doc, 5, from);
        VELMDISPLAY_Update(display);
        Draw();
        Click(ms_x, label_y);
        EXPECT_EQ(VELMAUDIO_GetDrawProperty(doc, 5), to) << "from " << from;
    }
    const std::vector<std::pair<int, int>> to_time = {{0, 1}, {2, 1}, {4, 1}, {1, 4}, {3, 4}, {5, 4}};
    for (auto [from, to] : to_time) {
        VELMAUDIO_SetDrawProperty(doc, 5, from);
        VELMDISPLAY_Update(display);
        Draw();
        Click(hms_x, label_y);
        EXPECT_EQ(VELMAUDIO_GetDrawProperty(doc, 5), to) << "from " << from;
    }
}

TEST_F(Display, DoubleClicksEnterEditOrAnnounceTheFormatArea)
{
    ASSERT_NE(Attach(), nullptr);
    Draw();
    EXPECT_TRUE(VELMDISPLAY_MouseDblClick(display, kWidth - 20, 10, VELMDISPLAY_BUTTON_PRIMARY));
    EXPECT_EQ(log.seen, std::vector<uint32_t>{VELMDISPLAY_EVENT_FORMATCLICK});
    EXPECT_FALSE(VELMDISPLAY_IsEditing(display));
    log.seen.clear();
    EXPECT_FALSE(VELMDISPLAY_MouseDblClick(display, 20, 10, 0)) << "only the primary button";
    EXPECT_TRUE(VELMDISPLAY_MouseDblClick(display, 20, 10, VELMDISPLAY_BUTTON_PRIMARY));
    EXPECT_TRUE(VELMDISPLAY_IsEditing(display));
    EXPECT_EQ(log.seen, (std::vector<uint32_t>{VELMDISPLAY_EVENT_BEFOREEDIT, VELMDISPLAY_EVENT_EDITSTARTED}));
    EXPECT_EQ(VELMDISPLAY_GetOptions(display), 0x1Au);
}

TEST_F(Display, AVetoKeepsItOutOfEditMode)
{
    ASSERT_NE(Attach(), nullptr);
    log.answer_before_edit = 0;
    EXPECT_FALSE(VELMDISPLAY_EnterEdit(display));
    EXPECT_FALSE(VELMDISPLAY_IsEditing(display));
    EXPECT_EQ(log.seen, std::vector<uint32_t>{VELMDISPLAY_EVENT_BEFOREEDIT});
}

TEST_F(Display, NewlineEscapeAndAPressLeaveEditMode)
{
    VELMAUDIO doc = Attach();
    ASSERT_NE(doc, nullptr);
    VELMAUDIO_SetDrawProperty(doc, 5, 0);
    VELMDISPLAY_Update(display);
    Draw();

    ASSERT_TRUE(VELMDISPLAY_EnterEdit(display));
    Type("1234");
    EXPECT_EQ(viewtest::compare_golden(Draw(), "display_edit_sample"), "");
    log.seen.clear();
    EXPECT_TRUE(VELMDISPLAY_KeyPressed(display, '\n'));
    EXPECT_FALSE(VELMDISPLAY_IsEditing(display));
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 1234);
    EXPECT_EQ(log.seen, std::vector<uint32_t>{VELMDISPLAY_EVENT_EDITENDED});

    ASSERT_TRUE(VELMDISPLAY_EnterEdit(display));
    Type("99");
    log.seen.clear();
    EXPECT_TRUE(VELMDISPLAY_KeyPressed(display, 27));
    EXPECT_FALSE(VELMDISPLAY_IsEditing(display));
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 1234) << "escape keeps the cursor";
    EXPECT_EQ(log.seen, std::vector<uint32_t>{VELMDISPLAY_EVENT_EDITENDED});

    ASSERT_TRUE(VELMDISPLAY_EnterEdit(display));
    Type("777");
    log.seen.clear();
    VELMDISPLAY_MouseDown(display, 200, 40, VELMDISPLAY_BUTTON_PRIMARY);
    EXPECT_FALSE(VELMDISPLAY_IsEditing(display));
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 777) << "a press applies typed text";
    EXPECT_EQ(log.seen, std::vector<uint32_t>{VELMDISPLAY_EVENT_EDITENDED});
    EXPECT_FALSE(VELMDISPLAY_KeyPressed(display, '1')) << "keys are ignored outside edit mode";
}

TEST_F(Display, TheBlinkTimerTogglesTheBlankBitOnlyInEditMode)
{
    ASSERT_NE(Attach(), nullptr);
    ASSERT_TRUE(VELMDISPLAY_EnterEdit(display));
    const uint32_t before = VELMDISPLAY_GetOptions(display) & VELMDISPLAY_OPTION_BLANK;
    ASSERT_TRUE(Settle([&] {
        return (VELMDISPLAY_GetOptions(display) & VELMDISPLAY_OPTION_BLANK) != before;
    }));
    EXPECT_NE(std::count(log.seen.begin(), log.seen.end(), VELMDISPLAY_EVENT_BLINK), 0);
    VELMDISPLAY_CancelEdit(display);
    // Destroying in edit mode must leave no timer behind to fire on freed memory.
    ASSERT_TRUE(VELMDISPLAY_EnterEdit(display));
    VELMDISPLAY_Destroy(display);
    display = nullptr;
    log.seen.clear();
    Settle([n = 0]() mutable { return ++n > 400; });
    EXPECT_EQ(std::count(log.seen.begin(), log.seen.end(), VELMDISPLAY_EVENT_BLINK), 0);
}

TEST_F(Display, SampleKeysTakeUpToTenDigits)
{
    VELMAUDIO doc = Attach();
    ASSERT_NE(doc, nullptr);
    VELMAUDIO_SetDrawProperty(doc, 5, 0);
    VELMDISPLAY_Update(display);
    EXPECT_TRUE(TypeFresh("0123456789"));
    EXPECT_EQ(VELMDISPLAY_GetEditValue(display), 123456789);
    EXPECT_FALSE(VELMDISPLAY_KeyPressed(display, '1')) << "an eleventh digit";
    EXPECT_FALSE(VELMDISPLAY_KeyPressed(display, '.'));
    EXPECT_FALSE(VELMDISPLAY_KeyPressed(display, 'a'));
    EXPECT_STREQ(VELMDISPLAY_GetEditText(display), "0123456789");
    EXPECT_TRUE(VELMDISPLAY_KeyPressed(display, '\b'));
    EXPECT_EQ(VELMDISPLAY_GetEditValue(display), 12345678);
    EXPECT_TRUE(TypeFresh("0"));
    EXPECT_FALSE(VELMDISPLAY_KeyPressed(display, '0')) << "a second leading zero";
    EXPECT_STREQ(VELMDISPLAY_GetEditText(display), "0");
}

TEST_F(Display, FrameKeysReadFramesAndAnOffsetBelowTheFrameLength)
{
    VELMAUDIO doc = Attach();
    ASSERT_NE(doc, nullptr);
    VELMAUDIO_SetDrawProperty(doc, 5, 2);
    VELMDISPLAY_Update(display);
    const int64_t length = VELMAUDIO_ScaleFrameLength(doc);
    ASSERT_GT(length, 1);
    for (char separator : {':', '.', '/', ' '}) {
        EXPECT_TRUE(TypeFresh(std::string("12") + separator + "1"));
        EXPECT_STREQ(VELMDISPLAY_GetEditText(display), "12/1");
        EXPECT_EQ(VELMDISPLAY_GetEditValue(display), 12 * length + 1);
    }
    EXPECT_TRUE(TypeFresh("3/"));
    const std::string too_big = std::to_string(length);
    bool refused = false;
    for (char c : too_big)
        refused = !VELMDISPLAY_KeyPressed(display, c) || refused;
    EXPECT_TRUE(refused || too_big.size() > 4) << "offset " << too_big << " is not below the frame length";
    EXPECT_FALSE(VELMDISPLAY_KeyPressed(display, 'x'));
    EXPECT_FALSE(TypeFresh("1/1/")) << "a second separator";
}

TEST_F(Display, TimeKeysLandOneSampleAfterTheTypedTime)
{
    VELMAUDIO doc = Attach();
    ASSERT_NE(doc, nullptr);
    VELMAUDIO_SetDrawProperty(doc, 5, 1);
    VELMDISPLAY_Update(display);
    struct Case {
        const char *text;
        int64_t value;
        uint32_t folds;
    };
    const Case cases[] = {
        {"1.5", 1 * kRate + 500 * kRate / 1000 + 1, 0x18},
        {"1.001", kRate + 1 * kRate / 1000 + 1, 0x18},
        {"999999", 999999LL * kRate + 1, 0x18},
        {"2:03.25", 123LL * kRate + 250 * kRate / 1000 + 1, 0x8},
        {"9999:59", (9999LL * 60 + 59) * kRate + 1, 0x8},
        {"1:02:03.004", 3723LL * kRate + 4 * kRate / 1000 + 1, 0},
        {"999:59:59", (999LL * 3600 + 59 * 60 + 59) * kRate + 1, 0},
    };
    for (const Case &c : cases) {
        EXPECT_TRUE(TypeFresh(c.text)) << c.text;
        EXPECT_EQ(VELMDISPLAY_GetEditValue(display), c.value) << c.text;
        EXPECT_EQ(VELMDISPLAY_GetOptions(display) & 0x18, c.folds) << c.text;
    }
    for (const char *refused : {"1000000", "10000:00", "1:60", "1:00:60", "1:60:00", "1000:00:00", "1:2:3:4",
                                "1.2.3", "1.0001", "1a"}) {
        EXPECT_FALSE(TypeFresh(refused)) << refused;
    }
    EXPECT_TRUE(TypeFresh("12"));
    EXPECT_FALSE(VELMDISPLAY_KeyPressed(display, '/'));
    EXPECT_STREQ(VELMDISPLAY_GetEditText(display), "12") << "a refused key changes nothing";
    EXPECT_EQ(VELMDISPLAY_GetEditValue(display), 12LL * kRate + 1);
    EXPECT_EQ(viewtest::compare_golden(Draw(), "display_edit_time"), "");
}

TEST_F(Display, HugeOrEndlessTypingIsRefusedNotWrapped)
{
    VELMAUDIO doc = Attach();
    ASSERT_NE(doc, nullptr);
    VELMAUDIO_SetDrawProperty(doc, 5, 2);
    VELMDISPLAY_Update(display);
    // Frames times the frame length past 64 bits.
    EXPECT_FALSE(TypeFresh(std::string(19, '9')));
    EXPECT_GE(VELMDISPLAY_GetEditValue(display), 0);
    // Text never grows past its buffer however long the typing goes on.
    VELMDISPLAY_CancelEdit(display);
    ASSERT_TRUE(VELMDISPLAY_EnterEdit(display));
    VELMDISPLAY_KeyPressed(display, '1');
    for (int i = 0; i < 3000; ++i)
        VELMDISPLAY_KeyPressed(display, '/');
    EXPECT_LE(std::string(VELMDISPLAY_GetEditText(display)).size(), 1023u);
}

TEST_F(Display, ADetachedDisplayFallsBackToTheEmptyReadOut)
{
    VELMAUDIO doc = Attach();
    ASSERT_NE(doc, nullptr);
    VELMAUDIO_SetCursorPosition(doc, 500);
    ASSERT_TRUE(VELMDISPLAY_EnterEdit(display));
    VELMDISPLAY_SetVelmAudio(display, nullptr);
    EXPECT_FALSE(VELMDISPLAY_IsEditing(display)) << "detaching leaves edit mode";
    VELMDISPLAY_Update(display);
    EXPECT_EQ(VELMDISPLAY_GetPosition(display), 0);
    EXPECT_TRUE(VELMDISPLAY_GetOptions(display) & VELMDISPLAY_OPTION_BLANK);
}

TEST_F(Display, FollowsADocumentPlayingThroughTheVirtualDevice)
{
    VELMPLAY_Initialize();
    soundtest::Setting device{"libvelm.playback.devicename", "Virtual Device"};
    soundtest::Setting speed{"libvelm.sound.virtual.speed", "8"};
    soundtest::Setting output{"libvelm.sound.virtual.playbackfile", dir.file("played.wav")};
    VELMAUDIO doc = Attach(1, 2.0);
    ASSERT_NE(doc, nullptr);
    VELMAUDIO_SetDrawProperty(doc, 5, 0);
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_RANGE, 0, VELMAUDIO_NumSamples(doc)));
    int64_t moving = -1;
    ASSERT_TRUE(Settle([&] {
        VELMDISPLAY_Update(display);
        const int64_t at = VELMDISPLAY_GetPosition(display);
        if (VELMAUDIO_GetPlayStatus(doc) && at > 0)
            moving = at;
        return moving > 0;
    }));
    EXPECT_TRUE(VELMDISPLAY_RedrawNeeded(display));
    const QImage playing = Draw();
    ASSERT_TRUE(Settle([&] { return VELMAUDIO_GetPlayStatus(doc) == 0; }));
    VELMDISPLAY_Update(display);
    EXPECT_TRUE(VELMDISPLAY_RedrawNeeded(display)) << "the stop changes the status";
    const QImage stopped = Draw();
    // The gradient pair changes with the play status.
    EXPECT_NE(playing.pixel(2, 2), stopped.pixel(2, 2));
    EXPECT_EQ(viewtest::compare_golden(stopped, "display_stopped"), "");
}

} // namespace
