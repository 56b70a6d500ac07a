// What a view state takes from the canvas and region modules.
#include "core/state_internal.hpp"
#include "render/canvas/velmcanvas.h"

namespace velm {

const VELMCOLORMAP *default_color_scheme()
{
    return &VELMCOLORMAP_CE2K;
}

void refresh_top_parent(VELMSTATE *state)
{
    if (!state->focusedRegion.region) state->focusedTopParent = VELMREGIONCOPY{};
}

} // namespace velm
