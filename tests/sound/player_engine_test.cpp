// The player itself: following the view's selections, speed, gains and
// their fade, effects, file players, waiting and the play cursor's moves.
#include "player_support.hpp"

#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "edit/velmselection.h"

using namespace playtest;

namespace {

constexpr uint32_t kVisible = 0x200000;

// Starts a player made by hand and links it, so that the document's
// queries and Gone() see it.
bool StartLinked(VELMAUDIO doc, VELMPLAYER player)
{
    return player && VELMPLAY_Start(player) && VELMAUDIO_LinkPlayer(doc, player);
}

TEST_F(PlayerTest, LoopOnSelectionPlaysTheChunksInTurn)
{
    soundtest::Setting loop{"libvelm.playback.looponaudioselection", "1"};
    VELMAUDIO doc = Open(1, 1.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, kVisible));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 1000, 2000));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 3000, 4000));
    ASSERT_TRUE(StartLinked(doc, VELMPLAY_CreatePlayer(doc, 0)));
    // Heard: the second chunk, then the first again.
    bool second = false;
    ASSERT_TRUE(soundtest::WaitFor([&] {
        for (int64_t p : events.positions) {
            if (p >= 3000) second = true;
            if (second && p < 2000) return true;
        }
        return false;
    }));
    ASSERT_TRUE(VELMAUDIO_PlayStop(doc));
    for (int64_t p : events.positions) EXPECT_TRUE((p >= 1000 && p <= 2000) || (p >= 3000 && p <= 4000)) << p;

    const std::vector<float> played = Played();
    const std::vector<float> first = Samples(doc, 1000, 1000);
    EXPECT_TRUE(Holds(played, 0, first));
    EXPECT_TRUE(Holds(played, 1000, Samples(doc, 3000, 1000)));
    EXPECT_TRUE(Holds(played, 2000, first));
}

TEST_F(PlayerTest, WithoutLoopTheSelectionEndsThePlayback)
{
    VELMAUDIO doc = Open(1, 1.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, kVisible));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 1000, 2000));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 3000, 4000));
    ASSERT_TRUE(StartLinked(doc, VELMPLAY_CreatePlayer(doc, 0)));
    ASSERT_TRUE(Gone(doc));
    const std::vector<float> played = Played();
    EXPECT_TRUE(Holds(played, 0, Samples(doc, 1000, 1000)));
    EXPECT_TRUE(Holds(played, 1000, Samples(doc, 3000, 1000)));
    for (size_t i = 2000; i < played.size(); ++i) ASSERT_EQ(played[i], 0.0f) << i;
}

TEST_F(PlayerTest, SpeedIsWholeAndLimited)
{
    VELMAUDIO doc = Open(1, 60.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, kVisible));
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, 240000));
    VELMPLAYER player = VELMPLAY_CreatePlayer(doc, 0);
    ASSERT_NE(player, nullptr);
    EXPECT_EQ(VELMPLAY_GetSpeed(player), 1.0f);
    ASSERT_TRUE(StartLinked(doc, player));
    // The reader takes a new speed at its next read.
    const std::pair<float, float> asked[] = {{2.7f, 2.0f}, {0.5f, 1.0f}, {-0.5f, -1.0f}, {-40.0f, -32.0f},
                                             {0.0f, 1.0f}, {40.0f, 32.0f}};
    for (auto [speed, taken] : asked) {
        ASSERT_TRUE(VELMPLAY_ChangeSpeed(player, speed));
        EXPECT_TRUE(soundtest::WaitFor([&] { return VELMPLAY_GetSpeed(player) == taken; })) << speed;
    }
    EXPECT_FALSE(VELMPLAY_ChangeSpeed(player, NAN));
    EXPECT_FALSE(VELMPLAY_ChangeSpeed(nullptr, 2.0f));
    EXPECT_EQ(VELMPLAY_GetSpeed(nullptr), 0.0f);
}

