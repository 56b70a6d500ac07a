// The font of a custom track's texts: the configured region (or phonetic)
// text font at the track's own size and colours.
#include "core/document_internal.hpp"
#include "render/view/drawer_internal.hpp"
#include "render/view/velmoverlays.h"

const VELMCONFIGFONT *VELMDRAW_GetCustomTrackFont(VELMDRAW d, int track, VELMCONFIGFONT *out)
{
    if (!d || !d->state || !out || track < 0 || track >= VELM_MAX_CUSTOM_TRACKS) return nullptr;
    const VELMTRACKDISPLAY &t = d->state->tracks[track];
    *out = (t.options & 0x10000u) ? d->config.phoneticTextFont : d->config.regionTextFont;
    // A track that never had its size set keeps the configured one.
    if (t.fontSize > 0.0f) out->size = t.fontSize;
    out->color = static_cast<uint32_t>(t.fontColor);
    out->inactiveColor = static_cast<uint32_t>(t.inactiveFontColor);
    return out;
}

const VELMCONFIGFONT *VELMAUDIO_GetCustomTrackFont(VELMAUDIO doc, int track, VELMCONFIGFONT *out)
{
    if (!doc || !doc->signal) return nullptr;
    return VELMDRAW_GetCustomTrackFont(doc->renderer, track, out);
}
