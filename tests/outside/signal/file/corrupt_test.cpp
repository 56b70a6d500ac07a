// Bad files fail to open with an error code; none crashes or makes the
// reader allocate what the header claims.
#include <gtest/gtest.h>
#include <sndfile.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstring>
#include <random>

#include "tests/outside/signal/file/reader_helpers.hpp"

using namespace velmsig;
using namespace velmtest;

namespace {

// A canonical 44-byte WAVE header with the given fields.
std::string wave_header(uint16_t channels, uint32_t rate, uint16_t bits, uint32_t data_bytes) {
    std::string h;
    auto u32 = [&h](uint32_t v) { for (int i = 0; i < 4; ++i) h += static_cast<char>(v >> (8 * i)); };
    auto u16 = [&h](uint16_t v) { for (int i = 0; i < 2; ++i) h += static_cast<char>(v >> (8 * i)); };
    h += "RIFF";
    u32(36 + data_bytes);
    h += "WAVEfmt ";
    u32(16);
    u16(1);
    u16(channels);
    u32(rate);
    u32(rate * channels * bits / 8);
    u16(static_cast<uint16_t>(channels * bits / 8));
    u16(bits);
    h += "data";
    u32(data_bytes);
    return h;
}

// An RF64 header whose 64-bit sizes claim `frames` mono 16-bit frames.
std::string rf64_header(uint64_t frames) {
    std::string h;
    auto u64 = [&h](uint64_t v) { for (int i = 0; i < 8; ++i) h += static_cast<char>(v >> (8 * i)); };
    auto u32 = [&h](uint32_t v) { for (int i = 0; i < 4; ++i) h += static_cast<char>(v >> (8 * i)); };
    auto u16 = [&h](uint16_t v) { for (int i = 0; i < 2; ++i) h += static_cast<char>(v >> (8 * i)); };
    h += "RF64";
    u32(0xFFFFFFFF);
    h += "WAVEds64";
    u32(28);
    u64(2 * frames + 72);  // RIFF size
    u64(2 * frames);       // data size
    u64(frames);           // sample count
    u32(0);
    h += "fmt ";
    u32(16);
    u16(1);
    u16(1);
    u32(8000);
    u32(16000);
    u16(2);
    u16(16);
    h += "data";
    u32(0xFFFFFFFF);
    return h;
}

class Corrupt : public ::testing::Test {
protected:
    // Opening fails with `error`, through every way in.
    void expect_refused(const std::string &bytes, int error) {
        std::string path = dir_.file("bad.wav");
        write_text(path, bytes);
        AUDIOSIGNAL_ResetLastError();
        EXPECT_EQ(open_reader(path.c_str(), "AUTO"), nullptr);
        EXPECT_EQ(AUDIOSIGNAL_GetLastError(), error);
        EXPECT_EQ(AUDIOSIGNAL_CanOpen(path.c_str(), "AUTO", AUDIO_CANOPEN_DECODE), 0);
        EXPECT_EQ(AUDIOSIGNAL_GetLastError(), error);
    }
    TempDir dir_;
};

TEST_F(Corrupt, EmptyAndMissingFiles) {
    expect_refused("", AUDIO_ERROR_CORRUPT_DATA);
    EXPECT_EQ(open_reader(dir_.file("none.wav").c_str(), "AUTO"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_FILE_NOT_FOUND);
    EXPECT_EQ(open_reader(dir_.path().c_str(), "AUTO"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_UNSUPPORTED_FORMAT);
    EXPECT_EQ(open_reader(nullptr, "AUTO"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_BAD_ARGUMENT);
}

TEST_F(Corrupt, RandomBytesAreNotAudio) {
    std::mt19937 random(7);
    for (int round = 0; round < 20; ++round) {
        std::string bytes(1 + random() % 5000, '\0');
        for (char &b : bytes) b = static_cast<char>(random());
        write_text(dir_.file("noise.bin"), bytes);
        EXPECT_EQ(open_reader(dir_.file("noise.bin").c_str(), "AUTO"), nullptr);
        EXPECT_NE(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_NONE);
    }
}

TEST_F(Corrupt, HeadersClaimingTooMuch) {
    std::string data(4000, '\x01');
    expect_refused(wave_header(65535, 44100, 16, 4000) + data, AUDIO_ERROR_CORRUPT_DATA);
    expect_refused(wave_header(100, 44100, 16, 4000) + data, AUDIO_ERROR_CORRUPT_DATA);
    expect_refused(wave_header(2, 0, 16, 4000) + data, AUDIO_ERROR_CORRUPT_DATA);
}

TEST_F(Corrupt, TruncatedFilesOpenWithWhatTheyHold) {
    auto samples = test_signal(2, 10000);
    std::string path = dir_.file("t.wav");
    ASSERT_TRUE(write_sndfile(path, SF_FORMAT_WAV | SF_FORMAT_PCM_16, 8000, 2, samples));
    std::string whole = slurp(path);

    // Cut inside the header: refused.
    for (size_t cut : {4u, 12u, 30u})
        expect_refused(whole.substr(0, cut), cut < 12 ? AUDIO_ERROR_UNSUPPORTED_FORMAT : AUDIO_ERROR_CORRUPT_DATA);

    // Cut inside the samples: the frames that are there.
    write_text(path, whole.substr(0, whole.size() - 4000));
    auto reader = open_reader(path.c_str(), "AUTO");
    ASSERT_NE(reader, nullptr);
    EXPECT_EQ(reader->frames(), 10000 - 1000);
    auto got = read_all(*reader);
    EXPECT_EQ(got, std::vector<float>(samples.begin(), samples.end() - 4000 / 2));

    // Data sizes of 2^32 bytes and 2^40 frames on small files: bounded by the file.
    for (const std::string &header : {wave_header(1, 8000, 16, 0xFFFFFFF0u), rf64_header(uint64_t{1} << 40)}) {
        write_text(path, header + std::string(2000, '\0'));
        reader = open_reader(path.c_str(), "AUTO");
        ASSERT_NE(reader, nullptr);
        EXPECT_EQ(reader->frames(), 1000);  // exactly what is there
        std::vector<float> out(4000);
        EXPECT_EQ(reader->read(0, out.data(), 4000), 1000);
        EXPECT_EQ(reader->read(5000, out.data(), 1), 0);
    }
}

// Valid files with bytes of their headers changed at random: each opens or
// fails, and what opens reads to its end within what the file can hold.
TEST_F(Corrupt, MutatedHeadersNeverCrash) {
    std::mt19937 random(11);
    auto samples = test_signal(2, 3000);
    for (int sf : {SF_FORMAT_WAV | SF_FORMAT_PCM_16, SF_FORMAT_AIFF | SF_FORMAT_PCM_24, SF_FORMAT_CAF | SF_FORMAT_FLOAT,
                   SF_FORMAT_RF64 | SF_FORMAT_PCM_16, SF_FORMAT_FLAC | SF_FORMAT_PCM_16, SF_FORMAT_OGG | SF_FORMAT_VORBIS}) {
        std::string path = dir_.file("m");
        ASSERT_TRUE(write_sndfile(path, sf, 44100, 2, samples));
        const std::string whole = slurp(path);
        for (int round = 0; round < 40; ++round) {
            std::string bytes = whole;
            for (int k = 0; k < 1 + round % 4; ++k)
                bytes[random() % std::min<size_t>(bytes.size(), 128)] = static_cast<char>(random());
            write_text(path, bytes);
            auto reader = open_reader(path.c_str(), "AUTO");
            if (!reader) {
                EXPECT_NE(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_NONE);
                continue;
            }
            ASSERT_LE(reader->format().numChannels, AUDIO_MAX_CHANNELS);
            std::vector<float> part(static_cast<size_t>(4096 * reader->format().numChannels));
            int64_t total = 0;
            for (int64_t n; (n = reader->read(total, part.data(), 4096)) > 0;) total += n;
            if (reader->random_access()) {
                EXPECT_LE(total, static_cast<int64_t>(bytes.size()));
            }
        }
    }
}

#ifndef VELM_SANITIZE  // the sanitizers reserve far more address space than the limit
// Header claims never turn into allocations: with 256 MB of address space
// every hostile file still opens or fails for its own reason.
TEST_F(Corrupt, HostileHeadersNeedLittleMemory) {
    std::vector<std::string> files;
    for (const std::string &bytes : {wave_header(65535, 44100, 16, 0xFFFFFFF0u), wave_header(2, 44100, 32, 0xFFFFFFF0u),
                                     rf64_header(uint64_t{1} << 40), rf64_header(uint64_t{1} << 62)}) {
        files.push_back(dir_.file("hostile" + std::to_string(files.size())));
        write_text(files.back(), bytes + std::string(4096, '\x7f'));
    }
    pid_t pid = fork();
    if (pid == 0) {
        struct rlimit limit = {256 << 20, 256 << 20};
        setrlimit(RLIMIT_AS, &limit);
        for (const std::string &path : files) {
            auto reader = open_reader(path.c_str(), "AUTO");
            if (!reader && AUDIOSIGNAL_GetLastError() == AUDIO_ERROR_OUT_OF_MEMORY) _exit(1);
            std::vector<float> out(4096 * 2);
            if (reader && reader->format().numChannels <= 2)
                for (int64_t at = 0, n; (n = reader->read(at, out.data(), 4096)) > 0;) at += n;
        }
        _exit(0);
    }
    int status = -1;
    waitpid(pid, &status, 0);
    EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << status;
}
#endif

TEST_F(Corrupt, ReadArgumentsAreChecked) {
    std::string path = dir_.file("ok.wav");
    ASSERT_TRUE(write_sndfile(path, SF_FORMAT_WAV | SF_FORMAT_PCM_16, 8000, 2, test_signal(2, 100)));
    auto reader = open_reader(path.c_str(), "AUTO");
    ASSERT_NE(reader, nullptr);
    float out[8];
    EXPECT_EQ(reader->read(-1, out, 1), -1);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_BAD_ARGUMENT);
    EXPECT_EQ(reader->read(0, nullptr, 1), -1);
    EXPECT_EQ(reader->read(0, out, INT64_MAX), -1);  // more samples than positions hold
}

}  // namespace
