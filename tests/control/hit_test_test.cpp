// The object under the pointer, hit-tested on a real drawn view: a stereo
// document with both lane kinds, a navigator and custom tracks.
#include <gtest/gtest.h>
#include <memory>
#include <vector>

#include "control/velmcontrol.h"
#include "core/document_internal.hpp"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "core/velmutil.h"
#include "edit/velmcustomtrack.h"
#include "edit/velmregion.h"
#include "edit/velmselection.h"
#include "render/view/drawer_internal.hpp"
#include "render/view/velmoverlays.h"
#include "render/view/view_support.hpp"
#include "sound/sound_support.hpp"
#include "sound/velmplay.h"
#include "testaudio.hpp"
#include "widgets/guiapp.h"

namespace {

constexpr uint32_t kBothKindsNavigator = 0x3 | 0x4000;

_VELMRECT rect(int left, int top, int width, int height)
{
    _VELMRECT r{};
    return *VELMUTIL_DefineRect(&r, left, top, width, height);
}

struct Seen {
    uint32_t code, old;
};

// Records each change of the object under the pointer; optionally rewrites it.
struct Listener {
    std::vector<Seen> seen;
    uint32_t rewrite = 0;
    static int handle(const BLNotifyEvent *e, void *user)
    {
        auto *self = static_cast<Listener *>(user);
        if (e->event != 0x20032) return 1;
        auto *code = static_cast<uint32_t *>(e->data1);
        self->seen.push_back({*code, *static_cast<uint32_t *>(e->data2)});
        if (self->rewrite) *code = self->rewrite;
        return 1;
    }
};

class HitTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        MakeGuiApplication();
        canvas = std::make_unique<viewtest::Canvas>(800, 520);
        doc = viewtest::open_audio(dir.file("a.wav"), viewtest::speech_like(8000, 2, 1.0), 8000, 2);
        ASSERT_NE(doc, nullptr);
        ASSERT_GE(VELMAUDIO_AddCustomTrack(doc, "words"), 0);
        ASSERT_TRUE(VELMAUDIO_ShowCustomTrack(doc, "default"));
        ASSERT_TRUE(VELMAUDIO_ShowCustomTrack(doc, "words"));
        draw(kBothKindsNavigator);
        ASSERT_NE(drawer(), nullptr);
        ASSERT_TRUE(VELMAUDIO_AddEventHandler(doc, Listener::handle, &listener));
    }
    void TearDown() override { VELMAUDIO_Close(doc); }

    void draw(uint32_t flags)
    {
        VELMAUDIO_SetDrawProperty(doc, 2, static_cast<int32_t>(flags));
        ASSERT_TRUE(canvas->draw(doc));
    }
    VELMDRAW drawer() const { return doc->renderer; }
    const velm::view::Lane &lane(int i) const { return drawer()->lanes[static_cast<size_t>(i)]; }
    uint32_t at(int x, int y)
    {
        EXPECT_TRUE(VELMCONTROL_SetPointer(drawer(), x, y));
        return VELMCONTROL_GetMouseOverObject(drawer());
    }
    static int mid_x(const _VELMRECT &r) { return r.left + r.width / 2; }
    static int mid_y(const _VELMRECT &r) { return r.top + r.height / 2; }
    // A column of a lane clear of its channel buttons.
    int lane_x(int i) const { return lane(i).area.left + 20; }

    velmtest::TempDir dir;
    std::unique_ptr<viewtest::Canvas> canvas;
    VELMAUDIO doc = nullptr;
    Listener listener;
};

