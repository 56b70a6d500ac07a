#include "outside/signal/dsp/fftlength_internal.hpp"

#include "outside/base/blbase.h"
#include "outside/signal/dspb.h"

namespace velmsig {

bool accept_fft_length(int length, const char *caller)
{
    if (length < 2 || length > DSPB_MAX_FFT_LENGTH) {
        BLDEBUG_Error(0, "%s: FFT length %d is out of range (2 to %d)", caller, length,
                      DSPB_MAX_FFT_LENGTH);
        return false;
    }
    if ((length & (length - 1)) != 0) {
        BLDEBUG_Error(0, "%s: FFT length %d is not a power of two", caller, length);
        return false;
    }
    return true;
}

}  // namespace velmsig
