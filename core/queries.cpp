// What a document answers about its file and signal.
#include "core/velmqueries.h"

#include <cstdio>

#include "core/document_internal.hpp"
#include "edit/velmundo.h"
#include "render/view/velmdraw.h"

namespace {

bool loaded(VELMAUDIO doc)
{
    return doc && doc->signal;
}

bool has_status(VELMAUDIO doc, uint32_t bit)
{
    return doc && doc->state && (doc->state->status & bit);
}

_audio_format format_of(VELMAUDIO doc)
{
    _audio_format f = AUDIO_NullFormat();
    if (loaded(doc)) AUDIOSIGNAL_GetFormat(doc->signal, &f);
    return f;
}

} // namespace

int VELMAUDIO_IsUnresolvedLink(VELMAUDIO doc)
{
    return has_status(doc, STATUS_UNRESOLVED_LINK) ? 1 : 0;
}

int VELMAUDIO_HasFileName(VELMAUDIO doc)
{
    return has_status(doc, STATUS_HAS_FILE) ? 1 : 0;
}

int VELMAUDIO_ClearChangedState(VELMAUDIO doc)
{
    return VELMSTATE_ResetChanges(doc);
}

const char *VELMAUDIO_GetFileFormatLabel(VELMAUDIO doc)
{
    if (!loaded(doc)) return nullptr;
    const _audio_format f = format_of(doc);
    const char *container = AUDIODEF_ContainerString(f.containerKind);
    const char *coding = AUDIODEF_AudioFormatString(f.audioFormatKind);
    if (!coding) return nullptr;
    if (container)
        std::snprintf(doc->formatLabel, sizeof doc->formatLabel, "%s / %s", container, coding);
    else
        std::snprintf(doc->formatLabel, sizeof doc->formatLabel, "%s", coding);
    return doc->formatLabel;
}

int64_t VELMAUDIO_GetFileSize(VELMAUDIO doc)
{
    return loaded(doc) ? AUDIOSIGNAL_SizeInDisk(doc->signal) : -1;
}

int64_t VELMAUDIO_GetFileId(VELMAUDIO doc)
{
    return doc && doc->state ? doc->state->fileId : -1;
}

uint64_t VELMAUDIO_GetFileTime(VELMAUDIO doc)
{
    return doc ? doc->fileStamp : 0;
}

uint64_t VELMAUDIO_GetChangeTime(VELMAUDIO doc)
{
    return doc && doc->state ? doc->state->changeStamp : 0;
}

int VELMAUDIO_ResetAudioFileStamp(VELMAUDIO doc)
{
    if (!has_status(doc, STATUS_HAS_FILE)) return 0;
    doc->fileStamp = BLUTIL_GetFileTime(doc->fileName, 2);
    return 1;
}

int VELMAUDIO_GetExternalChangeStatus(VELMAUDIO doc)
{
    if (!doc || !doc->state) return 0;
    if (!has_status(doc, STATUS_HAS_FILE) || BLIO_GetHFileKind(doc->fileName) != 1) {
        if (has_status(doc, STATUS_HAS_FILE) && !BLIO_FileExists(doc->fileName))
            return has_status(doc, STATUS_MODIFIED) ? VELM_FILE_MISSING_MODIFIED : VELM_FILE_MISSING;
        return VELM_FILE_UNCHANGED;
    }
    if (BLUTIL_GetFileTime(doc->fileName, 2) != doc->fileStamp)
        return has_status(doc, STATUS_MODIFIED) ? VELM_FILE_CHANGED_MODIFIED : VELM_FILE_CHANGED;
    return VELM_FILE_UNCHANGED;
}

int64_t VELMAUDIO_NumSamples(VELMAUDIO doc)
{
    return loaded(doc) ? AUDIOSIGNAL_NumSamples(doc->signal) : 0;
}

int VELMAUDIO_SampleRate(VELMAUDIO doc)
{
    return loaded(doc) ? format_of(doc).sampleRate : 0;
}

