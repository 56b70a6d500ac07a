// Audio documents: creation, binding to files, loading, saving, reverting,
// unloading and closing, with reference counting.
#include <cstdio>
#include <cstring>
#include <string>

#include "core/document_internal.hpp"
#include "render/view/velmdraw.h"
#include "core/startup_internal.hpp"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "edit/velmcustomtrack.h"
#include "edit/velmregion.h"
#include "edit/velmundo.h"
#include "outside/signal/audiosignal.h"
#include "sound/player_internal.hpp"
#include "sound/recorder_guard.hpp"

static int release_reference(VELMAUDIO doc);

namespace {

int untitled_counter = 1;

// The object registry disposes of documents still open at shut-down, having
// already forgotten them.
int dispose_document(void *doc)
{
    return release_reference(static_cast<VELMAUDIO>(doc));
}

VELMAUDIO create_record()
{
    BLMEM pool = BLMEM_CreateMemDescrEx("VELMAUDIO Data Memory", 0, 8);
    if (!pool) return nullptr;
    auto *doc = static_cast<VELMAUDIO>(BLMEM_New(pool, sizeof(_VELMAUDIO)));
    if (!doc) {
        BLMEM_DisposeMemDescr(pool);
        return nullptr;
    }
    doc->pool = pool;
    doc->state = VELMSTATE_Create();
    doc->formatCapabilities = 0x7FFFFF00u;
    doc->dispatcher = BLNOTIFY_CreateDispatcher(doc);
    doc->settings = BLSETTINGS_Create();
    doc->references = 1;
    doc->referenceLock = MutexInit();
    for (int i = 0; i < VELM_MAX_CUSTOM_TRACKS; ++i) doc->customTracks[i].id = i;
    doc->options = OPTION_EDITABLE;
    if (!doc->state || !doc->dispatcher || !doc->settings || !doc->referenceLock) {
        velm::close_document(doc);
        return nullptr;
    }
    VELMCONFIG_ApplyStateConfiguration(doc, doc->state);
    VELMAUDIO_AddCustomTrack(doc, "default");
    return doc;
}

void name_untitled(VELMAUDIO doc)
{
    const int n = untitled_counter++;
    if (n == 1)
        velm::copy_text(doc->fileName, sizeof doc->fileName, "untitled");
    else
        std::snprintf(doc->fileName, sizeof doc->fileName, "untitled %d", n);
}

void reset_view(VELMAUDIO doc)
{
    VELMAUDIO_ResetZoomLimits(doc);
    VELMAUDIO_ZoomFullReset(doc);
    VELMAUDIO_SetCursorPosition(doc, 0);
}

VELMAUDIO finish_new(VELMAUDIO doc, AUDIOSIGNAL *signal, bool from_signal)
{
    name_untitled(doc);
    VELMAUDIO_SetAudioSignal(doc, signal);
    doc->state->changeStamp = AUDIOSIGNAL_GetTimeStamp(signal, 0);
    doc->savedStamp = from_signal ? 0 : doc->state->changeStamp;
    doc->fileStamp = 0;
    reset_view(doc);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_EVERYTHING);
    RegisterObject(doc, 0, dispose_document);
    return doc;
}

// A file whose container is a settings document keeps the document's settings.
void bind_settings_to_file(VELMAUDIO doc, bool fresh)
{
    if (fresh && doc->settings) {
        BLSETTINGS_Destroy(doc->settings);
        doc->settings = nullptr;
        doc->settingsActive = 0;
    }
    if (!doc->settings) doc->settings = BLSETTINGS_Create();
    if (doc->settings) BLSETTINGS_SetConfigFileEx(doc->settings, doc->fileName, "ini");
}

bool is_settings_document(AUDIOSIGNAL *signal)
{
    _audio_format format;
    return AUDIOSIGNAL_GetFormat(signal, &format) && format.containerKind == AUDIO_CONTAINER_LINK;
}

