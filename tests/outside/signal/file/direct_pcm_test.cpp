// Samples read straight from the file equal libsndfile's own conversion, for
// every coding and byte order the direct path takes.
#include <gtest/gtest.h>
#include <fcntl.h>
#include <sndfile.h>
#include <unistd.h>

#include <bit>
#include <cstdint>
#include <limits>

#include "outside/signal/audioformat.h"
#include "outside/signal/file/direct_pcm_internal.hpp"
#include "outside/signal/file/unique_fd_internal.hpp"
#include "tests/outside/signal/file/file_helpers.hpp"

using namespace velmsig;
using namespace velmtest;

namespace {

struct Coding {
    int sf;
    int ours;
};

TEST(DirectPcm, MatchesLibsndfileInBothByteOrders) {
    TempDir dir;
    auto samples = test_signal(3, 5000);
    samples[0] = -1.0f;  // full scale both ways
    samples[1] = 0.999f;
    for (const Coding c : {Coding{SF_FORMAT_PCM_S8, AUDIO_FORMAT_PCM_S8}, Coding{SF_FORMAT_PCM_U8, AUDIO_FORMAT_PCM_U8},
                           Coding{SF_FORMAT_PCM_16, AUDIO_FORMAT_PCM_16}, Coding{SF_FORMAT_PCM_24, AUDIO_FORMAT_PCM_24},
                           Coding{SF_FORMAT_PCM_32, AUDIO_FORMAT_PCM_32}, Coding{SF_FORMAT_FLOAT, AUDIO_FORMAT_FLOAT}})
        for (int order : {SF_ENDIAN_LITTLE, SF_ENDIAN_BIG}) {
            std::string path = dir.file("x.raw");
            ASSERT_TRUE(write_sndfile(path, SF_FORMAT_RAW | c.sf | order, 8000, 3, samples));
            SF_INFO info{};
            info.samplerate = 8000;
            info.channels = 3;
            info.format = SF_FORMAT_RAW | c.sf | order;
            SNDFILE *f = sf_open(path.c_str(), SFM_READ, &info);
            ASSERT_NE(f, nullptr);
            std::vector<float> theirs(samples.size());
            ASSERT_EQ(sf_readf_float(f, theirs.data(), 5000), 5000);
            sf_close(f);

            UniqueFd fd(open(path.c_str(), O_RDONLY));
            DirectPcm direct(fd.get(), 0, c.ours, 3, order == SF_ENDIAN_BIG);
            ASSERT_TRUE(DirectPcm::handles(c.ours));
            std::vector<float> ours(samples.size());
            // Two pieces, the second running past the end.
            ASSERT_EQ(direct.read(0, ours.data(), 1234), 1234);
            ASSERT_EQ(direct.read(1234, ours.data() + 3 * 1234, 9999), 5000 - 1234);
            EXPECT_EQ(ours, theirs) << c.sf << " " << order;
        }
}

// Stores words as they are in memory; the descriptor of the raw file.
template <typename Word>
UniqueFd raw_file(const std::string &path, const std::vector<Word> &words) {
    UniqueFd fd(open(path.c_str(), O_RDWR | O_CREAT | O_TRUNC, 0600));
    const auto bytes = static_cast<ssize_t>(words.size() * sizeof(Word));
    EXPECT_EQ(write(fd.get(), words.data(), static_cast<size_t>(bytes)), bytes);
    return fd;
}

TEST(DirectPcm, EverySixteenBitValueWidensExactlyAtAnyOffset) {
    TempDir dir;
    std::vector<uint16_t> words;
    for (int v = -32768; v <= 32767; ++v) words.push_back(static_cast<uint16_t>(v));
    for (bool swapped : {false, true}) {
        std::vector<uint16_t> stored = words;
        if (swapped)
            for (uint16_t &w : stored) w = __builtin_bswap16(w);
        UniqueFd fd = raw_file(dir.file("all16.raw"), stored);
        DirectPcm direct(fd.get(), 0, AUDIO_FORMAT_PCM_16, 1, swapped);
        // Starting one sample in leaves every read unaligned with a short tail.
        std::vector<float> out(words.size() - 1);
        ASSERT_EQ(direct.read(1, out.data(), 70000), static_cast<int64_t>(out.size()));
        for (size_t i = 0; i < out.size(); ++i) {
            const int v = static_cast<int16_t>(words[i + 1]);
            ASSERT_EQ(out[i], static_cast<float>(v) / 32768.0f) << v << (swapped ? " swapped" : "");
        }
    }
}

TEST(DirectPcm, TwentyFourBitValuesWidenExactlyInBothByteOrders) {
    TempDir dir;
    std::vector<int32_t> values{-(1 << 23), (1 << 23) - 1, -1, 0, 1};
    for (int32_t v = -(1 << 23); v < (1 << 23); v += 97) values.push_back(v);
    for (bool big : {false, true}) {
        std::vector<uint8_t> bytes;
        for (int32_t v : values)
            for (int k = 0; k < 3; ++k) bytes.push_back(static_cast<uint8_t>(static_cast<uint32_t>(v) >> (8 * (big ? 2 - k : k))));
        UniqueFd fd = raw_file(dir.file("values24.raw"), bytes);
        DirectPcm direct(fd.get(), 0, AUDIO_FORMAT_PCM_24, 1, big);
        std::vector<float> out(values.size());
        ASSERT_EQ(direct.read(0, out.data(), static_cast<int64_t>(values.size())), static_cast<int64_t>(values.size()));
        for (size_t i = 0; i < values.size(); ++i)
            ASSERT_EQ(out[i], static_cast<float>(values[i]) / 8388608.0f) << values[i] << (big ? " big-endian" : "");
    }
}

TEST(DirectPcm, ThirtyTwoBitValuesRoundLikeAScalarConversion) {
    TempDir dir;
    constexpr int32_t lo = std::numeric_limits<int32_t>::min(), hi = std::numeric_limits<int32_t>::max();
    // Extremes and values between two floats, where rounding shows.
    std::vector<int32_t> values{lo, lo + 1, hi, hi - 1, 0, 1, -1, (1 << 24) + 1, -(1 << 24) - 1, 0x7FFFFFC0, 0x40000041};
    for (int i = 0; i < 1000; ++i) values.push_back(static_cast<int32_t>(static_cast<uint32_t>(i) * 2654435761u));
    UniqueFd fd = raw_file(dir.file("edges32.raw"), values);
    DirectPcm direct(fd.get(), 0, AUDIO_FORMAT_PCM_32, 1, false);
    std::vector<float> out(values.size());
    ASSERT_EQ(direct.read(0, out.data(), static_cast<int64_t>(values.size())), static_cast<int64_t>(values.size()));
    for (size_t i = 0; i < values.size(); ++i)
        ASSERT_EQ(std::bit_cast<uint32_t>(out[i]), std::bit_cast<uint32_t>(static_cast<float>(values[i]) / 2147483648.0f))
            << values[i];
}

}  // namespace
