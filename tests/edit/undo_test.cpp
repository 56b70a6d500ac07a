// The undo history: scripts, the bounded stack, the saved point and the revert actions.
#include "core/velmaudio.h"
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "edit/velmselection.h"
#include "edit/velmundo.h"

#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

namespace {

struct Events {
    std::vector<uint32_t> codes;
    int past_saved_answer = 1;
    static int handler(const BLNotifyEvent *e, void *user)
    {
        auto *self = static_cast<Events *>(user);
        self->codes.push_back(e->event);
        return e->event == 0x20026 ? self->past_saved_answer : 1;
    }
    int count(uint32_t code) const
    {
        int n = 0;
        for (uint32_t c : codes) n += c == code;
        return n;
    }
};

// A stereo document of 1000 frames holding a ramp on channel 0 and its negative on channel 1.
struct Undo : ::testing::Test {
    Events events;
    VELMAUDIO doc = nullptr;
    void SetUp() override
    {
        const _audio_format f = AUDIO_InitFormat(1000, 2, 16);
        AUDIOSIGNAL *signal = AUDIOSIGNAL_New(&f);
        std::vector<float> frames(2000);
        for (int i = 0; i < 1000; ++i) {
            frames[2 * i] = i / 1000.0f;
            frames[2 * i + 1] = -i / 1000.0f;
        }
        AUDIOSIGNAL_PIPE *pipe = AUDIOSIGNAL_CreatePipe(signal, 0);
        ASSERT_EQ(AUDIOSIGNAL_AppendToPipe(pipe, frames.data(), 1000), 1000);
        AUDIOSIGNAL_ClosePipe(pipe);
        doc = VELMAUDIO_NewFromSignal(signal, 0);
        ASSERT_NE(doc, nullptr);
        VELMAUDIO_AddEventHandler(doc, Events::handler, &events);
    }
    void TearDown() override
    {
        VELMAUDIO_DelEventHandler(doc, Events::handler, &events);
        VELMAUDIO_Close(doc);
    }
    AUDIOSIGNAL *signal() const { return VELMAUDIO_GetAudioSignal(doc); }
    std::vector<float> channel(int c) const
    {
        std::vector<float> out(static_cast<size_t>(AUDIOSIGNAL_NumSamples(signal())));
        AUDIOSIGNAL_GetChannelSamples(signal(), c, 0, out.data(), static_cast<int64_t>(out.size()));
        return out;
    }
    // Records an audio-blocks script as an edit would, before touching the signal.
    void record_blocks(const char *label)
    {
        VELMUNDOSCRIPT *script = VELMUNDO_CreateUndoScript(label, VELMAUDIO_GetState(doc));
        ASSERT_TRUE(VELMUNDO_AddRevertAudioBlocks(script, signal()));
        ASSERT_TRUE(VELMUNDO_PushUndoScript(doc, script));
    }
};

} // namespace

TEST_F(Undo, EmptyScriptsAndEmptyStacks)
{
    EXPECT_FALSE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(events.count(0x20025), 0);
    VELMUNDOSCRIPT *script = VELMUNDO_CreateUndoScript(nullptr, VELMAUDIO_GetState(doc));
    ASSERT_NE(script, nullptr);
    EXPECT_STREQ(VELMUNDO_ScriptLabel(script), "Undefined");
    EXPECT_FALSE(VELMUNDO_PushUndoScript(doc, script)); // no actions: refused and released
    EXPECT_EQ(VELMUNDO_Count(doc), 0);
    EXPECT_EQ(events.count(0x20025), 0);
    EXPECT_EQ(VELMAUDIO_NextUndoLabel(doc), nullptr);
}

TEST_F(Undo, ViewOnlyStepsRestoreSelectionAndCursor)
{
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 100, 200));
    ASSERT_TRUE(VELMAUDIO_CreateUndo(doc, "Select"));
    EXPECT_STREQ(VELMAUDIO_NextUndoLabel(doc), "Select");
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 500, 900));
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(VELMAUDIO_SelectionBegin(doc), 100);
    EXPECT_EQ(VELMAUDIO_SelectionEnd(doc), 200);
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 200);
    EXPECT_EQ(events.count(0x20027), 1);
}

TEST_F(Undo, TheStackKeepsTheNewest1024)
{
    for (int i = 0; i < 1025; ++i) ASSERT_TRUE(VELMAUDIO_CreateUndo(doc, std::to_string(i).c_str()));
    EXPECT_EQ(VELMUNDO_Count(doc), 1024);
    EXPECT_STREQ(VELMAUDIO_NextUndoLabel(doc), "1024");
    for (int i = 0; i < 1023; ++i) ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_STREQ(VELMAUDIO_NextUndoLabel(doc), "1"); // "0" was dropped
    EXPECT_GT(VELMUNDO_SizeInMemory(doc), 0);
    EXPECT_TRUE(VELMUNDO_DestroyStack(doc));
    EXPECT_EQ(VELMUNDO_Count(doc), 0);
}

TEST_F(Undo, AudioBlocksComeBackExactly)
{
    const std::vector<float> before0 = channel(0), before1 = channel(1);
    record_blocks("Cut");
    AUDIOSIGNAL *cut = AUDIOSIGNAL_CutEx(signal(), nullptr, 0x400, 100, 600);
    ASSERT_NE(cut, nullptr);
    AUDIOSIGNAL_Destroy(cut);
    ASSERT_EQ(AUDIOSIGNAL_NumSamples(signal()), 500);
    VELMSTATE_NotifyChanges(doc, 0);
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(channel(0), before0);
    EXPECT_EQ(channel(1), before1);
}

