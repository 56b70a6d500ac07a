// Edits that work in place over the selections, and whole-signal changes.
#include <cstdio>
#include <cstring>
#include <string>
#include <vector>

#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "core/velmtimeconv.h"
#include "edit/edit_internal.hpp"
#include "sound/velmplay.h"
#include "sound/velmrecord.h"

namespace {

// Runs op over each selection (or once over the whole signal), the series flag on the first call.
template <typename Op>
int over_selections(VELMAUDIO doc, const char *label, const char *fallback, Op op)
{
    if (!velm::begin_edit(doc, label, fallback, velm::kRecordBlocks)) return 0;
    const VELMSELECTION *s = doc->state->selections;
    if (!s) {
        if (!op(velm::kSeries, int64_t{0}, velm::kWholeSignal)) return velm::roll_back(doc);
    } else {
        int flag = velm::kSeries;
        for (; s; s = s->next, flag = 0)
            if (!op(flag, VELMSELECTION_GetBegin(doc, s), VELMSELECTION_GetEnd(doc, s))) return velm::roll_back(doc);
    }
    return velm::finish_edit(doc);
}

bool quantizer_unchanged(const char *quantizer)
{
    return !quantizer || !*quantizer || std::strcmp(quantizer, "NOCHANGES") == 0;
}

} // namespace

int VELMAUDIO_Reverse(VELMAUDIO doc, const char *label)
{
    return over_selections(doc, label, "Reverse", [doc](int flag, int64_t b, int64_t e) {
        return AUDIOSIGNAL_ReverseEx(doc->signal, flag, b, e) != 0;
    });
}

int VELMAUDIO_Silence(VELMAUDIO doc, const char *label)
{
    return over_selections(doc, label, "Silence", [doc](int flag, int64_t b, int64_t e) {
        return AUDIOSIGNAL_SilenceEx(doc->signal, flag, b, e) != 0;
    });
}

int VELMAUDIO_TransformSelection(VELMAUDIO doc, const char *effect, const char *label)
{
    if (!effect) return 0;
    return over_selections(doc, label, "FX Transform", [doc, effect](int flag, int64_t b, int64_t e) {
        return AUDIOSIGNAL_ApplyEffectEx(doc->signal, flag, b, e, effect) != 0;
    });
}

int VELMAUDIO_RemoveDC(VELMAUDIO doc, const char *label)
{
    if (!doc || !doc->signal || !VELMAUDIO_Editable(doc)) return 0;
    int64_t length = VELMAUDIO_SelectionLength(doc);
    if (length <= 0) length = velm::sample_count(doc);
    if (length <= 0) return 0;
    const int channels = VELMAUDIO_NumActiveChannels(doc);
    std::vector<double> offsets(static_cast<size_t>(channels));
    for (int i = 0; i < channels; ++i)
        offsets[static_cast<size_t>(i)] = -VELMAUDIO_GetChannelSamplesSum(doc, i) / static_cast<double>(length);
    char vector[1024];
    if (BLSTRING_SetDoubleVectorToString(offsets.data(), channels, vector, sizeof vector) < 0) return 0;
    char effect[sizeof vector + 32];
    std::snprintf(effect, sizeof effect, "GAIN[offsets=%s]", vector);
    return VELMAUDIO_TransformSelection(doc, effect, label ? label : "Remove DC");
}

int VELMAUDIO_SetSampleRate(VELMAUDIO doc, int32_t rate, const char *label)
{
    if (!doc || !doc->signal || rate <= 0) return 0;
    const int previous = AUDIOSIGNAL_SampleRate(doc->signal);
    if (previous == rate) return 1;
    VELMUNDOSCRIPT *script = VELMUNDO_CreateUndoScript(label ? label : "Set Sample Rate", doc->state);
    if (!VELMUNDO_AddSetSampleRate(script, previous) || !VELMUNDO_PushUndoScript(doc, script)) {
        VELMUNDO_DestroyUndoScript(script);
        return 0;
    }
    if (!AUDIOSIGNAL_SetSampleRate(doc->signal, rate)) return velm::roll_back(doc);
    VELMSTATE_NotifyChanges(doc, 0);
    return 1;
}

