// Scanning a long 16-bit stereo WAV file: a bare libsndfile read of the
// whole file into floats beside our reader handing out every frame in
// chunks (what a signal's first scan costs before its own work), and a save.
//
//   bench_signal_file [--minutes=N]   (default 60: one hour, about 635 MB)
//
// The file is made once in the temporary folder and reused.
#include <benchmark/benchmark.h>
#include <sndfile.h>
#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <cstring>
#include <filesystem>
#include <string>
#include <vector>

#include "outside/signal/file/audiofile_internal.hpp"

namespace {

int minutes = 60;
constexpr int kRate = 44100;
constexpr int64_t kChunk = 65536;

std::string source_path() {
    return (std::filesystem::temp_directory_path() / ("velm-bench-" + std::to_string(minutes) + "min.wav")).string();
}

void make_source() {
    std::string path = source_path();
    int64_t frames = int64_t{minutes} * 60 * kRate;
    if (std::filesystem::exists(path) && std::filesystem::file_size(path) == static_cast<uintmax_t>(44 + frames * 4))
        return;
    SF_INFO info{};
    info.samplerate = kRate;
    info.channels = 2;
    info.format = SF_FORMAT_WAV | SF_FORMAT_PCM_16;
    SNDFILE *f = sf_open(path.c_str(), SFM_WRITE, &info);
    std::vector<short> block(2 * kChunk);
    for (int64_t at = 0; at < frames; at += kChunk) {
        for (int64_t i = 0; i < kChunk; ++i) block[2 * i] = block[2 * i + 1] = static_cast<short>((at + i) * 7);
        sf_writef_short(f, block.data(), std::min(kChunk, frames - at));
    }
    sf_close(f);
}

long peak_rss_kb() {
    struct rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return usage.ru_maxrss;
}

void BM_BareLibsndfileRead(benchmark::State &state) {
    for (auto _ : state) {
        SF_INFO info{};
        SNDFILE *f = sf_open(source_path().c_str(), SFM_READ, &info);
        std::vector<float> all(static_cast<size_t>(info.frames * info.channels));
        benchmark::DoNotOptimize(sf_readf_float(f, all.data(), info.frames));
        sf_close(f);
    }
    state.counters["peak_rss_MB"] = static_cast<double>(peak_rss_kb()) / 1024;
}

void BM_ReaderScan(benchmark::State &state) {
    long before = peak_rss_kb();
    for (auto _ : state) {
        auto reader = velmsig::open_reader(source_path().c_str(), "AUTO");
        std::vector<float> chunk(static_cast<size_t>(kChunk * 2));
        for (int64_t at = 0, n; (n = reader->read(at, chunk.data(), kChunk)) > 0; at += n) {
            benchmark::DoNotOptimize(chunk.data());
            benchmark::ClobberMemory();
        }
    }
    state.counters["rss_growth_MB"] = static_cast<double>(peak_rss_kb() - before) / 1024;
}

void BM_SaveWave16(benchmark::State &state) {
    std::string target = source_path() + ".saved.wav";
    for (auto _ : state) {
        auto reader = velmsig::open_reader(source_path().c_str(), "AUTO");
        auto writer = velmsig::create_writer(target.c_str(), reader->format(), "WAVE", nullptr);
        std::vector<float> chunk(static_cast<size_t>(kChunk * 2));
        for (int64_t at = 0, n; (n = reader->read(at, chunk.data(), kChunk)) > 0; at += n) writer->write(chunk.data(), n);
        writer->commit();
    }
    std::filesystem::remove(target);
}

// The scan first: the bare read's vector would inflate the peak it reports.
BENCHMARK(BM_ReaderScan)->Unit(benchmark::kMillisecond)->Iterations(3);
BENCHMARK(BM_BareLibsndfileRead)->Unit(benchmark::kMillisecond)->Iterations(3);
BENCHMARK(BM_SaveWave16)->Unit(benchmark::kMillisecond)->Iterations(1);

}  // namespace

int main(int argc, char **argv) {
    for (int i = 1; i < argc; ++i)
        if (std::strncmp(argv[i], "--minutes=", 10) == 0) minutes = std::max(1, std::atoi(argv[i] + 10));
    benchmark::Initialize(&argc, argv);
    make_source();
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
