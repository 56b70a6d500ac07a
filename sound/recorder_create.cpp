// Recorder lifecycle: settings, creation, destruction, queries, and the
// recorders a document or a signal must end before it goes away.
#include <algorithm>
#include <cmath>
#include <vector>

#include "core/velmqueries.h"
#include "sound/recorder_guard.hpp"
#include "sound/recorder_internal.hpp"
#include "sound/sound_internal.hpp"

namespace {

constexpr double kDefaultViewWindow = 30.0;

double view_window_setting()
{
    const double t = BLSETTINGS_GetFloatEx(nullptr, "libvelm.record.viewwindowtime=[%f]", kDefaultViewWindow);
    return std::isfinite(t) && t > 0 ? t : kDefaultViewWindow;
}

// Live recorders, so that a document can end those that write into it.
// Created, destroyed and looked up on the shell's thread only.
std::vector<VELMRECORDER> &live_recorders()
{
    static std::vector<VELMRECORDER> list;
    return list;
}

int dispose_recorder(void *recorder)
{
    return VELMRECORD_DestroyRecorder(static_cast<VELMRECORDER>(recorder));
}

template <typename Match>
void destroy_where(Match match)
{
    std::vector<VELMRECORDER> doomed;
    for (VELMRECORDER r : live_recorders())
        if (match(r)) doomed.push_back(r);
    for (VELMRECORDER r : doomed) VELMRECORD_DestroyRecorder(r);
}

} // namespace

namespace velm {

bool recorder_alive(VELMRECORDER recorder)
{
    const std::vector<VELMRECORDER> &list = live_recorders();
    return std::find(list.begin(), list.end(), recorder) != list.end() && IsRegisteredObject(recorder);
}

void end_document_recordings(VELMAUDIO doc)
{
    if (doc) destroy_where([doc](VELMRECORDER r) { return r->doc == doc; });
}

void end_signal_recordings(const AUDIOSIGNAL *signal)
{
    if (signal) destroy_where([signal](VELMRECORDER r) { return r->pipe && r->signal == signal; });
}

} // namespace velm

int VELMRECORD_Initialize(void)
{
    VELMSOUND_Initialize();
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.record.viewwindowtime=%d", static_cast<int>(kDefaultViewWindow));
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.record.osbuffersize=%f", 0.05);
    return 1;
}

void VELMRECORD_Finalize(void)
{
    // Their streams would outlive the devices they run on.
    destroy_where([](VELMRECORDER) { return true; });
    VELMSOUND_Finalize();
}

VELMRECORDER VELMRECORD_CreateRecorder(VELMAUDIO doc, uint32_t flags, int64_t position)
{
    AUDIOSIGNAL *signal = VELMAUDIO_GetAudioSignal(doc);
    if (!signal || !VELMAUDIO_Editable(doc)) return nullptr;
    VELMSOUND_Initialize();
    if (!VELMSOUND_SupportCapture()) {
        BLDEBUG_Warning(-1, "VELMRECORD_CreateRecorder: No device sound found!");
        return nullptr;
    }
    BLMEM pool = BLMEM_CreateMemDescrEx("VELMRECORDER MemSpace", 1024, 0);
    if (!pool) return nullptr;
    auto *r = static_cast<VELMRECORDER>(BLMEM_New(pool, sizeof(_VELMRECORDER)));
    float *buffer = r ? static_cast<float *>(BLMEM_New(pool, velm::kRecordBufferSamples * sizeof(float))) : nullptr;
    BLMUTEX lock = buffer ? MutexInit() : nullptr;
    if (!lock) {
        BLMEM_DisposeMemDescr(pool);
        return nullptr;
    }
    r->pool = pool;
    r->target = 0;
    r->doc = doc;
    r->signal = signal;
    r->lock = lock;
    r->flags = flags;
    VELMAUDIO_GetSignalFormat(&r->signalFormat, doc);
    r->status = VELMRECORD_STATUS_CREATED;
    r->position = std::clamp<int64_t>(position, 0, VELMAUDIO_NumSamples(doc));
    r->updateCallback = velm::recorder_update;
    r->updateUser = r;
    r->buffer = buffer;
    r->capacity = velm::kRecordBufferSamples;
    r->bufferTime = static_cast<float>(velmsound::BufferTimeSetting("libvelm.record.osbuffersize=[%f]"));
    r->viewWindow = static_cast<float>(view_window_setting());
    live_recorders().push_back(r);
    RegisterObject(r, 0, dispose_recorder);
    return r;
}

int VELMRECORD_DestroyRecorder(VELMRECORDER r)
{
    if (!r || !velm::recorder_alive(r)) return 0;
    // Gone for everyone first: handlers of the events below cannot reach it twice.
    UnRegisterObject(r);
    std::vector<VELMRECORDER> &list = live_recorders();
    list.erase(std::remove(list.begin(), list.end(), r), list.end());
    VELMAUDIO_UnlinkRecorder(r->doc, r);
    if (r->timer) {
        VELMTIMER_KillTimer(r->timer);
        r->timer = nullptr;
    }
    const bool was_recording = r->status == VELMRECORD_STATUS_RECORDING;
    if (r->stream && VELMSOUND_IsCapturing(r->stream)) VELMSOUND_Stop(r->stream);
    velm::recorder_close_pipe(r);
    if (was_recording) VELMAUDIO_SetStopRecordPosition(r->doc);
    if (!(r->flags & VELMRECORD_FLAG_SILENT_DESTROY))
        BLNOTIFY_SendEvent(VELMAUDIO_Dispatcher(r->doc), nullptr, 0, VELMRECORD_NOTIFY_DESTROYED, r, nullptr);
    // Closing the stream ends its worker thread, which holds the record.
    if (r->stream && VELMSOUND_Close(r->stream)) r->status = VELMRECORD_STATUS_CLOSED;
    r->stream = nullptr;
    MutexDestroy(r->lock);
    AUDIOFX_DestroyPath(r->conversion);
    BLMEM_DisposeMemDescr(r->pool);
    return 1;
}

int64_t VELMRECORD_RecordPosition(VELMRECORDER r)
{
    if (!velm::recorder_alive(r) || r->status != VELMRECORD_STATUS_RECORDING) return -1;
    MutexLock(r->lock);
    const int64_t position = r->position;
    MutexUnlock(r->lock);
    return position;
}

int VELMRECORD_GetStatus(VELMRECORDER r)
{
    return velm::recorder_alive(r) ? r->status : VELMRECORD_STATUS_CLOSED;
}

int VELMRECORD_IsRecording(VELMRECORDER r)
{
    return velm::recorder_alive(r) && r->stream && VELMSOUND_IsCapturing(r->stream) ? 1 : 0;
}

int VELMRECORD_SetGUITimer(VELMRECORDER r, VELMTIMER_Callback callback, void *user)
{
    if (!velm::recorder_alive(r) || r->timer) return 0;
    r->updateCallback = callback;
    r->updateUser = user;
    return 1;
}

VELMRECORDER VELMRECORD_CreateFileRecorder(const char *, const char *) { return nullptr; }
int VELMRECORD_AddEffect(VELMRECORDER, const char *) { return 0; }
int VELMRECORD_RemoveEffect(VELMRECORDER, const char *) { return 0; }
int VELMRECORD_Pause(VELMRECORDER) { return 0; }
int VELMRECORD_Resume(VELMRECORDER) { return 0; }
int VELMRECORD_IsPaused(VELMRECORDER) { return 0; }
