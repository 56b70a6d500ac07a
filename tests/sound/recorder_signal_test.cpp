// What recording leaves in the signal: the captured frames at the record
// position, with what followed moved behind them.
#include "core/velmnavigation.h"
#include "edit/velmedit.h"
#include "edit/velmundo.h"
#include "recorder_support.hpp"

namespace {

using rectest::kCaptureFrames;
using rectest::kPcm16Tolerance;
using rectest::kRate;
using rectest::max_difference;

class RecordedSignal : public rectest::Recording {};

TEST_F(RecordedSignal, NewDocumentReceivesTheCapturedFrames)
{
    VELMAUDIO doc = document(kRate, 1);
    ASSERT_NE(doc, nullptr);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, 0, nullptr);
    ASSERT_NE(r, nullptr);
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 1);
    EXPECT_EQ(VELMRECORD_GetStatus(r), VELMRECORD_STATUS_RECORDING);
    EXPECT_EQ(VELMAUDIO_GetState(doc)->recordStart, 0);
    ASSERT_TRUE(record_until(r, kCaptureFrames + 800));
    ASSERT_EQ(VELMAUDIO_RecordStop(doc), 1);
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 0);
    EXPECT_EQ(VELMAUDIO_GetState(doc)->recordStart, -1);
    EXPECT_EQ(VELMAUDIO_GetState(doc)->recordPosition, -1);

    const int64_t length = VELMAUDIO_NumSamples(doc);
    ASSERT_GE(length, kCaptureFrames + 800);
    EXPECT_LE(max_difference(doc, 0, captured), kPcm16Tolerance);
    // The device goes on with silence after the file's end.
    const std::vector<float> after = rectest::channel(doc, 0, kCaptureFrames, length - kCaptureFrames);
    EXPECT_EQ(*std::max_element(after.begin(), after.end()), 0.0f);
}

TEST_F(RecordedSignal, RecordingInTheMiddleMovesTheRestRight)
{
    const std::vector<float> original = velmtest::sine(kRate, 1, 6000, 100.0, 0.3);
    VELMAUDIO doc = document(kRate, 1, original);
    ASSERT_NE(doc, nullptr);
    const int64_t cursor = 2500;
    VELMAUDIO_SetCursorPosition(doc, cursor);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, 0, nullptr);
    ASSERT_NE(r, nullptr);
    EXPECT_EQ(VELMAUDIO_GetState(doc)->recordStart, cursor);
    ASSERT_TRUE(record_until(r, cursor + kCaptureFrames));
    ASSERT_EQ(VELMAUDIO_RecordStop(doc), 1);

    const int64_t recorded = VELMAUDIO_NumSamples(doc) - 6000;
    ASSERT_GE(recorded, kCaptureFrames);
    const std::vector<float> before(original.begin(), original.begin() + cursor);
    const std::vector<float> rest(original.begin() + cursor, original.end());
    EXPECT_LE(max_difference(doc, 0, before), kPcm16Tolerance);
    EXPECT_LE(max_difference(doc, cursor, captured), kPcm16Tolerance);
    EXPECT_LE(max_difference(doc, cursor + recorded, rest), kPcm16Tolerance);
}

TEST_F(RecordedSignal, APositionBeyondTheEndRecordsAtTheEnd)
{
    const std::vector<float> original = velmtest::sine(kRate, 1, 3000, 100.0, 0.3);
    VELMAUDIO doc = document(kRate, 1, original);
    ASSERT_NE(doc, nullptr);
    VELMRECORDER r = VELMRECORD_CreateRecorder(doc, 0, 1000000);
    ASSERT_NE(r, nullptr);
    ASSERT_EQ(VELMRECORD_Start(r, nullptr), 1);
    EXPECT_EQ(VELMAUDIO_GetState(doc)->recordStart, 3000);
    ASSERT_TRUE(record_until(r, 3000 + kCaptureFrames));
    ASSERT_EQ(VELMRECORD_Stop(r), 1);
    EXPECT_EQ(VELMRECORD_RecordPosition(r), -1);
    EXPECT_EQ(VELMRECORD_GetStatus(r), VELMRECORD_STATUS_STOPPED);
    EXPECT_EQ(VELMRECORD_DestroyRecorder(r), 1);

    EXPECT_LE(max_difference(doc, 0, original), kPcm16Tolerance);
    EXPECT_LE(max_difference(doc, 3000, captured), kPcm16Tolerance);
}

