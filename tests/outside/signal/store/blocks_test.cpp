// Chunk sequences: reading and exact extremes over every kind of storage.
#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <random>
#include <vector>

#include "outside/signal/store/sample_source.hpp"
#include "outside/signal/store/segments.hpp"

using namespace velmsig;

namespace {

std::vector<float> random_samples(int64_t count, uint32_t seed)
{
    std::mt19937 rng(seed);
    std::uniform_real_distribution<float> dist(-1.0f, 1.0f);
    std::vector<float> samples(static_cast<size_t>(count));
    for (float &x : samples) x = dist(rng);
    return samples;
}

// Interleaved frames in memory, read like a file in place.
class VectorSource final : public SampleSource {
public:
    VectorSource(std::vector<float> interleaved, int channels)
        : data_(std::move(interleaved)), channels_(channels)
    {
    }
    int channels() const override { return channels_; }
    int64_t frames() const override { return int64_t(data_.size()) / channels_; }
    int64_t read(int64_t first, float *out, int64_t count) override
    {
        ++reads;
        count = std::min(count, frames() - first);
        std::copy_n(data_.begin() + first * channels_, count * channels_, out);
        return count;
    }
    int reads = 0;

private:
    std::vector<float> data_;
    int channels_;
};

// Checks reads and extremes of random ranges against the plain samples.
void expect_matches(const Segments &segments, const std::vector<float> &reference, uint32_t seed)
{
    ASSERT_EQ(segments.length(), int64_t(reference.size()));
    std::vector<float> window(static_cast<size_t>(kWindowFrames));
    WindowCache cache{0, -1, 0, window.data()};
    std::mt19937 rng(seed);
    for (int i = 0; i < 200; ++i) {
        int64_t a = int64_t(rng() % reference.size());
        int64_t b = int64_t(rng() % reference.size());
        if (a > b) std::swap(a, b);
        if (i % 4 == 0) b = std::min<int64_t>(a + int64_t(rng() % 600) + 1, int64_t(reference.size()));
        if (a == b) continue;
        const auto [lo, hi] = std::minmax_element(reference.begin() + a, reference.begin() + b);
        const MinMax got = segments.minmax(a, b - a, cache);
        ASSERT_EQ(got.min, *lo) << a << ".." << b;
        ASSERT_EQ(got.max, *hi) << a << ".." << b;
    }
    std::vector<float> all(reference.size());
    ASSERT_TRUE(segments.read(0, segments.length(), all.data()));
    EXPECT_EQ(all, reference);
}

TEST(SignalStoreBlocks, MemoryChunksAndSlicesGiveExactExtremes)
{
    const std::vector<float> samples = random_samples(300000, 1);
    SegmentsBuilder whole;
    whole.append_samples(samples.data(), int64_t(samples.size()));
    SegmentsPtr sequence = whole.build();
    EXPECT_EQ(sequence->parts().size(), 5u);  // 4 full chunks and a short one
    expect_matches(*sequence, samples, 2);

    // A sequence cut and reassembled from slices at odd positions.
    SegmentsBuilder pieces;
    pieces.append_range(*sequence, 200001, 250000);
    pieces.append_range(*sequence, 3, 70000);
    pieces.append_range(*sequence, 131071, 131075);
    SegmentsPtr spliced = pieces.build();
    std::vector<float> reference(samples.begin() + 200001, samples.begin() + 250000);
    reference.insert(reference.end(), samples.begin() + 3, samples.begin() + 70000);
    reference.insert(reference.end(), samples.begin() + 131071, samples.begin() + 131075);
    expect_matches(*spliced, reference, 3);
}

TEST(SignalStoreBlocks, NanSamplesDoNotHideTheExtremesBeforeThem)
{
    std::vector<float> samples = random_samples(3000, 6);
    for (float &x : samples) x *= 0.5f;
    // Each extreme is followed by a NaN four samples on (the same vector lane)
    // and one at the very end of its window.
    samples[0] = -0.9f;
    samples[4] = __builtin_nanf("");
    samples[300] = 0.95f;
    samples[304] = __builtin_nanf("");
    samples[511] = __builtin_nanf("");
    SegmentsBuilder builder;
    builder.append_samples(samples.data(), int64_t(samples.size()));
    SegmentsPtr sequence = builder.build();
    std::vector<float> window(static_cast<size_t>(kWindowFrames));
    WindowCache cache{0, -1, 0, window.data()};
    for (const auto &[first, count] : {std::pair<int64_t, int64_t>{0, 3000}, {0, 256}, {256, 256}, {1, 2000}}) {
        MinMax expected = MinMax::empty();
        for (int64_t i = first; i < first + count; ++i) expected.add({samples[size_t(i)], samples[size_t(i)]});
        const MinMax got = sequence->minmax(first, count, cache);
        EXPECT_EQ(got.min, expected.min) << first << "+" << count;
        EXPECT_EQ(got.max, expected.max) << first << "+" << count;
    }
    EXPECT_EQ(sequence->minmax(0, 3000, cache).min, -0.9f);
    EXPECT_EQ(sequence->minmax(0, 3000, cache).max, 0.95f);
}

TEST(SignalStoreBlocks, NeighbouringSlicesOfOneChunkJoin)
{
    const std::vector<float> samples = random_samples(1000, 4);
    SegmentsBuilder builder;
    builder.append_samples(samples.data(), 1000);
    SegmentsPtr sequence = builder.build();
    SegmentsBuilder again;
    again.append_range(*sequence, 0, 400);
    again.append_range(*sequence, 400, 1000);
    EXPECT_EQ(again.build()->parts().size(), 1u);
}

TEST(SignalStoreBlocks, SourceChunksReadInPlaceWithWindowCache)
{
    const int channels = 2;
    const int64_t frames = 100000;
    std::vector<float> interleaved = random_samples(frames * channels, 5);
    auto source = std::make_shared<VectorSource>(interleaved, channels);
    SegmentsBuilder builder;
    std::vector<float> right(static_cast<size_t>(frames));
    for (int64_t i = 0; i < frames; ++i) right[size_t(i)] = interleaved[size_t(i * channels + 1)];
    for (int64_t at = 0; at < frames; at += kChunkFrames) {
        const int64_t n = std::min(kChunkFrames, frames - at);
        builder.append({make_source_chunk(source, 1, at, n, summarize(right.data() + at, n)), 0, n});
    }
    SegmentsPtr sequence = builder.build();
    EXPECT_EQ(sequence->memory_share(), 0);
    expect_matches(*sequence, right, 6);

    // Edge windows are read only when their extremes could change the
    // result, and consecutive ranges meeting inside one fetch it once.
    std::vector<float> window(static_cast<size_t>(kWindowFrames));
    WindowCache cache{0, -1, 0, window.data()};
    source->reads = 0;
    const int64_t width = 20000;
    for (int64_t at = 1000; at + width < frames; at += width) sequence->minmax(at, width, cache);
    EXPECT_LE(source->reads, 2);  // 4 columns of 78 windows: an edge rarely holds an extreme

    // A peak planted in an edge window is found.
    interleaved[size_t(2 * 1001 + 1)] = 5.0f;
    auto peaked = std::make_shared<VectorSource>(interleaved, channels);
    right[1001] = 5.0f;
    ChunkPtr chunk = make_source_chunk(peaked, 1, 0, kChunkFrames, summarize(right.data(), kChunkFrames));
    EXPECT_EQ(chunk->minmax(1001, 30000, cache).max, 5.0f);
    EXPECT_LT(chunk->minmax(1002, 30000, cache).max, 1.0f);
}

TEST(SignalStoreBlocks, BlockFileChunksHoldNoMemory)
{
    const std::vector<float> samples = random_samples(70000, 7);
    SegmentsBuilder builder;
    builder.append_samples(samples.data(), int64_t(samples.size()), Placement::BlockFile);
    SegmentsPtr sequence = builder.build();
    for (const Segment &s : sequence->parts()) EXPECT_EQ(s.chunk->samples(), nullptr);
    EXPECT_EQ(sequence->memory_share(), 0);
    expect_matches(*sequence, samples, 8);

    ChunkPtr moved = move_to_block_file(*make_chunk(samples.data(), 1000));
    ASSERT_TRUE(moved);
    std::vector<float> back(1000);
    ASSERT_TRUE(moved->read(0, 1000, back.data()));
    EXPECT_TRUE(std::equal(back.begin(), back.end(), samples.begin()));
}

TEST(SignalStoreBlocks, SilenceIsSharedAndZero)
{
    SegmentsBuilder builder;
    builder.append_silence(kChunkFrames * 3 + 5);
    SegmentsPtr sequence = builder.build();
    expect_matches(*sequence, std::vector<float>(size_t(kChunkFrames * 3 + 5), 0.0f), 9);
    EXPECT_EQ(sequence->memory_share(), 0);
    for (const Segment &s : sequence->parts()) EXPECT_EQ(s.chunk, silence_chunk());
}

TEST(SignalStoreBlocks, SharedChunksSplitTheirMemory)
{
    const std::vector<float> samples = random_samples(kChunkFrames, 10);
    SegmentsBuilder builder;
    builder.append_samples(samples.data(), kChunkFrames);
    SegmentsPtr first = builder.build();
    const int64_t alone = first->memory_share();
    EXPECT_EQ(alone, kChunkFrames * int64_t(sizeof(float)));
    SegmentsBuilder copy;
    copy.append_range(*first, 0, kChunkFrames);
    SegmentsPtr second = copy.build();
    EXPECT_EQ(first->memory_share(), alone / 2);
    EXPECT_EQ(first->memory_share() + second->memory_share(), alone);
    second.reset();
    EXPECT_EQ(first->memory_share(), alone);
}

TEST(SignalStoreBlocks, EditsShareTheUntouchedPages)
{
    const std::vector<float> samples = random_samples(64 * 400, 11);
    SegmentsBuilder builder;
    for (int i = 0; i < 400; ++i) builder.append({make_chunk(samples.data() + 64 * i, 64), 0, 64});
    SegmentsPtr sequence = builder.build();
    ASSERT_GE(sequence->pages().size(), 400 / kPageParts);

    // Remove a few frames in the middle.
    SegmentsBuilder edit;
    edit.append_range(*sequence, 0, 12800);
    edit.append_range(*sequence, 12803, sequence->length());
    SegmentsPtr edited = edit.build();
    size_t shared = 0;
    for (const PagePtr &page : edited->pages()) {
        shared += std::count(sequence->pages().begin(), sequence->pages().end(), page);
    }
    EXPECT_GE(shared + 3, sequence->pages().size());
    std::vector<float> reference(samples.begin(), samples.begin() + 12800);
    reference.insert(reference.end(), samples.begin() + 12803, samples.end());
    expect_matches(*edited, reference, 12);
}

}  // namespace
