// Commands that change a document's selections, and the selection being dragged.
#include <algorithm>

#include "core/document_internal.hpp"
#include "core/state_internal.hpp"
#include "core/velmnavigation.h"
#include "core/velmtimeconv.h"
#include "edit/velmselection.h"

namespace {

bool loaded(VELMAUDIO doc)
{
    return doc && doc->signal && doc->state;
}

int send(VELMAUDIO doc, uint32_t code, void *first, void *second)
{
    return BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, code, first, second);
}

int64_t sample_count(VELMAUDIO doc)
{
    return AUDIOSIGNAL_NumSamples(doc->signal);
}

// The state without selections, the edit cursor shown again.
void drop_all_selections(VELMAUDIO doc)
{
    VELMSTATE *fresh = VELMSTATE_ClearSelection(doc->state);
    if (fresh) doc->state = fresh;
    doc->state->cursor.shown = 1;
}

VELMSELECTION *new_record(VELMAUDIO doc, double begin, double end)
{
    return VELMSELECTION_CreateAudioSelection(doc->state->pool, begin, end);
}

// Inserts [tb, te] into the ordered list, merging what it touches.
bool merge_in(VELMAUDIO doc, double tb, double te)
{
    VELMSTATE *s = doc->state;
    VELMSELECTION **link = &s->selections;
    while (*link && (*link)->end < tb) link = &(*link)->next;
    VELMSELECTION *n = *link;
    if (!n || n->begin > te) {
        VELMSELECTION *rec = new_record(doc, tb, te);
        if (!rec) return false;
        rec->next = n;
        *link = rec;
        return true;
    }
    n->begin = std::min(n->begin, tb);
    n->end = std::max(n->end, te);
    while (n->next && n->next->begin <= n->end) {
        VELMSELECTION *gone = n->next;
        n->end = std::max(n->end, gone->end);
        n->next = gone->next;
        BLMEM_Delete(s->pool, gone);
    }
    return true;
}

// Removes [tb, te] from the ordered list, splitting a record it lies inside.
void cut_out(VELMAUDIO doc, double tb, double te)
{
    VELMSTATE *s = doc->state;
    VELMSELECTION **link = &s->selections;
    while (VELMSELECTION *n = *link) {
        if (n->begin > te) return;
        if (n->begin >= tb) {
            if (te < n->end) {
                n->begin = te;
                return;
            }
            *link = n->next;
            tb = n->end;
            BLMEM_Delete(s->pool, n);
            continue;
        }
        if (tb < n->end) {
            if (te < n->end) {
                VELMSELECTION *tail = new_record(doc, te, n->end);
                if (tail) {
                    tail->next = n->next;
                    n->next = tail;
                }
                n->end = tb;
                return;
            }
            n->end = tb;
        }
        link = &n->next;
    }
}

void collapse_selecting(VELMAUDIO doc)
{
    VELMSTATE *s = doc->state;
    VELMSELECTION_SetBegin(doc, &s->selecting, s->cursor.position);
    VELMSELECTION_SetEnd(doc, &s->selecting, s->cursor.position);
    s->status |= STATUS_VISUAL_CHANGED;
}

} // namespace

int VELMAUDIO_ClearSelection(VELMAUDIO doc)
{
    if (!loaded(doc)) return 0;
    if (!doc->state->selections) return 1;
    if (!send(doc, 0x2000F, nullptr, nullptr)) return 0;
    drop_all_selections(doc);
    VELMSTATE_NotifyChanges(doc, 0);
    send(doc, 0x20010, nullptr, nullptr);
    return 1;
}

int VELMAUDIO_InvertSelection(VELMAUDIO doc)
{
    if (!loaded(doc) || !doc->state->selections) return 0;
    if (!send(doc, 0x20011, nullptr, nullptr)) return 0;
    VELMSTATE *fresh = VELMSTATE_InvertSelection(doc->state, VELMAUDIO_Duration(doc));
    if (fresh) doc->state = fresh;
    VELMSTATE_NotifyChanges(doc, 0);
    send(doc, 0x20012, nullptr, nullptr);
    return 1;
}

int VELMAUDIO_AddSelection(VELMAUDIO doc, int64_t a, int64_t b)
{
    if (!loaded(doc)) return 0;
    const int64_t left = VELMAUDIO_ViewBeginLimit(doc), right = VELMAUDIO_ViewEndLimit(doc);
    // Both ends are clamped into the limits, so a range wholly outside them
    // collapses instead of turning inside out.
    const int64_t lo = std::clamp(std::min(a, b), left, std::max(left, right));
    const int64_t hi = std::clamp(std::max(a, b), left, std::max(left, right));
    double tb = VELMAUDIO_SampleToTime(doc, lo), te = VELMAUDIO_SampleToTime(doc, hi);
    const int64_t cursor = std::min(std::max(left, b), right);
    if (tb == te) {
        doc->state->cursor.position = cursor;
        return 1;
    }
    if (!send(doc, 0x2000B, &tb, &te)) {
        VELMSTATE_NotifyChanges(doc, 0);
        return 0;
    }
    doc->state->cursor.shown = 0;
    doc->state->cursor.position = cursor;
    if (!merge_in(doc, tb, te)) return 0;
    send(doc, 0x2000C, &tb, &te);
    VELMSTATE_NotifyChanges(doc, 0);
    return 1;
}

