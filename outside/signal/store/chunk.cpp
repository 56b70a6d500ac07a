#include "outside/signal/store/chunk.hpp"

#ifdef __SSE2__
#include <immintrin.h>
#endif

#include <algorithm>
#include <atomic>
#include <cstring>

#include "outside/signal/store/block_file.hpp"
#include "outside/signal/store/sample_source.hpp"
#include "outside/signal/store/store_config.hpp"

namespace velmsig {

namespace {

std::atomic<uint64_t> next_chunk_id{1};
std::atomic<int64_t> memory_in_use{0};

int64_t window_count(int64_t frames)
{
    return (frames + kWindowFrames - 1) / kWindowFrames;
}

class MemoryChunk final : public Chunk {
public:
    MemoryChunk(const float *samples, int64_t count)
        : Chunk(count, summarize(samples, count)), data_(samples, samples + count)
    {
        memory_in_use += memory_bytes();
    }
    ~MemoryChunk() override { memory_in_use -= memory_bytes(); }

    bool read(int64_t first, int64_t count, float *out) const override
    {
        std::memcpy(out, data_.data() + first, size_t(count) * sizeof(float));
        return true;
    }
    const float *samples() const override { return data_.data(); }
    int64_t memory_bytes() const override { return int64_t(data_.size() * sizeof(float)); }

private:
    std::vector<float> data_;
};

class SilenceChunk final : public Chunk {
public:
    explicit SilenceChunk(int64_t count) : Chunk(count) {}
    bool read(int64_t, int64_t count, float *out) const override
    {
        std::fill(out, out + count, 0.0f);
        return true;
    }
};

class BlockFileChunk final : public Chunk {
public:
    BlockFileChunk(BlockFile *file, int64_t slot, int64_t count, std::vector<MinMax> windows)
        : Chunk(count, std::move(windows)), file_(file), slot_(slot)
    {
    }
    ~BlockFileChunk() override { file_->release(slot_); }

    bool read(int64_t first, int64_t count, float *out) const override
    {
        return file_->load(slot_, first, count, out);
    }

private:
    BlockFile *file_;
    int64_t slot_;
};

class SourceChunk final : public Chunk {
public:
    SourceChunk(std::shared_ptr<SampleSource> source, int channel, int64_t first, int64_t count,
                std::vector<MinMax> windows)
        : Chunk(count, std::move(windows)), source_(std::move(source)), channel_(channel), first_(first)
    {
    }

