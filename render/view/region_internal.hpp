// What the region layers share: placing a region on its track and drawing
// one region.  Private to the renderer.
#ifndef VELM_REGION_INTERNAL_HPP
#define VELM_REGION_INTERNAL_HPP

#include "render/view/drawer_internal.hpp"

namespace velm::view {

// The region's entry as it would be listed now: its columns on its track's
// area (the lanes' rows for a hidden "default" track).  False when the region
// lies outside the view or its track is not drawn.
bool area_from_region(VELMDRAW drawer, const AUDIOREGION *region, int default_track, RegionEntry *entry);

// The listed entry of a region (or of a copy of it), or null.
const RegionEntry *find_entry(const _VELMDRAW *drawer, const AUDIOREGION *region);

// Paints one region of a shown track on the current target.
void draw_track_region(VELMDRAW drawer, const RegionEntry &entry);

// The band of the shown custom tracks across the display area; empty when
// no track is shown.
_VELMRECT track_band(const _VELMDRAW *drawer);

// Corner size of a track's regions: `rounded` unless its regions are square.
inline uint32_t region_corner(uint32_t options, uint32_t rounded)
{
    return (options & 0x20u) ? 0u : rounded;
}

} // namespace velm::view

#endif
