// Backgrounds of the custom tracks, painted with the lanes' backgrounds.
#include <algorithm>

#include "core/document_internal.hpp"
#include "edit/velmcustomtrack.h"
#include "render/view/drawer_internal.hpp"
#include "render/view/velmoverlays.h"

using namespace velm::view;

namespace {

struct Gradient {
    uint32_t from, to;  // top row, bottom row
};

// The tracks form one block under the lanes; the gradients shade its outer
// edges: the top of the first track and the bottom of the last one (both
// for a track that is first and last).  "Top" colours run from an edge
// inwards, "bottom" colours continue from there.
void fill_track(VELMDRAW d, const _VELMRECT &a, int x, int width, uint32_t options)
{
    const VELMDRAWCONFIG &c = d->config;
    VELMCANVAS canvas = d->canvas;
    const uint32_t edges = options & (VELMTRACK_FIRST_VISIBLE | VELMTRACK_LAST_VISIBLE);
    if (!edges) {
        VELMCANVAS_SelectColor(canvas, c.customTrackBgBrush);
        VELMCANVAS_FillRect(canvas, x, a.top, width, a.height, 0);
        return;
    }
    const Gradient edge{c.customTrackBgGradientTopBegin, c.customTrackBgGradientTopEnd};
    const Gradient inner{c.customTrackBgGradientBottomBegin, c.customTrackBgGradientBottomEnd};
    const Gradient edge_below{edge.to, edge.from}, inner_below{inner.to, inner.from};
    const Gradient upper = (edges & VELMTRACK_FIRST_VISIBLE) ? edge : inner_below;
    const Gradient lower = (edges & VELMTRACK_LAST_VISIBLE) ? edge_below : inner;
    const int upper_height = a.height / 2;
    VELMCANVAS_SelectGradient(canvas, upper.from, upper.to);
    VELMCANVAS_FillVertGradientRect(canvas, x, a.top, width, upper_height, 0);
    VELMCANVAS_SelectGradient(canvas, lower.from, lower.to);
    VELMCANVAS_FillVertGradientRect(canvas, x, a.top + upper_height, width, a.height - upper_height, 0);
}

} // namespace

int VELMDRAW_DrawCustomCanvas(VELMDRAW d, int first, int last)
{
    if (!d || !d->canvas || !d->state) return 0;
    // A transparent view keeps the tracks' backgrounds: they are what clears
    // a track before its regions are drawn again.
    if (d->state->viewFlags & 0x800u) return 1;
    for (int t = 0; t < VELM_MAX_CUSTOM_TRACKS; ++t) {
        if (!d->trackShown[static_cast<size_t>(t)]) continue;
        if (!BLNOTIFY_SendEvent(d->document->dispatcher, nullptr, 0, 0x20050, nullptr, nullptr)) continue;
        const _VELMRECT &a = d->trackAreas[static_cast<size_t>(t)];
        const int from = std::max(first, 0), to = std::min(last, a.width - 1);
        if (to < from) continue;
        fill_track(d, a, a.left + from, to - from + 1, d->state->tracks[t].options);
    }
    return 1;
}
