// Rectangles that the overlays place on each frame and that the pointer
// controller hit-tests afterwards.  Part of the drawer record.
#ifndef VELM_OVERLAY_LAYOUT_HPP
#define VELM_OVERLAY_LAYOUT_HPP

#include <array>
#include <cstdint>

#include "core/velmstate.h"
#include "render/canvas/velmrect.h"

namespace velm::view {

// The two handles of one committed selection; a handle that was not drawn
// has an empty rectangle.
struct SelectionSlider {
    const VELMSELECTION *selection = nullptr;
    _VELMRECT display{};
    _VELMRECT begin{}, end{};
};

constexpr int kMaxSelectionSliders = 128;

struct OverlayLayout {
    std::array<_VELMRECT, 2> cursorSliders{};     // edit cursor, play cursor; cleared each frame
    std::array<SelectionSlider, kMaxSelectionSliders> selectionSliders{};
    int32_t selectionSliderCount = 0;
    std::array<_VELMRECT, 2> zoomLimitHandles{};  // begin, end
    _VELMRECT navigatorBox{};                     // the visible window in the navigator strip
};

} // namespace velm::view

#endif
