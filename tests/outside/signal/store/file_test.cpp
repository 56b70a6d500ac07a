// Signals opened from and saved to real files; regions moving with edits.
#include <sndfile.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <string>

#include "outside/signal/audioregion.h"
#include "store_test_support.hpp"

using namespace store_test;

namespace {

std::string temp_path(const char *name)
{
    return std::string(VELM_TEST_BINARY_DIR) + "/store_" + name;
}

// Writes 16-bit samples (or FLAC) with libsndfile; returns the values as read back.
Channels write_file(const std::string &path, const Channels &channels, int format)
{
    SF_INFO info{};
    info.samplerate = 44100;
    info.channels = int(channels.size());
    info.format = format;
    SNDFILE *file = sf_open(path.c_str(), SFM_WRITE, &info);
    EXPECT_NE(file, nullptr);
    const size_t frames = channels[0].size();
    std::vector<float> interleaved;
    for (size_t i = 0; i < frames; ++i) {
        for (const auto &channel : channels) interleaved.push_back(channel[i] * 0.9f);
    }
    sf_writef_float(file, interleaved.data(), sf_count_t(frames));
    sf_close(file);
    file = sf_open(path.c_str(), SFM_READ, &info);
    sf_readf_float(file, interleaved.data(), sf_count_t(frames));
    sf_close(file);
    Channels result(channels.size(), std::vector<float>(frames));
    for (size_t i = 0; i < frames; ++i) {
        for (size_t c = 0; c < channels.size(); ++c) result[c][i] = interleaved[i * channels.size() + c];
    }
    return result;
}

TEST(SignalStoreFile, PcmIsReadInPlaceAndSurvivesTheFileGoing)
{
    const std::string path = temp_path("pcm.wav");
    const Channels expected = write_file(path, random_channels(2, 150000, 41), SF_FORMAT_WAV | SF_FORMAT_PCM_16);
    AUDIOSIGNAL *signal = AUDIOSIGNAL_OpenEx(path.c_str(), "AUTO", AUDIOSIGNAL_OPEN_METADATA | AUDIOSIGNAL_OPEN_SAMPLES,
                                             nullptr, nullptr);
    ASSERT_NE(signal, nullptr);
    EXPECT_EQ(AUDIOSIGNAL_SampleRate(signal), 44100);
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(signal), 150000);
    EXPECT_LT(AUDIOSIGNAL_SizeInMemory(signal), 150000);  // summaries only, no decoded copy
    char text[64];
    ASSERT_EQ(AUDIOSIGNAL_GetFormatString(signal, text, sizeof text), 1);
    EXPECT_EQ(std::string(text).find("AUTO"), std::string::npos);
    EXPECT_EQ(AUDIOSIGNAL_SizeInDisk(signal), int64_t(44 + 150000 * 4));
    struct stat info;
    ASSERT_EQ(stat(path.c_str(), &info), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_FILE),
              uint64_t(info.st_mtim.tv_sec) * 1000000000u + uint64_t(info.st_mtim.tv_nsec));
    EXPECT_EQ(AUDIOSIGNAL_HasChanges(signal), 0);

    unlink(path.c_str());
    EXPECT_EQ(read_all(signal), expected);
    float lo, hi;
    ASSERT_EQ(AUDIOSIGNAL_GetChannelMinMax(signal, 1, 1000, 100000, &lo, &hi), 1);
    EXPECT_EQ(lo, *std::min_element(expected[1].begin() + 1000, expected[1].begin() + 101000));
    EXPECT_EQ(hi, *std::max_element(expected[1].begin() + 1000, expected[1].begin() + 101000));
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreFile, EveryChannelCountGetsExactSummaries)
{
    for (int channels : {1, 3, 4}) {
        const std::string path = temp_path("channels.wav");
        const Channels expected =
            write_file(path, random_channels(channels, 70001, uint32_t(46 + channels)), SF_FORMAT_WAV | SF_FORMAT_PCM_24);
        AUDIOSIGNAL *signal = AUDIOSIGNAL_OpenEx(path.c_str(), "AUTO", 0, nullptr, nullptr);
        ASSERT_NE(signal, nullptr);
        for (int c = 0; c < channels; ++c) {
            AUDIOPOINTER pointer;
            AUDIOSIGNAL_InitAudioPointer(signal, &pointer, 3, c);
            for (int64_t at = 3; at < 70001; at += 3001) {
                float lo, hi;
                const int64_t n = AUDIOSIGNAL_GetChannelMinMaxFromAudioPointer(signal, &pointer, 3001, &lo, &hi);
                const auto [a, b] = std::minmax_element(expected[size_t(c)].begin() + at,
                                                        expected[size_t(c)].begin() + at + n);
                ASSERT_EQ(lo, *a) << channels << " channels, channel " << c << " at " << at;
                ASSERT_EQ(hi, *b) << channels << " channels, channel " << c << " at " << at;
            }
        }
        AUDIOSIGNAL_Destroy(signal);
        unlink(path.c_str());
    }
}

