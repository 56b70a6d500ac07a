/* What a document answers about its file and signal: properties, metadata,
 * the external-change check, memory, statistics, sums and extremes. */
#ifndef VELMQUERIES_H
#define VELMQUERIES_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmaudio.h"
#include "outside/signal/audiometadata.h"

VELM_EXTERN_C_BEGIN

/* External-change codes (VELMAUDIO_GetExternalChangeStatus). */
#define VELM_FILE_UNCHANGED          1
#define VELM_FILE_CHANGED            2
#define VELM_FILE_CHANGED_MODIFIED   3 /* changed on disk while the document has unsaved changes */
#define VELM_FILE_MISSING            4
#define VELM_FILE_MISSING_MODIFIED   5

VELM_API int         VELMAUDIO_IsUnresolvedLink(VELMAUDIO doc);
VELM_API int         VELMAUDIO_HasFileName(VELMAUDIO doc);
VELM_API int         VELMAUDIO_ClearChangedState(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_GetFileFormatLabel(VELMAUDIO doc);
VELM_API int64_t     VELMAUDIO_GetFileSize(VELMAUDIO doc);
VELM_API int64_t     VELMAUDIO_GetFileId(VELMAUDIO doc);
VELM_API uint64_t    VELMAUDIO_GetFileTime(VELMAUDIO doc);
VELM_API uint64_t    VELMAUDIO_GetChangeTime(VELMAUDIO doc);
VELM_API int         VELMAUDIO_ResetAudioFileStamp(VELMAUDIO doc);
VELM_API int         VELMAUDIO_GetExternalChangeStatus(VELMAUDIO doc);
VELM_API int64_t     VELMAUDIO_NumSamples(VELMAUDIO doc);
VELM_API int         VELMAUDIO_SampleRate(VELMAUDIO doc);
VELM_API int         VELMAUDIO_NumChannels(VELMAUDIO doc);
VELM_API int         VELMAUDIO_NumActiveChannels(VELMAUDIO doc);
VELM_API uint32_t    VELMAUDIO_ActiveChannelsMask(VELMAUDIO doc);
/* kind 0 rate, 1 channels, 2 active channels, 3 bits per sample, 4 the signal
 * handle (written through a pointer-sized out value). */
VELM_API int         VELMAUDIO_GetAudioProperty(VELMAUDIO doc, int kind, void *out);
VELM_API _audio_format *VELMAUDIO_GetSignalFormat(_audio_format *out, VELMAUDIO doc);
VELM_API int         VELMAUDIO_GetFormatString(VELMAUDIO doc, char *buffer, int size);
VELM_API uint32_t    VELMAUDIO_FormatFilterMask(VELMAUDIO doc);
VELM_API int         VELMAUDIO_ReadOnly(VELMAUDIO doc);
VELM_API int         VELMAUDIO_HasValidHash(VELMAUDIO doc);
VELM_API AUDIOSIGNAL_HASH *VELMAUDIO_GetSignalHash(VELMAUDIO doc, AUDIOSIGNAL_HASH *out);
VELM_API int64_t     VELMAUDIO_SizeInMemory(VELMAUDIO doc);
VELM_API int         VELMAUDIO_FreeMemory(VELMAUDIO doc);
VELM_API int         VELMAUDIO_GetSignalStats(VELMAUDIO doc, AUDIOSIGNAL_STATISTICS *out, double window, uint8_t flag);
VELM_API double      VELMAUDIO_GetChannelSamplesSum(VELMAUDIO doc, int channel);
VELM_API double      VELMAUDIO_GetChannelSamplesSum2(VELMAUDIO doc, int channel);
VELM_API int         VELMAUDIO_GetChannelMinMax(VELMAUDIO doc, int channel, float *min, float *max);

VELM_API int VELMAUDIO_SetTitle(VELMAUDIO doc, const char *text);
VELM_API int VELMAUDIO_SetArtist(VELMAUDIO doc, const char *text);
VELM_API int VELMAUDIO_SetAlbumArtist(VELMAUDIO doc, const char *text);
VELM_API int VELMAUDIO_SetAlbumName(VELMAUDIO doc, const char *text);
VELM_API int VELMAUDIO_SetComposer(VELMAUDIO doc, const char *text);
VELM_API int VELMAUDIO_SetTrackNum(VELMAUDIO doc, const char *text);
VELM_API int VELMAUDIO_SetTotalAlbumTracks(VELMAUDIO doc, const char *text);
VELM_API int VELMAUDIO_SetDiscNum(VELMAUDIO doc, const char *text);
VELM_API int VELMAUDIO_SetTotalAlbumDiscs(VELMAUDIO doc, const char *text);
VELM_API int VELMAUDIO_SetGenre(VELMAUDIO doc, const char *text);
VELM_API const char *VELMAUDIO_GetTitle(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_GetArtist(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_GetAlbumArtist(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_GetAlbumName(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_GetComposer(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_GetTrackNum(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_GetTotalAlbumTracks(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_GetDiscNum(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_GetTotalAlbumDiscs(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_GetGenre(VELMAUDIO doc);
VELM_API int VELMAUDIO_SetMetaData(VELMAUDIO doc, const char *key, const char *value);
VELM_API int VELMAUDIO_SetBinaryMetaData(VELMAUDIO doc, const char *key, const void *data, int size);
VELM_API const char *VELMAUDIO_GetMetaData(VELMAUDIO doc, const char *key);
VELM_API const void *VELMAUDIO_GetBinaryMetaData(VELMAUDIO doc, const char *key, int *size);

VELM_EXTERN_C_END

#endif /* VELMQUERIES_H */
