#include <cstdint>

#include "outside/signal/store/signal_internal.hpp"

namespace velmsig {

namespace {
thread_local int last_error = AUDIO_ERROR_NONE;
}

void set_error(int code)
{
    last_error = code;
}

}  // namespace velmsig
