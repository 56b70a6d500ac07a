// The velm tool, run as a program: what it prints for the demo sound and for files.
#include "testaudio.hpp"

#include <gtest/gtest.h>

#include <cstdio>
#include <string>

namespace {

struct ToolRun {
    int status;
    std::string output;
};

ToolRun run(const std::string &arguments)
{
    const std::string command = std::string(VELM_TOOL_PATH) + " " + arguments + " 2>&1";
    FILE *pipe = popen(command.c_str(), "r");
    ToolRun r{-1, {}};
    if (!pipe) return r;
    char buffer[4096];
    size_t n;
    while ((n = fread(buffer, 1, sizeof buffer, pipe)) > 0) r.output.append(buffer, n);
    r.status = pclose(pipe);
    return r;
}

bool has(const ToolRun &r, const std::string &text)
{
    return r.output.find(text) != std::string::npos;
}

} // namespace

TEST(VelmTool, InfoOnTheDemoSound)
{
    const ToolRun r = run("info");
    ASSERT_EQ(r.status, 0) << r.output;
    EXPECT_TRUE(has(r, "44100 Hz")) << r.output;
    EXPECT_TRUE(has(r, "176400 samples (4.000 s)")) << r.output;
    EXPECT_TRUE(has(r, "Demo chord")) << r.output;
    EXPECT_TRUE(has(r, "channel 1: peak")) << r.output;
    EXPECT_TRUE(has(r, "channel 2: peak")) << r.output;
}

TEST(VelmTool, InfoMeasuresAFile)
{
    velmtest::TempDir dir;
    const std::string path = dir.file("half.wav");
    // A full-scale half: peak 0.5 is -6.02 dBFS; a constant 0.5 has RMS 0.5 and DC 0.5.
    std::vector<float> frames(8000, 0.5f);
    ASSERT_TRUE(velmtest::write_audio(path, frames, 8000, 1, SF_FORMAT_WAV | SF_FORMAT_FLOAT));
    const ToolRun r = run("info " + path + " --from 0.25 --to 0.75");
    ASSERT_EQ(r.status, 0) << r.output;
    EXPECT_TRUE(has(r, "8000 Hz")) << r.output;
    EXPECT_TRUE(has(r, "0.250 s .. 0.750 s")) << r.output;
    EXPECT_TRUE(has(r, "peak 0.5000 (-6.02 dBFS), RMS 0.5000 (-6.02 dBFS), DC offset +0.500000")) << r.output;
}

TEST(VelmTool, BadInputFailsWithAMessage)
{
    velmtest::TempDir dir;
    ToolRun r = run("info " + dir.file("missing.wav"));
    EXPECT_NE(r.status, 0);
    EXPECT_TRUE(has(r, "cannot open")) << r.output;
    r = run("info --from banana");
    EXPECT_NE(r.status, 0);
    EXPECT_TRUE(has(r, "usage")) << r.output;
    r = run("frobnicate");
    EXPECT_NE(r.status, 0);
    EXPECT_TRUE(has(r, "unknown command")) << r.output;
}
