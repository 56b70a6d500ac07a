// Signals: creation, format, stamps, hash, channel masks, memory and read access.
#include <atomic>
#include <cstring>
#include <thread>

#include "outside/base/blbase.h"
#include "store_test_support.hpp"

using namespace store_test;

namespace {

TEST(SignalStoreSignal, NewSignalsCheckTheirFormat)
{
    AUDIO_FORMAT format = format_of(2, 48000);
    AUDIOSIGNAL *signal = AUDIOSIGNAL_New(&format);
    ASSERT_NE(signal, nullptr);
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(signal), 0);
    EXPECT_EQ(AUDIOSIGNAL_NumChannels(signal), 2);
    EXPECT_EQ(AUDIOSIGNAL_SampleRate(signal), 48000);
    EXPECT_EQ(AUDIOSIGNAL_GetActiveChannelMask(signal), 3u);
    EXPECT_EQ(AUDIOSIGNAL_Destroy(signal), 1);

    AUDIO_FORMAT bad = format_of(0);
    EXPECT_EQ(AUDIOSIGNAL_New(&bad), nullptr);
    bad = format_of(33);
    EXPECT_EQ(AUDIOSIGNAL_New(&bad), nullptr);
    bad = format_of(1, 0);
    EXPECT_EQ(AUDIOSIGNAL_NewEx(&bad), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_New(nullptr), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_CreateSilence(&format, -1), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_Destroy(nullptr), 0);
}

TEST(SignalStoreSignal, NullHandlesGiveFailureValues)
{
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(nullptr), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetTimeStamp(nullptr, 0), 0u);
    EXPECT_EQ(AUDIOSIGNAL_HasChanges(nullptr), 0);
    EXPECT_EQ(AUDIOSIGNAL_TryReadAccess(nullptr), 0);
    EXPECT_EQ(AUDIOSIGNAL_DuplicateEx(nullptr, 0), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetChannelSamples(nullptr, 0, 0, nullptr, 1), -1);
    EXPECT_EQ(AUDIOSIGNAL_ClearEx(nullptr, 0, 0, 1), 0);
    EXPECT_EQ(AUDIOSIGNAL_SizeInMemory(nullptr), 0);
    AUDIOSIGNAL_HASH hash;
    EXPECT_EQ(AUDIOSIGNAL_GetSignalHash(&hash, nullptr), nullptr);
}

