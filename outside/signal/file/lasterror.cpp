#include "outside/signal/file/lasterror_internal.hpp"

#include <cerrno>

#include "outside/signal/audioformat.h"

namespace velmsig {

namespace {
thread_local int last_error = AUDIO_ERROR_NONE;
}

void set_last_error(int code) { last_error = code; }

int error_of_errno(int e, int fallback) {
    switch (e) {
        case ENOENT: case ENOTDIR: return AUDIO_ERROR_FILE_NOT_FOUND;
        case EACCES: case EPERM: case EROFS: return AUDIO_ERROR_ACCESS_DENIED;
        case ENOMEM: return AUDIO_ERROR_OUT_OF_MEMORY;
        default: return fallback;
    }
}

}  // namespace velmsig

extern "C" {

AUDIO_API int AUDIOSIGNAL_GetLastError(void) { return velmsig::last_error; }

AUDIO_API void AUDIOSIGNAL_ResetLastError(void) { velmsig::last_error = AUDIO_ERROR_NONE; }

}  // extern "C"
