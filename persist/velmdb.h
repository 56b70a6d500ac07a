/*
 * The file catalogue: one SQLite database per process that remembers every
 * audio file a document opened, linked or saved (canonical name, file time,
 * duration, format text, rate, channels, last access and access count).
 *
 * While open, the catalogue answers these global events (data 1 is the
 * document, data 2 the sender's result slot):
 *   0x20001  int64_t *   receives the file's id when its time is unchanged
 *   0x20002  const char ** receives the stored format text when the time is
 *                        unchanged; the text stays valid until the calling
 *                        thread's next 0x20002 request
 *   0x20005, 0x20006     an open or a save is recorded; int64_t * receives the id
 */
#ifndef VELMDB_H
#define VELMDB_H

#include "core/velm_api.h"

VELM_EXTERN_C_BEGIN

/* 1 when the catalogue at path is open (also when it already was), 0 when
 * path is null or the file cannot serve as a catalogue: a missing folder, a
 * read-only, foreign or damaged file is left untouched and one message goes
 * to the log.  The library works on without a catalogue. */
VELM_API int VELMDB_OpenDatabase(const char *path);

/* 1 when the catalogue was closed, 0 when none was open or closing failed. */
VELM_API int VELMDB_CloseDatabase(void);

VELM_EXTERN_C_END

#endif /* VELMDB_H */
