// Puts the region and custom-track layers into the frame's drawing order.
#include "render/view/drawer_internal.hpp"
#include "render/view/velmoverlays.h"

using namespace velm::view;

namespace {

// The "default" track's regions over the lanes, then every track's regions.
int draw_regions(VELMDRAW drawer, int first, int last)
{
    const int ok = VELMDRAW_DrawRegionsAndCues(drawer, first, last);
    return VELMDRAW_DrawCustomTrackRegions(drawer, first, last) && ok;
}

// Only the focused region's edges move without a full redraw.
int redraw_changed_region(VELMDRAW drawer)
{
    return VELMDRAW_UpdateChangedRegion(drawer, &drawer->state->focusedRegion);
}

const bool registered = [] {
    DrawHooks &hooks = draw_hooks();
    hooks.visibleRegions = VELMDRAW_UpdateVisibleRegion;
    hooks.trackScales = VELMDRAW_DrawVertCustomTracks;
    hooks.regions = draw_regions;
    hooks.regionOnFocus = VELMDRAW_DrawRegionOnFocus;
    hooks.changedRegion = redraw_changed_region;
    hooks.regionShadows = VELMDRAW_DrawCustomTrackRegionShadows;
    return true;
}();

} // namespace
