// How a recording is started, followed, vetoed, stopped and torn down, as
// the shell sees it.
#include "core/velmnavigation.h"
#include "edit/velmedit.h"
#include "edit/velmundo.h"
#include "recorder_support.hpp"
#include "sound_support.hpp"

namespace {

using rectest::EventProbe;
using rectest::kCaptureFrames;
using rectest::kRate;

class RecordControl : public rectest::Recording {
protected:
    static constexpr int64_t kLength = 200000;

    // A 25 s document with the cursor at its end and the view on [0, view_end].
    VELMAUDIO long_document(int64_t view_end)
    {
        VELMAUDIO doc = document(kRate, 1, velmtest::sine(kRate, 1, kLength));
        if (!doc) return nullptr;
        VELMAUDIO_SetCursorPosition(doc, kLength);
        return VELMAUDIO_Zoom(doc, 0, view_end) ? doc : nullptr;
    }
};

TEST_F(RecordControl, TheViewFollowsTheRecording)
{
    VELMAUDIO doc = long_document(1000);
    ASSERT_NE(doc, nullptr);
    EventProbe positions(doc, VELMRECORD_NOTIFY_POSITION);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, 0, nullptr);
    ASSERT_NE(r, nullptr);
    const VELMSTATE *state = VELMAUDIO_GetState(doc);
    // A view shorter than ten seconds widens to ten at the start.
    EXPECT_EQ(state->viewBegin, 0);
    EXPECT_EQ(state->viewEnd, 10 * kRate);
    ASSERT_TRUE(pump_until([state] { return state->recordPosition > kLength + 1000; }));
    EXPECT_EQ(state->recordStart, kLength);
    EXPECT_EQ(state->viewEnd, state->recordPosition);
    EXPECT_GE(positions.count, 2); // the start, then the updates
    EXPECT_EQ(VELMAUDIO_RecordStop(doc), 1);
}

TEST_F(RecordControl, PositionEventsInsteadOfViewMoves)
{
    VELMAUDIO doc = long_document(100000);
    ASSERT_NE(doc, nullptr);
    EventProbe positions(doc, VELMRECORD_NOTIFY_POSITION);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, VELMRECORD_FLAG_NOTIFY_POSITION, nullptr);
    ASSERT_NE(r, nullptr);
    const VELMSTATE *state = VELMAUDIO_GetState(doc);
    const int64_t begin = state->viewBegin, end = state->viewEnd;
    ASSERT_TRUE(pump_until([&positions] { return positions.count >= 3; }));
    EXPECT_EQ(VELMAUDIO_RecordStop(doc), 1);

    EXPECT_EQ(state->viewBegin, begin);
    EXPECT_EQ(state->viewEnd, end);
    // The first event announces the start; the timer's carry the recorder.
    EXPECT_EQ(positions.positions[0], kLength);
    EXPECT_EQ(positions.data2[0], nullptr);
    for (size_t i = 1; i < positions.positions.size(); ++i) {
        EXPECT_EQ(positions.data2[i], static_cast<void *>(r));
        EXPECT_GT(positions.positions[i], positions.positions[i - 1]);
    }
}

TEST_F(RecordControl, TheShellMayTakeOverTheTimer)
{
    VELMAUDIO doc = document(kRate, 1);
    ASSERT_NE(doc, nullptr);
    VELMRECORDER r = VELMRECORD_CreateRecorder(doc, 0, 0);
    ASSERT_NE(r, nullptr);
    int ticks = 0;
    auto tick = [](void *user) { return ++*static_cast<int *>(user); };
    ASSERT_EQ(VELMRECORD_SetGUITimer(r, tick, &ticks), 1);
    ASSERT_EQ(VELMRECORD_Start(r, nullptr), 1);
    EXPECT_EQ(VELMRECORD_SetGUITimer(r, nullptr, nullptr), 0);
    ASSERT_TRUE(pump_until([&ticks] { return ticks >= 2; }));
    // The recorder's own update no longer runs: the range stays at its start.
    EXPECT_EQ(VELMAUDIO_GetState(doc)->recordPosition, 0);
    EXPECT_GT(VELMRECORD_RecordPosition(r), 0);
    EXPECT_EQ(VELMRECORD_Stop(r), 1);
    EXPECT_EQ(VELMRECORD_DestroyRecorder(r), 1);
}

