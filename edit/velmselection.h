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

/* ---- A document's committed selections and the selection being dragged ---- */

VELM_API int      VELMAUDIO_HasSelection(VELMAUDIO doc);
VELM_API int64_t  VELMAUDIO_SelectionLength(VELMAUDIO doc);
/* -1 without selections (0 on failure). */
VELM_API int64_t  VELMAUDIO_SelectionBegin(VELMAUDIO doc);
VELM_API int64_t  VELMAUDIO_SelectionEnd(VELMAUDIO doc);
VELM_API int      VELMAUDIO_SelectionChunkCount(VELMAUDIO doc);
VELM_API int64_t  VELMAUDIO_SelectionChunkBegin(VELMAUDIO doc, int index);
VELM_API int64_t  VELMAUDIO_SelectionChunkEnd(VELMAUDIO doc, int index);
VELM_API const VELMSELECTION *VELMAUDIO_SelectionOverTime(VELMAUDIO doc, double seconds);
VELM_API const VELMSELECTION *VELMAUDIO_SelectionOverSample(VELMAUDIO doc, int64_t sample);
VELM_API int64_t  VELMAUDIO_GetSelectionResizeBorder(VELMAUDIO doc, int64_t sample);
VELM_API int64_t  VELMAUDIO_GetSelectingAnchor(VELMAUDIO doc);

VELM_API int VELMAUDIO_ClearSelection(VELMAUDIO doc);
VELM_API int VELMAUDIO_InvertSelection(VELMAUDIO doc);
/* The second sample is where the edit cursor goes. */
VELM_API int VELMAUDIO_AddSelection(VELMAUDIO doc, int64_t a, int64_t b);
VELM_API int VELMAUDIO_DelSelection(VELMAUDIO doc, int64_t a, int64_t b);
VELM_API int VELMAUDIO_SelectAudio(VELMAUDIO doc, int64_t a, int64_t b);
VELM_API int VELMAUDIO_SelectAll(VELMAUDIO doc);
VELM_API int VELMAUDIO_SelectVisible(VELMAUDIO doc);
VELM_API int VELMAUDIO_SelectToEnd(VELMAUDIO doc);
VELM_API int VELMAUDIO_SelectToStart(VELMAUDIO doc);
VELM_API int VELMAUDIO_SetSelectingKind(VELMAUDIO doc, int kind);
VELM_API int VELMAUDIO_UpdateSelecting(VELMAUDIO doc, int64_t a, int64_t b);
VELM_API int VELMAUDIO_CommitSelecting(VELMAUDIO doc);
VELM_API int VELMAUDIO_UndoSelecting(VELMAUDIO doc);

VELM_EXTERN_C_END

#endif /* VELMSELECTION_H */
