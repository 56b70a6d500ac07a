// The document's side of recording: its one recorder and the recording
// range of its view state.
#include <algorithm>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "sound/recorder_internal.hpp"

namespace {

void send_position(VELMAUDIO doc, int64_t *position)
{
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, VELMRECORD_NOTIFY_POSITION, position, nullptr);
}

int64_t seconds_to_samples(VELMAUDIO doc, double seconds)
{
    _audio_format format;
    return AUDIO_Time2Sample(VELMAUDIO_GetSignalFormat(&format, doc), seconds);
}

} // namespace

VELMRECORDER VELMAUDIO_RecordStart(VELMAUDIO doc, uint32_t flags, const char *undo_label)
{
    if (!doc || !doc->signal) return nullptr;
    if (doc->recorder && !VELMAUDIO_RecordStop(doc)) return nullptr;
    VELMRECORDER r = VELMRECORD_CreateRecorder(doc, flags, VELMAUDIO_GetCursorPosition(doc));
    if (!r) return nullptr;
    if (!VELMRECORD_Start(r, (flags & VELMRECORD_FLAG_UNDO) ? undo_label : nullptr)) {
        VELMRECORD_DestroyRecorder(r);
        return nullptr;
    }
    doc->recorder = r;
    return r;
}

int VELMAUDIO_RecordStop(VELMAUDIO doc)
{
    if (!doc || !doc->recorder) return 0;
    auto *r = static_cast<VELMRECORDER>(doc->recorder);
    // A recorder that no longer records is only released: keeping it would
    // leave the document unable to record again.
    if (VELMRECORD_GetStatus(r) == VELMRECORD_STATUS_RECORDING && !VELMRECORD_Stop(r)) return 0;
    VELMRECORD_DestroyRecorder(r);
    doc->recorder = nullptr;
    return 1;
}

int VELMAUDIO_IsRecording(VELMAUDIO doc)
{
    return doc && doc->recorder ? 1 : 0;
}

int VELMAUDIO_LinkRecorder(VELMAUDIO doc, VELMRECORDER recorder)
{
    if (!doc || !recorder || doc->recorder) return 0;
    doc->recorder = recorder;
    return 1;
}

int VELMAUDIO_UnlinkRecorder(VELMAUDIO doc, VELMRECORDER recorder)
{
    if (!doc || !recorder || doc->recorder != recorder) return 0;
    doc->recorder = nullptr;
    return 1;
}

int VELMAUDIO_SetStartRecordPosition(VELMAUDIO doc, int64_t position)
{
    if (!doc || !doc->signal) return 0;
    doc->state->recordStart = doc->state->recordPosition = position;
    const int64_t ten_seconds = seconds_to_samples(doc, 10.0);
    if (VELMAUDIO_ViewLength(doc) < ten_seconds)
        VELMAUDIO_Zoom(doc, doc->state->viewBegin, doc->state->viewBegin + ten_seconds);
    send_position(doc, &position);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_FULL);
    return 1;
}

int VELMAUDIO_SetRecordPosition(VELMAUDIO doc, int64_t position)
{
    if (!doc || !doc->signal) return 0;
    if (position == doc->state->recordPosition) return 1;
    doc->state->recordPosition = position;
    const int64_t window = std::max(VELMAUDIO_ViewLength(doc), seconds_to_samples(doc, 5.0));
    VELMAUDIO_Zoom(doc, position - window, position);
    send_position(doc, &position);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_FULL);
    return 1;
}

int VELMAUDIO_SetStopRecordPosition(VELMAUDIO doc)
{
    if (!doc || !doc->state) return 0;
    doc->state->recordStart = doc->state->recordPosition = -1;
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_RECORDING);
    return 1;
}
