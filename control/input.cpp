// The document's input entry points: each hands the event to the
// controller of the document's drawer.
#include <cmath>

#include "control/velminput.h"

#include "control/velmcontrol.h"
#include "core/document_internal.hpp"

namespace {

VELMDRAW drawer_of(VELMAUDIO doc)
{
    return doc && doc->signal ? doc->renderer : nullptr;
}

// Wheel deltas arrive as numbers: truncated, and kept within a range whose
// sums cannot overflow.
int wheel_delta(double delta)
{
    if (!std::isfinite(delta)) return 0;
    constexpr double kLimit = 1 << 24;
    return static_cast<int>(std::trunc(std::fmax(-kLimit, std::fmin(kLimit, delta))));
}

} // namespace

int VELMAUDIO_MouseMove(VELMAUDIO doc, int x, int y, uint32_t flags) { return VELMCONTROL_MouseMove(drawer_of(doc), x, y, flags); }
int VELMAUDIO_MouseDown(VELMAUDIO doc, int x, int y, uint32_t flags) { return VELMCONTROL_MouseDown(drawer_of(doc), x, y, flags); }
int VELMAUDIO_MouseUp(VELMAUDIO doc, int x, int y, uint32_t flags) { return VELMCONTROL_MouseUp(drawer_of(doc), x, y, flags); }

int VELMAUDIO_MouseDblClick(VELMAUDIO doc, int x, int y, uint32_t flags)
{
    return VELMCONTROL_MouseDblClick(drawer_of(doc), x, y, flags);
}

int VELMAUDIO_MouseWheel(VELMAUDIO doc, int x, int y, double delta, uint32_t flags)
{
    return VELMCONTROL_MouseWheel(drawer_of(doc), x, y, wheel_delta(delta), flags);
}

int VELMAUDIO_MouseHWheel(VELMAUDIO doc, int x, int y, double delta, uint32_t flags)
{
    return VELMCONTROL_MouseHWheel(drawer_of(doc), x, y, wheel_delta(delta), flags);
}

int VELMAUDIO_ZoomGesture(VELMAUDIO doc, int x, int y, double factor)
{
    return VELMCONTROL_ZoomGesture(drawer_of(doc), x, y, factor);
}

int VELMAUDIO_AccKeyDown(VELMAUDIO doc, uint32_t keys) { return VELMCONTROL_AccKeyDown(drawer_of(doc), keys); }
int VELMAUDIO_AccKeyUp(VELMAUDIO doc, uint32_t keys) { return VELMCONTROL_AccKeyUp(drawer_of(doc), keys); }
