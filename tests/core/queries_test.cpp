// Document queries: file properties, the external-change check, statistics,
// sums and extremes against values computed here from the raw samples.
#include "core/velmaudio.h"
#include "core/velmqueries.h"
#include "testaudio.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <fstream>
#include <limits>
#include <thread>

namespace {

constexpr int kRate = 8000;
constexpr int64_t kFrames = 4000;

struct Opened : ::testing::Test {
    velmtest::TempDir dir;
    std::string path = dir.file("tone.wav");
    std::vector<float> frames = velmtest::sine(kRate, 2, kFrames, 300.0, 0.8);
    VELMAUDIO doc = nullptr;
    void SetUp() override
    {
        // A DC offset on channel 1 makes its sums differ from channel 0's.
        for (size_t i = 1; i < frames.size(); i += 2) frames[i] = frames[i] * 0.5f + 0.25f;
        ASSERT_TRUE(velmtest::write_audio(path, frames, kRate, 2, SF_FORMAT_WAV | SF_FORMAT_FLOAT));
        doc = VELMAUDIO_Open(path.c_str(), "AUTO");
        ASSERT_NE(doc, nullptr);
    }
    void TearDown() override { VELMAUDIO_Close(doc); }

    void select(double begin, double end)
    {
        VELMSTATE *s = VELMAUDIO_GetState(doc);
        VELMSELECTION **tail = &s->selections;
        while (*tail) tail = &(*tail)->next;
        auto *rec = static_cast<VELMSELECTION *>(BLMEM_New(s->pool, sizeof(VELMSELECTION)));
        rec->begin = begin;
        rec->end = end;
        *tail = rec;
    }
    // Sum of channel c over [begin, end) frames.
    double sum(int c, int64_t begin, int64_t end, bool squares = false) const
    {
        double total = 0;
        for (int64_t i = begin; i < end; ++i) {
            const double x = frames[static_cast<size_t>(i * 2 + c)];
            total += squares ? x * x : x;
        }
        return total;
    }
};

} // namespace

TEST_F(Opened, FileAndSignalProperties)
{
    EXPECT_EQ(VELMAUDIO_NumSamples(doc), kFrames);
    EXPECT_EQ(VELMAUDIO_SampleRate(doc), kRate);
    EXPECT_EQ(VELMAUDIO_NumChannels(doc), 2);
    EXPECT_EQ(VELMAUDIO_NumActiveChannels(doc), 2);
    EXPECT_EQ(VELMAUDIO_ActiveChannelsMask(doc), 0x3u);
    EXPECT_EQ(VELMAUDIO_GetFileSize(doc), static_cast<int64_t>(std::filesystem::file_size(path)));
    EXPECT_TRUE(VELMAUDIO_HasFileName(doc));
    EXPECT_FALSE(VELMAUDIO_IsUnresolvedLink(doc));
    int32_t value = 0;
    ASSERT_TRUE(VELMAUDIO_GetAudioProperty(doc, 3, &value));
    EXPECT_EQ(value, 32);
    EXPECT_FALSE(VELMAUDIO_GetAudioProperty(doc, 9, &value));
    AUDIOSIGNAL *signal = nullptr;
    ASSERT_TRUE(VELMAUDIO_GetAudioProperty(doc, 4, &signal));
    EXPECT_EQ(signal, VELMAUDIO_GetAudioSignal(doc));
    _audio_format f;
    EXPECT_EQ(VELMAUDIO_GetSignalFormat(&f, doc)->sampleRate, kRate);
    EXPECT_EQ(VELMAUDIO_GetSignalFormat(&f, nullptr)->sampleRate, 0);
    const char *label = VELMAUDIO_GetFileFormatLabel(doc);
    ASSERT_NE(label, nullptr);
    EXPECT_NE(std::string(label).find(" / "), std::string::npos) << label;
    EXPECT_GT(VELMAUDIO_SizeInMemory(doc), 0);
    EXPECT_TRUE(VELMAUDIO_FreeMemory(doc));
    EXPECT_EQ(VELMAUDIO_GetFileSize(nullptr), -1);
    EXPECT_EQ(VELMAUDIO_GetFileId(nullptr), -1);
}

TEST_F(Opened, ExternalChanges)
{
    EXPECT_EQ(VELMAUDIO_GetExternalChangeStatus(doc), VELM_FILE_UNCHANGED);
    const auto later = std::filesystem::last_write_time(path) + std::chrono::seconds(5);
    std::filesystem::last_write_time(path, later);
    EXPECT_EQ(VELMAUDIO_GetExternalChangeStatus(doc), VELM_FILE_CHANGED);
    ASSERT_TRUE(VELMAUDIO_ResetAudioFileStamp(doc));
    EXPECT_EQ(VELMAUDIO_GetExternalChangeStatus(doc), VELM_FILE_UNCHANGED);
    std::filesystem::remove(path);
    EXPECT_EQ(VELMAUDIO_GetExternalChangeStatus(doc), VELM_FILE_MISSING);
    AUDIOSIGNAL_AppendSilence(VELMAUDIO_GetAudioSignal(doc), 10);
    VELMSTATE_NotifyChanges(doc, 0);
    EXPECT_EQ(VELMAUDIO_GetExternalChangeStatus(doc), VELM_FILE_MISSING_MODIFIED);
    EXPECT_EQ(VELMAUDIO_GetExternalChangeStatus(nullptr), 0);
}

