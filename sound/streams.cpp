// Playback and capture streams: lazy device handles, the back-end stream,
// and the check that a stream's device is still in the list.
#include "sound/sound_devices.hpp"

#include "outside/base/blbase.h"

#include <algorithm>
#include <cmath>

struct _VELMSOUNDSTREAM {
    uint32_t direction; // 0 playback, 1 capture
    VELMSOUNDDEVICE device;
    // A copy of the device's operations, so that a stream outliving its
    // device (removed by a refresh) can still be released.
    VelmSoundOps ops;
    void *backend;
};

namespace {

constexpr uint32_t kPlayback = 0;
constexpr uint32_t kCapture = 1;

bool CheckDeviceSanity(VELMSOUNDSTREAM stream)
{
    if (velmsound::IsListed(stream->device)) return true;
    BLDEBUG_Error(-1, "(VELMSOUND)_CheckDeviceSanity: Device sanity check failed!");
    return false;
}

// The device's handle for the direction, opened on first use.
void *DeviceHandle(VELMSOUNDDEVICE device, uint32_t direction)
{
    void *&handle = direction == kPlayback ? device->playbackDevice : device->captureDevice;
    if (handle) return handle;
    std::lock_guard guard(device->lock);
    if (!handle) {
        auto open = direction == kPlayback ? device->ops.OpenPlaybackDevice : device->ops.OpenCaptureDevice;
        if (open) handle = open(device);
    }
    return handle;
}

VELMSOUNDSTREAM Open(VELMSOUNDDEVICE device, uint32_t direction, float buffer_time,
                     VELMSOUND_StreamCallback callback, void *user, const _audio_format *format)
{
    if (!device || !callback || !format || !velmsound::IsListed(device)) return nullptr;
    if (!(buffer_time > 0.0f) || buffer_time > 10.0f) return nullptr;
    if (direction == kPlayback && !device->playbackDevice) {
        BLDEBUG_Log(18000, "VELMSOUND_OpenPlayback: Selected playback device: %s", device->info.name);
        BLDEBUG_Log(18000, "VELMSOUND_OpenPlayback: Playback format: %s", AUDIO_ComposeFormatString(format));
    }
    void *handle = DeviceHandle(device, direction);
    if (!handle) return nullptr;
    auto open = direction == kPlayback ? device->ops.OpenPlayback : device->ops.OpenCapture;
    void *backend = open ? open(handle, buffer_time, callback, user, format) : nullptr;
    if (!backend) return nullptr;
    return new _VELMSOUNDSTREAM{direction, device, device->ops, backend};
}

} // namespace

double velmsound::BufferTimeSetting(const char *key_format)
{
    const double t = BLSETTINGS_GetFloatEx(nullptr, key_format, 0.05);
    return std::isfinite(t) ? std::clamp(t, 0.005, 2.0) : 0.05;
}

VELMSOUNDSTREAM VELMSOUND_OpenPlayback(VELMSOUNDDEVICE device, float buffer_time, VELMSOUND_StreamCallback callback,
                                       void *user, const _audio_format *format)
{
    return Open(device, kPlayback, buffer_time, callback, user, format);
}

VELMSOUNDSTREAM VELMSOUND_OpenCapture(VELMSOUNDDEVICE device, float buffer_time, VELMSOUND_StreamCallback callback,
                                      void *user, const _audio_format *format)
{
    return Open(device, kCapture, buffer_time, callback, user, format);
}

int VELMSOUND_Start(VELMSOUNDSTREAM stream)
{
    if (!stream || !CheckDeviceSanity(stream)) return 0;
    return stream->direction == kPlayback ? stream->ops.StartPlayback(stream->backend)
                                          : stream->ops.StartCapture(stream->backend);
}

int VELMSOUND_Stop(VELMSOUNDSTREAM stream)
{
    if (!stream || !CheckDeviceSanity(stream)) return 0;
    return stream->direction == kPlayback ? stream->ops.StopPlayback(stream->backend)
                                          : stream->ops.StopCapture(stream->backend);
}

int VELMSOUND_Pause(VELMSOUNDSTREAM stream)
{
    if (!stream || !CheckDeviceSanity(stream)) return 0;
    return stream->direction == kPlayback ? stream->ops.PausePlayback(stream->backend) : 0;
}

// A stream whose device went away is still released (its worker stopped and
// its memory freed), but the call reports the failed check.
int VELMSOUND_Close(VELMSOUNDSTREAM stream)
{
    if (!stream) return 0;
    const bool sane = CheckDeviceSanity(stream);
    const int closed = stream->direction == kPlayback ? stream->ops.ClosePlayback(stream->backend)
                                                      : stream->ops.CloseCapture(stream->backend);
    delete stream;
    return sane && closed;
}

int64_t VELMSOUND_PlayCursorPosition(VELMSOUNDSTREAM stream)
{
    if (!stream) return -1;
    if (!CheckDeviceSanity(stream)) return 0;
    return stream->direction == kPlayback ? stream->ops.PlayCursorPosition(stream->backend) : 0;
}

int64_t VELMSOUND_CaptureCursorPosition(VELMSOUNDSTREAM stream)
{
    return 0;
}

int VELMSOUND_IsPlaying(VELMSOUNDSTREAM stream)
{
    if (!stream || !CheckDeviceSanity(stream)) return 0;
    return stream->direction == kPlayback && stream->backend ? stream->ops.IsPlaying(stream->backend) : 0;
}

int VELMSOUND_IsCapturing(VELMSOUNDSTREAM stream)
{
    if (!stream || stream->direction != kCapture) return 0;
    return stream->ops.IsCapturing(stream->backend);
}
