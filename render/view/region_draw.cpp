// Regions in the slow picture: each region on its custom track, the
// "default" track's regions over the lanes, and the redraw of the one region
// whose edges moved.
#include <algorithm>
#include <vector>

#include "core/document_internal.hpp"
#include "core/velmaudio.h"
#include "edit/velmcustomtrack.h"
#include "render/view/region_internal.hpp"
#include "render/view/velmoverlays.h"

using namespace velm::view;

namespace {

// Regions narrower than these are drawn as a plain bar (unselected) or only
// as their shadow (selected).
constexpr int kMinFramedWidth = 5;
constexpr int kMinSelectedWidth = 7;
constexpr int kSelectedInset = 3;

uint32_t text_flags(uint32_t options, bool label)
{
    const uint32_t left = label ? VELMTRACK_ALIGNLABELLEFT : VELMTRACK_ALIGNCOMMENTLEFT;
    const uint32_t right = label ? VELMTRACK_ALIGNLABELRIGHT : VELMTRACK_ALIGNCOMMENTRIGHT;
    const uint32_t align = (options & left) ? VELMCANVASTEXT_LEFT : (options & right) ? VELMCANVASTEXT_RIGHT : VELMCANVASTEXT_CENTER;
    return align | ((options & VELMTRACK_ALLOWPARTIALTEXT) ? VELMCANVASTEXT_ELLIPSIS : 0u);
}

// The box of a region's text, 8 columns in from its true ends.  A region
// reaching far beyond both sides of the display loses the same number of
// columns at each end, so that centred text stays on its true middle;
// whatever still lies beyond is cut where no text can show.
bool text_box(VELMDRAW d, const RegionEntry &e, _VELMRECT *box)
{
    constexpr double kFar = 2.0 * kOffViewColumns;
    double from = 0.0, to = 0.0;
    region_columns(d, e.begin, e.end, &from, &to);
    // Beyond this the text is out of sight whatever its alignment.
    constexpr double kLimit = 1e15;
    int64_t left = d->display.left + static_cast<int64_t>(std::clamp(from, -kLimit, kLimit)) + 8;
    int64_t right = d->display.left + static_cast<int64_t>(std::clamp(to, -kLimit, kLimit)) - 8;
    const auto reach = static_cast<int64_t>(kOffViewColumns);
    const int64_t cut = std::min(std::max<int64_t>(0, d->display.left - reach - left),
                                 std::max<int64_t>(0, right - d->display.right - reach));
    left = std::max<int64_t>(left + cut, d->display.left - static_cast<int64_t>(kFar));
    right = std::min<int64_t>(right - cut, d->display.right + static_cast<int64_t>(kFar));
    if (right < left) return false;
    *box = make_rect(static_cast<int32_t>(left), e.area.top + 2, static_cast<int32_t>(right - left + 1), e.area.height - 4);
    return true;
}

// The label or the comment, as the track's options choose, inside the region.
void draw_region_text(VELMDRAW d, const RegionEntry &e, int track, uint32_t options)
{
    // An editor open over the regions, or one editing this region's text,
    // shows the text itself.
    if (VELMAUDIO_IsExternalRegionEditorVisible(d->document) || (e.region->flags & AUDIOREGION_FLAG_HIDETEXT)) return;
    const uint32_t which = options & (VELMTRACK_SHOWRGNLABEL | VELMTRACK_SHOWRGNCOMMENT);
    const bool label = which == VELMTRACK_SHOWRGNLABEL;
    if (!label && which != VELMTRACK_SHOWRGNCOMMENT) return;
    const char *text = label ? AUDIOREGION_GetLabel(e.region) : AUDIOREGION_GetComment(e.region);
    _VELMRECT box{};
    if (!text || !*text || !text_box(d, e, &box) || box.height <= 0) return;
    VELMCONFIGFONT config;
    const _VELMCANVASFONT font = canvas_font(*VELMDRAW_GetCustomTrackFont(d, track, &config));
    VELMCANVAS_SelectFont(d->canvas, &font);
    VELMCANVAS_SelectFontColor(d->canvas, config.color);
    VELMCANVAS_FillRectangleText(d->canvas, &box, text, static_cast<int>(text_flags(options, label)));
}

bool meets_columns(const _VELMRECT &area, const _VELMRECT &clip)
{
    return area.left <= clip.right && area.right >= clip.left;
}

} // namespace

void velm::view::draw_track_region(VELMDRAW d, const RegionEntry &e)
{
    VELMCANVAS c = d->canvas;
    const int track = AUDIOREGION_GetTrackId(e.region);
    if (track < 0 || track >= VELM_MAX_CUSTOM_TRACKS) return;
    const VELMTRACKDISPLAY &t = d->state->tracks[track];
    const uint32_t color = static_cast<uint32_t>(t.backgroundColor) & 0xFFFFFFu;
    const _VELMRECT &a = e.area;
    if (!AUDIOREGION_IsSelected(e.region)) {
        VELMCANVAS_SelectColor(c, color);
        VELMCANVAS_SetAlphaFactor(c, static_cast<float>(t.backgroundAlpha) / 255.0f);
        if (a.width < kMinFramedWidth) {
            const int width = std::max(1, a.width), height = std::max(1, a.height);
            VELMCANVAS_FillRect(c, a.left, a.top, width, height, 0);
            VELMCANVAS_SelectColor(c, 0);
            VELMCANVAS_SetAlphaFactor(c, 0.2f);
            VELMCANVAS_FillRect(c, a.left, a.top, width, height, 0);
        } else {
            const uint32_t corner = region_corner(t.options, 14);
            VELMCANVAS_FillRect(c, a.left, a.top, a.width, a.height, corner);
            // Darken only the outermost pixel ring: the border.
            const _VELMRECT inside = make_rect(a.left + 1, a.top + 1, a.width - 2, a.height - 2);
            VELMCANVAS_ProtectDrawArea(c, &inside);
            VELMCANVAS_SelectColor(c, d->config.regionBorderColor);
            VELMCANVAS_SetAlphaFactor(c, 0.2f);
            VELMCANVAS_FillRect(c, a.left, a.top, a.width, a.height, corner);
            VELMCANVAS_ClearDrawArea(c);
        }
        VELMCANVAS_SetAlphaFactor(c, 1.0f);
    } else {
        const int x = a.left + kSelectedInset, y = a.top + kSelectedInset;
        const int width = std::max(0, a.width - 2 * kSelectedInset), height = a.height - 2 * kSelectedInset;
        if (a.width >= kMinSelectedWidth) {
            VELMCANVAS_SelectColor(c, color);
            VELMCANVAS_FillRect(c, x, y, width, height, region_corner(t.options, 8));
        }
        VELMCANVAS_SelectShadowColor(c, d->config.selectedRegionBorderColor);
        VELMCANVAS_ShadowRect(c, x, y, width, height, 3, 0xD8000000u | region_corner(t.options, 8));
    }
    draw_region_text(d, e, track, t.options);
}

