// The play cursor as the view shows it, and the channel displays' mute
// indicators, which follow the renderer's layout.
#include <gtest/gtest.h>

#include <QCoreApplication>

#include <string>

#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "sound/sound_support.hpp"
#include "sound/velmplay.h"
#include "testaudio.hpp"
#include "view_support.hpp"

namespace {

constexpr int kRate = 8000;

// Control bits of the first seven slots, two bits each, slot 0 lowest.
uint32_t indicators(VELMAUDIO doc)
{
    uint32_t bits = 0;
    for (int slot = 0; slot < 7; ++slot)
        for (uint32_t control = 1; control <= 2; ++control)
            if (VELMAUDIO_IsChannelControlVisible(doc, slot, control)) bits |= control << (2 * slot);
    return bits;
}

class PlayCursor : public ::testing::Test {
protected:
    VELMAUDIO open(int channels)
    {
        const std::string path = dir.file("tone" + std::to_string(channels) + ".wav");
        if (!velmtest::write_audio(path, viewtest::speech_like(kRate, channels, 1.0), kRate, channels)) return nullptr;
        VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO");
        if (doc) docs.push_back(doc);
        return doc;
    }
    void TearDown() override
    {
        for (VELMAUDIO doc : docs) VELMAUDIO_Close(doc);
    }

    velmtest::TempDir dir;
    std::vector<VELMAUDIO> docs;
};

TEST_F(PlayCursor, HiddenUntilPlaybackShowsIt)
{
    VELMAUDIO doc = open(1);
    ASSERT_NE(doc, nullptr);
    EXPECT_EQ(VELMAUDIO_GetPlayCursorPosition(doc), -1);
    EXPECT_EQ(VELMAUDIO_PlayCursorVisible(doc), 0);
    EXPECT_EQ(VELMAUDIO_HidePlayCursor(doc), 1);
    EXPECT_EQ(VELMAUDIO_GetPlayCursorPosition(nullptr), -1);
    EXPECT_EQ(VELMAUDIO_PlayCursorVisible(nullptr), 0);
    EXPECT_EQ(VELMAUDIO_HidePlayCursor(nullptr), 0);
}

TEST_F(PlayCursor, MuteIndicatorsNeedARenderer)
{
    VELMAUDIO doc = open(2);
    ASSERT_NE(doc, nullptr);
    EXPECT_EQ(VELMAUDIO_UpdateMuteChannelControlsVisibility(doc, 1), 0);
    EXPECT_EQ(indicators(doc), 0u);
    EXPECT_EQ(VELMAUDIO_UpdateMuteChannelControlsVisibility(nullptr, 1), 0);
}

TEST_F(PlayCursor, MuteIndicatorsFollowTheWaveformDisplays)
{
    viewtest::ensure_application();
    VELMAUDIO stereo = open(2), mono = open(1);
    ASSERT_NE(stereo, nullptr);
    ASSERT_NE(mono, nullptr);
    viewtest::Canvas canvas(640, 400);
    for (VELMAUDIO doc : {stereo, mono}) {
        ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, 0x3 | 0x10000));
        ASSERT_TRUE(canvas.draw(doc));
    }

    // Stereo, both kinds: the first channel's display shows indicator 1, the
    // second's indicator 2; spectrogram and navigator displays none.
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(stereo, 1));
    EXPECT_EQ(indicators(stereo), 0x1u | (0x2u << 2));
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(mono, 1));
    EXPECT_EQ(indicators(mono), 0x1u);

    // Nothing plays, so an unforced refresh takes every indicator away.
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(stereo, 0));
    EXPECT_EQ(indicators(stereo), 0u);

    // With one active channel only its display carries indicator 1.
    ASSERT_TRUE(VELMAUDIO_SetChannelMask(stereo, 0x2));
    ASSERT_TRUE(canvas.draw(stereo));
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(stereo, 1));
    EXPECT_EQ(indicators(stereo), 0x1u << 2);

    // Without waveform displays the indicators are left as they are.
    ASSERT_TRUE(VELMAUDIO_ClrDrawOption(stereo, 0x1));
    ASSERT_TRUE(canvas.draw(stereo));
    ASSERT_TRUE(VELMAUDIO_ChangeChannelControlVisibility(stereo, 3, 2, 1));
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(stereo, 0));
    EXPECT_EQ(indicators(stereo), (0x1u << 2) | (0x2u << 6));
}

