// Segments: one channel's samples as an immutable sequence of chunk slices.
// Edits build new sequences that share the untouched chunks.
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

class Segments {
public:
    Segments() : starts_{0} {}
    explicit Segments(std::vector<Segment> parts);
    ~Segments();
    Segments(const Segments &) = delete;
    Segments &operator=(const Segments &) = delete;

    int64_t length() const { return starts_.back(); }
    const std::vector<Segment> &parts() const { return parts_; }
    int64_t start(size_t index) const { return starts_[index]; }
    // Index of the part holding position (0 <= position < length()).
    size_t locate(int64_t position) const;

    // Copies [first, first + count) (inside the sequence) into out.
    bool read(int64_t first, int64_t count, float *out) const;
    // Exact extremes of [first, first + count) (count > 0, inside).
    MinMax minmax(int64_t first, int64_t count, WindowCache &cache) const;
    // This sequence's share of sample memory: each chunk's bytes divided
    // among the sequence entries that refer to it.
    int64_t memory_share() const;

private:
    std::vector<Segment> parts_;
    std::vector<int64_t> starts_;  // parts_.size() + 1 entries
};

using SegmentsPtr = std::shared_ptr<const Segments>;

// Builds a sequence from pieces, joining neighbours that continue each other.
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
    std::vector<Segment> parts_;
    int64_t length_ = 0;
};

}  // namespace velmsig
