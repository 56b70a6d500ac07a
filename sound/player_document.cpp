// The document's player: starting playback of the selections, the view or a
// range, and the calls that forward to the linked player.
#include <algorithm>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "edit/velmselection.h"
#include "sound/player_internal.hpp"

namespace {

VELMPLAYER player_of(VELMAUDIO doc)
{
    return doc ? static_cast<VELMPLAYER>(doc->player) : nullptr;
}

// The range a start mode plays; false for an unknown mode or, in mode 0,
// a document without selections.
bool play_range(VELMAUDIO doc, uint32_t mode, int64_t begin, int64_t end, int64_t &lo, int64_t &hi)
{
    const int64_t low = VELMAUDIO_ViewBeginLimit(doc), high = VELMAUDIO_ViewEndLimit(doc);
    switch (mode) {
    case VELMPLAY_MODE_SELECTIONS: return VELMAUDIO_SelectionChunkCount(doc) > 0;
    case VELMPLAY_MODE_LIMITS: lo = low, hi = high; return true;
    case VELMPLAY_MODE_FROM_VIEW: lo = VELMAUDIO_ViewBegin(doc), hi = high; return true;
    case VELMPLAY_MODE_RANGE:
        lo = std::max(std::min(begin, high), low);
        hi = std::max(std::min(end, high), low);
        return true;
    default: return false;
    }
}

bool add_blocks(VELMAUDIO doc, VELMPLAYER player, uint32_t flags, int64_t lo, int64_t hi)
{
    if ((flags & VELMPLAY_MODE_MASK) == VELMPLAY_MODE_SELECTIONS) {
        const int count = VELMAUDIO_SelectionChunkCount(doc);
        for (int i = 0; i < count; ++i)
            if (!VELMPLAY_AddBlock(player, VELMAUDIO_SelectionChunkBegin(doc, i), VELMAUDIO_SelectionChunkEnd(doc, i), 0))
                return false;
        return true;
    }
    const int64_t cursor = VELMAUDIO_GetCursorPosition(doc);
    if (cursor > std::min(lo, hi) && cursor < std::max(lo, hi)) {
        if (flags & VELMPLAY_FROM_CURSOR)
            lo = cursor;
        else if (flags & VELMPLAY_TO_CURSOR)
            hi = cursor;
    }
    return VELMPLAY_AddBlock(player, lo, hi, 0) != 0;
}

} // namespace

int VELMAUDIO_PlayStart(VELMAUDIO doc, uint32_t flags, int64_t begin, int64_t end)
{
    if (!doc || !doc->signal || VELMAUDIO_NumSamples(doc) <= 0) return 0;
    if (doc->player && !VELMAUDIO_PlayStop(doc)) return 0;
    int64_t lo = 0, hi = 0;
    if (!play_range(doc, flags & VELMPLAY_MODE_MASK, begin, end, lo, hi)) return 0;
    VELMPLAYER player = VELMPLAY_CreatePlayer(doc, flags);
    if (!player) return 0;
    if (flags & VELMPLAY_CHANNEL_MASK) VELMPLAY_SetChannelMask(player, (flags >> 5) & 0x7FFu);
    if (!add_blocks(doc, player, flags, lo, hi) || !VELMPLAY_Start(player)) {
        VELMPLAY_DestroyPlayer(player);
        return 0;
    }
    doc->player = player;
    return 1;
}

int VELMAUDIO_PlayStop(VELMAUDIO doc)
{
    VELMPLAYER player = player_of(doc);
    if (!player) return 0;
    // A player that already stopped (or never started) only needs to go.
    const int status = VELMPLAY_GetStatus(player);
    if ((status == VELMPLAY_STATUS_PLAYING || status == VELMPLAY_STATUS_OPENED) && !VELMPLAY_Stop(player)) return 0;
    VELMPLAY_DestroyPlayer(player);
    doc->player = nullptr;
    return 1;
}

int VELMAUDIO_PlayPause(VELMAUDIO doc)
{
    return VELMPLAY_Pause(player_of(doc));
}

int VELMAUDIO_PlayResume(VELMAUDIO doc)
{
    return VELMPLAY_Resume(player_of(doc));
}

int VELMAUDIO_PlayWait(VELMAUDIO doc)
{
    return VELMPLAY_Wait(player_of(doc));
}

int VELMAUDIO_IsPlaying(VELMAUDIO doc)
{
    return VELMPLAY_IsPlaying(player_of(doc));
}

int VELMAUDIO_IsPaused(VELMAUDIO doc)
{
    return VELMPLAY_IsPaused(player_of(doc));
}

int VELMAUDIO_GetPlayStatus(VELMAUDIO doc)
{
    return VELMPLAY_GetStatus(player_of(doc));
}

VELMPLAYER VELMAUDIO_Player(VELMAUDIO doc)
{
    return player_of(doc);
}

int VELMAUDIO_LinkPlayer(VELMAUDIO doc, VELMPLAYER player)
{
    // Only a document's own player: destroying it unlinks it from there.
    const velm::play::Player *p = velm::play::live(player);
    if (!doc || !p || p->doc != doc || doc->player) return 0;
    doc->player = player;
    return 1;
}

int VELMAUDIO_UnlinkPlayer(VELMAUDIO doc, VELMPLAYER player)
{
    if (!doc || !player || doc->player != player) return 0;
    doc->player = nullptr;
    return 1;
}
