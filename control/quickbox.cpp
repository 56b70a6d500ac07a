// The quick (zoom) box and the scale-range selections: values of the view
// state that a drag builds and the renderer shows.
#include <algorithm>

#include "control/velmcontrol.h"
#include "core/document_internal.hpp"

namespace {

VELMSTATE *view_state(VELMAUDIO doc)
{
    return doc ? doc->state : nullptr;
}

// Size from the origin to the corner, both included; kept within 32 bits
// whatever the coordinates.
int32_t extent(int32_t origin, int32_t corner)
{
    const int64_t size = int64_t{corner} - origin + 1;
    return static_cast<int32_t>(std::clamp<int64_t>(size, INT32_MIN, INT32_MAX));
}

// One end of a scale-range selection (vertical or spectral).
using RangeEnd = double VELMSTATE::*;

// A new range: both ends at value; drawn once it has an extent.
int start_range(VELMAUDIO doc, RangeEnd start, RangeEnd end, double value)
{
    VELMSTATE *s = view_state(doc);
    if (!s) return 0;
    s->*start = s->*end = value;
    return 1;
}

int end_range(VELMAUDIO doc, RangeEnd end, double value)
{
    VELMSTATE *s = view_state(doc);
    if (!s) return 0;
    s->*end = value;
    VELMSTATE_NotifyChanges(doc, 0);
    return 1;
}

} // namespace

int VELMAUDIO_StartQuickBox(VELMAUDIO doc, int x, int y)
{
    VELMSTATE *s = view_state(doc);
    if (!s) return 0;
    s->quickBox = VELMQUICKBOX{x, y, 0, 0, x, y};
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x2002F, &x, &y);
    return 1;
}

int VELMAUDIO_UpdateQuickBox(VELMAUDIO doc, int x, int y)
{
    VELMSTATE *s = view_state(doc);
    if (!s) return 0;
    VELMQUICKBOX &box = s->quickBox;
    box.cornerX = x;
    box.cornerY = y;
    box.width = extent(box.x, x);
    box.height = extent(box.y, y);
    VELMSTATE_NotifyChanges(doc, 0);
    return 1;
}

int VELMAUDIO_ClearQuickBox(VELMAUDIO doc)
{
    VELMSTATE *s = view_state(doc);
    if (!s) return 0;
    s->quickBox = VELMQUICKBOX{};
    VELMSTATE_NotifyChanges(doc, 0);
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x20030, nullptr, nullptr);
    return 1;
}

int VELMAUDIO_StartVerticalScaleSelection(VELMAUDIO doc, double value)
{
    return start_range(doc, &VELMSTATE::vertSelectionStart, &VELMSTATE::vertSelectionEnd, value);
}

int VELMAUDIO_EndVerticalScaleSelection(VELMAUDIO doc, double value)
{
    return end_range(doc, &VELMSTATE::vertSelectionEnd, value);
}

int VELMAUDIO_StartSpecScaleSelection(VELMAUDIO doc, double value)
{
    return start_range(doc, &VELMSTATE::spectralSelectionStart, &VELMSTATE::spectralSelectionEnd, value);
}

int VELMAUDIO_EndSpecScaleSelection(VELMAUDIO doc, double value)
{
    return end_range(doc, &VELMSTATE::spectralSelectionEnd, value);
}