// The shell may end the recording from the position event the timer sends.
TEST_F(RecordControl, APositionHandlerMayStopTheRecording)
{
    for (uint32_t flags : {0u, VELMRECORD_FLAG_NOTIFY_POSITION}) {
        VELMAUDIO doc = document(kRate, 1);
        ASSERT_NE(doc, nullptr);
        auto stop = [](const BLNotifyEvent *event, void *user) {
            if (event->event == VELMRECORD_NOTIFY_POSITION && *static_cast<const int64_t *>(event->data1) > 0)
                VELMAUDIO_RecordStop(static_cast<VELMAUDIO>(user));
            return 1;
        };
        BLNOTIFY_AddHandler(VELMAUDIO_Dispatcher(doc), stop, doc);
        ASSERT_NE(VELMAUDIO_RecordStart(doc, flags, nullptr), nullptr);
        EXPECT_TRUE(pump_until([doc] { return !VELMAUDIO_IsRecording(doc); })) << flags;
        EXPECT_GT(VELMAUDIO_NumSamples(doc), 0) << flags;
        pump();
    }
}

TEST_F(RecordControl, AVetoedStartRecordsNothing)
{
    VELMAUDIO doc = document(kRate, 1, velmtest::sine(kRate, 1, 1000));
    ASSERT_NE(doc, nullptr);
    EventProbe refuse(doc, VELMRECORD_NOTIFY_START, 0);
    EventProbe destroyed(doc, VELMRECORD_NOTIFY_DESTROYED);
    EXPECT_EQ(VELMAUDIO_RecordStart(doc, VELMRECORD_FLAG_UNDO, "Record"), nullptr);
    EXPECT_EQ(refuse.count, 1);
    EXPECT_EQ(destroyed.count, 1);
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 0);
    EXPECT_EQ(VELMUNDO_Count(doc), 0);
    pump();
    EXPECT_EQ(VELMAUDIO_NumSamples(doc), 1000);
    EXPECT_EQ(VELMAUDIO_GetState(doc)->recordStart, -1);
}

TEST_F(RecordControl, QuietRecordingsAreNotAnnounced)
{
    VELMAUDIO doc = document(kRate, 1);
    ASSERT_NE(doc, nullptr);
    EventProbe refuse_start(doc, VELMRECORD_NOTIFY_START, 0);
    EventProbe refuse_stop(doc, VELMRECORD_NOTIFY_STOP, 0);
    ASSERT_NE(VELMAUDIO_RecordStart(doc, VELMRECORD_FLAG_QUIET, nullptr), nullptr);
    EXPECT_EQ(VELMAUDIO_RecordStop(doc), 1);
    EXPECT_EQ(refuse_start.count + refuse_stop.count, 0);
}

TEST_F(RecordControl, AVetoedStopKeepsRecording)
{
    VELMAUDIO doc = document(kRate, 1);
    ASSERT_NE(doc, nullptr);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, 0, nullptr);
    ASSERT_NE(r, nullptr);
    {
        EventProbe refuse(doc, VELMRECORD_NOTIFY_STOP, 0);
        EXPECT_EQ(VELMAUDIO_RecordStop(doc), 0);
        EXPECT_EQ(refuse.count, 1);
        EXPECT_EQ(refuse.data1[0], static_cast<void *>(r));
        // Nor can a new start replace it.
        EXPECT_EQ(VELMAUDIO_RecordStart(doc, 0, nullptr), nullptr);
        // A format change that cannot stop the recording does not happen.
        _audio_format wider{kRate, 2, 16, 0, 0};
        EXPECT_EQ(VELMAUDIO_ChangeAudioFormat(doc, &wider, nullptr, nullptr, 0, 0, nullptr), 0);
        EXPECT_EQ(AUDIOSIGNAL_NumChannels(VELMAUDIO_GetAudioSignal(doc)), 1);
    }
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 1);
    const int64_t now = VELMRECORD_RecordPosition(r);
    EXPECT_TRUE(record_until(r, now + 1000));
    EXPECT_EQ(VELMAUDIO_RecordStop(doc), 1);
}

