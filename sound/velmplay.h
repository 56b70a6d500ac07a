/*
 * Playback: a player reads float samples from a document's signal (or from
 * a list of blocks of it, or from an audio file), runs them through an
 * optional effect and an optional format conversion, applies per-channel
 * gains with a short fade and hands 16-bit frames to a sound device stream.
 *
 * The device pulls samples on its own worker thread; everything else runs
 * on the shell's thread, where a 33 ms timer moves the document's play
 * cursor, enforces the stop rules and notifies the shell.  A document links
 * at most one player (VELMAUDIO_PlayStart and friends).
 */
#ifndef VELMPLAY_H
#define VELMPLAY_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmaudio.h"
#include "outside/signal/audioformat.h"

VELM_EXTERN_C_BEGIN

typedef struct _VELMPLAYER *VELMPLAYER;

/* Start flags.  The low four bits are the start mode. */
#define VELMPLAY_MODE_MASK        0x0Fu
#define VELMPLAY_MODE_SELECTIONS  0u         /* play the selections */
#define VELMPLAY_MODE_LIMITS      1u         /* view-begin limit .. view-end limit */
#define VELMPLAY_MODE_FROM_VIEW   2u         /* view begin .. view-end limit, stop past the view */
#define VELMPLAY_MODE_RANGE       3u         /* the given range */
#define VELMPLAY_FIXED_RANGE      0x3u       /* any of these: the range does not follow the view */
#define VELMPLAY_CHANNEL_MASK     0x10u      /* bits 5..15 hold a channel mask (unsupported) */
#define VELMPLAY_FROM_CURSOR      0x200000u  /* begin at the cursor when it lies inside the range */
#define VELMPLAY_TO_CURSOR        0x400000u  /* end at the cursor when it lies inside the range */
#define VELMPLAY_SILENT           0x800000u  /* no announcements, vetoes or notifications */
#define VELMPLAY_NO_NOTIFY        0x1000000u /* no position and destroy notifications */
#define VELMPLAY_KEEP_CURSORS     0x2000000u /* leave the cursor and play cursor alone */

/* Status. */
#define VELMPLAY_STATUS_CLOSED   0
#define VELMPLAY_STATUS_CREATED  1
#define VELMPLAY_STATUS_PLAYING  2
#define VELMPLAY_STATUS_OPENED   3 /* opened, or paused */
#define VELMPLAY_STATUS_STOPPED  4
#define VELMPLAY_STATUS_FAILED  (-1)

/* Notifications to the document's dispatcher; data 1 is the player unless
 * stated.  The first four are vetoes: a handler's 0 cancels. */
#define VELMPLAY_NOTIFY_START     0x2003E
#define VELMPLAY_NOTIFY_STOP      0x2003F
#define VELMPLAY_NOTIFY_PAUSE     0x20040
#define VELMPLAY_NOTIFY_RESUME    0x20041
#define VELMPLAY_NOTIFY_DESTROYED 0x20042
/* data 1: pointer to the int64_t position, data 2: the player.  A 0 answer
 * ends VELMPLAY_Wait's loop. */
#define VELMPLAY_NOTIFY_POSITION  0x20043

/* What the update timer calls every 33 ms instead of the player's own
 * update (VELMPLAY_SetGUITimer); the result is what VELMPLAY_Wait sees. */
typedef int (*VELMPLAY_UpdateCallback)(void *user);

/* Registers the playback settings' defaults and starts the sound layer. */
VELM_API int  VELMPLAY_Initialize(void);
VELM_API void VELMPLAY_Finalize(void);

/* Null without a document or signal, respectively for a file that does not
 * load (format_text as AUDIO_LoadFile takes it, e.g. "AUTO"). */
VELM_API VELMPLAYER VELMPLAY_CreatePlayer(VELMAUDIO doc, uint32_t flags);
VELM_API VELMPLAYER VELMPLAY_CreateFilePlayer(const char *file_name, const char *format_text, uint32_t flags);
/* Refuses a player that is not (or no longer) live; 1 only when it had a
 * stream to close. */
VELM_API int VELMPLAY_DestroyPlayer(VELMPLAYER player);

