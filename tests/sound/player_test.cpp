// Playback of a document through the virtual device: what comes out of the
// device, how playback ends, and what the document sees meanwhile.
#include "player_support.hpp"

#include "core/velmnavigation.h"
#include "edit/velmedit.h"
#include "edit/velmselection.h"

using namespace playtest;

namespace {

TEST_F(PlayerTest, ASelectionComesOutOfTheDeviceAsItIsStored)
{
    VELMAUDIO doc = Open(1, 1.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 2000, 6000));
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_SELECTIONS, 0, 0));
    EXPECT_TRUE(VELMAUDIO_IsPlaying(doc));
    EXPECT_EQ(VELMAUDIO_GetPlayStatus(doc), VELMPLAY_STATUS_PLAYING);
    ASSERT_TRUE(Gone(doc));

    const std::vector<float> played = Played();
    EXPECT_TRUE(Holds(played, 0, Samples(doc, 2000, 4000)));
    // What follows the selection is silence, never more of the signal.
    for (size_t i = 4000; i < played.size(); ++i) ASSERT_EQ(played[i], 0.0f) << i;

    // The ended stream took the player away from the update timer, which
    // moved the play cursor on its way and said so.
    EXPECT_EQ(events.Count(VELMPLAY_NOTIFY_START), 1);
    EXPECT_GE(events.Count(VELMPLAY_NOTIFY_POSITION), 1);
    EXPECT_EQ(events.Count(VELMPLAY_NOTIFY_DESTROYED), 1);
    ASSERT_FALSE(events.playCursor.empty());
    for (int64_t p : events.playCursor) {
        EXPECT_GE(p, 2000);
        EXPECT_LE(p, 6000);
    }
    EXPECT_FALSE(VELMAUDIO_IsPlaying(doc));
    EXPECT_FALSE(VELMAUDIO_PlayCursorVisible(doc));
}

TEST_F(PlayerTest, AnAbsurdDeviceBufferSettingStillPlays)
{
    VELMAUDIO doc = Open(1, 0.5);
    ASSERT_NE(doc, nullptr);
    for (const char *absurd : {"3600", "nan", "-1"}) {
        soundtest::Setting buffer{"libvelm.playback.osbuffersize", absurd};
        ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 1000, 3000)) << absurd;
        ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_SELECTIONS, 0, 0)) << absurd;
        EXPECT_EQ(VELMAUDIO_GetPlayStatus(doc), VELMPLAY_STATUS_PLAYING) << absurd;
        ASSERT_TRUE(Gone(doc)) << absurd;
        EXPECT_TRUE(Holds(Played(), 0, Samples(doc, 1000, 2000))) << absurd;
    }
}

TEST_F(PlayerTest, TwoSelectionsPlayAsTwoBlocksAndEnd)
{
    VELMAUDIO doc = Open(2, 1.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 1000, 2000));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 5000, 5500));
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_SELECTIONS, 0, 0));
    ASSERT_TRUE(Gone(doc));

    const std::vector<float> played = Played();
    EXPECT_TRUE(Holds(played, 0, Samples(doc, 1000, 1000)));
    EXPECT_TRUE(Holds(played, 2 * 1000, Samples(doc, 5000, 500)));
    // The play cursor jumped with the blocks: never inside the gap.
    for (int64_t p : events.playCursor) EXPECT_TRUE((p >= 1000 && p <= 2000) || (p >= 5000 && p <= 5500)) << p;
}

TEST_F(PlayerTest, ModesChooseTheRange)
{
    VELMAUDIO doc = Open(1, 1.0);
    ASSERT_NE(doc, nullptr);
    // Without selections mode 0 has nothing to play; unknown modes fail.
    EXPECT_FALSE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_SELECTIONS, 0, 0));
    EXPECT_FALSE(VELMAUDIO_PlayStart(doc, 7, 0, 0));
    EXPECT_FALSE(VELMAUDIO_PlayStart(nullptr, VELMPLAY_MODE_LIMITS, 0, 0));
    EXPECT_EQ(VELMAUDIO_Player(doc), nullptr);

    // A given range, from the cursor inside it.
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, 3000));
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_RANGE | VELMPLAY_FROM_CURSOR, 2000, 4000));
    ASSERT_TRUE(Gone(doc));
    std::vector<float> played = Played();
    EXPECT_TRUE(Holds(played, 0, Samples(doc, 3000, 1000)));
    for (size_t i = 1000; i < played.size(); ++i) ASSERT_EQ(played[i], 0.0f) << i;

    // Up to the cursor instead.
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_RANGE | VELMPLAY_TO_CURSOR, 2000, 4000));
    ASSERT_TRUE(Gone(doc));
    played = Played();
    EXPECT_TRUE(Holds(played, 0, Samples(doc, 2000, 1000)));
    for (size_t i = 1000; i < played.size(); ++i) ASSERT_EQ(played[i], 0.0f) << i;
}