TEST(SignalStoreSignal, SilenceTakesNoSampleMemory)
{
    AUDIO_FORMAT format = format_of(2);
    AUDIOSIGNAL *signal = AUDIOSIGNAL_CreateSilence(&format, 44100 * 600);
    ASSERT_NE(signal, nullptr);
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(signal), 44100 * 600);
    EXPECT_LT(AUDIOSIGNAL_SizeInMemory(signal), 1 << 20);
    float lo = 1, hi = -1;
    EXPECT_EQ(AUDIOSIGNAL_GetChannelMinMax(signal, 1, 0, AUDIOSIGNAL_END, &lo, &hi), 1);
    EXPECT_EQ(lo, 0.0f);
    EXPECT_EQ(hi, 0.0f);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreSignal, AbsurdSilenceLengthsFailAndChangeNothing)
{
    AUDIO_FORMAT format = format_of(1);
    EXPECT_EQ(AUDIOSIGNAL_CreateSilence(&format, AUDIOSIGNAL_END), nullptr);
    AUDIOSIGNAL *signal = make_signal(random_channels(1, 1000, 5));
    const uint64_t stamp = AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_CHANGES);
    // Both the overflowing and the merely enormous length are refused.
    EXPECT_EQ(AUDIOSIGNAL_AppendSilence(signal, AUDIOSIGNAL_END - 500), -1);
    EXPECT_EQ(AUDIOSIGNAL_AppendSilence(signal, int64_t(1) << 50), -1);
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(signal), 1000);
    EXPECT_EQ(AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_CHANGES), stamp);
    // A day of silence at 96 kHz is not absurd.
    EXPECT_EQ(AUDIOSIGNAL_AppendSilence(signal, int64_t(96000) * 86400), int64_t(96000) * 86400);
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(signal), 1000 + int64_t(96000) * 86400);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreSignal, ChangeStampsMoveWithEveryChange)
{
    AUDIOSIGNAL *signal = make_signal(random_channels(1, 5000, 1));
    const uint64_t before = AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_CHANGES);
    AUDIOSIGNAL_ResetChanges(signal);
    EXPECT_EQ(AUDIOSIGNAL_HasChanges(signal), 0);
    ASSERT_EQ(AUDIOSIGNAL_SilenceEx(signal, AUDIOSIGNAL_FLAG_SERIES, 10, 20), 1);
    const uint64_t after = AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_CHANGES);
    EXPECT_GT(after, before);
    EXPECT_EQ(AUDIOSIGNAL_HasChanges(signal), 1);
    AUDIOSIGNAL_ResetChanges(signal);
    EXPECT_EQ(AUDIOSIGNAL_HasChanges(signal), 0);

    EXPECT_EQ(AUDIOSIGNAL_NotifyChange(signal, AUDIOSIGNAL_CHANGED_REGIONS), 1);
    EXPECT_GT(AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_CHANGES), after);
    EXPECT_EQ(AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_REGIONS),
              AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_CHANGES));
    EXPECT_EQ(AUDIOSIGNAL_NotifyChange(signal, 0), 0);

    const uint64_t relabelled = AUDIOSIGNAL_GetTimeStamp(signal, 0);
    EXPECT_EQ(AUDIOSIGNAL_SetSampleRate(signal, 22050), 1);
    EXPECT_EQ(AUDIOSIGNAL_SampleRate(signal), 22050);
    EXPECT_GT(AUDIOSIGNAL_GetTimeStamp(signal, 0), relabelled);
    EXPECT_EQ(AUDIOSIGNAL_SetSampleRate(signal, 0), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_FILE), 0u);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreSignal, HashFollowsTheSamples)
{
    const Channels samples = random_channels(2, 20000, 2);
    AUDIOSIGNAL *a = make_signal(samples);
    AUDIOSIGNAL *b = make_signal(samples);
    EXPECT_EQ(AUDIOSIGNAL_HasValidHash(a), 0);
    AUDIOSIGNAL_HASH ha, hb;
    ASSERT_EQ(AUDIOSIGNAL_GetSignalHash(&ha, a), &ha);
    EXPECT_EQ(AUDIOSIGNAL_HasValidHash(a), 1);
    ASSERT_EQ(AUDIOSIGNAL_GetSignalHash(&hb, b), &hb);
    EXPECT_EQ(0, memcmp(ha.bytes, hb.bytes, sizeof ha.bytes));

    AUDIOSIGNAL_ReverseEx(b, 0, 100, 101);  // one sample: nothing moves
    EXPECT_EQ(AUDIOSIGNAL_HasValidHash(b), 0);
    AUDIOSIGNAL_GetSignalHash(&hb, b);
    EXPECT_EQ(0, memcmp(ha.bytes, hb.bytes, sizeof ha.bytes));
    AUDIOSIGNAL_SilenceEx(b, 0, 100, 101);
    AUDIOSIGNAL_GetSignalHash(&hb, b);
    EXPECT_NE(0, memcmp(ha.bytes, hb.bytes, sizeof ha.bytes));

    AUDIOSIGNAL *copy = AUDIOSIGNAL_DuplicateEx(a, 0);
    EXPECT_EQ(AUDIOSIGNAL_HasValidHash(copy), 1);
    AUDIOSIGNAL_Destroy(copy);
    AUDIOSIGNAL_Destroy(a);
    AUDIOSIGNAL_Destroy(b);
}