TEST_F(HitTest, LanesAndTheirChannelSelectBands)
{
    for (int i = 0; i < 4; ++i) {
        const _VELMRECT &a = lane(i).area;
        const int band = a.height * 3 / 10;
        ASSERT_GT(band, 2) << i;
        const uint32_t plain = 0x3000u | static_cast<uint32_t>(i);
        EXPECT_EQ(at(lane_x(i), mid_y(a)), plain) << i;
        if (lane(i).channel == 0) {
            EXPECT_EQ(at(lane_x(i), a.top + 1), plain | 0x100000u) << i;
            EXPECT_EQ(at(lane_x(i), a.top + band - 1), plain | 0x100000u) << i;
            EXPECT_EQ(at(lane_x(i), a.top + band), plain) << i;
            EXPECT_EQ(at(lane_x(i), a.bottom - 1), plain) << i;
        } else {
            EXPECT_EQ(at(lane_x(i), a.bottom - 1), plain | 0x100000u) << i;
            EXPECT_EQ(at(lane_x(i), a.bottom - band + 1), plain | 0x100000u) << i;
            EXPECT_EQ(at(lane_x(i), a.bottom - band), plain) << i;
            EXPECT_EQ(at(lane_x(i), a.top + 1), plain) << i;
        }
    }
    // Lanes 0 and 1 are waveforms, 2 and 3 spectrograms; 4 and up the navigator.
    EXPECT_EQ(lane(2).kind, VELMDRAW_LANE_SPECTROGRAM);
    EXPECT_EQ(at(lane_x(4), mid_y(lane(4).area)) & 0xFFFF000u, 0x400000u);
}

TEST_F(HitTest, BandsWhilePlayingFollowTheChannelButtons)
{
    // Played through the virtual device, held paused.
    soundtest::Setting device{"libvelm.playback.devicename", "Virtual Device"};
    soundtest::Setting output{"libvelm.sound.virtual.playbackfile", dir.file("played.wav")};
    VELMPLAY_Initialize();
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS, 0, 0));
    ASSERT_TRUE(VELMAUDIO_PlayPause(doc));
    const _VELMRECT &a = lane(0).area;
    ASSERT_GT(a.height, 70);
    EXPECT_EQ(at(lane_x(0), a.top), 0x3000u);
    ASSERT_TRUE(VELMAUDIO_ChangeChannelControlVisibility(doc, 0, 1, 1));
    EXPECT_EQ(at(lane_x(0), a.top + 59), 0x103000u);
    EXPECT_EQ(at(lane_x(0), a.top + 60), 0x3000u);
    // Stopped, the plain band is back.
    ASSERT_TRUE(VELMAUDIO_PlayStop(doc));
    EXPECT_EQ(at(lane_x(0), a.top + 59), 0x3000u);
    EXPECT_EQ(at(lane_x(0), a.top), 0x103000u);
}

TEST_F(HitTest, VerticalScalesAndTheirKindBox)
{
    for (int i = 0; i < 4; ++i) {
        const _VELMRECT &s = lane(i).vertScale;
        const uint32_t scale = 0x4200u | static_cast<uint32_t>(i);
        EXPECT_EQ(at(mid_x(s), mid_y(s)), scale) << i;
        EXPECT_EQ(at(mid_x(s), s.top), scale | 0x4400u) << i;
        EXPECT_EQ(at(mid_x(s), s.top + 13), scale | 0x4400u) << i;
        EXPECT_EQ(at(mid_x(s), s.top + 14), scale) << i;
    }
}

TEST_F(HitTest, TimeScaleAndItsKindBox)
{
    const _VELMRECT &h = drawer()->horzScale;
    ASSERT_GT(h.width, 100);
    EXPECT_EQ(at(mid_x(h), mid_y(h)), 0x4100u);
    EXPECT_EQ(at(h.left, mid_y(h)), 0x4500u);
    EXPECT_EQ(at(h.left + 29, mid_y(h)), 0x4500u);
    EXPECT_EQ(at(h.left + 30, mid_y(h)), 0x4100u);
}

