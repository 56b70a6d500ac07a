// Spectrogram columns over a long recording: for each column a window of
// samples around its position is copied out, windowed, transformed and turned
// into decibels, as a spectrogram lane does it.  The goal is 2000 columns of
// FFT length 2048 over a one-hour stereo signal in under 40 ms on one core.
#include "outside/signal/dspb.h"

#include <benchmark/benchmark.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <numbers>
#include <vector>

namespace {

constexpr int kRate = 44100;
constexpr int64_t kFrames = int64_t(kRate) * 3600;
constexpr int kColumns = 2000;
constexpr int kFFTLength = 2048;

// One hour of stereo: per channel a tone gliding over the hour, a steady
// tone and a little noise, generated once (about 1.3 GB of float samples).
const std::vector<std::vector<float>> &hour_of_stereo()
{
    static const auto channels = [] {
        std::vector<std::vector<float>> out(2, std::vector<float>(kFrames));
        uint32_t noise = 12345u;
        for (int c = 0; c < 2; ++c) {
            double phase = 0.0;
            const double steady = 2.0 * std::numbers::pi * (440.0 * (c + 1)) / kRate;
            for (int64_t i = 0; i < kFrames; ++i) {
                const double glide_hz = 100.0 + 8000.0 * double(i) / kFrames;
                phase += 2.0 * std::numbers::pi * glide_hz / kRate;
                noise = noise * 1664525u + 1013904223u;
                out[c][i] = float(0.4 * std::sin(phase) + 0.2 * std::sin(steady * double(i)) +
                                  1e-3 * (int32_t(noise) / 2147483648.0));
            }
        }
        return out;
    }();
    return channels;
}

struct Lane {
    std::vector<float> window = std::vector<float>(kFFTLength);
    std::vector<float> weights = std::vector<float>(kFFTLength);
    std::vector<float> work = std::vector<float>(kFFTLength);
    std::vector<float> db = std::vector<float>(kFFTLength / 2 + 1);
    double norm = 0.0;
    DSPB_FFTPROC *proc = DSPB_FFTProcCreate(kFFTLength);

    Lane()
    {
        DSPB_CreateWindow(DSPB_WINDOW_BLACKMAN, window.data(), kFFTLength);
        norm = DSPB_GetWindowNormFactor(window.data(), kFFTLength);
        DSPB_CreatePreEmphAdjust(weights.data(), kFFTLength, 0.9);
    }
    ~Lane() { DSPB_FFTProcDestroy(proc); }

    // One column centred on `position`; returns the level of one bin so the
    // work cannot be optimised away.
    float column(const std::vector<float> &samples, int64_t position)
    {
        // The samples of the frame that exist, zeros beyond the signal's ends.
        const int64_t first = position - kFFTLength / 2;
        const int64_t from = std::max<int64_t>(first, 0);
        const int64_t to = std::min<int64_t>(first + kFFTLength, kFrames);
        std::fill(work.begin(), work.end(), 0.0f);
        std::copy(samples.begin() + from, samples.begin() + to, work.begin() + (from - first));
        DSPB_ApplyWindow(window.data(), work.data(), kFFTLength);
        DSPB_FFTProcExecutePSD(proc, work.data(), db.data());
        DSPB_PSDtoDB(kFFTLength, db.data(), db.data(), weights.data(), norm, 110.0);
        return db[kFFTLength / 8];
    }
};

// state.range(0) channels, kColumns columns each, spread over the hour.
void BM_SpectrogramColumnsOverAnHour(benchmark::State &state)
{
    const auto &channels = hour_of_stereo();
    const int lanes = int(state.range(0));
    Lane lane;
    for (auto _ : state) {
        for (int c = 0; c < lanes; ++c) {
            for (int col = 0; col < kColumns; ++col) {
                const int64_t position = kFrames * col / kColumns;
                benchmark::DoNotOptimize(lane.column(channels[c], position));
            }
        }
    }
    state.counters["columns"] = double(kColumns) * lanes;
    state.counters["per_column"] = benchmark::Counter(
        double(kColumns) * lanes, benchmark::Counter::kIsIterationInvariantRate |
                                      benchmark::Counter::kInvert);
}
BENCHMARK(BM_SpectrogramColumnsOverAnHour)
    ->ArgName("channels")
    ->Arg(1)
    ->Arg(2)
    ->Unit(benchmark::kMillisecond);

// The transform alone, for comparison with FFTW's own figure.
void BM_PowerSpectrum2048(benchmark::State &state)
{
    Lane lane;
    const auto &samples = hour_of_stereo()[0];
    for (auto _ : state) {
        DSPB_FFTProcExecutePSD(lane.proc, samples.data(), lane.db.data());
        benchmark::DoNotOptimize(lane.db.data());
    }
}
BENCHMARK(BM_PowerSpectrum2048)->Unit(benchmark::kMicrosecond);

// Decibels of one spectrum of 1025 bins.
void BM_PSDtoDB2048(benchmark::State &state)
{
    Lane lane;
    std::vector<float> psd(kFFTLength / 2 + 1, 1234.5f);
    for (auto _ : state) {
        DSPB_PSDtoDB(kFFTLength, psd.data(), lane.db.data(), lane.weights.data(), lane.norm,
                     110.0);
        benchmark::DoNotOptimize(lane.db.data());
    }
}
BENCHMARK(BM_PSDtoDB2048)->Unit(benchmark::kMicrosecond);

}  // namespace

BENCHMARK_MAIN();
