// The signal store on one hour of 44.1 kHz stereo: opening a 16-bit WAV
// beside a bare libsndfile read, exact extremes, and edits on the hour
// against the same edits on one minute.
#include <benchmark/benchmark.h>
#include <sndfile.h>
#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <fstream>
#include <string>
#include <vector>

#include "outside/signal/audiosignal.h"

namespace {

constexpr int kRate = 44100;

// Resident memory of the process in bytes.
int64_t resident_bytes()
{
    std::ifstream statm("/proc/self/statm");
    int64_t pages = 0, resident = 0;
    statm >> pages >> resident;
    return resident * sysconf(_SC_PAGESIZE);
}

// CPU time of every thread of the process.
double process_cpu_seconds()
{
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return double(usage.ru_utime.tv_sec + usage.ru_stime.tv_sec) +
           double(usage.ru_utime.tv_usec + usage.ru_stime.tv_usec) * 1e-6;
}

// A 16-bit stereo WAV of the given seconds (a sweep with noise), made once.
std::string test_file(int seconds)
{
    const std::string path = "/tmp/velm_bench_store_" + std::to_string(seconds) + "s.wav";
    if (access(path.c_str(), R_OK) == 0) return path;
    SF_INFO info{};
    info.samplerate = kRate;
    info.channels = 2;
    info.format = SF_FORMAT_WAV | SF_FORMAT_PCM_16;
    SNDFILE *file = sf_open(path.c_str(), SFM_WRITE, &info);
    std::vector<short> block(size_t(kRate) * 2);
    uint32_t noise = 1;
    for (int s = 0; s < seconds; ++s) {
        for (int i = 0; i < kRate; ++i) {
            noise = noise * 1664525u + 1013904223u;
            const double t = s + double(i) / kRate;
            const double v = 0.6 * std::sin(2 * M_PI * (200 + 3 * t) * t) + 0.1 * (double(noise >> 8) / 16777216.0 - 0.5);
            block[size_t(2 * i)] = short(v * 32767);
            block[size_t(2 * i + 1)] = short(-v * 32767);
        }
        sf_writef_short(file, block.data(), kRate);
    }
    sf_close(file);
    return path;
}

// Reads the file once so that both readers below find it in the page cache.
void warm(const std::string &path)
{
    std::FILE *file = std::fopen(path.c_str(), "rb");
    std::vector<char> buffer(1 << 20);
    while (std::fread(buffer.data(), 1, buffer.size(), file) > 0) {
    }
    std::fclose(file);
}

void BM_BareSndfileRead(benchmark::State &state)
{
    const std::string path = test_file(3600);
    warm(path);
    for (auto _ : state) {
        SF_INFO info{};
        SNDFILE *file = sf_open(path.c_str(), SFM_READ, &info);
        std::vector<float> samples(size_t(info.frames) * size_t(info.channels));
        benchmark::DoNotOptimize(sf_readf_float(file, samples.data(), info.frames));
        sf_close(file);
    }
}
BENCHMARK(BM_BareSndfileRead)->Unit(benchmark::kMillisecond)->Iterations(2);

void BM_OpenHour(benchmark::State &state)
{
    const std::string path = test_file(3600);
    warm(path);
    int64_t growth = 0;
    double cpu = 0.0;
    for (auto _ : state) {
        const int64_t before = resident_bytes();
        const double started = process_cpu_seconds();
        AUDIOSIGNAL *signal = AUDIOSIGNAL_OpenEx(path.c_str(), "AUTO", 0, nullptr, nullptr);
        cpu += process_cpu_seconds() - started;
        growth = std::max(growth, resident_bytes() - before);
        state.PauseTiming();
        AUDIOSIGNAL_Destroy(signal);
        state.ResumeTiming();
    }
    state.counters["rss_growth_MB"] = double(growth) / (1 << 20);
    state.counters["process_cpu_ms"] = cpu * 1000 / double(state.iterations());
}
BENCHMARK(BM_OpenHour)->Unit(benchmark::kMillisecond)->Iterations(3);

// One open signal per length, kept for the benchmarks below.
AUDIOSIGNAL *opened(int seconds)
{
    static AUDIOSIGNAL *hour = nullptr, *minute = nullptr;
    AUDIOSIGNAL *&signal = seconds == 3600 ? hour : minute;
    if (!signal) signal = AUDIOSIGNAL_OpenEx(test_file(seconds).c_str(), "AUTO", 0, nullptr, nullptr);
    return signal;
}

void BM_MinMaxWholeHour(benchmark::State &state)
{
    AUDIOSIGNAL *signal = opened(3600);
    float lo, hi;
    for (auto _ : state) benchmark::DoNotOptimize(AUDIOSIGNAL_GetChannelMinMax(signal, 0, 0, AUDIOSIGNAL_END, &lo, &hi));
}
BENCHMARK(BM_MinMaxWholeHour)->Unit(benchmark::kMicrosecond);

void BM_2000ColumnsOverTheHour(benchmark::State &state)
{
    AUDIOSIGNAL *signal = opened(3600);
    const int64_t frames = AUDIOSIGNAL_NumSamples(signal);
    for (auto _ : state) {
        AUDIOPOINTER pointer;
        AUDIOSIGNAL_InitAudioPointer(signal, &pointer, 0, 1);
        for (int column = 0; column < 2000; ++column) {
            const int64_t width = frames * (column + 1) / 2000 - frames * column / 2000;
            float lo, hi;
            AUDIOSIGNAL_GetChannelMinMaxFromAudioPointer(signal, &pointer, width, &lo, &hi);
            benchmark::DoNotOptimize(lo);
        }
    }
}
BENCHMARK(BM_2000ColumnsOverTheHour)->Unit(benchmark::kMicrosecond);

// Cut at an arbitrary position, paste it back elsewhere, clear a piece and
// restore the state saved before: the signal ends as it began.
void BM_CutPasteClearRestore(benchmark::State &state)
{
    AUDIOSIGNAL *signal = opened(int(state.range(0)));
    const int64_t frames = AUDIOSIGNAL_NumSamples(signal);
    uint64_t position = 12345;
    for (auto _ : state) {
        position = position * 6364136223846793005ull + 1442695040888963407ull;
        const int64_t at = int64_t(position >> 20) % (frames - 100000);
        AUDIOSIGNAL_STATE saved;
        AUDIOSIGNAL_SaveState(signal, &saved);
        AUDIOSIGNAL *cut = AUDIOSIGNAL_CutEx(signal, nullptr, 0, at, at + 44100);
        AUDIOSIGNAL_PasteEx(signal, cut, 0, at / 3, at / 3, nullptr);
        AUDIOSIGNAL_ClearEx(signal, 0, at / 2, at / 2 + 777);
        AUDIOSIGNAL_RestoreState(signal, &saved);
        AUDIOSIGNAL_Destroy(cut);
    }
    state.counters["ops_per_iteration"] = 4;
}
BENCHMARK(BM_CutPasteClearRestore)->Arg(60)->Arg(3600)->Unit(benchmark::kMicrosecond);

// One hundred cuts and pastes at arbitrary positions, each with its saved
// state kept as an undo history keeps it: the memory they hold together.
void BM_HundredEditsWithSavedStates(benchmark::State &state)
{
    AUDIOSIGNAL *signal = opened(int(state.range(0)));
    const int64_t frames = AUDIOSIGNAL_NumSamples(signal);
    int64_t held = 0;
    for (auto _ : state) {
        AUDIOSIGNAL *work = AUDIOSIGNAL_DuplicateEx(signal, 0);
        const int64_t before = AUDIOSIGNAL_SizeInMemory(work) + AUDIOSIGNAL_SizeInMemory(signal);
        std::vector<AUDIOSIGNAL_STATE> states(100);
        uint64_t position = 99;
        for (AUDIOSIGNAL_STATE &saved : states) {
            position = position * 6364136223846793005ull + 1442695040888963407ull;
            const int64_t at = int64_t(position >> 20) % (frames - 100000);
            AUDIOSIGNAL_SaveState(work, &saved);
            AUDIOSIGNAL *cut = AUDIOSIGNAL_CutEx(work, nullptr, 0, at, at + 4410);
            AUDIOSIGNAL_PasteEx(work, cut, 0, at / 2, at / 2, nullptr);
            AUDIOSIGNAL_Destroy(cut);
        }
        held = AUDIOSIGNAL_SizeInMemory(work) + AUDIOSIGNAL_SizeInMemory(signal) - before;
        for (const AUDIOSIGNAL_STATE &saved : states) {
            for (int c = 0; c < saved.numChannels; ++c) held += AUDIOBLOCKSLIST_SizeInMemory(saved.blocksList[c]);
        }
        for (AUDIOSIGNAL_STATE &saved : states) AUDIOSIGNAL_ClearState(&saved);
        AUDIOSIGNAL_Destroy(work);
    }
    state.counters["held_KB"] = double(held) / 1024;
}
BENCHMARK(BM_HundredEditsWithSavedStates)->Arg(60)->Arg(3600)->Unit(benchmark::kMillisecond);

}  // namespace

BENCHMARK_MAIN();
