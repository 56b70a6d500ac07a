// The AUDIO_ file calls, the last error and the open check, through the
// shared library.
#include <gtest/gtest.h>
#include <sndfile.h>

#include <cmath>
#include <thread>

#include "outside/signal/audioformat.h"
#include "tests/outside/signal/file/file_helpers.hpp"

using namespace velmtest;

namespace {

std::vector<float> load_all(AUDIO_FILE *file) {
    _audio_format f = AUDIO_GetAudioFileFormat(file);
    std::vector<float> all, part(static_cast<size_t>(512 * f.numChannels));
    int64_t n;
    while ((n = AUDIO_ReadIEEEFloat(file, part.data(), 512)) > 0)
        all.insert(all.end(), part.begin(), part.begin() + n * f.numChannels);
    EXPECT_EQ(n, 0);
    return all;
}

TEST(FileApi, WritesAndReadsFrames) {
    TempDir dir;
    std::string path = dir.file("device.wav");
    _audio_format format = AUDIO_InitFormat(22050, 2, 16);
    AUDIO_FILE *out = AUDIO_CreateFileEx(path.c_str(), &format, "WAVPCM");
    ASSERT_NE(out, nullptr);
    auto samples = test_signal(2, 3000);
    EXPECT_EQ(AUDIO_WriteIEEEFloat(out, samples.data(), 1000), 1000);
    EXPECT_EQ(AUDIO_WriteIEEEFloat(out, samples.data() + 2000, 2000), 2000);
    EXPECT_EQ(AUDIO_GetAudioFileFormat(out).sampleRate, 22050);
    EXPECT_EQ(AUDIO_ReadIEEEFloat(out, samples.data(), 1), -1);  // not a reader
    ASSERT_EQ(AUDIO_CloseFile(out), 1);

    AUDIO_FILE *in = AUDIO_LoadFile(path.c_str(), "AUTO");
    ASSERT_NE(in, nullptr);
    _audio_format got = AUDIO_GetAudioFileFormat(in);
    EXPECT_EQ(got.sampleRate, 22050);
    EXPECT_EQ(got.numChannels, 2);
    EXPECT_EQ(got.containerKind, AUDIO_CONTAINER_WAVE);
    EXPECT_EQ(load_all(in), samples);
    EXPECT_EQ(AUDIO_WriteIEEEFloat(in, samples.data(), 1), -1);  // not a writer
    EXPECT_EQ(AUDIO_CloseFile(in), 1);
}

TEST(FileApi, ConvertsRateAndChannelsWhileLoading) {
    TempDir dir;
    std::string path = dir.file("tone.wav");
    const int rate = 8000, frames = 8000;
    std::vector<float> stereo(2 * frames);
    for (int i = 0; i < frames; ++i) {
        float v = 0.5f * static_cast<float>(std::sin(2 * M_PI * 250.0 * i / rate));
        stereo[2 * i] = v;
        stereo[2 * i + 1] = v * 0.5f;  // (L + R) / 2 = 0.75 v
    }
    ASSERT_TRUE(write_sndfile(path, SF_FORMAT_WAV | SF_FORMAT_FLOAT, rate, 2, stereo));

    // Channels only: every frame stays where it was.
    AUDIO_FILE *mono = AUDIO_LoadFile(path.c_str(), "AUTO:FMTCONV[nc=1]");
    ASSERT_NE(mono, nullptr);
    EXPECT_EQ(AUDIO_GetAudioFileFormat(mono).numChannels, 1);
    auto m = load_all(mono);
    ASSERT_EQ(m.size(), static_cast<size_t>(frames));
    for (int i = 0; i < frames; i += 97) EXPECT_FLOAT_EQ(m[i], 0.75f * stereo[2 * i]);
    AUDIO_CloseFile(mono);

    // Rate: twice the frames, the same tone (its zero crossings per second).
    AUDIO_FILE *up = AUDIO_LoadFile(path.c_str(), "AUTO:FMTCONV[sr=16000,nc=2,nbits=16]");
    ASSERT_NE(up, nullptr);
    _audio_format f = AUDIO_GetAudioFileFormat(up);
    EXPECT_EQ(f.sampleRate, 16000);
    EXPECT_EQ(f.bitsPerSample, 16);
    auto u = load_all(up);
    AUDIO_CloseFile(up);
    EXPECT_NEAR(static_cast<double>(u.size()), 2.0 * 2 * frames, 2.0 * 64);
    int crossings = 0;
    for (size_t i = 2; i + 2 < u.size() / 2; i += 2) crossings += (u[i] < 0) != (u[i + 2] < 0);
    EXPECT_NEAR(crossings, 2 * 250 * (u.size() / 2 / 2) / 16000.0, 4);
}

TEST(FileApi, BadArgumentsFailCleanly) {
    _audio_format f = AUDIO_InitFormat(8000, 1, 16);
    EXPECT_EQ(AUDIO_LoadFile(nullptr, "AUTO"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_BAD_ARGUMENT);
    EXPECT_EQ(AUDIO_CreateFileEx("/tmp/x.wav", nullptr, "WAVE"), nullptr);
    EXPECT_EQ(AUDIO_CreateFileEx("/tmp/x.wav", &f, "WAVE[sr=x]"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_BAD_FORMAT_STRING);
    float buf[4];
    EXPECT_EQ(AUDIO_ReadIEEEFloat(nullptr, buf, 1), -1);
    EXPECT_EQ(AUDIO_WriteIEEEFloat(nullptr, buf, 1), -1);
    EXPECT_EQ(AUDIO_CloseFile(nullptr), 0);
    EXPECT_EQ(AUDIO_GetAudioFileFormat(nullptr).sampleRate, 0);
}

TEST(LastError, IsPerThreadAndResets) {
    AUDIOSIGNAL_ResetLastError();
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_NONE);
    EXPECT_EQ(AUDIO_LoadFile("/nonexistent/file.wav", "AUTO"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_FILE_NOT_FOUND);
    int other = -1;
    std::thread([&other] { other = AUDIOSIGNAL_GetLastError(); }).join();
    EXPECT_EQ(other, AUDIO_ERROR_NONE);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_FILE_NOT_FOUND);
    AUDIOSIGNAL_ResetLastError();
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_NONE);
}

TEST(CanOpen, AnswersFromTheHeader) {
    TempDir dir;
    std::string path = dir.file("ok.flac");
    ASSERT_TRUE(write_sndfile(path, SF_FORMAT_FLAC | SF_FORMAT_PCM_16, 44100, 1, test_signal(1, 1000)));
    EXPECT_EQ(AUDIOSIGNAL_CanOpen(path.c_str(), "AUTO", 0), 1);
    EXPECT_EQ(AUDIOSIGNAL_CanOpen(path.c_str(), "AUTO", AUDIO_CANOPEN_DECODE), 1);
    EXPECT_EQ(AUDIOSIGNAL_CanOpen(path.c_str(), "AUTO[", 0), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_BAD_FORMAT_STRING);
    EXPECT_EQ(AUDIOSIGNAL_CanOpen(dir.file("none.wav").c_str(), "AUTO", 0), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_FILE_NOT_FOUND);
    write_text(dir.file("text.txt"), "just some words, not sound\n");
    EXPECT_EQ(AUDIOSIGNAL_CanOpen(dir.file("text.txt").c_str(), "AUTO", 0), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_UNSUPPORTED_FORMAT);
}

}  // namespace
