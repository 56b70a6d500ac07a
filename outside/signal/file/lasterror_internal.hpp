// The calling thread's last error of the signal library.
#pragma once

namespace velmsig {

// Records code (AUDIO_ERROR_*) as the thread's last error.
void set_last_error(int code);

}  // namespace velmsig