TEST(SignalStoreFile, SummariesStayExactAcrossTheScansPieces)
{
    // A little over two of the scan's pieces, so that threads share it and
    // the last piece ends inside a window.
    const int64_t frames = 2 * (int64_t(1) << 20) + 1000;
    const std::string path = temp_path("long.wav");
    Channels samples = random_channels(1, frames, 47);
    samples[0][size_t(frames) - 1] = 1.0f;  // the peak in the last, partial window
    samples[0][(size_t(1) << 20) - 1] = -1.0f;  // the trough just before the first piece ends
    const Channels expected = write_file(path, samples, SF_FORMAT_WAV | SF_FORMAT_PCM_16);
    AUDIOSIGNAL *signal = AUDIOSIGNAL_OpenEx(path.c_str(), "AUTO", 0, nullptr, nullptr);
    ASSERT_NE(signal, nullptr);
    EXPECT_EQ(read_all(signal), expected);
    const auto &channel = expected[0];
    for (const auto &[at, n] : {std::pair<int64_t, int64_t>{0, frames}, {1000000, 100000}, {(1 << 20) - 1, 2},
                               {2 * (1 << 20) - 300, 1300}, {frames - 1, 1}}) {
        float lo, hi;
        ASSERT_EQ(AUDIOSIGNAL_GetChannelMinMax(signal, 0, at, n, &lo, &hi), 1);
        EXPECT_EQ(lo, *std::min_element(channel.begin() + at, channel.begin() + at + n)) << at;
        EXPECT_EQ(hi, *std::max_element(channel.begin() + at, channel.begin() + at + n)) << at;
    }
    AUDIOSIGNAL_Destroy(signal);
    unlink(path.c_str());
}

TEST(SignalStoreFile, CompressedFilesAreDecodedOnceOutOfMemory)
{
    const std::string path = temp_path("coded.flac");
    const Channels expected = write_file(path, random_channels(1, 100000, 42), SF_FORMAT_FLAC | SF_FORMAT_PCM_16);
    AUDIOSIGNAL *signal = AUDIOSIGNAL_OpenEx(path.c_str(), "AUTO", 0, nullptr, nullptr);
    ASSERT_NE(signal, nullptr);
    EXPECT_LT(AUDIOSIGNAL_SizeInMemory(signal), 10000);
    EXPECT_EQ(read_all(signal), expected);
    AUDIOSIGNAL_Destroy(signal);
    unlink(path.c_str());
}

TEST(SignalStoreFile, SaveAndOpenAgainKeepsTheSamples)
{
    const std::string path = temp_path("saved.wav");
    const Channels samples = random_channels(2, 80000, 43);
    AUDIOSIGNAL *signal = make_signal(samples);
    ASSERT_EQ(AUDIOSIGNAL_Save(signal, path.c_str(), "WAVE[nb=32,af=float]") ||
                  AUDIOSIGNAL_Save(signal, path.c_str(), "AUTO"),
              1);
    EXPECT_EQ(AUDIOSIGNAL_GetFileName(signal), path);
    EXPECT_GT(AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_FILE), 0u);
    AUDIOSIGNAL *back = AUDIOSIGNAL_OpenEx(path.c_str(), "AUTO", 0, nullptr, nullptr);
    ASSERT_NE(back, nullptr);
    const Channels read = read_all(back);
    ASSERT_EQ(read.size(), 2u);
    ASSERT_EQ(read[0].size(), samples[0].size());
    for (size_t c = 0; c < 2; ++c) {
        for (size_t i = 0; i < read[c].size(); i += 97) EXPECT_NEAR(read[c][i], samples[c][i], 1.0 / 32768);
    }
    // Saving over the file the signal reads from in place.
    AUDIOSIGNAL_ReverseEx(back, 0, 0, AUDIOSIGNAL_END);
    const Channels reversed = read_all(back);
    ASSERT_EQ(AUDIOSIGNAL_Save(back, path.c_str(), "AUTO"), 1);
    EXPECT_EQ(read_all(back), reversed);
    AUDIOSIGNAL_Destroy(back);
    AUDIOSIGNAL_Destroy(signal);
    unlink(path.c_str());
}

