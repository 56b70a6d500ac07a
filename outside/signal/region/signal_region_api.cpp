// The AUDIOSIGNAL_ region calls: queries and edits over a signal's region
// set, and its region files.
#include <algorithm>

#include "outside/base/blbase.h"
#include "outside/signal/file/lasterror_internal.hpp"
#include "outside/signal/region/region_files.hpp"

using velmsig::Region;
using velmsig::RegionQuery;
using velmsig::RegionSet;

namespace {

RegionSet *regions_of(AUDIOSIGNAL *signal)
{
    RegionSet *set = signal ? velmsig::signal_regions(signal) : nullptr;
    if (!set) velmsig::set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
    return set;
}

bool valid_track(int track) { return track >= -1 && track < AUDIOREGION_MAX_TRACKS; }

RegionQuery make_query(int64_t begin, int64_t end, uint32_t tracks, uint32_t skip_flags,
                       AUDIOREGION_Filter filter)
{
    RegionQuery q;
    q.begin = begin;
    q.end = end;
    q.tracks = tracks;
    q.skip_flags = skip_flags;
    q.filter = filter;
    return q;
}

RegionQuery selected_of(int track)
{
    return make_query(0, 0, track >= 0 ? AUDIOREGION_TRACK_BIT(track) : 0,
                      AUDIOREGION_FLAG_DELETED, AUDIOREGION_IsSelected);
}

int count(AUDIOSIGNAL *signal, const RegionQuery &q)
{
    const RegionSet *set = regions_of(signal);
    return set ? int(set->count(q)) : 0;
}

int fill(AUDIOSIGNAL *signal, const RegionQuery &q, AUDIOREGION **array, int max)
{
    const RegionSet *set = regions_of(signal);
    if (!set || !array || max <= 0) return 0;
    const std::vector<Region *> found = set->select(q);
    const int n = std::min(max, int(found.size()));
    std::copy_n(found.begin(), n, array);
    return n;
}

// The live region of this signal that a record stands for.
Region *own_region(RegionSet *set, const AUDIOREGION *record)
{
    Region *r = velmsig::resolve(record);
    return r && r->set == set ? r : nullptr;
}

AUDIOREGION *neighbour(AUDIOSIGNAL *signal, const AUDIOREGION *region, bool next)
{
    RegionSet *set = regions_of(signal);
    const Region *r = set ? own_region(set, region) : nullptr;
    return r ? set->nearest(r, int(r->flags & AUDIOREGION_TRACK_MASK), next) : nullptr;
}

bool matches(const Region *r, const RegionSet &set, int64_t begin, int64_t end, int match)
{
    if (end < 0) return true;
    const int64_t b = set.to_sample(r->begin), e = set.to_sample(r->begin + r->length);
    switch (match) {
    case AUDIOREGION_MATCH_EXACT: return b == begin && e == end;
    case AUDIOREGION_MATCH_OVERLAP: return b <= end && e >= begin;
    case AUDIOREGION_MATCH_INSIDE: return b >= begin && e <= end;
    case AUDIOREGION_MATCH_CONTAINS: return b <= begin && e >= end;
    default: return false;
    }
}

bool same_text(const std::optional<std::string> &text, const char *wanted)
{
    return !wanted || (text && *text == wanted);
}

int unselect(AUDIOSIGNAL *signal, int track)
{
    RegionSet *set = regions_of(signal);
    if (!set || !valid_track(track)) return 0;
    for (Region *r : set->select(selected_of(track))) r->flags &= ~AUDIOREGION_FLAG_SELECTED;
    return 1;
}

}  // namespace

