/*
 * The pointer controller's state inside a document's view drawer: what the
 * user is dragging, the object under the pointer and the settings that time
 * gestures.  The renderer asks these queries to draw overlays in their
 * dragged state; the document forwards a few of them.
 */
#ifndef VELMCONTROL_H
#define VELMCONTROL_H

#include <stdint.h>

#include "core/velmstate.h"
#include "render/view/velmdraw.h"

VELM_EXTERN_C_BEGIN

/* Clears every interaction field and reads "libvelm.draw.hovertime",
 * "libvelm.draw.mousedowntime" and "libvelm.draw.AudioDragActive". */
VELM_API int VELMCONTROL_Reset(VELMDRAW drawer);
/* Forgets the busy mark and kills the repeat and hover timers. */
VELM_API int VELMCONTROL_Stop(VELMDRAW drawer);

/* Each is 0 for a null drawer or one that has not drawn yet. */
VELM_API int VELMCONTROL_IsInteracting(VELMDRAW drawer);
VELM_API int VELMCONTROL_IsSelecting(VELMDRAW drawer);
VELM_API int VELMCONTROL_IsMovingCursor(VELMDRAW drawer);
VELM_API int VELMCONTROL_IsMovingPlayCursor(VELMDRAW drawer);
VELM_API int VELMCONTROL_IsSlidingSelection(VELMDRAW drawer);
VELM_API int VELMCONTROL_IsGrabbingRegion(VELMDRAW drawer);
VELM_API int VELMCONTROL_IsSlidingSelectionBegin(VELMDRAW drawer, const VELMSELECTION *selection);
VELM_API int VELMCONTROL_IsSlidingSelectionEnd(VELMDRAW drawer, const VELMSELECTION *selection);
/* The sample the slid handle was last dragged to; -1 when none is slid. */
VELM_API int64_t VELMCONTROL_GetSlidingSelectionSample(VELMDRAW drawer);
/* The code of the object under the pointer (0 when none). */
VELM_API uint32_t VELMCONTROL_GetMouseOverObject(VELMDRAW drawer);

/* The document's renderer's answers; 0 without a renderer. */
VELM_API int VELMAUDIO_IsInteracting(VELMAUDIO doc);
VELM_API int VELMAUDIO_IsSelecting(VELMAUDIO doc);
VELM_API int VELMAUDIO_IsMovingCursor(VELMAUDIO doc);
VELM_API int VELMAUDIO_IsMovingPlayCursor(VELMAUDIO doc);

VELM_EXTERN_C_END

#endif /* VELMCONTROL_H */