TEST(SignalStoreSignal, ChannelMasks)
{
    AUDIOSIGNAL *signal = make_signal(random_channels(3, 100, 3));
    EXPECT_EQ(AUDIOSIGNAL_NumActiveChannels(signal), 3);
    EXPECT_EQ(AUDIOSIGNAL_DisableChannel(signal, 1), 1);
    EXPECT_EQ(AUDIOSIGNAL_DisableChannel(signal, 1), 0);  // no change
    EXPECT_EQ(AUDIOSIGNAL_ChannelActive(signal, 1), 0);
    EXPECT_EQ(AUDIOSIGNAL_ChannelActive(signal, 2), 1);
    EXPECT_EQ(AUDIOSIGNAL_GetActiveChannelMask(signal), 5u);
    EXPECT_EQ(AUDIOSIGNAL_GetDisabledChannelMask(signal), 2u);
    EXPECT_EQ(AUDIOSIGNAL_NumActiveChannels(signal), 2);
    AUDIO_FORMAT active;
    ASSERT_EQ(AUDIOSIGNAL_GetActiveFormat(signal, &active), 1);
    EXPECT_EQ(active.numChannels, 2);
    EXPECT_EQ(AUDIOSIGNAL_EnableChannel(signal, 1), 1);
    EXPECT_EQ(AUDIOSIGNAL_EnableChannel(signal, 1), 0);
    EXPECT_EQ(AUDIOSIGNAL_EnableChannel(signal, 3), 0);
    EXPECT_EQ(AUDIOSIGNAL_DisableChannel(signal, -1), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetDisabledChannelMask(signal), 0u);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreSignal, DuplicatesShareTheirBlocks)
{
    AUDIOSIGNAL *signal = make_signal(random_channels(2, 200000, 4));
    const int64_t alone = AUDIOSIGNAL_SizeInMemory(signal);
    EXPECT_GT(alone, 2 * 200000 * 4);
    AUDIOSIGNAL *copy = AUDIOSIGNAL_DuplicateEx(signal, 0);
    EXPECT_EQ(read_all(copy), read_all(signal));
    EXPECT_EQ(AUDIOSIGNAL_GetTimeStamp(copy, 0), AUDIOSIGNAL_GetTimeStamp(signal, 0));
    // Both hold every block, so each counts half of it.
    EXPECT_LT(AUDIOSIGNAL_SizeInMemory(signal), alone * 6 / 10);
    EXPECT_NEAR(double(AUDIOSIGNAL_SizeInMemory(signal) + AUDIOSIGNAL_SizeInMemory(copy)), double(alone),
                double(alone) * 0.05);
    // An edit of the copy leaves the original as it was.
    const Channels original = read_all(signal);
    AUDIOSIGNAL_SilenceEx(copy, 0, 0, AUDIOSIGNAL_END);
    EXPECT_EQ(read_all(signal), original);
    AUDIOSIGNAL_Destroy(copy);
    EXPECT_EQ(AUDIOSIGNAL_SizeInMemory(signal), alone);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreSignal, SamplesBeyondTheMemoryLimitGoToTheBlockFile)
{
    ASSERT_EQ(BLSETTINGS_ChangeEx(nullptr, "audiosignal.cache.memorylimit=0"), 1);
    const Channels samples = random_channels(2, 150000, 7);
    AUDIOSIGNAL *signal = make_signal(samples);
    BLSETTINGS_DeleteEx(nullptr, "audiosignal.cache.memorylimit");
    EXPECT_LT(AUDIOSIGNAL_SizeInMemory(signal), 100000);
    EXPECT_EQ(read_all(signal), samples);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreSignal, FreeDataMemoryMovesSamplesOutKeepingThem)
{
    AUDIOSIGNAL *signal = make_signal(random_channels(1, 150000, 5));
    const Channels before = read_all(signal);
    const uint64_t stamp = AUDIOSIGNAL_GetTimeStamp(signal, 0);
    EXPECT_EQ(AUDIOSIGNAL_FreeDataMemory(signal), 1);
    EXPECT_LT(AUDIOSIGNAL_SizeInMemory(signal), 100000);
    EXPECT_EQ(read_all(signal), before);
    EXPECT_EQ(AUDIOSIGNAL_GetTimeStamp(signal, 0), stamp);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreSignal, ReadAccessNeverWaitsForAWriter)
{
    AUDIOSIGNAL *signal = make_signal(random_channels(1, 1000, 6));
    EXPECT_EQ(AUDIOSIGNAL_ReleaseReadAccess(signal), 0);  // nothing taken
    ASSERT_EQ(AUDIOSIGNAL_TryReadAccess(signal), 1);
    ASSERT_EQ(AUDIOSIGNAL_TryReadAccess(signal), 1);       // shared

    // A writer on another thread waits until the last reader is gone.
    std::atomic<bool> edited{false};
    std::thread writer([&] {
        AUDIOSIGNAL_SilenceEx(signal, 0, 0, 10);
        edited = true;
    });
    EXPECT_EQ(AUDIOSIGNAL_ReleaseReadAccess(signal), 1);
    EXPECT_FALSE(edited.load());
    EXPECT_EQ(AUDIOSIGNAL_ReleaseReadAccess(signal), 1);
    writer.join();
    EXPECT_TRUE(edited.load());

    AUDIOSIGNAL_Destroy(signal);
}

}  // namespace