TEST_F(RecordControl, ARecordingWhoseDeviceChangeFailedCanBeStopped)
{
    // A test device that offers only 50 Hz, too slow for one frame per
    // buffer time: its stream cannot open.
    soundtest::Setting buffer{"libvelm.record.osbuffersize", "0.005"};
    soundtest::Setting formats{"libvelm.sound.test.captureformats", std::to_string(0x41300000)};
    soundtest::Setting rate{"libvelm.sound.test.maxrate", "50"};
    soundtest::Plugged test_device{"libvelm.sound.testdevice", "1"};
    VELMAUDIO doc = document(kRate, 1);
    ASSERT_NE(doc, nullptr);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, 0, nullptr);
    ASSERT_NE(r, nullptr);
    ASSERT_TRUE(record_until(r, 1000));
    EXPECT_EQ(VELMRECORD_ChangeDevice(r, "Audio IO Test Device"), 0);
    EXPECT_EQ(VELMRECORD_IsRecording(r), 0);
    // What was recorded stays, and the document can record again.
    EXPECT_EQ(VELMAUDIO_RecordStop(doc), 1);
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 0);
    EXPECT_GE(VELMAUDIO_NumSamples(doc), 1000);
    EXPECT_NE(VELMAUDIO_RecordStart(doc, 0, nullptr), nullptr);
    EXPECT_EQ(VELMAUDIO_RecordStop(doc), 1);
}

TEST_F(RecordControl, PauseIsRefusedAndRecordingGoesOn)
{
    VELMAUDIO doc = document(kRate, 1);
    ASSERT_NE(doc, nullptr);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, 0, nullptr);
    ASSERT_NE(r, nullptr);
    EXPECT_EQ(VELMRECORD_ChangeDevice(r, "Virtual Device"), 1);
    EXPECT_EQ(VELMRECORD_Pause(r), 0);
    EXPECT_EQ(VELMRECORD_IsPaused(r), 0);
    EXPECT_EQ(VELMRECORD_IsRecording(r), 1);
    const int64_t now = VELMRECORD_RecordPosition(r);
    EXPECT_TRUE(record_until(r, now + 1000));
    EXPECT_EQ(VELMRECORD_Resume(r), 0);
    EXPECT_EQ(VELMRECORD_AddEffect(r, "invert"), 0);
    EXPECT_EQ(VELMRECORD_RemoveEffect(r, "invert"), 0);
    EXPECT_EQ(VELMRECORD_CreateFileRecorder(dir.file("x.wav").c_str(), "WAVE"), nullptr);
    EXPECT_EQ(VELMAUDIO_RecordStop(doc), 1);
}

TEST_F(RecordControl, ClosingTheDocumentWhileRecordingEndsIt)
{
    const _audio_format format{kRate, 1, 16, 0, 0};
    VELMAUDIO doc = VELMAUDIO_New(&format);
    ASSERT_NE(doc, nullptr);
    const int objects = CountRegisteredObjects();
    struct Seen {
        int destroyed = 0;
        int askedToSave = 0;
    } seen;
    auto count = [](const BLNotifyEvent *event, void *user) {
        auto *s = static_cast<Seen *>(user);
        if (event->event == VELMRECORD_NOTIFY_DESTROYED) ++s->destroyed;
        if (event->event == 0x20009) ++s->askedToSave;
        return 1;
    };
    BLNOTIFY_AddHandler(VELMAUDIO_Dispatcher(doc), count, &seen);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, 0, nullptr);
    ASSERT_NE(r, nullptr);
    EXPECT_EQ(CountRegisteredObjects(), objects + 1);
    ASSERT_TRUE(record_until(r, 2000));
    EXPECT_EQ(VELMAUDIO_Close(doc), 1);
    EXPECT_EQ(seen.destroyed, 1);
    EXPECT_EQ(seen.askedToSave, 1); // the recorded frames are unsaved changes
    EXPECT_EQ(CountRegisteredObjects(), objects - 1);
    EXPECT_EQ(VELMRECORD_DestroyRecorder(r), 0);
    pump(); // a capture thread still writing would touch freed memory here
}

TEST_F(RecordControl, FinalizingEndsEveryRecording)
{
    VELMAUDIO doc = document(kRate, 1);
    ASSERT_NE(doc, nullptr);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, 0, nullptr);
    ASSERT_NE(r, nullptr);
    ASSERT_TRUE(record_until(r, 1000));
    VELMRECORD_Finalize();
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 0);
    EXPECT_EQ(VELMRECORD_DestroyRecorder(r), 0);
    const int64_t length = VELMAUDIO_NumSamples(doc);
    pump();
    EXPECT_EQ(VELMAUDIO_NumSamples(doc), length);
    VELMRECORD_Initialize();
}