int VELMDRAW_DrawCustomTrackRegions(VELMDRAW d, int first, int last)
{
    if (!d || !d->canvas || !d->state || !d->laidOut) return 0;
    first = std::max(first, 0);
    last = std::min(last, d->columns - 1);
    if (last < first) return 1;
    const RegionLayer &layer = d->regionLayer;
    for (int track = 0; track < VELM_MAX_CUSTOM_TRACKS; ++track) {
        if (!d->trackShown[static_cast<size_t>(track)]) continue;
        const _VELMRECT &area = d->trackAreas[static_cast<size_t>(track)];
        const _VELMRECT clip = make_rect(area.left + first, area.top, last - first + 1, area.height);
        VELMCANVAS_SetDrawArea(d->canvas, &clip);
        for (int i = 0; i < layer.count; ++i) {
            const RegionEntry &e = layer.entries[i];
            if ((e.flags & 0x1u) && AUDIOREGION_GetTrackId(e.region) == track && meets_columns(e.area, clip))
                draw_track_region(d, e);
        }
        VELMCANVAS_ClearDrawArea(d->canvas);
    }
    return 1;
}

int VELMDRAW_DrawRegionsAndCues(VELMDRAW d, int first, int last)
{
    if (!d || !d->canvas || !d->state || !d->laidOut) return 0;
    if (!(d->state->viewFlags & 0x2000000u)) return 1;
    first = std::max(first, 0);
    last = std::min(last, d->columns - 1);
    if (last < first) return 1;
    const _VELMRECT &lanes = d->lanesArea;
    const _VELMRECT clip = make_rect(d->display.left + first, d->display.top, last - first + 1, d->display.height);
    VELMCANVAS c = d->canvas;
    VELMCANVAS_SetDrawArea(c, &clip);
    const RegionLayer &layer = d->regionLayer;
    for (int i = 0; i < layer.count; ++i) {
        const RegionEntry &e = layer.entries[i];
        if (!(e.flags & 0x2u) || !meets_columns(e.area, clip)) continue;
        VELMCANVAS_SelectColor(c, 0x3F3F3Fu);
        VELMCANVAS_SetAlphaFactor(c, 0.5f);
        VELMCANVAS_FillRect(c, e.area.left, lanes.top, e.area.width, lanes.height, 12);
        VELMCANVAS_SetAlphaFactor(c, 1.0f);
        VELMCANVAS_SelectColor(c, 0x404840u);
        VELMCANVAS_BorderRect(c, e.area.left, lanes.top, e.area.width, lanes.height, 12);
    }
    VELMCANVAS_ClearDrawArea(c);
    return 1;
}

int VELMDRAW_UpdateChangedRegion(VELMDRAW d, const VELMREGIONCOPY *changed)
{
    if (!d || !d->canvas || !d->state || !d->laidOut || !changed) return 0;
    // Besides the focused region, an edge change of any region or the
    // descendants that followed it may have moved.
    const std::vector<RegionEntry> now = visible_entries(d);
    const RegionChange change = changed_regions(d, now);
    if (change.lanes) return -1;
    const _VELMRECT band = track_band(d);
    const int first = std::max(change.left - 1 - d->display.left, 0);
    const int last = std::min(change.right + 1 - d->display.left, d->columns - 1);
    if (!change.any() || band.height <= 0 || last < first) return keep_entries(d, now) ? 1 : 0;

    VELMCANVAS c = d->canvas;
    VELMCANVAS_SelectTarget(c, VELMCANVASTARGET_MEMORY);
    // Only the tracks' backgrounds lie in the band; the grids span the lanes
    // too, so the band is the clip.
    const _VELMRECT clip = make_rect(d->display.left + first, band.top, last - first + 1, band.height);
    VELMCANVAS_SetDrawArea(c, &clip);
    int ok = VELMDRAW_DrawCustomCanvas(d, first, last);
    ok &= draw_scale_grids(d, first, last);
    VELMCANVAS_ClearDrawArea(c);
    ok &= keep_entries(d, now) ? 1 : 0;
    ok &= VELMDRAW_DrawCustomTrackRegions(d, first, last);
    ok &= VELMCANVAS_MoveBlock2(c, VELMCANVASTARGET_MEMORY, clip.left, clip.top, clip.width, clip.height,
                                VELMCANVASTARGET_OUTPUT, clip.left, clip.top);
    VELMCANVAS_SelectTarget(c, VELMCANVASTARGET_OUTPUT);
    mark_dirty(d, clip.left, clip.top, clip.right, clip.bottom);
    return ok;
}
