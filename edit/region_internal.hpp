// Helpers shared by the document-level region calls.
#ifndef VELM_REGION_INTERNAL_HPP
#define VELM_REGION_INTERNAL_HPP

#include "core/document_internal.hpp"
#include "edit/velmregion.h"

namespace velm {

// A region record (or a copy of one) to the region it stands for.
AUDIOREGION *identity(const AUDIOREGION *region);

// Whether a region belongs to the document's signal.
bool owns_region(VELMAUDIO doc, const AUDIOREGION *region);

// Whether the region's track may be edited; numbers no track holds may.
bool region_track_editable(VELMAUDIO doc, const AUDIOREGION *region);

// The display options of the region's track (property 2).
uint32_t region_track_options(VELMAUDIO doc, const AUDIOREGION *region);

void clear_current(VELMAUDIO doc);

// Forgets the focused copy when it stands for this region.
void drop_focus_on(VELMAUDIO doc, const AUDIOREGION *region);

} // namespace velm

#endif