// Replaces the first "AUTO" of a format text, keeping the text within its buffer.
void replace_auto(char *text, size_t size, const char *name)
{
    char *at = std::strstr(text, "AUTO");
    if (!at || !name) return;
    std::string replaced(text, static_cast<size_t>(at - text));
    replaced += name;
    replaced += at + 4;
    velm::copy_text(text, size, replaced.c_str());
}

// Puts the detected format's name in place of "AUTO" and notes what the file can hold.
void adopt_file_format(VELMAUDIO doc, AUDIOSIGNAL *signal, bool rename_auto)
{
    _audio_format format;
    if (!AUDIOSIGNAL_GetFormat(signal, &format)) return;
    int index = 0;
    const AUDIO_FORMAT_DESCR *descr = AUDIO_GetFormatDescr(&format, &index);
    if (!descr) return;
    if (rename_auto && index >= 0 && index < descr->numEntries)
        replace_auto(doc->fileFormat, sizeof doc->fileFormat, descr->entries[index].name);
    doc->formatCapabilities = descr->flags & 0x7FFFFF00u;
}

void send_global(uint32_t code, VELMAUDIO doc, void *data)
{
    BLNOTIFY_SendEvent(nullptr, nullptr, 0, code, doc, data);
}

} // namespace

namespace velm {

void copy_text(char *buffer, size_t size, const char *text)
{
    if (!buffer || size == 0) return;
    if (!text) text = "";
    std::snprintf(buffer, size, "%s", text);
}

int close_document(VELMAUDIO doc)
{
    UnRegisterObject(doc);
    // No player may read the document once it is gone; a closing document
    // takes its players with it, unasked.
    play::destroy_players_of(doc);
    if (doc->dispatcher) {
        BLNOTIFY_DestroyDispatcher(doc->dispatcher);
        doc->dispatcher = nullptr;
    }
    VELMDRAW_Destroy(doc->renderer);
    doc->renderer = nullptr;
    if (doc->signal) AUDIOSIGNAL_Destroy(doc->signal);
    if (doc->state) VELMSTATE_Destroy(doc->state);
    VELMUNDO_DestroyStack(doc);
    if (doc->settings) {
        if (doc->settingsActive) BLSETTINGS_Remove(doc->settings);
        BLSETTINGS_Destroy(doc->settings);
    }
    if (doc->referenceLock) MutexDestroy(doc->referenceLock);
    BLMEM_DisposeMemDescr(doc->pool);
    return 1;
}

} // namespace velm

VELMAUDIO VELMAUDIO_New(const _audio_format *format)
{
    if (!format) return nullptr;
    AUDIOSIGNAL *signal = AUDIOSIGNAL_New(format);
    if (!signal) return nullptr;
    VELMAUDIO doc = create_record();
    if (!doc) {
        AUDIOSIGNAL_Destroy(signal);
        return nullptr;
    }
    return finish_new(doc, signal, false);
}

VELMAUDIO VELMAUDIO_NewFromSignal(AUDIOSIGNAL *signal, int duplicate)
{
    if (!signal) return nullptr;
    AUDIOSIGNAL *own = duplicate ? AUDIOSIGNAL_DuplicateEx(signal, 0) : signal;
    if (!own) return nullptr;
    VELMAUDIO doc = create_record();
    if (!doc) {
        if (duplicate) AUDIOSIGNAL_Destroy(own);
        return nullptr;
    }
    return finish_new(doc, own, true);
}

VELMAUDIO VELMAUDIO_CreateUnresolvedLink(void)
{
    VELMAUDIO doc = create_record();
    if (!doc) return nullptr;
    doc->state->status |= STATUS_UNRESOLVED_LINK;
    VELMAUDIO_SetAudioSignal(doc, nullptr);
    RegisterObject(doc, 0, dispose_document);
    return doc;
}

int VELMAUDIO_Link(VELMAUDIO doc, const char *file_name, const char *format)
{
    if (!doc || !file_name || !format || doc->signal || !(doc->state->status & STATUS_UNRESOLVED_LINK)) return 0;
    velm::copy_text(doc->fileName, sizeof doc->fileName, file_name);
    velm::copy_text(doc->fileFormat, sizeof doc->fileFormat, format);
    doc->state->status = (doc->state->status | STATUS_HAS_FILE | STATUS_NOT_LOADED) & ~STATUS_UNRESOLVED_LINK;
    doc->fileStamp = BLUTIL_GetFileTime(doc->fileName, 2);
    send_global(0x20001, doc, &doc->state->fileId);
    return 1;
}

