/* Small pure helpers: millisecond and sample texts, typed-time parsing. */
#ifndef VELMUTIL_H
#define VELMUTIL_H

#include <stdint.h>

#include "core/velm_api.h"

VELM_EXTERN_C_BEGIN

VELM_API void    VELMUTIL_DecomposeMsTime(int64_t ms, int *hours, int *minutes, int *seconds, int *milliseconds);
/* The precision follows the reference: "hh:mm:ss.mmm", "mm:ss.mmm", "s.mmm" or "0.mmm". */
VELM_API int     VELMUTIL_MsTimeToBuffer(int64_t ms, int64_t reference_ms, char *buffer, int size);
VELM_API int     VELMUTIL_SamplesToTimeString(int64_t sample, int64_t reference, int32_t rate, char *buffer, int size);
/* Parses "h:m:s.fff" and its shorter forms.  The text is split in place (every
 * ':' and '.' becomes a NUL), so callers pass a writable copy.  Fields that are
 * not numbers read as 0; a null text gives all zeros and returns 0. */
VELM_API int     VELMUTIL_DecomposeStringTime(char *text, int *hours, int *minutes, int *seconds, int *milliseconds);
VELM_API int64_t VELMUTIL_TimeStringToMs(const char *text);
VELM_API int64_t VELMUTIL_TimeStringToSample(const char *text, int32_t rate);

VELM_EXTERN_C_END

#endif /* VELMUTIL_H */
