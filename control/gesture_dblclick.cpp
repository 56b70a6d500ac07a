// The double-click handler.
#include <algorithm>

#include "control/gesture_internal.hpp"
#include "core/velmnavigation.h"
#include "edit/velmregion.h"
#include "edit/velmselection.h"
#include "sound/velmplay.h"

namespace velm::control {

namespace {

// A double click on a channel button plays that channel alone, or mutes it
// and plays its neighbour.
void solo(VELMDRAW d, int channel)
{
    VELMPLAYER player = VELMAUDIO_Player(d->document);
    const bool on = VELMPLAY_GetChannelGain(player, channel) > 0.0;
    VELMPLAY_SetChannelGain(player, channel, on ? 1.0 : 0.0);
    VELMPLAY_SetChannelGain(player, channel ^ 1, on ? 0.0 : 1.0);
}

// Centres the view on the sample under the pointer, keeping its width.
int centre_view(VELMDRAW d)
{
    VELMAUDIO doc = d->document;
    const int64_t width = VELMAUDIO_ViewEnd(doc) - VELMAUDIO_ViewBegin(doc);
    int64_t centre = navigator_sample(d, d->control.pointerX);
    int64_t begin = centre - width / 2;
    if (begin < 0) {
        centre -= begin;
        begin = 0;
    }
    int64_t end = centre + width / 2;
    const int64_t limit = VELMAUDIO_ViewEndLimit(doc);
    if (end > limit) {
        begin -= end - limit;
        end = limit;
    }
    return VELMAUDIO_Zoom(doc, begin, end);
}

int scale_click(VELMDRAW d, uint32_t code)
{
    VELMAUDIO doc = d->document;
    const bool box = (code & 0x4400u) == 0x4400u;
    if ((code & 0x4200u) == 0x4200u) {
        const int kind = VELMDRAW_ChannelKind(d, lane_of(d, code));
        if (kind == 1) return box ? VELMAUDIO_SelectNextVertScaleKind(doc) : VELMAUDIO_ZoomVerticalReset(doc);
        if (kind == 2) return box ? VELMAUDIO_SelectNextSpecScaleKind(doc) : VELMAUDIO_ZoomSpectralReset(doc);
        return 1;
    }
    return box ? VELMAUDIO_SelectNextHorzScaleKind(doc) : VELMAUDIO_ZoomReset(doc);
}

int double_click(VELMDRAW d, int x, int y, uint32_t flags)
{
    point_at(d, x, y);
    Interaction &c = d->control;
    const uint32_t code = c.mouseOver;
    VELMAUDIO doc = d->document;
    if (code & 0x10000u) {
        send(d, 0x2003A, VELMAUDIO_GetRegionOnFocus(doc), nullptr);
        return 1;
    }
    if (code & 0x2000000u) {
        solo(d, static_cast<int>(code & 0xFFu));
        return 1;
    }
    if (code & 0x1000u) return (flags & 0x02u) ? VELMAUDIO_SelectAll(doc) : VELMAUDIO_SelectVisible(doc);
    if ((code & 0x4200u) == 0x4200u || (code & 0x4100u) == 0x4100u) return scale_click(d, code);
    if (code & 0x400000u) return centre_view(d);
    if (code & 0x800000u) {
        VELMAUDIO_ZoomFullReset(doc);
        c.mouseOver = 0;
    }
    return 1;
}

} // namespace

} // namespace velm::control

int VELMCONTROL_MouseDblClick(VELMDRAW drawer, int x, int y, uint32_t flags)
{
    velm::control::Busy busy(drawer);
    return busy.ok() ? velm::control::double_click(drawer, x, y, flags) : 0;
}