TEST_F(Undo, SampleRateSwapAndReplacedSignal)
{
    VELMUNDOSCRIPT *script = VELMUNDO_CreateUndoScript("Rate", VELMAUDIO_GetState(doc));
    ASSERT_TRUE(VELMUNDO_AddSetSampleRate(script, 1000));
    ASSERT_TRUE(VELMUNDO_AddSwapChannels(script));
    ASSERT_TRUE(VELMUNDO_PushUndoScript(doc, script));
    ASSERT_TRUE(AUDIOSIGNAL_SetSampleRate(signal(), 2000));
    ASSERT_TRUE(AUDIOSIGNAL_SwapChannels(signal()));
    const std::vector<float> ramp = channel(1);
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(AUDIOSIGNAL_SampleRate(signal()), 1000);
    EXPECT_EQ(channel(0), ramp);

    AUDIOSIGNAL *original = signal();
    ASSERT_TRUE(VELMAUDIO_CreateSignalUndo(doc, nullptr));
    EXPECT_NE(signal(), original);
    AUDIOSIGNAL_ReverseEx(signal(), 0x400, 0, AUDIOSIGNAL_END);
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(signal(), original);
    EXPECT_EQ(channel(0), ramp);
}

TEST_F(Undo, CrossingTheSavedPointAsksFirst)
{
    // Make the document clean, edit, and try to undo past the saved point.
    VELMSTATE_ResetChanges(doc);
    record_blocks("Silence");
    ASSERT_TRUE(AUDIOSIGNAL_SilenceEx(signal(), 0x400, 0, 500));
    VELMSTATE_NotifyChanges(doc, 0);
    ASSERT_TRUE(VELMAUDIO_HasChanges(doc));
    ASSERT_TRUE(VELMAUDIO_ClearChangedState(doc)); // "saved" after the edit

    events.past_saved_answer = 0;
    EXPECT_FALSE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(events.count(0x20026), 1);
    EXPECT_EQ(VELMUNDO_Count(doc), 1);
    EXPECT_FLOAT_EQ(channel(0)[300], 0.0f);

    events.past_saved_answer = 1;
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_FLOAT_EQ(channel(0)[300], 0.3f);
    EXPECT_TRUE(VELMAUDIO_HasChanges(doc)); // back past the save: differs from the file
}

TEST_F(Undo, UndoingBackToTheSavedPointIsClean)
{
    VELMSTATE_ResetChanges(doc);
    record_blocks("one");
    AUDIOSIGNAL_SilenceEx(signal(), 0x400, 0, 10);
    VELMSTATE_NotifyChanges(doc, 0);
    record_blocks("two");
    AUDIOSIGNAL_SilenceEx(signal(), 0x400, 20, 30);
    VELMSTATE_NotifyChanges(doc, 0);
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_TRUE(VELMAUDIO_HasChanges(doc));
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_FALSE(VELMAUDIO_HasChanges(doc));
    EXPECT_EQ(events.count(0x20026), 0);
}

TEST_F(Undo, RegionCreationIsUndoneByMarkingItDeleted)
{
    AUDIOREGION *region = AUDIOSIGNAL_AddRegionToTrackEx(signal(), 0, 0.1, 0.2, "word", nullptr, 0);
    ASSERT_NE(region, nullptr);
    VELMUNDOSCRIPT *script = VELMUNDO_CreateUndoScript("Region", VELMAUDIO_GetState(doc));
    ASSERT_TRUE(VELMUNDO_AddRevertCreateRegion(script, region));
    ASSERT_TRUE(VELMUNDO_AddChangeRegionLabel(script, region, "word"));
    ASSERT_TRUE(VELMUNDO_PushUndoScript(doc, script));
    AUDIOREGION_SetLabel(region, "changed");
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_TRUE(AUDIOREGION_IsDeleted(region));
    EXPECT_STREQ(AUDIOREGION_GetLabel(region), "word");

    script = VELMUNDO_CreateUndoScript("Move", VELMAUDIO_GetState(doc));
    ASSERT_TRUE(VELMUNDO_AddRevertAllRegionsState(script, signal()));
    ASSERT_TRUE(VELMUNDO_PushUndoScript(doc, script));
    AUDIOREGION_Offset(region, 300);
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_NEAR(AUDIOREGION_Begin(region), 0.1, 1e-9);
    EXPECT_TRUE(AUDIOREGION_IsDeleted(region));
}

TEST(UndoNulls, FailureValues)
{
    EXPECT_EQ(VELMUNDO_CreateUndoScript("x", nullptr), nullptr);
    EXPECT_EQ(VELMUNDO_AddNoAction(nullptr), 0);
    EXPECT_EQ(VELMUNDO_AddRevertAudioBlocks(nullptr, nullptr), 0);
    EXPECT_EQ(VELMUNDO_PushUndoScript(nullptr, nullptr), 0);
    EXPECT_EQ(VELMUNDO_PopUndoScript(nullptr), nullptr);
    EXPECT_EQ(VELMUNDO_DestroyUndoScript(nullptr), 0);
    EXPECT_EQ(VELMAUDIO_Undo(nullptr), 0);
    EXPECT_EQ(VELMAUDIO_CreateUndo(nullptr, "x"), 0);
    EXPECT_EQ(VELMAUDIO_RestoreState(nullptr, nullptr), 0);
}
