// Pointer areas: the sign toggles remaining time, the labels step the unit,
// a double click on the digits enters edit mode.
#include "core/velmconfig.h"
#include "widgets/display/display_internal.hpp"

namespace {

uint32_t area_at(const _VELMDISPLAY *d, int x, int y)
{
    const Layout &l = d->layout;
    if (display_inside(l.sign, x, y))
        return kAreaSign;
    const _VELMRECT &row = l.labels;
    const bool in_row = y >= row.top && y < row.top + row.height;
    const uint32_t samples = display_inside(l.samples, x, y) ? kAreaSamples : 0;
    if (in_row && x >= l.millis.left && x < l.millis.left + l.millis.width)
        return kAreaMsLabel | samples;
    if (in_row && x >= l.hours.left && x < l.seconds.left + l.seconds.width)
        return kAreaHmsLabel;
    if (samples)
        return samples;
    if (display_inside(l.format, x, y))
        return kAreaFormat;
    return 0;
}

// The milliseconds label steps through samples, frames and their views.
int next_unit(int unit)
{
    switch (unit) {
    case kUnitSample: return kUnitFrame;
    case kUnitTime: return kUnitSample;
    case kUnitFrameView: return kUnitSample;
    case kUnitFrame: return kUnitSampleView;
    case kUnitTimeView: return kUnitSampleView;
    case kUnitSampleView: return kUnitFrameView;
    default: return unit;
    }
}

// The hours label switches to time, keeping whether the view's own scale is used.
int time_unit(int unit)
{
    return unit == kUnitSample || unit == kUnitFrame || unit == kUnitTimeView ? kUnitTime : kUnitTimeView;
}

void set_unit(_VELMDISPLAY *d, int unit)
{
    if (display_has_doc(d))
        VELMAUDIO_SetDrawProperty(d->doc, kUnitProperty, unit);
}

} // namespace

int VELMDISPLAY_MouseMove(VELMDISPLAY display, int x, int y, uint32_t)
{
    if (!display)
        return 0;
    display->hover = area_at(display, x, y);
    return 1;
}

uint32_t VELMDISPLAY_GetPointerArea(VELMDISPLAY display)
{
    return display ? display->hover : 0;
}

int VELMDISPLAY_MouseDown(VELMDISPLAY display, int x, int y, uint32_t flags)
{
    if (!display)
        return 0;
    VELMDISPLAY_MouseMove(display, x, y, flags);
    if (!(flags & VELMDISPLAY_BUTTON_PRIMARY))
        return 1;
    display->press_area = display->hover;
    display->pressed = true;
    if (display->now.editing)
        display_end_edit(display, !display->text.empty());
    return 1;
}

int VELMDISPLAY_MouseUp(VELMDISPLAY display, int x, int y, uint32_t flags)
{
    if (!display)
        return 0;
    VELMDISPLAY_MouseMove(display, x, y, flags);
    if (!display->pressed)
        return 1;
    display->pressed = false;
    const uint32_t area = display->press_area;
    const int unit = display->now.unit;
    if (area == kAreaSign)
        display->now.options ^= VELMDISPLAY_OPTION_REMAINING;
    else if (area & kAreaMsLabel)
        set_unit(display, next_unit(unit));
    else if (area == kAreaHmsLabel)
        set_unit(display, time_unit(unit));
    VELMDISPLAY_Update(display);
    return 1;
}

int VELMDISPLAY_MouseDblClick(VELMDISPLAY display, int x, int y, uint32_t flags)
{
    if (!display || !(flags & VELMDISPLAY_BUTTON_PRIMARY))
        return 0;
    if (display_inside(display->layout.digits, x, y))
        return VELMDISPLAY_EnterEdit(display);
    if (display_inside(display->layout.format, x, y)) {
        display_notify(VELMDISPLAY_EVENT_FORMATCLICK);
        return 1;
    }
    return 0;
}

int VELMDISPLAY_MouseWheel(VELMDISPLAY display, int, int, uint32_t)
{
    return display && display->doc;
}

int VELMDISPLAY_MouseHWheel(VELMDISPLAY display, int, int, uint32_t)
{
    return display && display->doc;
}

int VELMDISPLAY_AccKeyDown(VELMDISPLAY, int, uint32_t)
{
    return 0;
}

int VELMDISPLAY_AccKeyUp(VELMDISPLAY, int, uint32_t)
{
    return 0;
}
