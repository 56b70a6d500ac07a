// The calling thread's last error of the signal library.
#pragma once

namespace velmsig {

// Records code (AUDIO_ERROR_*) as the thread's last error.
void set_last_error(int code);

// The error code of a failed system call's errno; `fallback` for the errors
// that only say reading or writing failed.
int error_of_errno(int e, int fallback);

}  // namespace velmsig
