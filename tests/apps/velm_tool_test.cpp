// The velm tool, run as a program: what it prints for the demo sound and for files.
#include "testaudio.hpp"
#include "tool_run.hpp"

#include <gtest/gtest.h>

#include <algorithm>

#include <QImage>
#include <cstdlib>
#include <fstream>
#include <string>

namespace {

using velmtest::contents;
using velmtest::distinct_colours;
using velmtest::expect_failure;
using velmtest::run_tool;
using velmtest::ToolRun;

// What libsndfile reads in a file's header; all zero when it cannot open it.
SF_INFO file_info(const std::string &path)
{
    SF_INFO info{};
    if (SNDFILE *f = sf_open(path.c_str(), SFM_READ, &info)) sf_close(f);
    return info;
}

// Sign changes along the first channel of interleaved frames.
int zero_crossings(const std::vector<float> &frames, int channels)
{
    int n = 0;
    for (size_t i = static_cast<size_t>(channels); i < frames.size(); i += static_cast<size_t>(channels))
        n += (frames[i - static_cast<size_t>(channels)] < 0) != (frames[i] < 0);
    return n;
}

} // namespace

TEST(VelmTool, InfoOnTheDemoSound)
{
    const ToolRun r = run_tool("info");
    ASSERT_EQ(r.status, 0) << r.output;
    EXPECT_TRUE(r.has("44100 Hz")) << r.output;
    EXPECT_TRUE(r.has("176400 samples (4.000 s)")) << r.output;
    EXPECT_TRUE(r.has("Demo sound")) << r.output;
    EXPECT_TRUE(r.has("channel 1: peak")) << r.output;
    EXPECT_TRUE(r.has("channel 2: peak")) << r.output;
}

TEST(VelmTool, InfoMeasuresAFile)
{
    velmtest::TempDir dir;
    const std::string path = dir.file("half.wav");
    // A full-scale half: peak 0.5 is -6.02 dBFS; a constant 0.5 has RMS 0.5 and DC 0.5.
    std::vector<float> frames(8000, 0.5f);
    ASSERT_TRUE(velmtest::write_audio(path, frames, 8000, 1, SF_FORMAT_WAV | SF_FORMAT_FLOAT));
    const ToolRun r = run_tool("info " + path + " --from 0.25 --to 0.75");
    ASSERT_EQ(r.status, 0) << r.output;
    EXPECT_TRUE(r.has("8000 Hz")) << r.output;
    EXPECT_TRUE(r.has("0.250 s .. 0.750 s")) << r.output;
    EXPECT_TRUE(r.has("peak 0.5000 (-6.02 dBFS), RMS 0.5000 (-6.02 dBFS), DC offset +0.500000")) << r.output;
}

TEST(VelmTool, InfoMeasuresEveryChannelOfAWideFile)
{
    velmtest::TempDir dir;
    const std::string path = dir.file("eight.wav");
    // Eight channels, channel k holding the constant k / 10.
    std::vector<float> frames;
    for (int i = 0; i < 4000; ++i)
        for (int c = 1; c <= 8; ++c) frames.push_back(0.1f * static_cast<float>(c));
    ASSERT_TRUE(velmtest::write_audio(path, frames, 8000, 8, SF_FORMAT_WAV | SF_FORMAT_FLOAT));
    const ToolRun r = run_tool("info " + path);
    ASSERT_EQ(r.status, 0) << r.output;
    EXPECT_TRUE(r.has("channel 1: peak 0.1000 (-20.00 dBFS), RMS 0.1000 (-20.00 dBFS), DC offset +0.100000")) << r.output;
    EXPECT_TRUE(r.has("channel 7: peak 0.7000 (-3.10 dBFS), RMS 0.7000 (-3.10 dBFS), DC offset +0.700000")) << r.output;
    EXPECT_TRUE(r.has("channel 8: peak 0.8000 (-1.94 dBFS), RMS 0.8000 (-1.94 dBFS), DC offset +0.800000")) << r.output;
}

TEST(VelmTool, BadInputFailsWithAMessage)
{
    velmtest::TempDir dir;
    expect_failure("info " + dir.file("missing.wav"), 1, "cannot open");
    expect_failure("info --from banana", 2, "cannot use the argument 'banana'");
    expect_failure("frobnicate", 2, "unknown command");
}