int VELMAUDIO_SwapChannels(VELMAUDIO doc, const char *label)
{
    if (!doc || !doc->signal || AUDIOSIGNAL_NumChannels(doc->signal) != 2) return 0;
    VELMUNDOSCRIPT *script = VELMUNDO_CreateUndoScript(label ? label : "Swap Channels", doc->state);
    if (!VELMUNDO_AddSwapChannels(script) || !VELMUNDO_PushUndoScript(doc, script)) {
        VELMUNDO_DestroyUndoScript(script);
        return 0;
    }
    if (!AUDIOSIGNAL_SwapChannels(doc->signal)) return velm::roll_back(doc);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_EVERYTHING);
    return 1;
}

int VELMAUDIO_Transform(VELMAUDIO doc, const char *effect, const char *label)
{
    if (!doc || !doc->signal || !effect || !VELMAUDIO_Editable(doc)) return 0;
    AUDIOSIGNAL *fresh = AUDIOSIGNAL_ApplyTransform(doc->signal, effect);
    if (!fresh) return 0;
    VELMUNDOSCRIPT *script = VELMUNDO_CreateUndoScript(label ? label : "FX Trasnform", doc->state);
    if (!script) {
        AUDIOSIGNAL_Destroy(fresh);
        return 0;
    }
    AUDIOSIGNAL *earlier = VELMAUDIO_SetAudioSignal(doc, fresh);
    VELMUNDO_ReplaceSignal(script, earlier);
    if (!VELMUNDO_PushUndoScript(doc, script)) {
        AUDIOSIGNAL_Destroy(VELMAUDIO_SetAudioSignal(doc, earlier));
        return 0;
    }
    return velm::finish_edit(doc);
}

int VELMAUDIO_ChangeAudioFormat(VELMAUDIO doc, const _audio_format *format, const char *quantizer,
                                const double *gains, int rows, int columns, const char *label)
{
    if (!doc || !format || !VELMAUDIO_Editable(doc)) return 0;
    _audio_format current;
    VELMAUDIO_GetSignalFormat(&current, doc);
    _audio_format wanted = *format;
    const bool same_quantizer = quantizer_unchanged(quantizer);
    if (current.sampleRate == wanted.sampleRate && current.numChannels == wanted.numChannels && same_quantizer) {
        BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x2002E, &current, nullptr);
        return 1;
    }
    if (!AUDIO_IsCompatible(&wanted, doc->formatCapabilities)) {
        if (!BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x2002D, &wanted, &current)) return 0;
        doc->formatCapabilities = 0x7FFFFF00u;
        doc->state->status &= ~STATUS_HAS_FILE;
    }
    const double cursor = VELMAUDIO_SampleToTime(doc, doc->state->cursor.position);
    const double view_begin = VELMAUDIO_SampleToTime(doc, doc->state->viewBegin);
    const double view_end = VELMAUDIO_SampleToTime(doc, doc->state->viewEnd);

    std::string effect(512, '\0');
    char matrix[256] = "";
    if (gains && BLSTRING_SetDoubleMatrixToString(gains, rows, columns, matrix, sizeof matrix) < 0) return 0;
    const std::string mix = gains ? std::string(",mixergains=") + matrix : std::string();
    const std::string quant = same_quantizer ? std::string() : std::string(":quantizer[type=") + quantizer + "]";
    const int n = std::snprintf(effect.data(), effect.size(), "fmtconv[sr=%d,nc=%d%s]%s", wanted.sampleRate,
                                wanted.numChannels, mix.c_str(), quant.c_str());
    if (n < 0 || static_cast<size_t>(n) >= effect.size()) return 0;
    effect.resize(static_cast<size_t>(n));
    // Frames recorded during the conversion would be lost from its result.
    if (VELMAUDIO_IsRecording(doc) && !VELMAUDIO_RecordStop(doc)) return 0;

    // A player reads in the old format: it stops first, and a refused stop
    // leaves the format as it is.
    if (VELMAUDIO_Player(doc) && !VELMAUDIO_PlayStop(doc)) return 0;
    if (!VELMAUDIO_Transform(doc, effect.c_str(), label ? label : "Change Audio Format")) return 0;
    if (wanted.sampleRate == current.sampleRate) return 1;
    VELMAUDIO_SetCursorPosition(doc, VELMAUDIO_TimeToSample(doc, cursor));
    const int spectral = VELMAUDIO_ZoomSpectralReset(doc);
    VELMAUDIO_Zoom(doc, VELMAUDIO_TimeToSample(doc, view_begin), VELMAUDIO_TimeToSample(doc, view_end));
    return spectral;
}