/* Queues [min(a,b), max(a,b)) of the document's signal. */
VELM_API int VELMPLAY_AddBlock(VELMPLAYER player, int64_t a, int64_t b, uint32_t block_flags);
/* A fixed range to play; only before the stream opens. */
VELM_API int VELMPLAY_SetPlayRange(VELMPLAYER player, int64_t a, int64_t b);

VELM_API int VELMPLAY_Start(VELMPLAYER player);
VELM_API int VELMPLAY_Pause(VELMPLAYER player);
VELM_API int VELMPLAY_Resume(VELMPLAYER player);
VELM_API int VELMPLAY_Stop(VELMPLAYER player);
/* Runs the update on the calling thread until the stream ends (the player is
 * then destroyed) or the update answers 0. */
VELM_API int VELMPLAY_Wait(VELMPLAYER player);

VELM_API int VELMPLAY_IsPlaying(VELMPLAYER player);
VELM_API int VELMPLAY_IsPaused(VELMPLAYER player);
VELM_API int VELMPLAY_GetStatus(VELMPLAYER player);

/* The sample of the document being heard now; -1 for a null player. */
VELM_API int64_t VELMPLAY_PlayPosition(VELMPLAYER player);
VELM_API int VELMPLAY_Goto(VELMPLAYER player, int64_t position);
VELM_API int VELMPLAY_Offset(VELMPLAYER player, int64_t delta);

/* Whole speeds 1..32 forward, -32..-1 backward; 0 for a null player. */
VELM_API int   VELMPLAY_ChangeSpeed(VELMPLAYER player, float speed);
VELM_API float VELMPLAY_GetSpeed(VELMPLAYER player);

/* Channels 0..5.  A channel's gain never exceeds the master gain. */
VELM_API int    VELMPLAY_SetMasterGain(VELMPLAYER player, double gain);
VELM_API int    VELMPLAY_SetChannelGain(VELMPLAYER player, int channel, double gain);
VELM_API double VELMPLAY_GetChannelGain(VELMPLAYER player, int channel);

/* The effect script, printf-style (see the signal library's effect paths). */
VELM_API int VELMPLAY_ChangeEffect(VELMPLAYER player, const char *format, ...)
    __attribute__((format(printf, 2, 3)));
VELM_API int VELMPLAY_ChangeDevice(VELMPLAYER player, const char *device_name);
VELM_API int VELMPLAY_SetGUITimer(VELMPLAYER player, VELMPLAY_UpdateCallback callback, void *user);
/* No longer supported: logs an error and answers 0. */
VELM_API int VELMPLAY_SetChannelMask(VELMPLAYER player, uint32_t mask);

/* The format read from the source, and the one handed to the device. */
VELM_API _audio_format VELMPLAY_GetInputFormat(VELMPLAYER player);
VELM_API _audio_format VELMPLAY_GetOutputFormat(VELMPLAYER player);

/* ---- The document's player ---------------------------------------------- */

/* begin and end are used by VELMPLAY_MODE_RANGE only. */
VELM_API int VELMAUDIO_PlayStart(VELMAUDIO doc, uint32_t flags, int64_t begin, int64_t end);
VELM_API int VELMAUDIO_PlayStop(VELMAUDIO doc);
VELM_API int VELMAUDIO_PlayPause(VELMAUDIO doc);
VELM_API int VELMAUDIO_PlayResume(VELMAUDIO doc);
VELM_API int VELMAUDIO_PlayWait(VELMAUDIO doc);
VELM_API int VELMAUDIO_IsPlaying(VELMAUDIO doc);
VELM_API int VELMAUDIO_IsPaused(VELMAUDIO doc);
VELM_API int VELMAUDIO_GetPlayStatus(VELMAUDIO doc);
VELM_API VELMPLAYER VELMAUDIO_Player(VELMAUDIO doc);
VELM_API int VELMAUDIO_LinkPlayer(VELMAUDIO doc, VELMPLAYER player);
VELM_API int VELMAUDIO_UnlinkPlayer(VELMAUDIO doc, VELMPLAYER player);

VELM_EXTERN_C_END

#endif /* VELMPLAY_H */
