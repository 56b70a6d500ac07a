/*
 * The audio document: one open sound with its view state, signal, events and
 * settings, reached through a VELMAUDIO handle.  Every call accepts a null
 * handle and answers its failure value (0, false, null, or -1 for 64-bit ids).
 */
#ifndef VELMAUDIO_H
#define VELMAUDIO_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmstate.h"
#include "outside/base/blbase.h"
#include "outside/signal/audioformat.h"
#include "outside/signal/audiosignal.h"

VELM_EXTERN_C_BEGIN


/* Document option flags. */
#define OPTION_EDITABLE               0x1u
#define OPTION_HIDE_FROM_RECENT       0x2u
#define OPTION_EXTERNAL_REGION_EDITOR 0x4u

/* Sizes of the document's fixed texts, terminating NUL included. */
#define VELM_FILENAME_SIZE   1024
#define VELM_FORMAT_SIZE     4096
#define VELM_TRACKNAME_SIZE  256

/* Document-layer error codes (VELMAUDIO_GetLastError). */
#define VELM_ERROR_NONE               0
#define VELM_ERROR_FILE_NOT_FOUND     1
#define VELM_ERROR_UNSUPPORTED_FORMAT 2
#define VELM_ERROR_READ               3
#define VELM_ERROR_CORRUPT_DATA       5
#define VELM_ERROR_OUT_OF_MEMORY      6
#define VELM_ERROR_OTHER              7

/* ---- Start-up ---------------------------------------------------------- */

VELM_API int  VELM_Initialize(void);
VELM_API void VELM_Finalize(void);

/* ---- Creation, binding, loading ---------------------------------------- */

VELM_API VELMAUDIO VELMAUDIO_New(const _audio_format *format);
VELM_API VELMAUDIO VELMAUDIO_NewFromSignal(AUDIOSIGNAL *signal, int duplicate);
VELM_API VELMAUDIO VELMAUDIO_CreateUnresolvedLink(void);
VELM_API int       VELMAUDIO_Link(VELMAUDIO doc, const char *file_name, const char *format);
VELM_API VELMAUDIO VELMAUDIO_CreateLink(const char *file_name, const char *format);
VELM_API int       VELMAUDIO_OpenLink(VELMAUDIO doc);
VELM_API VELMAUDIO VELMAUDIO_Open(const char *file_name, const char *format);
VELM_API int       VELMAUDIO_CanOpen(const char *file_name, const char *format, int flags);
VELM_API VELMAUDIO VELMAUDIO_Reference(VELMAUDIO doc);

VELM_API int VELMAUDIO_GetLastError(void);
VELM_API void VELMAUDIO_ResetLastError(void);

/* ---- Closing and saving ------------------------------------------------- */

VELM_API int VELMAUDIO_Close(VELMAUDIO doc);
/* mode 0: release a reference; mode 1: unload the audio of an unmodified file. */
VELM_API int VELMAUDIO_CloseEx(VELMAUDIO doc, int mode);
VELM_API int VELMAUDIO_Save(VELMAUDIO doc);
VELM_API int VELMAUDIO_SaveAs(VELMAUDIO doc, const char *file_name, const char *format);
VELM_API int VELMAUDIO_SaveCopyAs(VELMAUDIO doc, const char *file_name, const char *format);
VELM_API int VELMAUDIO_RevertToSaved(VELMAUDIO doc);

/* ---- Signal and state --------------------------------------------------- */

/* Installs a new signal (or none) and returns the previous one, now the caller's. */
VELM_API AUDIOSIGNAL *VELMAUDIO_SetAudioSignal(VELMAUDIO doc, AUDIOSIGNAL *signal);
VELM_API AUDIOSIGNAL *VELMAUDIO_GetAudioSignal(VELMAUDIO doc);
VELM_API VELMSTATE *VELMAUDIO_GetState(VELMAUDIO doc);
VELM_API uint32_t   VELMAUDIO_GetStatus(VELMAUDIO doc);
VELM_API int        VELMAUDIO_HasActionInProgress(VELMAUDIO doc);
VELM_API int        VELMAUDIO_IsOpen(VELMAUDIO doc);
VELM_API int        VELMAUDIO_HasChanges(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_GetFileName(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_GetFileFormatString(VELMAUDIO doc);

/* ---- Options ------------------------------------------------------------ */

VELM_API int VELMAUDIO_Editable(VELMAUDIO doc);
VELM_API int VELMAUDIO_SetEditable(VELMAUDIO doc, int editable);
VELM_API int VELMAUDIO_ShowInRecent(VELMAUDIO doc);
VELM_API int VELMAUDIO_SetShowInRecent(VELMAUDIO doc, int show);
VELM_API int VELMAUDIO_IsExternalRegionEditorVisible(VELMAUDIO doc);
VELM_API int VELMAUDIO_SetExternalRegionEditorVisible(VELMAUDIO doc, int visible);
/* "EDITABLE|NOEDITABLE" words, case and spaces and underscores ignored. */
VELM_API uint32_t VELMDEFINES_DecodeVelmOptions(uint32_t flags, const char *text);

/* ---- Events ------------------------------------------------------------- */

VELM_API int      VELMAUDIO_AddEventHandler(VELMAUDIO doc, BLNOTIFY_Handler handler, void *user);
VELM_API int      VELMAUDIO_DelEventHandler(VELMAUDIO doc, BLNOTIFY_Handler handler, void *user);
VELM_API BLNOTIFY VELMAUDIO_Dispatcher(VELMAUDIO doc);
VELM_API const char *VELM_TranslateString(const char *text);

/* ---- Document settings -------------------------------------------------- */

VELM_API int         VELMAUDIO_ChangeSetting(VELMAUDIO doc, const char *format, ...) BL_PRINTF(2, 3);
VELM_API int         VELMAUDIO_ChangeSecretSetting(VELMAUDIO doc, const char *format, ...) BL_PRINTF(2, 3);
VELM_API const char *VELMAUDIO_StringSetting(VELMAUDIO doc, const char *format, ...) BL_PRINTF(2, 3);
VELM_API const char *VELMAUDIO_SecretStringSetting(VELMAUDIO doc, const char *format, ...) BL_PRINTF(2, 3);
VELM_API int         VELMAUDIO_IntSetting(VELMAUDIO doc, const char *format, ...) BL_PRINTF(2, 3);
VELM_API float       VELMAUDIO_FloatSetting(VELMAUDIO doc, const char *format, ...) BL_PRINTF(2, 3);
VELM_API int         VELMAUDIO_BoolSetting(VELMAUDIO doc, const char *format, ...) BL_PRINTF(2, 3);
VELM_API int         VELMAUDIO_ActivateSettings(VELMAUDIO doc);
VELM_API int         VELMAUDIO_DeactivateSettings(VELMAUDIO doc);

VELM_EXTERN_C_END

#endif /* VELMAUDIO_H */