int VELMAUDIO_NumChannels(VELMAUDIO doc)
{
    return loaded(doc) ? format_of(doc).numChannels : 0;
}

int VELMAUDIO_NumActiveChannels(VELMAUDIO doc)
{
    return loaded(doc) ? AUDIOSIGNAL_NumActiveChannels(doc->signal) : 0;
}

uint32_t VELMAUDIO_ActiveChannelsMask(VELMAUDIO doc)
{
    return loaded(doc) ? AUDIOSIGNAL_GetActiveChannelMask(doc->signal) : 0;
}

int VELMAUDIO_GetAudioProperty(VELMAUDIO doc, int kind, void *out)
{
    if (!loaded(doc) || !out) return 0;
    const _audio_format f = format_of(doc);
    switch (kind) {
    case 0: *static_cast<int32_t *>(out) = f.sampleRate; return 1;
    case 1: *static_cast<int32_t *>(out) = f.numChannels; return 1;
    case 2: *static_cast<int32_t *>(out) = AUDIOSIGNAL_NumActiveChannels(doc->signal); return 1;
    case 3: *static_cast<int32_t *>(out) = f.bitsPerSample; return 1;
    case 4: *static_cast<AUDIOSIGNAL **>(out) = doc->signal; return 1;
    default: return 0;
    }
}

_audio_format *VELMAUDIO_GetSignalFormat(_audio_format *out, VELMAUDIO doc)
{
    if (!out) return nullptr;
    if (!loaded(doc) || !AUDIOSIGNAL_GetFormat(doc->signal, out)) *out = AUDIO_InitFormat(0, 0, 0);
    return out;
}

int VELMAUDIO_GetFormatString(VELMAUDIO doc, char *buffer, int size)
{
    return loaded(doc) ? AUDIOSIGNAL_GetFormatString(doc->signal, buffer, size) : 0;
}

uint32_t VELMAUDIO_FormatFilterMask(VELMAUDIO doc)
{
    if (!loaded(doc)) return 0;
    const _audio_format f = format_of(doc);
    return AUDIO_FormatFilterMaskFromAudioFormat(&f);
}

int VELMAUDIO_ReadOnly(VELMAUDIO doc)
{
    return loaded(doc) ? AUDIOSIGNAL_ReadOnly(doc->signal) : 0;
}

int VELMAUDIO_HasValidHash(VELMAUDIO doc)
{
    return loaded(doc) ? AUDIOSIGNAL_HasValidHash(doc->signal) : 0;
}

AUDIOSIGNAL_HASH *VELMAUDIO_GetSignalHash(VELMAUDIO doc, AUDIOSIGNAL_HASH *out)
{
    return loaded(doc) && out ? AUDIOSIGNAL_GetSignalHash(out, doc->signal) : nullptr;
}

int64_t VELMAUDIO_SizeInMemory(VELMAUDIO doc)
{
    if (!doc) return 0;
    int64_t total = BLMEM_SizeInMemory(doc->pool);
    if (doc->signal) total += AUDIOSIGNAL_SizeInMemory(doc->signal);
    if (doc->renderer) total += VELMDRAW_SizeInMemory(doc->renderer);
    total += VELMUNDO_SizeInMemory(doc);
    return total;
}

int VELMAUDIO_FreeMemory(VELMAUDIO doc)
{
    if (!doc) return 0;
    const int64_t before = VELMAUDIO_SizeInMemory(doc);
    int ok = doc->signal ? AUDIOSIGNAL_FreeDataMemory(doc->signal) : 1;
    if (doc->undo && !VELMUNDO_FreeMemory(doc)) ok = 0;
    // The renderer is made again at the next draw.
    if (doc->renderer && !doc->drawing) {
        VELMDRAW_Destroy(doc->renderer);
        doc->renderer = nullptr;
    }
    const int64_t after = VELMAUDIO_SizeInMemory(doc);
    BLDEBUG_Log(-1, "Size change: %lld -> %lld (%lld bytes freed)", static_cast<long long>(before),
                static_cast<long long>(after), static_cast<long long>(before - after));
    return ok ? 1 : 0;
}
