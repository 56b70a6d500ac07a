// The regions drawn in the current view.  Part of the drawer record.
#ifndef VELM_REGION_LAYER_HPP
#define VELM_REGION_LAYER_HPP

#include <cstdint>

#include "outside/signal/audioregion.h"
#include "render/canvas/velmrect.h"

namespace velm::view {

// One region inside the view window: its columns on its track's area (the
// lanes' rows for a hidden "default" track), in canvas coordinates.
struct RegionEntry {
    _VELMRECT area{};
    double begin = 0.0, end = 0.0;  // samples
    uint32_t flags = 0;             // 0x1 its track is shown, 0x2 it lies on the "default" track
    AUDIOREGION *region = nullptr;
};

// The entries in drawing order: by nesting depth (outermost first), each
// depth in time order; a hit test walking backwards meets the innermost
// region first.
struct RegionLayer {
    RegionEntry *entries = nullptr;  // in the drawer's pool
    int32_t capacity = 0;
    int32_t count = 0;
    // The signal that owns the listed regions.  Once the document holds
    // another one, the old regions may be freed: the entries name nothing
    // until the list is rebuilt.
    const AUDIOSIGNAL *signal = nullptr;

    bool names_regions_of(const AUDIOSIGNAL *current) const { return entries && signal == current; }
};

} // namespace velm::view

#endif
