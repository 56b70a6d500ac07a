// velm render's selections, regions, cursor and scale kinds.
#include "testaudio.hpp"
#include "tool_run.hpp"

#include <gtest/gtest.h>

#include <QImage>
#include <fstream>
#include <string>

using velmtest::run_tool;
using velmtest::ToolRun;

namespace {

// Two seconds of a tone at 16 kHz, a label file of three regions beside it.
class VelmRenderMarks : public ::testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_TRUE(velmtest::write_audio(sound, velmtest::sine(16000, 1, 32000, 300.0, 0.4), 16000, 1));
        std::ofstream(labels) << "0.1\t0.3\tone\n0.5\t0.5\tpoint\n1.0\t1.8\tlast\n";
    }
    QImage render(const std::string &name, const std::string &options)
    {
        const std::string out = dir.file(name + ".png");
        const ToolRun r = run_tool("render " + sound + " -o " + out + " --size 400x240 " + options);
        EXPECT_EQ(r.exit_code(), 0) << options << ": " << r.output;
        return QImage(QString::fromStdString(out), "PNG");
    }

    velmtest::TempDir dir;
    const std::string sound = dir.file("tone.wav");
    const std::string labels = dir.file("labels.txt");
};

} // namespace

TEST_F(VelmRenderMarks, SelectionsRegionsAndTheCursorReachTheDocument)
{
    const std::string out = dir.file("marked.png");
    ToolRun r = run_tool("render " + sound + " -o " + out + " --size 400x240 --verbose --select 0.2:0.4 --select 1.2:1.5" +
                         " --regions " + labels + " --cursor 0.7");
    ASSERT_EQ(r.exit_code(), 0) << r.output;
    EXPECT_EQ(r.output, "velm: 3 regions, 2 selections\n");
    EXPECT_EQ(QImage(QString::fromStdString(out), "PNG").size(), QSize(400, 240));

    // Ranges that overlap are merged by the document into one.
    r = run_tool("render " + sound + " -o " + out + " -v --select 0.2:0.6 --select 0.5:0.9");
    ASSERT_EQ(r.exit_code(), 0) << r.output;
    EXPECT_EQ(r.output, "velm: 0 regions, 1 selections\n");
    // Without --verbose nothing is said.
    r = run_tool("render " + sound + " -o " + out + " --select 0.2:0.6 --regions " + labels);
    EXPECT_EQ(r.exit_code(), 0);
    EXPECT_EQ(r.output, "");
}

// Each mark is drawn: selections over the lanes, the regions in the default
// track under them, the cursor as a line.
TEST_F(VelmRenderMarks, MarksAreDrawn)
{
    const QImage plain = render("plain", "--lanes waveform");
    const QImage selected = render("selected", "--lanes waveform --select 0.5:1.0");
    const QImage regions = render("regions", "--lanes waveform --regions " + labels);
    const QImage cursor = render("cursor", "--lanes waveform --cursor 1.25");
    ASSERT_FALSE(plain.isNull());
    for (const QImage *marked : {&selected, &regions, &cursor}) EXPECT_NE(*marked, plain);
    // The selection lightens the lanes over its columns only, about a
    // quarter of the width (the lanes end at the vertical scales).
    const int y = plain.height() / 3;
    int lighter = 0;
    for (int x = 0; x < plain.width(); ++x)
        if (qGray(selected.pixel(x, y)) > qGray(plain.pixel(x, y))) ++lighter;
    EXPECT_GT(lighter, plain.width() / 6);
    EXPECT_LT(lighter, plain.width() / 3);
}

TEST_F(VelmRenderMarks, ScaleKindsChangeThePicture)
{
    const QImage waveform = render("waveform", "--lanes waveform"); // time and sample value scales
    EXPECT_EQ(render("time", "--lanes waveform --horz-scale time"), waveform);
    EXPECT_NE(render("samples", "--lanes waveform --horz-scale sample"), waveform);
    EXPECT_NE(render("frames", "--lanes waveform --horz-scale frame"), waveform);
    EXPECT_NE(render("db", "--lanes waveform --vert-scale db"), waveform);
    // Either name of a kind draws the same.
    EXPECT_EQ(render("norm", "--lanes waveform --vert-scale norm"),
              render("normalized", "--lanes waveform --vert-scale normalized"));
    EXPECT_NE(render("mels", "--lanes spectrogram --spectral-scale mels"), render("hz", "--lanes spectrogram --spectral-scale hz"));
}

TEST_F(VelmRenderMarks, BadMarksAreRefusedAndTheOutputKept)
{
    const std::string out = dir.file("keep.png");
    std::ofstream(out) << "old picture";
    const std::string base = "render " + sound + " -o " + out + " ";
    for (const char *options : {"--select 2:1", "--select 1", "--select a:b", "--select 1:1", "--horz-scale minutes",
                                "--vert-scale ''", "--spectral-scale HZ", "--cursor -1", "--cursor soon", "--regions ''",
                                "--regions"})
        velmtest::expect_failure(base + options, 2, "cannot use the argument");

    std::ofstream(dir.file("garbage.txt"), std::ios::binary) << std::string("\x01\x02\xff\xfe nothing here\n", 17);
    const std::pair<std::string, std::string> failing[] = {
        {"--select 5:6", "velm: the selection 5:6 holds no samples\n"},
        {"--cursor 9", "velm: the cursor at 9 s is past the end of the sound\n"},
        {"--regions " + dir.file("missing.txt"), "velm: cannot read the regions in '" + dir.file("missing.txt") + "': no such file\n"},
        {"--regions " + dir.file("garbage.txt"), "velm: cannot read the regions in '" + dir.file("garbage.txt") + "': the data is damaged\n"},
    };
    for (const auto &[options, message] : failing) {
        const ToolRun r = run_tool(base + options);
        EXPECT_EQ(r.exit_code(), 1) << options;
        EXPECT_EQ(r.output, message);
    }
    EXPECT_EQ(velmtest::contents(out), "old picture");
}
