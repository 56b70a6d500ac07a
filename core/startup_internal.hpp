// Start-up hooks and document helpers shared inside the core.
#ifndef VELM_STARTUP_INTERNAL_HPP
#define VELM_STARTUP_INTERNAL_HPP

#include "core/velmaudio.h"

namespace velm {

// Run by the platform layer when the shared library is loaded and unloaded.
void process_attach();
void process_detach();

// Final teardown of a document, without events or reference counting.
int close_document(VELMAUDIO doc);

// The callback through which a signal asks its document for things.
int signal_callback(void *document, int code, void *data1, void *data2);

void set_last_error(int code);

} // namespace velm

#endif
