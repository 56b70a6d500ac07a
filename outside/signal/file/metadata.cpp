// AUDIOMETADATA: named fields, free texts and binary entries.  Named fields
// are free texts under fixed keys, so AUDIOMETADATA_GetMetaData(meta,
// "title") answers the title too.
#include "outside/signal/file/metadata_internal.hpp"

#include <algorithm>
#include <cctype>
#include <map>
#include <new>
#include <string>
#include <vector>

struct _audio_metadata {
    std::map<std::string, std::string> text;
    std::map<std::string, std::vector<unsigned char>> binary;
};

namespace velmsig {

namespace {

constexpr const char kTitle[] = "title";
constexpr const char kArtist[] = "artist";
constexpr const char kAlbumArtist[] = "albumartist";
constexpr const char kAlbum[] = "album";
constexpr const char kComposer[] = "composer";
constexpr const char kTrack[] = "tracknumber";
constexpr const char kTotalTracks[] = "totaltracks";
constexpr const char kDisc[] = "discnumber";
constexpr const char kTotalDiscs[] = "totaldiscs";
constexpr const char kGenre[] = "genre";

struct SndfileString {
    int id;
    const char *key;
};
constexpr SndfileString kSndfileStrings[] = {
    {SF_STR_TITLE, kTitle},      {SF_STR_ARTIST, kArtist},    {SF_STR_ALBUM, kAlbum},
    {SF_STR_TRACKNUMBER, kTrack}, {SF_STR_GENRE, kGenre},     {SF_STR_COMMENT, "comment"},
    {SF_STR_COPYRIGHT, "copyright"}, {SF_STR_DATE, "date"},  {SF_STR_SOFTWARE, "software"},
    {SF_STR_LICENSE, "license"},
};

std::string lower(const char *key) {
    std::string k(key);
    std::transform(k.begin(), k.end(), k.begin(), [](unsigned char c) { return std::tolower(c); });
    return k;
}

int set_text(AUDIOMETADATA *meta, const char *key, const char *value) {
    if (!meta || !key || !*key) return 0;
    try {
        if (value)
            meta->text[lower(key)] = value;
        else
            meta->text.erase(lower(key));
    } catch (const std::bad_alloc &) {
        return 0;
    }
    return 1;
}

const char *get_text(const AUDIOMETADATA *meta, const char *key) {
    if (!meta || !key) return nullptr;
    auto it = meta->text.find(lower(key));
    return it == meta->text.end() ? nullptr : it->second.c_str();
}

}  // namespace

AUDIOMETADATA *metadata_from_sndfile(SNDFILE *file) {
    AUDIOMETADATA *meta = nullptr;
    for (const auto &s : kSndfileStrings) {
        const char *value = sf_get_string(file, s.id);
        if (!value || !*value) continue;
        if (!meta) meta = new (std::nothrow) AUDIOMETADATA;
        if (!meta) return nullptr;
        set_text(meta, s.key, value);
    }
    return meta;
}

void metadata_to_sndfile(SNDFILE *file, const AUDIOMETADATA *meta) {
    if (!meta) return;
    for (const auto &s : kSndfileStrings)
        if (const char *value = get_text(meta, s.key)) sf_set_string(file, s.id, value);
}

}  // namespace velmsig

using namespace velmsig;

extern "C" {

AUDIO_API AUDIOMETADATA *AUDIOMETADATA_Create(void) { return new (std::nothrow) AUDIOMETADATA; }

AUDIO_API AUDIOMETADATA *AUDIOMETADATA_Duplicate(const AUDIOMETADATA *meta) {
    if (!meta) return nullptr;
    try {
        return new AUDIOMETADATA(*meta);
    } catch (const std::bad_alloc &) {
        return nullptr;
    }
}

AUDIO_API int AUDIOMETADATA_Destroy(AUDIOMETADATA *meta) {
    if (!meta) return 0;
    delete meta;
    return 1;
}

AUDIO_API int AUDIOMETADATA_IsEmpty(const AUDIOMETADATA *meta) {
    return !meta || (meta->text.empty() && meta->binary.empty());
}

#define VELM_METADATA_FIELD(Name, key)                                                         \
    AUDIO_API int AUDIOMETADATA_Set##Name(AUDIOMETADATA *meta, const char *text) {             \
        return text ? set_text(meta, key, text) : 0;                                           \
    }                                                                                          \
    AUDIO_API const char *AUDIOMETADATA_Get##Name(const AUDIOMETADATA *meta) { return get_text(meta, key); }

VELM_METADATA_FIELD(Title, kTitle)
VELM_METADATA_FIELD(Artist, kArtist)
VELM_METADATA_FIELD(AlbumArtist, kAlbumArtist)
VELM_METADATA_FIELD(AlbumName, kAlbum)
VELM_METADATA_FIELD(Composer, kComposer)
VELM_METADATA_FIELD(TrackNum, kTrack)
VELM_METADATA_FIELD(TotalAlbumTracks, kTotalTracks)
VELM_METADATA_FIELD(DiscNum, kDisc)
VELM_METADATA_FIELD(TotalAlbumDiscs, kTotalDiscs)
VELM_METADATA_FIELD(Genre, kGenre)

#undef VELM_METADATA_FIELD

AUDIO_API int AUDIOMETADATA_SetMetaData(AUDIOMETADATA *meta, const char *key, const char *value) {
    return set_text(meta, key, value);
}

AUDIO_API const char *AUDIOMETADATA_GetMetaData(const AUDIOMETADATA *meta, const char *key) {
    return get_text(meta, key);
}

AUDIO_API int AUDIOMETADATA_SetBinaryMetaData(AUDIOMETADATA *meta, const char *key, const void *data, int size) {
    if (!meta || !key || !*key || (data && (size < 0 || size > AUDIOMETADATA_MAX_BINARY_SIZE))) return 0;
    try {
        if (!data) {
            meta->binary.erase(lower(key));
            return 1;
        }
        auto *bytes = static_cast<const unsigned char *>(data);
        meta->binary[lower(key)].assign(bytes, bytes + size);
    } catch (const std::bad_alloc &) {
        return 0;
    }
    return 1;
}

AUDIO_API const void *AUDIOMETADATA_GetBinaryMetaData(const AUDIOMETADATA *meta, const char *key, int *size) {
    if (size) *size = 0;
    if (!meta || !key) return nullptr;
    auto it = meta->binary.find(lower(key));
    if (it == meta->binary.end()) return nullptr;
    if (size) *size = static_cast<int>(it->second.size());
    // An empty entry still answers non-null so that it differs from "unset".
    return it->second.empty() ? static_cast<const void *>(&it->second) : it->second.data();
}

}  // extern "C"