TEST_F(RecordControl, UnloadingWhileRecordingKeepsWhatWasRecorded)
{
    VELMAUDIO doc = document(kRate, 1, velmtest::sine(kRate, 1, 1000));
    ASSERT_NE(doc, nullptr);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, 0, nullptr);
    ASSERT_NE(r, nullptr);
    ASSERT_TRUE(record_until(r, 3000));
    // The recording ends; the document now has changes and stays loaded.
    EXPECT_EQ(VELMAUDIO_CloseEx(doc, 1), 0);
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 0);
    EXPECT_EQ(VELMAUDIO_IsOpen(doc), 1);
    const int64_t length = VELMAUDIO_NumSamples(doc);
    EXPECT_GE(length, 3000);
    pump();
    EXPECT_EQ(VELMAUDIO_NumSamples(doc), length);
}

TEST_F(RecordControl, UndoWhileRecordingEndsTheRecording)
{
    VELMAUDIO doc = document(kRate, 1, velmtest::sine(kRate, 1, 1000));
    ASSERT_NE(doc, nullptr);
    VELMRECORDER r = VELMAUDIO_RecordStart(doc, VELMRECORD_FLAG_UNDO, "Record");
    ASSERT_NE(r, nullptr);
    ASSERT_TRUE(record_until(r, 2000));
    ASSERT_EQ(VELMAUDIO_Undo(doc), 1);
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 0);
    EXPECT_EQ(VELMAUDIO_GetState(doc)->recordStart, -1);
    pump();
    EXPECT_EQ(VELMAUDIO_NumSamples(doc), 1000);
}

TEST_F(RecordControl, ADocumentHasOneRecorder)
{
    VELMAUDIO doc = document(kRate, 1);
    ASSERT_NE(doc, nullptr);
    EventProbe destroyed(doc, VELMRECORD_NOTIFY_DESTROYED);
    VELMRECORDER first = VELMAUDIO_RecordStart(doc, 0, nullptr);
    ASSERT_NE(first, nullptr);
    ASSERT_NE(VELMAUDIO_RecordStart(doc, 0, nullptr), nullptr);
    EXPECT_EQ(destroyed.count, 1);
    EXPECT_EQ(destroyed.data1[0], static_cast<void *>(first));

    VELMRECORDER spare = VELMRECORD_CreateRecorder(doc, 0, 0);
    ASSERT_NE(spare, nullptr);
    EXPECT_EQ(VELMAUDIO_LinkRecorder(doc, spare), 0);
    EXPECT_EQ(VELMAUDIO_UnlinkRecorder(doc, spare), 0);
    EXPECT_EQ(VELMAUDIO_RecordStop(doc), 1);
    EXPECT_EQ(VELMAUDIO_RecordStop(doc), 0);
    // A linked recorder that never started is released by the stop.
    EXPECT_EQ(VELMAUDIO_LinkRecorder(doc, spare), 1);
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 1);
    EXPECT_EQ(VELMAUDIO_RecordStop(doc), 1);
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 0);
    EXPECT_EQ(VELMRECORD_DestroyRecorder(spare), 0);
}

// Handlers that try to end a recorder while it is being ended, or while it
// asks to start, find nothing left to end.
TEST_F(RecordControl, HandlersCannotEndARecorderTwice)
{
    VELMAUDIO doc = document(kRate, 1);
    ASSERT_NE(doc, nullptr);
    struct Attempts {
        VELMAUDIO doc;
        uint32_t code;
        std::vector<int> results;
    } attempts{doc, VELMRECORD_NOTIFY_DESTROYED, {}};
    auto end_again = [](const BLNotifyEvent *event, void *user) {
        auto *a = static_cast<Attempts *>(user);
        if (event->event == a->code) {
            a->results.push_back(VELMAUDIO_RecordStop(a->doc));
            a->results.push_back(VELMRECORD_DestroyRecorder(static_cast<VELMRECORDER>(event->data1)));
        }
        return 1;
    };
    BLNOTIFY_AddHandler(VELMAUDIO_Dispatcher(doc), end_again, &attempts);
    ASSERT_NE(VELMAUDIO_RecordStart(doc, 0, nullptr), nullptr);
    EXPECT_EQ(VELMAUDIO_RecordStop(doc), 1);
    EXPECT_EQ(attempts.results, (std::vector<int>{0, 0}));

    // Destroyed by a handler of its own start announcement: the start fails.
    attempts.code = VELMRECORD_NOTIFY_START;
    attempts.results.clear();
    VELMRECORDER r = VELMRECORD_CreateRecorder(doc, 0, 0);
    ASSERT_NE(r, nullptr);
    EXPECT_EQ(VELMRECORD_Start(r, nullptr), 0);
    EXPECT_EQ(attempts.results, (std::vector<int>{0, 1}));
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 0);
    BLNOTIFY_DelHandler(VELMAUDIO_Dispatcher(doc), end_again, &attempts);
}

