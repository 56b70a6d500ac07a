// The recorder's 500 ms update on the shell's thread: the view follows the
// recording, or the shell is told the position and moves it itself.
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "core/velmtimeconv.h"
#include "sound/recorder_internal.hpp"

namespace {

// Reads the recorder before it sends anything: a handler may destroy it.
int show_position(VELMRECORDER r, int64_t position)
{
    VELMAUDIO doc = r->doc;
    if (r->flags & VELMRECORD_FLAG_NOTIFY_POSITION) {
        if (r->flags & VELMRECORD_FLAG_QUIET) return 1;
        return BLNOTIFY_SendEvent(VELMAUDIO_Dispatcher(doc), nullptr, 0, VELMRECORD_NOTIFY_POSITION, &position, r);
    }
    const int64_t window = VELMAUDIO_TimeToSample(doc, r->viewWindow);
    if (window > VELMAUDIO_NumSamples(doc))
        VELMAUDIO_ZoomFullReset(doc);
    else
        VELMAUDIO_Zoom(doc, position - window, position);
    VELMAUDIO_SetRecordPosition(doc, position);
    return 1;
}

} // namespace

namespace velm {

int recorder_update(void *user)
{
    auto *r = static_cast<VELMRECORDER>(user);
    if (!r || r->updateBusy || !VELMRECORD_IsRecording(r)) return 0;
    const int64_t position = VELMRECORD_RecordPosition(r);
    if (position <= r->lastShown) return 1;
    r->lastShown = position;
    r->updateBusy = 1;
    const int result = show_position(r, position);
    // A handler of the events sent meanwhile may have destroyed the recorder.
    if (recorder_alive(r)) r->updateBusy = 0;
    return result;
}

} // namespace velm
