// The scale steps of a frame.
#include "render/view/drawer_internal.hpp"
#include "render/view/velmscales.h"

// A scroll moves the lanes but not the strip under them, and every label
// may move: the whole strip is drawn again whenever the ticks are.
int velm::view::draw_horz_scale(VELMDRAW drawer)
{
    const int ok = VELMDRAW_HorzScalePrepareDisplayData(drawer);
    return VELMDRAW_DrawHorzScale(drawer, 0, drawer->columns - 1) && ok;
}

int velm::view::draw_scale_grids(VELMDRAW drawer, int first, int last)
{
    const int ok = VELMDRAW_DrawHorzScaleGrid(drawer, first, last);
    return VELMDRAW_DrawVertScaleGrid(drawer, first, last) && ok;
}