TEST(VelmTool, RenderDrawsTheDemoSoundWithoutADisplay)
{
    velmtest::TempDir dir;
    const std::string out = dir.file("demo.png");
    // The tool picks the offscreen platform itself when none is named.
    const std::string saved = std::getenv("QT_QPA_PLATFORM") ? std::getenv("QT_QPA_PLATFORM") : "";
    unsetenv("QT_QPA_PLATFORM");
    const ToolRun r = run_tool("render -o " + out + " --size 320x200");
    if (!saved.empty()) setenv("QT_QPA_PLATFORM", saved.c_str(), 1);
    ASSERT_EQ(r.status, 0) << r.output;
    EXPECT_EQ(r.output, "");
    const QImage image(QString::fromStdString(out), "PNG");
    ASSERT_FALSE(image.isNull());
    EXPECT_EQ(image.width(), 320);
    EXPECT_EQ(image.height(), 200);
    EXPECT_FALSE(image.hasAlphaChannel()); // the view is opaque
    // Background, waveform, spectrogram shades and navigator.
    EXPECT_GT(distinct_colours(image), 16u);
}

TEST(VelmTool, RenderOptionsChangeThePicture)
{
    velmtest::TempDir dir;
    const std::string sound = dir.file("tone.wav");
    std::vector<float> frames = velmtest::sine(16000, 1, 32000, 300.0, 0.3);
    for (size_t i = 16000; i < 20000; ++i) frames[i] *= 2.5f; // a louder stretch in the middle
    ASSERT_TRUE(velmtest::write_audio(sound, frames, 16000, 1));

    auto render = [&](const std::string &name, const std::string &options) {
        const std::string out = dir.file(name + ".png");
        const ToolRun r = run_tool("render " + sound + " -o " + out + " --size 400x240 " + options);
        EXPECT_EQ(r.status, 0) << options << ": " << r.output;
        return QImage(QString::fromStdString(out), "PNG");
    };
    const QImage waveform = render("waveform", "--lanes waveform");
    const QImage spectrogram = render("spectrogram", "--lanes spectrogram");
    const QImage both = render("both", "--lanes both");
    const QImage middle = render("middle", "--lanes waveform --from 0.9 --to 1.3");
    const QImage wide = render("wide", "--lanes spectrogram --set libvelm.spectral.preset=wide");
    for (const QImage *image : {&waveform, &spectrogram, &both, &middle, &wide}) {
        ASSERT_EQ(image->size(), QSize(400, 240));
        EXPECT_GT(distinct_colours(*image), 2u);
    }
    EXPECT_NE(waveform, spectrogram);
    EXPECT_NE(waveform, both);
    EXPECT_NE(spectrogram, both);
    EXPECT_NE(waveform, middle);
    EXPECT_NE(spectrogram, wide);
}

TEST(VelmTool, RenderRefusesBadArgumentsAndKeepsTheOutput)
{
    velmtest::TempDir dir;
    const std::string out = dir.file("keep.png");
    std::ofstream(out) << "old picture";
    const char *refused[] = {
        "--size 10x10", "--size 640", "--size 99999x400", "--lanes waves", "--set colour=red",
        "--set libvelm.", "--from -1", "--to 2 --bogus",
    };
    for (const char *options : refused) expect_failure("render -o " + out + " " + options, 2, "cannot use the argument");
    expect_failure("render --size 320x200", 2, "an argument is missing");
    expect_failure("render -o " + out + " --from 30", 1, "the range holds no samples");
    expect_failure("render " + dir.file("missing.wav") + " -o " + out, 1, "cannot open");
    EXPECT_EQ(contents(out), "old picture");

    expect_failure("render -o " + dir.file("no/such/folder.png"), 1, "cannot write");
    const ToolRun r = run_tool("render --help");
    EXPECT_EQ(r.status, 0);
    EXPECT_TRUE(r.has("usage: velm render")) << r.output;
}

TEST(VelmTool, ConvertResamplesAndMixesDownKeepingThePitch)
{
    velmtest::TempDir dir;
    const std::string in = dir.file("sine.wav");
    const std::string out = dir.file("mono.wav");
    ASSERT_TRUE(velmtest::write_audio(in, velmtest::sine(44100, 2, 44100, 440.0), 44100, 2));
    const ToolRun r = run_tool("convert " + in + " " + out + " --rate 16000 --channels 1");
    ASSERT_EQ(r.status, 0) << r.output;
    int rate = 0, channels = 0;
    const std::vector<float> frames = velmtest::read_audio(out, &rate, &channels);
    EXPECT_EQ(rate, 16000);
    EXPECT_EQ(channels, 1);
    EXPECT_NEAR(static_cast<double>(frames.size()), 16000.0, 16.0);
    // One second of 440 Hz crosses zero 880 times.
    EXPECT_NEAR(zero_crossings(frames, 1), 880, 10);
}

