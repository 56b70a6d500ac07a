// Edits that add audio: paste, mix paste and append.
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "core/startup_internal.hpp"
#include "edit/edit_internal.hpp"

namespace {

constexpr int kBoth = velm::kRecordRegions | velm::kRecordBlocks;

bool more_than_one_selection(VELMAUDIO doc)
{
    return doc->state->selections && doc->state->selections->next;
}

void tell_only_first_used(VELMAUDIO doc)
{
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x2000A, nullptr, nullptr);
}

// Opens a file as a signal for pasting or appending; null when it cannot.
AUDIOSIGNAL *open_source(VELMAUDIO doc, const char *file_name, const char *format)
{
    if (!doc || !doc->signal || !file_name || !format || !VELMAUDIO_Editable(doc)) return nullptr;
    return AUDIOSIGNAL_OpenEx(file_name, format, 2, doc, velm::signal_callback);
}

// A silent signal of n frames in the document's format.
AUDIOSIGNAL *silence(VELMAUDIO doc, int64_t frames)
{
    if (!doc || !doc->signal || frames <= 0 || !VELMAUDIO_Editable(doc)) return nullptr;
    _audio_format format;
    VELMAUDIO_GetSignalFormat(&format, doc);
    return AUDIOSIGNAL_CreateSilence(&format, frames);
}

// Pastes the source at the end, keeps the view's width plus the new audio, selects the new audio.
int append_signal(VELMAUDIO doc, AUDIOSIGNAL *source)
{
    const int64_t view = doc->state->viewEnd - doc->state->viewBegin;
    int64_t length = 0;
    if (!AUDIOSIGNAL_PasteEx(doc->signal, source, velm::kSeries, velm::kWholeSignal, velm::kWholeSignal, &length))
        return velm::roll_back(doc);
    const int64_t n = velm::sample_count(doc);
    if (!VELMAUDIO_Zoom(doc, n - view - length, n) || !VELMAUDIO_SelectAudio(doc, n - length, n))
        return velm::roll_back(doc);
    return velm::finish_edit(doc);
}

} // namespace

int VELMAUDIO_Paste(VELMAUDIO doc, AUDIOSIGNAL *source, const char *label)
{
    if (!doc || !doc->signal || !source || !VELMAUDIO_Editable(doc)) return 0;
    const VELMSELECTION *first = doc->state->selections;
    const bool more = more_than_one_selection(doc);
    const int64_t b = first ? VELMSELECTION_GetBegin(doc, first) : doc->state->cursor.position;
    const int64_t e = first ? VELMSELECTION_GetEnd(doc, first) : b;
    if (!velm::begin_edit(doc, label, "paste", kBoth)) return 0;
    int64_t length = 0;
    if (!AUDIOSIGNAL_PasteEx(doc->signal, source, velm::kSeries, b, e, &length)) return velm::roll_back(doc);
    const VELMSTATE *s = doc->state;
    if (!first) {
        if (!VELMAUDIO_Zoom(doc, s->viewBegin, s->viewEnd + length) || !VELMAUDIO_SelectAudio(doc, b, b + length))
            return velm::roll_back(doc);
    } else {
        if (!VELMAUDIO_SelectAudio(doc, b, b + length)) return velm::roll_back(doc);
        s = doc->state;
        if (!VELMAUDIO_Zoom(doc, s->viewBegin, s->viewEnd + length - (e - b))) return velm::roll_back(doc);
        if (more) tell_only_first_used(doc);
    }
    return velm::finish_edit(doc);
}

int VELMAUDIO_PasteSilence(VELMAUDIO doc, int64_t frames, const char *label)
{
    AUDIOSIGNAL *source = silence(doc, frames);
    if (!source) return 0;
    const int result = VELMAUDIO_Paste(doc, source, label);
    AUDIOSIGNAL_Destroy(source);
    return result;
}

int VELMAUDIO_PasteFromFile(VELMAUDIO doc, const char *file_name, const char *format, const char *label)
{
    AUDIOSIGNAL *source = open_source(doc, file_name, format);
    if (!source) return 0;
    const int result = VELMAUDIO_Paste(doc, source, label);
    AUDIOSIGNAL_Destroy(source);
    return result;
}

int VELMAUDIO_MixPaste(VELMAUDIO doc, AUDIOSIGNAL *source, int mode, double parameter, const char *label)
{
    if (!doc || !doc->signal || !source || !VELMAUDIO_Editable(doc)) return 0;
    if (more_than_one_selection(doc)) {
        tell_only_first_used(doc);
        return 0;
    }
    const VELMSELECTION *first = doc->state->selections;
    const int64_t b = first ? VELMSELECTION_GetBegin(doc, first) : doc->state->cursor.position;
    const int64_t e = first ? VELMSELECTION_GetEnd(doc, first) : b;
    if (!velm::begin_edit(doc, label, "mix paste", kBoth)) return 0;
    int64_t length = 0;
    AUDIOSIGNAL *signal = doc->signal;
    switch (mode) {
    case 0:
        AUDIOSIGNAL_MixPasteEx(signal, source, velm::kSeries, b, b, parameter, &length);
        VELMAUDIO_Zoom(doc, doc->state->viewBegin, doc->state->viewEnd + length);
        VELMAUDIO_SelectAudio(doc, b, b + length);
        break;
    case 1:
        if (first)
            AUDIOSIGNAL_MixPasteEx(signal, source, velm::kSeries, b, e, parameter, &length);
        else
            AUDIOSIGNAL_MixPasteEx(signal, source, velm::kSeries, b, b + AUDIOSIGNAL_NumSamples(source), parameter, &length);
        VELMAUDIO_SelectAudio(doc, b, b + length);
        break;
    case 2:
        if (!first) break;
        AUDIOSIGNAL_ClearEx(signal, velm::kSeries, b, e);
        AUDIOSIGNAL_MixPasteEx(signal, source, 0, b, b, parameter, &length);
        VELMAUDIO_SelectAudio(doc, b, b + length);
        break;
    default:
        break;
    }
    return velm::finish_edit(doc);
}

int VELMAUDIO_Append(VELMAUDIO doc, AUDIOSIGNAL *source, const char *label)
{
    if (!doc || !doc->signal || !source || !VELMAUDIO_Editable(doc)) return 0;
    if (!velm::begin_edit(doc, label, "append", kBoth)) return 0;
    return append_signal(doc, source);
}

int VELMAUDIO_AppendFromFile(VELMAUDIO doc, const char *file_name, const char *format, const char *label)
{
    AUDIOSIGNAL *source = open_source(doc, file_name, format);
    if (!source) return 0;
    const int result = VELMAUDIO_Append(doc, source, label);
    AUDIOSIGNAL_Destroy(source);
    return result;
}

int VELMAUDIO_AppendSilence(VELMAUDIO doc, int64_t frames, const char *label)
{
    if (!doc || !doc->signal || frames <= 0 || !VELMAUDIO_Editable(doc)) return 0;
    if (!velm::begin_edit(doc, label, "append", kBoth)) return 0;
    _audio_format format;
    VELMAUDIO_GetSignalFormat(&format, doc);
    AUDIOSIGNAL *temporary = AUDIOSIGNAL_NewEx(&format);
    if (!temporary || AUDIOSIGNAL_AppendSilence(temporary, frames) != frames) {
        AUDIOSIGNAL_Destroy(temporary);
        return velm::roll_back(doc);
    }
    const int result = append_signal(doc, temporary);
    if (!AUDIOSIGNAL_Destroy(temporary)) return 0;
    return result;
}
