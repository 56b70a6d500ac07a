// Undo scripts, the bounded stack of a document, and undoing.
#include <cstring>
#include <deque>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "edit/undo_internal.hpp"

struct VELMUNDOSTACK {
    std::deque<VELMUNDOSCRIPT *> scripts; // front: the oldest
};

namespace {

void changed(VELMAUDIO doc)
{
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x20025, nullptr, nullptr);
}

// Whether an undo may go back past the saved point without asking.
bool must_ask_past_saved(VELMAUDIO doc)
{
    return !doc->settings || VELMAUDIO_BoolSetting(doc, "libvelm.undo.checkpastsaved=[1]");
}

} // namespace

VELMUNDOSCRIPT *VELMUNDO_CreateUndoScript(const char *label, const VELMSTATE *state)
{
    if (!state) return nullptr;
    BLMEM pool = BLMEM_CreateMemDescrEx("UNDO SCRIPT Memory", 1024, 0);
    if (!pool) return nullptr;
    auto *script = new VELMUNDOSCRIPT;
    script->pool = pool;
    velm::copy_text(script->label, sizeof script->label, label ? label : "Undefined");
    script->state = VELMSTATE_CreateCopy(pool, state);
    if (!script->state) {
        VELMUNDO_DestroyUndoScript(script);
        return nullptr;
    }
    return script;
}

int VELMUNDO_DestroyUndoScript(VELMUNDOSCRIPT *script)
{
    if (!script) return 0;
    for (velm::UndoAction &a : script->actions) velm::release_action(a);
    BLMEM_DisposeMemDescr(script->pool);
    delete script;
    return 1;
}

const char *VELMUNDO_ScriptLabel(const VELMUNDOSCRIPT *script)
{
    return script ? script->label : nullptr;
}

int VELMUNDO_PushUndoScript(VELMAUDIO doc, VELMUNDOSCRIPT *script)
{
    if (!doc || !script) return 0;
    if (script->actions.empty()) {
        VELMUNDO_DestroyUndoScript(script);
        return 0;
    }
    if (!doc->undo) doc->undo = new VELMUNDOSTACK;
    auto &scripts = doc->undo->scripts;
    if (scripts.size() >= VELMUNDO_MAX_SCRIPTS) {
        VELMUNDO_DestroyUndoScript(scripts.front());
        scripts.pop_front();
    }
    scripts.push_back(script);
    changed(doc);
    return 1;
}

VELMUNDOSCRIPT *VELMUNDO_PopUndoScript(VELMAUDIO doc)
{
    if (!doc || !doc->undo || doc->undo->scripts.empty()) return nullptr;
    VELMUNDOSCRIPT *script = doc->undo->scripts.back();
    doc->undo->scripts.pop_back();
    changed(doc);
    return script;
}

int VELMUNDO_DestroyStack(VELMAUDIO doc)
{
    if (!doc) return 0;
    if (!doc->undo) return 1;
    auto &scripts = doc->undo->scripts;
    while (!scripts.empty()) {
        VELMUNDO_DestroyUndoScript(scripts.back());
        scripts.pop_back();
    }
    delete doc->undo;
    doc->undo = nullptr;
    if (doc->dispatcher) changed(doc);
    return 1;
}

int VELMUNDO_Count(VELMAUDIO doc)
{
    return doc && doc->undo ? static_cast<int>(doc->undo->scripts.size()) : 0;
}

int64_t VELMUNDO_SizeInMemory(VELMAUDIO doc)
{
    if (!doc || !doc->undo) return 0;
    int64_t total = 0;
    for (const VELMUNDOSCRIPT *script : doc->undo->scripts) {
        total += BLMEM_SizeInMemory(script->pool);
        for (const velm::UndoAction &a : script->actions) total += velm::action_size_in_memory(a);
    }
    return total;
}

int VELMUNDO_FreeMemory(VELMAUDIO doc)
{
    if (!doc || !doc->undo || doc->undo->scripts.empty()) return 0;
    int ok = 1;
    for (VELMUNDOSCRIPT *script : doc->undo->scripts)
        for (velm::UndoAction &a : script->actions)
            if (a.kind == velm::UndoKind::ReplaceSignal && a.signal && !AUDIOSIGNAL_FreeDataMemory(a.signal)) ok = 0;
    return ok;
}

int VELMAUDIO_CreateUndo(VELMAUDIO doc, const char *label)
{
    if (!doc || !doc->signal) return 0;
    VELMUNDOSCRIPT *script = VELMUNDO_CreateUndoScript(label, doc->state);
    if (!VELMUNDO_AddNoAction(script) || !VELMUNDO_PushUndoScript(doc, script)) {
        VELMUNDO_DestroyUndoScript(script);
        return 0;
    }
    VELMSTATE_NotifyChanges(doc, 0);
    return 1;
}

int VELMAUDIO_CreateSignalUndo(VELMAUDIO doc, const char *label)
{
    if (!doc || !doc->signal) return 0;
    AUDIOSIGNAL *copy = AUDIOSIGNAL_DuplicateEx(doc->signal, 0);
    if (!copy) return 0;
    VELMUNDOSCRIPT *script = VELMUNDO_CreateUndoScript(label, doc->state);
    if (!script) {
        AUDIOSIGNAL_Destroy(copy);
        return 0;
    }
    AUDIOSIGNAL *earlier = VELMAUDIO_SetAudioSignal(doc, copy);
    VELMUNDO_ReplaceSignal(script, earlier);
    if (!VELMUNDO_PushUndoScript(doc, script)) {
        AUDIOSIGNAL_Destroy(VELMAUDIO_SetAudioSignal(doc, earlier));
        return 0;
    }
    VELMSTATE_NotifyChanges(doc, 0);
    return 1;
}

int VELMAUDIO_Undo(VELMAUDIO doc)
{
    VELMUNDOSCRIPT *script = VELMUNDO_PopUndoScript(doc);
    if (!script) return 0;

    bool back_to_clean_allowed = true;
    if (script->state->changeStamp < doc->savedStamp) {
        if (must_ask_past_saved(doc)) {
            if (!BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x20026, nullptr, nullptr)) {
                VELMUNDO_PushUndoScript(doc, script);
                return 0;
            }
            doc->savedStamp = 0;
            back_to_clean_allowed = false;
        }
    }
    VELMAUDIO_SetChannelMask(doc, script->state->channelMask);
    for (auto it = script->actions.rbegin(); it != script->actions.rend(); ++it) velm::revert_action(doc, *it);
    VELMSTATE_Assign(script->state, &doc->state);
    const uint64_t restored = doc->state->changeStamp;
    VELMUNDO_DestroyUndoScript(script);

    if (back_to_clean_allowed && doc->signal && doc->savedStamp == restored) {
        VELMSTATE_ResetChanges(doc);
        doc->savedStamp = doc->state->changeStamp;
    }
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x20027, nullptr, nullptr);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_EVERYTHING);
    return 1;
}

const char *VELMAUDIO_NextUndoLabel(VELMAUDIO doc)
{
    if (!doc || !doc->undo || doc->undo->scripts.empty()) return nullptr;
    return doc->undo->scripts.back()->label;
}

VELMSTATE *VELMAUDIO_SaveState(VELMAUDIO doc)
{
    return doc ? VELMSTATE_CreateCopy(nullptr, doc->state) : nullptr;
}

int VELMAUDIO_RestoreState(VELMAUDIO doc, VELMSTATE *saved)
{
    if (!doc || !saved) return 0;
    const int result = VELMSTATE_Assign(saved, &doc->state);
    VELMSTATE_Destroy(saved);
    return result;
}
