/*
 * Scales of the audio view: the horizontal (time) scale under the lanes with
 * its vertical grid lines.  Ticks are chosen so that two of them always leave
 * room for one label; only every other tick (a multiple of twice the step
 * from the origin) is labelled.
 */
#ifndef VELMSCALES_H
#define VELMSCALES_H

#include <stdint.h>

#include "render/view/velmdraw.h"

VELM_EXTERN_C_BEGIN

/* Horizontal scale kinds; the _VIEW kinds count from the view start. */
#define VELMDRAW_HORZ_SAMPLE      0
#define VELMDRAW_HORZ_TIME        1
#define VELMDRAW_HORZ_FRAME       2
#define VELMDRAW_HORZ_SAMPLE_VIEW 3
#define VELMDRAW_HORZ_TIME_VIEW   4
#define VELMDRAW_HORZ_FRAME_VIEW  5

/* Computes the step and the ticks of the current view; 0 before the first
 * layout or when the view cannot be measured. */
VELM_API int     VELMDRAW_HorzScalePrepareDisplayData(VELMDRAW drawer);
/* Samples between ticks of the prepared scale; 0 before the first one. */
VELM_API int64_t VELMDRAW_GetHorzScaleStep(VELMDRAW drawer);
/* The column of a sample, interpolated between the ticks; -1 outside them. */
VELM_API int     VELMDRAW_HorzScaleGetDisplayXPos(VELMDRAW drawer, int64_t sample);
/* The scale strip and the grid lines through the lanes, columns first .. last. */
VELM_API int     VELMDRAW_DrawHorzScale(VELMDRAW drawer, int first, int last);
VELM_API int     VELMDRAW_DrawHorzScaleGrid(VELMDRAW drawer, int first, int last);

VELM_EXTERN_C_END

#endif /* VELMSCALES_H */