TEST_F(PlayerTest, SpeedTwoPlaysEverySecondSample)
{
    VELMAUDIO doc = Open(1, 1.0);
    ASSERT_NE(doc, nullptr);
    VELMPLAYER player = VELMPLAY_CreatePlayer(doc, 0);
    ASSERT_TRUE(VELMPLAY_SetPlayRange(player, 6000, 2000));
    ASSERT_TRUE(VELMPLAY_ChangeSpeed(player, 2.0f));
    ASSERT_TRUE(StartLinked(doc, player));
    EXPECT_FALSE(VELMPLAY_SetPlayRange(player, 0, 100)); // the stream is open
    ASSERT_TRUE(Gone(doc));
    const std::vector<float> all = Samples(doc, 2000, 4000);
    std::vector<float> every_second;
    for (size_t i = 0; i < all.size(); i += 2) every_second.push_back(all[i]);
    const std::vector<float> played = Played();
    EXPECT_TRUE(Holds(played, 0, every_second));
    for (size_t i = every_second.size(); i < played.size(); ++i) ASSERT_EQ(played[i], 0.0f) << i;
}

TEST_F(PlayerTest, ChannelGainsStayUnderTheMasterGain)
{
    VELMAUDIO doc = Open(2, 0.5);
    ASSERT_NE(doc, nullptr);
    VELMPLAYER player = VELMPLAY_CreatePlayer(doc, 0);
    ASSERT_NE(player, nullptr);
    for (int c = 0; c < 6; ++c) EXPECT_EQ(VELMPLAY_GetChannelGain(player, c), 1.0);
    ASSERT_TRUE(VELMPLAY_SetChannelGain(player, 0, 2.0));
    EXPECT_EQ(VELMPLAY_GetChannelGain(player, 0), 1.0);
    ASSERT_TRUE(VELMPLAY_SetMasterGain(player, 0.5));
    for (int c = 0; c < 6; ++c) EXPECT_EQ(VELMPLAY_GetChannelGain(player, c), 0.5);
    ASSERT_TRUE(VELMPLAY_SetChannelGain(player, 5, 0.8));
    EXPECT_EQ(VELMPLAY_GetChannelGain(player, 5), 0.5);
    ASSERT_TRUE(VELMPLAY_SetChannelGain(player, 1, 0.25));
    EXPECT_EQ(VELMPLAY_GetChannelGain(player, 1), 0.25);
    EXPECT_FALSE(VELMPLAY_SetChannelGain(player, 6, 0.0));
    EXPECT_FALSE(VELMPLAY_SetChannelGain(player, -1, 0.0));
    EXPECT_EQ(VELMPLAY_GetChannelGain(player, 6), 0.0);
    EXPECT_EQ(VELMPLAY_GetChannelGain(nullptr, 0), 0.0);

    // A half master gain halves what is heard.
    ASSERT_TRUE(VELMPLAY_SetChannelGain(player, 1, 0.5));
    ASSERT_TRUE(VELMPLAY_SetPlayRange(player, 0, 1000));
    ASSERT_TRUE(StartLinked(doc, player));
    ASSERT_TRUE(Gone(doc));
    std::vector<float> half = Samples(doc, 0, 1000);
    for (float &x : half) x *= 0.5f;
    EXPECT_TRUE(Holds(Played(), 0, half));
}

TEST_F(PlayerTest, AMutedChannelFallsSilentWithinFiftyMilliseconds)
{
    VELMAUDIO doc = Open(2, 1.0);
    ASSERT_NE(doc, nullptr);
    VELMPLAYER player = VELMPLAY_CreatePlayer(doc, 0);
    ASSERT_TRUE(VELMPLAY_SetPlayRange(player, 0, 4000));
    ASSERT_TRUE(VELMPLAY_SetChannelGain(player, 1, 0.0));
    ASSERT_TRUE(StartLinked(doc, player));
    ASSERT_TRUE(Gone(doc));
    const std::vector<float> played = Played(), stored = Samples(doc, 0, 4000);
    ASSERT_GE(played.size(), stored.size());
    const int fade = kRate / 20; // 50 ms
    for (int i = 0; i < 4000; ++i) {
        ASSERT_NEAR(played[2 * i], stored[2 * i], 1.5 / 32768) << i;
        const float right = played[2 * i + 1];
        if (i >= fade)
            ASSERT_EQ(right, 0.0f) << i;
        else
            ASSERT_LE(std::fabs(right), std::fabs(stored[2 * i + 1]) * (1.0 - double(i) / fade) + 2.0 / 32768) << i;
    }
    // Halfway through the fade the channel is still heard.
    float loudest = 0.0f;
    for (int i = fade / 4; i < fade / 2; ++i) loudest = std::max(loudest, std::fabs(played[2 * i + 1]));
    EXPECT_GT(loudest, 0.1f);
}

