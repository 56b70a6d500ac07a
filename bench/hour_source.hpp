// The one-hour stereo WAV file the document benchmarks open: tones whose
// loudness changes every few seconds, different per channel.  Made once in
// the temporary folder (about 635 MB) and kept for later runs.
#ifndef VELM_BENCH_HOUR_SOURCE_HPP
#define VELM_BENCH_HOUR_SOURCE_HPP

#include <sndfile.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

namespace velmbench {

constexpr int kRate = 44100;
constexpr int64_t kFrames = int64_t{3600} * kRate;

// The file's path, written first when it is missing or of another size.
inline std::string hour_source()
{
    const std::string path = (std::filesystem::temp_directory_path() / "velm-bench-render-hour.wav").string();
    if (std::filesystem::exists(path) && std::filesystem::file_size(path) == static_cast<uintmax_t>(44 + kFrames * 4))
        return path;
    SF_INFO info{};
    info.samplerate = kRate;
    info.channels = 2;
    info.format = SF_FORMAT_WAV | SF_FORMAT_PCM_16;
    SNDFILE *f = sf_open(path.c_str(), SFM_WRITE, &info);
    constexpr int64_t chunk = 65536;
    std::vector<short> block(2 * chunk);
    for (int64_t at = 0; at < kFrames; at += chunk) {
        const int64_t n = std::min(chunk, kFrames - at);
        for (int64_t i = 0; i < n; ++i) {
            const int64_t t = at + i;
            const double loud = 0.2 + 0.7 * std::fabs(std::sin(static_cast<double>(t / (kRate * 3)) * 1.7));
            const double wave = std::sin(static_cast<double>(t % 100) * (2.0 * M_PI / 100.0));
            block[2 * i] = static_cast<short>(12000 * loud * wave);
            block[2 * i + 1] = static_cast<short>(9000 * loud * wave * (t % 7 == 0 ? -1 : 1));
        }
        sf_writef_short(f, block.data(), n);
    }
    sf_close(f);
    return path;
}

} // namespace velmbench

#endif
