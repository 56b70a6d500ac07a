// The device record behind a VELMSOUNDDEVICE handle and the operation table
// through which the layer reaches a back-end.  Back-ends create records with
// velmsound::NewDevice and hand them to the list; the layer frees them.
#ifndef VELMSOUND_SOUND_INTERNAL_HPP
#define VELMSOUND_SOUND_INTERNAL_HPP

#include "sound/velmsound.h"

#include <mutex>

// A back-end's per-direction device handle and its streams are opaque here.
struct VelmSoundOps {
    void *(*OpenPlaybackDevice)(VELMSOUNDDEVICE device);
    void (*ClosePlaybackDevice)(void *devhandle);
    void *(*OpenCaptureDevice)(VELMSOUNDDEVICE device);
    void (*CloseCaptureDevice)(void *devhandle);
    void *(*OpenPlayback)(void *devhandle, float buffer_time, VELMSOUND_StreamCallback callback, void *user,
                          const _audio_format *format);
    int (*StartPlayback)(void *stream);
    int (*PausePlayback)(void *stream);
    int (*StopPlayback)(void *stream);
    int (*ClosePlayback)(void *stream);
    int64_t (*PlayCursorPosition)(void *stream);
    int (*IsPlaying)(void *stream);
    void *(*OpenCapture)(void *devhandle, float buffer_time, VELMSOUND_StreamCallback callback, void *user,
                         const _audio_format *format);
    int (*CloseCapture)(void *stream);
    int (*StartCapture)(void *stream);
    int (*StopCapture)(void *stream);
    int (*IsCapturing)(void *stream);
};

struct _VELMSOUNDDEVICE {
    uint32_t index = 0;
    uint8_t present = 0;
    uint8_t added = 0;
    const char *identity = identityBuffer; // what the back-end recognises the device by
    VELMSOUNDDEVICEINFO info{};
    VelmSoundOps ops{};
    std::mutex lock;                        // guards the lazy opening of the two handles
    void *playbackDevice = nullptr;
    void *captureDevice = nullptr;
    char identityBuffer[VELMSOUND_NAME_SIZE] = {};
};

namespace velmsound {

// A zeroed record of the given kind and identity, named name (cut to fit).
VELMSOUNDDEVICE NewDevice(uint32_t kind, const char *identity, const char *name, const char *description);
void DeleteDevice(VELMSOUNDDEVICE device);

// Installs the device-handle operations of a back-end whose devices need no
// handle of their own: the record is its handle for each direction it has.
void UseDeviceAsHandle(VELMSOUNDDEVICE device);

// The listed record of that kind and identity, or null.
VELMSOUNDDEVICE FindDevice(VELMSOUNDDEVICE *list, int count, uint32_t kind, const char *identity);

// Appends a new record marked present and added; a full list refuses it
// (the record is freed and the refusal logged).  Returns the new count.
int AppendDevice(VELMSOUNDDEVICE *list, int count, VELMSOUNDDEVICE device);

// Copies text into a fixed buffer, cut at its first line break and to fit.
void CopyLine(char *buffer, const char *text);

// The stream format checks every back-end shares: 16-bit, one or two
// channels, a rate the layer can represent.
bool UsableStreamFormat(const _audio_format *format);

// A device buffer time in seconds read from the setting key ("...=[%f]"):
// 0.05 when unset or not a number, else kept within 5 ms .. 2 s, so that an
// odd setting still opens a stream: a device cannot keep up below that, and
// above it the device's ring grows absurd.
double BufferTimeSetting(const char *key_format);

} // namespace velmsound

#endif // VELMSOUND_SOUND_INTERNAL_HPP