TEST_F(PlayerTest, TheChannelMaskMutesThePlayersChannels)
{
    VELMAUDIO doc = Open(2, 4.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, 0x10000));
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS, 0, 0));
    VELMPLAYER player = VELMAUDIO_Player(doc);
    ASSERT_TRUE(VELMAUDIO_SetChannelMask(doc, 0x1));
    EXPECT_EQ(VELMPLAY_GetChannelGain(player, 0), 1.0);
    EXPECT_EQ(VELMPLAY_GetChannelGain(player, 1), 0.0);
    ASSERT_TRUE(VELMAUDIO_SetChannelMask(doc, 0x3));
    EXPECT_EQ(VELMPLAY_GetChannelGain(player, 1), 1.0);
    EXPECT_TRUE(VELMAUDIO_PlayStop(doc));
}

TEST_F(PlayerTest, AnEffectChangesWhatIsHeard)
{
    VELMAUDIO doc = Open(1, 1.0);
    ASSERT_NE(doc, nullptr);
    VELMPLAYER player = VELMPLAY_CreatePlayer(doc, 0);
    EXPECT_FALSE(VELMPLAY_ChangeEffect(player, "nosuchstage[x=%d]", 1));
    // A path too wide to hold leaves the player without an effect.
    EXPECT_FALSE(VELMPLAY_ChangeEffect(player, "fmtconv[sr=%d,nc=%d]", 1000000, 64));
    EXPECT_EQ(VELMPLAY_GetOutputFormat(player).sampleRate, kRate);
    EXPECT_EQ(VELMPLAY_GetOutputFormat(player).numChannels, 1);
    // The second change reconfigures the first one's path.
    ASSERT_TRUE(VELMPLAY_ChangeEffect(player, "amplify[factor=%d]", 3));
    ASSERT_TRUE(VELMPLAY_ChangeEffect(player, "%s", "invert"));
    ASSERT_TRUE(VELMPLAY_SetPlayRange(player, 0, 2000));
    ASSERT_TRUE(StartLinked(doc, player));
    ASSERT_TRUE(Gone(doc));
    std::vector<float> inverted = Samples(doc, 0, 2000);
    for (float &x : inverted) x = -x;
    EXPECT_TRUE(Holds(Played(), 0, inverted));
}

TEST_F(PlayerTest, AnEffectThatChangesTheRateReachesTheDevice)
{
    VELMAUDIO doc = Open(1, 1.0, 200.0);
    ASSERT_NE(doc, nullptr);
    VELMPLAYER player = VELMPLAY_CreatePlayer(doc, 0);
    EXPECT_EQ(VELMPLAY_GetInputFormat(player).sampleRate, kRate);
    ASSERT_TRUE(VELMPLAY_ChangeEffect(player, "fmtconv[sr=%d]", 2 * kRate));
    EXPECT_EQ(VELMPLAY_GetOutputFormat(player).sampleRate, 2 * kRate);
    ASSERT_TRUE(VELMPLAY_SetPlayRange(player, 0, 4000));
    ASSERT_TRUE(StartLinked(doc, player));
    ASSERT_TRUE(soundtest::WaitFor([&] { return VELMPLAY_PlayPosition(player) >= 2000; }));
    EXPECT_LE(VELMPLAY_PlayPosition(player), 4000); // positions are the document's samples
    ASSERT_TRUE(Gone(doc));
    int rate = 0;
    const std::vector<float> played = velmtest::read_audio(playedFile, &rate);
    EXPECT_EQ(rate, 2 * kRate);
    // The resampled tone keeps its level.
    float peak = 0.0f;
    for (size_t i = 1000; i < 6000 && i < played.size(); ++i) peak = std::max(peak, std::fabs(played[i]));
    EXPECT_NEAR(peak, 0.5f, 0.02f);
    EXPECT_EQ(VELMPLAY_GetOutputFormat(nullptr).sampleRate, 0);
    EXPECT_EQ(VELMPLAY_GetInputFormat(nullptr).numChannels, 0);
}

