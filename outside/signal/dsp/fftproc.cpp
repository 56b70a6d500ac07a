// FFT processors: power spectra of real frames through a shared plan.
#include "outside/signal/dspb.h"

#include "outside/base/blbase.h"
#include "outside/signal/dsp/fftlength_internal.hpp"
#include "outside/signal/dsp/fftplans_internal.hpp"

#include <algorithm>
#include <mutex>
#include <new>

struct _DSPB_FFTPROC {
    std::shared_ptr<const velmsig::FFTPlan> plan;
    velmsig::FFTBuffers buffers;
    std::mutex busy;  // held while a call works in `buffers`

    _DSPB_FFTPROC(std::shared_ptr<const velmsig::FFTPlan> p, int length)
        : plan(std::move(p)), buffers(length)
    {
    }
};

namespace {

int power_spectrum(const velmsig::FFTPlan &plan, velmsig::FFTBuffers &buffers, const float *in,
                   float *out)
{
    const int length = plan.length;
    std::copy(in, in + length, buffers.real.get());
    fftwf_execute_dft_r2c(plan.plan, buffers.real.get(), buffers.spectrum.get());
    const int bins = length / 2 + 1;
    const fftwf_complex *x = buffers.spectrum.get();
    for (int k = 0; k < bins; ++k)
        out[k] = x[k][0] * x[k][0] + x[k][1] * x[k][1];
    return bins;
}

}  // namespace

extern "C" {

DSPB_FFTPROC *DSPB_FFTProcCreate(int fftLength)
{
    if (!velmsig::accept_fft_length(fftLength, "DSPB_FFTProcCreate"))
        return nullptr;
    auto plan = velmsig::fft_plan(fftLength);
    if (!plan) {
        BLDEBUG_Error(0, "DSPB_FFTProcCreate: no FFT plan for length %d", fftLength);
        return nullptr;
    }
    auto *proc = new (std::nothrow) _DSPB_FFTPROC(std::move(plan), fftLength);
    if (proc && !proc->buffers) {
        delete proc;
        proc = nullptr;
    }
    if (!proc)
        BLDEBUG_Error(0, "DSPB_FFTProcCreate: out of memory for length %d", fftLength);
    return proc;
}

void DSPB_FFTProcDestroy(DSPB_FFTPROC *proc)
{
    delete proc;
}

int DSPB_FFTProcExecutePSD(DSPB_FFTPROC *proc, const float *in, float *out)
{
    if (!proc || !in || !out)
        return 0;
    std::unique_lock lock(proc->busy, std::try_to_lock);
    if (lock.owns_lock())
        return power_spectrum(*proc->plan, proc->buffers, in, out);
    // Another thread is using this processor: work in buffers of our own.
    velmsig::FFTBuffers own(proc->plan->length);
    if (!own)
        return 0;
    return power_spectrum(*proc->plan, own, in, out);
}

}  // extern "C"
