// The library's picture set (the region frame pieces and their loader)
// belongs to the widgets module, which comes later in the build order.  The
// canvas refers to it weakly: until that module is linked in, the loader's
// address and the pieces' addresses are null and nothing is loaded or pasted.
#ifndef VELM_CANVAS_PICTURES_INTERNAL_H
#define VELM_CANVAS_PICTURES_INTERNAL_H

#include "render/canvas/velmcanvas.h"

extern "C" {
__attribute__((weak)) int VELMRESOURCES_Load(void);

__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRoundTopLeftOpen;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRoundLeftOpen;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRoundBottomLeftOpen;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRoundTopRightOpen;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRoundRightOpen;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRoundBottomRightOpen;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRectTopOpen;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRectBottomOpen;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRectTopLeft;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRectLeft;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRectBottomLeft;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRectTopRight;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRectRight;
__attribute__((weak)) extern VELMCANVASIMAGE Img_RegionRectBottomRight;
}

#endif // VELM_CANVAS_PICTURES_INTERNAL_H
