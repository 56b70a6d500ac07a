// Gestures on the objects drawn over a view: regions on a custom track,
// channel buttons of a playing document, the zoom box and the divider.
#include <gtest/gtest.h>

#include <cmath>
#include <memory>
#include <utility>
#include <vector>

#include "control/velmcontrol.h"
#include "control/velminput.h"
#include "core/document_internal.hpp"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "edit/velmcustomtrack.h"
#include "edit/velmregion.h"
#include "edit/velmselection.h"
#include "edit/velmundo.h"
#include "render/view/drawer_internal.hpp"
#include "render/view/velmoverlays.h"
#include "render/view/view_support.hpp"
#include "sound/sound_support.hpp"
#include "sound/velmplay.h"
#include "testaudio.hpp"
#include "widgets/guiapp.h"

namespace {

constexpr uint32_t kPrimary = 0x20, kAdd = 0x02, kExtend = 0x08, kBox = 0x80;

class Objects : public ::testing::Test {
protected:
    void SetUp() override
    {
        MakeGuiApplication();
        canvas = std::make_unique<viewtest::Canvas>(800, 520);
        doc = viewtest::open_audio(dir.file("a.wav"), viewtest::speech_like(8000, 2, 2.0), 8000, 2);
        ASSERT_NE(doc, nullptr);
        ASSERT_GE(VELMAUDIO_AddCustomTrack(doc, "words"), 0);
        ASSERT_TRUE(VELMAUDIO_ShowCustomTrack(doc, "words"));
        VELMAUDIO_SetDrawProperty(doc, 2, 0x3 | 0x4000);
        draw();
    }
    void TearDown() override { VELMAUDIO_Close(doc); }
    void draw() { ASSERT_TRUE(canvas->draw(doc)); }
    VELMDRAW drawer() const { return doc->renderer; }
    const velm::view::Lane &lane(int i) const { return drawer()->lanes[static_cast<size_t>(i)]; }
    int64_t sample_at(int x) const
    {
        return static_cast<int64_t>(std::floor(VELMDRAW_ConvertDisplayXtoRealX(drawer(), x - drawer()->display.left)));
    }
    _VELMRECT region_rect(const AUDIOREGION *region)
    {
        _VELMRECT r{};
        EXPECT_TRUE(VELMAUDIO_GetRegionDrawRect(doc, region, &r));
        return r;
    }
    void click(int x, int y, uint32_t flags)
    {
        ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x, y, 0));
        ASSERT_TRUE(VELMAUDIO_MouseDown(doc, x, y, flags));
        ASSERT_TRUE(VELMAUDIO_MouseUp(doc, x, y, flags));
    }

    velmtest::TempDir dir;
    std::unique_ptr<viewtest::Canvas> canvas;
    VELMAUDIO doc = nullptr;
};

TEST_F(Objects, RegionClicksSelectAndDragsMove)
{
    AUDIOREGION *first = VELMAUDIO_CreateRegionEx(doc, "words", 2000, 4000, "one", nullptr, VELMREGION_NO_UNDO);
    AUDIOREGION *second = VELMAUDIO_CreateRegionEx(doc, "words", 8000, 10000, "two", nullptr, VELMREGION_NO_UNDO);
    ASSERT_TRUE(first && second);
    draw();
    std::vector<std::pair<uint32_t, void *>> seen;
    auto record = [](const BLNotifyEvent *e, void *user) {
        if (e->event == 0x20039 || e->event == 0x2003A)
            static_cast<std::vector<std::pair<uint32_t, void *>> *>(user)->emplace_back(e->event, e->data1);
        return 1;
    };
    ASSERT_TRUE(VELMAUDIO_AddEventHandler(doc, record, &seen));
    const _VELMRECT a = region_rect(first), b = region_rect(second);
    const int y = a.top + a.height / 2;
    click(a.left + a.width / 2, y, kPrimary);
    EXPECT_TRUE(AUDIOREGION_IsSelected(first));
    ASSERT_TRUE(VELMAUDIO_MouseDblClick(doc, a.left + a.width / 2, y, kPrimary));
    using Seen = std::vector<std::pair<uint32_t, void *>>;
    EXPECT_EQ(seen, (Seen{{0x20039, first}, {0x2003A, first}}));
    ASSERT_TRUE(VELMAUDIO_DelEventHandler(doc, record, &seen));
    // The add modifier toggles; the region-to-selection one selects its audio.
    click(b.left + b.width / 2, y, kPrimary | kAdd);
    EXPECT_TRUE(AUDIOREGION_IsSelected(first));
    EXPECT_TRUE(AUDIOREGION_IsSelected(second));
    click(b.left + b.width / 2, y, kPrimary | kAdd);
    EXPECT_FALSE(AUDIOREGION_IsSelected(second));
    click(b.left + b.width / 2, y, kPrimary | 0x04);
    EXPECT_EQ(VELMAUDIO_SelectionBegin(doc), 8000);
    EXPECT_EQ(VELMAUDIO_SelectionEnd(doc), 10000);
    // Drag the first region 40 columns right.
    click(a.left + a.width / 2, y, kPrimary);
    const int x = a.left + a.width / 2;
    const int64_t shift = sample_at(x + 40) - sample_at(x);
    ASSERT_TRUE(VELMAUDIO_MouseDown(doc, x, y, kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x + 20, y, kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x + 40, y, kPrimary));
    EXPECT_TRUE(VELMAUDIO_IsInteracting(doc));
    ASSERT_TRUE(VELMAUDIO_MouseUp(doc, x + 40, y, kPrimary));
    EXPECT_EQ(VELMAUDIO_GetRegionBeginSample(doc, first), 2000 + shift);
    EXPECT_EQ(VELMAUDIO_GetRegionBeginSample(doc, second), 8000);
    // The whole drag is one undo step.
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(VELMAUDIO_GetRegionBeginSample(doc, first), 2000);
    EXPECT_FALSE(VELMAUDIO_Undo(doc));
    // The region's border drags alone.
    ASSERT_TRUE(VELMAUDIO_OffsetRegions(doc, shift));
    draw();
    const _VELMRECT moved = region_rect(first);
    const int right = moved.left + moved.width - 1;
    const int64_t end = VELMAUDIO_GetRegionEndSample(doc, first);
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, right, y, 0));
    ASSERT_TRUE(VELMAUDIO_MouseDown(doc, right, y, kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, right + 30, y, kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseUp(doc, right + 30, y, kPrimary));
    EXPECT_GT(VELMAUDIO_GetRegionEndSample(doc, first), end);
    EXPECT_EQ(VELMAUDIO_GetRegionBeginSample(doc, first), 2000 + shift);
}

