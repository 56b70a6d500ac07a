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

/* The hit test: classifies the object of the last drawn layout under the
 * last pointer position and stores its code.  When the code changes while
 * no button is held, 0x20032 goes to the document's dispatcher with pointers
 * to the new and the old code; a handler may rewrite the new one, and what
 * it leaves is stored.  The frame runs it after every draw.  0 without a
 * drawn view. */
VELM_API int VELMCONTROL_UpdateMouseOverObject(VELMDRAW drawer);
/* Records the pointer position (canvas pixels) and runs the hit test: the
 * step every pointer handler starts with.  0 for a null drawer, one not yet
 * drawn, or while another controller call is running. */
VELM_API int VELMCONTROL_SetPointer(VELMDRAW drawer, int x, int y);

/* The gesture handlers (the shell reaches them through control/velminput.h).
 * Every one returns 0 for a null drawer, one not yet drawn, a document
 * without audio, or while another controller call or timer is running.
 * Move, release and keys return the smart-zoom update (1); a press returns
 * 0 when its preliminary move fails.  Wheel deltas are in eighths of a
 * degree; the low 3 bits carry over to the next event.  The hover timer
 * sends 0x20037 (code, position) or 0x20038 (region, position), the
 * position being two int32 values x, y. */
VELM_API int VELMCONTROL_MouseMove(VELMDRAW drawer, int x, int y, uint32_t flags);
VELM_API int VELMCONTROL_MouseDown(VELMDRAW drawer, int x, int y, uint32_t flags);
VELM_API int VELMCONTROL_MouseUp(VELMDRAW drawer, int x, int y, uint32_t flags);
VELM_API int VELMCONTROL_MouseDblClick(VELMDRAW drawer, int x, int y, uint32_t flags);
VELM_API int VELMCONTROL_MouseWheel(VELMDRAW drawer, int x, int y, int delta, uint32_t flags);
VELM_API int VELMCONTROL_MouseHWheel(VELMDRAW drawer, int x, int y, int delta, uint32_t flags);
VELM_API int VELMCONTROL_ZoomGesture(VELMDRAW drawer, int x, int y, double factor);
VELM_API int VELMCONTROL_AccKeyDown(VELMDRAW drawer, uint32_t bits);
VELM_API int VELMCONTROL_AccKeyUp(VELMDRAW drawer, uint32_t bits);

/* The quick (zoom) box and the scale-range selections of a document's view
 * state; each is 0 for a null document or one without view state, else 1.
 * Start sets origin and corner to (x, y) with size 0 x 0 and sends 0x2002F
 * with pointers to x and y; Update moves the corner, the size counting both
 * ends (negative when dragged up or left); Clear zeroes the box and sends
 * 0x20030.  The Start calls of the scale ranges set both ends and notify
 * nothing; the End calls move the end. */
VELM_API int VELMAUDIO_StartQuickBox(VELMAUDIO doc, int x, int y);
VELM_API int VELMAUDIO_UpdateQuickBox(VELMAUDIO doc, int x, int y);
VELM_API int VELMAUDIO_ClearQuickBox(VELMAUDIO doc);
VELM_API int VELMAUDIO_StartVerticalScaleSelection(VELMAUDIO doc, double value);
VELM_API int VELMAUDIO_EndVerticalScaleSelection(VELMAUDIO doc, double value);
VELM_API int VELMAUDIO_StartSpecScaleSelection(VELMAUDIO doc, double value);
VELM_API int VELMAUDIO_EndSpecScaleSelection(VELMAUDIO doc, double value);

/* The document's renderer's answers; 0 without a renderer. */
VELM_API int VELMAUDIO_IsInteracting(VELMAUDIO doc);
VELM_API int VELMAUDIO_IsSelecting(VELMAUDIO doc);
VELM_API int VELMAUDIO_IsMovingCursor(VELMAUDIO doc);
VELM_API int VELMAUDIO_IsMovingPlayCursor(VELMAUDIO doc);

VELM_EXTERN_C_END

#endif /* VELMCONTROL_H */
