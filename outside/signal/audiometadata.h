/*
 * Audio signal library: descriptive metadata of a sound (title, artist...),
 * free text entries and binary entries.
 *
 * Setters copy what they are given and return 1 (0 for a null handle or
 * key); getters return texts owned by the metadata object, valid until the
 * same entry is set again or the object is destroyed, or null when unset.
 * Track and disc numbers are texts ("3", "3/12" is kept as written).
 */
#ifndef AUDIOMETADATA_H
#define AUDIOMETADATA_H

#include <stddef.h>
#include "audioformat.h"

#ifdef __cplusplus
extern "C" {
#endif

typedef struct _audio_metadata AUDIOMETADATA;

AUDIO_API AUDIOMETADATA *AUDIOMETADATA_Create(void);
AUDIO_API AUDIOMETADATA *AUDIOMETADATA_Duplicate(const AUDIOMETADATA *meta);
AUDIO_API int AUDIOMETADATA_Destroy(AUDIOMETADATA *meta);
/* 1 when no entry is set. */
AUDIO_API int AUDIOMETADATA_IsEmpty(const AUDIOMETADATA *meta);

AUDIO_API int AUDIOMETADATA_SetTitle(AUDIOMETADATA *meta, const char *text);
AUDIO_API int AUDIOMETADATA_SetArtist(AUDIOMETADATA *meta, const char *text);
AUDIO_API int AUDIOMETADATA_SetAlbumArtist(AUDIOMETADATA *meta, const char *text);
AUDIO_API int AUDIOMETADATA_SetAlbumName(AUDIOMETADATA *meta, const char *text);
AUDIO_API int AUDIOMETADATA_SetComposer(AUDIOMETADATA *meta, const char *text);
AUDIO_API int AUDIOMETADATA_SetTrackNum(AUDIOMETADATA *meta, const char *text);
AUDIO_API int AUDIOMETADATA_SetTotalAlbumTracks(AUDIOMETADATA *meta, const char *text);
AUDIO_API int AUDIOMETADATA_SetDiscNum(AUDIOMETADATA *meta, const char *text);
AUDIO_API int AUDIOMETADATA_SetTotalAlbumDiscs(AUDIOMETADATA *meta, const char *text);
AUDIO_API int AUDIOMETADATA_SetGenre(AUDIOMETADATA *meta, const char *text);

AUDIO_API const char *AUDIOMETADATA_GetTitle(const AUDIOMETADATA *meta);
AUDIO_API const char *AUDIOMETADATA_GetArtist(const AUDIOMETADATA *meta);
AUDIO_API const char *AUDIOMETADATA_GetAlbumArtist(const AUDIOMETADATA *meta);
AUDIO_API const char *AUDIOMETADATA_GetAlbumName(const AUDIOMETADATA *meta);
AUDIO_API const char *AUDIOMETADATA_GetComposer(const AUDIOMETADATA *meta);
AUDIO_API const char *AUDIOMETADATA_GetTrackNum(const AUDIOMETADATA *meta);
AUDIO_API const char *AUDIOMETADATA_GetTotalAlbumTracks(const AUDIOMETADATA *meta);
AUDIO_API const char *AUDIOMETADATA_GetDiscNum(const AUDIOMETADATA *meta);
AUDIO_API const char *AUDIOMETADATA_GetTotalAlbumDiscs(const AUDIOMETADATA *meta);
AUDIO_API const char *AUDIOMETADATA_GetGenre(const AUDIOMETADATA *meta);

/* Free text entries under any key (keys compare without regard to case).
 * The keys "comment", "copyright", "date", "software" and "license" are the
 * ones files carry besides the named fields.  A null value removes the entry. */
AUDIO_API int AUDIOMETADATA_SetMetaData(AUDIOMETADATA *meta, const char *key, const char *value);
AUDIO_API const char *AUDIOMETADATA_GetMetaData(const AUDIOMETADATA *meta, const char *key);
/* Binary entries (at most 16 MiB each); kept in memory only, never written
 * to files.  A null data removes the entry. */
#define AUDIOMETADATA_MAX_BINARY_SIZE (16 * 1024 * 1024)
AUDIO_API int AUDIOMETADATA_SetBinaryMetaData(AUDIOMETADATA *meta, const char *key,
                                              const void *data, int size);
AUDIO_API const void *AUDIOMETADATA_GetBinaryMetaData(const AUDIOMETADATA *meta, const char *key,
                                                      int *size);

#ifdef __cplusplus
}
#endif

#endif /* AUDIOMETADATA_H */
