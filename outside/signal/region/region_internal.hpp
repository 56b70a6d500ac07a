// Regions inside the signal library: the region set a signal holds, and
// the seam through which the set asks its signal for what it needs.
#ifndef VELMSIG_REGION_INTERNAL_HPP
#define VELMSIG_REGION_INTERNAL_HPP

#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "outside/signal/audioregion.h"

namespace velmsig {

class RegionSet;

// What a region set needs from the signal that holds it.  The signal
// implements this and hands itself to its RegionSet.
class RegionHost {
public:
    virtual ~RegionHost() = default;
    virtual AUDIOSIGNAL *region_signal() = 0;     // answered by AUDIOREGION_GetParentSignal
    virtual int region_sample_rate() const = 0;   // frames per second
    virtual int64_t region_frames() const = 0;    // length of the signal in frames
    // Forwards a request to the signal's parent object: 0x10025 (data1 a
    // track name, data2 an int32_t * for its number) and 0x10026 (data1 a
    // track name, data2 its label).  Answers 0 when nobody answered.
    virtual int region_request(uint32_t code, void *data1, void *data2) = 0;
    // A region changed in a way that changes the document (not for
    // selection changes, nor for calls asked to be quiet).
    virtual void regions_changed() = 0;
};

// Implemented by the store: the region set of a signal, null for null.
RegionSet *signal_regions(AUDIOSIGNAL *signal);

// One region.  The public record comes first; a copy of it made by a
// caller finds this object again through `identity`.
struct Region : AUDIOREGION {
    RegionSet *set = nullptr;
    Region *parent = nullptr;
    std::vector<Region *> children;
    double share_begin = 0.0;   // (begin - parent begin) / parent length
    double share_length = 1.0;  // length / parent length
    std::optional<std::string> label;
    std::optional<std::string> comment;
    uint64_t serial = 0;        // creation order, the last tie-breaker of time order
};

// The live region a record stands for, or null for null or zeroed records.
Region *resolve(const AUDIOREGION *record);
// Time order: begin, then length, then creation.
bool region_before(const Region *a, const Region *b);

// A region as region files carry it.
struct RegionRecord {
    double begin = 0.0, length = 0.0;   // seconds
    int track = 0;                   // 0..15, after track names are resolved
    uint32_t flags = 0;              // AUDIOREGION_FLAG_* kept by files (no track bits)
    std::optional<std::string> label, comment;
    int parent = -1;                 // index of an earlier record, or -1
};

struct TrackRecord {
    int number = 0;                  // the number in the file
    std::string name;
    std::optional<std::string> label;
};

// What a region file holds, and what reading it met.
struct RegionFileContent {
    std::vector<TrackRecord> tracks;
    std::vector<RegionRecord> regions;
    std::vector<std::string> problems;   // one text per line or chunk skipped
};

// Filter of the counting and listing calls (see AUDIOSIGNAL_CountRegions).
struct RegionQuery {
    int64_t begin = 0, end = 0;          // samples; no time condition when end <= begin
    uint32_t tracks = 0;                 // track mask, 0 = all
    uint32_t skip_flags = 0;
    AUDIOREGION_Filter filter = nullptr;
};

// All regions of one signal.  Regions are freed only with the set, so that
// handles kept by undo records and view states stay valid.
class RegionSet {
public:
    explicit RegionSet(RegionHost *host);
    ~RegionSet();
    RegionSet(const RegionSet &) = delete;
    RegionSet &operator=(const RegionSet &) = delete;

    // Hooks for the signal's edits, in frames: regions move with the audio.
    // A cut before a region shifts it, through it shortens it, over all of it
    // deletes it; an insertion before it shifts it, inside it lengthens it.
    // Regions that do not move are not written (a recording thread appends
    // through on_insert while the interface reads the regions).
    void on_insert(int64_t at, int64_t frames);
    void on_remove(int64_t at, int64_t frames);
    // Adds copies of the live regions of other (a duplicated signal).
    void copy_from(const RegionSet &other);

    RegionHost *host() const { return host_; }
    AUDIOSIGNAL *signal() const;
    int sample_rate() const;          // 0 when unknown
    double duration() const;          // seconds; 0 when unknown
    int64_t to_sample(double seconds) const;
    double to_seconds(int64_t sample) const;

    // New region, clamped to the signal; null when the set is full, or for a
    // track out of range, a time that is not a number or a text too long.
    Region *add(double begin, double end, int track, uint32_t flags,
                const char *label, const char *comment);
    size_t size() const { return regions_.size(); }
    std::vector<Region *> select(const RegionQuery &query) const;   // in time order
    size_t count(const RegionQuery &query) const;
    std::vector<Region *> track_regions(int track) const;           // live, time order
    // The live region of a track (-1: any) next after / before `from` in
    // time order; with a null `from`, the first / last one.
    Region *nearest(const Region *from, int track, bool after) const;

    // Region edits (also through the AUDIOREGION_ calls).
    bool change_edge(Region *region, double time, bool end, int mode);
    bool offset(const std::vector<Region *> &regions, int64_t frames);
    bool set_parent(Region *region, Region *parent);
    void delete_all();
    void clear_changed(int only_track);   // after the regions were written (-1: all tracks)
    void adjust_child_shares();
    void changed(bool quiet = false);

    // Region files.
    RegionFileContent export_content(int only_track) const;
    // Adds the content's regions; track names become numbers through the
    // host.  Regions that cannot be added are noted in *problems.  Answers
    // the number of regions added.
    int import_content(const RegionFileContent &content, int forced_track,
                       std::vector<std::string> *problems);
    int track_number(const std::string &name);   // -1 when unknown and nobody answers
    const std::map<int, std::string> &track_names() const { return track_names_; }

    static constexpr size_t kMaxRegions = 1u << 18;
    static constexpr int kMaxDepth = 32;        // nesting levels below a top region
    static constexpr size_t kMaxText = 1u << 16;  // bytes of a label or comment

private:
    bool matches(const Region *r, const RegionQuery &q) const;

    RegionHost *host_;
    std::vector<std::unique_ptr<Region>> regions_;   // creation order
    std::map<int, std::string> track_names_;         // learned through the host
    uint64_t next_serial_ = 1;
};

}  // namespace velmsig

#endif  // VELMSIG_REGION_INTERNAL_HPP