VELMAUDIO VELMAUDIO_CreateLink(const char *file_name, const char *format)
{
    if (!file_name || !format) return nullptr;
    VELMAUDIO doc = VELMAUDIO_CreateUnresolvedLink();
    if (!doc) return nullptr;
    if (!VELMAUDIO_Link(doc, file_name, format)) {
        velm::close_document(doc);
        return nullptr;
    }
    return doc;
}

int VELMAUDIO_OpenLink(VELMAUDIO doc)
{
    if (!doc || doc->signal) return 0;
    VELMSTATE *state = doc->state;
    if ((state->status & (STATUS_HAS_FILE | STATUS_NOT_LOADED)) != (STATUS_HAS_FILE | STATUS_NOT_LOADED)) return 0;

    state->status |= STATUS_BUSY;
    AUDIOSIGNAL *signal = AUDIOSIGNAL_OpenEx(doc->fileName, doc->fileFormat, 3, doc, velm::signal_callback);
    if (signal && (state->status & STATUS_HAS_REGIONS_FILE) &&
        AUDIOSIGNAL_ReadRegions(signal, doc->regionsFileName, doc->regionsFileFormat) != 1) {
        AUDIOSIGNAL_Destroy(signal);
        signal = nullptr;
    }
    if (!signal) {
        velm::set_last_error(velm::map_signal_error(AUDIOSIGNAL_GetLastError()));
        state->status &= ~STATUS_BUSY;
        send_global(0x20004, doc, nullptr);
        return 0;
    }

    VELMAUDIO_SetAudioSignal(doc, signal);
    if (is_settings_document(signal)) bind_settings_to_file(doc, false);
    adopt_file_format(doc, signal, true);
    state = doc->state;
    state->changeStamp = doc->savedStamp = AUDIOSIGNAL_GetTimeStamp(signal, 0);
    doc->fileStamp = AUDIOSIGNAL_GetTimeStamp(signal, 2);
    reset_view(doc);
    if (doc->settings) {
        doc->options = VELMDEFINES_DecodeVelmOptions(doc->options, BLSETTINGS_GetStringEx(doc->settings, "velm.link.options"));
        doc->options = VELMDEFINES_DecodeVelmOptions(doc->options, BLSETTINGS_GetStringEx(doc->settings, "velm.link.velmoptions"));
    }
    _audio_format format;
    if (AUDIOSIGNAL_GetFormat(signal, &format) && format.bitsPerSample > 16) VELMAUDIO_SetDrawProperty(doc, 3, 3);
    doc->state->status &= ~(STATUS_NOT_LOADED | STATUS_BUSY);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_EVERYTHING);
    send_global(0x20003, doc, nullptr);
    send_global(0x20005, doc, &doc->state->fileId);
    if (!(doc->options & OPTION_HIDE_FROM_RECENT)) send_global(0x20007, doc, nullptr);
    return 1;
}

VELMAUDIO VELMAUDIO_Open(const char *file_name, const char *format)
{
    VELMAUDIO doc = VELMAUDIO_CreateLink(file_name, format);
    if (!doc) return nullptr;
    if (!VELMAUDIO_OpenLink(doc)) {
        velm::close_document(doc);
        return nullptr;
    }
    return doc;
}

int VELMAUDIO_CanOpen(const char *file_name, const char *format, int flags)
{
    if (AUDIOSIGNAL_CanOpen(file_name, format, flags)) return 1;
    velm::set_last_error(velm::map_signal_error(AUDIOSIGNAL_GetLastError()));
    return 0;
}

VELMAUDIO VELMAUDIO_Reference(VELMAUDIO doc)
{
    // Neither a stale handle nor a document closed while it draws can be held again.
    if (!doc || !IsRegisteredObject(doc) || doc->closeAfterDraw) return nullptr;
    MutexLock(doc->referenceLock);
    ++doc->references;
    MutexUnlock(doc->referenceLock);
    return doc;
}

