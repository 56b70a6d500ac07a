/*
 * The time display: a large read-out of the play position (the cursor when
 * nothing plays) in time, samples or frames, with the signal's rate and
 * channel layout, and an edit mode in which a typed position becomes the
 * cursor.  It draws on any canvas and takes pointer and key events.
 *
 * The display keeps the document handle it is given and does not own it:
 * the shell detaches it (VELMDISPLAY_SetVelmAudio(display, NULL)) before
 * closing the document.  Calls on a null display return 0 / false.
 */
#ifndef VELMDISPLAY_H
#define VELMDISPLAY_H

#include <stdint.h>

#include "core/velmaudio.h"
#include "render/canvas/velmcanvas.h"

VELM_EXTERN_C_BEGIN

typedef struct _VELMDISPLAY *VELMDISPLAY;

/* Notifications on the global dispatcher. */
#define VELMDISPLAY_EVENT_BLINK       0x20048u
#define VELMDISPLAY_EVENT_EDITSTARTED 0x20049u
#define VELMDISPLAY_EVENT_EDITENDED   0x2004Au
#define VELMDISPLAY_EVENT_BEFOREEDIT  0x2004Bu /* a handler answering 0 refuses */
#define VELMDISPLAY_EVENT_FORMATCLICK 0x2004Du

/* Option bits (VELMDISPLAY_GetOptions). */
#define VELMDISPLAY_OPTION_REMAINING 0x1u
#define VELMDISPLAY_OPTION_BLANK     0x2u
#define VELMDISPLAY_OPTION_NOHOURS   0x8u
#define VELMDISPLAY_OPTION_NOMINUTES 0x10u

/* Pointer flag of the primary button. */
#define VELMDISPLAY_BUTTON_PRIMARY 0x20u

VELM_API VELMDISPLAY VELMDISPLAY_Create(void);
VELM_API int VELMDISPLAY_Destroy(VELMDISPLAY display);

VELM_API int VELMDISPLAY_SetVelmAudio(VELMDISPLAY display, VELMAUDIO doc);
VELM_API int VELMDISPLAY_Update(VELMDISPLAY display);
VELM_API int VELMDISPLAY_RedrawNeeded(VELMDISPLAY display);
/* Draws the whole widget on the canvas's size; out (may be null) receives
 * the widget rectangle. */
VELM_API int VELMDISPLAY_Draw(VELMCANVAS canvas, VELMDISPLAY display, _VELMRECT *out);
VELM_API int VELMDISPLAY_Turnon(VELMDISPLAY display);
VELM_API int VELMDISPLAY_Turnoff(VELMDISPLAY display);

/* Properties 0 and 1 are kept for the shell; others are refused.  Set
 * answers 0 in every case, Get answers 0 for other properties. */
VELM_API int VELMDISPLAY_SetDrawProperty(VELMDISPLAY display, int property, uint32_t value);
VELM_API uint32_t VELMDISPLAY_GetDrawProperty(VELMDISPLAY display, int property);

/* What the display shows after its last update. */
VELM_API int64_t  VELMDISPLAY_GetPosition(VELMDISPLAY display);
VELM_API int64_t  VELMDISPLAY_GetEditValue(VELMDISPLAY display);
VELM_API uint32_t VELMDISPLAY_GetOptions(VELMDISPLAY display);
VELM_API int      VELMDISPLAY_GetUnit(VELMDISPLAY display);
VELM_API const char *VELMDISPLAY_GetEditText(VELMDISPLAY display);

VELM_API int VELMDISPLAY_IsEditing(VELMDISPLAY display);
VELM_API int VELMDISPLAY_EnterEdit(VELMDISPLAY display);
VELM_API int VELMDISPLAY_ApplyEdit(VELMDISPLAY display);
VELM_API int VELMDISPLAY_CancelEdit(VELMDISPLAY display);
/* True when the character was taken; a refused one changes nothing. */
VELM_API int VELMDISPLAY_KeyPressed(VELMDISPLAY display, int character);

/* Area under the pointer after the last move: 0x1 the format area, 0x2 the
 * label under the milliseconds, 0x4 the labels under hours, minutes and
 * seconds, 0x8 the sign, 0x10 the samples field; 0 elsewhere. */
VELM_API uint32_t VELMDISPLAY_GetPointerArea(VELMDISPLAY display);
VELM_API int VELMDISPLAY_MouseMove(VELMDISPLAY display, int x, int y, uint32_t flags);
VELM_API int VELMDISPLAY_MouseDown(VELMDISPLAY display, int x, int y, uint32_t flags);
VELM_API int VELMDISPLAY_MouseUp(VELMDISPLAY display, int x, int y, uint32_t flags);
VELM_API int VELMDISPLAY_MouseDblClick(VELMDISPLAY display, int x, int y, uint32_t flags);
VELM_API int VELMDISPLAY_MouseWheel(VELMDISPLAY display, int x, int y, uint32_t flags);
VELM_API int VELMDISPLAY_MouseHWheel(VELMDISPLAY display, int x, int y, uint32_t flags);
VELM_API int VELMDISPLAY_AccKeyDown(VELMDISPLAY display, int key, uint32_t flags);
VELM_API int VELMDISPLAY_AccKeyUp(VELMDISPLAY display, int key, uint32_t flags);

VELM_EXTERN_C_END

#endif /* VELMDISPLAY_H */