TEST_F(RecordControl, SettingsHaveDefaultsAndAbsurdBufferTimesAreBounded)
{
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.record.viewwindowtime"), 30);
    EXPECT_DOUBLE_EQ(BLSETTINGS_GetFloatEx(nullptr, "libvelm.record.osbuffersize"), 0.05);
    VELMAUDIO doc = document(kRate, 1);
    ASSERT_NE(doc, nullptr);
    for (const char *time : {"1e9", "-1", "nan"}) {
        BLSETTINGS_ChangeEx(nullptr, "libvelm.record.osbuffersize=%s", time);
        VELMRECORDER r = VELMAUDIO_RecordStart(doc, 0, nullptr);
        ASSERT_NE(r, nullptr) << time;
        EXPECT_TRUE(record_until(r, 1000)) << time;
        EXPECT_EQ(VELMAUDIO_RecordStop(doc), 1);
    }
    BLSETTINGS_DeleteEx(nullptr, "libvelm.record.osbuffersize");
}

TEST_F(RecordControl, RefusedRequests)
{
    VELMAUDIO doc = document(kRate, 1);
    ASSERT_NE(doc, nullptr);
    VELMRECORDER r = VELMRECORD_CreateRecorder(doc, VELMRECORD_FLAG_SILENT_DESTROY, 0);
    ASSERT_NE(r, nullptr);
    EventProbe destroyed(doc, VELMRECORD_NOTIFY_DESTROYED);
    EXPECT_EQ(VELMRECORD_GetStatus(r), VELMRECORD_STATUS_CREATED);
    EXPECT_EQ(VELMRECORD_RecordPosition(r), -1);
    EXPECT_EQ(VELMRECORD_Stop(r), 0);
    EXPECT_EQ(VELMRECORD_ChangeDevice(r, "Virtual Device"), 0);
    EXPECT_EQ(VELMRECORD_DestroyRecorder(r), 1);
    EXPECT_EQ(VELMRECORD_DestroyRecorder(r), 0);
    EXPECT_EQ(destroyed.count, 0);
    // A destroyed recorder's handle is refused like a null one.
    EXPECT_EQ(VELMRECORD_GetStatus(r), VELMRECORD_STATUS_CLOSED);
    EXPECT_EQ(VELMRECORD_IsRecording(r), 0);
    EXPECT_EQ(VELMRECORD_RecordPosition(r), -1);
    EXPECT_EQ(VELMRECORD_Start(r, nullptr), 0);
    EXPECT_EQ(VELMRECORD_Stop(r), 0);
    EXPECT_EQ(VELMRECORD_ChangeDevice(r, "Virtual Device"), 0);
    EXPECT_EQ(VELMRECORD_SetGUITimer(r, nullptr, nullptr), 0);
    EXPECT_EQ(VELMAUDIO_IsRecording(doc), 0);

    VELMAUDIO_SetEditable(doc, 0);
    EXPECT_EQ(VELMAUDIO_RecordStart(doc, 0, nullptr), nullptr);
    VELMAUDIO link = VELMAUDIO_CreateUnresolvedLink();
    EXPECT_EQ(VELMAUDIO_RecordStart(link, 0, nullptr), nullptr);
    EXPECT_EQ(VELMAUDIO_SetStartRecordPosition(link, 0), 0);
    VELMAUDIO_Close(link);

    EXPECT_EQ(VELMAUDIO_RecordStart(nullptr, 0, nullptr), nullptr);
    EXPECT_EQ(VELMAUDIO_RecordStop(nullptr), 0);
    EXPECT_EQ(VELMRECORD_Start(nullptr, "x"), 0);
    EXPECT_EQ(VELMRECORD_RecordPosition(nullptr), -1);
    EXPECT_EQ(VELMRECORD_DestroyRecorder(nullptr), 0);
}

} // namespace