TEST_F(Opened, SumsAndExtremesFollowTheSelections)
{
    EXPECT_NEAR(VELMAUDIO_GetChannelSamplesSum(doc, 1), sum(1, 0, kFrames), 1e-3);
    EXPECT_NEAR(VELMAUDIO_GetChannelSamplesSum2(doc, 0), sum(0, 0, kFrames, true), 1e-3);
    select(0.1, 0.2);   // frames 800 .. 1600
    select(0.3, 0.35);  // frames 2400 .. 2800
    const double expected = sum(1, 800, 1600) + sum(1, 2400, 2800);
    EXPECT_NEAR(VELMAUDIO_GetChannelSamplesSum(doc, 1), expected, 1e-3);

    float lo = 0, hi = 0;
    ASSERT_TRUE(VELMAUDIO_GetChannelMinMax(doc, 0, &lo, &hi));
    float want_lo = 1, want_hi = -1;
    for (int64_t i : {800, 2400})
        for (int64_t k = i; k < i + (i == 800 ? 800 : 400); ++k) {
            want_lo = std::min(want_lo, frames[static_cast<size_t>(k * 2)]);
            want_hi = std::max(want_hi, frames[static_cast<size_t>(k * 2)]);
        }
    EXPECT_FLOAT_EQ(lo, want_lo);
    EXPECT_FLOAT_EQ(hi, want_hi);
    EXPECT_TRUE(VELMAUDIO_GetChannelMinMax(doc, 0, nullptr, nullptr));

    // Channel arguments count from the lowest active channel.
    AUDIOSIGNAL_DisableChannel(VELMAUDIO_GetAudioSignal(doc), 0);
    EXPECT_NEAR(VELMAUDIO_GetChannelSamplesSum(doc, 0), expected, 1e-3);
    EXPECT_FALSE(VELMAUDIO_GetChannelMinMax(doc, 1, &lo, &hi));
}

TEST_F(Opened, StatisticsOverSelectionsMergeTheirParts)
{
    AUDIOSIGNAL_STATISTICS whole{};
    ASSERT_TRUE(VELMAUDIO_GetSignalStats(doc, &whole, 0.05, 0));
    EXPECT_EQ(whole.numSamples, kFrames);
    EXPECT_NEAR(whole.channel[1].mean, sum(1, 0, kFrames) / kFrames, 1e-4);

    select(0.0, 0.1);
    select(0.25, 0.5);
    AUDIOSIGNAL_STATISTICS parts{};
    ASSERT_TRUE(VELMAUDIO_GetSignalStats(doc, &parts, 0.05, 0));
    EXPECT_EQ(parts.numSamples, 800 + 2000);
    EXPECT_NEAR(parts.channel[1].mean, (sum(1, 0, 800) + sum(1, 2000, 4000)) / 2800, 1e-4);
    EXPECT_TRUE(VELMAUDIO_GetSignalStats(doc, nullptr, 0.05, 0));
    EXPECT_FALSE(VELMAUDIO_GetSignalStats(nullptr, &parts, 0.05, 0));
}

TEST_F(Opened, AbsurdChannelsAndWindowsAreRefused)
{
    AUDIOSIGNAL_DisableChannel(VELMAUDIO_GetAudioSignal(doc), 0);
    float lo = 0, hi = 0;
    EXPECT_FALSE(VELMAUDIO_GetChannelMinMax(doc, std::numeric_limits<int>::max(), &lo, &hi));
    EXPECT_EQ(VELMAUDIO_GetChannelSamplesSum(doc, std::numeric_limits<int>::max()), 0.0);
    EXPECT_EQ(VELMAUDIO_GetChannelSamplesSum2(doc, -1), 0.0);

    AUDIOSIGNAL_STATISTICS stats{};
    EXPECT_FALSE(VELMAUDIO_GetSignalStats(doc, &stats, std::numeric_limits<double>::quiet_NaN(), 0));
    EXPECT_FALSE(VELMAUDIO_GetSignalStats(doc, &stats, std::numeric_limits<double>::infinity(), 0));
    EXPECT_FALSE(VELMAUDIO_GetSignalStats(doc, &stats, 1e10, 0)); // milliseconds beyond 32 bits
    EXPECT_TRUE(VELMAUDIO_GetSignalStats(doc, &stats, 0.05, 0));
}

TEST_F(Opened, MetadataIsCreatedOnDemandAndSaved)
{
    EXPECT_EQ(VELMAUDIO_GetTitle(doc), nullptr);
    ASSERT_TRUE(VELMAUDIO_SetTitle(doc, "Evening tone"));
    ASSERT_TRUE(VELMAUDIO_SetArtist(doc, "Test Bench"));
    EXPECT_STREQ(VELMAUDIO_GetTitle(doc), "Evening tone");
    ASSERT_TRUE(VELMAUDIO_SetMetaData(doc, "engineer", "nobody"));
    EXPECT_STREQ(VELMAUDIO_GetMetaData(doc, "engineer"), "nobody");
    const std::string copy = dir.file("tagged.wav");
    ASSERT_TRUE(VELMAUDIO_SaveAs(doc, copy.c_str(), "WAVE"));
    VELMAUDIO again = VELMAUDIO_Open(copy.c_str(), "AUTO");
    ASSERT_NE(again, nullptr);
    EXPECT_STREQ(VELMAUDIO_GetTitle(again), "Evening tone");
    EXPECT_STREQ(VELMAUDIO_GetArtist(again), "Test Bench");
    VELMAUDIO_Close(again);
    EXPECT_EQ(VELMAUDIO_SetTitle(nullptr, "x"), 0);
}
