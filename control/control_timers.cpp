// The controller's timers: hover, press-and-hold over a region and the
// navigator scroll while the press lies outside the visible window.  Each
// runs under the busy guard, so a tick inside a handler does nothing.
#include <algorithm>
#include <cmath>

#include "control/gesture_internal.hpp"
#include "core/velmnavigation.h"
#include "edit/velmregion.h"

namespace velm::control {

int hover_tick(void *user)
{
    auto *d = static_cast<VELMDRAW>(user);
    Busy busy(d);
    if (!busy.ok()) return 0;
    Interaction &c = d->control;
    kill_timer(c.hoverTimer); // one shot
    if (!c.buttonReleased) return 1;
    int32_t position[2] = {c.pointerX, c.pointerY};
    if (c.mouseOver & 0x10000u) send(d, 0x20038, VELMAUDIO_GetRegionOnFocus(d->document), position);
    else send(d, 0x20037, &c.mouseOver, position);
    return 1;
}

int press_tick(void *user)
{
    auto *d = static_cast<VELMDRAW>(user);
    Busy busy(d);
    if (!busy.ok()) return 0;
    Interaction &c = d->control;
    kill_timer(c.hoverTimer); // one shot
    if (!c.buttonReleased && (c.mouseOver & 0x70000u)) VELMAUDIO_EventOverFocusedRegion(d->document);
    return 1;
}

int navigator_scroll_tick(void *user)
{
    auto *d = static_cast<VELMDRAW>(user);
    Busy busy(d);
    if (!busy.ok()) return 0;
    VELMAUDIO doc = d->document;
    const int64_t begin = VELMAUDIO_ViewBegin(doc), end = VELMAUDIO_ViewEnd(doc);
    const int64_t length = end - begin, half = length / 2;
    const int64_t step = std::llround(static_cast<double>(length) * d->control.navigatorScrollFactor);
    const int64_t press = d->control.pressSample;
    int64_t start = begin;
    if (press < begin + half - step) start = std::max(begin - step, VELMAUDIO_ViewBeginLimit(doc));
    else if (press > end - half + step) start = std::min(begin + step, VELMAUDIO_ViewEndLimit(doc) - length);
    else return 1;
    return VELMAUDIO_Zoom(doc, start, start + length);
}

} // namespace velm::control