TEST_F(Objects, ZoomBoxAndDivider)
{
    const _VELMRECT &a = lane(0).area;
    const int x0 = a.left + 100, x1 = a.left + 300, y = a.top + a.height / 2;
    const int64_t from = sample_at(x0), to = sample_at(x1);
    ASSERT_TRUE(VELMAUDIO_MouseDown(doc, x0, y, kPrimary | kBox | kAdd));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x1, y + 10, kPrimary | kBox | kAdd));
    EXPECT_EQ(doc->state->quickBox.width, x1 - x0 + 1);
    ASSERT_TRUE(VELMAUDIO_MouseUp(doc, x1, y + 10, kPrimary | kBox | kAdd));
    EXPECT_EQ(doc->state->quickBox.width, 0);
    EXPECT_NEAR(static_cast<double>(VELMAUDIO_ViewBegin(doc)), static_cast<double>(from), 30.0);
    EXPECT_NEAR(static_cast<double>(VELMAUDIO_ViewEnd(doc)), static_cast<double>(to), 30.0);
    // The divider strip between the lane kinds moves the pane height.
    draw();
    ASSERT_EQ(drawer()->dividers.count, 1);
    const _VELMRECT d = drawer()->dividers.rect[0];
    const int32_t height = VELMAUDIO_GetDrawProperty(doc, 6);
    const int dy = d.top + d.height / 2;
    ASSERT_TRUE(VELMAUDIO_MouseDown(doc, a.left + 50, dy, kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, a.left + 50, dy + 25, kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseUp(doc, a.left + 50, dy + 25, kPrimary));
    EXPECT_EQ(VELMAUDIO_GetDrawProperty(doc, 6), height + 25);
}

