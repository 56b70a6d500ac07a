// Helpers shared by the effect path tests: test signals, running a path to the
// end, measuring, and catching the error log.
#ifndef TESTS_SIGNAL_FX_SUPPORT_HPP
#define TESTS_SIGNAL_FX_SUPPORT_HPP

#include "outside/base/blbase.h"
#include "outside/signal/audiofx.h"

#include <gtest/gtest.h>

#include <cmath>
#include <numbers>
#include <string>
#include <vector>

namespace fxtest {

inline _audio_format format(int rate, int channels, int bits = 32)
{
    _audio_format f{};
    f.sampleRate = rate;
    f.numChannels = static_cast<int16_t>(channels);
    f.bitsPerSample = static_cast<int16_t>(bits);
    return f;
}

// Interleaved sine of the given frequency on every channel (channel c scaled by 1 / (c + 1)).
inline std::vector<float> sine(double hz, int rate, int channels, int64_t frames, double amplitude = 0.5)
{
    std::vector<float> out(static_cast<size_t>(frames * channels));
    for (int64_t f = 0; f < frames; ++f)
        for (int c = 0; c < channels; ++c)
            out[f * channels + c] =
                static_cast<float>(amplitude / (c + 1) * std::sin(2 * std::numbers::pi * hz * f / rate));
    return out;
}

// Feeds input in blocks of the given sizes (cycled), then drains; returns all output.
inline std::vector<float> run_path(AUDIOFX *path, const std::vector<float> &in, int in_channels,
                                   std::vector<int64_t> blocks = {4096})
{
    const int out_channels = AUDIOFX_GetOutputFormat(path).numChannels;
    const int64_t frames = static_cast<int64_t>(in.size()) / in_channels;
    std::vector<float> out;
    std::vector<float> room(static_cast<size_t>(1 << 20));
    const int64_t room_frames = static_cast<int64_t>(room.size()) / out_channels;
    size_t next = 0;
    for (int64_t done = 0; done < frames;) {
        const int64_t n = std::min(blocks[next++ % blocks.size()], frames - done);
        const int64_t got =
            AUDIOFX_ProcessSamples(path, in.data() + done * in_channels, n, room.data(), room_frames);
        EXPECT_GE(got, 0);
        out.insert(out.end(), room.begin(), room.begin() + got * out_channels);
        done += n;
    }
    for (int64_t got; (got = AUDIOFX_ProcessSamples(path, nullptr, 0, room.data(), room_frames)) > 0;)
        out.insert(out.end(), room.begin(), room.begin() + got * out_channels);
    return out;
}

// The output of a path fed in odd blocks equals the output of one call.
inline void expect_block_size_does_not_matter(const _audio_format &in, const char *script,
                                              const std::vector<float> &samples, std::vector<int64_t> blocks)
{
    AUDIOFX *whole = AUDIOFX_CreatePathEx(in, -1, -1, "%s", script);
    AUDIOFX *pieces = AUDIOFX_CreatePathEx(in, -1, -1, "%s", script);
    ASSERT_TRUE(whole && pieces) << script;
    const auto one_call = run_path(whole, samples, in.numChannels, {static_cast<int64_t>(samples.size())});
    const auto streamed = run_path(pieces, samples, in.numChannels, std::move(blocks));
    ASSERT_EQ(one_call.size(), streamed.size()) << script;
    for (size_t i = 0; i < one_call.size(); ++i)
        ASSERT_NEAR(one_call[i], streamed[i], 1e-6f) << script << ": sample " << i;
    AUDIOFX_DestroyPath(whole);
    AUDIOFX_DestroyPath(pieces);
}

// Magnitude of one frequency in one channel (a single DFT bin, Hann window).
inline double tone_level(const std::vector<float> &x, int channels, int channel, double hz, int rate)
{
    const size_t frames = x.size() / channels;
    double re = 0, im = 0, window_sum = 0;
    for (size_t f = 0; f < frames; ++f) {
        const double w = 0.5 - 0.5 * std::cos(2 * std::numbers::pi * f / frames);
        const double phase = 2 * std::numbers::pi * hz * f / rate;
        re += w * x[f * channels + channel] * std::cos(phase);
        im += w * x[f * channels + channel] * std::sin(phase);
        window_sum += w;
    }
    return 2 * std::hypot(re, im) / window_sum;
}

inline double channel_mean(const std::vector<float> &x, int channels, int channel)
{
    double sum = 0;
    for (size_t i = channel; i < x.size(); i += channels)
        sum += x[i];
    return sum / static_cast<double>(x.size() / channels);
}

// Collects the error log while alive.
class LogCapture {
public:
    LogCapture()
    {
        previous_level_ = BLDEBUG_GetLevel();
        BLDEBUG_SetLevel(BLDEBUG_LEVEL_ALL);
        BLDEBUG_SetSink(&LogCapture::sink, this);
    }
    ~LogCapture()
    {
        BLDEBUG_SetSink(nullptr, nullptr);
        BLDEBUG_SetLevel(previous_level_);
    }
    const std::vector<std::string> &errors() const { return errors_; }

private:
    static void sink(int kind, int, const char *message, void *user)
    {
        if (kind == BLDEBUG_KIND_ERROR)
            static_cast<LogCapture *>(user)->errors_.emplace_back(message);
    }
    std::vector<std::string> errors_;
    int previous_level_;
};

}  // namespace fxtest

#endif
