// Power spectra to decibels of full scale, with optional per-bin weights.
#include "outside/signal/dspb.h"

#include "outside/base/blbase.h"
#include "outside/signal/dsp/fftlength_internal.hpp"

#include <cmath>
#include <numbers>

extern "C" {

int DSPB_CreatePreEmphAdjust(float *weights, int fftLength, double coefficient)
{
    if (!velmsig::accept_fft_length(fftLength, "DSPB_CreatePreEmphAdjust"))
        return 0;
    if (!weights || !std::isfinite(coefficient)) {
        BLDEBUG_Error(0, "DSPB_CreatePreEmphAdjust: invalid weights buffer or coefficient");
        return 0;
    }
    // |1 - c e^{-jw}|^2 at the frequency of each bin.
    const double step = 2.0 * std::numbers::pi / fftLength;
    for (int k = 0; k < fftLength; ++k)
        weights[k] = static_cast<float>(1.0 - 2.0 * coefficient * std::cos(step * k) +
                                        coefficient * coefficient);
    return 1;
}

int DSPB_PSDtoDB(int fftLength, const float *in, float *out, const float *weights, double norm,
                 double range)
{
    if (!velmsig::accept_fft_length(fftLength, "DSPB_PSDtoDB"))
        return 0;
    if (!in || !out || !(norm > 0.0) || !(range > 0.0) || !std::isfinite(norm) ||
        !std::isfinite(range)) {
        BLDEBUG_Error(0, "DSPB_PSDtoDB: invalid buffers, norm %g or range %g", norm, range);
        return 0;
    }
    const int bins = fftLength / 2 + 1;
    // A sine of amplitude 1 on bin k (0 < k < N/2) gives |X| = norm / 2; a
    // constant 1 in bin 0, or the alternating full-scale signal in bin N/2,
    // gives |X| = norm.  Scaling by those references reads full scale as 0 dB.
    const float inner = static_cast<float>(4.0 / (norm * norm));
    const float edge = static_cast<float>(1.0 / (norm * norm));
    const float floor_db = static_cast<float>(-range);
    for (int k = 0; k < bins; ++k) {
        float power = in[k] * ((k == 0 || k == bins - 1) ? edge : inner);
        if (weights)
            power *= weights[k];
        const float db = 10.0f * std::log10(power);
        // log10 of 0 is -inf and of a negative power NaN: both read as the floor.
        out[k] = db > floor_db ? (db < 0.0f ? db : 0.0f) : floor_db;
    }
    return bins;
}

}  // extern "C"
