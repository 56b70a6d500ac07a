// Chunks: immutable runs of one channel's samples with their min/max summaries.
#pragma once

#include <atomic>
#include <cstdint>
#include <memory>
#include <vector>

namespace velmsig {

class SampleSource;

// Largest chunk of new samples, largest chunk of a file read in place (it
// holds no samples, so fewer, longer ones keep block lists short), and the
// frames summarised by one window entry.
constexpr int64_t kChunkFrames = 65536;
constexpr int64_t kSourceChunkFrames = 1 << 20;
constexpr int64_t kWindowFrames = 256;

struct MinMax {
    float min;
    float max;
    void add(const MinMax &o) {
        if (o.min < min) min = o.min;
        if (o.max > max) max = o.max;
    }
    static MinMax empty() { return {__builtin_inff(), -__builtin_inff()}; }
};

MinMax scan_minmax(const float *samples, int64_t count);
// Extremes of each channel of count interleaved frames into out[channel].
void scan_frames(const float *frames, int64_t count, int channels, MinMax *out);
// The union of count summary entries.
MinMax merge_minmax(const MinMax *entries, int64_t count);

// The raw samples of one window, kept by a reader that scans forward so that
// the window shared by two consecutive ranges is fetched once.
struct WindowCache {
    uint64_t chunk_id = 0;
    int64_t window = -1;
    int32_t count = 0;
    float *samples = nullptr;  // kWindowFrames floats owned by the caller
};

class Chunk {
public:
    virtual ~Chunk();
    Chunk(const Chunk &) = delete;
    Chunk &operator=(const Chunk &) = delete;

    int64_t frames() const { return frames_; }
    uint64_t id() const { return id_; }
    MinMax whole() const { return whole_; }

    // Copies count samples from first (inside the chunk) into out; false on
    // a read error of the file behind it.
    virtual bool read(int64_t first, int64_t count, float *out) const = 0;
    // The samples when they sit in memory, else null.
    virtual const float *samples() const { return nullptr; }
    // Bytes of sample memory this chunk holds.
    virtual int64_t memory_bytes() const { return 0; }
    // True when every sample is 0 and nothing is stored.
    virtual bool is_silence() const { return false; }

    // Sequence entries referring to this chunk: they share its memory.
    void hold() const { ++holders_; }
    void release() const { --holders_; }
    int64_t holders() const { return holders_; }

    // Exact extremes of [a, b) (0 <= a < b <= frames()): window summaries in
    // the middle, raw samples at the two edges (read errors count as 0).
    MinMax minmax(int64_t a, int64_t b, WindowCache &cache) const;

protected:
    // windows: one entry per kWindowFrames (the last may cover fewer).
    Chunk(int64_t frames, std::vector<MinMax> windows);
    explicit Chunk(int64_t frames);  // all-zero summaries

private:
    MinMax raw_minmax(int64_t a, int64_t b, WindowCache &cache) const;

    int64_t frames_;
    uint64_t id_;
    std::vector<MinMax> windows_;
    MinMax whole_;
    mutable std::atomic<int64_t> holders_{0};
};

using ChunkPtr = std::shared_ptr<const Chunk>;

// Where a new chunk keeps its samples.
enum class Placement {
    Budget,     // memory while the process stays under the memory budget, else the block file
    BlockFile,  // the block file (decoded copies of compressed files)
};

// A chunk holding a copy of samples (count <= kChunkFrames).
ChunkPtr make_chunk(const float *samples, int64_t count, Placement placement = Placement::Budget);
// kChunkFrames zero samples, shared by every silent stretch; stores nothing.
const ChunkPtr &silence_chunk();
// Samples read in place from a source: channel of frames [first, first + count)
// with summaries computed by the caller's scan.
ChunkPtr make_source_chunk(std::shared_ptr<SampleSource> source, int channel, int64_t first,
                           int64_t count, std::vector<MinMax> windows);
// The same samples moved to the block file (null when they are not in memory
// or the file cannot take them).
ChunkPtr move_to_block_file(const Chunk &chunk);

// Summaries of count samples, one entry per window.
std::vector<MinMax> summarize(const float *samples, int64_t count);

// Sample bytes held in memory by all chunks of the process.
int64_t chunk_memory_in_use();

}  // namespace velmsig
