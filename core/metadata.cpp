// A document's metadata: forwarded to its signal's metadata object, which the
// setters create on demand and the getters never do.
#include "core/document_internal.hpp"
#include "core/velmqueries.h"

namespace {

AUDIOMETADATA *metadata(VELMAUDIO doc, bool create)
{
    if (!doc || !doc->signal) return nullptr;
    AUDIOMETADATA *meta = AUDIOSIGNAL_GetMetaData(doc->signal);
    if (!meta && create) {
        meta = AUDIOMETADATA_Create();
        if (meta && !AUDIOSIGNAL_SetMetaData(doc->signal, meta)) {
            AUDIOMETADATA_Destroy(meta);
            meta = nullptr;
        }
    }
    return meta;
}

int set(VELMAUDIO doc, int (*setter)(AUDIOMETADATA *, const char *), const char *text)
{
    AUDIOMETADATA *meta = metadata(doc, true);
    return meta ? setter(meta, text) : 0;
}

const char *get(VELMAUDIO doc, const char *(*getter)(const AUDIOMETADATA *))
{
    const AUDIOMETADATA *meta = metadata(doc, false);
    return meta ? getter(meta) : nullptr;
}

} // namespace

int VELMAUDIO_SetTitle(VELMAUDIO doc, const char *t) { return set(doc, AUDIOMETADATA_SetTitle, t); }
int VELMAUDIO_SetArtist(VELMAUDIO doc, const char *t) { return set(doc, AUDIOMETADATA_SetArtist, t); }
int VELMAUDIO_SetAlbumArtist(VELMAUDIO doc, const char *t) { return set(doc, AUDIOMETADATA_SetAlbumArtist, t); }
int VELMAUDIO_SetAlbumName(VELMAUDIO doc, const char *t) { return set(doc, AUDIOMETADATA_SetAlbumName, t); }
int VELMAUDIO_SetComposer(VELMAUDIO doc, const char *t) { return set(doc, AUDIOMETADATA_SetComposer, t); }
int VELMAUDIO_SetTrackNum(VELMAUDIO doc, const char *t) { return set(doc, AUDIOMETADATA_SetTrackNum, t); }
int VELMAUDIO_SetTotalAlbumTracks(VELMAUDIO doc, const char *t) { return set(doc, AUDIOMETADATA_SetTotalAlbumTracks, t); }
int VELMAUDIO_SetDiscNum(VELMAUDIO doc, const char *t) { return set(doc, AUDIOMETADATA_SetDiscNum, t); }
int VELMAUDIO_SetTotalAlbumDiscs(VELMAUDIO doc, const char *t) { return set(doc, AUDIOMETADATA_SetTotalAlbumDiscs, t); }
int VELMAUDIO_SetGenre(VELMAUDIO doc, const char *t) { return set(doc, AUDIOMETADATA_SetGenre, t); }

const char *VELMAUDIO_GetTitle(VELMAUDIO doc) { return get(doc, AUDIOMETADATA_GetTitle); }
const char *VELMAUDIO_GetArtist(VELMAUDIO doc) { return get(doc, AUDIOMETADATA_GetArtist); }
const char *VELMAUDIO_GetAlbumArtist(VELMAUDIO doc) { return get(doc, AUDIOMETADATA_GetAlbumArtist); }
const char *VELMAUDIO_GetAlbumName(VELMAUDIO doc) { return get(doc, AUDIOMETADATA_GetAlbumName); }
const char *VELMAUDIO_GetComposer(VELMAUDIO doc) { return get(doc, AUDIOMETADATA_GetComposer); }
const char *VELMAUDIO_GetTrackNum(VELMAUDIO doc) { return get(doc, AUDIOMETADATA_GetTrackNum); }
const char *VELMAUDIO_GetTotalAlbumTracks(VELMAUDIO doc) { return get(doc, AUDIOMETADATA_GetTotalAlbumTracks); }
const char *VELMAUDIO_GetDiscNum(VELMAUDIO doc) { return get(doc, AUDIOMETADATA_GetDiscNum); }
const char *VELMAUDIO_GetTotalAlbumDiscs(VELMAUDIO doc) { return get(doc, AUDIOMETADATA_GetTotalAlbumDiscs); }
const char *VELMAUDIO_GetGenre(VELMAUDIO doc) { return get(doc, AUDIOMETADATA_GetGenre); }

int VELMAUDIO_SetMetaData(VELMAUDIO doc, const char *key, const char *value)
{
    AUDIOMETADATA *meta = metadata(doc, true);
    return meta ? AUDIOMETADATA_SetMetaData(meta, key, value) : 0;
}

int VELMAUDIO_SetBinaryMetaData(VELMAUDIO doc, const char *key, const void *data, int size)
{
    AUDIOMETADATA *meta = metadata(doc, true);
    return meta ? AUDIOMETADATA_SetBinaryMetaData(meta, key, data, size) : 0;
}

const char *VELMAUDIO_GetMetaData(VELMAUDIO doc, const char *key)
{
    const AUDIOMETADATA *meta = metadata(doc, false);
    return meta ? AUDIOMETADATA_GetMetaData(meta, key) : nullptr;
}

const void *VELMAUDIO_GetBinaryMetaData(VELMAUDIO doc, const char *key, int *size)
{
    const AUDIOMETADATA *meta = metadata(doc, false);
    return meta ? AUDIOMETADATA_GetBinaryMetaData(meta, key, size) : nullptr;
}