int VELMAUDIO_Close(VELMAUDIO doc)
{
    return VELMAUDIO_CloseEx(doc, 0);
}

static int release_reference(VELMAUDIO doc)
{
    MutexLock(doc->referenceLock);
    // A close from a close-query handler only gives back a reference taken
    // meanwhile; the close being asked decides alone.
    const bool nested = doc->closeQuery;
    if (!nested || doc->references > 0) --doc->references;
    const int left = doc->references;
    MutexUnlock(doc->referenceLock);
    if (nested || left >= 1) return 0;

    // Stopped first, so that what was recorded counts as a change below.
    velm::end_document_recordings(doc);
    // The question whether to close a modified document is asked in silence.
    const bool paused = VELMAUDIO_GetPlayStatus(doc) == VELMPLAY_STATUS_PLAYING && VELMAUDIO_PlayPause(doc);
    if (doc->state->status & STATUS_MODIFIED) {
        doc->closeQuery = 1;
        const int answer = BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x20009, doc, nullptr);
        doc->closeQuery = 0;
        MutexLock(doc->referenceLock);
        if (answer != 1) ++doc->references;
        // A handler that took a reference keeps the document alive.
        const bool kept = doc->references >= 1;
        MutexUnlock(doc->referenceLock);
        if (kept) {
            if (paused) VELMAUDIO_PlayResume(doc);
            return 0;
        }
    }
    // Closed from a handler of a draw: the draw is still using the document.
    if (doc->drawing) {
        doc->closeAfterDraw = 1;
        return 1;
    }
    return velm::close_document(doc);
}

static int unload(VELMAUDIO doc)
{
    velm::end_document_recordings(doc);
    VELMSTATE *state = doc->state;
    if (!(state->status & STATUS_HAS_FILE) || (state->status & STATUS_MODIFIED) || doc->drawing) return 0;
    velm::play::destroy_players_of(doc);
    VELMDRAW_Destroy(doc->renderer);
    doc->renderer = nullptr;
    if (doc->signal) AUDIOSIGNAL_Destroy(VELMAUDIO_SetAudioSignal(doc, nullptr));
    VELMUNDO_DestroyStack(doc);
    if (doc->settings) {
        if (doc->settingsActive) BLSETTINGS_Remove(doc->settings);
        BLSETTINGS_Destroy(doc->settings);
        doc->settings = nullptr;
        doc->settingsActive = 0;
    }
    doc->fileStamp = BLUTIL_GetFileTime(doc->fileName, 2);
    state->status = STATUS_HAS_FILE | STATUS_NOT_LOADED;
    return 0;
}

int VELMAUDIO_CloseEx(VELMAUDIO doc, int mode)
{
    // A live document is registered until its teardown: a stale handle is refused unread.
    if (!doc || !IsRegisteredObject(doc)) return 0;
    if (mode == 0) return release_reference(doc);
    if (mode == 1) return unload(doc);
    return 0;
}

int VELMAUDIO_SaveAs(VELMAUDIO doc, const char *file_name, const char *format)
{
    if (!doc || !doc->signal || !file_name || !format) return 0;
    if (!AUDIOSIGNAL_Save(doc->signal, file_name, format)) return 0;
    if (file_name != doc->fileName) velm::copy_text(doc->fileName, sizeof doc->fileName, file_name);
    if (format != doc->fileFormat) velm::copy_text(doc->fileFormat, sizeof doc->fileFormat, format);
    adopt_file_format(doc, doc->signal, false);
    doc->state->status |= STATUS_HAS_FILE;
    VELMSTATE_ResetChanges(doc);
    doc->fileStamp = AUDIOSIGNAL_GetTimeStamp(doc->signal, 2);
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x2002C, doc->fileName, doc->fileFormat);
    send_global(0x20006, doc, &doc->state->fileId);
    if (!(doc->options & OPTION_HIDE_FROM_RECENT)) send_global(0x20008, doc, nullptr);
    return 1;
}

