// velm devices, play and record through the always-present virtual device.
#include "testaudio.hpp"
#include "tool_run.hpp"

#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

using velmtest::run_tool;
using velmtest::ToolRun;

namespace {

const char kVirtual[] = " --device 'Virtual Device' --set libvelm.sound.virtual.speed=8";

// The leading frames of got equal want within two 16-bit steps.
void expect_same_start(const std::vector<float> &got, const std::vector<float> &want, size_t samples)
{
    ASSERT_GE(got.size(), samples);
    ASSERT_GE(want.size(), samples);
    size_t off = 0;
    for (size_t i = 0; i < samples; ++i)
        if (std::fabs(got[i] - want[i]) > 2.0f / 32768.0f) ++off;
    EXPECT_EQ(off, 0u);
}

TEST(VelmSound, DevicesListTheVirtualDevice)
{
    const ToolRun r = run_tool("devices");
    EXPECT_EQ(r.exit_code(), 0);
    EXPECT_TRUE(r.has("Virtual Device")) << r.output;
    EXPECT_TRUE(r.has("playback, capture")) << r.output;
}

TEST(VelmSound, PlayedAndRecordedSoundsComeOutWhole)
{
    velmtest::TempDir dir;
    const std::vector<float> tone = velmtest::sine(44100, 2, 22050, 330.0, 0.6);
    ASSERT_TRUE(velmtest::write_audio(dir.file("in.wav"), tone, 44100, 2));

    // The range played is the second quarter second of the tone.
    const ToolRun play = run_tool("play " + dir.file("in.wav") + " --from 0.25 --to 0.5" + kVirtual +
                                  " --set libvelm.sound.virtual.playbackfile=" + dir.file("heard.wav"));
    ASSERT_EQ(play.exit_code(), 0) << play.output;
    EXPECT_EQ(play.output, "");
    const std::vector<float> heard = velmtest::read_audio(dir.file("heard.wav"));
    expect_same_start(heard, std::vector<float>(tone.begin() + 2 * 11025, tone.end()), 2 * 11025);

    const ToolRun record = run_tool("record " + dir.file("rec.flac") + " --seconds 0.4 --rate 44100 --channels 2" +
                                    kVirtual + " --set libvelm.sound.virtual.capturefile=" + dir.file("in.wav"));
    ASSERT_EQ(record.exit_code(), 0) << record.output;
    int rate = 0, channels = 0;
    const std::vector<float> recorded = velmtest::read_audio(dir.file("rec.flac"), &rate, &channels);
    EXPECT_EQ(rate, 44100);
    EXPECT_EQ(channels, 2);
    EXPECT_EQ(recorded.size(), 2u * 17640u);
    expect_same_start(recorded, tone, 2 * 17640);
}

TEST(VelmSound, RefusesWhatItCannotDo)
{
    velmtest::TempDir dir;
    velmtest::expect_failure("play --device 'No Such Device'", 1, "no playback device named 'No Such Device'");
    velmtest::expect_failure("record " + dir.file("r.wav") + " --seconds 1 --device 'No Such Device'", 1,
                             "no capture device named");
    velmtest::expect_failure("record " + dir.file("r.wav"), 2, "missing");
    velmtest::expect_failure("record " + dir.file("r.wav") + " --seconds 0", 2, "'0'");
    velmtest::expect_failure("record " + dir.file("r.wav") + " --seconds 1 --channels 3", 2, "'3'");
    velmtest::expect_failure("play --set novalue", 2, "'novalue'");
    velmtest::expect_failure("devices extra", 2, "'extra'");
    velmtest::expect_failure("record " + dir.file("no/such/folder/r.wav") + " --seconds 0.1" + std::string(kVirtual), 1,
                             "cannot write");
    EXPECT_FALSE(std::filesystem::exists(dir.file("r.wav")));
}

} // namespace