TEST(VelmTool, ConvertTakesTheTypeFromTheExtensionOrTheFormat)
{
    velmtest::TempDir dir;
    const std::string in = dir.file("sine.wav");
    ASSERT_TRUE(velmtest::write_audio(in, velmtest::sine(22050, 2, 22050, 1000.0), 22050, 2));
    ToolRun r = run_tool("convert " + in + " " + dir.file("copy.flac"));
    ASSERT_EQ(r.status, 0) << r.output;
    r = run_tool("convert " + in + " " + dir.file("copy.snd") + " --format AIFF --channels 3");
    ASSERT_EQ(r.status, 0) << r.output;

    const SF_INFO flac = file_info(dir.file("copy.flac"));
    EXPECT_EQ(flac.format & SF_FORMAT_TYPEMASK, SF_FORMAT_FLAC);
    EXPECT_EQ(flac.channels, 2);
    EXPECT_EQ(flac.samplerate, 22050);
    const SF_INFO aiff = file_info(dir.file("copy.snd"));
    EXPECT_EQ(aiff.format & SF_FORMAT_TYPEMASK, SF_FORMAT_AIFF);
    EXPECT_EQ(aiff.channels, 3);
    EXPECT_EQ(aiff.frames, 22050);
}

TEST(VelmTool, ConvertFailuresLeaveTheOutputAlone)
{
    velmtest::TempDir dir;
    const std::string in = dir.file("sine.wav");
    const std::string out = dir.file("keep.wav");
    ASSERT_TRUE(velmtest::write_audio(in, velmtest::sine(8000, 1, 8000), 8000, 1));
    std::ofstream(out) << "old sound";
    expect_failure("convert " + in + " " + out + " --format NOSUCHTYPE", 1, "cannot write");
    expect_failure("convert " + in + " " + out + " --rate 2", 1, "cannot convert to 2 Hz");
    expect_failure("convert " + dir.file("missing.wav") + " " + out, 1, "cannot open");
    for (const char *options : {"--rate fast", "--rate 0", "--channels -2", "--format", "extra"})
        expect_failure("convert " + in + " " + out + " " + options, 2, "cannot use the argument");
    expect_failure("convert " + in, 2, "an argument is missing");
    EXPECT_EQ(contents(out), "old sound");
    expect_failure("convert " + in + " " + dir.file("no/such/folder.wav"), 1, "cannot write");
}

TEST(VelmTool, EditRunsItsStepsInOrder)
{
    velmtest::TempDir dir;
    const std::string in = dir.file("ramp.wav"), out = dir.file("edited.wav");
    std::vector<float> ramp(8000);
    for (size_t i = 0; i < ramp.size(); ++i) ramp[i] = static_cast<float>(i) / 8000.0f;
    ASSERT_TRUE(velmtest::write_audio(in, ramp, 8000, 1, SF_FORMAT_WAV | SF_FORMAT_FLOAT));
    // Cut the second quarter, paste it at the start, reverse the last tenth.
    const ToolRun r = run_tool("edit " + in + " " + out +
                          " --select 0.25:0.5 --cut --select 0:0.001 --paste --select 0.9:1 --reverse");
    ASSERT_EQ(r.exit_code(), 0) << r.output;
    const std::vector<float> edited = velmtest::read_audio(out);
    std::vector<float> expected(ramp.begin() + 2000, ramp.begin() + 4000);
    expected.insert(expected.end(), ramp.begin() + 8, ramp.begin() + 2000);
    expected.insert(expected.end(), ramp.begin() + 4000, ramp.end());
    std::reverse(expected.begin() + 7200, expected.end()); // 0.9 s to the (now shorter) end
    ASSERT_EQ(edited.size(), expected.size());
    for (size_t i = 0; i < edited.size(); ++i) ASSERT_FLOAT_EQ(edited[i], expected[i]) << i;
}

TEST(VelmTool, AFailedEditStepLeavesTheOutputAlone)
{
    velmtest::TempDir dir;
    const std::string in = dir.file("tone.wav"), out = dir.file("out.wav");
    ASSERT_TRUE(velmtest::write_audio(in, velmtest::sine(8000, 1, 800), 8000, 1));
    std::ofstream(out) << "precious";
    expect_failure("edit " + in + " " + out + " --select-all --effect nosuchstage[x=1]", 1, "step 2");
    EXPECT_EQ(contents(out), "precious");
    expect_failure("edit " + in + " " + out + " --paste", 1, "was not written");
    expect_failure("edit " + in + " " + out + " --select 2:1", 2, "--select");
    EXPECT_EQ(contents(out), "precious");
}
