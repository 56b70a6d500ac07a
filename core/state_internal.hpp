// View-state helpers shared inside the core.
#ifndef VELM_STATE_INTERNAL_HPP
#define VELM_STATE_INTERNAL_HPP

#include "core/velmstate.h"

namespace velm {

// The colour map a new view state's spectrogram starts with.
const VELMCOLORMAP *default_color_scheme();

// Refreshes the copy of the focused region's outermost parent.
void refresh_top_parent(VELMSTATE *state);

// Appends a selection record to a state's pool and links it at *tail.
VELMSELECTION *append_selection(VELMSTATE *state, VELMSELECTION **tail, double begin, double end);

// Re-creates a state without selections; the caller stores the result.
VELMSTATE *rebuild_without_selections(VELMSTATE *state);

bool spectral_differs(const VELMSPECTRALCONFIG &a, const VELMSPECTRALCONFIG &b);

} // namespace velm

#endif
