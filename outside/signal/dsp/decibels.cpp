// Power spectra to decibels of full scale, with optional per-bin weights.
#include "outside/signal/dspb.h"

#include "outside/base/blbase.h"
#include "outside/signal/dsp/fftlength_internal.hpp"

#include <bit>
#include <cfloat>
#include <cmath>
#include <cstdint>
#include <numbers>

namespace {

// 10 log10(x) of a power x in [FLT_MIN, FLT_MAX], within 1e-4 dB.
// Spectrogram columns convert a thousand bins each and std::log10 was most
// of their cost; this branch-free form lets the compiler vectorise the loop.
inline float normal_power_to_db(float x)
{
    // x = m 2^e with m in [sqrt(1/2), sqrt(2)), then
    // log2 m = (2 / ln 2) atanh(t) with t = (m - 1) / (m + 1), |t| < 0.172.
    const uint32_t bits = std::bit_cast<uint32_t>(x);
    const float m1 = std::bit_cast<float>((bits & 0x007fffffu) | 0x3f800000u);
    const bool high = m1 > std::numbers::sqrt2_v<float>;
    const float m = high ? m1 * 0.5f : m1;
    const float e = float(int(bits >> 23) - 127) + (high ? 1.0f : 0.0f);
    const float t = (m - 1.0f) / (m + 1.0f);
    const float t2 = t * t;
    const float atanh = t * (1.0f + t2 * (1.0f / 3 + t2 * (1.0f / 5 + t2 * (1.0f / 7))));
    const float log2 = e + atanh * float(2.0 / std::numbers::ln2);
    return log2 * float(10.0 * std::numbers::ln2 / std::numbers::ln10);
}

// The decibels of one scaled power, clamped to floor_db .. 0.  Powers too
// small for a normal float (zero and below included) and NaN read as the
// floor, infinite ones as full scale.
inline float clamped_db(float power, float floor_db)
{
    const bool normal = (power >= FLT_MIN) & (power <= FLT_MAX);
    const float db = normal_power_to_db(normal ? power : 1.0f);
    const float clamped = db > floor_db ? (db < 0.0f ? db : 0.0f) : floor_db;
    return normal ? clamped : (power > FLT_MAX ? 0.0f : floor_db);
}

}  // namespace

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
    auto weight = [weights](int k) { return weights ? weights[k] : 1.0f; };
    // The edge bins first: in and out may be the same array.
    const float first = clamped_db(in[0] * edge * weight(0), floor_db);
    const float last = clamped_db(in[bins - 1] * edge * weight(bins - 1), floor_db);
    // Each bin reads only its own input, so in == out carries nothing over.
    if (weights) {
#pragma GCC ivdep
        for (int k = 1; k < bins - 1; ++k)
            out[k] = clamped_db(in[k] * inner * weights[k], floor_db);
    } else {
#pragma GCC ivdep
        for (int k = 1; k < bins - 1; ++k)
            out[k] = clamped_db(in[k] * inner, floor_db);
    }
    out[0] = first;
    out[bins - 1] = last;
    return bins;
}

}  // extern "C"
