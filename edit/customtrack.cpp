// The document's table of custom tracks and the option texts of a track.
#include "edit/velmcustomtrack.h"

#include <cctype>
#include <cstdlib>
#include <cstring>
#include <string>

#include "core/document_internal.hpp"

namespace {

struct OptionToken {
    uint32_t flag;
    const char *token;
};

// Encoding order; the centre alignments decode to nothing and are never written.
const OptionToken kTokens[] = {
    {VELMTRACK_NOHORZGRID, "|NOHORZGRID|"},
    {VELMTRACK_NOSHOWAUDIOSELECTION, "|NOSHOWAUDIOSELECTION|"},
    {VELMTRACK_RGNSQUARECORNER, "|RGNSQUARECORNER|"},
    {VELMTRACK_SHOWRGNLABEL, "|SHOWRGNLABEL|"},
    {VELMTRACK_SHOWRGNCOMMENT, "|SHOWRGNCOMMENT|"},
    {VELMTRACK_NOOFFSETONRGNMOVE, "|NOOFFSETONRGNMOVE|"},
    {VELMTRACK_NOOFFSETONRGNSELECTION, "|NOOFFSETONRGNSELECTION|"},
    {VELMTRACK_ALIGNLABELLEFT, "|ALIGNLABELLEFT|"},
    {VELMTRACK_ALIGNLABELRIGHT, "|ALIGNLABELRIGHT|"},
    {VELMTRACK_ALIGNCOMMENTLEFT, "|ALIGNCOMMENTLEFT|"},
    {VELMTRACK_ALIGNCOMMENTRIGHT, "|ALIGNCOMMENTRIGHT|"},
    {VELMTRACK_ALLOWPARTIALTEXT, "|ALLOWPARTIALTEXT|"},
    {VELMTRACK_USEPHONETICFONT, "|USEPHONETICFONT|"},
};

bool same_identifier(const VELMCUSTOMTRACK &slot, const char *identifier)
{
    return std::strncmp(slot.name, identifier, VELM_TRACKNAME_SIZE) == 0;
}

int find_position(VELMAUDIO doc, const char *identifier)
{
    if (!doc || !identifier) return -1;
    for (int i = 0; i < doc->customTrackCount; ++i)
        if (doc->customTracks[i].inUse && same_identifier(doc->customTracks[i], identifier)) return i;
    return -1;
}

} // namespace

int VELMAUDIO_AddCustomTrack(VELMAUDIO doc, const char *identifier)
{
    if (!doc || !identifier) return -1;
    const int found = find_position(doc, identifier);
    if (found >= 0) return doc->customTracks[found].id;
    if (doc->customTrackCount >= VELM_MAX_CUSTOM_TRACKS) return -1;
    VELMCUSTOMTRACK &slot = doc->customTracks[doc->customTrackCount++];
    slot.inUse = 1;
    velm::copy_text(slot.name, sizeof slot.name, identifier);
    return slot.id;
}

int VELMAUDIO_RemoveCustomTrack(VELMAUDIO doc, const char *identifier)
{
    if (!doc || doc->customTrackCount == 0 || !doc->customTracks[0].inUse) return 0;
    const int position = find_position(doc, identifier);
    if (position < 0) return 0;
    const int last = --doc->customTrackCount;
    VELMCUSTOMTRACK freed = doc->customTracks[position];
    freed.inUse = 0;
    freed.name[0] = '\0';
    if (position != last) doc->customTracks[position] = doc->customTracks[last];
    doc->customTracks[last] = freed;
    return 1;
}

int VELMAUDIO_FindCustomTrackId(VELMAUDIO doc, const char *identifier)
{
    const int position = find_position(doc, identifier);
    return position >= 0 ? doc->customTracks[position].id : -1;
}

int VELMAUDIO_ExistCustomTrack(VELMAUDIO doc, const char *identifier)
{
    return find_position(doc, identifier) >= 0 ? 1 : 0;
}

int VELMAUDIO_CustomTrackPosition(VELMAUDIO doc, const char *identifier)
{
    return find_position(doc, identifier);
}

const char *VELMAUDIO_GetCustomTrackUniqId(VELMAUDIO doc, int track)
{
    if (!doc) return nullptr;
    for (int i = 0; i < doc->customTrackCount; ++i)
        if (doc->customTracks[i].inUse && doc->customTracks[i].id == track) return doc->customTracks[i].name;
    return nullptr;
}

int VELMAUDIO_NumCustomTracks(VELMAUDIO doc)
{
    return doc ? doc->customTrackCount : 0;
}

const VELMCUSTOMTRACK *VELMAUDIO_CustomTrackInPosition(VELMAUDIO doc, int position)
{
    if (!doc || position < 0 || position >= doc->customTrackCount) return nullptr;
    return &doc->customTracks[position];
}

const char *VELMAUDIO_CustomTrackIdentifierInPosition(VELMAUDIO doc, int position)
{
    const VELMCUSTOMTRACK *slot = VELMAUDIO_CustomTrackInPosition(doc, position);
    return slot ? slot->name : nullptr;
}

uint32_t VELMDEFINES_DecodeCustomTrackOption(const char *text)
{
    if (!text) return 0;
    const long number = std::strtol(text, nullptr, 10);
    if (number != 0) return static_cast<uint32_t>(number);
    std::string normal = "|";
    for (const char *p = text; *p; ++p)
        if (*p != ' ' && *p != '_') normal += static_cast<char>(std::toupper(static_cast<unsigned char>(*p)));
    normal += '|';
    uint32_t flags = 0;
    for (const OptionToken &t : kTokens)
        if (normal.find(t.token) != std::string::npos) flags |= t.flag;
    return flags;
}

int VELMDEFINES_EncodeCustomTrackOption(uint32_t flags, char *buffer, int size)
{
    if (!buffer || size <= 0) return 0;
    buffer[0] = '\0';
    size_t used = 0;
    for (const OptionToken &t : kTokens) {
        if (!(flags & t.flag)) continue;
        for (const char *c = t.token; *c && used + 1 < static_cast<size_t>(size); ++c) buffer[used++] = *c;
        buffer[used] = '\0';
    }
    return 1;
}