TEST_F(PlayerTest, PlayingFromTheViewStopsPastItsRightEdge)
{
    soundtest::Setting slower{"libvelm.sound.virtual.speed", "4"};
    VELMAUDIO doc = Open(1, 4.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 0, 8000));
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_FROM_VIEW, 0, 0));
    ASSERT_TRUE(Gone(doc));
    // The whole signal is 32000 frames; playback stopped after 8000.
    const std::vector<float> played = Played();
    EXPECT_TRUE(Holds(played, 0, Samples(doc, 0, 8000)));
    EXPECT_LT(played.size(), 32000u);
    EXPECT_EQ(events.Count(VELMPLAY_NOTIFY_STOP), 1);
}

TEST_F(PlayerTest, PausingKeepsThePosition)
{
    VELMAUDIO doc = Open(1, 4.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS, 0, 0));
    VELMPLAYER player = VELMAUDIO_Player(doc);
    ASSERT_TRUE(soundtest::WaitFor([&] { return VELMPLAY_PlayPosition(player) > 4000; }));
    ASSERT_TRUE(VELMAUDIO_PlayPause(doc));
    EXPECT_TRUE(VELMAUDIO_IsPaused(doc));
    EXPECT_TRUE(VELMAUDIO_IsPlaying(doc)); // paused counts as playing
    EXPECT_FALSE(VELMAUDIO_PlayPause(doc));
    const int64_t held = VELMPLAY_PlayPosition(player);
    // Several updates later the position has not moved.
    const int updates = events.Count(VELMPLAY_NOTIFY_POSITION);
    ASSERT_TRUE(soundtest::WaitFor([&] { return events.Count(VELMPLAY_NOTIFY_POSITION) >= updates + 3; }));
    EXPECT_EQ(VELMPLAY_PlayPosition(player), held);
    EXPECT_EQ(VELMAUDIO_GetPlayCursorPosition(doc), held);

    ASSERT_TRUE(VELMAUDIO_PlayResume(doc));
    EXPECT_FALSE(VELMAUDIO_IsPaused(doc));
    EXPECT_FALSE(VELMAUDIO_PlayResume(doc));
    ASSERT_TRUE(Gone(doc));
    // Nothing was lost or repeated around the pause.
    EXPECT_TRUE(Holds(Played(), 0, Samples(doc, 0, 32000)));
    EXPECT_EQ(events.Count(VELMPLAY_NOTIFY_PAUSE), 1);
    EXPECT_EQ(events.Count(VELMPLAY_NOTIFY_RESUME), 1);
}

TEST_F(PlayerTest, RefusedAnnouncementsCancel)
{
    VELMAUDIO doc = Open(1, 4.0);
    ASSERT_NE(doc, nullptr);
    events.refuse = VELMPLAY_NOTIFY_START;
    EXPECT_FALSE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS, 0, 0));
    EXPECT_EQ(VELMAUDIO_Player(doc), nullptr);

    events.refuse = VELMPLAY_NOTIFY_PAUSE;
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS, 0, 0));
    EXPECT_FALSE(VELMAUDIO_PlayPause(doc));
    EXPECT_EQ(VELMAUDIO_GetPlayStatus(doc), VELMPLAY_STATUS_PLAYING);

    events.refuse = VELMPLAY_NOTIFY_STOP;
    EXPECT_FALSE(VELMAUDIO_PlayStop(doc));
    EXPECT_NE(VELMAUDIO_Player(doc), nullptr);
    // A running player that refuses to stop also keeps a new start away.
    EXPECT_FALSE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS, 0, 0));

    events.refuse = 0;
    ASSERT_TRUE(VELMAUDIO_PlayPause(doc));
    events.refuse = VELMPLAY_NOTIFY_RESUME;
    EXPECT_FALSE(VELMAUDIO_PlayResume(doc));
    EXPECT_TRUE(VELMAUDIO_IsPaused(doc));

    events.refuse = 0;
    EXPECT_TRUE(VELMAUDIO_PlayStop(doc));
    EXPECT_EQ(VELMAUDIO_Player(doc), nullptr);
    EXPECT_FALSE(VELMAUDIO_PlayStop(doc));
}

