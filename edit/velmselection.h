/* Selection records: one time range in seconds, converted to samples through
 * the document's format. */
#ifndef VELMSELECTION_H
#define VELMSELECTION_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmstate.h"

VELM_EXTERN_C_BEGIN

VELM_API VELMSELECTION *VELMSELECTION_CreateAudioSelection(BLMEM pool, double begin, double end);
VELM_API int64_t VELMSELECTION_GetBegin(VELMAUDIO doc, const VELMSELECTION *selection);
VELM_API int64_t VELMSELECTION_GetEnd(VELMAUDIO doc, const VELMSELECTION *selection);
VELM_API int64_t VELMSELECTION_GetDuration(VELMAUDIO doc, const VELMSELECTION *selection);
VELM_API double  VELMSELECTION_GetBeginTime(const VELMSELECTION *selection);
VELM_API double  VELMSELECTION_GetEndTime(const VELMSELECTION *selection);
VELM_API double  VELMSELECTION_GetDurationTime(const VELMSELECTION *selection);
VELM_API int     VELMSELECTION_SetBegin(VELMAUDIO doc, VELMSELECTION *selection, int64_t sample);
VELM_API int     VELMSELECTION_SetEnd(VELMAUDIO doc, VELMSELECTION *selection, int64_t sample);
VELM_API int     VELMSELECTION_SetBeginTime(VELMSELECTION *selection, double seconds);
VELM_API int     VELMSELECTION_SetEndTime(VELMSELECTION *selection, double seconds);
VELM_API int     VELMSELECTION_Compare(const VELMSELECTION *a, const VELMSELECTION *b);

VELM_EXTERN_C_END

#endif /* VELMSELECTION_H */
