// The interaction state that the pointer controller keeps inside the view
// drawer.  Private to the library.
#ifndef VELM_CONTROL_INTERNAL_HPP
#define VELM_CONTROL_INTERNAL_HPP

#include <cstdint>

#include "control/velmcontrol.h"
#include "core/velmstate.h"
#include "core/velmtimer.h"

namespace velm::control {

// Drag states; 0 is idle.
enum DragState : uint32_t {
    kIdle = 0,
    kSelecting = 1,
    kSlidingSelection = 2,
    kPanning = 3,
    kVerticalScrolling = 4,
    kMovingCursor = 5,
    kMovingPlayCursor = 6,
    kMovingRegions = 7,
    kResizingRegion = 8,
    kZoomBox = 9,
    kResizingDivider = 10,
    kResizingNavigatorWindow = 11,
    kMovingZoomLimit = 12,
    kVertScaleSelection = 13,
    kSpecScaleSelection = 14,
    kMovingSelection = 16,
};

struct Interaction {
    uint8_t  busy = 0;              // re-entry guard of every entry point and timer
    uint32_t pressArea = 0;         // 0 display, 1 navigator, 2 scale, 3 vertical scale, 4 custom track
    uint32_t mouseOver = 0;         // code of the object under the pointer
    uint32_t grabbed = 0;           // mouseOver at the press; 0 when nothing is held
    int32_t  pressX = 0, pressY = 0;
    int32_t  pointerX = 0, pointerY = 0;
    int32_t  hoverX = 0, hoverY = 0;
    int64_t  pointerSample = 0;
    int64_t  pressSample = 0;
    int64_t  navigatorBegin = 0, navigatorEnd = 0;
    double   pressValue = 0.0;
    int64_t  selectionAnchor = 0;
    int64_t  selectionOtherEnd = 0;
    int64_t  lastDragSample = 0;
    uint32_t pressFlags = 0;
    uint32_t keyState = 0;
    uint32_t buttonReleased = 1;
    const VELMSELECTION *selectionUnderPointer = nullptr; // a draggable selection, when audio drag is on
    VELMSELECTION *slidSelection = nullptr;
    VELMTIMER repeatTimer = nullptr;
    VELMTIMER hoverTimer = nullptr;  // hover timer while up; press timer while a region is held
    int32_t  wheelRemainder = 0, hWheelRemainder = 0;
    uint32_t dragState = kIdle;
    int32_t  hoverTime = 500;        // milliseconds
    int32_t  pressTime = 200;        // milliseconds
    double   navigatorScrollFactor = 0.2;
    uint8_t  audioDragActive = 0;
};

} // namespace velm::control

#endif
