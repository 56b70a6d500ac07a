/*
 * The pointer and key input of a document's view, as the shell delivers it.
 * Each call returns 0 for a null document, one without a drawn view or
 * without audio, and while another input call is running; otherwise
 * non-zero when handled.  Positions are canvas pixels; flags are the
 * library's button and key bits (see velmacckeys.h for the translation of
 * the shell's bits).
 */
#ifndef VELMINPUT_H
#define VELMINPUT_H

#include <stdint.h>

#include "control/velmacckeys.h"
#include "core/velmstate.h"

VELM_EXTERN_C_BEGIN

VELM_API int VELMAUDIO_MouseMove(VELMAUDIO doc, int x, int y, uint32_t flags);
VELM_API int VELMAUDIO_MouseDown(VELMAUDIO doc, int x, int y, uint32_t flags);
VELM_API int VELMAUDIO_MouseUp(VELMAUDIO doc, int x, int y, uint32_t flags);
VELM_API int VELMAUDIO_MouseDblClick(VELMAUDIO doc, int x, int y, uint32_t flags);
/* delta in eighths of a degree (120 is one notch), truncated toward zero;
 * a delta that is not a finite number counts as 0. */
VELM_API int VELMAUDIO_MouseWheel(VELMAUDIO doc, int x, int y, double delta, uint32_t flags);
VELM_API int VELMAUDIO_MouseHWheel(VELMAUDIO doc, int x, int y, double delta, uint32_t flags);
/* Zooms around the sample under x by factor (as VELMAUDIO_ZoomByFactor);
 * 0 for a factor that is not a finite number. */
VELM_API int VELMAUDIO_ZoomGesture(VELMAUDIO doc, int x, int y, double factor);
VELM_API int VELMAUDIO_AccKeyDown(VELMAUDIO doc, uint32_t keys);
VELM_API int VELMAUDIO_AccKeyUp(VELMAUDIO doc, uint32_t keys);

VELM_EXTERN_C_END

#endif /* VELMINPUT_H */
