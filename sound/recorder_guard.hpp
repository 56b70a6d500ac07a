// What the document calls so that no capture thread writes into a signal
// it is about to release.  Private to the library.
#ifndef VELM_RECORDER_GUARD_HPP
#define VELM_RECORDER_GUARD_HPP

#include "core/velmaudio.h"

namespace velm {

// Frees every recorder of doc, stopping its capture without asking.
void end_document_recordings(VELMAUDIO doc);
// Frees every recorder that is writing into signal.
void end_signal_recordings(const AUDIOSIGNAL *signal);

} // namespace velm

#endif