TEST_F(PlayerTest, AFilePlayerPlaysAFile)
{
    const std::string path = dir.file("file.wav");
    const std::vector<float> tone = velmtest::sine(kRate, 2, 3000, 300.0, 0.4);
    ASSERT_TRUE(velmtest::write_audio(path, tone, kRate, 2));
    EXPECT_EQ(VELMPLAY_CreateFilePlayer(dir.file("missing.wav").c_str(), "AUTO", 0), nullptr);
    EXPECT_EQ(VELMPLAY_CreateFilePlayer(nullptr, "AUTO", 0), nullptr);
    VELMPLAYER player = VELMPLAY_CreateFilePlayer(path.c_str(), "AUTO", 0);
    ASSERT_NE(player, nullptr);
    EXPECT_EQ(VELMPLAY_GetInputFormat(player).numChannels, 2);
    ASSERT_TRUE(VELMPLAY_Start(player));
    // The update timer destroys it once the file has played.
    ASSERT_TRUE(soundtest::WaitFor([&] { return VELMPLAY_GetStatus(player) == 0; }));
    const std::vector<float> played = Played();
    ASSERT_GE(played.size(), tone.size());
    for (size_t i = 0; i < tone.size(); ++i) ASSERT_NEAR(played[i], tone[i], 1.5 / 32768) << i;
}

TEST_F(PlayerTest, AFilePlayerDestroyedWhileTheDeviceReadsLetsTheDeviceFinishFirst)
{
    // A long device buffer keeps the device thread reading the file while
    // the player goes away.
    soundtest::Setting buffer{"libvelm.playback.osbuffersize", "4"};
    const std::string path = dir.file("long.wav");
    ASSERT_TRUE(velmtest::write_audio(path, velmtest::sine(kRate, 2, kRate * 40, 300.0, 0.4), kRate, 2));
    for (int round = 0; round < 8; ++round) {
        VELMPLAYER player = VELMPLAY_CreateFilePlayer(path.c_str(), "AUTO", 0);
        ASSERT_NE(player, nullptr);
        ASSERT_TRUE(VELMPLAY_Start(player));
        EXPECT_TRUE(VELMPLAY_DestroyPlayer(player));
        EXPECT_EQ(VELMPLAY_GetStatus(player), 0);
    }
}

TEST_F(PlayerTest, WaitingRunsTheUpdatesUntilTheEnd)
{
    VELMAUDIO doc = Open(1, 4.0);
    ASSERT_NE(doc, nullptr);
    EXPECT_FALSE(VELMAUDIO_PlayWait(doc));
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 0, 6000));
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_SELECTIONS, 0, 0));
    EXPECT_TRUE(VELMAUDIO_PlayWait(doc));
    EXPECT_EQ(VELMAUDIO_Player(doc), nullptr);
    EXPECT_EQ(events.Count(VELMPLAY_NOTIFY_DESTROYED), 1);
    EXPECT_TRUE(Holds(Played(), 0, Samples(doc, 0, 6000)));

    // A position handler's 0 ends the wait and leaves the player playing.
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS, 0, 0));
    events.refuse = VELMPLAY_NOTIFY_POSITION;
    EXPECT_TRUE(VELMAUDIO_PlayWait(doc));
    EXPECT_NE(VELMAUDIO_Player(doc), nullptr);
    events.refuse = 0;
    EXPECT_TRUE(VELMAUDIO_PlayStop(doc));
}

int ticks = 0;
int CountTick(void *user)
{
    ++*static_cast<int *>(user);
    return 1;
}

TEST_F(PlayerTest, TheUpdateCanBeReplacedBeforeTheStart)
{
    VELMAUDIO doc = Open(1, 4.0);
    ASSERT_NE(doc, nullptr);
    VELMPLAYER player = VELMPLAY_CreatePlayer(doc, 0);
    int count = 0;
    ASSERT_TRUE(VELMPLAY_SetGUITimer(player, CountTick, &count));
    ASSERT_TRUE(StartLinked(doc, player));
    EXPECT_FALSE(VELMPLAY_SetGUITimer(player, CountTick, &ticks));
    ASSERT_TRUE(soundtest::WaitFor([&] { return count >= 3; }));
    // The shell's callback replaced the player's own update.
    EXPECT_EQ(events.Count(VELMPLAY_NOTIFY_POSITION), 0);
    EXPECT_EQ(ticks, 0);
    EXPECT_TRUE(VELMAUDIO_PlayStop(doc));
}