extern "C" {

AUDIOREGION *AUDIOSIGNAL_AddRegionToTrackEx(AUDIOSIGNAL *signal, int flags, double begin,
                                            double end, const char *label, const char *comment,
                                            int track)
{
    RegionSet *set = regions_of(signal);
    if (!set) return nullptr;
    const uint32_t kept = uint32_t(flags) & (AUDIOREGION_FLAG_TEMPORARY |
                                             AUDIOREGION_FLAG_HIDETEXT | AUDIOREGION_FLAG_READONLY);
    Region *r = set->add(begin, end, track, kept | AUDIOREGION_FLAG_CHANGED, label, comment);
    if (!r) {
        velmsig::set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return nullptr;
    }
    set->changed(flags & AUDIOREGION_ADD_QUIET);
    return r;
}

int AUDIOSIGNAL_CountRegions(AUDIOSIGNAL *signal, int64_t begin, int64_t end, uint32_t tracks,
                             uint32_t skip_flags, AUDIOREGION_Filter filter)
{
    return count(signal, make_query(begin, end, tracks, skip_flags, filter));
}

int AUDIOSIGNAL_GetRegions(AUDIOSIGNAL *signal, AUDIOREGION **array, int max, int64_t begin,
                           int64_t end, uint32_t tracks, uint32_t skip_flags,
                           AUDIOREGION_Filter filter)
{
    return fill(signal, make_query(begin, end, tracks, skip_flags, filter), array, max);
}

int AUDIOSIGNAL_CountVisibleRegions(AUDIOSIGNAL *signal, int64_t begin, int64_t end)
{
    return count(signal, make_query(begin, end, 0, AUDIOREGION_FLAG_DELETED, nullptr));
}

int AUDIOSIGNAL_GetVisibleRegions(AUDIOSIGNAL *signal, AUDIOREGION **array, int max,
                                  int64_t begin, int64_t end)
{
    return fill(signal, make_query(begin, end, 0, AUDIOREGION_FLAG_DELETED, nullptr), array, max);
}

int AUDIOSIGNAL_CountVisibleRegionsOfTrack(AUDIOSIGNAL *signal, int64_t begin, int64_t end,
                                           uint32_t tracks, uint32_t skip_flags,
                                           AUDIOREGION_Filter filter)
{
    return count(signal,
                 make_query(begin, end, tracks, skip_flags | AUDIOREGION_FLAG_DELETED, filter));
}

int AUDIOSIGNAL_GetVisibleRegionsOfTrack(AUDIOSIGNAL *signal, AUDIOREGION **array, int max,
                                         int64_t begin, int64_t end, uint32_t tracks,
                                         uint32_t skip_flags, AUDIOREGION_Filter filter)
{
    return fill(signal,
                make_query(begin, end, tracks, skip_flags | AUDIOREGION_FLAG_DELETED, filter),
                array, max);
}

int AUDIOSIGNAL_CountSelectedRegionsOfTrack(AUDIOSIGNAL *signal, int track)
{
    return valid_track(track) ? count(signal, selected_of(track)) : 0;
}

int AUDIOSIGNAL_GetSelectedRegions(AUDIOSIGNAL *signal, int track, AUDIOREGION **array, int max)
{
    return valid_track(track) ? fill(signal, selected_of(track), array, max) : 0;
}

AUDIOREGION *AUDIOSIGNAL_FindFirstRegion(AUDIOSIGNAL *signal, int track)
{
    const RegionSet *set = regions_of(signal);
    return set && valid_track(track) ? set->nearest(nullptr, track, true) : nullptr;
}

AUDIOREGION *AUDIOSIGNAL_FindLastRegion(AUDIOSIGNAL *signal, int track)
{
    const RegionSet *set = regions_of(signal);
    return set && valid_track(track) ? set->nearest(nullptr, track, false) : nullptr;
}

AUDIOREGION *AUDIOSIGNAL_FindNextRegion(AUDIOSIGNAL *signal, const AUDIOREGION *region)
{
    return neighbour(signal, region, true);
}

AUDIOREGION *AUDIOSIGNAL_FindPrevRegion(AUDIOSIGNAL *signal, const AUDIOREGION *region)
{
    return neighbour(signal, region, false);
}

AUDIOREGION *AUDIOSIGNAL_FindRegion(AUDIOSIGNAL *signal, int64_t begin, int64_t end,
                                    const char *label, const char *comment, int track, int match)
{
    const RegionSet *set = regions_of(signal);
    if (!set || !valid_track(track)) return nullptr;
    for (Region *r : set->track_regions(track))
        if (matches(r, *set, begin, end, match) && same_text(r->label, label) &&
            same_text(r->comment, comment))
            return r;
    return nullptr;
}

int AUDIOSIGNAL_OffsetRegions(AUDIOSIGNAL *signal, int64_t offset, int track,
                              AUDIOREGION_Filter filter)
{
    RegionSet *set = regions_of(signal);
    if (!set || !valid_track(track)) return 0;
    std::vector<Region *> moving = set->track_regions(track);
    if (filter)
        moving.erase(std::remove_if(moving.begin(), moving.end(),
                                    [filter](const Region *r) { return !filter(r); }),
                     moving.end());
    if (!set->offset(moving, offset)) return 0;
    set->changed();
    return 1;
}

int AUDIOSIGNAL_UnselectAllRegions(AUDIOSIGNAL *signal) { return unselect(signal, -1); }

int AUDIOSIGNAL_UnselectAllRegionsOfTrack(AUDIOSIGNAL *signal, int track)
{
    return unselect(signal, track);
}

int AUDIOSIGNAL_DeleteAllRegions(AUDIOSIGNAL *signal)
{
    RegionSet *set = regions_of(signal);
    if (!set) return 0;
    set->delete_all();
    set->changed();
    return 1;
}

int AUDIOSIGNAL_AdjustRegionChildShares(AUDIOSIGNAL *signal)
{
    RegionSet *set = regions_of(signal);
    if (!set) return 0;
    set->adjust_child_shares();
    return 1;
}

int AUDIOSIGNAL_ReadRegions(AUDIOSIGNAL *signal, const char *file, const char *format)
{
    RegionSet *set = regions_of(signal);
    if (!set) return 0;
    std::vector<std::string> problems;
    const int error = velmsig::read_region_file(*set, file, format, &problems);
    for (const std::string &problem : problems)
        BLDEBUG_Warning(AUDIO_ERROR_CORRUPT_DATA, "AUDIOSIGNAL_ReadRegions: %s: %s", file,
                        problem.c_str());
    if (error) {
        velmsig::set_last_error(error);
        return 0;
    }
    return 1;
}

int AUDIOSIGNAL_WriteRegions(AUDIOSIGNAL *signal, const char *file, const char *format)
{
    RegionSet *set = regions_of(signal);
    if (!set) return 0;
    const int error = velmsig::write_region_file(*set, file, format);
    if (error) {
        velmsig::set_last_error(error);
        return 0;
    }
    return 1;
}

}  // extern "C"
