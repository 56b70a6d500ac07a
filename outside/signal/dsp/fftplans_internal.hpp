// FFTW plans for real-input transforms, made once per length and shared.
//
// FFTW's planner is not thread-safe, so plans are made and destroyed under one
// lock; executing a plan on new arrays (fftwf_execute_dft_r2c) is thread-safe,
// which lets every processor of a length share that length's plan.
#ifndef VELMSIG_DSP_FFTPLANS_INTERNAL_HPP
#define VELMSIG_DSP_FFTPLANS_INTERNAL_HPP

#include <fftw3.h>

#include <memory>

namespace velmsig {

struct FFTPlan {
    int length = 0;
    fftwf_plan plan = nullptr;
    FFTPlan(int n, fftwf_plan p) : length(n), plan(p) {}
    FFTPlan(const FFTPlan &) = delete;
    FFTPlan &operator=(const FFTPlan &) = delete;
    ~FFTPlan();
};

// The plan for an accepted length; null when FFTW could not make one.
std::shared_ptr<const FFTPlan> fft_plan(int length);

// Makes the plans of the powers of two from `smallest` to `largest`.
void prepare_fft_plans(int smallest, int largest);

// Forgets every kept plan; plans still held by processors live on with them.
void release_fft_plans();

// Arrays with the SIMD alignment FFTW's plans were made for: a plan may only
// run on arrays aligned like those it was planned with.
struct FFTBuffers {
    struct Free {
        void operator()(void *p) const { fftwf_free(p); }
    };
    std::unique_ptr<float[], Free> real;              // length values
    std::unique_ptr<fftwf_complex[], Free> spectrum;  // length / 2 + 1 bins

    explicit FFTBuffers(int length);  // check with operator bool: either may be null
    explicit operator bool() const { return real && spectrum; }
};

}  // namespace velmsig

#endif