TEST_F(PlayerTest, ADestroyedPlayerIsRefused)
{
    VELMAUDIO doc = Open(1, 4.0);
    ASSERT_NE(doc, nullptr);
    VELMPLAYER player = VELMPLAY_CreatePlayer(doc, 0);
    ASSERT_TRUE(VELMPLAY_Start(player));
    EXPECT_FALSE(VELMPLAY_Start(player));
    EXPECT_TRUE(VELMPLAY_DestroyPlayer(player));
    EXPECT_FALSE(VELMPLAY_DestroyPlayer(player));
    EXPECT_FALSE(VELMPLAY_Stop(player));
    EXPECT_EQ(VELMPLAY_PlayPosition(player), -1);
    EXPECT_EQ(VELMPLAY_CreatePlayer(nullptr, 0), nullptr);
    EXPECT_FALSE(VELMAUDIO_LinkPlayer(doc, player));

    // A document links only its own player, and only one.
    VELMAUDIO other = Open(1, 1.0);
    ASSERT_NE(other, nullptr);
    VELMPLAYER mine = VELMPLAY_CreatePlayer(doc, 0), theirs = VELMPLAY_CreatePlayer(other, 0);
    EXPECT_FALSE(VELMAUDIO_LinkPlayer(doc, theirs));
    EXPECT_TRUE(VELMAUDIO_LinkPlayer(doc, mine));
    EXPECT_FALSE(VELMAUDIO_LinkPlayer(doc, mine));
    EXPECT_FALSE(VELMAUDIO_UnlinkPlayer(doc, theirs));
    EXPECT_EQ(VELMAUDIO_Player(doc), mine);
    EXPECT_TRUE(VELMAUDIO_UnlinkPlayer(doc, mine));
    EXPECT_EQ(VELMAUDIO_Player(doc), nullptr);
    // Players not linked anywhere go with their documents.
    EXPECT_EQ(VELMPLAY_GetStatus(theirs), VELMPLAY_STATUS_CREATED);
    EXPECT_TRUE(VELMAUDIO_Close(other));
    docs.pop_back();
    EXPECT_EQ(VELMPLAY_GetStatus(theirs), 0);
    EXPECT_EQ(VELMPLAY_GetStatus(mine), VELMPLAY_STATUS_CREATED);
    EXPECT_FALSE(VELMPLAY_SetChannelMask(nullptr, 0x3));
    EXPECT_FALSE(VELMPLAY_ChangeDevice(nullptr, "Virtual Device"));
}

TEST_F(PlayerTest, AHandlerMayDestroyThePlayerItIsToldAbout)
{
    VELMAUDIO doc = Open(1, 4.0);
    ASSERT_NE(doc, nullptr);
    struct Doom {
        uint32_t code;
    } doom{0};
    auto destroy = [](const BLNotifyEvent *event, void *user) {
        if (event->event == static_cast<Doom *>(user)->code)
            VELMPLAY_DestroyPlayer(static_cast<VELMPLAYER>(event->data1));
        return 1;
    };
    BLNOTIFY_AddHandler(VELMAUDIO_Dispatcher(doc), destroy, &doom);
    // Each call fails once its announcement took the player away.
    for (uint32_t code : {VELMPLAY_NOTIFY_START, VELMPLAY_NOTIFY_PAUSE, VELMPLAY_NOTIFY_RESUME, VELMPLAY_NOTIFY_STOP}) {
        doom.code = 0;
        VELMPLAYER player = VELMPLAY_CreatePlayer(doc, 0);
        ASSERT_NE(player, nullptr);
        if (code != VELMPLAY_NOTIFY_START) ASSERT_TRUE(VELMPLAY_Start(player));
        if (code == VELMPLAY_NOTIFY_RESUME) ASSERT_TRUE(VELMPLAY_Pause(player));
        doom.code = code;
        const int result = code == VELMPLAY_NOTIFY_START   ? VELMPLAY_Start(player)
                           : code == VELMPLAY_NOTIFY_PAUSE ? VELMPLAY_Pause(player)
                           : code == VELMPLAY_NOTIFY_RESUME ? VELMPLAY_Resume(player)
                                                            : VELMPLAY_Stop(player);
        EXPECT_EQ(result, 0) << code;
        EXPECT_EQ(VELMPLAY_GetStatus(player), 0) << code;
    }
    BLNOTIFY_DelHandler(VELMAUDIO_Dispatcher(doc), destroy, &doom);
}

