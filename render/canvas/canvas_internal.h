// Shared by the canvas's own sources: forwarding to the operations table and
// the rectangle constraint of the shape operations.
#ifndef VELM_CANVAS_INTERNAL_H
#define VELM_CANVAS_INTERNAL_H

#include "render/canvas/velmcanvas.h"

namespace velm::canvas {

inline bool Usable(VELMCANVAS canvas)
{
    return canvas && canvas->ops && canvas->data;
}

// Calls a table slot with the back-end data first; a canvas that is not
// usable, or an empty slot, gives `failure` without calling anything.
template <auto Slot, typename Result, typename... Args>
Result Call(VELMCANVAS canvas, Result failure, Args... args)
{
    if (!Usable(canvas) || !(canvas->ops->*Slot)) return failure;
    return (canvas->ops->*Slot)(canvas->data, args...);
}

// Slots that take no back-end data (the image-only ones).
template <auto Slot, typename Result, typename... Args>
Result CallWithoutData(VELMCANVAS canvas, Result failure, Args... args)
{
    if (!Usable(canvas) || !(canvas->ops->*Slot)) return failure;
    return (canvas->ops->*Slot)(args...);
}

// Fits a shape rectangle to the canvas so that it reaches at most two pixels
// past the left edge and one past the others (the corner size past every
// edge when rounded).  Limits the corner size to the smaller side and makes
// it even.  False when the canvas size is unknown or nothing is left.
bool ConstrainRect(VELMCANVAS canvas, int &x, int &y, int &width, int &height, int &corner);

// Called with every canvas the host destroys, before it goes, so that the
// renderers drawing on it forget it.  One listener; null removes it.
using DestroyListener = void (*)(VELMCANVAS canvas);
void SetDestroyListener(DestroyListener listener);

} // namespace velm::canvas

#endif // VELM_CANVAS_INTERNAL_H
