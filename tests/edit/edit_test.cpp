// Editing commands, checked sample by sample against edits made on a plain copy.
#include "core/velmaudio.h"
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "edit/velmedit.h"
#include "edit/velmselection.h"
#include "edit/velmundo.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <vector>

namespace {

constexpr int kRate = 1000;

std::vector<float> ramp(int64_t n, float scale = 1.0f)
{
    std::vector<float> v(static_cast<size_t>(n));
    for (int64_t i = 0; i < n; ++i) v[static_cast<size_t>(i)] = scale * static_cast<float>(i) / static_cast<float>(n);
    return v;
}

AUDIOSIGNAL *mono_signal(const std::vector<float> &samples)
{
    const _audio_format f = AUDIO_InitFormat(kRate, 1, 16);
    AUDIOSIGNAL *s = AUDIOSIGNAL_New(&f);
    AUDIOSIGNAL_PIPE *pipe = AUDIOSIGNAL_CreatePipe(s, 0);
    AUDIOSIGNAL_AppendToPipe(pipe, samples.data(), static_cast<int64_t>(samples.size()));
    AUDIOSIGNAL_ClosePipe(pipe);
    return s;
}

std::vector<float> samples_of(AUDIOSIGNAL *s)
{
    std::vector<float> out(static_cast<size_t>(AUDIOSIGNAL_NumSamples(s)));
    AUDIOSIGNAL_GetChannelSamples(s, 0, 0, out.data(), static_cast<int64_t>(out.size()));
    return out;
}

struct Edit : ::testing::Test {
    std::vector<float> reference = ramp(1000);
    VELMAUDIO doc = nullptr;
    std::vector<uint32_t> codes;
    static int record(const BLNotifyEvent *e, void *user)
    {
        static_cast<std::vector<uint32_t> *>(user)->push_back(e->event);
        return 1;
    }
    void SetUp() override
    {
        doc = VELMAUDIO_NewFromSignal(mono_signal(reference), 0);
        ASSERT_NE(doc, nullptr);
        VELMAUDIO_AddEventHandler(doc, record, &codes);
    }
    void TearDown() override
    {
        VELMAUDIO_DelEventHandler(doc, record, &codes);
        VELMAUDIO_Close(doc);
    }
    std::vector<float> now() const { return samples_of(VELMAUDIO_GetAudioSignal(doc)); }
    void erase(int64_t b, int64_t e) { reference.erase(reference.begin() + b, reference.begin() + e); }
};

} // namespace

TEST_F(Edit, CopiesLeaveTheDocumentAlone)
{
    EXPECT_EQ(VELMAUDIO_Copy(doc), nullptr);
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 100, 200));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 500, 550));
    AUDIOSIGNAL *copy = VELMAUDIO_Copy(doc);
    ASSERT_NE(copy, nullptr);
    std::vector<float> expected(reference.begin() + 100, reference.begin() + 200);
    expected.insert(expected.end(), reference.begin() + 500, reference.begin() + 550);
    EXPECT_EQ(samples_of(copy), expected);
    AUDIOSIGNAL_Destroy(copy);
    AUDIOSIGNAL *all = VELMAUDIO_CopyAll(doc);
    EXPECT_EQ(samples_of(all), reference);
    AUDIOSIGNAL_Destroy(all);
    EXPECT_EQ(now(), reference);
    EXPECT_EQ(VELMUNDO_Count(doc), 0);
}

TEST_F(Edit, ClearingThreeSelectionsShiftsTheLaterOnes)
{
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 100, 200));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 400, 450));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 800, 900));
    ASSERT_TRUE(VELMAUDIO_Clear(doc, nullptr));
    erase(800, 900);
    erase(400, 450);
    erase(100, 200);
    EXPECT_EQ(now(), reference);
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 100);
    EXPECT_FALSE(VELMAUDIO_HasSelection(doc));
    EXPECT_STREQ(VELMAUDIO_NextUndoLabel(doc), "Clear");
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(now(), ramp(1000));
    EXPECT_EQ(VELMAUDIO_SelectionChunkCount(doc), 3);
}

