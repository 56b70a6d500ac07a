// Regions on a one-hour signal holding 20000 of them (a word track, one
// every 180 ms): what drawing, walking, cutting and region files cost.
#include <benchmark/benchmark.h>

#include <cstdio>
#include <string>
#include <vector>

#include "outside/signal/audio.h"

namespace {

constexpr int kRate = 44100;
constexpr int kRegions = 20000;

AUDIOSIGNAL *hour_with_regions()
{
    AUDIO_FORMAT format{};
    format.sampleRate = kRate;
    format.numChannels = 1;
    format.bitsPerSample = 16;
    AUDIOSIGNAL *signal = AUDIOSIGNAL_CreateSilence(&format, int64_t(kRate) * 3600);
    for (int i = 0; i < kRegions; ++i) {
        const double begin = i * 0.18;
        AUDIOSIGNAL_AddRegionToTrackEx(signal, AUDIOREGION_ADD_QUIET, begin, begin + 0.15, "word",
                                       nullptr, i % 3);
    }
    return signal;
}

// The regions inside a ten-second view, as each full redraw asks for them.
void BM_VisibleRegions(benchmark::State &state)
{
    AUDIOSIGNAL *signal = hour_with_regions();
    std::vector<AUDIOREGION *> found(1024);
    const int64_t begin = int64_t(kRate) * 1800, end = begin + int64_t(kRate) * 10;
    for (auto _ : state) {
        const int n = AUDIOSIGNAL_CountVisibleRegions(signal, begin, end);
        benchmark::DoNotOptimize(
            AUDIOSIGNAL_GetVisibleRegions(signal, found.data(), n, begin, end));
    }
    AUDIOSIGNAL_Destroy(signal);
}
BENCHMARK(BM_VisibleRegions)->Unit(benchmark::kMicrosecond);

// One step of a walk along a track (selecting a run of regions).
void BM_NextRegion(benchmark::State &state)
{
    AUDIOSIGNAL *signal = hour_with_regions();
    AUDIOREGION *region = AUDIOSIGNAL_FindFirstRegion(signal, 1);
    for (auto _ : state) {
        AUDIOREGION *next = AUDIOSIGNAL_FindNextRegion(signal, region);
        region = next ? next : AUDIOSIGNAL_FindFirstRegion(signal, 1);
    }
    AUDIOSIGNAL_Destroy(signal);
}
BENCHMARK(BM_NextRegion)->Unit(benchmark::kMicrosecond);

// A cut and the paste that undoes it, with every region following.
void BM_CutAndPaste(benchmark::State &state)
{
    AUDIOSIGNAL *signal = hour_with_regions();
    const int64_t at = int64_t(kRate) * 600;
    for (auto _ : state) {
        AUDIOSIGNAL *clip = AUDIOSIGNAL_CutEx(signal, nullptr, 0, at, at + kRate);
        AUDIOSIGNAL_PasteEx(signal, clip, 0, at, at, nullptr);
        AUDIOSIGNAL_Destroy(clip);
    }
    AUDIOSIGNAL_Destroy(signal);
}
BENCHMARK(BM_CutAndPaste)->Unit(benchmark::kMillisecond);

// Writing and reading all regions in a region file format.
void region_file(benchmark::State &state, const char *format)
{
    AUDIOSIGNAL *signal = hour_with_regions();
    const std::string path = std::string("/tmp/velm_bench_regions.") + format;
    for (auto _ : state) {
        AUDIOSIGNAL *target = AUDIOSIGNAL_DuplicateEx(signal, 0);
        AUDIOSIGNAL_DeleteAllRegions(target);
        if (!AUDIOSIGNAL_WriteRegions(signal, path.c_str(), format) ||
            !AUDIOSIGNAL_ReadRegions(target, path.c_str(), format))
            state.SkipWithError("region file failed");
        AUDIOSIGNAL_Destroy(target);
    }
    std::remove(path.c_str());
    AUDIOSIGNAL_Destroy(signal);
}
BENCHMARK_CAPTURE(region_file, labels, "LABELS")->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(region_file, own, "VRGN")->Unit(benchmark::kMillisecond);

}  // namespace

BENCHMARK_MAIN();