    bool read(int64_t first, int64_t count, float *out) const override
    {
        // The source gives every channel; one reusable buffer per thread.
        thread_local std::vector<float> frames;
        const int channels = source_->channels();
        frames.resize(size_t(count) * size_t(channels));
        if (source_->read(first_ + first, frames.data(), count) != count) return false;
        for (int64_t i = 0; i < count; ++i) out[i] = frames[size_t(i * channels + channel_)];
        return true;
    }

private:
    std::shared_ptr<SampleSource> source_;
    int channel_;
    int64_t first_;
};

ChunkPtr store_in_block_file(const float *samples, int64_t count, std::vector<MinMax> windows)
{
    BlockFile *file = BlockFile::instance();
    if (!file) return nullptr;
    int64_t slot = file->store(samples, count);
    if (slot < 0) return nullptr;
    return std::make_shared<BlockFileChunk>(file, slot, count, std::move(windows));
}

}  // namespace

void scan_frames(const float *frames, int64_t count, int channels, MinMax *out)
{
    for (int c = 0; c < channels; ++c) out[c] = MinMax::empty();
    int64_t i = 0;
#ifdef __SSE2__
    // With 1, 2 or 4 channels every lane of four samples stays on one channel.
    // Four pairs of running extremes let the loads overlap instead of waiting
    // on one chain; the sample goes first, so a NaN is passed over (minps and
    // maxps return their second operand when either is NaN).
    if (4 % channels == 0) {
        const int64_t step = 4 / channels;  // frames per register
        const __m128 inf = _mm_set1_ps(__builtin_inff()), minus_inf = _mm_set1_ps(-__builtin_inff());
        __m128 lo[4] = {inf, inf, inf, inf}, hi[4] = {minus_inf, minus_inf, minus_inf, minus_inf};
        for (; i + 4 * step <= count; i += 4 * step) {
            for (int k = 0; k < 4; ++k) {
                const __m128 x = _mm_loadu_ps(frames + (i + k * step) * channels);
                lo[k] = _mm_min_ps(x, lo[k]);
                hi[k] = _mm_max_ps(x, hi[k]);
            }
        }
        for (; i + step <= count; i += step) {
            const __m128 x = _mm_loadu_ps(frames + i * channels);
            lo[0] = _mm_min_ps(x, lo[0]);
            hi[0] = _mm_max_ps(x, hi[0]);
        }
        alignas(16) float l[4], h[4];
        _mm_store_ps(l, _mm_min_ps(_mm_min_ps(lo[0], lo[1]), _mm_min_ps(lo[2], lo[3])));
        _mm_store_ps(h, _mm_max_ps(_mm_max_ps(hi[0], hi[1]), _mm_max_ps(hi[2], hi[3])));
        for (int k = 0; k < 4; ++k) out[k % channels].add({l[k], h[k]});
    }
#endif
    for (; i < count; ++i) {
        for (int c = 0; c < channels; ++c) out[c].add({frames[i * channels + c], frames[i * channels + c]});
    }
}

MinMax scan_minmax(const float *samples, int64_t count)
{
    MinMax result;
    scan_frames(samples, count, 1, &result);
    return result;
}

MinMax merge_minmax(const MinMax *entries, int64_t count)
{
    MinMax result = MinMax::empty();
    int64_t i = 0;
#ifdef __SSE2__
    // Two entries per register: lanes 0 and 2 hold minima, 1 and 3 maxima.
    __m128 vlo = _mm_set1_ps(result.min), vhi = _mm_set1_ps(result.max);
    static_assert(sizeof(MinMax) == 2 * sizeof(float), "entries are float pairs");
    for (; i + 2 <= count; i += 2) {
        const __m128 x = _mm_loadu_ps(&entries[i].min);
        vlo = _mm_min_ps(vlo, x);
        vhi = _mm_max_ps(vhi, x);
    }
    alignas(16) float l[4], h[4];
    _mm_store_ps(l, vlo);
    _mm_store_ps(h, vhi);
    result = {std::min(l[0], l[2]), std::max(h[1], h[3])};
#endif
    for (; i < count; ++i) result.add(entries[i]);
    return result;
}

std::vector<MinMax> summarize(const float *samples, int64_t count)
{
    std::vector<MinMax> windows(size_t(window_count(count)));
    for (size_t w = 0; w < windows.size(); ++w) {
        int64_t begin = int64_t(w) * kWindowFrames;
        windows[w] = scan_minmax(samples + begin, std::min(kWindowFrames, count - begin));
    }
    return windows;
}

Chunk::Chunk(int64_t frames, std::vector<MinMax> windows)
    : frames_(frames), id_(next_chunk_id++), windows_(std::move(windows)), whole_(MinMax::empty())
{
    for (const MinMax &w : windows_) whole_.add(w);
}

Chunk::Chunk(int64_t frames)
    : frames_(frames), id_(next_chunk_id++), windows_(size_t(window_count(frames)), MinMax{0.0f, 0.0f}),
      whole_{0.0f, 0.0f}
{
}

Chunk::~Chunk() = default;

MinMax Chunk::raw_minmax(int64_t a, int64_t b, WindowCache &cache) const
{
    if (const float *data = samples()) return scan_minmax(data + a, b - a);
    MinMax result = MinMax::empty();
    while (a < b) {
        const int64_t window = a / kWindowFrames;
        const int64_t begin = window * kWindowFrames;
        if (cache.chunk_id != id_ || cache.window != window) {
            const int64_t count = std::min(kWindowFrames, frames_ - begin);
            if (!read(begin, count, cache.samples)) std::fill(cache.samples, cache.samples + count, 0.0f);
            cache.chunk_id = id_;
            cache.window = window;
            cache.count = int32_t(count);
        }
        const int64_t stop = std::min(b, begin + cache.count);
        result.add(scan_minmax(cache.samples + (a - begin), stop - a));
        a = stop;
    }
    return result;
}

MinMax Chunk::minmax(int64_t a, int64_t b, WindowCache &cache) const
{
    if (a == 0 && b == frames_) return whole_;
    // Whole windows inside [a, b); the chunk's last window may be short.
    const int64_t first = (a + kWindowFrames - 1) / kWindowFrames;
    const int64_t last = b == frames_ ? int64_t(windows_.size()) : b / kWindowFrames;
    if (first >= last) return raw_minmax(a, b, cache);
    MinMax result = merge_minmax(windows_.data() + first, last - first);
    // An edge window whose extremes lie within the result cannot change it:
    // its samples are read only when it might.
    auto edge = [&](int64_t window, int64_t from, int64_t to) {
        const MinMax &bounds = windows_[size_t(window)];
        if (bounds.min < result.min || bounds.max > result.max) result.add(raw_minmax(from, to, cache));
    };
    if (a < first * kWindowFrames) edge(first - 1, a, first * kWindowFrames);
    if (last * kWindowFrames < b) edge(last, last * kWindowFrames, b);
    return result;
}

ChunkPtr make_chunk(const float *samples, int64_t count, Placement placement)
{
    const int64_t bytes = count * int64_t(sizeof(float));
    if (placement == Placement::BlockFile || memory_in_use + bytes > memory_budget_bytes()) {
        if (ChunkPtr stored = store_in_block_file(samples, count, summarize(samples, count))) return stored;
        // Without a usable block file the samples must still be kept.
    }
    return std::make_shared<MemoryChunk>(samples, count);
}

const ChunkPtr &silence_chunk()
{
    static const ChunkPtr silence = std::make_shared<SilenceChunk>(kChunkFrames);
    return silence;
}

ChunkPtr make_source_chunk(std::shared_ptr<SampleSource> source, int channel, int64_t first, int64_t count,
                           std::vector<MinMax> windows)
{
    return std::make_shared<SourceChunk>(std::move(source), channel, first, count, std::move(windows));
}

ChunkPtr move_to_block_file(const Chunk &chunk)
{
    const float *data = chunk.samples();
    if (!data) return nullptr;
    return store_in_block_file(data, chunk.frames(), summarize(data, chunk.frames()));
}

}  // namespace velmsig
