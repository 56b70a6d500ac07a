// Wheels, the zoom gesture and the accelerator keys.
#include <algorithm>
#include <cmath>

#include "control/gesture_internal.hpp"
#include "core/velmnavigation.h"
#include "sound/velmplay.h"

namespace velm::control {

namespace {

// Deltas come in eighths of a degree, 15 degrees a notch; the low 3 bits
// wait in the remainder for the next event.
double notches(int32_t &remainder, int delta)
{
    const int64_t total = static_cast<int64_t>(delta) + remainder;
    remainder = static_cast<int32_t>(total & 7);
    return static_cast<double>(total >> 3) / 15.0;
}

void wheel_gain(VELMDRAW d, double n, uint32_t flags)
{
    VELMPLAYER player = VELMAUDIO_Player(d->document);
    const double step = n > 0 ? 0.03 : n < 0 ? -0.03 : 0.0;
    auto nudge = [&](int ch) {
        VELMPLAY_SetChannelGain(player, ch, std::clamp(VELMPLAY_GetChannelGain(player, ch) + step, 0.0, 1.0));
    };
    const int lane = static_cast<int>(d->control.mouseOver & 0xFFu);
    if (flags & 0x08u) {
        if (lane < d->laneCount) nudge(d->lanes[static_cast<size_t>(lane)].channel);
    } else {
        for (int ch = 0; ch < 6; ++ch) nudge(ch);
    }
}

int wheel(VELMDRAW d, int x, int y, int delta, uint32_t flags)
{
    int result = point_at(d, x, y);
    const double n = notches(d->control.wheelRemainder, delta);
    const uint32_t code = d->control.mouseOver;
    VELMAUDIO doc = d->document;
    if (code & 0x2000000u) wheel_gain(d, n, flags);
    if ((code & 0x4200u) == 0x4200u || ((code & 0x1000u) && (flags & 0x08u))) {
        const int lane = lane_of(d, code);
        const double factor = std::pow(1.2, -n);
        const int kind = VELMDRAW_ChannelKind(d, lane);
        if (kind == 1) result &= VELMAUDIO_ZoomVerticalFactor(doc, factor) != 0;
        else if (kind == 2) {
            const auto centre = static_cast<float>(lane_value(d, lane, d->control.pointerY));
            result &= VELMAUDIO_ZoomSpectralFactorAround(doc, centre, factor) != 0;
        } else result = 0;
    }
    if (((code & 0x1000u) || (code & 0x4100u) == 0x4100u) && !(flags & 0x0Eu))
        VELMAUDIO_ZoomByFactor(doc, display_sample(d, d->control.pointerX), n * 0.3);
    if ((code & 0x400000u) && !(flags & 0x0Eu)) {
        const int64_t b = VELMAUDIO_ViewBegin(doc), e = VELMAUDIO_ViewEnd(doc);
        const double width = static_cast<double>(e - b);
        const int64_t nb = std::max<int64_t>(0, std::llround(static_cast<double>(b) + n * 0.3 * width));
        const int64_t ne = std::min<int64_t>(VELMAUDIO_ViewEndLimit(doc), std::llround(static_cast<double>(e) - n * 0.3 * width));
        result &= VELMAUDIO_Zoom(doc, nb, ne) != 0;
    }
    return result;
}

int hwheel(VELMDRAW d, int x, int y, int delta, uint32_t flags)
{
    point_at(d, x, y);
    const double n = notches(d->control.hWheelRemainder, delta);
    const uint32_t code = d->control.mouseOver;
    VELMAUDIO doc = d->document;
    auto scroll = [&] {
        int64_t by = std::llround(-n * 0.1 * static_cast<double>(VELMAUDIO_ViewEnd(doc) - VELMAUDIO_ViewBegin(doc)));
        if (by < 0) by = std::max(by, VELMAUDIO_ViewBeginLimit(doc) - VELMAUDIO_ViewBegin(doc));
        if (by > 0) by = std::min(by, VELMAUDIO_ViewEndLimit(doc) - VELMAUDIO_ViewEnd(doc));
        shift_view(d, by);
    };
    if ((code & 0x1000u) || (code & 0x4100u) == 0x4100u) scroll();
    if (code & 0x400000u) scroll();
    return move(d, x, y, flags);
}

int keys(VELMDRAW d, uint32_t bits, bool down)
{
    Interaction &c = d->control;
    if (down) c.keyState |= bits;
    else c.keyState &= ~bits;
    const int result = smart_zoom_update(d);
    send(d, down ? 0x20035 : 0x20036, &c.mouseOver, down ? &c.keyState : nullptr);
    return result;
}

} // namespace

} // namespace velm::control

using velm::control::Busy;

int VELMCONTROL_MouseWheel(VELMDRAW drawer, int x, int y, int delta, uint32_t flags)
{
    Busy busy(drawer);
    return busy.ok() ? velm::control::wheel(drawer, x, y, delta, flags) : 0;
}

int VELMCONTROL_MouseHWheel(VELMDRAW drawer, int x, int y, int delta, uint32_t flags)
{
    Busy busy(drawer);
    return busy.ok() ? velm::control::hwheel(drawer, x, y, delta, flags) : 0;
}

int VELMCONTROL_ZoomGesture(VELMDRAW drawer, int x, int y, double factor)
{
    Busy busy(drawer);
    if (!busy.ok() || !std::isfinite(factor) || !velm::control::point_at(drawer, x, y)) return 0;
    VELMAUDIO_ZoomByFactor(drawer->document, velm::control::display_sample(drawer, drawer->control.pointerX), factor);
    return 1;
}

int VELMCONTROL_AccKeyDown(VELMDRAW drawer, uint32_t bits)
{
    Busy busy(drawer);
    return busy.ok() ? velm::control::keys(drawer, bits, true) : 0;
}

int VELMCONTROL_AccKeyUp(VELMDRAW drawer, uint32_t bits)
{
    Busy busy(drawer);
    return busy.ok() ? velm::control::keys(drawer, bits, false) : 0;
}
