// fmtconv 44.1 -> 48 kHz stereo through an effect path against the same
// resampler called directly.  Ten minutes of audio stream through each in
// device-sized blocks; the "s_per_hour" counter scales the time to an hour.
#include "outside/signal/audiofx.h"

#include <benchmark/benchmark.h>
#include <soxr.h>

#include <cmath>
#include <numbers>
#include <vector>

namespace {

constexpr int kInRate = 44100;
constexpr int kOutRate = 48000;
constexpr int kChannels = 2;
constexpr int64_t kBlock = 4096;  // frames per call
constexpr int kMinutes = 10;      // streamed per run: one generated minute, repeated

const std::vector<float> &one_minute()
{
    static const std::vector<float> samples = [] {
        std::vector<float> s(static_cast<size_t>(60 * kInRate * kChannels));
        for (size_t f = 0; f < s.size() / kChannels; ++f) {
            const double t = static_cast<double>(f) / kInRate;
            s[f * kChannels] = static_cast<float>(0.4 * std::sin(2 * std::numbers::pi * 440 * t));
            s[f * kChannels + 1] = static_cast<float>(0.3 * std::sin(2 * std::numbers::pi * 1000 * t));
        }
        return s;
    }();
    return samples;
}

// Streams kMinutes of audio through process(in, frames, out, room) -> produced,
// then drain(out, room) -> produced until it gives nothing; returns the output frames.
template <typename Process, typename Drain>
int64_t stream(Process process, Drain drain)
{
    const std::vector<float> &in = one_minute();
    const int64_t frames = static_cast<int64_t>(in.size()) / kChannels;
    const int64_t room = 2 * kBlock;
    std::vector<float> out(static_cast<size_t>(room * kChannels));
    int64_t produced = 0;
    for (int minute = 0; minute < kMinutes; ++minute)
        for (int64_t done = 0; done < frames; done += kBlock)
            produced +=
                process(in.data() + done * kChannels, std::min(kBlock, frames - done), out.data(), room);
    for (int64_t got; (got = drain(out.data(), room)) > 0;)
        produced += got;
    benchmark::DoNotOptimize(out.data());
    return produced;
}

void report(benchmark::State &state, int64_t output_frames)
{
    const double seconds_of_audio = kMinutes * 60.0;
    state.SetItemsProcessed(static_cast<int64_t>(state.iterations()) * kMinutes * 60 * kInRate);
    // Time per iteration / (hours of audio per iteration).
    state.counters["s_per_hour"] =
        benchmark::Counter(seconds_of_audio / 3600.0,
                           benchmark::Counter::kIsIterationInvariantRate | benchmark::Counter::kInvert);
    state.counters["out_frames"] = static_cast<double>(output_frames);
}

void BM_SoxrDirect(benchmark::State &state)
{
    one_minute();
    int64_t produced = 0;
    for (auto _ : state) {
        const soxr_quality_spec_t quality = soxr_quality_spec(SOXR_HQ, 0);
        soxr_t resampler = soxr_create(kInRate, kOutRate, kChannels, nullptr, nullptr, &quality, nullptr);
        const auto run = [&](const float *in, int64_t frames, float *out, int64_t room) {
            size_t idone = 0, odone = 0;
            soxr_process(resampler, in, static_cast<size_t>(frames), &idone, out, static_cast<size_t>(room),
                         &odone);
            return static_cast<int64_t>(odone);
        };
        produced = stream(run, [&](float *out, int64_t room) { return run(nullptr, 0, out, room); });
        soxr_delete(resampler);
    }
    report(state, produced);
}

void BM_EffectPath(benchmark::State &state)
{
    one_minute();
    _audio_format format{};
    format.sampleRate = kInRate;
    format.numChannels = kChannels;
    format.bitsPerSample = 32;
    int64_t produced = 0;
    for (auto _ : state) {
        AUDIOFX *path = AUDIOFX_CreatePathEx(format, -1, kBlock, "fmtconv[sr=%d,nc=%d]", kOutRate, kChannels);
        produced = stream(
            [&](const float *in, int64_t frames, float *out, int64_t room) {
                return AUDIOFX_ProcessSamples(path, in, frames, out, room);
            },
            [&](float *out, int64_t room) { return AUDIOFX_ProcessSamples(path, nullptr, 0, out, room); });
        AUDIOFX_DestroyPath(path);
    }
    report(state, produced);
}

}  // namespace

BENCHMARK(BM_SoxrDirect)->Unit(benchmark::kMillisecond)->Iterations(3);
BENCHMARK(BM_EffectPath)->Unit(benchmark::kMillisecond)->Iterations(3);

BENCHMARK_MAIN();
