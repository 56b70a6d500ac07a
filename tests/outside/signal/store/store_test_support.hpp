// Helpers shared by the store tests: signals made from plain sample vectors.
#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <random>
#include <vector>

#include "outside/signal/audiosignal.h"

namespace store_test {

using Channels = std::vector<std::vector<float>>;

inline AUDIO_FORMAT format_of(int channels, int rate = 44100)
{
    AUDIO_FORMAT format{};
    format.sampleRate = rate;
    format.numChannels = int16_t(channels);
    format.bitsPerSample = 32;
    return format;
}

inline Channels random_channels(int channels, int64_t frames, uint32_t seed)
{
    std::mt19937 rng(seed);
    std::uniform_real_distribution<float> dist(-1.0f, 1.0f);
    Channels result(static_cast<size_t>(channels), std::vector<float>(static_cast<size_t>(frames)));
    for (auto &channel : result) {
        for (float &x : channel) x = dist(rng);
    }
    return result;
}

// A signal holding the samples (put in through a pipe, in uneven pieces).
inline AUDIOSIGNAL *make_signal(const Channels &channels, int rate = 44100)
{
    const AUDIO_FORMAT format = format_of(int(channels.size()), rate);
    AUDIOSIGNAL *signal = AUDIOSIGNAL_New(&format);
    AUDIOSIGNAL_PIPE *pipe = AUDIOSIGNAL_CreatePipe(signal, 0);
    const int64_t frames = int64_t(channels[0].size());
    std::vector<float> interleaved;
    for (int64_t at = 0, piece = 1000; at < frames; at += piece, piece = piece * 3 + 7) {
        const int64_t n = std::min(piece, frames - at);
        interleaved.clear();
        for (int64_t i = 0; i < n; ++i) {
            for (const auto &channel : channels) interleaved.push_back(channel[size_t(at + i)]);
        }
        AUDIOSIGNAL_AppendToPipe(pipe, interleaved.data(), n);
    }
    AUDIOSIGNAL_ClosePipe(pipe);
    return signal;
}

// Every channel's samples, read back.
inline Channels read_all(AUDIOSIGNAL *signal)
{
    Channels result(size_t(AUDIOSIGNAL_NumChannels(signal)));
    const int64_t frames = AUDIOSIGNAL_NumSamples(signal);
    for (size_t c = 0; c < result.size(); ++c) {
        result[c].resize(size_t(frames));
        EXPECT_EQ(AUDIOSIGNAL_GetChannelSamples(signal, int(c), 0, result[c].data(), frames), frames);
    }
    return result;
}

}  // namespace store_test
