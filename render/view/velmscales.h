/*
 * Scales of the audio view: the horizontal (time) scale under the lanes with
 * its vertical grid lines, and the value scale beside each lane with its
 * horizontal grid lines.  Ticks are chosen so that two of them always leave
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

/* Vertical (value) scale kinds of waveform lanes. */
#define VELMDRAW_VERT_SAMPLE     0
#define VELMDRAW_VERT_DECIBEL    1
#define VELMDRAW_VERT_PERCENT    2
#define VELMDRAW_VERT_NORMALIZED 3

/* Scale kinds of spectrogram lanes. */
#define VELMDRAW_SPEC_HERTZ 0
#define VELMDRAW_SPEC_MELS  1

/* Every lane's value scale, and the zero and grid lines through the
 * waveform lanes over columns first .. last. */
VELM_API int    VELMDRAW_DrawVertScale(VELMDRAW drawer);
VELM_API int    VELMDRAW_DrawVertScaleGrid(VELMDRAW drawer, int first, int last);
/* Step in the kind's units (sample values of the given bits, decibels and
 * normalised amplitudes alike, percent) that puts grid lines closest to 30
 * pixels apart in a waveform lane; 0 for another lane or kind. */
VELM_API double VELMDRAW_CalculateVertScaleStep(VELMDRAW drawer, int lane, int kind, int bits);
/* The same in hertz or Mels for a spectrogram lane. */
VELM_API double VELMDRAW_CalculateSpecScaleStep(VELMDRAW drawer, int lane, int kind);
/* Row inside the lane of a value in a kind's units; -1 for a lane of the
 * other sort or an unknown kind. */
VELM_API int    VELMDRAW_ConvertVertScaleKindRealYtoDisplayY(VELMDRAW drawer, int lane, int kind, double value);
VELM_API int    VELMDRAW_ConvertSpecScaleKindRealYtoDisplayY(VELMDRAW drawer, int lane, int kind, double value);

VELM_EXTERN_C_END

#endif /* VELMSCALES_H */