TEST_F(PlayerTest, AHandlerOfTheCursorMovedByStopMayDestroyThePlayer)
{
    soundtest::Setting move{"libvelm.playback.movecursoronstop", "1"};
    VELMAUDIO doc = Open(1, 4.0);
    ASSERT_NE(doc, nullptr);
    VELMPLAYER player = VELMPLAY_CreatePlayer(doc, 0);
    ASSERT_NE(player, nullptr);
    ASSERT_TRUE(VELMPLAY_Start(player));
    // Stopping away from the start moves the cursor, and so tells the shell.
    ASSERT_TRUE(soundtest::WaitFor([&] { return VELMPLAY_PlayPosition(player) > 0; }));
    auto destroy = [](const BLNotifyEvent *event, void *user) {
        if (event->event == 0x2001C) VELMPLAY_DestroyPlayer(static_cast<VELMPLAYER>(user));
        return 1;
    };
    BLNOTIFY_AddHandler(VELMAUDIO_Dispatcher(doc), destroy, player);
    EXPECT_TRUE(VELMPLAY_Stop(player));
    EXPECT_EQ(VELMPLAY_GetStatus(player), 0);
    BLNOTIFY_DelHandler(VELMAUDIO_Dispatcher(doc), destroy, player);
}

TEST_F(PlayerTest, AStoppedPlayerIsNotRestartedOnAnotherDevice)
{
    soundtest::Plugged test_device{"libvelm.sound.testdevice", "1"};
    VELMAUDIO doc = Open(1, 4.0);
    ASSERT_NE(doc, nullptr);
    VELMPLAYER player = VELMPLAY_CreatePlayer(doc, 0);
    ASSERT_TRUE(VELMPLAY_Start(player));
    ASSERT_TRUE(VELMPLAY_Stop(player));
    EXPECT_FALSE(VELMPLAY_ChangeDevice(player, "Audio IO Test Device"));
    EXPECT_EQ(VELMPLAY_GetStatus(player), VELMPLAY_STATUS_STOPPED);
    EXPECT_FALSE(VELMPLAY_IsPlaying(player));
    EXPECT_TRUE(VELMPLAY_DestroyPlayer(player));
}

TEST_F(PlayerTest, MovesBeyondTheEndsStopThere)
{
    VELMAUDIO doc = Open(1, 1.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, kVisible));
    VELMPLAYER player = VELMPLAY_CreatePlayer(doc, 0);
    ASSERT_NE(player, nullptr);
    EXPECT_FALSE(VELMPLAY_Goto(nullptr, 0));
    EXPECT_FALSE(VELMPLAY_Offset(nullptr, 0));
    // The largest offsets land on the ends, whatever the position was.
    ASSERT_TRUE(VELMPLAY_Goto(player, 3000));
    ASSERT_TRUE(VELMPLAY_Offset(player, INT64_MAX));
    ASSERT_TRUE(VELMPLAY_Offset(player, -1000));
    ASSERT_TRUE(VELMPLAY_Start(player));
    ASSERT_TRUE(soundtest::WaitFor([&] { return VELMPLAY_GetStatus(player) == 0; }));
    EXPECT_TRUE(Holds(Played(), 0, Samples(doc, 7000, 1000)));

    player = VELMPLAY_CreatePlayer(doc, 0);
    ASSERT_NE(player, nullptr);
    ASSERT_TRUE(VELMPLAY_Goto(player, INT64_MIN));
    ASSERT_TRUE(VELMPLAY_Offset(player, INT64_MIN));
    ASSERT_TRUE(VELMPLAY_Offset(player, 2000));
    ASSERT_TRUE(VELMPLAY_Start(player));
    ASSERT_TRUE(soundtest::WaitFor([&] { return VELMPLAY_GetStatus(player) == 0; }));
    EXPECT_TRUE(Holds(Played(), 0, Samples(doc, 2000, 6000)));
}

TEST_F(PlayerTest, TheSameDeviceIsKept)
{
    VELMAUDIO doc = Open(1, 4.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS, 0, 0));
    VELMPLAYER player = VELMAUDIO_Player(doc);
    EXPECT_TRUE(VELMPLAY_ChangeDevice(player, "Virtual Device"));
    EXPECT_FALSE(VELMPLAY_ChangeDevice(player, nullptr));
    EXPECT_EQ(VELMPLAY_GetStatus(player), VELMPLAY_STATUS_PLAYING);
    EXPECT_TRUE(VELMAUDIO_PlayStop(doc));
}

