// Puts the scales into the frame's drawing order.
#include "render/view/drawer_internal.hpp"
#include "render/view/velmscales.h"

using namespace velm::view;

namespace {

// A scroll moves the lanes but not the strip under them, and every label
// may move: the whole strip is drawn again whenever the ticks are.
int prepare_and_draw_horz_scale(VELMDRAW drawer, int, int)
{
    const int ok = VELMDRAW_HorzScalePrepareDisplayData(drawer);
    return VELMDRAW_DrawHorzScale(drawer, 0, drawer->columns - 1) && ok;
}

int draw_scale_grids(VELMDRAW drawer, int first, int last)
{
    const int ok = VELMDRAW_DrawHorzScaleGrid(drawer, first, last);
    return VELMDRAW_DrawVertScaleGrid(drawer, first, last) && ok;
}

const bool registered = [] {
    DrawHooks &hooks = draw_hooks();
    hooks.vertScales = VELMDRAW_DrawVertScale;
    hooks.horzScale = prepare_and_draw_horz_scale;
    hooks.scaleGrids = draw_scale_grids;
    return true;
}();

} // namespace
