// Change notification: the single point where repaints are requested and the
// document's modified state is evaluated.
#include "core/document_internal.hpp"
#include "edit/velmselection.h"
#include "outside/signal/audiosignal.h"

namespace {

void send_modified(VELMAUDIO doc, int32_t modified)
{
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x20023, &modified, nullptr);
}

} // namespace

int VELMSTATE_NotifyChanges(VELMAUDIO doc, uint32_t changes)
{
    if (!doc || !doc->state || !doc->signal) return 0;
    const uint64_t now = AUDIOSIGNAL_GetTimeStamp(doc->signal, 0);
    const uint64_t saved = doc->savedStamp;
    if (now == saved) {
        if (doc->state->changeStamp != saved) {
            doc->state->changeStamp = saved;
            send_modified(doc, 0);
        }
    } else {
        doc->state->fileId = -1;
        doc->state->status |= STATUS_MODIFIED;
        if (now != doc->state->changeStamp) {
            doc->state->changeStamp = now;
            send_modified(doc, 1);
        }
    }
    // A handler may have replaced the state; read it again.
    doc->state->changes |= changes;
    doc->state->status |= STATUS_VISUAL_CHANGED;
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x20024, nullptr, nullptr);
    return 1;
}

int VELMSTATE_ResetChanges(VELMAUDIO doc)
{
    if (!doc || !doc->state || !doc->signal) return 0;
    AUDIOSIGNAL_ResetChanges(doc->signal);
    doc->state->status &= ~STATUS_MODIFIED;
    send_modified(doc, 0);
    doc->state->changeStamp = doc->savedStamp = AUDIOSIGNAL_GetTimeStamp(doc->signal, 0);
    return 1;
}

int VELMSTATE_ResetVisualChanges(VELMAUDIO doc)
{
    if (!doc || !doc->state) return 0;
    doc->state->viewFlags &= ~0x80000000u;
    doc->state->status &= ~STATUS_VISUAL_CHANGED;
    doc->state->changes = 0;
    return 1;
}

int64_t VELMSTATE_SelectionSize(VELMAUDIO doc, const VELMSTATE *state)
{
    if (!state) return 0;
    int64_t total = 0;
    for (const VELMSELECTION *s = state->selections; s; s = s->next) {
        const int64_t duration = VELMSELECTION_GetDuration(doc, s);
        if (__builtin_add_overflow(total, duration, &total)) return duration > 0 ? INT64_MAX : INT64_MIN;
    }
    return total;
}

int VELMAUDIO_HasChanges(VELMAUDIO doc)
{
    if (!doc || !doc->state || !doc->signal) return 0;
    return (doc->state->status & STATUS_MODIFIED) || AUDIOSIGNAL_HasChanges(doc->signal) ? 1 : 0;
}