TEST_F(Objects, ChannelButtonsChangeThePlayersGains)
{
    soundtest::Setting device{"libvelm.playback.devicename", "Virtual Device"};
    soundtest::Setting speed{"libvelm.sound.virtual.speed", "8"};
    soundtest::Setting output{"libvelm.sound.virtual.playbackfile", dir.file("played.wav")};
    VELMPLAY_Initialize();
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS, 0, 0));
    ASSERT_TRUE(VELMAUDIO_PlayPause(doc)); // held, so that it still plays when asked
    ASSERT_TRUE(VELMAUDIO_ChangeChannelControlVisibility(doc, 0, 1, 1));
    draw();
    VELMPLAYER player = VELMAUDIO_Player(doc);
    const _VELMRECT &button = lane(0).buttons[0];
    const int x = button.left + button.width / 2, y = button.top + button.height / 2;
    ASSERT_DOUBLE_EQ(VELMPLAY_GetChannelGain(player, 0), 1.0);
    click(x, y, kPrimary);
    EXPECT_DOUBLE_EQ(VELMPLAY_GetChannelGain(player, 0), 0.0);
    click(x, y, kPrimary);
    EXPECT_DOUBLE_EQ(VELMPLAY_GetChannelGain(player, 0), 1.0);
    // The extend modifier wheels that channel alone, within [0, 1].
    ASSERT_TRUE(VELMAUDIO_MouseWheel(doc, x, y, -120.0, kExtend));
    EXPECT_NEAR(VELMPLAY_GetChannelGain(player, 0), 0.97, 1e-9);
    EXPECT_DOUBLE_EQ(VELMPLAY_GetChannelGain(player, 1), 1.0);
    ASSERT_TRUE(VELMAUDIO_MouseWheel(doc, x, y, 240.0, kExtend));
    EXPECT_DOUBLE_EQ(VELMPLAY_GetChannelGain(player, 0), 1.0);
    // Without it every channel follows.
    ASSERT_TRUE(VELMAUDIO_MouseWheel(doc, x, y, -120.0, 0));
    EXPECT_NEAR(VELMPLAY_GetChannelGain(player, 1), 0.97, 1e-9);
    // A double click plays the channel alone.
    ASSERT_TRUE(VELMAUDIO_MouseDblClick(doc, x, y, kPrimary));
    EXPECT_DOUBLE_EQ(VELMPLAY_GetChannelGain(player, 0), 1.0);
    EXPECT_DOUBLE_EQ(VELMPLAY_GetChannelGain(player, 1), 0.0);
    // The bottom cursor slider moves the play cursor while playing.
    // (The playback timer that shows the play cursor ticks in an event loop
    // this test does not run: it is shown by hand.)
    drawer()->config.playCursorDrawSlider = 1;
    VELMAUDIO_SetPlayCursorPosition(doc, 4000);
    doc->state->playCursor.shown = 1;
    draw();
    const _VELMRECT slider = drawer()->overlay.cursorSliders[1];
    ASSERT_GT(slider.width, 0);
    const int sx = slider.left + slider.width / 2, sy = slider.top + slider.height / 2;
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, sx, sy, 0));
    ASSERT_EQ(VELMCONTROL_GetMouseOverObject(drawer()), 0x8000401u);
    ASSERT_TRUE(VELMAUDIO_MouseDown(doc, sx, sy, kPrimary));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, sx + 100, sy, kPrimary));
    EXPECT_TRUE(VELMAUDIO_IsMovingPlayCursor(doc));
    ASSERT_TRUE(VELMAUDIO_MouseUp(doc, sx + 100, sy, kPrimary));
    EXPECT_EQ(VELMAUDIO_GetPlayCursorPosition(doc), sample_at(sx + 100));
    ASSERT_TRUE(VELMAUDIO_PlayStop(doc));
}

TEST_F(Objects, WheelOverTheScaleZoomsVertically)
{
    const _VELMRECT &scale = lane(0).vertScale;
    const double top = doc->state->vertMax;
    ASSERT_TRUE(VELMAUDIO_MouseWheel(doc, scale.left + scale.width / 2, scale.top + scale.height / 2, 120.0, 0));
    EXPECT_NEAR(doc->state->vertMax, top / 1.2, 1e-6);
    // A double click resets it.
    ASSERT_TRUE(VELMAUDIO_MouseDblClick(doc, scale.left + scale.width / 2, scale.top + scale.height / 2, kPrimary));
    EXPECT_DOUBLE_EQ(doc->state->vertMax, top);
}

} // namespace

namespace {

// The view drawn before the document's signal was replaced names regions
// that are gone: gestures over them must not reach them.
TEST_F(Objects, GesturesAfterTheSignalWasReplaced)
{
    AUDIOREGION *region = VELMAUDIO_CreateRegionEx(doc, "words", 2000, 4000, "one", nullptr, VELMREGION_NO_UNDO);
    ASSERT_NE(region, nullptr);
    draw();
    const _VELMRECT r = region_rect(region);
    const int x = r.left + r.width / 2, y = r.top + r.height / 2;
    AUDIOSIGNAL *copy = AUDIOSIGNAL_DuplicateEx(doc->signal, 0);
    ASSERT_NE(copy, nullptr);
    AUDIOSIGNAL_Destroy(VELMAUDIO_SetAudioSignal(doc, copy));
    ASSERT_TRUE(VELMAUDIO_MouseMove(doc, x, y, 0));
    EXPECT_EQ(VELMCONTROL_GetMouseOverObject(drawer()) & 0x70000u, 0u);
    click(x, y, kPrimary);
    ASSERT_TRUE(VELMAUDIO_MouseDblClick(doc, x, y, kPrimary));
    // Without a signal every gesture is refused.
    AUDIOSIGNAL *held = VELMAUDIO_SetAudioSignal(doc, nullptr);
    EXPECT_FALSE(VELMAUDIO_MouseDown(doc, x, y, kPrimary));
    EXPECT_FALSE(VELMAUDIO_MouseWheel(doc, x, y, 120.0, 0));
    EXPECT_FALSE(VELMAUDIO_AccKeyDown(doc, kAdd));
    VELMAUDIO_SetAudioSignal(doc, held);
    EXPECT_TRUE(VELMAUDIO_AccKeyDown(doc, kAdd));
}

} // namespace
