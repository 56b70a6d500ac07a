/*
 * Digit read-outs shared by the time display and the audio view's labels:
 * a position drawn as time, sample count or frame and offset, every
 * character in a fixed cell, leading zeros dim and the significant digits
 * bright (the font's inactive and active colours).
 */
#ifndef VELMDRAWCOMMON_H
#define VELMDRAWCOMMON_H

#include <stdint.h>

#include "core/velmconfig.h"
#include "render/canvas/velmcanvas.h"

VELM_EXTERN_C_BEGIN

/* The canvas must be painting (fonts are selected only then).  The draw
 * calls return the width they advanced, 0 for a null canvas or font; x and
 * y are the top left of the first cell.
 *
 * Options: bit 0x1 a bright minus sign (remaining time), 0x2 zeros instead
 * of the value, 0x4 no sign cell, 0x8 hours folded into minutes, 0x10
 * hours and minutes folded into seconds (wins over 0x8).  A negative value
 * draws its magnitude: the sign cell follows the options alone.  Times are
 * rounded to the nearest millisecond. */
VELM_API int VELMDRAWCOMMON_DrawDisplayTime(VELMCANVAS canvas, const VELMCONFIGFONT *font, uint32_t options, int x,
                                            int y, double seconds);
VELM_API int VELMDRAWCOMMON_DrawDisplaySample(VELMCANVAS canvas, const VELMCONFIGFONT *font, uint32_t options, int x,
                                              int y, int64_t sample);
VELM_API int VELMDRAWCOMMON_DrawDisplayFrame(VELMCANVAS canvas, const VELMCONFIGFONT *font, uint32_t options, int x,
                                             int y, int64_t frame, int64_t offset);
/* Widths in pixels of the read-outs above; 0 for a null canvas or font. */
VELM_API int VELMDRAWCOMMON_DrawDisplayTimeWidth(VELMCANVAS canvas, const VELMCONFIGFONT *font, uint32_t options);
VELM_API int VELMDRAWCOMMON_DrawDisplaySampleWidth(VELMCANVAS canvas, const VELMCONFIGFONT *font, uint32_t options);
VELM_API int VELMDRAWCOMMON_DrawDisplayFrameWidth(VELMCANVAS canvas, const VELMCONFIGFONT *font, uint32_t options);

VELM_EXTERN_C_END

#endif /* VELMDRAWCOMMON_H */
