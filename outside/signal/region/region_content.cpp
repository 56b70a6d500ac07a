// Between a region set and what region files hold: the regions to write,
// and the regions read, with their track names turned into numbers.
#include <functional>
#include <set>
#include <unordered_map>

#include "outside/signal/region/region_internal.hpp"

namespace velmsig {

namespace {

// Flags that region files carry; the rest describe the session.
constexpr uint32_t kKeptFlags = AUDIOREGION_FLAG_SELECTED | AUDIOREGION_FLAG_HIDETEXT |
                                AUDIOREGION_FLAG_READONLY;
constexpr uint32_t kLeftOut = AUDIOREGION_FLAG_DELETED | AUDIOREGION_FLAG_TEMPORARY;

}  // namespace

RegionFileContent RegionSet::export_content(int only_track) const
{
    RegionFileContent content;
    RegionQuery query;
    query.skip_flags = kLeftOut;
    if (only_track >= 0) query.tracks = 1u << only_track;
    const std::vector<Region *> kept = select(query);
    const std::set<const Region *> written(kept.begin(), kept.end());

    // Parents go before their children, each level in time order.
    std::unordered_map<const Region *, std::vector<const Region *>> kids;
    for (const Region *r : kept)
        if (r->parent && written.count(r->parent)) kids[r->parent].push_back(r);
    std::function<void(const Region *, int)> emit = [&](const Region *r, int parent) {
        RegionRecord rec;
        rec.begin = r->begin;
        rec.length = r->length;
        rec.track = int(r->flags & AUDIOREGION_TRACK_MASK);
        rec.flags = r->flags & kKeptFlags;
        rec.label = r->label;
        rec.comment = r->comment;
        rec.parent = parent;
        const int me = int(content.regions.size());
        content.regions.push_back(std::move(rec));
        if (auto it = kids.find(r); it != kids.end())
            for (const Region *c : it->second) emit(c, me);
    };
    for (const Region *r : kept)
        if (!r->parent || !written.count(r->parent)) emit(r, -1);

    std::set<int> used;
    for (const RegionRecord &rec : content.regions) used.insert(rec.track);
    for (int number : used) {
        TrackRecord track;
        track.number = number;
        auto name = track_names_.find(number);
        if (name != track_names_.end()) track.name = name->second;
        content.tracks.push_back(std::move(track));
    }
    return content;
}

int RegionSet::import_content(const RegionFileContent &content, int forced_track,
                              std::vector<std::string> *problems)
{
    // The file's track numbers become the document's through their names.
    std::unordered_map<int, int> numbers;
    for (const TrackRecord &track : content.tracks) {
        if (track.name.empty()) continue;
        const int number = track_number(track.name);
        if (number >= 0) numbers[track.number] = number;
        if (track.label && host_)
            host_->region_request(0x10026, const_cast<char *>(track.name.c_str()),
                                  const_cast<char *>(track.label->c_str()));
    }

    std::vector<Region *> made(content.regions.size(), nullptr);
    int added = 0;
    for (size_t i = 0; i < content.regions.size(); ++i) {
        const RegionRecord &rec = content.regions[i];
        int track = rec.track;
        if (forced_track >= 0)
            track = forced_track;
        else if (auto it = numbers.find(rec.track); it != numbers.end())
            track = it->second;
        Region *r = add(rec.begin, rec.begin + rec.length, track, rec.flags & kKeptFlags,
                        rec.label ? rec.label->c_str() : nullptr,
                        rec.comment ? rec.comment->c_str() : nullptr);
        if (!r) {
            problems->push_back("region " + std::to_string(i + 1) + " cannot be added");
            continue;
        }
        // The length as written, not as recomputed from the end.
        if (r->begin == rec.begin && rec.length >= 0.0 && r->begin + rec.length <= duration())
            r->length = rec.length;
        made[i] = r;
        ++added;
        if (rec.parent >= 0 && size_t(rec.parent) < i && made[size_t(rec.parent)] &&
            !set_parent(r, made[size_t(rec.parent)]))
            problems->push_back("region " + std::to_string(i + 1) +
                                " nested too deep, kept at the top");
    }
    return added;
}

}  // namespace velmsig