TEST_F(HitTest, DividerGrabsTwoPixelsOnEachSide)
{
    ASSERT_EQ(drawer()->dividers.count, 1);
    const _VELMRECT &d = drawer()->dividers.rect[0];
    const int x = lane_x(0);
    EXPECT_EQ(at(x, mid_y(d)), 0x201000u);
    // The rows around the strip belong to the lanes too; the strip's index
    // replaces the lane's.
    EXPECT_EQ(at(x, d.top - 2) & 0x200FFFu, 0x200000u);
    EXPECT_EQ(at(x, d.bottom + 2) & 0x200FFFu, 0x200000u);
    EXPECT_EQ(at(x, d.top - 3), 0x103001u);
    EXPECT_EQ(at(x, d.bottom + 3), 0x103002u);
}

TEST_F(HitTest, CustomTracksNameTheirSlot)
{
    int shown = 0;
    for (uint32_t t = 0; t < VELM_MAX_CUSTOM_TRACKS; ++t) {
        if (!drawer()->trackShown[t]) continue;
        ++shown;
        const _VELMRECT &a = drawer()->trackAreas[t];
        EXPECT_EQ(at(mid_x(a), mid_y(a)), 0x8000u | t) << t;
    }
    EXPECT_EQ(shown, 2);
    draw(kBothKindsNavigator | 0x800);
    const _VELMRECT &h = drawer()->horzScale;
    EXPECT_EQ(at(mid_x(h), mid_y(h)), 0x4100u); // the scale moved up under the lanes
}

TEST_F(HitTest, ChannelButtonsOnlyWhenVisible)
{
    const _VELMRECT &first = lane(0).buttons[0], &second = lane(0).buttons[1];
    EXPECT_EQ(at(mid_x(second), mid_y(second)), 0x3000u);
    ASSERT_TRUE(VELMAUDIO_ChangeChannelControlVisibility(doc, 0, 2, 1));
    // The second button of lane 0 names channel 1.
    EXPECT_EQ(at(mid_x(second), mid_y(second)), 0x2000001u);
    EXPECT_EQ(at(mid_x(first), mid_y(first)), 0x103000u);
    ASSERT_TRUE(VELMAUDIO_ChangeChannelControlVisibility(doc, 0, 1, 1));
    // The first button lies in channel 0's select band, which stays marked.
    EXPECT_EQ(at(mid_x(first), mid_y(first)), 0x2100000u);
}

TEST_F(HitTest, NavigatorStripAndItsBox)
{
    ASSERT_NE(drawer()->navigatorPosition, 0);
    const _VELMRECT strip = drawer()->navigator;
    _VELMRECT &box = drawer()->overlay.navigatorBox;
    box = rect(strip.left + strip.width / 3, strip.top + 3, strip.width / 3, strip.height - 6);
    const int y = mid_y(box);
    EXPECT_EQ(at(strip.left + 4, y), 0x400000u);
    EXPECT_EQ(at(box.left, y), 0x400002u);
    EXPECT_EQ(at(box.left + 2, y), 0x400002u);
    EXPECT_EQ(at(box.left + box.width - 1, y), 0x400003u);
    EXPECT_EQ(at(box.left + box.width - 2, y), 0x400003u);
    EXPECT_EQ(at(mid_x(box), y), 0x400000u);
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 1000, 3000));
    EXPECT_EQ(at(mid_x(box), y), 0x400001u);
    EXPECT_EQ(at(box.left + box.width + 4, y), 0x400000u);
}

TEST_F(HitTest, ViewKindButtonsComeFirst)
{
    draw(kBothKindsNavigator | 0x8000);
    for (uint32_t i = 0; i < 3; ++i) {
        const _VELMRECT &b = drawer()->buttons[i].rect;
        EXPECT_EQ(at(mid_x(b), mid_y(b)), 0x80000u | i) << i;
    }
}

TEST_F(HitTest, SmartZoomButtonWithinTheNavigatorStrip)
{
    draw(kBothKindsNavigator | 0x40000);
    const _VELMRECT &z = drawer()->zoomButton;
    ASSERT_GT(z.width, 0);
    ASSERT_TRUE(VELMUTIL_IsInsideRect(&drawer()->navigator, mid_x(z), mid_y(z)));
    EXPECT_EQ(at(mid_x(z), mid_y(z)), 0x800000u);
    EXPECT_EQ(at(z.left - 3, mid_y(z)), 0x400000u);
}

