// The one rule for FFT lengths, shared by every call that takes one.
#ifndef VELMSIG_DSP_FFTLENGTH_INTERNAL_HPP
#define VELMSIG_DSP_FFTLENGTH_INTERNAL_HPP

namespace velmsig {

// True for a power of two from 2 to DSPB_MAX_FFT_LENGTH; otherwise logs the
// refusal under the caller's name and returns false.
bool accept_fft_length(int length, const char *caller);

}  // namespace velmsig

#endif
