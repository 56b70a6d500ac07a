// Starting and stopping a recording, and moving it to another device.
#include <algorithm>

#include "core/velmqueries.h"
#include "edit/velmundo.h"
#include "sound/recorder_internal.hpp"

namespace {

bool same_shape(const _audio_format &a, const _audio_format &b)
{
    return a.sampleRate == b.sampleRate && a.numChannels == b.numChannels;
}

// The named capture device (or the system's choice) and the 16-bit format
// it records closest to the signal's; null when there is none.
VELMSOUNDDEVICE select_device(VELMRECORDER r, const char *name, _audio_format *format)
{
    *format = r->signalFormat;
    format->bitsPerSample = 16;
    return VELMSOUND_SelectCaptureDevice(VELMSOUND_GetSoundDeviceByName(name, 1), format);
}

void close_stream(VELMRECORDER r)
{
    VELMSOUND_Close(r->stream);
    r->stream = nullptr;
}

VELMSOUNDSTREAM open_stream(VELMRECORDER r)
{
    return VELMSOUND_OpenCapture(r->device, r->bufferTime, velm::recorder_capture, r, &r->captureFormat);
}

// False when a handler refused, or destroyed the recorder meanwhile.
bool announce(VELMRECORDER r, uint32_t event)
{
    if (r->flags & VELMRECORD_FLAG_QUIET) return true;
    const bool agreed = BLNOTIFY_SendEvent(VELMAUDIO_Dispatcher(r->doc), nullptr, 0, event, r, nullptr) != 0;
    return agreed && velm::recorder_alive(r);
}

} // namespace

namespace velm {

bool recorder_make_conversion(VELMRECORDER r)
{
    AUDIOFX_DestroyPath(r->conversion);
    r->conversion = nullptr;
    if (same_shape(r->captureFormat, r->signalFormat)) return true;
    r->conversion = AUDIOFX_CreatePathEx(r->captureFormat, -1, -1, "fmtconv[sr=%d,nc=%d]",
                                         r->signalFormat.sampleRate, r->signalFormat.numChannels);
    return r->conversion != nullptr;
}

} // namespace velm

int VELMRECORD_Start(VELMRECORDER r, const char *undo_label)
{
    if (!velm::recorder_alive(r) || r->stream || !r->doc || !VELMAUDIO_GetAudioSignal(r->doc)) return 0;
    VELMAUDIO_GetSignalFormat(&r->signalFormat, r->doc);
    const char *name = BLSETTINGS_GetStringEx(nullptr, "libvelm.record.devicename=[%s]", "default");
    r->device = select_device(r, name, &r->captureFormat);
    if (!r->device || !announce(r, VELMRECORD_NOTIFY_START)) return 0;
    if (!velm::recorder_make_conversion(r)) return 0;
    r->lastShown = r->position;
    r->stream = open_stream(r);
    if (!r->stream) return 0;
    // The undo step keeps the signal as it was and hands the document a copy
    // to record into.
    if (undo_label && !VELMAUDIO_CreateSignalUndo(r->doc, undo_label)) {
        close_stream(r);
        return 0;
    }
    r->signal = VELMAUDIO_GetAudioSignal(r->doc);
    r->position = std::min(r->position, AUDIOSIGNAL_NumSamples(r->signal));
    MutexLock(r->lock);
    r->pipe = AUDIOSIGNAL_CreatePipe(r->signal, r->position);
    MutexUnlock(r->lock);
    if (!r->pipe || !VELMSOUND_Start(r->stream)) {
        close_stream(r);
        velm::recorder_close_pipe(r);
        if (undo_label) VELMAUDIO_Undo(r->doc);
        return 0;
    }
    if (r->updateCallback) r->timer = VELMTIMER_CreateTimer(velm::kRecordUpdateMs, r->updateCallback, r->updateUser);
    VELMAUDIO_SetStartRecordPosition(r->doc, r->position);
    r->status = VELMRECORD_STATUS_RECORDING;
    return 1;
}

int VELMRECORD_Stop(VELMRECORDER r)
{
    // A recording whose device change failed has no stream left, yet must
    // still end, or its document could never record again.
    if (!velm::recorder_alive(r) || r->status != VELMRECORD_STATUS_RECORDING) return 0;
    if (!announce(r, VELMRECORD_NOTIFY_STOP)) return 0;
    if (r->stream) VELMSOUND_Stop(r->stream);
    if (r->timer) {
        VELMTIMER_KillTimer(r->timer);
        r->timer = nullptr;
    }
    velm::recorder_close_pipe(r);
    VELMAUDIO_SetStopRecordPosition(r->doc);
    r->status = VELMRECORD_STATUS_STOPPED;
    return 1;
}

int VELMRECORD_ChangeDevice(VELMRECORDER r, const char *device_name)
{
    if (!velm::recorder_alive(r) || !device_name || r->status != VELMRECORD_STATUS_RECORDING) return 0;
    _audio_format format;
    VELMSOUNDDEVICE device = select_device(r, device_name, &format);
    if (!device) return 0;
    if (device == r->device) return 1;
    if (r->stream) {
        VELMSOUND_Stop(r->stream);
        close_stream(r);
    }
    // The old device's frames still in the conversion belong before the new ones.
    MutexLock(r->lock);
    velm::recorder_drain(r);
    r->device = device;
    r->captureFormat = format;
    const bool converts = velm::recorder_make_conversion(r);
    MutexUnlock(r->lock);
    if (!converts) return 0;
    r->stream = open_stream(r);
    return r->stream && VELMSOUND_Start(r->stream) ? 1 : 0;
}
