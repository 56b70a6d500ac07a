// The progress a thread is told while signals are opened from and saved to files.
#include <sndfile.h>
#include <unistd.h>

#include <algorithm>
#include <string>
#include <thread>
#include <vector>

#include "store_test_support.hpp"

using namespace store_test;

namespace {

std::string temp_path(const char *name)
{
    return std::string(VELM_TEST_BINARY_DIR) + "/progress_" + name;
}

void write_file(const std::string &path, int64_t frames, int format)
{
    SF_INFO info{};
    info.samplerate = 44100;
    info.channels = 1;
    info.format = format;
    SNDFILE *file = sf_open(path.c_str(), SFM_WRITE, &info);
    ASSERT_NE(file, nullptr);
    const std::vector<float> samples = random_channels(1, frames, 7)[0];
    sf_writef_float(file, samples.data(), frames);
    sf_close(file);
}

void record(void *user, double fraction)
{
    static_cast<std::vector<double> *>(user)->push_back(fraction);
}

// Rising fractions within (0, 1], ending with exactly one 1.0.
void expect_rising_to_one(const std::vector<double> &fractions, size_t at_least)
{
    ASSERT_GE(fractions.size(), at_least);
    EXPECT_LE(fractions.size(), 101u);
    EXPECT_GT(fractions.front(), 0.0);
    for (size_t i = 1; i < fractions.size(); ++i) EXPECT_GT(fractions[i], fractions[i - 1]) << i;
    EXPECT_EQ(fractions.back(), 1.0);
}

class SignalProgress : public ::testing::Test {
protected:
    void SetUp() override { AUDIO_SetProgressCallback(record, &fractions); }
    void TearDown() override { AUDIO_SetProgressCallback(nullptr, nullptr); }
    std::vector<double> fractions;
};

}  // namespace

TEST_F(SignalProgress, OpeningAndSavingACompressedFileRiseToOne)
{
    const std::string path = temp_path("long.flac");
    const std::string copy = temp_path("copy.flac");
    write_file(path, 600000, SF_FORMAT_FLAC | SF_FORMAT_PCM_16);
    AUDIOSIGNAL *signal = AUDIOSIGNAL_OpenEx(path.c_str(), "AUTO", 0, nullptr, nullptr);
    ASSERT_NE(signal, nullptr);
    // Decoded in steps of 65536 frames: ten of them.
    expect_rising_to_one(fractions, 5);

    fractions.clear();
    ASSERT_EQ(AUDIOSIGNAL_Save(signal, copy.c_str(), "FLAC"), 1);
    expect_rising_to_one(fractions, 5);
    AUDIOSIGNAL_Destroy(signal);
    unlink(path.c_str());
    unlink(copy.c_str());
}

TEST_F(SignalProgress, PcmReadInPlaceCountsEveryThreadsPieces)
{
    const std::string path = temp_path("long.wav");
    write_file(path, 3 * (int64_t(1) << 20) + 5, SF_FORMAT_WAV | SF_FORMAT_PCM_16);
    AUDIOSIGNAL *signal = AUDIOSIGNAL_OpenEx(path.c_str(), "AUTO", 0, nullptr, nullptr);
    ASSERT_NE(signal, nullptr);
    expect_rising_to_one(fractions, 2);
    AUDIOSIGNAL_Destroy(signal);
    unlink(path.c_str());
}

TEST_F(SignalProgress, AFailedSaveNeverReachesOneAndOtherThreadsHearNothing)
{
    const Channels samples = random_channels(2, 200000, 3);
    AUDIOSIGNAL *signal = make_signal(samples);
    EXPECT_EQ(AUDIOSIGNAL_Save(signal, temp_path("no/such/folder.wav").c_str(), "WAVE"), 0);
    EXPECT_EQ(std::count(fractions.begin(), fractions.end(), 1.0), 0);

    // The callback belongs to the thread that set it.
    fractions.clear();
    const std::string path = temp_path("other.wav");
    std::thread other([&] { EXPECT_EQ(AUDIOSIGNAL_Save(signal, path.c_str(), "WAVE"), 1); });
    other.join();
    EXPECT_TRUE(fractions.empty());

    // Turned off, nothing is told.
    AUDIO_SetProgressCallback(nullptr, &fractions);
    EXPECT_EQ(AUDIOSIGNAL_Save(signal, path.c_str(), "WAVE"), 1);
    EXPECT_TRUE(fractions.empty());
    AUDIO_SetProgressCallback(record, &fractions);
    EXPECT_EQ(AUDIOSIGNAL_Save(signal, path.c_str(), "WAVE"), 1);
    expect_rising_to_one(fractions, 3);
    AUDIOSIGNAL_Destroy(signal);
    unlink(path.c_str());
}
