#include "outside/signal/store/segments.hpp"

#include <algorithm>

namespace velmsig {

namespace {

std::vector<int64_t> running_starts(size_t count, auto length_of)
{
    std::vector<int64_t> starts;
    starts.reserve(count + 1);
    int64_t position = 0;
    starts.push_back(0);
    for (size_t i = 0; i < count; ++i) starts.push_back(position += length_of(i));
    return starts;
}

size_t index_of(const std::vector<int64_t> &starts, int64_t position)
{
    return size_t(std::upper_bound(starts.begin(), starts.end(), position) - starts.begin()) - 1;
}

}  // namespace

Page::Page(std::vector<Segment> parts)
    : parts_(std::move(parts)), starts_(running_starts(parts_.size(), [&](size_t i) { return parts_[i].length; }))
{
    for (const Segment &s : parts_) s.chunk->hold();
}

Page::~Page()
{
    for (const Segment &s : parts_) s.chunk->release();
}

size_t Page::locate(int64_t position) const
{
    return index_of(starts_, position);
}

Segments::Segments(std::vector<PagePtr> pages)
    : pages_(std::move(pages)), starts_(running_starts(pages_.size(), [&](size_t i) { return pages_[i]->length(); }))
{
}

std::vector<Segment> Segments::parts() const
{
    std::vector<Segment> result;
    for (const PagePtr &page : pages_) result.insert(result.end(), page->parts().begin(), page->parts().end());
    return result;
}

template <typename Visit>
void Segments::walk(int64_t first, int64_t count, Visit visit) const
{
    for (size_t p = index_of(starts_, first); count > 0; ++p) {
        const Page &page = *pages_[p];
        for (size_t i = page.locate(first - starts_[p]); count > 0 && i < page.parts().size(); ++i) {
            const Segment &s = page.parts()[i];
            const int64_t inside = first - starts_[p] - page.start(i);
            const int64_t n = std::min(count, s.length - inside);
            visit(s, s.offset + inside, n);
            first += n;
            count -= n;
        }
    }
}

bool Segments::read(int64_t first, int64_t count, float *out) const
{
    bool ok = true;
    walk(first, count, [&](const Segment &s, int64_t from, int64_t n) {
        ok = s.chunk->read(from, n, out) && ok;
        out += n;
    });
    return ok;
}

MinMax Segments::minmax(int64_t first, int64_t count, WindowCache &cache) const
{
    MinMax result = MinMax::empty();
    walk(first, count, [&](const Segment &s, int64_t from, int64_t n) {
        result.add(s.chunk->minmax(from, from + n, cache));
    });
    return result;
}

int64_t Segments::memory_share() const
{
    int64_t bytes = 0;
    for (const PagePtr &page : pages_) {
        int64_t page_bytes = 0;
        for (const Segment &s : page->parts()) {
            const int64_t held = s.chunk->memory_bytes();
            if (held > 0) page_bytes += held / std::max<int64_t>(1, s.chunk->holders());
        }
        bytes += page_bytes / std::max<long>(1, page.use_count());
    }
    return bytes;
}

int64_t Segments::table_bytes() const
{
    int64_t bytes = int64_t(pages_.size() * (sizeof(PagePtr) + sizeof(int64_t)));
    for (const PagePtr &page : pages_) {
        const int64_t page_bytes = int64_t(sizeof(Page) + page->parts().size() * (sizeof(Segment) + sizeof(int64_t)));
        bytes += page_bytes / std::max<long>(1, page.use_count());
    }
    return bytes;
}

void SegmentsBuilder::append(const Segment &segment)
{
    if (segment.length <= 0) return;
    length_ += segment.length;
    if (!open_.empty()) {
        Segment &last = open_.back();
        if (last.chunk == segment.chunk && last.offset + last.length == segment.offset) {
            last.length += segment.length;
            return;
        }
    }
    open_.push_back(segment);
    if (open_.size() == kPageParts) close_page();
}

void SegmentsBuilder::append_page(const PagePtr &page)
{
    // A page that fits beside the loose slices joins them, so that edits do
    // not leave a trail of small pages.
    if (!open_.empty() && open_.size() + page->parts().size() <= kPageParts) {
        for (const Segment &s : page->parts()) append(s);
        return;
    }
    close_page();
    pages_.push_back(page);
    length_ += page->length();
}

void SegmentsBuilder::close_page()
{
    if (open_.empty()) return;
    pages_.push_back(std::make_shared<const Page>(std::move(open_)));
    open_.clear();
}

void SegmentsBuilder::append_range(const Segments &source, int64_t begin, int64_t end)
{
    begin = std::max<int64_t>(begin, 0);
    end = std::min(end, source.length());
    int64_t page_begin = 0;
    for (const PagePtr &page : source.pages()) {
        const int64_t page_end = page_begin + page->length();
        if (begin <= page_begin && page_end <= end) {
            append_page(page);
        } else if (begin < page_end && page_begin < end) {
            const int64_t from = std::max(begin, page_begin) - page_begin, to = std::min(end, page_end) - page_begin;
            for (size_t i = page->locate(from); i < page->parts().size() && page->start(i) < to; ++i) {
                const Segment &s = page->parts()[i];
                const int64_t a = std::max(from, page->start(i)), b = std::min(to, page->start(i) + s.length);
                append({s.chunk, s.offset + (a - page->start(i)), b - a});
            }
        }
        page_begin = page_end;
        if (page_begin >= end) break;
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
    close_page();
    length_ = 0;
    auto result = std::make_shared<const Segments>(std::move(pages_));
    pages_.clear();
    return result;
}

}  // namespace velmsig