int VELMAUDIO_Save(VELMAUDIO doc)
{
    if (!doc || !doc->signal || !(doc->state->status & STATUS_HAS_FILE)) return 0;
    // A separate regions file is written only after the audio was saved, and a
    // failed audio save is reported as a failure whatever the regions do.
    const int saved = VELMAUDIO_SaveAs(doc, doc->fileName, doc->fileFormat);
    if (saved && (doc->state->status & STATUS_HAS_REGIONS_FILE)) return VELMAUDIO_SaveRegions(doc);
    return saved;
}

int VELMAUDIO_SaveCopyAs(VELMAUDIO doc, const char *file_name, const char *format)
{
    if (!doc || !doc->signal || !file_name || !format) return 0;
    return AUDIOSIGNAL_Save(doc->signal, file_name, format) ? 1 : 0;
}

int VELMAUDIO_RevertToSaved(VELMAUDIO doc)
{
    // A draw holds the signal's read access and is drawing it: it stays until the draw ends.
    if (!doc || !doc->signal || doc->drawing || !(doc->state->status & STATUS_HAS_FILE)) return 0;
    AUDIOSIGNAL *fresh = AUDIOSIGNAL_OpenEx(doc->fileName, doc->fileFormat, 3, doc, velm::signal_callback);
    if (!fresh) return 0;
    AUDIOSIGNAL *old = VELMAUDIO_SetAudioSignal(doc, fresh);
    if (is_settings_document(fresh)) bind_settings_to_file(doc, true);
    // The history and the region snapshots were written against the dropped
    // signal: its block lists and region records.  None of it applies to the
    // file as saved, and undoing into it would reach freed regions.
    VELMUNDO_DestroyStack(doc);
    doc->state->focusedRegion = doc->state->focusedTopParent = doc->state->currentRegion = VELMREGIONCOPY{};
    AUDIOSIGNAL_Destroy(old);
    VELMSTATE_ResetChanges(doc);
    reset_view(doc);
    doc->state->changeStamp = doc->savedStamp = AUDIOSIGNAL_GetTimeStamp(fresh, 0);
    doc->fileStamp = AUDIOSIGNAL_GetTimeStamp(fresh, 2);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_EVERYTHING);
    send_global(0x20005, doc, &doc->state->fileId);
    return 1;
}

AUDIOSIGNAL *VELMAUDIO_SetAudioSignal(VELMAUDIO doc, AUDIOSIGNAL *signal)
{
    if (!doc) return nullptr;
    AUDIOSIGNAL *previous = doc->signal;
    // A signal the document lets go of may be freed next: nothing may record into it.
    velm::end_signal_recordings(previous);
    if (previous) AUDIOSIGNAL_SetParentObject(previous, nullptr, nullptr);
    velm::play::replace_signal(doc, signal);
    if (signal) AUDIOSIGNAL_SetParentObject(signal, doc, velm::signal_callback);
    return previous;
}

AUDIOSIGNAL *VELMAUDIO_GetAudioSignal(VELMAUDIO doc)
{
    return doc ? doc->signal : nullptr;
}

VELMSTATE *VELMAUDIO_GetState(VELMAUDIO doc)
{
    return doc ? doc->state : nullptr;
}

uint32_t VELMAUDIO_GetStatus(VELMAUDIO doc)
{
    return doc && doc->state ? doc->state->status : 0;
}

int VELMAUDIO_HasActionInProgress(VELMAUDIO doc)
{
    return doc && doc->state && (doc->state->status & STATUS_BUSY) ? 1 : 0;
}

int VELMAUDIO_IsOpen(VELMAUDIO doc)
{
    return doc && doc->signal && !(doc->state->status & STATUS_NOT_LOADED) ? 1 : 0;
}

const char *VELMAUDIO_GetFileName(VELMAUDIO doc)
{
    return doc ? doc->fileName : nullptr;
}

const char *VELMAUDIO_GetFileFormatString(VELMAUDIO doc)
{
    return doc ? doc->fileFormat : nullptr;
}
