// The display record: creation, the update from the document, and the
// redraw test against the last drawn values.
#include <new>

#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "sound/velmplay.h"
#include "widgets/display/display_internal.hpp"

int display_is_sample_unit(int unit)
{
    return unit == kUnitSample || unit == kUnitSampleView;
}

int display_is_frame_unit(int unit)
{
    return unit == kUnitFrame || unit == kUnitFrameView;
}

bool display_has_doc(const _VELMDISPLAY *d)
{
    return d->doc && VELMAUDIO_IsOpen(d->doc);
}

void display_notify(uint32_t event)
{
    BLNOTIFY_SendEvent(VELMAUDIO_Dispatcher(nullptr), nullptr, 0, event, nullptr, nullptr);
}

bool display_inside(const _VELMRECT &r, int x, int y)
{
    return x >= r.left && x < r.left + r.width && y >= r.top && y < r.top + r.height;
}

VELMDISPLAY VELMDISPLAY_Create(void)
{
    auto *d = new (std::nothrow) _VELMDISPLAY;
    if (!d)
        return nullptr;
    VELMCONFIG_InitDisplayDrawConfig(&d->config);
    VELMDISPLAY_Update(d);
    return d;
}

int VELMDISPLAY_Destroy(VELMDISPLAY display)
{
    if (!display)
        return 0;
    // The blink timer must never fire on a freed display.
    if (display->blink)
        VELMTIMER_KillTimer(display->blink);
    delete display;
    return 1;
}

int VELMDISPLAY_SetVelmAudio(VELMDISPLAY display, VELMAUDIO doc)
{
    if (!display)
        return 0;
    if (display->doc != doc && display->blink)
        display_end_edit(display, false);
    display->doc = doc;
    return 1;
}

int VELMDISPLAY_Update(VELMDISPLAY display)
{
    if (!display)
        return 0;
    Shown &s = display->now;
    if (display_has_doc(display)) {
        VELMAUDIO doc = display->doc;
        s.status = VELMAUDIO_GetPlayStatus(doc);
        s.position = VELMAUDIO_GetPlayCursorPosition(doc);
        if (s.position < 0)
            s.position = VELMAUDIO_GetCursorPosition(doc);
        _audio_format format{};
        VELMAUDIO_GetSignalFormat(&format, doc);
        s.rate = format.sampleRate;
        s.channels = format.numChannels;
        s.bits = format.bitsPerSample;
        s.unit = VELMAUDIO_GetDrawProperty(doc, kUnitProperty);
        if (s.options & VELMDISPLAY_OPTION_REMAINING)
            s.position = VELMAUDIO_NumSamples(doc) - s.position;
        if (!s.editing)
            s.options &= ~VELMDISPLAY_OPTION_BLANK;
    } else {
        s.status = 0;
        s.position = 0;
        s.rate = 8000;
        s.channels = 1;
        s.bits = 16;
        s.unit = kUnitTime;
        s.options |= VELMDISPLAY_OPTION_BLANK;
    }
    s.redraw_mark = display->powered;
    return 1;
}

int VELMDISPLAY_RedrawNeeded(VELMDISPLAY display)
{
    if (!display)
        return 0;
    return !display->ever_drawn || !(display->now == display->drawn);
}

int VELMDISPLAY_Turnon(VELMDISPLAY display)
{
    if (!display)
        return 0;
    display->powered = 1;
    return 1;
}

int VELMDISPLAY_Turnoff(VELMDISPLAY display)
{
    if (!display)
        return 0;
    display->powered = 0;
    return 1;
}

int VELMDISPLAY_SetDrawProperty(VELMDISPLAY display, int property, uint32_t value)
{
    if (display && (property == 0 || property == 1))
        display->property[property] = value;
    return 0;
}

uint32_t VELMDISPLAY_GetDrawProperty(VELMDISPLAY display, int property)
{
    return display && (property == 0 || property == 1) ? display->property[property] : 0;
}

int64_t VELMDISPLAY_GetPosition(VELMDISPLAY display)
{
    return display ? display->now.position : 0;
}

int64_t VELMDISPLAY_GetEditValue(VELMDISPLAY display)
{
    return display ? display->now.edit_value : 0;
}

uint32_t VELMDISPLAY_GetOptions(VELMDISPLAY display)
{
    return display ? display->now.options : 0;
}

int VELMDISPLAY_GetUnit(VELMDISPLAY display)
{
    return display ? display->now.unit : 0;
}

const char *VELMDISPLAY_GetEditText(VELMDISPLAY display)
{
    return display ? display->text.c_str() : nullptr;
}