// The virtual device has no 12000 Hz: it records at a rate it has, and the
// recorder converts to the signal's.
TEST_F(RecordedSignal, ARateTheDeviceLacksIsConverted)
{
    constexpr int kSignalRate = 12000;
    VELMAUDIO doc = document(kSignalRate, 2);
    ASSERT_NE(doc, nullptr);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, 0, nullptr);
    ASSERT_NE(r, nullptr);
    const int64_t frames = kCaptureFrames * kSignalRate / kRate;
    ASSERT_TRUE(record_until(r, frames + 1200));
    ASSERT_EQ(VELMAUDIO_RecordStop(doc), 1);

    // Away from the ends, where the resamplers ring, both channels carry the
    // capture at the signal's rate.
    const std::vector<float> expected = rectest::swelling_sine(kSignalRate, 1, frames);
    const int64_t edge = kSignalRate / 100;
    const std::vector<float> middle(expected.begin() + edge, expected.end() - edge);
    EXPECT_LE(max_difference(doc, edge, middle, 0), 0.01);
    EXPECT_LE(max_difference(doc, edge, middle, 1), 0.01);
}

TEST_F(RecordedSignal, UndoStepTakesTheRecordingAway)
{
    const std::vector<float> original = velmtest::sine(kRate, 1, 2000, 100.0, 0.3);
    VELMAUDIO doc = document(kRate, 1, original);
    ASSERT_NE(doc, nullptr);
    VELMAUDIO_SetCursorPosition(doc, 1000);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, VELMRECORD_FLAG_UNDO, "Record");
    ASSERT_NE(r, nullptr);
    ASSERT_STREQ(VELMAUDIO_NextUndoLabel(doc), "Record");
    ASSERT_TRUE(record_until(r, 1000 + kCaptureFrames));
    ASSERT_EQ(VELMAUDIO_RecordStop(doc), 1);
    ASSERT_GT(VELMAUDIO_NumSamples(doc), 2000 + kCaptureFrames - 1);

    ASSERT_EQ(VELMAUDIO_Undo(doc), 1);
    EXPECT_EQ(VELMAUDIO_NumSamples(doc), 2000);
    EXPECT_LE(max_difference(doc, 0, original), kPcm16Tolerance);

    // Without the flag the label makes no step.
    ASSERT_NE(VELMAUDIO_RecordStart(doc, 0, "Record"), nullptr);
    EXPECT_EQ(VELMAUDIO_RecordStop(doc), 1);
    EXPECT_EQ(VELMUNDO_Count(doc), 0);
}

TEST_F(RecordedSignal, FormatChangeStopsTheRecordingFirst)
{
    VELMAUDIO doc = document(kRate, 1);
    ASSERT_NE(doc, nullptr);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, 0, nullptr);
    ASSERT_NE(r, nullptr);
    ASSERT_TRUE(record_until(r, kCaptureFrames));
    _audio_format wider{kRate, 2, 16, 0, 0};
    ASSERT_EQ(VELMAUDIO_ChangeAudioFormat(doc, &wider, nullptr, nullptr, 0, 0, nullptr), 1);
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 0);
    EXPECT_EQ(AUDIOSIGNAL_NumChannels(VELMAUDIO_GetAudioSignal(doc)), 2);
    const int64_t length = VELMAUDIO_NumSamples(doc);
    EXPECT_GE(length, kCaptureFrames);
    // Nothing more arrives once the conversion is done.
    pump();
    EXPECT_EQ(VELMAUDIO_NumSamples(doc), length);
}

} // namespace
