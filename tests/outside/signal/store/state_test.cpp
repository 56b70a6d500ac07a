// Saved states and block lists as the undo history uses them.
#include "store_test_support.hpp"

using namespace store_test;

namespace {

// The undo history's revert: destroy the changed current lists, restore, clear.
void revert(AUDIOSIGNAL *signal, AUDIOSIGNAL_STATE &state)
{
    bool differed = false;
    for (int c = 0; c < state.numChannels; ++c) {
        AUDIOBLOCKSLIST *current = AUDIOSIGNAL_GetChannelBlocksList(signal, c);
        if (current != state.blocksList[c]) {
            AUDIOBLOCKSLIST_Destroy(current);
            differed = true;
        }
    }
    if (differed) {
        ASSERT_EQ(AUDIOSIGNAL_RestoreState(signal, &state), 1);
    }
    AUDIOSIGNAL_ClearState(&state);
}

// Recording an undo step: save the state and deactivate the current lists.
void record(AUDIOSIGNAL *signal, AUDIOSIGNAL_STATE &state)
{
    ASSERT_EQ(AUDIOSIGNAL_SaveState(signal, &state), 1);
    for (int c = 0; c < AUDIOSIGNAL_NumChannels(signal); ++c) {
        EXPECT_EQ(AUDIOBLOCKSLIST_Desactive(AUDIOSIGNAL_GetChannelBlocksList(signal, c)), 1);
    }
}

TEST(SignalStoreState, UndoRestoresEveryEarlierState)
{
    const Channels start = random_channels(2, 200000, 21);
    AUDIOSIGNAL *signal = make_signal(start);
    std::vector<Channels> history;
    std::vector<AUDIOSIGNAL_STATE> states(8);
    for (int i = 0; i < 8; ++i) {
        history.push_back(read_all(signal));
        record(signal, states[size_t(i)]);
        EXPECT_EQ(states[size_t(i)].numChannels, 2);
        EXPECT_EQ(AUDIOBLOCKSLIST_NumSamples(states[size_t(i)].blocksList[0]), AUDIOSIGNAL_NumSamples(signal));
        if (i % 3 == 2) AUDIOSIGNAL_DisableChannel(signal, 1);
        AUDIOSIGNAL_ClearEx(signal, 0, 1000 * i, 1000 * i + 30000);
        AUDIOSIGNAL_ReverseEx(signal, 0, 500, 900);
        AUDIOSIGNAL_EnableChannel(signal, 1);
    }
    for (int i = 7; i >= 0; --i) {
        const uint64_t stamp = AUDIOSIGNAL_GetTimeStamp(signal, 0);
        revert(signal, states[size_t(i)]);
        EXPECT_EQ(states[size_t(i)].numChannels, 0);
        EXPECT_EQ(read_all(signal), history[size_t(i)]) << "undo " << i;
        EXPECT_GT(AUDIOSIGNAL_GetTimeStamp(signal, 0), stamp);
    }
    EXPECT_EQ(read_all(signal), start);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreState, DroppedStatesFreeTheirBlocks)
{
    AUDIOSIGNAL *signal = make_signal(random_channels(1, 300000, 22));
    const int64_t before = AUDIOSIGNAL_SizeInMemory(signal);
    AUDIOSIGNAL_STATE state;
    record(signal, state);
    // Unchanged, the saved list is the signal's own: both count half.
    EXPECT_EQ(AUDIOSIGNAL_GetChannelBlocksList(signal, 0), state.blocksList[0]);
    EXPECT_NEAR(double(AUDIOBLOCKSLIST_SizeInMemory(state.blocksList[0])), before / 2.0, before * 0.01);

    AUDIOSIGNAL_ReverseEx(signal, 0, 0, AUDIOSIGNAL_END);  // every block new
    EXPECT_NE(AUDIOSIGNAL_GetChannelBlocksList(signal, 0), state.blocksList[0]);
    EXPECT_NEAR(double(AUDIOBLOCKSLIST_SizeInMemory(state.blocksList[0])), double(before), before * 0.01);

    // The history drops the step: destroy the saved lists, clear the state.
    AUDIOBLOCKSLIST_Destroy(state.blocksList[0]);
    EXPECT_EQ(AUDIOSIGNAL_ClearState(&state), 1);
    EXPECT_NEAR(double(AUDIOSIGNAL_SizeInMemory(signal)), double(before), before * 0.01);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreState, ManyCutsAndPastesShareTheUntouchedBlocks)
{
    AUDIOSIGNAL *signal = make_signal(random_channels(2, 44100 * 20, 23));
    const int64_t before = AUDIOSIGNAL_SizeInMemory(signal);
    std::vector<AUDIOSIGNAL_STATE> states(100);
    std::mt19937 rng(24);
    for (auto &state : states) {
        record(signal, state);
        const int64_t at = int64_t(rng() % 800000);
        AUDIOSIGNAL *cut = AUDIOSIGNAL_CutEx(signal, nullptr, 0, at, at + 5000);
        AUDIOSIGNAL_PasteEx(signal, cut, 0, at / 2, at / 2, nullptr);
        AUDIOSIGNAL_Destroy(cut);
    }
    int64_t held = AUDIOSIGNAL_SizeInMemory(signal);
    for (const auto &state : states) {
        for (int c = 0; c < 2; ++c) held += AUDIOBLOCKSLIST_SizeInMemory(state.blocksList[c]);
    }
    // Only block tables grow (about 1 MB): one copy of the samples is 7 MB.
    EXPECT_LT(held - before, 2 << 20);
    for (auto &state : states) AUDIOSIGNAL_ClearState(&state);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreState, BadStatesAreRefused)
{
    AUDIOSIGNAL *stereo = make_signal(random_channels(2, 100, 25));
    AUDIOSIGNAL *mono = make_signal(random_channels(1, 100, 26));
    AUDIOSIGNAL_STATE state;
    ASSERT_EQ(AUDIOSIGNAL_SaveState(mono, &state), 1);
    EXPECT_EQ(AUDIOSIGNAL_RestoreState(stereo, &state), 0);
    EXPECT_EQ(AUDIOSIGNAL_ClearState(&state), 1);
    EXPECT_EQ(AUDIOSIGNAL_SaveState(nullptr, &state), 0);
    EXPECT_EQ(AUDIOSIGNAL_ClearState(nullptr), 0);
    EXPECT_EQ(AUDIOBLOCKSLIST_Destroy(nullptr), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetChannelBlocksList(mono, 1), nullptr);
    AUDIOSIGNAL_Destroy(stereo);
    AUDIOSIGNAL_Destroy(mono);
}

}  // namespace
