// Playback and capture streams over an endpoint: the playback ring holds
// four buffer times and is refilled by one worker thread every eighth of
// it; the capture ring holds a hundred buffer times and is drained by its
// worker at most every 200 ms.  Stream callbacks run on the worker only,
// which fills the playback ring as soon as the stream opens.
#ifndef VELMPLATFORM_SOUND_RING_HPP
#define VELMPLATFORM_SOUND_RING_HPP

#include "platform/sound_endpoint.hpp"
#include "sound/velmsound.h"

#include <memory>

namespace velmsound {

// Ring sizes in bytes for a buffer time, whole frames; the capture ring
// holds at most 20 seconds.
uint32_t PlaybackRingBytes(const _audio_format *format, float buffer_time);
uint32_t CaptureRingBytes(const _audio_format *format, float buffer_time);

// Stream handles as the device operations take them; null on failure.
void *OpenPlaybackRing(std::unique_ptr<PlaybackEndpoint> endpoint, float buffer_time,
                       VELMSOUND_StreamCallback callback, void *user, const _audio_format *format);
void *OpenCaptureRing(std::unique_ptr<CaptureEndpoint> endpoint, float buffer_time,
                      VELMSOUND_StreamCallback callback, void *user, const _audio_format *format);

// Installs the stream operations of a device built on the rings for one
// direction; the back-end adds its OpenPlayback or OpenCapture, which make
// the endpoint.
void InstallPlaybackRingOps(VELMSOUNDDEVICE device);
void InstallCaptureRingOps(VELMSOUNDDEVICE device);

// The stream operations of every device built on the rings.
int StartPlaybackRing(void *stream);
int PausePlaybackRing(void *stream);
int StopPlaybackRing(void *stream);
int ClosePlaybackRing(void *stream);
int64_t PlaybackRingPosition(void *stream);
int PlaybackRingIsPlaying(void *stream);
int CloseCaptureRing(void *stream);
int StartCaptureRing(void *stream);
int StopCaptureRing(void *stream);
int CaptureRingIsCapturing(void *stream);

} // namespace velmsound

#endif // VELMPLATFORM_SOUND_RING_HPP
