#include "outside/signal/store/segments.hpp"

#include <algorithm>

namespace velmsig {

Segments::Segments(std::vector<Segment> parts) : parts_(std::move(parts))
{
    starts_.reserve(parts_.size() + 1);
    int64_t position = 0;
    starts_.push_back(0);
    for (const Segment &s : parts_) {
        starts_.push_back(position += s.length);
        s.chunk->hold();
    }
}

Segments::~Segments()
{
    for (const Segment &s : parts_) s.chunk->release();
}

size_t Segments::locate(int64_t position) const
{
    auto it = std::upper_bound(starts_.begin(), starts_.end(), position);
    return size_t(it - starts_.begin()) - 1;
}

bool Segments::read(int64_t first, int64_t count, float *out) const
{
    bool ok = true;
    for (size_t i = locate(first); count > 0; ++i) {
        const Segment &s = parts_[i];
        const int64_t inside = first - starts_[i];
        const int64_t n = std::min(count, s.length - inside);
        ok = s.chunk->read(s.offset + inside, n, out) && ok;
        out += n;
        first += n;
        count -= n;
    }
    return ok;
}

MinMax Segments::minmax(int64_t first, int64_t count, WindowCache &cache) const
{
    MinMax result = MinMax::empty();
    for (size_t i = locate(first); count > 0; ++i) {
        const Segment &s = parts_[i];
        const int64_t inside = first - starts_[i];
        const int64_t n = std::min(count, s.length - inside);
        result.add(s.chunk->minmax(s.offset + inside, s.offset + inside + n, cache));
        first += n;
        count -= n;
    }
    return result;
}

int64_t Segments::memory_share() const
{
    int64_t bytes = 0;
    for (const Segment &s : parts_) {
        const int64_t held = s.chunk->memory_bytes();
        if (held > 0) bytes += held / std::max<int64_t>(1, s.chunk->holders());
    }
    return bytes;
}

void SegmentsBuilder::append(const Segment &segment)
{
    if (segment.length <= 0) return;
    length_ += segment.length;
    if (!parts_.empty()) {
        Segment &last = parts_.back();
        if (last.chunk == segment.chunk && last.offset + last.length == segment.offset) {
            last.length += segment.length;
            return;
        }
    }
    parts_.push_back(segment);
}

void SegmentsBuilder::append_range(const Segments &source, int64_t begin, int64_t end)
{
    begin = std::max<int64_t>(begin, 0);
    end = std::min(end, source.length());
    if (begin >= end) return;
    for (size_t i = source.locate(begin); begin < end; ++i) {
        const Segment &s = source.parts()[i];
        const int64_t inside = begin - source.start(i);
        const int64_t n = std::min(end - begin, s.length - inside);
        append({s.chunk, s.offset + inside, n});
        begin += n;
    }
}

void SegmentsBuilder::append_samples(const float *samples, int64_t count, Placement placement)
{
    while (count > 0) {
        const int64_t n = std::min(count, kChunkFrames);
        append({make_chunk(samples, n, placement), 0, n});
        samples += n;
        count -= n;
    }
}

void SegmentsBuilder::append_silence(int64_t count)
{
    while (count > 0) {
        const int64_t n = std::min(count, kChunkFrames);
        append({silence_chunk(), 0, n});
        count -= n;
    }
}

SegmentsPtr SegmentsBuilder::build()
{
    length_ = 0;
    return std::make_shared<const Segments>(std::move(parts_));
}

}  // namespace velmsig
