// Backgrounds of the custom tracks, painted with the lanes' backgrounds.
#include <algorithm>

#include "core/document_internal.hpp"
#include "render/view/drawer_internal.hpp"
#include "render/view/velmoverlays.h"

int VELMDRAW_DrawCustomCanvas(VELMDRAW d, int first, int last)
{
    if (!d || !d->canvas || !d->state) return 0;
    if (d->state->viewFlags & 0x1000000u) return 1;
    for (int t = 0; t < VELM_MAX_CUSTOM_TRACKS; ++t) {
        if (!d->trackShown[static_cast<size_t>(t)]) continue;
        if (!BLNOTIFY_SendEvent(d->document->dispatcher, nullptr, 0, 0x20050, nullptr, nullptr)) continue;
        const _VELMRECT &a = d->trackAreas[static_cast<size_t>(t)];
        const int from = std::max(first, 0), to = std::min(last, a.width - 1);
        if (to < from) continue;
        VELMCANVAS_SelectColor(d->canvas, d->config.customTrackBgBrush);
        VELMCANVAS_FillRect(d->canvas, a.left + from, a.top, to - from + 1, a.height, 0);
    }
    return 1;
}
