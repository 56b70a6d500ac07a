// Questions about a document's selections.
#include <cstdint>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "core/velmtimeconv.h"
#include "edit/velmselection.h"

namespace {

bool loaded(VELMAUDIO doc)
{
    return doc && doc->signal && doc->state;
}

const VELMSELECTION *chunk(VELMAUDIO doc, int index)
{
    if (!doc || !doc->state) return nullptr;
    const VELMSELECTION *s = doc->state->selections;
    for (int i = 1; s && i <= index; ++i) s = s->next;
    return s;
}

// |a - b| without overflow, whatever the two positions are.
uint64_t distance(int64_t a, int64_t b)
{
    return a > b ? static_cast<uint64_t>(a) - static_cast<uint64_t>(b) : static_cast<uint64_t>(b) - static_cast<uint64_t>(a);
}

} // namespace

int VELMAUDIO_HasSelection(VELMAUDIO doc)
{
    return doc && doc->state && doc->state->selections ? 1 : 0;
}

int64_t VELMAUDIO_SelectionLength(VELMAUDIO doc)
{
    return loaded(doc) ? VELMSTATE_SelectionSize(doc, doc->state) : 0;
}

int64_t VELMAUDIO_SelectionBegin(VELMAUDIO doc)
{
    if (!loaded(doc)) return 0;
    const VELMSELECTION *s = doc->state->selections;
    return s ? VELMSELECTION_GetBegin(doc, s) : -1;
}

int64_t VELMAUDIO_SelectionEnd(VELMAUDIO doc)
{
    if (!loaded(doc) || !doc->state->selections) return 0;
    const VELMSELECTION *s = doc->state->selections;
    while (s->next) s = s->next;
    return VELMSELECTION_GetEnd(doc, s);
}

int VELMAUDIO_SelectionChunkCount(VELMAUDIO doc)
{
    int n = 0;
    for (const VELMSELECTION *s = doc && doc->state ? doc->state->selections : nullptr; s; s = s->next) ++n;
    return n;
}

int64_t VELMAUDIO_SelectionChunkBegin(VELMAUDIO doc, int index)
{
    const VELMSELECTION *s = chunk(doc, index);
    return s ? VELMSELECTION_GetBegin(doc, s) : -1;
}

int64_t VELMAUDIO_SelectionChunkEnd(VELMAUDIO doc, int index)
{
    const VELMSELECTION *s = chunk(doc, index);
    return s ? VELMSELECTION_GetEnd(doc, s) : -1;
}

const VELMSELECTION *VELMAUDIO_SelectionOverTime(VELMAUDIO doc, double t)
{
    for (const VELMSELECTION *s = doc && doc->state ? doc->state->selections : nullptr; s; s = s->next)
        if (s->begin <= t && t <= s->end) return s;
    return nullptr;
}

const VELMSELECTION *VELMAUDIO_SelectionOverSample(VELMAUDIO doc, int64_t sample)
{
    return VELMAUDIO_SelectionOverTime(doc, VELMAUDIO_SampleToTime(doc, sample));
}

int64_t VELMAUDIO_GetSelectionResizeBorder(VELMAUDIO doc, int64_t sample)
{
    if (!doc || !doc->state) return 0;
    const VELMSELECTION *s = doc->state->selections;
    if (!s || s->next) return VELMAUDIO_GetCursorPosition(doc);
    const int64_t b = VELMSELECTION_GetBegin(doc, s);
    const int64_t e = VELMSELECTION_GetEnd(doc, s);
    return distance(b, sample) < distance(e, sample) ? e : b;
}

int64_t VELMAUDIO_GetSelectingAnchor(VELMAUDIO doc)
{
    if (!doc || !doc->state) return 0;
    return VELMSELECTION_GetBegin(doc, &doc->state->selecting);
}
