// Start-up and shut-down of the DSP routines.
#include "outside/signal/dspb.h"

#include "outside/base/blbase.h"
#include "outside/signal/dsp/fftplans_internal.hpp"

#include <mutex>

namespace {

std::mutex start_lock;
int start_count = 0;

// The lengths spectral displays use; preparing them at start-up keeps plan
// making out of the first drawing.
constexpr int kCommonSmallest = 256;
constexpr int kCommonLargest = 8192;

}  // namespace

extern "C" {

int DSPB_Initialize(void)
{
    std::lock_guard lock(start_lock);
    if (start_count++ == 0 && BLSETTINGS_GetIntEx(nullptr, "dspb.fftw.prepare_plans=[0]") == 1)
        velmsig::prepare_fft_plans(kCommonSmallest, kCommonLargest);
    return 1;
}

void DSPB_Finalize(void)
{
    std::lock_guard lock(start_lock);
    if (start_count == 0)
        return;
    if (--start_count == 0)
        velmsig::release_fft_plans();
}

}  // extern "C"
