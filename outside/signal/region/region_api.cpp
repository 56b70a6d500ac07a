// The AUDIOREGION_ calls.  Queries read the record they are given (a copy
// answers with its own times); edits go to the region the record stands for
// and refresh the given record afterwards.
#include <algorithm>
#include <cstring>

#include "outside/signal/region/region_internal.hpp"

using velmsig::Region;
using velmsig::resolve;

namespace {

// The record a caller handed in, brought up to date after an edit.
int refreshed(AUDIOREGION *record, const Region *live, int result)
{
    if (record != live) *record = *live;
    return result;
}

int set_flag(AUDIOREGION *record, uint32_t flag, bool on)
{
    Region *r = resolve(record);
    if (!r) return 0;
    r->flags = on ? (r->flags | flag) : (r->flags & ~flag);
    return refreshed(record, r, 1);
}

int set_text(AUDIOREGION *record, std::optional<std::string> Region::*field, const char *text)
{
    Region *r = resolve(record);
    if (!r || (text && std::strlen(text) > velmsig::RegionSet::kMaxText)) return 0;
    if (text)
        r->*field = text;
    else
        (r->*field).reset();
    r->flags |= AUDIOREGION_FLAG_CHANGED;
    r->set->changed();
    return refreshed(record, r, 1);
}

const char *get_text(const AUDIOREGION *record, std::optional<std::string> Region::*field)
{
    const Region *r = resolve(record);
    return r && r->*field ? (r->*field)->c_str() : nullptr;
}

int change_edge(AUDIOREGION *record, double time, bool end, int mode)
{
    Region *r = resolve(record);
    if (!r || !r->set->change_edge(r, time, end, mode)) return 0;
    r->set->changed();
    return refreshed(record, r, 1);
}

int mark_deleted(AUDIOREGION *record, bool deleted)
{
    Region *r = resolve(record);
    if (!r) return 0;
    std::vector<Region *> group{r};
    for (size_t i = 0; i < group.size(); ++i)
        for (Region *c : group[i]->children) group.push_back(c);
    for (Region *g : group)
        g->flags = deleted ? (g->flags | AUDIOREGION_FLAG_DELETED)
                           : (g->flags & ~AUDIOREGION_FLAG_DELETED);
    r->set->changed();
    return refreshed(record, r, 1);
}

void collect_descendants(const Region *r, std::vector<Region *> &out)
{
    for (Region *c : r->children) {
        out.push_back(c);
        collect_descendants(c, out);
    }
}

}  // namespace