TEST_F(Edit, CutReturnsTheAudioAndPasteReplacesTheFirstSelection)
{
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 300, 400));
    AUDIOSIGNAL *cut = VELMAUDIO_Cut(doc, nullptr);
    ASSERT_NE(cut, nullptr);
    EXPECT_EQ(samples_of(cut), std::vector<float>(reference.begin() + 300, reference.begin() + 400));
    erase(300, 400);
    EXPECT_EQ(now(), reference);
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 300);

    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 10, 20));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 700, 710));
    codes.clear();
    ASSERT_TRUE(VELMAUDIO_Paste(doc, cut, "put back"));
    std::vector<float> pasted = samples_of(cut);
    reference.erase(reference.begin() + 10, reference.begin() + 20);
    reference.insert(reference.begin() + 10, pasted.begin(), pasted.end());
    EXPECT_EQ(now(), reference);
    EXPECT_EQ(VELMAUDIO_SelectionBegin(doc), 10);
    EXPECT_EQ(VELMAUDIO_SelectionEnd(doc), 110);
    EXPECT_NE(std::find(codes.begin(), codes.end(), 0x2000Au), codes.end());
    EXPECT_STREQ(VELMAUDIO_NextUndoLabel(doc), "put back");
    AUDIOSIGNAL_Destroy(cut);
}

TEST_F(Edit, ReverseAndSilenceWorkPerSelection)
{
    ASSERT_TRUE(VELMAUDIO_Reverse(doc, nullptr));
    std::reverse(reference.begin(), reference.end());
    EXPECT_EQ(now(), reference);
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 0, 10));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 990, 1000));
    ASSERT_TRUE(VELMAUDIO_Silence(doc, nullptr));
    std::fill(reference.begin(), reference.begin() + 10, 0.0f);
    std::fill(reference.end() - 10, reference.end(), 0.0f);
    EXPECT_EQ(now(), reference);
    EXPECT_EQ(VELMUNDO_Count(doc), 2);
}

TEST_F(Edit, TrimKeepsOnlyTheSelections)
{
    ASSERT_TRUE(VELMAUDIO_SelectAll(doc));
    EXPECT_FALSE(VELMAUDIO_Trim(doc, nullptr)); // covering everything: nothing to trim, nothing recorded
    EXPECT_EQ(VELMUNDO_Count(doc), 0);
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 0, 100));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 500, 600));
    ASSERT_TRUE(VELMAUDIO_Trim(doc, nullptr));
    std::vector<float> expected(reference.begin(), reference.begin() + 100);
    expected.insert(expected.end(), reference.begin() + 500, reference.begin() + 600);
    EXPECT_EQ(now(), expected);
    EXPECT_EQ(VELMAUDIO_SelectionLength(doc), 200);
}

TEST_F(Edit, AppendAndMixPaste)
{
    const std::vector<float> tail = ramp(100, -1.0f);
    AUDIOSIGNAL *source = mono_signal(tail);
    ASSERT_TRUE(VELMAUDIO_Append(doc, source, nullptr));
    reference.insert(reference.end(), tail.begin(), tail.end());
    EXPECT_EQ(now(), reference);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 1100);
    EXPECT_EQ(VELMAUDIO_SelectionBegin(doc), 1000);

    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 0, 10));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 20, 30));
    EXPECT_FALSE(VELMAUDIO_MixPaste(doc, source, 0, 1.0, nullptr));
    EXPECT_STREQ(VELMAUDIO_NextUndoLabel(doc), "append");

    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 200, 300));
    ASSERT_TRUE(VELMAUDIO_MixPaste(doc, source, 1, 0.5, nullptr));
    for (int i = 0; i < 100; ++i) reference[static_cast<size_t>(200 + i)] += 0.5f * tail[static_cast<size_t>(i)];
    const std::vector<float> mixed = now();
    ASSERT_EQ(mixed.size(), reference.size());
    for (size_t i = 0; i < mixed.size(); ++i) ASSERT_NEAR(mixed[i], reference[i], 1e-6) << i;
    AUDIOSIGNAL_Destroy(source);

    ASSERT_TRUE(VELMAUDIO_AppendSilence(doc, 50, nullptr));
    EXPECT_EQ(VELMAUDIO_NumSamples(doc), 1150);
    EXPECT_FLOAT_EQ(now().back(), 0.0f);
}

