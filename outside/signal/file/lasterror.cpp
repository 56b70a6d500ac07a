#include "outside/signal/file/lasterror_internal.hpp"

#include "outside/signal/audioformat.h"

namespace velmsig {

namespace {
thread_local int last_error = AUDIO_ERROR_NONE;
}

void set_last_error(int code) { last_error = code; }

}  // namespace velmsig

extern "C" {

AUDIO_API int AUDIOSIGNAL_GetLastError(void) { return velmsig::last_error; }

AUDIO_API void AUDIOSIGNAL_ResetLastError(void) { velmsig::last_error = AUDIO_ERROR_NONE; }

}  // extern "C"
