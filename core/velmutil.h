/* Small pure helpers: millisecond and sample texts, typed-time parsing,
 * rectangles and the real-to-pixel mapping of drawing areas. */
#ifndef VELMUTIL_H
#define VELMUTIL_H

#include <stdint.h>

#include "core/velm_api.h"
#include "render/canvas/velmrect.h"

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

/* ---- Rectangles and drawing areas ---- */

typedef double (*VELMAREA_Mapping)(double value);

/* The coordinates of a drawing area: its rectangle, the pixel row and column
 * of the real value 0, the real ranges its height and width span, and
 * optional mappings between display and real values. */
typedef struct _VELMAREA {
    _VELMRECT rect;
    int32_t yOrigin;
    int32_t xOrigin;
    double  yExtent;
    double  xExtent;
    VELMAREA_Mapping displayToRealY;
    VELMAREA_Mapping realToDisplayY;
    VELMAREA_Mapping realToDisplayX;
    VELMAREA_Mapping displayToRealX;
} VELMAREA;

/* Border masks of VELMUTIL_IsOverRectBorder. */
#define VELMUTIL_BORDER_LEFT   1
#define VELMUTIL_BORDER_RIGHT  2
#define VELMUTIL_BORDER_TOP    4
#define VELMUTIL_BORDER_BOTTOM 8

VELM_API int VELMUTIL_IsInsideRect(const _VELMRECT *rect, int x, int y);
VELM_API int VELMUTIL_IsInsideArea(const VELMAREA *area, int x, int y);
VELM_API int VELMUTIL_IsOverRectBorder(const _VELMRECT *rect, int mask, int x, int y);
VELM_API int VELMUTIL_IsOverAreaBorder(const VELMAREA *area, int mask, int x, int y);
VELM_API int VELMUTIL_CompareRect(const _VELMRECT *a, const _VELMRECT *b);
/* mode 2: width and height from the corners (1 when both are positive);
 * mode 4: right and bottom from the size; mode 1: left and top from the size. */
VELM_API int VELMUTIL_EvalDimensions(_VELMRECT *rect, int mode);
VELM_API _VELMRECT *VELMUTIL_DefineRect(_VELMRECT *out, int left, int top, int width, int height);
VELM_API _VELMRECT *VELMUTIL_ComposeRect(_VELMRECT *out, const _VELMRECT *a, const _VELMRECT *b);
VELM_API _VELMRECT *VELMUTIL_ExtractRectFromArea(_VELMRECT *out, const VELMAREA *area);
VELM_API int32_t VELMUTIL_ConvertRealYtoDisplayY(const VELMAREA *area, double y);
VELM_API double  VELMUTIL_ConvertDisplayYtoRealY(const VELMAREA *area, int32_t row);
VELM_API int32_t VELMUTIL_ConvertRealXtoDisplayX(const VELMAREA *area, double x);
VELM_API double  VELMUTIL_ConvertDisplayXtoRealX(const VELMAREA *area, int32_t column);

VELM_EXTERN_C_END

#endif /* VELMUTIL_H */
