// The scale areas beside the custom tracks: painted like the lanes' scale
// areas, with the track's label in them.
#include "core/document_internal.hpp"
#include "edit/velmcustomtrack.h"
#include "render/view/drawer_internal.hpp"
#include "render/view/velmoverlays.h"

using namespace velm::view;

int VELMDRAW_DrawVertCustomTracks(VELMDRAW d)
{
    if (!d || !d->canvas || !d->state || !d->laidOut) return 0;
    const uint32_t flags = d->state->viewFlags;
    if (flags & 0x8u) return 1;
    VELMCANVAS c = d->canvas;
    const _VELMCANVASFONT font = canvas_font(d->config.scaleFont);
    for (int track = 0; track < VELM_MAX_CUSTOM_TRACKS; ++track) {
        const _VELMRECT &r = d->trackScales[static_cast<size_t>(track)];
        if (!d->trackShown[static_cast<size_t>(track)] || r.width <= 0 || r.height <= 0) continue;
        if (!(flags & 0x1000000u)) {
            VELMCANVAS_SelectColor(c, d->config.scaleBgBrush);
            VELMCANVAS_FillRect(c, r.left, r.top, r.width, r.height, 0);
        }
        const char *id = VELMAUDIO_GetCustomTrackUniqId(d->document, track);
        const char *label = id ? VELMAUDIO_CustomTrackLabel(d->document, id) : nullptr;
        const _VELMRECT box = make_rect(r.left + 6, r.top + 1, r.width - 8, r.height - 2);
        if (label && *label && box.width > 0 && box.height > 0) {
            VELMCANVAS_SelectFont(c, &font);
            VELMCANVAS_SelectFontColor(c, d->config.scaleFont.color);
            VELMCANVAS_FillRectangleText(c, &box, label, VELMCANVASTEXT_LEFT | VELMCANVASTEXT_ELLIPSIS);
        }
        VELMCANVAS_ShadowRect(c, r.left, r.top, 1, r.height, 15, 0x3FBFF000u);
        mark_dirty(d, r.left, r.top, r.right, r.bottom);
    }
    return 1;
}
