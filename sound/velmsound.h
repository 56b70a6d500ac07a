/*
 * Sound devices: one process-wide list of playback and capture devices,
 * device and format selection, and playback and capture streams.
 *
 * Samples cross this layer as interleaved 16-bit PCM.  A playback stream
 * pulls them through its callback, a capture stream pushes them, always on
 * the device's own worker thread, never on the caller's.  The device list is
 * refreshed and read on the shell's thread only.
 */
#ifndef VELMSOUND_H
#define VELMSOUND_H

#include <stdint.h>

#include "core/velm_api.h"
#include "outside/signal/audioformat.h"

VELM_EXTERN_C_BEGIN

#define VELMSOUND_MAX_DEVICES 128
#define VELMSOUND_NAME_SIZE   256

/* Device kinds. */
#define VELMSOUND_KIND_TEST   0 /* the test back-end (VELMSOUND_TEST_EnumerateDevices) */
#define VELMSOUND_KIND_SYSTEM 1 /* the platform back-end: system devices and the virtual device */

/* Notifications, sent to the global dispatcher. */
#define VELMSOUND_NOTIFY_DEVICE_ADDED 0x2003C /* data 1: the new device's VELMSOUNDDEVICEINFO */
#define VELMSOUND_NOTIFY_LIST_CHANGED 0x2003D /* devices were added or removed */

typedef struct _VELMSOUNDDEVICE *VELMSOUNDDEVICE;
typedef struct _VELMSOUNDSTREAM *VELMSOUNDSTREAM;

/* Playback: fill up to bytes bytes of buffer, return how many were written
 * (0: no more data).  Capture: consume the bytes and return exactly bytes
 * to keep capturing.  Runs on the device's worker thread. */
typedef int32_t (*VELMSOUND_StreamCallback)(void *user, void *buffer, int32_t bytes);

/* The public part of a device, as the shell reads it from the list. */
typedef struct _VELMSOUNDDEVICEINFO {
    VELMSOUNDDEVICE handle;     /* the value the rest of the API takes */
    uint8_t  playback;
    uint8_t  defaultPlayback;
    uint8_t  capture;
    uint8_t  defaultCapture;
    uint32_t kind;              /* VELMSOUND_KIND_* */
    uint32_t maxPlaybackRate;   /* Hz */
    uint32_t maxCaptureRate;    /* Hz */
    uint32_t playbackFormats;   /* format filter mask of playable formats */
    uint32_t captureFormats;    /* format filter mask of recordable formats */
    const char *name;
    const char *description;
    char nameBuffer[VELMSOUND_NAME_SIZE];
    char descriptionBuffer[VELMSOUND_NAME_SIZE];
} VELMSOUNDDEVICEINFO;

/* The published list, in list order; rebuilt by every refresh. */
VELM_API extern VELMSOUNDDEVICEINFO *VelmSoundDeviceInfoList[VELMSOUND_MAX_DEVICES];
VELM_API extern int32_t VelmSoundDeviceInfoCount;

/* Initialises on the first call, then refreshes the list; the result is
 * VELMSOUND_UpdateDeviceList's. */
VELM_API int VELMSOUND_Initialize(void);
VELM_API void VELMSOUND_Finalize(void);

/* Re-enumerates the devices; 1 when one was added or removed. */
VELM_API int VELMSOUND_UpdateDeviceList(void);

/* The first device named exactly name that supports the direction; null for
 * a null name or "default", which let selection choose. */
VELM_API VELMSOUNDDEVICE VELMSOUND_GetSoundDeviceByName(const char *name, int capture);

/* Choose a device (the given one when it fits, else the default, else any)
 * and adjust format in place to one the device supports; null on failure. */
VELM_API VELMSOUNDDEVICE VELMSOUND_SelectPlaybackDevice(VELMSOUNDDEVICE device, _audio_format *format);
VELM_API VELMSOUNDDEVICE VELMSOUND_SelectCaptureDevice(VELMSOUNDDEVICE device, _audio_format *format);

VELM_API int VELMSOUND_SupportPlayback(void);
VELM_API int VELMSOUND_SupportCapture(void);

/* buffer_time is the device latency in seconds; format must be 16-bit. */
VELM_API VELMSOUNDSTREAM VELMSOUND_OpenPlayback(VELMSOUNDDEVICE device, float buffer_time,
                                                VELMSOUND_StreamCallback callback, void *user,
                                                const _audio_format *format);
VELM_API VELMSOUNDSTREAM VELMSOUND_OpenCapture(VELMSOUNDDEVICE device, float buffer_time,
                                               VELMSOUND_StreamCallback callback, void *user,
                                               const _audio_format *format);

VELM_API int VELMSOUND_Start(VELMSOUNDSTREAM stream);
VELM_API int VELMSOUND_Stop(VELMSOUNDSTREAM stream);
VELM_API int VELMSOUND_Pause(VELMSOUNDSTREAM stream);
VELM_API int VELMSOUND_Close(VELMSOUNDSTREAM stream);

/* Frames played so far; 0 for capture, -1 for a null stream. */
VELM_API int64_t VELMSOUND_PlayCursorPosition(VELMSOUNDSTREAM stream);
VELM_API int64_t VELMSOUND_CaptureCursorPosition(VELMSOUNDSTREAM stream);
VELM_API int VELMSOUND_IsPlaying(VELMSOUNDSTREAM stream);
VELM_API int VELMSOUND_IsCapturing(VELMSOUNDSTREAM stream);

/* The platform back-end the list is filled from. */
VELM_API int VELMSOUND_WINDOWS_DIRECTSOUND_Initialize(void);
VELM_API int VELMSOUND_WINDOWS_DIRECTSOUND_Finalize(void);
VELM_API int VELMSOUND_WINDOWS_DIRECTSOUND_EnumerateDevices(VELMSOUNDDEVICE *list, int count);

/* The test back-end: one timer-driven device writing to and reading from
 * files.  Refreshes never call it. */
VELM_API int VELMSOUND_TEST_EnumerateDevices(VELMSOUNDDEVICE *list, int count);

VELM_EXTERN_C_END

#endif /* VELMSOUND_H */
