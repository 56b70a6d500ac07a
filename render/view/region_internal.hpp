// What the region layers share: placing a region on its track and drawing
// one region.  Private to the renderer.
#ifndef VELM_REGION_INTERNAL_HPP
#define VELM_REGION_INTERNAL_HPP

#include <climits>
#include <vector>

#include "render/view/drawer_internal.hpp"

namespace velm::view {

// A region running out of view keeps its true extent (its text stays
// centred on the whole region as it scrolls), up to this many columns beyond
// either end of the display, which keeps coordinates well inside 32 bits.
constexpr double kOffViewColumns = 1 << 24;

// The display columns a region covers: from its begin sample's column to
// the column of its last sample.
void region_columns(VELMDRAW drawer, double begin, double end, double *from, double *to);

// The region's entry as it would be listed now: its columns on its track's
// area (the lanes' rows for a hidden "default" track).  False when the region
// lies outside the view or its track is not drawn.
bool area_from_region(VELMDRAW drawer, const AUDIOREGION *region, int default_track, RegionEntry *entry);

// The regions in view as the list would hold them now, parents before their
// children; and storing such a list as the drawer's.
std::vector<RegionEntry> visible_entries(VELMDRAW drawer);
bool keep_entries(VELMDRAW drawer, const std::vector<RegionEntry> &entries);

// The canvas columns of every region whose place differs between the
// drawer's list and `now` (moved, resized, come or gone), and where they
// show: on the tracks, over the lanes.
struct RegionChange {
    int32_t left = INT32_MAX, right = INT32_MIN;
    bool tracks = false, lanes = false;
    bool any() const { return left <= right; }
};
RegionChange changed_regions(const _VELMDRAW *drawer, const std::vector<RegionEntry> &now);

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