extern "C" {

double AUDIOREGION_Begin(const AUDIOREGION *region)
{
    return resolve(region) ? region->begin : -1.0;
}

double AUDIOREGION_End(const AUDIOREGION *region)
{
    return resolve(region) ? region->begin + region->length : -1.0;
}

double AUDIOREGION_Length(const AUDIOREGION *region)
{
    return resolve(region) ? region->length : -1.0;
}

int64_t AUDIOREGION_BeginSample(const AUDIOREGION *region)
{
    const Region *r = resolve(region);
    return r && r->set->sample_rate() ? r->set->to_sample(region->begin) : -1;
}

int64_t AUDIOREGION_EndSample(const AUDIOREGION *region)
{
    const Region *r = resolve(region);
    return r && r->set->sample_rate() ? r->set->to_sample(region->begin + region->length) : -1;
}

int64_t AUDIOREGION_NumSamples(const AUDIOREGION *region)
{
    const int64_t begin = AUDIOREGION_BeginSample(region);
    return begin < 0 ? -1 : AUDIOREGION_EndSample(region) - begin;
}

AUDIOSIGNAL *AUDIOREGION_GetParentSignal(const AUDIOREGION *region)
{
    const Region *r = resolve(region);
    return r ? r->set->signal() : nullptr;
}

int AUDIOREGION_GetTrackId(const AUDIOREGION *region)
{
    return resolve(region) ? int(region->flags & AUDIOREGION_TRACK_MASK) : -1;
}

int AUDIOREGION_ChangeBegin(AUDIOREGION *region, double time, int mode)
{
    return change_edge(region, time, false, mode);
}

int AUDIOREGION_ChangeEnd(AUDIOREGION *region, double time, int mode)
{
    return change_edge(region, time, true, mode);
}

int AUDIOREGION_Offset(AUDIOREGION *region, int64_t offset)
{
    Region *r = resolve(region);
    if (!r || (r->flags & AUDIOREGION_FLAG_DELETED) || !r->set->offset({r}, offset)) return 0;
    r->set->changed();
    return refreshed(region, r, 1);
}

int AUDIOREGION_SetTrackId(AUDIOREGION *region, int track)
{
    Region *r = resolve(region);
    if (!r || track < 0 || track >= AUDIOREGION_MAX_TRACKS) return 0;
    r->flags = (r->flags & ~AUDIOREGION_TRACK_MASK) | uint32_t(track) | AUDIOREGION_FLAG_CHANGED;
    r->set->changed();
    return refreshed(region, r, 1);
}

const char *AUDIOREGION_GetLabel(const AUDIOREGION *region)
{
    return get_text(region, &Region::label);
}

const char *AUDIOREGION_GetComment(const AUDIOREGION *region)
{
    return get_text(region, &Region::comment);
}

int AUDIOREGION_SetLabel(AUDIOREGION *region, const char *label)
{
    return set_text(region, &Region::label, label);
}

int AUDIOREGION_SetComment(AUDIOREGION *region, const char *comment)
{
    return set_text(region, &Region::comment, comment);
}

int AUDIOREGION_IsSelected(const AUDIOREGION *region)
{
    return resolve(region) && (region->flags & AUDIOREGION_FLAG_SELECTED) ? 1 : 0;
}

int AUDIOREGION_IsDeleted(const AUDIOREGION *region)
{
    return resolve(region) && (region->flags & AUDIOREGION_FLAG_DELETED) ? 1 : 0;
}

int AUDIOREGION_IsChanged(const AUDIOREGION *region)
{
    return resolve(region) && (region->flags & AUDIOREGION_FLAG_CHANGED) ? 1 : 0;
}

int AUDIOREGION_IsBetween(const AUDIOREGION *region, int64_t begin, int64_t end)
{
    const int64_t b = AUDIOREGION_BeginSample(region);
    return b >= 0 && b <= end && AUDIOREGION_EndSample(region) >= begin ? 1 : 0;
}

int AUDIOREGION_IsFullVisible(const AUDIOREGION *region, int64_t begin, int64_t end)
{
    const int64_t b = AUDIOREGION_BeginSample(region);
    return b >= 0 && b >= begin && AUDIOREGION_EndSample(region) <= end ? 1 : 0;
}

int AUDIOREGION_Select(AUDIOREGION *region)
{
    const Region *r = resolve(region);
    if (!r || (r->flags & AUDIOREGION_FLAG_DELETED)) return 0;
    return set_flag(region, AUDIOREGION_FLAG_SELECTED, true);
}

int AUDIOREGION_Unselect(AUDIOREGION *region)
{
    return set_flag(region, AUDIOREGION_FLAG_SELECTED, false);
}

int AUDIOREGION_SetChanged(AUDIOREGION *region, uint8_t on)
{
    return set_flag(region, AUDIOREGION_FLAG_CHANGED, on != 0);
}

int AUDIOREGION_SetHideText(AUDIOREGION *region, uint8_t on)
{
    return set_flag(region, AUDIOREGION_FLAG_HIDETEXT, on != 0);
}

int AUDIOREGION_SetReadOnly(AUDIOREGION *region, uint8_t on)
{
    return set_flag(region, AUDIOREGION_FLAG_READONLY, on != 0);
}

int AUDIOREGION_CanDelete(const AUDIOREGION *region)
{
    const Region *r = resolve(region);
    return r && !(r->flags & (AUDIOREGION_FLAG_DELETED | AUDIOREGION_FLAG_READONLY)) ? 1 : 0;
}

int AUDIOREGION_DeleteEx(AUDIOREGION *region, int flags)
{
    return mark_deleted(region, true);
}

int AUDIOREGION_UndeleteEx(AUDIOREGION *region, int flags)
{
    return mark_deleted(region, false);
}

AUDIOREGION *AUDIOREGION_GetParent(const AUDIOREGION *region)
{
    const Region *r = resolve(region);
    return r ? r->parent : nullptr;
}

int AUDIOREGION_SetParent(AUDIOREGION *region, AUDIOREGION *parent)
{
    Region *r = resolve(region);
    Region *p = resolve(parent);
    if (!r || (parent && !p) || !r->set->set_parent(r, p)) return 0;
    r->set->changed();
    return refreshed(region, r, 1);
}

AUDIOREGION *AUDIOREGION_TopParent(const AUDIOREGION *region)
{
    Region *r = resolve(region);
    while (r && r->parent) r = r->parent;
    return r;
}

int AUDIOREGION_GetChildShare(const AUDIOREGION *region, double *begin_share,
                              double *length_share)
{
    const Region *r = resolve(region);
    if (!r || !begin_share || !length_share) return 0;
    *begin_share = r->share_begin;
    *length_share = r->share_length;
    return 1;
}

int AUDIOREGION_GetNumDescendents(const AUDIOREGION *region)
{
    const Region *r = resolve(region);
    if (!r) return 0;
    std::vector<Region *> all;
    collect_descendants(r, all);
    return int(all.size());
}

int AUDIOREGION_GetDescendents(const AUDIOREGION *region, AUDIOREGION **array, int max)
{
    const Region *r = resolve(region);
    if (!r || !array || max <= 0) return 0;
    std::vector<Region *> all;
    collect_descendants(r, all);
    const int n = std::min(max, int(all.size()));
    for (int i = 0; i < n; ++i) array[i] = all[size_t(i)];
    return n;
}

}  // extern "C"
