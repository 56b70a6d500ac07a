/*
 * Recording: a recorder captures 16-bit PCM from a capture device, converts
 * it to the document signal's sample rate and channel count when the device
 * delivers another, and inserts it into the signal at the record position,
 * which starts at the document's cursor.  A 500 ms timer on the caller's
 * thread moves the view along with the growing recording.
 *
 * Everything here runs on the shell's thread except the capture callback,
 * which runs on the device's worker thread and only appends to the signal.
 */
#ifndef VELMRECORD_H
#define VELMRECORD_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmaudio.h"
#include "core/velmtimer.h"

VELM_EXTERN_C_BEGIN

typedef struct _VELMRECORDER *VELMRECORDER;

/* Record flags. */
#define VELMRECORD_FLAG_QUIET           0x1u       /* no start and stop announcements, no position event */
#define VELMRECORD_FLAG_NOTIFY_POSITION 0x2u       /* send the position instead of moving the view */
#define VELMRECORD_FLAG_UNDO            0x4u       /* make an undo step at start */
#define VELMRECORD_FLAG_SILENT_DESTROY  0x1800000u /* either bit: no destroy event */

/* Recorder status. */
#define VELMRECORD_STATUS_CLOSED    0
#define VELMRECORD_STATUS_CREATED   1
#define VELMRECORD_STATUS_RECORDING 2
#define VELMRECORD_STATUS_STOPPED   3

/* Events on the document's dispatcher. */
#define VELMRECORD_NOTIFY_STOP      0x2003F /* before stopping, data 1: recorder; 0 vetoes */
#define VELMRECORD_NOTIFY_START     0x20044 /* before starting, data 1: recorder; 0 vetoes */
#define VELMRECORD_NOTIFY_DESTROYED 0x20046 /* data 1: recorder */
#define VELMRECORD_NOTIFY_POSITION  0x20047 /* data 1: int64_t *position; data 2: the recorder
                                               when sent by its update timer, else null */

/* Registers the recording settings ("libvelm.record.viewwindowtime", 30 s,
 * and "libvelm.record.osbuffersize", the device latency, 0.05 s) and starts
 * the sound layer.  Finalize frees every recorder, then stops the layer. */
VELM_API int  VELMRECORD_Initialize(void);
VELM_API void VELMRECORD_Finalize(void);

/* A recorder into doc's signal at min(position, sample count); null for a
 * document without a signal, one that is not editable, or without sound
 * devices. */
VELM_API VELMRECORDER VELMRECORD_CreateRecorder(VELMAUDIO doc, uint32_t flags, int64_t position);
/* Opens the device named by "libvelm.record.devicename" and starts
 * capturing; 0 when a stream is already open (also after a stop), no device
 * fits, or the start is vetoed.  With a label an undo step of that label
 * comes first. */
VELM_API int VELMRECORD_Start(VELMRECORDER recorder, const char *undo_label);
/* Ends capturing (status stopped) unless vetoed; only while recording. */
VELM_API int VELMRECORD_Stop(VELMRECORDER recorder);
/* Stops a running capture without asking and frees the recorder; 0 for a
 * recorder that is not (or no longer) alive. */
VELM_API int VELMRECORD_DestroyRecorder(VELMRECORDER recorder);

/* The next signal position to be written while recording, else -1. */
VELM_API int64_t VELMRECORD_RecordPosition(VELMRECORDER recorder);
VELM_API int VELMRECORD_GetStatus(VELMRECORDER recorder);
/* 1 while the device captures. */
VELM_API int VELMRECORD_IsRecording(VELMRECORDER recorder);
/* Replaces what the 500 ms timer calls (null: no timer); refused while the
 * timer runs. */
VELM_API int VELMRECORD_SetGUITimer(VELMRECORDER recorder, VELMTIMER_Callback callback, void *user);
/* Moves a running recording to another capture device (by name, "default"
 * for the system's choice); 0 when not recording. */
VELM_API int VELMRECORD_ChangeDevice(VELMRECORDER recorder, const char *device_name);

/* Not supported: they change nothing and return 0. */
VELM_API VELMRECORDER VELMRECORD_CreateFileRecorder(const char *file_name, const char *format);
VELM_API int VELMRECORD_AddEffect(VELMRECORDER recorder, const char *effect);
VELM_API int VELMRECORD_RemoveEffect(VELMRECORDER recorder, const char *effect);
VELM_API int VELMRECORD_Pause(VELMRECORDER recorder);
VELM_API int VELMRECORD_Resume(VELMRECORDER recorder);
VELM_API int VELMRECORD_IsPaused(VELMRECORDER recorder);

/* The document's recorder.  RecordStart stops and frees a running one (null
 * when that stop is vetoed), then records at the cursor; with
 * VELMRECORD_FLAG_UNDO and a label an undo step comes first.  RecordStop
 * stops and frees it (0 without one or when the stop is vetoed).  Closing or
 * unloading the document, changing its format and replacing its signal
 * (undo, revert) end the recording first. */
VELM_API VELMRECORDER VELMAUDIO_RecordStart(VELMAUDIO doc, uint32_t flags, const char *undo_label);
VELM_API int VELMAUDIO_RecordStop(VELMAUDIO doc);
VELM_API int VELMAUDIO_IsRecording(VELMAUDIO doc);
VELM_API int VELMAUDIO_LinkRecorder(VELMAUDIO doc, VELMRECORDER recorder);
VELM_API int VELMAUDIO_UnlinkRecorder(VELMAUDIO doc, VELMRECORDER recorder);

/* The recording range of the view state. */
VELM_API int VELMAUDIO_SetStartRecordPosition(VELMAUDIO doc, int64_t position);
VELM_API int VELMAUDIO_SetRecordPosition(VELMAUDIO doc, int64_t position);
VELM_API int VELMAUDIO_SetStopRecordPosition(VELMAUDIO doc);

VELM_EXTERN_C_END

#endif /* VELMRECORD_H */
