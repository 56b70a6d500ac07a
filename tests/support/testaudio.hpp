// Test helpers: temporary folders and small audio files written with libsndfile.
#ifndef VELM_TESTS_TESTAUDIO_HPP
#define VELM_TESTS_TESTAUDIO_HPP

#include <cmath>
#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

#include <sndfile.h>

namespace velmtest {

// A folder under the system's temporary folder, removed with its contents.
class TempDir {
public:
    TempDir()
    {
        std::string pattern = (std::filesystem::temp_directory_path() / "velmtest-XXXXXX").string();
        path_ = mkdtemp(pattern.data());
    }
    ~TempDir() { std::filesystem::remove_all(path_); }
    TempDir(const TempDir &) = delete;
    TempDir &operator=(const TempDir &) = delete;
    std::string file(const std::string &name) const { return (path_ / name).string(); }

private:
    std::filesystem::path path_;
};

// Interleaved frames: a sine of frequency hz and amplitude amp on every
// channel, the phase shifted by a quarter turn per channel.
inline std::vector<float> sine(int rate, int channels, int64_t frames, double hz = 440.0, double amp = 0.5)
{
    std::vector<float> out(static_cast<size_t>(frames * channels));
    for (int64_t i = 0; i < frames; ++i)
        for (int c = 0; c < channels; ++c)
            out[static_cast<size_t>(i * channels + c)] =
                static_cast<float>(amp * std::sin(2.0 * M_PI * hz * static_cast<double>(i) / rate + c * M_PI / 2));
    return out;
}

// Writes interleaved frames to a file; format is an SF_FORMAT_* word.
inline bool write_audio(const std::string &path, const std::vector<float> &frames, int rate, int channels,
                        int format = SF_FORMAT_WAV | SF_FORMAT_PCM_16)
{
    SF_INFO info{};
    info.samplerate = rate;
    info.channels = channels;
    info.format = format;
    SNDFILE *f = sf_open(path.c_str(), SFM_WRITE, &info);
    if (!f) return false;
    const sf_count_t n = static_cast<sf_count_t>(frames.size() / static_cast<size_t>(channels));
    const bool ok = sf_writef_float(f, frames.data(), n) == n;
    return sf_close(f) == 0 && ok;
}

// Reads a whole file as interleaved floats; channels and rate out.
inline std::vector<float> read_audio(const std::string &path, int *rate = nullptr, int *channels = nullptr)
{
    SF_INFO info{};
    SNDFILE *f = sf_open(path.c_str(), SFM_READ, &info);
    if (!f) return {};
    std::vector<float> out(static_cast<size_t>(info.frames * info.channels));
    sf_readf_float(f, out.data(), info.frames);
    sf_close(f);
    if (rate) *rate = info.samplerate;
    if (channels) *channels = info.channels;
    return out;
}

} // namespace velmtest

#endif