// Plays a document through the virtual device, held paused with the play
// cursor at a known sample.
class Playing : public PlayCursor {
protected:
    static void SetUpTestSuite() { VELMPLAY_Initialize(); }

    // With an application object the timers tick through Qt's event loop.
    bool play_paused(VELMAUDIO doc, int64_t at)
    {
        return VELMAUDIO_PlayStart(doc, 1, 0, 0) && soundtest::WaitFor([&] {
                   QCoreApplication::processEvents();
                   return VELMAUDIO_PlayCursorVisible(doc) != 0;
               }) &&
               VELMAUDIO_PlayPause(doc) && VELMAUDIO_SetPlayCursorPosition(doc, at) >= 0;
    }

    soundtest::Setting device{"libvelm.playback.devicename", "Virtual Device"};
    soundtest::Setting output{"libvelm.sound.virtual.playbackfile", dir.file("played.wav")};
};

TEST_F(Playing, MuteIndicatorsFollowThePlayersGains)
{
    viewtest::ensure_application();
    VELMAUDIO doc = open(2);
    ASSERT_NE(doc, nullptr);
    viewtest::Canvas canvas(640, 400);
    ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, 0x1 | 0x10000));
    ASSERT_TRUE(canvas.draw(doc));
    ASSERT_TRUE(play_paused(doc, 4000));
    VELMPLAYER player = VELMAUDIO_Player(doc);
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(doc, 0));
    EXPECT_EQ(indicators(doc), 0u);

    // The second channel muted: its display shows indicator 2.
    ASSERT_TRUE(VELMPLAY_SetChannelGain(player, 1, 0.0));
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(doc, 0));
    EXPECT_EQ(indicators(doc), 0x2u << 2);
    ASSERT_TRUE(VELMPLAY_SetChannelGain(player, 0, 0.0));
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(doc, 0));
    EXPECT_EQ(indicators(doc), 0x1u | (0x2u << 2));

    // Hiding the play cursor at the end of playback takes them away.
    ASSERT_TRUE(VELMAUDIO_PlayStop(doc));
    EXPECT_EQ(indicators(doc), 0u);
}

TEST_F(Playing, GainButtonsShowEachChannelsGain)
{
    viewtest::ensure_application();
    VELMAUDIO doc = open(2);
    ASSERT_NE(doc, nullptr);
    viewtest::Canvas canvas(640, 400);
    ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, 0x1 | 0x10000));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage still = canvas.output();
    ASSERT_TRUE(play_paused(doc, 4000));
    VELMPLAYER player = VELMAUDIO_Player(doc);
    ASSERT_TRUE(VELMPLAY_SetChannelGain(player, 0, 0.0));
    ASSERT_TRUE(VELMPLAY_SetChannelGain(player, 1, 0.5));
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(doc, 1));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage playing = canvas.output();
    EXPECT_EQ(viewtest::compare_golden(playing, "playing_gain_buttons"), "");

    // The buttons sit at the lanes' right ends, the first channel's at the
    // top, the second's at the bottom, darker than the view under them.
    auto darkened = [&](int left, int top) {
        int n = 0;
        for (int y = top; y < top + 30; ++y)
            for (int x = left; x < left + 40; ++x) n += qGray(playing.pixel(x, y)) < qGray(still.pixel(x, y));
        return n;
    };
    EXPECT_GT(darkened(530, 10), 600);
    EXPECT_GT(darkened(530, 338), 600);
    EXPECT_EQ(darkened(400, 338), 0);

    // Stopped, the frame carries no buttons again.
    ASSERT_TRUE(VELMAUDIO_PlayStop(doc));
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_EQ(viewtest::count_differences(canvas.output(), still), 0);
}

TEST_F(Playing, ThePlayCursorDrawsWhereTheUserPutsIt)
{
    viewtest::ensure_application();
    VELMAUDIO doc = open(1);
    ASSERT_NE(doc, nullptr);
    viewtest::Canvas canvas(640, 400);
    ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, 0x1));
    ASSERT_TRUE(play_paused(doc, 2000));
    ASSERT_TRUE(canvas.draw(doc));
    const QImage early = canvas.output();
    EXPECT_EQ(VELMAUDIO_SetPlayCursorPosition(doc, 6000), 2000);
    ASSERT_TRUE(canvas.draw(doc));
    EXPECT_GT(viewtest::count_differences(canvas.output(), early), 100);
    ASSERT_TRUE(VELMAUDIO_PlayStop(doc));
}

} // namespace