TEST_F(PlayerTest, ThePlayCursorMovesOnlyForARunningPlayer)
{
    VELMAUDIO doc = Open(1, 8.0);
    ASSERT_NE(doc, nullptr);
    EXPECT_EQ(VELMAUDIO_SetPlayCursorPosition(doc, 100), -1);
    EXPECT_EQ(VELMAUDIO_UpdatePlayCursorPosition(doc, 100), -1);
    EXPECT_FALSE(VELMAUDIO_ShowPlayCursor(doc));

    ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, kVisible));
    ASSERT_TRUE(StartLinked(doc, VELMPLAY_CreatePlayer(doc, 0)));
    ASSERT_TRUE(soundtest::WaitFor([&] { return VELMAUDIO_GetPlayCursorPosition(doc) > 1000; }));
    ASSERT_TRUE(VELMAUDIO_PlayPause(doc));
    const int64_t shown = VELMAUDIO_GetPlayCursorPosition(doc);
    events.playCursor.clear();

    // The user moves it: playback goes there, the document says so.
    EXPECT_EQ(VELMAUDIO_SetPlayCursorPosition(doc, 40000), shown);
    EXPECT_EQ(VELMAUDIO_GetPlayCursorPosition(doc), 40000);
    EXPECT_EQ(VELMAUDIO_SetPlayCursorPosition(doc, 40000), 0);
    EXPECT_EQ(VELMAUDIO_UpdatePlayCursorPosition(doc, 40000), 0);
    EXPECT_EQ(VELMAUDIO_UpdatePlayCursorPosition(doc, 1 << 30), 40000); // clamped to the end
    EXPECT_EQ(VELMAUDIO_GetPlayCursorPosition(doc), 64000);
    EXPECT_EQ(VELMAUDIO_SetPlayCursorPosition(doc, 40000), 64000);
    EXPECT_EQ(events.playCursor, (std::vector<int64_t>{40000, 64000, 40000}));

    ASSERT_TRUE(VELMAUDIO_PlayResume(doc));
    ASSERT_TRUE(soundtest::WaitFor([&] { return VELMAUDIO_GetPlayCursorPosition(doc) > 42000; }));
    EXPECT_LT(VELMAUDIO_GetPlayCursorPosition(doc), 64000);
    ASSERT_TRUE(VELMAUDIO_PlayStop(doc));
    EXPECT_EQ(VELMAUDIO_SetPlayCursorPosition(doc, 100), -1);
    EXPECT_FALSE(VELMAUDIO_PlayCursorVisible(doc));
}

TEST_F(PlayerTest, PlaybackFollowsTheCursorTheUserMoves)
{
    VELMAUDIO doc = Open(1, 8.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, kVisible));
    ASSERT_TRUE(StartLinked(doc, VELMPLAY_CreatePlayer(doc, 0)));
    ASSERT_TRUE(soundtest::WaitFor([&] { return VELMAUDIO_GetPlayCursorPosition(doc) > 1000; }));
    ASSERT_LT(VELMAUDIO_GetPlayCursorPosition(doc), 30000);
    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, 50000));
    ASSERT_TRUE(soundtest::WaitFor([&] { return VELMAUDIO_GetPlayCursorPosition(doc) > 50000; }));
    ASSERT_TRUE(VELMAUDIO_PlayStop(doc));
}

TEST_F(PlayerTest, KeptCursorsAreNeverShown)
{
    VELMAUDIO doc = Open(1, 4.0);
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_LIMITS | VELMPLAY_KEEP_CURSORS, 0, 0));
    const int updates = events.Count(VELMPLAY_NOTIFY_POSITION);
    ASSERT_TRUE(soundtest::WaitFor([&] { return events.Count(VELMPLAY_NOTIFY_POSITION) >= updates + 3; }));
    EXPECT_FALSE(VELMAUDIO_PlayCursorVisible(doc));
    EXPECT_EQ(VELMAUDIO_SetPlayCursorPosition(doc, 100), -1);
    EXPECT_EQ(events.Count(0x2001D), 0);
    ASSERT_TRUE(VELMAUDIO_PlayStop(doc));
}

} // namespace