TEST_F(HitTest, SlidersBeforeTheLanes)
{
    auto &layout = drawer()->overlay;
    const _VELMRECT &a = lane(0).area;
    layout.cursorSliders[0] = rect(a.left + 100, a.top, 11, 12);
    layout.cursorSliders[1] = rect(a.left + 105, a.top + 6, 11, 12);
    const int x = a.left + 106;
    drawer()->state->cursor.shown = 0;
    EXPECT_EQ(at(x, a.top + 2), 0x103000u); // neither cursor shown
    drawer()->state->cursor.shown = 1;
    drawer()->state->playCursor.shown = 1;
    EXPECT_EQ(at(x, a.top + 2), 0x8000400u);
    EXPECT_EQ(at(x, a.top + 8), 0x8000401u); // the play cursor's handle wins

    layout.selectionSliderCount = 2;
    layout.selectionSliders[1].begin = rect(a.left + 200, a.top, 10, 10);
    layout.selectionSliders[1].end = rect(a.left + 205, a.top, 10, 10);
    EXPECT_EQ(at(a.left + 201, a.top + 3), 0x8000901u);
    EXPECT_EQ(at(a.left + 207, a.top + 3), 0x8000A01u);
}

TEST_F(HitTest, RegionsInsideCustomTracks)
{
    int track = 0;
    while (!drawer()->trackShown[static_cast<size_t>(track)]) ++track;
    const _VELMRECT &t = drawer()->trackAreas[static_cast<size_t>(track)];
    AUDIOREGION *gone = VELMAUDIO_CreateRegionEx(doc, "words", 100, 900, "gone", nullptr, VELMREGION_NO_UNDO);
    AUDIOREGION *kept = VELMAUDIO_CreateRegionEx(doc, "words", 1000, 2000, "kept", nullptr, VELMREGION_NO_UNDO);
    ASSERT_TRUE(gone && kept);
    ASSERT_TRUE(VELMAUDIO_DeleteRegionEx(doc, gone, 0));
    // Both entries cover the same pixels; the deleted one is passed over.
    velm::view::RegionEntry entries[2];
    entries[0].region = gone;
    entries[1].region = kept;
    entries[0].area = entries[1].area = rect(t.left + 100, t.top, 60, t.height);
    drawer()->regionLayer.entries = entries;
    drawer()->regionLayer.count = drawer()->regionLayer.capacity = 2;
    const int y = mid_y(t);
    EXPECT_EQ(at(t.left + 130, y), 0x18001u);
    EXPECT_EQ(at(t.left + 100, y), 0x28001u);
    EXPECT_EQ(at(t.left + 159, y), 0x48001u);
    EXPECT_EQ(at(t.left + 170, y), 0x8000u | static_cast<uint32_t>(track));
    drawer()->regionLayer = velm::view::RegionLayer{};
}

// A region nested in another is drawn over it, and it is the one the
// pointer finds there.
TEST_F(HitTest, NestedRegionIsFoundOverItsParent)
{
    AUDIOREGION *parent = VELMAUDIO_CreateRegionEx(doc, "words", 1000, 7000, "sentence", nullptr, VELMREGION_NO_UNDO);
    AUDIOREGION *child = VELMAUDIO_CreateRegionEx(doc, "words", 3000, 5000, "word", nullptr, VELMREGION_NO_UNDO);
    ASSERT_TRUE(parent && child);
    ASSERT_TRUE(AUDIOREGION_SetParent(child, parent));
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_EVERYTHING);
    draw(kBothKindsNavigator);
    _VELMRECT inner{}, outer{};
    ASSERT_TRUE(VELMAUDIO_GetRegionDrawRect(doc, child, &inner));
    ASSERT_TRUE(VELMAUDIO_GetRegionDrawRect(doc, parent, &outer));
    const velm::view::RegionLayer &layer = drawer()->regionLayer;
    auto region_at = [&](int x, int y) -> const AUDIOREGION * {
        const uint32_t code = at(x, y);
        const auto index = static_cast<int>(code & 0xFFFu);
        if (!(code & 0x70000u) || index >= layer.count) return nullptr;
        return layer.entries[index].region;
    };
    EXPECT_EQ(region_at(mid_x(inner), mid_y(inner)), child);
    EXPECT_EQ(region_at(inner.left, mid_y(inner)), child);
    EXPECT_EQ(region_at(outer.left + 20, mid_y(outer)), parent);
}

