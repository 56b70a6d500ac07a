// Undo scripts and their revert actions.  Private to the library.
#ifndef VELM_UNDO_INTERNAL_HPP
#define VELM_UNDO_INTERNAL_HPP

#include <string>
#include <vector>

#include "edit/velmundo.h"

namespace velm {

enum class UndoKind {
    NoAction = 0,
    RevertAudioBlocks = 1,
    RevertAllRegions = 2,
    RevertRegions = 3,
    RevertCreateRegion = 4,
    ReplaceSignal = 5,
    ChangeRegionComment = 6,
    ChangeRegionLabel = 7,
    SetSampleRate = 8,
    SwapChannels = 9,
};

// What a region looked like: enough to put it back.
struct RegionSnapshot {
    AUDIOREGION *region;
    uint32_t flags;
    double begin;
    double length;
};

struct UndoAction {
    UndoKind kind = UndoKind::NoAction;
    AUDIOSIGNAL_STATE blocks{};          // RevertAudioBlocks
    std::vector<RegionSnapshot> regions; // the region kinds
    AUDIOSIGNAL *signal = nullptr;       // ReplaceSignal: owned until given back
    AUDIOSIGNAL *regionsOwner = nullptr; // RevertAllRegions: the signal whose regions were saved
    AUDIOREGION *region = nullptr;       // label and comment changes
    bool hasText = false;
    std::string text;
    int32_t rate = 0;                    // SetSampleRate
};

// Puts the signal and its regions back as one action found them.
void revert_action(VELMAUDIO doc, UndoAction &action);

// Releases what an action holds.
void release_action(UndoAction &action);

int64_t action_size_in_memory(const UndoAction &action);

} // namespace velm

struct _VELMUNDOSCRIPT {
    BLMEM pool;                        // "UNDO SCRIPT Memory": the view-state copy lives here
    char label[VELMUNDO_LABEL_SIZE];
    VELMSTATE *state;                  // the view state before the change
    std::vector<velm::UndoAction> actions; // oldest first; undone newest first
};

#endif