int VELMAUDIO_DelSelection(VELMAUDIO doc, int64_t a, int64_t b)
{
    if (!loaded(doc)) return 0;
    const int64_t count = sample_count(doc);
    const int64_t lo = std::clamp<int64_t>(std::min(a, b), 0, count);
    const int64_t hi = std::clamp<int64_t>(std::max(a, b), 0, count);
    double tb = VELMAUDIO_SampleToTime(doc, lo), te = VELMAUDIO_SampleToTime(doc, hi);
    if (tb == te) return 0;
    if (!send(doc, 0x2000D, &tb, &te)) {
        VELMSTATE_NotifyChanges(doc, 0);
        return 0;
    }
    cut_out(doc, tb, te);
    if (!doc->state->selections) {
        drop_all_selections(doc);
        doc->state->focusedRegion = VELMREGIONCOPY{};
    }
    send(doc, 0x2000E, &tb, &te);
    VELMSTATE_NotifyChanges(doc, 0);
    return 1;
}

int VELMAUDIO_SelectAudio(VELMAUDIO doc, int64_t a, int64_t b)
{
    if (!VELMAUDIO_ClearSelection(doc)) return 0;
    return VELMAUDIO_AddSelection(doc, a, b);
}

int VELMAUDIO_SelectAll(VELMAUDIO doc)
{
    return loaded(doc) ? VELMAUDIO_SelectAudio(doc, 0, sample_count(doc)) : 0;
}

int VELMAUDIO_SelectVisible(VELMAUDIO doc)
{
    return loaded(doc) ? VELMAUDIO_SelectAudio(doc, doc->state->viewBegin, doc->state->viewEnd) : 0;
}

int VELMAUDIO_SelectToEnd(VELMAUDIO doc)
{
    return loaded(doc) ? VELMAUDIO_SelectAudio(doc, doc->state->cursor.position, sample_count(doc)) : 0;
}

int VELMAUDIO_SelectToStart(VELMAUDIO doc)
{
    return loaded(doc) ? VELMAUDIO_SelectAudio(doc, doc->state->cursor.position, 0) : 0;
}

int VELMAUDIO_SetSelectingKind(VELMAUDIO doc, int kind)
{
    if (!loaded(doc)) return 0;
    doc->state->selectingKind = kind;
    return 1;
}

int VELMAUDIO_UpdateSelecting(VELMAUDIO doc, int64_t a, int64_t b)
{
    if (!loaded(doc)) return 0;
    const int64_t count = sample_count(doc);
    // Both ends are clamped into the signal, so a drag wholly outside it collapses
    // at the nearer end instead of turning inside out.
    int64_t lo = std::clamp<int64_t>(std::min(a, b), 0, count), hi = std::clamp<int64_t>(std::max(a, b), 0, count);
    VELMSTATE *s = doc->state;
    VELMSELECTION_SetBegin(doc, &s->selecting, lo);
    VELMSELECTION_SetEnd(doc, &s->selecting, hi);
    s->cursor.shown = 0;
    s->cursor.position = std::clamp<int64_t>(b, 0, count);
    s->focusedRegion = VELMREGIONCOPY{};
    send(doc, 0x20013, &lo, &hi);
    doc->state->status |= STATUS_VISUAL_CHANGED;
    VELMSTATE_NotifyChanges(doc, 0);
    return 1;
}

int VELMAUDIO_CommitSelecting(VELMAUDIO doc)
{
    if (!doc || !doc->state) return 0;
    VELMSTATE *s = doc->state;
    const int64_t begin = VELMSELECTION_GetBegin(doc, &s->selecting);
    const int64_t end = VELMSELECTION_GetEnd(doc, &s->selecting);
    int result = 1;
    if (begin == end) {
        if (!s->selections) s->cursor.shown = 1;
    } else {
        const int64_t cursor = s->cursor.position;
        const int64_t anchor = begin == cursor ? end : begin;
        switch (s->selectingKind) {
        case SELECTING_REPLACE: result = VELMAUDIO_SelectAudio(doc, anchor, cursor); break;
        case SELECTING_ADD: result = VELMAUDIO_AddSelection(doc, anchor, cursor); break;
        case SELECTING_SUBTRACT: result = VELMAUDIO_DelSelection(doc, anchor, cursor); break;
        default: break;
        }
    }
    collapse_selecting(doc);
    return result;
}

int VELMAUDIO_UndoSelecting(VELMAUDIO doc)
{
    if (!doc || !doc->state) return 0;
    collapse_selecting(doc);
    doc->state->selectingKind = SELECTING_REPLACE;
    return 1;
}
