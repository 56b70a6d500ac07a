// The frame every undoable edit shares.
#ifndef VELM_EDIT_INTERNAL_HPP
#define VELM_EDIT_INTERNAL_HPP

#include "core/document_internal.hpp"
#include "edit/velmedit.h"
#include "edit/velmselection.h"
#include "edit/velmundo.h"

namespace velm {

constexpr int kSeries = 0x400;
constexpr int64_t kWholeSignal = AUDIOSIGNAL_END;

enum EditRecords { kRecordBlocks = 1, kRecordRegions = 2 };

// Records and pushes the undo script of an edit (regions first, then blocks);
// false when the document may not be edited or the script cannot be pushed.
bool begin_edit(VELMAUDIO doc, const char *label, const char *fallback, int records, bool check_editable = true);

// Rolls a half-done edit back; always 0.
int roll_back(VELMAUDIO doc);

// Brings the view back within the signal and asks for a full repaint.
int finish_edit(VELMAUDIO doc);

// Pulls the window and the edit cursor back inside a signal that shrank.
void correct_view_state(VELMAUDIO doc);

int64_t sample_count(VELMAUDIO doc);

} // namespace velm

#endif