TEST_F(Edit, RateChannelsAndFormat)
{
    ASSERT_TRUE(VELMAUDIO_SetSampleRate(doc, kRate, nullptr));
    EXPECT_EQ(VELMUNDO_Count(doc), 0);
    ASSERT_TRUE(VELMAUDIO_SetSampleRate(doc, 2000, nullptr));
    EXPECT_EQ(VELMAUDIO_SampleRate(doc), 2000);
    EXPECT_EQ(now(), reference);
    EXPECT_FALSE(VELMAUDIO_SwapChannels(doc, nullptr)); // mono
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(VELMAUDIO_SampleRate(doc), kRate);

    _audio_format same = AUDIO_InitFormat(kRate, 1, 16);
    codes.clear();
    ASSERT_TRUE(VELMAUDIO_ChangeAudioFormat(doc, &same, "NOCHANGES", nullptr, 0, 0, nullptr));
    EXPECT_NE(std::find(codes.begin(), codes.end(), 0x2002Eu), codes.end());
    EXPECT_EQ(VELMUNDO_Count(doc), 0);

    _audio_format stereo = AUDIO_InitFormat(2000, 2, 16);
    ASSERT_TRUE(VELMAUDIO_ChangeAudioFormat(doc, &stereo, nullptr, nullptr, 0, 0, nullptr));
    EXPECT_EQ(VELMAUDIO_NumChannels(doc), 2);
    EXPECT_EQ(VELMAUDIO_SampleRate(doc), 2000);
    EXPECT_NEAR(static_cast<double>(VELMAUDIO_NumSamples(doc)), 2000.0, 4.0);
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(VELMAUDIO_NumChannels(doc), 1);
    EXPECT_EQ(now(), reference);
}

TEST_F(Edit, RemoveDCTakesTheMeanAway)
{
    ASSERT_TRUE(VELMAUDIO_RemoveDC(doc, nullptr));
    const std::vector<float> after = now();
    double sum = 0;
    for (float x : after) sum += x;
    EXPECT_NEAR(sum / static_cast<double>(after.size()), 0.0, 1e-6);
    EXPECT_STREQ(VELMAUDIO_NextUndoLabel(doc), "Remove DC");
}

TEST_F(Edit, ReadOnlyDocumentsAndBadArguments)
{
    ASSERT_TRUE(VELMAUDIO_SetEditable(doc, 0));
    EXPECT_FALSE(VELMAUDIO_Reverse(doc, nullptr));
    EXPECT_FALSE(VELMAUDIO_PasteSilence(doc, 10, nullptr));
    EXPECT_EQ(VELMUNDO_Count(doc), 0);
    ASSERT_TRUE(VELMAUDIO_SetEditable(doc, 1));
    EXPECT_FALSE(VELMAUDIO_TransformSelection(doc, "nosuchstage[x=1]", nullptr));
    EXPECT_EQ(now(), reference); // rolled back
    EXPECT_EQ(VELMUNDO_Count(doc), 0);
    EXPECT_FALSE(VELMAUDIO_Paste(doc, nullptr, nullptr));
    EXPECT_FALSE(VELMAUDIO_Clear(doc, nullptr)); // nothing selected
    EXPECT_EQ(VELMAUDIO_Cut(nullptr, nullptr), nullptr);
    EXPECT_FALSE(VELMAUDIO_PasteFromFile(doc, "/no/such/file.wav", "AUTO", nullptr));
}

TEST_F(Edit, EditsAtTheEndsAndFailedEffectsUndoExactly)
{
    const std::vector<float> original = reference;
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 900, 1000));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 0, 50));
    ASSERT_TRUE(VELMAUDIO_Trim(doc, nullptr));
    std::vector<float> expected(original.begin(), original.begin() + 50);
    expected.insert(expected.end(), original.begin() + 900, original.end());
    EXPECT_EQ(now(), expected);
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(now(), original);
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 950, 1000));
    AUDIOSIGNAL *cut = VELMAUDIO_Cut(doc, nullptr);
    ASSERT_NE(cut, nullptr);
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(VELMAUDIO_GetAudioSignal(doc)), 950);
    EXPECT_LE(VELMAUDIO_GetCursorPosition(doc), 950);
    VELMAUDIO_SetCursorPosition(doc, 950);
    ASSERT_TRUE(VELMAUDIO_Paste(doc, cut, nullptr));
    EXPECT_EQ(now(), original);
    ASSERT_TRUE(VELMAUDIO_Paste(doc, cut, nullptr));
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(now(), original);
    AUDIOSIGNAL_Destroy(cut);
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 100, 200));
    EXPECT_FALSE(VELMAUDIO_TransformSelection(doc, "NOSUCHEFFECT[x=1]", nullptr));
    EXPECT_EQ(now(), original);
    EXPECT_FALSE(VELMAUDIO_Transform(doc, "NOSUCHEFFECT[x=1]", nullptr));
    EXPECT_EQ(now(), original);
    EXPECT_EQ(VELMUNDO_Count(doc), 0);
}
