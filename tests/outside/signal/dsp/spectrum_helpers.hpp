// Test signals and spectra shared by the DSP tests.
#ifndef TEST_SIGNAL_DSP_SPECTRUM_HELPERS_HPP
#define TEST_SIGNAL_DSP_SPECTRUM_HELPERS_HPP

#include "outside/signal/dspb.h"

#include <cmath>
#include <memory>
#include <numbers>
#include <vector>

namespace dsptest {

struct ProcDeleter {
    void operator()(DSPB_FFTPROC *p) const { DSPB_FFTProcDestroy(p); }
};
using Proc = std::unique_ptr<DSPB_FFTPROC, ProcDeleter>;

// amplitude * sin(2 pi cycles n / period + phase) for n = 0 .. count-1.
inline std::vector<float> sine(int count, double amplitude, double cycles, int period,
                               double phase = 0.3)
{
    std::vector<float> x(count);
    for (int n = 0; n < count; ++n)
        x[n] = float(amplitude * std::sin(2.0 * std::numbers::pi * cycles * n / period + phase));
    return x;
}

// The first `length` samples of `signal` through a window of that length,
// zero-padded to fftLength, as decibels of full scale (floor -range dB).
inline std::vector<float> windowed_db(const std::vector<float> &signal, int kind, int length,
                                      int fftLength, double range = 200.0)
{
    std::vector<float> window(length), frame(fftLength, 0.0f);
    if (!DSPB_CreateWindow(kind, window.data(), length))
        return {};
    std::copy(signal.begin(), signal.begin() + length, frame.begin());
    DSPB_ApplyWindow(window.data(), frame.data(), length);
    Proc proc(DSPB_FFTProcCreate(fftLength));
    std::vector<float> db(fftLength / 2 + 1);
    if (!proc || DSPB_FFTProcExecutePSD(proc.get(), frame.data(), db.data()) != int(db.size()))
        return {};
    const double norm = DSPB_GetWindowNormFactor(window.data(), length);
    DSPB_PSDtoDB(fftLength, db.data(), db.data(), nullptr, norm, range);
    return db;
}

}  // namespace dsptest

#endif
