#include "render/canvas/canvas_internal.h"

#include <algorithm>
#include <cstdint>

namespace velm::canvas {
namespace {

// One axis of the constraint.  `slack` is how far an unrounded shape may
// start before the edge.  64-bit sums keep absurd arguments from overflowing.
void ConstrainAxis(int &pos, int &length, int corner, int extent, int slack)
{
    std::int64_t p = pos, len = length;
    if (corner != 0) {
        if (p < -corner) {
            len -= -corner - p;
            p = -corner;
        }
        if (p + len - corner > extent) len = std::int64_t{extent} + corner - p;
    } else {
        if (p < -slack) {
            len -= -slack - p;
            p = -slack;
        }
        if (p - 1 + len > extent) len = std::int64_t{extent} + 1 - p;
    }
    pos = static_cast<int>(p);
    length = static_cast<int>(std::max<std::int64_t>(len, -1));
}

} // namespace

bool ConstrainRect(VELMCANVAS canvas, int &x, int &y, int &width, int &height, int &corner)
{
    int canvas_width = 0, canvas_height = 0;
    if (!Call<&_VELMCANVASOPS::GetDimension>(canvas, 0, &canvas_width, &canvas_height)) return false;
    // A shape only ever shrinks here, so a negative side can never recover.
    if (width < 0 || height < 0) return false;
    if (corner != 0) corner = std::min({corner, width, height}) & ~1;
    ConstrainAxis(x, width, corner, canvas_width, 2);
    ConstrainAxis(y, height, corner, canvas_height, 1);
    return width >= 0 && height >= 0;
}

} // namespace velm::canvas
