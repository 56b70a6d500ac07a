// The list of regions in view: where each one lies on its track, rebuilt
// with every redraw of the slow picture and read by the hit test.
#include <algorithm>
#include <cmath>
#include <memory>
#include <unordered_map>
#include <vector>

#include "core/document_internal.hpp"
#include "edit/velmcustomtrack.h"
#include "render/view/region_internal.hpp"
#include "render/view/velmoverlays.h"

using namespace velm::view;

namespace {

// Nesting deeper than this is drawn as if it were this deep.
constexpr int kMaxDepth = 16;

int nesting_depth(const AUDIOREGION *region)
{
    int depth = 0;
    for (const AUDIOREGION *p = AUDIOREGION_GetParent(region); p && depth < kMaxDepth; p = AUDIOREGION_GetParent(p))
        ++depth;
    return depth;
}

bool reserve_entries(VELMDRAW d, int count)
{
    RegionLayer &layer = d->regionLayer;
    if (count <= layer.capacity) return true;
    const int capacity = std::max(count, 2 * layer.capacity);
    auto *entries = static_cast<RegionEntry *>(BLMEM_New(d->pool, static_cast<size_t>(capacity) * sizeof(RegionEntry)));
    if (!entries) return false;
    std::uninitialized_value_construct_n(entries, capacity);
    if (layer.entries) BLMEM_Delete(d->pool, layer.entries);
    layer.entries = entries;
    layer.capacity = capacity;
    return true;
}

} // namespace

