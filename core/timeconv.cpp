// Conversions through a document's format and position texts.
#include "core/velmtimeconv.h"

#include <cinttypes>
#include <cstdio>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "core/velmutil.h"
#include "outside/signal/audiosignal.h"

namespace {

bool signal_format(VELMAUDIO doc, _audio_format *format)
{
    return doc && doc->signal && AUDIOSIGNAL_GetFormat(doc->signal, format);
}

// Position text in one horizontal scale kind.
int sample_to_text(VELMAUDIO doc, int kind, int64_t sample, int64_t reference, char *buffer, int size)
{
    if (sample < 0 || !buffer || size <= 0) return 0;
    _audio_format format;
    if (!signal_format(doc, &format)) return 0;
    const int64_t shift = (kind >= 3 && kind <= 5) ? VELMAUDIO_ViewBeginLimit(doc) : 0;
    switch (kind) {
    case 0:
    case 3:
        std::snprintf(buffer, static_cast<size_t>(size), "%" PRId64, sample - shift);
        return 1;
    case 1:
    case 4:
        return VELMUTIL_SamplesToTimeString(sample - shift, reference, format.sampleRate, buffer, size);
    case 2:
    case 5: {
        const int64_t frame = VELMAUDIO_ScaleFrameLength(doc);
        if (frame <= 0) return 0;
        const int64_t s = sample - shift;
        std::snprintf(buffer, static_cast<size_t>(size), "%" PRId64 "/%04" PRId64, s / frame, s % frame);
        return 1;
    }
    default:
        std::snprintf(buffer, static_cast<size_t>(size), "##erro##");
        return 0;
    }
}

} // namespace

double VELMAUDIO_SampleToTime(VELMAUDIO doc, int64_t sample)
{
    _audio_format format;
    if (!signal_format(doc, &format)) return -1.0;
    return AUDIO_Sample2Time(&format, sample);
}

int64_t VELMAUDIO_TimeToSample(VELMAUDIO doc, double seconds)
{
    _audio_format format;
    if (!signal_format(doc, &format)) return -1;
    return AUDIO_Time2Sample(&format, seconds);
}

double VELMAUDIO_Duration(VELMAUDIO doc)
{
    if (!doc || !doc->signal) return 0.0;
    return VELMAUDIO_SampleToTime(doc, AUDIOSIGNAL_NumSamples(doc->signal));
}

int32_t VELMAUDIO_ScaleFrameMsTime(VELMAUDIO doc)
{
    if (!doc || !doc->signal) return -1;
    return doc->state->scaleFrameLength;
}

int64_t VELMAUDIO_ScaleFrameLength(VELMAUDIO doc)
{
    if (!doc || !doc->signal) return -1;
    return VELMAUDIO_TimeToSample(doc, static_cast<float>(doc->state->scaleFrameLength) / 1000.0f);
}

int64_t VELMAUDIO_TimeToFrame(VELMAUDIO doc, double seconds)
{
    const int64_t frame = VELMAUDIO_ScaleFrameLength(doc);
    if (frame <= 0) return -1;
    return VELMAUDIO_TimeToSample(doc, seconds) / frame;
}

int64_t VELMAUDIO_TimeToFrameSample(VELMAUDIO doc, double seconds)
{
    const int64_t frame = VELMAUDIO_ScaleFrameLength(doc);
    if (frame <= 0) return -1;
    return VELMAUDIO_TimeToSample(doc, seconds) % frame;
}

int VELMAUDIO_SampleToTimeString(VELMAUDIO doc, int64_t sample, char *buffer, int size)
{
    if (!doc || !doc->signal) return 0;
    const VELMSTATE *s = doc->state;
    int64_t reference = s->viewEnd;
    if (s->zoomUpperLimit > reference) reference = s->zoomUpperLimit;
    const int64_t count = AUDIOSIGNAL_NumSamples(doc->signal);
    if (count > reference) reference = count;
    return sample_to_text(doc, s->horzScaleKind, sample, reference, buffer, size);
}

int VELMAUDIO_RealSampleToTimeString(VELMAUDIO doc, int64_t sample, int64_t reference, char *buffer, int size)
{
    if (!doc || !doc->signal) return 0;
    static const int absolute_kind[] = {0, 1, 2, 0, 1, 2};
    const int kind = doc->state->horzScaleKind;
    return sample_to_text(doc, kind >= 0 && kind <= 5 ? absolute_kind[kind] : kind, sample, reference, buffer, size);
}

int VELMAUDIO_HorzScaleLabelKindString(VELMAUDIO doc, int unused, char *buffer, int size)
{
    (void)unused;
    if (!doc || !doc->state || !buffer || size <= 0) return 0;
    static const char *const labels[] = {"smpl", "hms", "frm", "smpl", "hms", "frm"};
    const int kind = doc->state->horzScaleKind;
    const bool known = kind >= 0 && kind <= 5;
    std::snprintf(buffer, static_cast<size_t>(size), "%s", known ? labels[kind] : "##error##");
    return known ? 1 : 0;
}
