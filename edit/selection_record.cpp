// Selection records.
#include "edit/velmselection.h"

#include <cstdint>

#include "core/velmtimeconv.h"

VELMSELECTION *VELMSELECTION_CreateAudioSelection(BLMEM pool, double begin, double end)
{
    if (!pool) return nullptr;
    auto *s = static_cast<VELMSELECTION *>(BLMEM_New(pool, sizeof(VELMSELECTION)));
    if (!s) return nullptr;
    s->begin = begin;
    s->end = end;
    s->next = nullptr;
    return s;
}

int64_t VELMSELECTION_GetBegin(VELMAUDIO doc, const VELMSELECTION *s)
{
    return s ? VELMAUDIO_TimeToSample(doc, s->begin) : 0;
}

int64_t VELMSELECTION_GetEnd(VELMAUDIO doc, const VELMSELECTION *s)
{
    return s ? VELMAUDIO_TimeToSample(doc, s->end) : 0;
}

int64_t VELMSELECTION_GetDuration(VELMAUDIO doc, const VELMSELECTION *s)
{
    if (!s) return 0;
    // Times beyond the positions convert to the extremes; their distance saturates.
    int64_t duration;
    if (__builtin_sub_overflow(VELMSELECTION_GetEnd(doc, s), VELMSELECTION_GetBegin(doc, s), &duration))
        return s->end > s->begin ? INT64_MAX : INT64_MIN;
    return duration;
}

double VELMSELECTION_GetBeginTime(const VELMSELECTION *s)
{
    return s ? s->begin : 0.0;
}

double VELMSELECTION_GetEndTime(const VELMSELECTION *s)
{
    return s ? s->end : 0.0;
}

double VELMSELECTION_GetDurationTime(const VELMSELECTION *s)
{
    return s ? s->end - s->begin : 0.0;
}

int VELMSELECTION_SetBegin(VELMAUDIO doc, VELMSELECTION *s, int64_t sample)
{
    if (!s) return 0;
    s->begin = VELMAUDIO_SampleToTime(doc, sample);
    return 1;
}

int VELMSELECTION_SetEnd(VELMAUDIO doc, VELMSELECTION *s, int64_t sample)
{
    if (!s) return 0;
    s->end = VELMAUDIO_SampleToTime(doc, sample);
    return 1;
}

int VELMSELECTION_SetBeginTime(VELMSELECTION *s, double seconds)
{
    if (!s) return 0;
    s->begin = seconds;
    return 1;
}

int VELMSELECTION_SetEndTime(VELMSELECTION *s, double seconds)
{
    if (!s) return 0;
    s->end = seconds;
    return 1;
}

int VELMSELECTION_Compare(const VELMSELECTION *a, const VELMSELECTION *b)
{
    if (a == b) return 1;
    if (!a || !b) return 0;
    return a->begin == b->begin && a->end == b->end;
}
