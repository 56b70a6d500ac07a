// Reading files made by libsndfile and by sox in every listed format.
#include <gtest/gtest.h>
#include <sndfile.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <cmath>
#include <thread>

#include "tests/outside/signal/file/reader_helpers.hpp"

using namespace velmsig;
using namespace velmtest;

namespace {

struct PcmCase {
    const char *name;
    int sf_format;
    int container;
    int coding;
    int bits;
    const char *format_name;
};

class PcmRead : public ::testing::TestWithParam<PcmCase> {};

TEST_P(PcmRead, SamplesComeBackExactlyAndInPlace) {
    const PcmCase &c = GetParam();
    TempDir dir;
    std::string path = dir.file(std::string("in.") + c.name);
    auto samples = test_signal(2, 5000);
    ASSERT_TRUE(write_sndfile(path, c.sf_format, 22050, 2, samples));

    auto reader = open_reader(path.c_str(), "AUTO");
    ASSERT_NE(reader, nullptr) << AUDIOSIGNAL_GetLastError();
    EXPECT_EQ(reader->format().sampleRate, 22050);
    EXPECT_EQ(reader->format().numChannels, 2);
    EXPECT_EQ(reader->format().bitsPerSample, c.bits);
    EXPECT_EQ(reader->format().containerKind, c.container);
    EXPECT_EQ(reader->format().audioFormatKind, c.coding);
    EXPECT_STREQ(reader->format_name(), c.format_name);
    EXPECT_TRUE(reader->random_access());
    EXPECT_EQ(reader->frames(), 5000);
    EXPECT_EQ(read_all(*reader, 777), samples);

    // Random access in the middle, and a short read at the end.
    std::vector<float> part(2 * 100);
    EXPECT_EQ(reader->read(4321, part.data(), 100), 100);
    EXPECT_EQ(part[0], samples[2 * 4321]);
    EXPECT_EQ(part[199], samples[2 * 4420 + 1]);
    EXPECT_EQ(reader->read(4950, part.data(), 100), 50);
    EXPECT_EQ(reader->read(5000, part.data(), 100), 0);
}

INSTANTIATE_TEST_SUITE_P(
    Formats, PcmRead,
    ::testing::Values(PcmCase{"wav16", SF_FORMAT_WAV | SF_FORMAT_PCM_16, AUDIO_CONTAINER_WAVE, AUDIO_FORMAT_PCM_16, 16, "WAVE"},
                      PcmCase{"wav24", SF_FORMAT_WAV | SF_FORMAT_PCM_24, AUDIO_CONTAINER_WAVE, AUDIO_FORMAT_PCM_24, 24, "WAVE"},
                      PcmCase{"wav32", SF_FORMAT_WAV | SF_FORMAT_PCM_32, AUDIO_CONTAINER_WAVE, AUDIO_FORMAT_PCM_32, 32, "WAVE"},
                      PcmCase{"wavf", SF_FORMAT_WAV | SF_FORMAT_FLOAT, AUDIO_CONTAINER_WAVE, AUDIO_FORMAT_FLOAT, 32, "WAVFLOAT"},
                      PcmCase{"rf64", SF_FORMAT_RF64 | SF_FORMAT_PCM_16, AUDIO_CONTAINER_RF64, AUDIO_FORMAT_PCM_16, 16, "RF64"},
                      PcmCase{"w64", SF_FORMAT_W64 | SF_FORMAT_PCM_24, AUDIO_CONTAINER_W64, AUDIO_FORMAT_PCM_24, 24, "W64"},
                      PcmCase{"aiff", SF_FORMAT_AIFF | SF_FORMAT_PCM_16, AUDIO_CONTAINER_AIFF, AUDIO_FORMAT_PCM_16, 16, "AIFF"},
                      PcmCase{"caf", SF_FORMAT_CAF | SF_FORMAT_PCM_24, AUDIO_CONTAINER_CAF, AUDIO_FORMAT_PCM_24, 24, "CAF"}),
    [](const auto &info) { return std::string(info.param.name); });

TEST(Reader, EightBitFilesReadWithinTheirStep) {
    TempDir dir;
    auto samples = test_signal(1, 2000);
    for (int sf : {SF_FORMAT_WAV | SF_FORMAT_PCM_U8, SF_FORMAT_AIFF | SF_FORMAT_PCM_S8}) {
        std::string path = dir.file("eight");
        ASSERT_TRUE(write_sndfile(path, sf, 8000, 1, samples));
        auto reader = open_reader(path.c_str(), "AUTO");
        ASSERT_NE(reader, nullptr);
        EXPECT_EQ(reader->format().bitsPerSample, 8);
        auto got = read_all(*reader, 333);
        ASSERT_EQ(got.size(), samples.size());
        for (size_t i = 0; i < got.size(); ++i) ASSERT_NEAR(got[i], samples[i], 1.0 / 128) << i;
    }
}

// Readers are shared by drawing and editing threads: concurrent reads at
// scattered places all get the right frames, on the direct path (WAVE) and
// through libsndfile (AIFF, FLAC).
TEST(Reader, ConcurrentReadsGetTheirOwnFrames) {
    TempDir dir;
    auto samples = test_signal(2, 40000);
    for (const auto &[name, sf] : {std::pair{"c.wav", SF_FORMAT_WAV | SF_FORMAT_PCM_16},
                                   std::pair{"c.aiff", SF_FORMAT_AIFF | SF_FORMAT_PCM_16},
                                   std::pair{"c.flac", SF_FORMAT_FLAC | SF_FORMAT_PCM_16}}) {
        std::string path = dir.file(name);
        ASSERT_TRUE(write_sndfile(path, sf, 44100, 2, samples));
        auto reader = open_reader(path.c_str(), "AUTO");
        ASSERT_NE(reader, nullptr);
        std::atomic<int> wrong{0};
        std::vector<std::thread> threads;
        for (int t = 0; t < 4; ++t)
            threads.emplace_back([&, t] {
                std::vector<float> part(2 * 500);
                for (int k = 0; k < 40; ++k) {
                    int64_t first = (t * 7919 + k * 3373) % 39500;
                    if (reader->read(first, part.data(), 500) != 500 ||
                        !std::equal(part.begin(), part.end(), samples.begin() + 2 * first))
                        ++wrong;
                }
            });
        for (auto &th : threads) th.join();
        EXPECT_EQ(wrong, 0) << name;
    }
}

TEST(Reader, KeepsReadingAFileDeletedOrRenamedOver) {
    TempDir dir;
    std::string path = dir.file("a.wav"), other = dir.file("b.wav");
    auto samples = test_signal(1, 3000);
    ASSERT_TRUE(write_sndfile(path, SF_FORMAT_WAV | SF_FORMAT_PCM_16, 8000, 1, samples));
    ASSERT_TRUE(write_sndfile(other, SF_FORMAT_WAV | SF_FORMAT_PCM_16, 8000, 1, test_signal(1, 10)));
    auto reader = open_reader(path.c_str(), "WAVE");
    ASSERT_NE(reader, nullptr);
    ASSERT_EQ(rename(other.c_str(), path.c_str()), 0);
    EXPECT_EQ(read_all(*reader), samples);
    ASSERT_EQ(unlink(path.c_str()), 0);
    EXPECT_EQ(read_all(*reader, 123), samples);
}

// A RIFF header holds 32-bit sizes: a tool that writes more than 4 GB of
// samples without switching to a 64-bit header leaves the size modulo 4 GB.
// The files are sparse, so the tests cost no disk space.
static void write_wrapped_wave(const std::string &path, uint16_t channels, uint16_t bits, int64_t data_bytes,
                        const std::vector<uint8_t> &last_frame) {
    std::FILE *f = std::fopen(path.c_str(), "wb");
    ASSERT_NE(f, nullptr);
    const auto u32 = [&](uint32_t v) { std::fwrite(&v, 4, 1, f); };
    const auto u16 = [&](uint16_t v) { std::fwrite(&v, 2, 1, f); };
    const uint16_t block = static_cast<uint16_t>(channels * bits / 8);
    std::fputs("RIFF", f);
    u32(static_cast<uint32_t>(36 + data_bytes));
    std::fputs("WAVEfmt ", f);
    u32(16), u16(1), u16(channels), u32(44100), u32(44100u * block), u16(block), u16(bits);
    std::fputs("data", f);
    u32(static_cast<uint32_t>(data_bytes));
    ASSERT_EQ(fseeko(f, 44 + data_bytes - int64_t(last_frame.size()), SEEK_SET), 0);
    std::fwrite(last_frame.data(), last_frame.size(), 1, f);
    ASSERT_EQ(std::fclose(f), 0);
}

TEST(Reader, PlainWaveBeyondFourGigabytesOpensWithItsWholeLength) {
    TempDir dir;
    const std::string path = dir.file("long.wav");
    const int64_t data_bytes = (int64_t{1} << 32) + 4000;  // stereo 16-bit frames
    const int16_t last[4] = {1000, -1000, 2000, -2000};
    const auto *bytes = reinterpret_cast<const uint8_t *>(last);
    write_wrapped_wave(path, 2, 16, data_bytes, std::vector<uint8_t>(bytes, bytes + sizeof last));
    auto reader = open_reader(path.c_str(), "AUTO");
    ASSERT_NE(reader, nullptr);
    ASSERT_EQ(reader->frames(), data_bytes / 4);
    float got[4] = {};
    ASSERT_EQ(reader->read(reader->frames() - 2, got, 2), 2);
    for (int i = 0; i < 4; ++i) EXPECT_FLOAT_EQ(got[i], last[i] / 32768.0f) << i;
    EXPECT_EQ(reader->read(reader->frames(), got, 1), 0);
}

// Six-byte frames do not divide 4 GB: the wrapped size is not a whole number
// of frames, yet every frame of the file is still there.
TEST(Reader, WrappedWaveWithFramesThatDoNotDivideFourGigabytesKeepsItsLastFrame) {
    TempDir dir;
    const std::string path = dir.file("long24.wav");
    const int64_t frames = ((int64_t{1} << 32) / 6) + 1000;  // stereo 24-bit frames
    const std::vector<uint8_t> last = {0x00, 0x00, 0x10, 0x00, 0x00, 0xF0};  // 0x100000, -0x100000
    write_wrapped_wave(path, 2, 24, frames * 6, last);
    auto reader = open_reader(path.c_str(), "AUTO");
    ASSERT_NE(reader, nullptr);
    ASSERT_EQ(reader->frames(), frames);
    float got[2] = {};
    ASSERT_EQ(reader->read(frames - 1, got, 1), 1);
    EXPECT_FLOAT_EQ(got[0], 0.125f);
    EXPECT_FLOAT_EQ(got[1], -0.125f);
}

// Exactly 4 GB of samples: the wrapped size claims no frame at all.
TEST(Reader, WrappedWaveThatClaimsNoFrameOpensWithItsWholeLength) {
    TempDir dir;
    const std::string path = dir.file("exact.wav");
    const int64_t frames = int64_t{1} << 30;  // stereo 16-bit frames
    const int16_t last[2] = {3000, -3000};
    const auto *bytes = reinterpret_cast<const uint8_t *>(last);
    write_wrapped_wave(path, 2, 16, frames * 4, std::vector<uint8_t>(bytes, bytes + sizeof last));
    auto reader = open_reader(path.c_str(), "AUTO");
    ASSERT_NE(reader, nullptr);
    ASSERT_EQ(reader->frames(), frames);
    float got[2] = {};
    ASSERT_EQ(reader->read(frames - 1, got, 1), 1);
    EXPECT_FLOAT_EQ(got[0], 3000 / 32768.0f);
    EXPECT_FLOAT_EQ(got[1], -3000 / 32768.0f);
}

TEST(Reader, ReadsHeadlessFilesAsTheFormatStringSays) {
    TempDir dir;
    std::string path = dir.file("x.raw");
    auto samples = test_signal(2, 1000);
    ASSERT_TRUE(write_sndfile(path, SF_FORMAT_RAW | SF_FORMAT_PCM_16 | SF_ENDIAN_BIG, 16000, 2, samples));

    auto reader = open_reader(path.c_str(), "RAW[sr=16000,nc=2,nbits=16,endian=big]");
    ASSERT_NE(reader, nullptr);
    EXPECT_EQ(reader->format().containerKind, AUDIO_CONTAINER_RAW);
    EXPECT_EQ(reader->frames(), 1000);
    EXPECT_EQ(read_all(*reader), samples);

    // A header to skip, then the same samples little-endian.
    std::string body;
    ASSERT_TRUE(write_sndfile(path, SF_FORMAT_RAW | SF_FORMAT_PCM_16 | SF_ENDIAN_LITTLE, 16000, 2, samples));
    write_text(path, "HEADER!!" + slurp(path));
    reader = open_reader(path.c_str(), "RAW[sr=16000,nc=2,offset=8]");
    ASSERT_NE(reader, nullptr);
    EXPECT_EQ(read_all(*reader), samples);

    // AUTO with a rate and channels falls back to headerless samples.
    reader = open_reader(path.c_str(), "AUTO[sr=8000,nc=1]");
    ASSERT_NE(reader, nullptr);
    EXPECT_EQ(reader->format().sampleRate, 8000);
    EXPECT_EQ(reader->frames(), (8 + 4000) / 2);

    // Without them a headerless file is not recognised.
    EXPECT_EQ(open_reader(path.c_str(), "AUTO"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_UNSUPPORTED_FORMAT);
    EXPECT_EQ(open_reader(path.c_str(), "RAW[sr=8000]"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_BAD_FORMAT_STRING);
}

struct CompressedCase {
    const char *name;
    int sf_format;
    int rate;
    int container;
    int coding;
    const char *format_name;
    double tolerance;  // lossy codings only come close
};

class CompressedRead : public ::testing::TestWithParam<CompressedCase> {};

TEST_P(CompressedRead, DecodesSequentially) {
    const CompressedCase &c = GetParam();
    SF_INFO probe{};
    probe.samplerate = c.rate;
    probe.channels = 2;
    probe.format = c.sf_format;
    if (!sf_format_check(&probe)) GTEST_SKIP() << "the installed libsndfile does not write " << c.name;
    TempDir dir;
    std::string path = dir.file(std::string("in.") + c.name);
    // A quiet sine: lossy codecs keep its shape.
    std::vector<float> samples(2 * static_cast<size_t>(c.rate));
    for (size_t i = 0; i < samples.size(); ++i)
        samples[i] = 0.5f * static_cast<float>(std::sin(2 * M_PI * 440.0 * static_cast<double>(i / 2) / c.rate));
    ASSERT_TRUE(write_sndfile(path, c.sf_format, c.rate, 2, samples));

    auto reader = open_reader(path.c_str(), "AUTO");
    ASSERT_NE(reader, nullptr) << AUDIOSIGNAL_GetLastError();
    EXPECT_EQ(reader->format().containerKind, c.container);
    EXPECT_EQ(reader->format().audioFormatKind, c.coding);
    EXPECT_EQ(reader->format().sampleRate, c.rate);
    EXPECT_EQ(reader->format().numChannels, 2);
    EXPECT_STREQ(reader->format_name(), c.format_name);
    EXPECT_FALSE(reader->random_access());
    auto got = read_all(*reader, 4096);
    // Lossy encoders may pad the end by a frame or two.
    ASSERT_GE(got.size(), samples.size() - 2 * 2048);
    ASSERT_LE(got.size(), samples.size() + 2 * 4096);
    double worst = 0;
    // Skip the codec's start-up and end: compare the middle.
    for (size_t i = samples.size() / 4; i < samples.size() / 2; ++i) worst = std::max(worst, double(std::fabs(got[i] - samples[i])));
    EXPECT_LE(worst, c.tolerance);
}

INSTANTIATE_TEST_SUITE_P(
    Formats, CompressedRead,
    ::testing::Values(CompressedCase{"flac", SF_FORMAT_FLAC | SF_FORMAT_PCM_16, 44100, AUDIO_CONTAINER_FLAC, AUDIO_FORMAT_FLAC, "FLAC", 1.0 / 32768},
                      CompressedCase{"ogg", SF_FORMAT_OGG | SF_FORMAT_VORBIS, 44100, AUDIO_CONTAINER_OGG, AUDIO_FORMAT_VORBIS, "OGG", 0.1},
                      CompressedCase{"opus", SF_FORMAT_OGG | SF_FORMAT_OPUS, 48000, AUDIO_CONTAINER_OGG, AUDIO_FORMAT_OPUS, "OPUS", 0.1},
                      CompressedCase{"mp3", SF_FORMAT_MPEG | SF_FORMAT_MPEG_LAYER_III, 44100, AUDIO_CONTAINER_MPEG, AUDIO_FORMAT_MP3, "MP3", 0.1}),
    [](const auto &info) { return std::string(info.param.name); });

// Files made by another tool: sox writes each listed type from one
// generated tone; every one opens with its rate, channels and length.
struct SoxCase {
    const char *extension;
    const char *options;
    int container;
    bool exact_length;
};

class SoxRead : public ::testing::TestWithParam<SoxCase> {};

TEST_P(SoxRead, OpensWithRateChannelsAndLength) {
    const SoxCase &c = GetParam();
    TempDir dir;
    std::string path = dir.file(std::string("tone.") + c.extension);
    if (run("sox -n -r 32000 -c 2 " + std::string(c.options) + " " + path + " synth 0.5 sine 300 vol 0.5") != 0)
        GTEST_SKIP() << "sox cannot write " << c.extension;
    auto reader = open_reader(path.c_str(), "AUTO");
    ASSERT_NE(reader, nullptr) << AUDIOSIGNAL_GetLastError();
    EXPECT_EQ(reader->format().sampleRate, 32000);
    EXPECT_EQ(reader->format().numChannels, 2);
    EXPECT_EQ(reader->format().containerKind, c.container);
    auto samples = read_all(*reader, 1000);
    if (c.exact_length)
        EXPECT_EQ(samples.size(), 2u * 16000);
    else
        EXPECT_NEAR(static_cast<double>(samples.size()), 2.0 * 16000, 2.0 * 2400);
    // A 300 Hz tone at half scale: its peak is near 0.5.
    float peak = 0;
    for (float s : samples) peak = std::max(peak, std::fabs(s));
    EXPECT_NEAR(peak, 0.5, 0.06);
}

INSTANTIATE_TEST_SUITE_P(Formats, SoxRead,
                         ::testing::Values(SoxCase{"wav", "-b 16", AUDIO_CONTAINER_WAVE, true},
                                           SoxCase{"aiff", "-b 24", AUDIO_CONTAINER_AIFF, true},
                                           SoxCase{"caf", "-b 16", AUDIO_CONTAINER_CAF, true},
                                           SoxCase{"w64", "-b 32 -e floating-point", AUDIO_CONTAINER_W64, true},
                                           SoxCase{"flac", "-b 16", AUDIO_CONTAINER_FLAC, true},
                                           SoxCase{"ogg", "", AUDIO_CONTAINER_OGG, false},
                                           SoxCase{"mp3", "", AUDIO_CONTAINER_MPEG, false}),
                         [](const auto &info) { return std::string(info.param.extension); });

}  // namespace
