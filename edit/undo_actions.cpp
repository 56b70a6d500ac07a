// Recording and reverting the actions of an undo script.
#include <algorithm>
#include <vector>

#include "core/document_internal.hpp"
#include "edit/undo_internal.hpp"

namespace {

using velm::RegionSnapshot;
using velm::UndoAction;
using velm::UndoKind;

// The region record is public: its flag word, begin and length are the whole
// of what an undo needs to put back.
RegionSnapshot snapshot(AUDIOREGION *region)
{
    return {region, region->flags, region->begin, region->length};
}

void write_back(const RegionSnapshot &s)
{
    s.region->flags = s.flags;
    s.region->begin = s.begin;
    s.region->length = s.length;
}

int add(VELMUNDOSCRIPT *script, UndoAction &&action)
{
    if (!script) return 0;
    script->actions.push_back(std::move(action));
    return 1;
}

AUDIOSIGNAL *region_signal(const UndoAction &action)
{
    return action.regions.empty() ? nullptr : AUDIOREGION_GetParentSignal(action.regions.front().region);
}

void revert_blocks(AUDIOSIGNAL *signal, AUDIOSIGNAL_STATE &state)
{
    if (state.numChannels == 0) return;
    bool changed = false;
    for (int c = 0; c < state.numChannels; ++c) {
        AUDIOBLOCKSLIST *current = AUDIOSIGNAL_GetChannelBlocksList(signal, c);
        if (current != state.blocksList[c]) {
            AUDIOBLOCKSLIST_Destroy(current);
            changed = true;
        }
    }
    if (changed) AUDIOSIGNAL_RestoreState(signal, &state);
    AUDIOSIGNAL_ClearState(&state);
}

} // namespace

int VELMUNDO_AddNoAction(VELMUNDOSCRIPT *script)
{
    return add(script, UndoAction{});
}

int VELMUNDO_AddRevertAudioBlocks(VELMUNDOSCRIPT *script, AUDIOSIGNAL *signal)
{
    if (!script || !signal) return 0;
    UndoAction a;
    a.kind = UndoKind::RevertAudioBlocks;
    if (!AUDIOSIGNAL_SaveState(signal, &a.blocks)) return 0;
    for (int c = 0; c < a.blocks.numChannels; ++c) AUDIOBLOCKSLIST_Desactive(a.blocks.blocksList[c]);
    return add(script, std::move(a));
}

int VELMUNDO_AddRevertAllRegionsState(VELMUNDOSCRIPT *script, AUDIOSIGNAL *signal)
{
    if (!script || !signal) return 0;
    UndoAction a;
    a.kind = UndoKind::RevertAllRegions;
    a.regionsOwner = signal;
    const int count = AUDIOSIGNAL_CountRegions(signal, 0, 0, 0, 0, nullptr);
    if (count > 0) {
        std::vector<AUDIOREGION *> handles(static_cast<size_t>(count));
        const int n = AUDIOSIGNAL_GetRegions(signal, handles.data(), count, 0, 0, 0, 0, nullptr);
        for (int i = 0; i < n; ++i) a.regions.push_back(snapshot(handles[static_cast<size_t>(i)]));
    }
    return add(script, std::move(a));
}

int VELMUNDO_AddRevertRegionState(VELMUNDOSCRIPT *script, AUDIOREGION *region)
{
    if (!script || !region) return 0;
    UndoAction a;
    a.kind = UndoKind::RevertRegions;
    a.regions.push_back(snapshot(region));
    return add(script, std::move(a));
}

int VELMUNDO_AddRevertRegionGroupState(VELMUNDOSCRIPT *script, AUDIOREGION *region)
{
    if (!script || !region) return 0;
    UndoAction a;
    a.kind = UndoKind::RevertRegions;
    AUDIOREGION *top = AUDIOREGION_TopParent(region);
    if (!top) top = region;
    a.regions.push_back(snapshot(top));
    const int n = AUDIOREGION_GetNumDescendents(top);
    if (n > 0) {
        std::vector<AUDIOREGION *> children(static_cast<size_t>(n));
        const int got = AUDIOREGION_GetDescendents(top, children.data(), n);
        for (int i = 0; i < got; ++i) a.regions.push_back(snapshot(children[static_cast<size_t>(i)]));
    }
    return add(script, std::move(a));
}

int VELMUNDO_AddRevertCreateRegion(VELMUNDOSCRIPT *script, AUDIOREGION *region)
{
    if (!script || !region) return 0;
    UndoAction a;
    a.kind = UndoKind::RevertCreateRegion;
    a.regions.push_back(snapshot(region));
    return add(script, std::move(a));
}

int VELMUNDO_ReplaceSignal(VELMUNDOSCRIPT *script, AUDIOSIGNAL *earlier)
{
    if (!script || !earlier) return 0;
    UndoAction a;
    a.kind = UndoKind::ReplaceSignal;
    a.signal = earlier;
    return add(script, std::move(a));
}

