// Where the samples come from: the document's signal (following the view,
// the selections and the cursor), a list of blocks of it, or an audio file.
#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <utility>

#include "control/velmcontrol.h"
#include "core/document_internal.hpp"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "edit/velmregion.h"
#include "edit/velmselection.h"
#include "outside/signal/audiosignal.h"
#include "sound/player_internal.hpp"

namespace velm::play {

namespace {

// Moves the read position into the selection's chunks: forward to the
// next chunk's begin from a gap, backward to the previous chunk's end.
void enter_chunk(Player *p, int step)
{
    const auto &chunks = p->view.chunks;
    if (step > 0) {
        auto next = std::find_if(chunks.begin(), chunks.end(),
                                 [&](const auto &c) { return c.second > p->readPosition; });
        if (next != chunks.end() && p->readPosition < next->first) p->readPosition = next->first;
    } else {
        auto prev = std::find_if(chunks.rbegin(), chunks.rend(),
                                 [&](const auto &c) { return c.first < p->readPosition; });
        if (prev != chunks.rend() && p->readPosition > prev->second) p->readPosition = prev->second;
    }
}

// How far reading may go from the read position: to the range's edge, and
// with a selection not past the chunk being read, so gaps stay silent.
int64_t reading_limit(const Player *p, int step)
{
    int64_t limit = step > 0 ? p->rangeEnd : p->rangeBegin;
    if (p->fixedRange() || !p->view.visible || p->playingRegion) return limit;
    for (const auto &[begin, end] : p->view.chunks) {
        if (step > 0 && begin <= p->readPosition && p->readPosition < end) return std::min(limit, end);
        if (step < 0 && begin < p->readPosition && p->readPosition <= end) return std::max(limit, begin);
    }
    return limit;
}

// Follows the document: the view widens the range; a region, the
// selections or a cursor the user moved decide where reading goes.
void follow_document(Player *p, int step)
{
    DocumentView &v = p->view;
    p->rangeEnd = std::max(p->rangeEnd, v.viewEnd);
    p->rangeBegin = std::min(p->rangeBegin, v.viewBegin);
    if (p->requestedPosition >= 0 && p->requestedPosition != p->readPosition) p->readPosition = p->requestedPosition;
    if (p->playingRegion) {
        p->rangeBegin = std::max(p->regionBegin, v.limitBegin);
        p->rangeEnd = std::min(p->regionEnd, v.limitEnd);
        return;
    }
    if (v.selecting) return;
    if (v.chunks.empty()) {
        if (v.cursorMove >= 0) p->pendingJump = std::exchange(v.cursorMove, -1);
        if (p->pendingJump >= 0 && !v.movingCursor) p->readPosition = std::exchange(p->pendingJump, -1);
        return;
    }
    if (p->pendingJump >= 0) p->readPosition = std::exchange(p->pendingJump, -1);
    enter_chunk(p, step);
    p->rangeBegin = v.chunks.front().first;
    p->rangeEnd = v.chunks.back().second;
}

// Keeps the play cursor in step with what is read: a jump of the read
// position or a change of speed starts a new stretch from here.
void account(Player *p, int64_t read_before)
{
    if (p->readPosition != read_before) {
        p->playCursor += p->readPosition - read_before;
    } else if (p->requestedSpeed != p->currentSpeed) {
        p->playCursor += std::llround(static_cast<double>(p->framesDelivered - p->framesAtChange) * p->currentSpeed);
        p->framesAtChange = p->framesDelivered;
        p->currentSpeed = p->requestedSpeed;
    } else {
        return;
    }
    p->jumpMarks.push(JumpMark{p->framesDelivered, p->playCursor, p->framesAtChange, p->currentSpeed});
}

} // namespace

int64_t signal_reader(Player *p, float *destination, int64_t frames)
{
    // A loop at the range's edge needs a second pass; more cannot help.
    for (int pass = 0; pass < 3; ++pass) {
        if (!p->doc || !p->doc->signal) return 0;
        const int64_t read_before = p->readPosition;
        const int step = static_cast<int>(p->currentSpeed);
        if (p->view.visible && !p->fixedRange()) follow_document(p, step);
        account(p, read_before);
        const int stride = static_cast<int>(p->currentSpeed);
        const int64_t distance = stride > 0 ? reading_limit(p, stride) - p->readPosition
                                            : p->readPosition - reading_limit(p, stride);
        const int64_t available = std::clamp<int64_t>((distance + std::abs(stride) - 1) / std::abs(stride), 0, frames);
        int64_t n = available > 0 ? AUDIOSIGNAL_GetMaskedSamplesWithStep(p->doc->signal, p->channelMask,
                                                                         p->readPosition, destination, available,
                                                                         stride)
                                  : 0;
        n = std::max<int64_t>(n, 0);
        p->readPosition += n * stride;
        p->requestedPosition = p->readPosition;
        if (!(p->view.visible && p->loopOnSelection && !p->view.chunks.empty())) return n;
        if (stride > 0 && p->readPosition >= p->rangeEnd) p->requestedPosition = p->rangeBegin;
        if (stride < 0 && p->readPosition <= p->rangeBegin) p->requestedPosition = p->rangeEnd;
        if (n > 0) return n;
    }
    return 0;
}

int64_t block_reader(Player *p, float *destination, int64_t frames)
{
    while (Block *head = p->blocks) {
        const int64_t want = std::min(frames, head->end - head->current);
        const int64_t got = want > 0 && p->doc && p->doc->signal
                                ? AUDIOSIGNAL_GetMaskedSamples(p->doc->signal, p->channelMask, head->current,
                                                               destination, want)
                                : 0;
        if (got > 0) {
            head->current += got;
            return got;
        }
        // Finished (or cut short by an edit): on to the next block, whose
        // samples are heard once what was read before them has played.
        p->blocks = head->next;
        if (!p->blocks) p->blockTail = nullptr;
        head->next = p->freeBlocks;
        p->freeBlocks = head;
        if (p->blocks) {
            p->playCursor += p->blocks->begin - head->end;
            p->jumpMarks.push(JumpMark{p->framesDelivered, p->playCursor, p->framesAtChange, p->currentSpeed});
        }
    }
    return 0;
}

int64_t file_reader(Player *p, float *destination, int64_t frames)
{
    return p->file ? std::max<int64_t>(AUDIO_ReadIEEEFloat(p->file, destination, frames), 0) : 0;
}

void refresh_view(Player *p)
{
    VELMAUDIO doc = p->doc;
    if (!doc || !doc->state) return;
    DocumentView v;
    v.visible = VELMAUDIO_IsVisible(doc) != 0;
    v.selecting = VELMAUDIO_IsSelecting(doc) != 0;
    v.movingCursor = VELMAUDIO_IsMovingCursor(doc) != 0;
    v.viewBegin = VELMAUDIO_ViewBegin(doc);
    v.viewEnd = VELMAUDIO_ViewEnd(doc);
    v.limitBegin = VELMAUDIO_ViewBeginLimit(doc);
    v.limitEnd = VELMAUDIO_ViewEndLimit(doc);
    const int count = VELMAUDIO_SelectionChunkCount(doc);
    for (int i = 0; i < count; ++i)
        v.chunks.emplace_back(VELMAUDIO_SelectionChunkBegin(doc, i), VELMAUDIO_SelectionChunkEnd(doc, i));
    // Only a reader that follows the cursor may take the document's note
    // that the cursor moved.
    if (p->followCursor && v.visible && !p->fixedRange() && !p->playingRegion && !v.selecting && v.chunks.empty() &&
        VELMAUDIO_CursorPositionChanged(doc))
        v.cursorMove = VELMAUDIO_GetCursorChangedPosition(doc);
    std::lock_guard guard(p->lock);
    if (v.cursorMove < 0) v.cursorMove = p->view.cursorMove;
    std::swap(p->view, v);
}

int64_t start_position(Player *p)
{
    VELMAUDIO doc = p->doc;
    if (VELMAUDIO_IsSelecting(doc)) return VELMAUDIO_GetAnchorChangedPosition(doc);
    if (VELMAUDIO_SelectionChunkCount(doc) > 0) return VELMAUDIO_SelectionChunkBegin(doc, 0);
    AUDIOREGION *region = VELMAUDIO_GetCurrentRegion(doc);
    if (!region || !VELMAUDIO_IsRegionSelected(doc, region)) region = VELMAUDIO_GetRegionOnFocus(doc);
    if (region) {
        p->playingRegion = true;
        p->regionBegin = VELMAUDIO_GetRegionBeginSample(doc, region);
        p->regionEnd = VELMAUDIO_GetRegionEndSample(doc, region);
        return p->regionBegin;
    }
    const int64_t cursor = VELMAUDIO_GetCursorPosition(doc);
    if (cursor >= VELMAUDIO_ViewBegin(doc) && cursor < VELMAUDIO_ViewEnd(doc)) return cursor;
    return VELMAUDIO_ViewBegin(doc);
}

} // namespace velm::play

