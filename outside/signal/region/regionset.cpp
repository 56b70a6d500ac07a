// The region set of a signal: creation, time order, the edit hooks that move
// regions with the audio, nesting and the shares of children.
#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>
#include <unordered_map>
#include <unordered_set>

#include "outside/signal/region/region_internal.hpp"

namespace velmsig {

namespace {

constexpr uint32_t kTrackBits = AUDIOREGION_TRACK_MASK;

double end_of(const Region *r) { return r->begin + r->length; }

void update_share(Region *r)
{
    const Region *p = r->parent;
    if (!p || p->length <= 0.0) {
        r->share_begin = 0.0;
        r->share_length = p ? 0.0 : 1.0;
        return;
    }
    r->share_begin = (r->begin - p->begin) / p->length;
    r->share_length = r->length / p->length;
}

void update_shares_below(Region *r)
{
    for (Region *c : r->children) {
        update_share(c);
        update_shares_below(c);
    }
}

bool is_descendant(const Region *r, const Region *of)
{
    for (const Region *p = r->parent; p; p = p->parent)
        if (p == of) return true;
    return false;
}

int depth_of(const Region *r)
{
    int depth = 0;
    for (const Region *p = r->parent; p; p = p->parent) ++depth;
    return depth;
}

int height_of(const Region *r)
{
    int height = 0;
    for (const Region *c : r->children) height = std::max(height, 1 + height_of(c));
    return height;
}

}  // namespace

bool region_before(const Region *a, const Region *b)
{
    if (a->begin != b->begin) return a->begin < b->begin;
    if (a->length != b->length) return a->length < b->length;
    return a->serial < b->serial;
}

Region *resolve(const AUDIOREGION *record)
{
    if (!record || !record->identity) return nullptr;
    auto *live = static_cast<Region *>(record->identity);
    return live->identity == live ? live : nullptr;
}

RegionSet::RegionSet(RegionHost *host) : host_(host) {}
RegionSet::~RegionSet() = default;

AUDIOSIGNAL *RegionSet::signal() const { return host_ ? host_->region_signal() : nullptr; }

int RegionSet::sample_rate() const
{
    const int rate = host_ ? host_->region_sample_rate() : 0;
    return rate > 0 ? rate : 0;
}

double RegionSet::duration() const
{
    const int rate = sample_rate();
    const int64_t frames = host_ ? host_->region_frames() : 0;
    return rate > 0 && frames > 0 ? double(frames) / rate : 0.0;
}

int64_t RegionSet::to_sample(double seconds) const
{
    return int64_t(std::llround(seconds * sample_rate()));
}

double RegionSet::to_seconds(int64_t sample) const
{
    const int rate = sample_rate();
    return rate > 0 ? double(sample) / rate : 0.0;
}

Region *RegionSet::add(double begin, double end, int track, uint32_t flags, const char *label,
                       const char *comment)
{
    if (!std::isfinite(begin) || !std::isfinite(end) || track < 0 ||
        track >= AUDIOREGION_MAX_TRACKS || regions_.size() >= kMaxRegions ||
        (label && std::strlen(label) > kMaxText) || (comment && std::strlen(comment) > kMaxText))
        return nullptr;
    if (end < begin) std::swap(begin, end);
    const double limit = duration();
    begin = std::clamp(begin, 0.0, limit);
    end = std::clamp(end, begin, limit);

    auto region = std::make_unique<Region>();
    Region *r = region.get();
    r->flags = (flags & ~kTrackBits) | uint32_t(track);
    r->spare = 0;
    r->begin = begin;
    r->length = end - begin;
    r->identity = r;
    r->set = this;
    if (label) r->label = label;
    if (comment) r->comment = comment;
    r->serial = next_serial_++;
    regions_.push_back(std::move(region));
    return r;
}

bool RegionSet::matches(const Region *r, const RegionQuery &q) const
{
    if (r->flags & q.skip_flags) return false;
    if (q.tracks && !(q.tracks & (1u << (r->flags & kTrackBits)))) return false;
    if (q.end > q.begin &&
        (to_sample(end_of(r)) < q.begin || to_sample(r->begin) > q.end))
        return false;
    return !q.filter || q.filter(r);
}

std::vector<Region *> RegionSet::select(const RegionQuery &q) const
{
    std::vector<Region *> out;
    for (const auto &owned : regions_)
        if (matches(owned.get(), q)) out.push_back(owned.get());
    std::sort(out.begin(), out.end(), region_before);
    return out;
}

size_t RegionSet::count(const RegionQuery &q) const
{
    return size_t(std::count_if(regions_.begin(), regions_.end(),
                                [&](const auto &owned) { return matches(owned.get(), q); }));
}

Region *RegionSet::nearest(const Region *from, int track, bool after) const
{
    // One pass, no sorting: walking a long track step by step stays linear per step.
    Region *best = nullptr;
    for (const auto &owned : regions_) {
        Region *r = owned.get();
        if ((r->flags & AUDIOREGION_FLAG_DELETED) ||
            (track >= 0 && int(r->flags & kTrackBits) != track) || r == from)
            continue;
        if (from && (after ? !region_before(from, r) : !region_before(r, from))) continue;
        if (!best || (after ? region_before(r, best) : region_before(best, r))) best = r;
    }
    return best;
}

std::vector<Region *> RegionSet::track_regions(int track) const
{
    RegionQuery q;
    q.skip_flags = AUDIOREGION_FLAG_DELETED;
    if (track >= 0) q.tracks = 1u << track;
    return select(q);
}

void RegionSet::on_insert(int64_t at, int64_t frames)
{
    if (frames <= 0 || at < 0 || sample_rate() == 0) return;
    // Recording appends from its own thread: regions it does not move are
    // not written at all.
    const double shift = to_seconds(frames);
    bool moved = false;
    for (const auto &owned : regions_) {
        Region *r = owned.get();
        const int64_t b = to_sample(r->begin), e = to_sample(end_of(r));
        if (at <= b)
            r->begin += shift;
        else if (at < e)
            r->length += shift;
        else
            continue;
        moved = true;
    }
    if (moved) adjust_child_shares();
}

void RegionSet::on_remove(int64_t at, int64_t frames)
{
    if (frames <= 0 || at < 0 || sample_rate() == 0) return;
    const int64_t stop = at + frames;
    bool moved = false;
    for (const auto &owned : regions_) {
        Region *r = owned.get();
        const int64_t b = to_sample(r->begin), e = to_sample(end_of(r));
        if (e <= at) continue;                       // wholly before the cut
        moved = true;
        if (b >= stop) {                             // wholly after it
            r->begin -= to_seconds(frames);
            continue;
        }
        const int64_t nb = std::min(b, at);
        const int64_t ne = e >= stop ? e - frames : at;
        // The cut took all of the region's audio (or the point it marked).
        const bool gone = ne == nb && (e > b || b > at);
        r->begin = to_seconds(nb);
        r->length = to_seconds(ne - nb);
        if (gone) r->flags |= AUDIOREGION_FLAG_DELETED;
        r->flags |= AUDIOREGION_FLAG_CHANGED;
    }
    if (moved) adjust_child_shares();
}

void RegionSet::copy_from(const RegionSet &other)
{
    std::unordered_map<const Region *, Region *> copies;
    for (const auto &owned : other.regions_) {
        const Region *src = owned.get();
        if (regions_.size() >= kMaxRegions) break;
        auto region = std::make_unique<Region>();
        Region *r = region.get();
        static_cast<AUDIOREGION &>(*r) = *src;
        r->identity = r;
        r->set = this;
        r->label = src->label;
        r->comment = src->comment;
        r->share_begin = src->share_begin;
        r->share_length = src->share_length;
        r->serial = next_serial_++;
        copies[src] = r;
        regions_.push_back(std::move(region));
    }
    for (const auto &[src, r] : copies) {
        if (!src->parent) continue;
        auto it = copies.find(src->parent);
        if (it == copies.end()) continue;
        r->parent = it->second;
        it->second->children.push_back(r);
    }
    track_names_.insert(other.track_names_.begin(), other.track_names_.end());
}

namespace {

// Gives a region a new span and fits its descendants into it: scaled by
// their shares, or kept where they are, cut to the span, with the edges that
// touched a moved edge following it.
void reshape(Region *r, double nb, double ne, int mode, double near)
{
    const double ob = r->begin, oe = end_of(r);
    r->begin = nb;
    r->length = ne - nb;
    for (Region *c : r->children) {
        double cb = c->begin, ce = end_of(c);
        if (mode & AUDIOREGION_CHANGE_SCALE) {
            cb = nb + c->share_begin * (ne - nb);
            ce = cb + c->share_length * (ne - nb);
        } else {
            if (std::fabs(cb - ob) < near) cb = nb;
            if (std::fabs(ce - oe) < near) ce = ne;
        }
        cb = std::clamp(cb, nb, ne);
        ce = std::clamp(ce, cb, ne);
        reshape(c, cb, ce, mode, near);
    }
}

}  // namespace

bool RegionSet::change_edge(Region *r, double time, bool end, int mode)
{
    if (!r || (r->flags & AUDIOREGION_FLAG_DELETED) || !std::isfinite(time)) return false;
    const double lo = r->parent ? r->parent->begin : 0.0;
    const double hi = r->parent ? end_of(r->parent) : duration();
    double nb = r->begin, ne = end_of(r);
    if (end)
        ne = std::clamp(time, nb, std::max(nb, hi));
    else
        nb = std::clamp(time, std::min(lo, ne), ne);
    const int rate = sample_rate();
    reshape(r, nb, ne, mode, rate > 0 ? 0.5 / rate : 1e-9);
    update_share(r);
    update_shares_below(r);
    r->flags |= AUDIOREGION_FLAG_CHANGED;
    return true;
}

bool RegionSet::offset(const std::vector<Region *> &regions, int64_t frames)
{
    if (frames == 0) return true;
    if (sample_rate() == 0) return false;
    // Regions inside another moving region move with it, not on their own.
    std::unordered_set<const Region *> moving;
    for (Region *r : regions)
        if (r && r->set == this && !(r->flags & AUDIOREGION_FLAG_DELETED)) moving.insert(r);
    std::vector<Region *> tops;
    for (Region *r : regions) {
        if (!moving.count(r)) continue;
        bool inner = false;
        for (const Region *p = r->parent; p && !inner; p = p->parent) inner = moving.count(p) > 0;
        if (!inner && std::find(tops.begin(), tops.end(), r) == tops.end()) tops.push_back(r);
    }
    if (tops.empty()) return false;

    // One shift for all, limited so that each stays within its bounds.
    double shift = to_seconds(frames);
    for (const Region *r : tops) {
        const double lo = r->parent ? r->parent->begin : 0.0;
        const double hi = r->parent ? end_of(r->parent) : duration();
        shift = std::clamp(shift, std::min(0.0, lo - r->begin), std::max(0.0, hi - end_of(r)));
    }
    for (Region *r : tops) {
        std::vector<Region *> group{r};
        for (size_t i = 0; i < group.size(); ++i)
            for (Region *c : group[i]->children) group.push_back(c);
        for (Region *g : group) g->begin += shift;
        r->flags |= AUDIOREGION_FLAG_CHANGED;
        update_share(r);
    }
    return true;
}

bool RegionSet::set_parent(Region *r, Region *parent)
{
    if (!r || r->set != this) return false;
    if (parent && (parent->set != this || parent == r || is_descendant(parent, r) ||
                   depth_of(parent) + 1 + height_of(r) > kMaxDepth))
        return false;
    if (r->parent) {
        auto &siblings = r->parent->children;
        siblings.erase(std::remove(siblings.begin(), siblings.end(), r), siblings.end());
    }
    r->parent = parent;
    if (parent) {
        parent->children.push_back(r);
        const double pb = parent->begin, pe = end_of(parent);
        if (r->begin < pb || end_of(r) > pe) {
            const double nb = std::clamp(r->begin, pb, pe);
            reshape(r, nb, std::clamp(end_of(r), nb, pe), 0, 0.0);
        }
    }
    update_share(r);
    update_shares_below(r);
    return true;
}

void RegionSet::delete_all()
{
    for (const auto &owned : regions_) owned->flags |= AUDIOREGION_FLAG_DELETED;
}

void RegionSet::clear_changed(int only_track)
{
    for (const auto &owned : regions_)
        if (only_track < 0 || int(owned->flags & kTrackBits) == only_track)
            owned->flags &= ~AUDIOREGION_FLAG_CHANGED;
}

void RegionSet::adjust_child_shares()
{
    for (const auto &owned : regions_) update_share(owned.get());
}

void RegionSet::changed(bool quiet)
{
    if (!quiet && host_) host_->regions_changed();
}

int RegionSet::track_number(const std::string &name)
{
    if (name.empty()) return -1;
    for (const auto &[number, known] : track_names_)
        if (known == name) return number;
    int32_t number = -1;
    if (!host_ || host_->region_request(0x10025, const_cast<char *>(name.c_str()), &number) != 1 ||
        number < 0 || number >= AUDIOREGION_MAX_TRACKS)
        return -1;
    track_names_[number] = name;
    return number;
}

}  // namespace velmsig
