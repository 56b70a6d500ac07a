// The steps every gesture handler shares: the busy guard, pointer samples,
// view shifts and the smart-zoom action that follows the keys.
#include <algorithm>
#include <cmath>

#include "control/gesture_internal.hpp"
#include "core/velmnavigation.h"
#include "edit/velmselection.h"
#include "sound/velmplay.h"

namespace velm::control {

namespace {

// Coordinates far outside any canvas are clamped so that sample arithmetic
// cannot overflow.
constexpr int kCoordinateLimit = 1 << 20;

int64_t to_sample(double s)
{
    return std::isfinite(s) && std::fabs(s) < 9.0e18 ? static_cast<int64_t>(std::floor(s)) : 0;
}

} // namespace

Busy::Busy(VELMDRAW drawer)
{
    if (!drawer || !drawer->state || !drawer->document || !drawer->document->signal || drawer->control.busy) return;
    drawer_ = drawer;
    drawer_->control.busy = 1;
}

Busy::~Busy()
{
    if (drawer_) drawer_->control.busy = 0;
}

int point_at(VELMDRAW d, int x, int y)
{
    d->control.pointerX = std::clamp(x, -kCoordinateLimit, kCoordinateLimit);
    d->control.pointerY = std::clamp(y, -kCoordinateLimit, kCoordinateLimit);
    return VELMCONTROL_UpdateMouseOverObject(d);
}

int64_t display_sample(VELMDRAW d, int x)
{
    return to_sample(VELMDRAW_ConvertDisplayXtoRealX(d, VELMDRAW_ConvertCanvasXtoAreaX(d, x)));
}

int64_t navigator_sample(VELMDRAW d, int x)
{
    // The navigator lanes share the display's columns.
    return to_sample(VELMDRAW_TBConvertDisplayXtoRealX(&d->navigatorBase, x - d->display.left));
}

void send(VELMDRAW d, uint32_t kind, void *data1, void *data2)
{
    BLNOTIFY_SendEvent(d->document->dispatcher, nullptr, 0, kind, data1, data2);
}

void kill_timer(VELMTIMER &timer)
{
    if (timer) VELMTIMER_KillTimer(timer);
    timer = nullptr;
}

void shift_view(VELMDRAW d, int64_t by)
{
    if (by) VELMAUDIO_Zoom(d->document, VELMAUDIO_ViewBegin(d->document) + by, VELMAUDIO_ViewEnd(d->document) + by);
}

int64_t autoscroll_step(VELMDRAW d, int x)
{
    const _VELMRECT &area = d->display;
    const double left = VELMDRAW_ConvertDisplayXtoRealX(d, 0);
    const int64_t spp = std::llround(VELMDRAW_ConvertDisplayXtoRealX(d, 1)) - std::llround(left);
    int64_t step = 0;
    if (x > area.left + area.width - 1) step = spp * (x - (area.left + area.width - 1) - 1);
    else if (x < area.left) step = spp * (x - area.left);
    VELMAUDIO doc = d->document;
    if (step < 0) step = std::max(step, VELMAUDIO_ViewBeginLimit(doc) - VELMAUDIO_ViewBegin(doc));
    if (step > 0) step = std::min(step, VELMAUDIO_ViewEndLimit(doc) - VELMAUDIO_ViewEnd(doc));
    shift_view(d, step);
    return step;
}

int smart_zoom_update(VELMDRAW d)
{
    const uint32_t k = d->control.keyState;
    int action;
    if ((k & 0x0Eu) == 0x0Eu) action = 4;
    else if ((k & 0x0Cu) == 0x0Cu) action = 6;
    else if (k & 0x04u) action = 5;
    else if ((k & 0x0Au) == 0x0Au) action = 4;
    else if (k & 0x08u) action = 3;
    else if (k & 0x02u) action = 2;
    else action = d->control.dragState == kSelecting || VELMAUDIO_SelectionLength(d->document) ? 1 : 2;
    VELMAUDIO_ChangeSmartZoomAction(d->document, action);
    return 1;
}

void set_channel_mask(VELMDRAW d, uint32_t code)
{
    if (VELMAUDIO_IsPlaying(d->document)) return;
    const int lane = lane_of(d, code);
    const bool single = (code & 0x100000u) && lane >= 0;
    const int channels = AUDIOSIGNAL_NumChannels(d->document->signal);
    const uint32_t all = channels >= 32 ? 0xFFFFFFFFu : (1u << std::max(channels, 0)) - 1u;
    VELMAUDIO_SetChannelMask(d->document, single ? 1u << (d->lanes[static_cast<size_t>(lane)].channel & 31) : all);
}

int lane_of(VELMDRAW d, uint32_t code)
{
    // The scale codes 0x4200 and 0x4400 reach into the index bits: lanes
    // are named by the low byte.
    const int lane = static_cast<int>(code & 0xFFu);
    return lane < std::min(d->laneCount, velm::view::kMaxLanes) ? lane : -1;
}

double lane_value(VELMDRAW d, int lane, int y)
{
    if (lane < 0) return 0.0;
    const velm::view::Lane &l = d->lanes[static_cast<size_t>(lane)];
    if (l.area.height <= 0) return l.rangeTop;
    return l.rangeTop - static_cast<double>(y - l.area.top) * (l.rangeTop - l.rangeBottom) / l.area.height;
}

} // namespace velm::control
