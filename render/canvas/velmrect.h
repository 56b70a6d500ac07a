/* The rectangle record shared by the canvas, the renderer and the utilities. */
#ifndef VELMRECT_H
#define VELMRECT_H

#include <stdint.h>

/* right = left + width - 1 and bottom = top + height - 1 once complete.
 * Operations that take a rectangle read left, top, width and height. */
typedef struct _VELMRECT {
    int32_t left;
    int32_t top;
    int32_t width;
    int32_t height;
    int32_t right;
    int32_t bottom;
} _VELMRECT;

#endif /* VELMRECT_H */
