// The frame every undoable edit shares: record, push, act, roll back or finish.
#include "edit/edit_internal.hpp"

namespace velm {

bool begin_edit(VELMAUDIO doc, const char *label, const char *fallback, int records, bool check_editable)
{
    if (!doc || !doc->signal || (check_editable && !VELMAUDIO_Editable(doc))) return false;
    VELMUNDOSCRIPT *script = VELMUNDO_CreateUndoScript(label ? label : fallback, doc->state);
    if (!script) return false;
    if (records & kRecordRegions) VELMUNDO_AddRevertAllRegionsState(script, doc->signal);
    if (records & kRecordBlocks) VELMUNDO_AddRevertAudioBlocks(script, doc->signal);
    return VELMUNDO_PushUndoScript(doc, script) != 0;
}

int roll_back(VELMAUDIO doc)
{
    VELMAUDIO_Undo(doc);
    return 0;
}

void correct_view_state(VELMAUDIO doc)
{
    VELMSTATE *s = doc->state;
    const int64_t count = sample_count(doc);
    if (s->viewEnd > count) {
        const int64_t length = s->viewEnd - s->viewBegin;
        s->viewEnd = count;
        s->viewBegin = count - length < 0 ? 0 : count - length;
    }
    if (s->cursor.position > count) s->cursor.position = count < 1 ? 0 : count - 1;
}

int finish_edit(VELMAUDIO doc)
{
    correct_view_state(doc);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_EVERYTHING);
    return 1;
}

int64_t sample_count(VELMAUDIO doc)
{
    return AUDIOSIGNAL_NumSamples(doc->signal);
}

} // namespace velm