static int add_text_change(VELMUNDOSCRIPT *script, UndoKind kind, AUDIOREGION *region, const char *previous)
{
    if (!script || !region) return 0;
    UndoAction a;
    a.kind = kind;
    a.region = region;
    a.hasText = previous != nullptr;
    if (previous) a.text = previous;
    return add(script, std::move(a));
}

int VELMUNDO_AddChangeRegionComment(VELMUNDOSCRIPT *script, AUDIOREGION *region, const char *previous)
{
    return add_text_change(script, UndoKind::ChangeRegionComment, region, previous);
}

int VELMUNDO_AddChangeRegionLabel(VELMUNDOSCRIPT *script, AUDIOREGION *region, const char *previous)
{
    return add_text_change(script, UndoKind::ChangeRegionLabel, region, previous);
}

int VELMUNDO_AddSetSampleRate(VELMUNDOSCRIPT *script, int32_t previous_rate)
{
    if (!script || previous_rate <= 0) return 0;
    UndoAction a;
    a.kind = UndoKind::SetSampleRate;
    a.rate = previous_rate;
    return add(script, std::move(a));
}

int VELMUNDO_AddSwapChannels(VELMUNDOSCRIPT *script)
{
    UndoAction a;
    a.kind = UndoKind::SwapChannels;
    return add(script, std::move(a));
}

namespace velm {

void revert_action(VELMAUDIO doc, UndoAction &a)
{
    AUDIOSIGNAL *signal = doc->signal;
    switch (a.kind) {
    case UndoKind::RevertAudioBlocks:
        if (signal) revert_blocks(signal, a.blocks);
        break;
    case UndoKind::RevertAllRegions:
        // The signal may have been replaced since; its regions went with it.
        if (a.regionsOwner != signal) break;
        AUDIOSIGNAL_DeleteAllRegions(signal);
        for (const RegionSnapshot &s : a.regions) write_back(s);
        AUDIOSIGNAL_AdjustRegionChildShares(signal);
        AUDIOSIGNAL_NotifyChange(signal, AUDIOSIGNAL_CHANGED_REGIONS);
        break;
    case UndoKind::RevertRegions:
        for (const RegionSnapshot &s : a.regions) write_back(s);
        if (AUDIOSIGNAL *owner = region_signal(a)) {
            AUDIOSIGNAL_AdjustRegionChildShares(owner);
            AUDIOSIGNAL_NotifyChange(owner, AUDIOSIGNAL_CHANGED_REGIONS);
        }
        break;
    case UndoKind::RevertCreateRegion:
        for (const RegionSnapshot &s : a.regions) s.region->flags |= AUDIOREGION_FLAG_DELETED;
        if (AUDIOSIGNAL *owner = region_signal(a)) AUDIOSIGNAL_AdjustRegionChildShares(owner);
        break;
    case UndoKind::ReplaceSignal:
        if (a.signal) {
            AUDIOSIGNAL_Destroy(VELMAUDIO_SetAudioSignal(doc, a.signal));
            a.signal = nullptr;
        }
        break;
    case UndoKind::ChangeRegionComment:
        AUDIOREGION_SetComment(a.region, a.hasText ? a.text.c_str() : nullptr);
        break;
    case UndoKind::ChangeRegionLabel:
        AUDIOREGION_SetLabel(a.region, a.hasText ? a.text.c_str() : nullptr);
        break;
    case UndoKind::SetSampleRate:
        if (signal) AUDIOSIGNAL_SetSampleRate(signal, a.rate);
        break;
    case UndoKind::SwapChannels:
        if (signal) AUDIOSIGNAL_SwapChannels(signal);
        break;
    case UndoKind::NoAction:
        break;
    }
}

void release_action(UndoAction &a)
{
    if (a.kind == UndoKind::RevertAudioBlocks) {
        for (int c = 0; c < a.blocks.numChannels; ++c) AUDIOBLOCKSLIST_Destroy(a.blocks.blocksList[c]);
        AUDIOSIGNAL_ClearState(&a.blocks);
    }
    if (a.kind == UndoKind::ReplaceSignal && a.signal) {
        AUDIOSIGNAL_Destroy(a.signal);
        a.signal = nullptr;
    }
}

int64_t action_size_in_memory(const UndoAction &a)
{
    int64_t total = static_cast<int64_t>(a.regions.size() * sizeof(RegionSnapshot) + a.text.size());
    if (a.kind == UndoKind::RevertAudioBlocks)
        for (int c = 0; c < a.blocks.numChannels; ++c) total += AUDIOBLOCKSLIST_SizeInMemory(a.blocks.blocksList[c]);
    if (a.kind == UndoKind::ReplaceSignal && a.signal) total += AUDIOSIGNAL_SizeInMemory(a.signal);
    return total;
}

} // namespace velm
