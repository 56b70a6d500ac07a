// Segments: one channel's samples as an immutable sequence of chunk slices,
// kept in shared pages so that edits copy only the pages they touch.
#pragma once

#include <cstdint>
#include <memory>
#include <vector>

#include "outside/signal/store/chunk.hpp"

namespace velmsig {

struct Segment {
    ChunkPtr chunk;
    int64_t offset;  // first frame inside the chunk
    int64_t length;
};

// Most slices in one page.
constexpr size_t kPageParts = 32;

// A run of slices; shared by every sequence that contains all of it.
class Page {
public:
    explicit Page(std::vector<Segment> parts);
    ~Page();
    Page(const Page &) = delete;
    Page &operator=(const Page &) = delete;

    const std::vector<Segment> &parts() const { return parts_; }
    int64_t start(size_t index) const { return starts_[index]; }
    int64_t length() const { return starts_.back(); }
    // Index of the slice holding position (0 <= position < length()).
    size_t locate(int64_t position) const;

private:
    std::vector<Segment> parts_;
    std::vector<int64_t> starts_;  // parts_.size() + 1 entries
};

using PagePtr = std::shared_ptr<const Page>;

class Segments {
public:
    Segments() : starts_{0} {}
    explicit Segments(std::vector<PagePtr> pages);

    int64_t length() const { return starts_.back(); }
    const std::vector<PagePtr> &pages() const { return pages_; }
    // Every slice in order.
    std::vector<Segment> parts() const;

    // Copies [first, first + count) (inside the sequence) into out.
    bool read(int64_t first, int64_t count, float *out) const;
    // Exact extremes of [first, first + count) (count > 0, inside).
    MinMax minmax(int64_t first, int64_t count, WindowCache &cache) const;
    // This sequence's share of sample memory: each chunk's bytes divided
    // among the page entries that refer to it, each page's among the
    // sequences that hold it.
    int64_t memory_share() const;
    // Bytes of the tables: this sequence's, and its share of its pages'.
    int64_t table_bytes() const;

private:
    // Calls visit(slice, first, count) for the slices of [first, first + count).
    template <typename Visit>
    void walk(int64_t first, int64_t count, Visit visit) const;

    std::vector<PagePtr> pages_;
    std::vector<int64_t> starts_;  // pages_.size() + 1 entries
};

using SegmentsPtr = std::shared_ptr<const Segments>;

// Builds a sequence from pieces, joining neighbours that continue each
// other and sharing whole pages of the sequences it copies from.
class SegmentsBuilder {
public:
    void append(const Segment &segment);
    // [begin, end) of an existing sequence (clamped to it).
    void append_range(const Segments &source, int64_t begin, int64_t end);
    void append_samples(const float *samples, int64_t count, Placement placement = Placement::Budget);
    void append_silence(int64_t count);
    int64_t length() const { return length_; }
    SegmentsPtr build();

private:
    void append_page(const PagePtr &page);
    void close_page();

    std::vector<PagePtr> pages_;
    std::vector<Segment> open_;  // slices not yet in a page
    int64_t length_ = 0;
};

}  // namespace velmsig
