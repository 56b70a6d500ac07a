// The document layer's last error, mapped from the signal library's.
#include "core/document_internal.hpp"
#include "core/startup_internal.hpp"
#include "outside/signal/audiosignal.h"

namespace {
int last_error = 0;
}

namespace velm {

int map_signal_error(int signal_error)
{
    switch (signal_error) {
    case 0: return VELM_ERROR_NONE;
    case AUDIO_ERROR_FILE_NOT_FOUND: return VELM_ERROR_FILE_NOT_FOUND;
    case AUDIO_ERROR_UNSUPPORTED_FORMAT: return VELM_ERROR_UNSUPPORTED_FORMAT;
    case AUDIO_ERROR_READ: return VELM_ERROR_READ;
    case AUDIO_ERROR_CORRUPT_DATA: return VELM_ERROR_CORRUPT_DATA;
    case AUDIO_ERROR_OUT_OF_MEMORY: return VELM_ERROR_OUT_OF_MEMORY;
    default: return VELM_ERROR_OTHER;
    }
}

void set_last_error(int code)
{
    last_error = code;
}

} // namespace velm

int VELMAUDIO_GetLastError(void)
{
    last_error = velm::map_signal_error(AUDIOSIGNAL_GetLastError());
    return last_error;
}

void VELMAUDIO_ResetLastError(void)
{
    last_error = 0;
    AUDIOSIGNAL_ResetLastError();
}
