// Region overlays on the output target: the columns of the region being
// dragged over the lanes, and the shadows and frames of the regions on the
// custom tracks.  Both save what they cover first.
#include <algorithm>

#include "control/velmcontrol.h"
#include "core/document_internal.hpp"
#include "edit/velmcustomtrack.h"
#include "render/view/region_internal.hpp"
#include "render/view/velmoverlays.h"

using namespace velm::view;

namespace {

// Regions this narrow get no shadow or frame: it would hide them.
constexpr int kMinShadowedWidth = 13;
// Shadows reach this far above and below the tracks.
constexpr int kShadowReach = 7;

bool same_region(const AUDIOREGION *a, const void *b)
{
    return b && (a == b || (a->identity && a->identity == b));
}

} // namespace

int VELMDRAW_DrawRegionOnFocus(VELMDRAW d, int first, int last)
{
    if (!d || !d->canvas || !d->state || !d->laidOut) return 0;
    const auto *region = static_cast<const AUDIOREGION *>(d->state->focusedRegion.region);
    if (!region || !VELMCONTROL_IsGrabbingRegion(d)) return 1;
    first = std::max(first, 0);
    last = std::min(last, d->columns - 1);
    RegionEntry e;
    if (last < first || !area_from_region(d, region, VELMAUDIO_FindCustomTrackId(d->document, "default"), &e))
        return 1;
    VELMCANVAS c = d->canvas;
    const _VELMRECT &lanes = d->lanesArea;
    // The edge lines stand one pixel outside the region and reach one pixel
    // past the lanes.
    const _VELMRECT clip = make_rect(d->display.left + first, lanes.top - 1, last - first + 1, lanes.height + 2);
    const int32_t left = std::max(e.area.left - 1, clip.left), right = std::min(e.area.right + 1, clip.right);
    if (right < left) return 1;
    VELMCANVAS_SaveOverlay(c, left, clip.top, right - left + 1, clip.height);
    VELMCANVAS_SetDrawArea(c, &clip);
    const VELMTRACKDISPLAY &t = d->state->tracks[AUDIOREGION_GetTrackId(region) & 0x7];
    VELMCANVAS_SelectColor(c, static_cast<uint32_t>(t.backgroundColor) & 0xFFFFFFu);
    VELMCANVAS_SetAlphaFactor(c, 0.15f);
    VELMCANVAS_FillRect(c, e.area.left, lanes.top, e.area.width, lanes.height, 0);
    VELMCANVAS_SelectColor(c, d->config.regionFocusBorderColor);
    VELMCANVAS_SetAlphaFactor(c, 0.5f);
    VELMCANVAS_FillRect(c, e.area.left - 1, clip.top, 1, clip.height, 0);
    VELMCANVAS_FillRect(c, e.area.right + 1, clip.top, 1, clip.height, 0);
    VELMCANVAS_SetAlphaFactor(c, 1.0f);
    VELMCANVAS_ClearDrawArea(c);
    mark_dirty(d, left, clip.top, right, clip.bottom);
    // The fill went over the separators between the lanes.
    return VELMDRAW_DrawChannelSeparators(d);
}

int VELMDRAW_DrawCustomTrackRegionShadows(VELMDRAW d)
{
    if (!d || !d->canvas || !d->state || !d->laidOut) return 0;
    const _VELMRECT band = track_band(d);
    const RegionLayer &layer = d->regionLayer;
    if (band.height <= 0 || band.width <= 0 || layer.count == 0 || !layer.names_regions_of(d->document->signal))
        return 1;
    VELMCANVAS c = d->canvas;
    const _VELMRECT area = make_rect(band.left, band.top - kShadowReach, band.width, band.height + 2 * kShadowReach);
    VELMCANVAS_SaveOverlayRect(c, &area);
    VELMCANVAS_SetDrawArea(c, &area);
    VELMCANVAS_SelectShadowColor(c, 0);
    const void *focused = d->state->focusedRegion.region;
    for (int i = 0; i < layer.count; ++i) {
        const RegionEntry &e = layer.entries[i];
        const _VELMRECT &r = e.area;
        if (!(e.flags & 0x1u) || r.width < kMinShadowedWidth) continue;
        const uint32_t options = d->state->tracks[AUDIOREGION_GetTrackId(e.region) & 0x7].options;
        const bool on_focus = same_region(e.region, focused);
        const bool selected = AUDIOREGION_IsSelected(e.region);
        if (!(options & 0x40u)) {
            if (on_focus) VELMCANVAS_ShadowRect(c, r.left, r.top, r.width, r.height, 7, 0x4C00000Cu);
            if (!selected) VELMCANVAS_BevelRect(c, r.left, r.top, r.width, r.height);
        } else if (on_focus || selected) {
            VELMCANVAS_ShadowRect(c, r.left, r.top, r.width, r.height, 7, 0x4C000000u | region_corner(options, 10));
        } else {
            VELMCANVAS_ShadowRect(c, r.left, r.top, r.width, r.height, 5, 0x33000000u | region_corner(options, 10));
        }
    }
    VELMCANVAS_ClearDrawArea(c);
    mark_dirty(d, area.left, area.top, area.right, area.bottom);
    return 1;
}