// The code holds 12 bits of entry index: a region past them must not be
// reported as another one.
TEST_F(HitTest, RegionCodeNeverNamesAnotherRegion)
{
    constexpr int kRegions = 4200;
    for (int i = 0; i < kRegions; ++i)
        ASSERT_NE(VELMAUDIO_CreateRegionEx(doc, "words", i, i + 1, nullptr, nullptr, VELMREGION_NO_UNDO), nullptr);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_EVERYTHING);
    draw(kBothKindsNavigator);
    const velm::view::RegionLayer &layer = drawer()->regionLayer;
    ASSERT_EQ(layer.count, kRegions);
    const int words = VELMAUDIO_FindCustomTrackId(doc, "words");
    const _VELMRECT &t = drawer()->trackAreas[static_cast<size_t>(words)];
    const int y = mid_y(t);
    int found = 0;
    for (int x = t.left; x <= t.right; ++x) {
        const uint32_t code = at(x, y);
        if (!(code & 0x70000u)) continue;
        ++found;
        const auto index = static_cast<int>(code & 0xFFFu);
        ASSERT_LT(index, layer.count) << x;
        const _VELMRECT &area = layer.entries[index].area;
        EXPECT_TRUE(x >= area.left && x <= area.right) << x << " names entry " << index;
    }
    EXPECT_GT(found, 0);
}

// Reverting to the saved file replaces the signal and its regions; until
// the next frame the pointer finds no region where the old ones were drawn.
TEST_F(HitTest, NoRegionFromARevertedSignal)
{
    AUDIOREGION *region = VELMAUDIO_CreateRegionEx(doc, "words", 1000, 5000, "unsaved", nullptr, VELMREGION_NO_UNDO);
    ASSERT_NE(region, nullptr);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_EVERYTHING);
    draw(kBothKindsNavigator);
    _VELMRECT r{};
    ASSERT_TRUE(VELMAUDIO_GetRegionDrawRect(doc, region, &r));
    const int x = mid_x(r), y = mid_y(r);
    EXPECT_EQ(at(x, y) & 0x70000u, 0x10000u);
    ASSERT_TRUE(VELMAUDIO_RevertToSaved(doc));
    EXPECT_EQ(at(x, y) & 0x70000u, 0u);
    draw(kBothKindsNavigator);
    EXPECT_EQ(at(x, y) & 0x70000u, 0u);
}

TEST_F(HitTest, ZoomLimitZonesAndHandles)
{
    const _VELMRECT &a = lane(0).area;
    const int y = mid_y(a);
    EXPECT_EQ(at(a.left + 2, y), 0x3000u);
    ASSERT_TRUE(VELMAUDIO_SetZoomLimits(doc, 2000, 6000));
    ASSERT_TRUE(VELMAUDIO_HasZoomLimit(doc));
    EXPECT_EQ(at(a.left + 2, y), 0x1003000u);
    EXPECT_EQ(at(a.right - 2, y), 0x1003000u);
    EXPECT_EQ(at(mid_x(a), y), 0x3000u);
    auto &handles = drawer()->overlay.zoomLimitHandles;
    handles[0] = rect(a.left, a.top, 9, a.height);
    EXPECT_EQ(at(a.left + 2, y), 0x1003000u); // handles need the control shown
    ASSERT_TRUE(VELMAUDIO_ChangeControlVisibility(doc, 2, 1));
    EXPECT_EQ(at(a.left + 2, y), 0x1003100u);
    handles[1] = rect(a.right - 8, a.top, 9, a.height);
    EXPECT_EQ(at(a.right - 2, y), 0x1003200u);
}