using namespace velm::play;

int VELMPLAY_AddBlock(VELMPLAYER handle, int64_t a, int64_t b, uint32_t block_flags)
{
    Player *p = live(handle);
    if (!p || !p->doc) return 0;
    const int64_t begin = std::min(a, b), end = std::max(a, b);
    if (begin < 0 || end > VELMAUDIO_NumSamples(p->doc)) return 0;
    std::lock_guard guard(p->lock);
    Block *block = p->freeBlocks;
    if (block)
        p->freeBlocks = block->next;
    else
        block = static_cast<Block *>(BLMEM_New(p->memory, sizeof(Block)));
    if (!block) return 0;
    *block = Block{begin, end, begin, block_flags, nullptr};
    if (p->blockTail)
        p->blockTail->next = block;
    else
        p->blocks = block, p->basePosition = begin;
    p->blockTail = block;
    p->fill = block_reader;
    p->rangeBegin = std::min(p->rangeBegin, begin);
    p->rangeEnd = std::max(p->rangeEnd, end);
    return 1;
}

int VELMPLAY_SetPlayRange(VELMPLAYER handle, int64_t a, int64_t b)
{
    Player *p = live(handle);
    if (!p || !p->doc || p->stream) return 0;
    std::lock_guard guard(p->lock);
    p->rangeEnd = std::min(std::max(a, b), VELMAUDIO_NumSamples(p->doc));
    p->rangeBegin = p->readPosition = p->requestedPosition = std::max<int64_t>(std::min(a, b), 0);
    p->flags |= VELMPLAY_FIXED_RANGE;
    return 1;
}