namespace velm::view {

void region_columns(VELMDRAW d, double begin, double end, double *from, double *to)
{
    // Column c shows the samples from positions[c] up to positions[c + 1];
    // the end sample is the first one after the region.
    *from = std::floor(VELMDRAW_ConvertRealXtoDisplayX(d, begin));
    *to = std::max(*from, std::ceil(VELMDRAW_ConvertRealXtoDisplayX(d, end)) - 1.0);
}

bool area_from_region(VELMDRAW d, const AUDIOREGION *region, int default_track, RegionEntry *entry)
{
    const int track = AUDIOREGION_GetTrackId(region);
    if (track < 0 || d->columns <= 0 || d->mainBase.step <= 0.0) return false;
    const bool shown = track < VELM_MAX_CUSTOM_TRACKS && d->trackShown[static_cast<size_t>(track)];
    const bool on_default = track == default_track;
    if (!shown && !on_default) return false;
    const double begin = static_cast<double>(AUDIOREGION_BeginSample(region));
    const double end = static_cast<double>(AUDIOREGION_EndSample(region));
    double from = 0.0, to = 0.0;
    region_columns(d, begin, end, &from, &to);
    const double columns = d->columns;
    if (to < 0.0 || from > columns - 1.0) return false;
    const int x0 = static_cast<int>(std::max(from, -kOffViewColumns));
    const int x1 = static_cast<int>(std::min(to, columns - 1.0 + kOffViewColumns));
    const _VELMRECT &rows = shown ? d->trackAreas[static_cast<size_t>(track)] : d->lanesArea;
    entry->area = make_rect(d->display.left + x0, rows.top, x1 - x0 + 1, rows.height);
    entry->begin = begin;
    entry->end = end;
    entry->flags = (shown ? 0x1u : 0u) | (on_default ? 0x2u : 0u);
    entry->region = const_cast<AUDIOREGION *>(region);
    return true;
}

const RegionEntry *find_entry(const _VELMDRAW *d, const AUDIOREGION *region)
{
    const RegionLayer &layer = d->regionLayer;
    if (!region || !layer.names_regions_of(d->document->signal)) return nullptr;
    for (int i = 0; i < layer.count; ++i) {
        const RegionEntry &e = layer.entries[i];
        if (e.region == region || (region->identity && e.region == region->identity)) return &e;
    }
    return nullptr;
}

_VELMRECT track_band(const _VELMDRAW *d)
{
    int32_t top = INT32_MAX, bottom = INT32_MIN;
    for (int t = 0; t < VELM_MAX_CUSTOM_TRACKS; ++t) {
        if (!d->trackShown[static_cast<size_t>(t)]) continue;
        const _VELMRECT &a = d->trackAreas[static_cast<size_t>(t)];
        top = std::min(top, a.top);
        bottom = std::max(bottom, a.bottom);
    }
    if (bottom < top) return _VELMRECT{};
    return make_rect(d->display.left, top, d->display.width, bottom - top + 1);
}

std::vector<RegionEntry> visible_entries(VELMDRAW d)
{
    std::vector<RegionEntry> entries;
    AUDIOSIGNAL *signal = d->document->signal;
    const int64_t begin = d->state->viewBegin, end = d->state->viewEnd;
    const int count = AUDIOSIGNAL_CountVisibleRegions(signal, begin, end);
    if (count <= 0) return entries;
    std::vector<AUDIOREGION *> found(static_cast<size_t>(count));
    const int n = std::clamp(AUDIOSIGNAL_GetVisibleRegions(signal, found.data(), count, begin, end), 0, count);
    const int default_track = VELMAUDIO_FindCustomTrackId(d->document, "default");
    entries.reserve(static_cast<size_t>(n));
    for (int i = 0; i < n; ++i) {
        RegionEntry entry;
        if (area_from_region(d, found[static_cast<size_t>(i)], default_track, &entry)) entries.push_back(entry);
    }
    // Time order puts a child that starts with its parent first; parents go
    // first so that they never cover their children.
    std::stable_sort(entries.begin(), entries.end(), [](const RegionEntry &a, const RegionEntry &b) {
        return nesting_depth(a.region) < nesting_depth(b.region);
    });
    return entries;
}

bool keep_entries(VELMDRAW d, const std::vector<RegionEntry> &entries)
{
    RegionLayer &layer = d->regionLayer;
    layer.count = 0;
    if (!reserve_entries(d, static_cast<int>(entries.size()))) return false;
    std::copy(entries.begin(), entries.end(), layer.entries);
    layer.count = static_cast<int32_t>(entries.size());
    layer.signal = d->document->signal;
    return true;
}

RegionChange changed_regions(const _VELMDRAW *d, const std::vector<RegionEntry> &now)
{
    RegionChange change;
    const bool over_lanes = d->state->viewFlags & 0x2000000u;
    auto add = [&](const RegionEntry &e) {
        change.left = std::min(change.left, e.area.left);
        change.right = std::max(change.right, e.area.right);
        if (e.flags & 0x1u) change.tracks = true;
        if ((e.flags & 0x2u) && over_lanes) change.lanes = true;
    };
    std::unordered_map<const AUDIOREGION *, const RegionEntry *> before;
    const RegionLayer &layer = d->regionLayer;
    for (int i = 0; i < layer.count; ++i) before.emplace(layer.entries[i].region, &layer.entries[i]);
    for (const RegionEntry &e : now) {
        const auto it = before.find(e.region);
        if (it != before.end()) {
            const RegionEntry &old = *it->second;
            const bool same = old.flags == e.flags && old.area.left == e.area.left && old.area.width == e.area.width &&
                              old.area.top == e.area.top && old.area.height == e.area.height;
            if (!same) add(old);
            before.erase(it);
            if (same) continue;
        }
        add(e);
    }
    for (const auto &gone : before) add(*gone.second);
    return change;
}

} // namespace velm::view

int VELMDRAW_UpdateVisibleRegion(VELMDRAW d)
{
    if (!d || !d->state || !d->laidOut) return 0;
    return keep_entries(d, visible_entries(d)) ? 1 : 0;
}

int VELMDRAW_GetVisibleRegionRect(VELMDRAW d, const AUDIOREGION *region, _VELMRECT *out)
{
    if (!d || !d->state || !region || !out) return 0;
    const RegionEntry *e = find_entry(d, region);
    // A region of a hidden "default" track shows only over the lanes.
    if (!e || (!(e->flags & 0x1u) && !(d->state->viewFlags & 0x2000000u))) return 0;
    const int32_t left = std::max(e->area.left, d->display.left);
    const int32_t right = std::min(e->area.right, d->display.right);
    *out = make_rect(left, e->area.top, right - left + 1, e->area.height);
    return 1;
}

int VELMAUDIO_GetRegionDrawRect(VELMAUDIO doc, const AUDIOREGION *region, _VELMRECT *out)
{
    if (!doc || !doc->signal || !doc->renderer) return 0;
    return VELMDRAW_GetVisibleRegionRect(doc->renderer, region, out);
}