TEST_F(HitTest, DraggableSelectionUnderTheModifier)
{
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 2000, 4000));
    const int x = lane(0).area.left + static_cast<int>(VELMDRAW_ConvertRealXtoDisplayX(drawer(), 3000));
    const int y = mid_y(lane(0).area);
    velm::control::Interaction &c = drawer()->control;
    c.audioDragActive = 1;
    EXPECT_EQ(at(x, y), 0x3000u);
    c.keyState = 4;
    EXPECT_EQ(at(x, y), 0x4003000u);
    EXPECT_NE(c.selectionUnderPointer, nullptr);
    EXPECT_EQ(at(lane(0).area.left + 2, y), 0x3000u); // before the selection
    EXPECT_EQ(c.selectionUnderPointer, nullptr);
}

TEST_F(HitTest, ChangesAreAnnouncedWhileNoButtonIsHeld)
{
    const _VELMRECT &a = lane(1).area, &h = drawer()->horzScale;
    listener.seen.clear();
    at(lane_x(1), mid_y(a));
    at(lane_x(1) + 5, mid_y(a)); // the same object: nothing new
    ASSERT_EQ(listener.seen.size(), 1u);
    const uint32_t before = listener.seen[0].old;
    EXPECT_EQ(listener.seen[0].code, 0x3001u);

    at(mid_x(h), mid_y(h));
    ASSERT_EQ(listener.seen.size(), 2u);
    EXPECT_EQ(listener.seen[1].code, 0x4100u);
    EXPECT_EQ(listener.seen[1].old, 0x3001u);
    EXPECT_NE(before, 0x3001u);

    // A handler's rewrite is what is kept.
    listener.rewrite = 0x77u;
    EXPECT_EQ(at(lane_x(1), mid_y(a)), 0x77u);
    listener.rewrite = 0;

    // A held button keeps the code fresh but quiet.
    drawer()->control.buttonReleased = 0;
    const size_t count = listener.seen.size();
    EXPECT_EQ(at(mid_x(h), mid_y(h)), 0x4100u);
    EXPECT_EQ(listener.seen.size(), count);
}

TEST_F(HitTest, EveryDrawRefreshesTheCode)
{
    EXPECT_EQ(at(lane_x(0), mid_y(lane(0).area)), 0x3000u);
    listener.seen.clear();
    // Spectrograms only: the same pixel now lies over the spectrogram of channel 0.
    draw(0x2 | 0x4000);
    EXPECT_EQ(VELMCONTROL_GetMouseOverObject(drawer()) & 0xFFFFFu, 0x3002u);
    ASSERT_EQ(listener.seen.size(), 1u);
    EXPECT_EQ(listener.seen[0].old, 0x3000u);
}

TEST_F(HitTest, RefusesNullAndReentry)
{
    EXPECT_EQ(VELMCONTROL_SetPointer(nullptr, 1, 1), 0);
    EXPECT_EQ(VELMCONTROL_UpdateMouseOverObject(nullptr), 0);
    const uint32_t code = at(lane_x(0), mid_y(lane(0).area));
    drawer()->control.busy = 1;
    EXPECT_EQ(VELMCONTROL_SetPointer(drawer(), 0, 0), 0);
    drawer()->control.busy = 0;
    EXPECT_EQ(VELMCONTROL_GetMouseOverObject(drawer()), code);
    EXPECT_EQ(at(-100000, 1 << 30), 0u);
}

} // namespace