TEST(SignalStoreFile, BadFilesFailCleanly)
{
    EXPECT_EQ(AUDIOSIGNAL_OpenEx(nullptr, "AUTO", 0, nullptr, nullptr), nullptr);
    AUDIOSIGNAL_ResetLastError();
    EXPECT_EQ(AUDIOSIGNAL_OpenEx(temp_path("missing.wav").c_str(), "AUTO", 0, nullptr, nullptr), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_FILE_NOT_FOUND);

    const std::string path = temp_path("garbage.wav");
    FILE *file = fopen(path.c_str(), "wb");
    const char bytes[] = "RIFF\xff\xff\xff\x7fWAVEfmt garbage that is no header at all";
    fwrite(bytes, 1, sizeof bytes, file);
    fclose(file);
    EXPECT_EQ(AUDIOSIGNAL_OpenEx(path.c_str(), "AUTO", 0, nullptr, nullptr), nullptr);
    EXPECT_NE(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_NONE);
    unlink(path.c_str());

    AUDIOSIGNAL *signal = make_signal(random_channels(1, 100, 44));
    EXPECT_EQ(AUDIOSIGNAL_Save(signal, "/nonexistent-folder/x.wav", "AUTO"), 0);
    EXPECT_EQ(AUDIOSIGNAL_Save(signal, nullptr, "AUTO"), 0);
    AUDIOSIGNAL_Destroy(signal);
}

int answer_track(void *parent, int code, void *, void *data2)
{
    ++*static_cast<int *>(parent);
    if (code == AUDIOSIGNAL_CALLBACK_TRACK_ID) *static_cast<int32_t *>(data2) = 3;
    return 1;
}

TEST(SignalStoreFile, AnEditWithNoActiveChannelMovesNoRegion)
{
    const Channels samples = random_channels(2, 44100 * 6, 46);
    AUDIOSIGNAL *signal = make_signal(samples);
    AUDIOREGION *region = AUDIOSIGNAL_AddRegionToTrackEx(signal, 0, 4.0, 5.0, "word", nullptr, 0);
    ASSERT_NE(region, nullptr);
    AUDIOSIGNAL_DisableChannel(signal, 0);
    AUDIOSIGNAL_DisableChannel(signal, 1);
    const uint64_t stamp = AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_CHANGES);
    // No channel takes part, so nothing is removed: the region must stay over its audio.
    EXPECT_EQ(AUDIOSIGNAL_ClearEx(signal, 0, 0, 44100), 0);
    EXPECT_EQ(AUDIOREGION_BeginSample(region), 4 * 44100);
    // Silence and reverse change nothing either, so they do not claim a change.
    EXPECT_EQ(AUDIOSIGNAL_SilenceEx(signal, 0, 0, 44100), 0);
    EXPECT_EQ(AUDIOSIGNAL_ReverseEx(signal, 0, 0, 44100), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_CHANGES), stamp);
    EXPECT_EQ(read_all(signal), samples);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStoreFile, RegionsMoveWithTheAudio)
{
    AUDIOSIGNAL *signal = make_signal(random_channels(1, 44100 * 10, 45));
    AUDIOREGION *region = AUDIOSIGNAL_AddRegionToTrackEx(signal, 0, 4.0, 5.0, "word", nullptr, 0);
    ASSERT_NE(region, nullptr);
    const uint64_t stamp = AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_REGIONS);
    ASSERT_EQ(AUDIOSIGNAL_ClearEx(signal, 0, 0, 44100), 1);  // one second before it
    EXPECT_EQ(AUDIOREGION_BeginSample(region), 3 * 44100);
    AUDIOSIGNAL *second = AUDIOSIGNAL_CopyEx(signal, nullptr, 0, 0, 44100);
    ASSERT_EQ(AUDIOSIGNAL_PasteEx(signal, second, 0, 0, 0, nullptr), 1);
    EXPECT_EQ(AUDIOREGION_BeginSample(region), 4 * 44100);
    EXPECT_EQ(AUDIOREGION_GetParentSignal(region), signal);
    EXPECT_GE(AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_REGIONS), stamp);

    AUDIOSIGNAL *copy = AUDIOSIGNAL_DuplicateEx(signal, 0);
    EXPECT_EQ(AUDIOSIGNAL_CountRegions(copy, 0, 0, 0, 0, nullptr), 1);

    int asked = 0;
    AUDIOSIGNAL_SetParentObject(signal, &asked, answer_track);
    EXPECT_EQ(AUDIOSIGNAL_GetParentObject(signal), &asked);
    AUDIOSIGNAL_Destroy(second);
    AUDIOSIGNAL_Destroy(copy);
    AUDIOSIGNAL_Destroy(signal);
}

}  // namespace