TEST_F(PlayerTest, SilentStartsAnnounceNothing)
{
    VELMAUDIO doc = Open(1, 0.5);
    ASSERT_NE(doc, nullptr);
    events.refuse = VELMPLAY_NOTIFY_START;
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS | VELMPLAY_SILENT | VELMPLAY_KEEP_CURSORS, 0, 0));
    ASSERT_TRUE(Gone(doc));
    for (uint32_t code : {VELMPLAY_NOTIFY_START, VELMPLAY_NOTIFY_POSITION, VELMPLAY_NOTIFY_DESTROYED, 0x2001D})
        EXPECT_EQ(events.Count(code), 0) << std::hex << code;
    EXPECT_TRUE(Holds(Played(), 0, Samples(doc, 0, 4000)));
}

TEST_F(PlayerTest, ClosingADocumentWhilePlayingEndsThePlayback)
{
    VELMAUDIO doc = Open(2, 4.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS, 0, 0));
    ASSERT_TRUE(soundtest::WaitFor([&] { return VELMAUDIO_GetPlayCursorPosition(doc) > 1000; }));

    // A modified document asks first; refusing resumes the playback.
    ASSERT_TRUE(VELMAUDIO_AppendSilence(doc, 100, nullptr));
    events.refuse = 0x20009;
    EXPECT_FALSE(VELMAUDIO_Close(doc));
    EXPECT_EQ(VELMAUDIO_GetPlayStatus(doc), VELMPLAY_STATUS_PLAYING);
    EXPECT_EQ(events.Count(VELMPLAY_NOTIFY_PAUSE), 1);
    EXPECT_EQ(events.Count(VELMPLAY_NOTIFY_RESUME), 1);

    // Agreeing closes it under the running device thread's feet, safely.
    events.refuse = 0;
    events.codes.clear();
    EXPECT_TRUE(VELMAUDIO_Close(doc));
    docs.clear();
    EXPECT_EQ(events.Count(VELMPLAY_NOTIFY_DESTROYED), 1);
    // What was played up to the close is the document's sound.
    EXPECT_GT(Played().size(), 1000u);
}

TEST_F(PlayerTest, AFormatChangeStopsThePlayback)
{
    VELMAUDIO doc = Open(2, 4.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS, 0, 0));
    events.refuse = VELMPLAY_NOTIFY_STOP;
    const _audio_format mono = AUDIO_InitFormat(kRate, 1, 16);
    // A player that refuses to stop keeps the format as it is.
    EXPECT_FALSE(VELMAUDIO_ChangeAudioFormat(doc, &mono, nullptr, nullptr, 0, 0, nullptr));
    EXPECT_EQ(VELMAUDIO_NumChannels(doc), 2);
    events.refuse = 0;
    EXPECT_TRUE(VELMAUDIO_ChangeAudioFormat(doc, &mono, nullptr, nullptr, 0, 0, nullptr));
    EXPECT_EQ(VELMAUDIO_Player(doc), nullptr);
    EXPECT_EQ(VELMAUDIO_NumChannels(doc), 1);
}

TEST_F(PlayerTest, UnloadingStopsThePlayback)
{
    VELMAUDIO doc = Open(1, 4.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS, 0, 0));
    VELMAUDIO_CloseEx(doc, 1);
    EXPECT_EQ(VELMAUDIO_Player(doc), nullptr);
    EXPECT_EQ(VELMAUDIO_GetAudioSignal(doc), nullptr);
    EXPECT_EQ(events.Count(VELMPLAY_NOTIFY_DESTROYED), 1);
}

} // namespace
