// Every velm command on every file type it writes, and on files it cannot use.
#include "testaudio.hpp"
#include "tool_run.hpp"

#include <gtest/gtest.h>
#include <pty.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <fstream>
#include <string>
#include <vector>

using velmtest::run_tool;
using velmtest::ToolRun;

namespace {

void expect_quiet_success(const std::string &arguments)
{
    const ToolRun r = run_tool(arguments);
    EXPECT_EQ(r.exit_code(), 0) << arguments;
    EXPECT_EQ(r.output, "") << arguments;
}

// Runs the tool with a terminal as its standard output and error; what the
// terminal showed, and the exit code.
std::pair<std::string, int> run_on_terminal(std::vector<std::string> arguments)
{
    std::vector<char *> argv{const_cast<char *>(VELM_TOOL_PATH)};
    for (std::string &argument : arguments) argv.push_back(argument.data());
    argv.push_back(nullptr);
    int terminal = -1;
    const pid_t child = forkpty(&terminal, nullptr, nullptr, nullptr);
    if (child == 0) {
        execv(argv[0], argv.data());
        _exit(127);
    }
    std::string shown;
    if (child < 0) return {shown, -1};
    char buffer[4096];
    ssize_t n;
    while ((n = read(terminal, buffer, sizeof buffer)) > 0) shown.append(buffer, static_cast<size_t>(n));
    close(terminal);
    int status = 0;
    waitpid(child, &status, 0);
    return {shown, WIFEXITED(status) ? WEXITSTATUS(status) : -1};
}

} // namespace

TEST(VelmFiles, ShortWorkShowsNoBarOnATerminal)
{
    velmtest::TempDir dir;
    const std::string in = dir.file("tone.flac");
    // A tenth of a second: far below the half second before a bar, even on a busy machine.
    ASSERT_TRUE(velmtest::write_audio(in, velmtest::sine(44100, 2, 4410), 44100, 2, SF_FORMAT_FLAC | SF_FORMAT_PCM_16));
    const auto [shown, code] = run_on_terminal({"convert", in, dir.file("copy.wav")});
    EXPECT_EQ(code, 0);
    EXPECT_EQ(shown, "");
    // The terminal does carry what the tool says.
    const auto [message, failed] = run_on_terminal({"info", dir.file("missing.wav")});
    EXPECT_EQ(failed, 1);
    EXPECT_NE(message.find("no such file"), std::string::npos) << message;
}

TEST(VelmFiles, EveryCommandWorksOnEveryFileType)
{
    velmtest::TempDir dir;
    const std::string in = dir.file("tone.wav");
    ASSERT_TRUE(velmtest::write_audio(in, velmtest::sine(22050, 2, 11025, 500.0), 22050, 2));
    for (const char *type : {"wav", "rf64", "w64", "aiff", "caf", "flac", "ogg", "mp3"}) {
        SCOPED_TRACE(type);
        const std::string file = dir.file(std::string("tone.") + type);
        const std::string edited = dir.file(std::string("edited.") + type);
        // Success says nothing on a pipe: no progress, no notes.
        expect_quiet_success("convert " + in + " " + file);
        const ToolRun info = run_tool("info " + file);
        EXPECT_EQ(info.exit_code(), 0);
        EXPECT_TRUE(info.has("22050 Hz")) << info.output;
        EXPECT_TRUE(info.has("channel 2: peak")) << info.output;
        expect_quiet_success("render " + file + " -o " + dir.file("tone.png") + " --size 200x100");
        EXPECT_FALSE(QImage(QString::fromStdString(dir.file("tone.png")), "PNG").isNull());
        expect_quiet_success("edit " + file + " " + edited + " --select 0:0.1 --silence");
        int rate = 0, channels = 0;
        const std::vector<float> frames = velmtest::read_audio(edited, &rate, &channels);
        EXPECT_EQ(rate, 22050);
        EXPECT_EQ(channels, 2);
        EXPECT_GE(frames.size(), 2u * 11025u);
    }
}

TEST(VelmFiles, UnusableFilesGiveOneLineAndStatusOne)
{
    velmtest::TempDir dir;
    const std::string good = dir.file("tone.wav");
    ASSERT_TRUE(velmtest::write_audio(good, velmtest::sine(8000, 1, 4000), 8000, 1));
    const std::string bad = dir.file("bad.wav");
    std::ofstream(bad, std::ios::binary) << std::string(3000, '\x5a');
    const std::string missing = dir.file("missing.flac");
    const std::string folder = dir.file("folder");
    ASSERT_EQ(mkdir(folder.c_str(), 0755), 0);
    const std::string nowhere = dir.file("no/such.wav");

    const std::pair<std::string, std::string> cases[] = {
        {"info " + bad, "cannot open '" + bad + "': not a sound file of a known format"},
        {"render " + bad + " -o " + dir.file("x.png"), "cannot open '" + bad + "'"},
        {"convert " + bad + " " + dir.file("x.wav"), "cannot open '" + bad + "'"},
        {"edit " + bad + " " + dir.file("x.wav") + " --reverse", "cannot open '" + bad + "'"},
        {"info " + missing, "cannot open '" + missing + "': no such file"},
        {"render " + missing + " -o " + dir.file("x.png"), "no such file"},
        {"convert " + missing + " " + dir.file("x.wav"), "no such file"},
        {"edit " + missing + " " + dir.file("x.wav") + " --reverse", "no such file"},
        {"info " + folder, "cannot open '" + folder + "': it is a folder"},
        {"convert " + good + " " + folder, "cannot write '" + folder + "' as AUTO: it is a folder"},
        {"convert " + good + " " + nowhere, "cannot write '" + nowhere + "' as AUTO: no such folder"},
        {"convert " + good + " " + dir.file("x.wav") + " --format NOSUCHTYPE", "not a format text it knows"},
        {"edit " + good + " " + nowhere + " --reverse", "no such folder"},
        {"render " + good + " -o " + folder, "cannot write '" + folder + "': it is a folder"},
        {"render " + good + " -o " + dir.file("no/such.png"), "no such folder"},
    };
    for (const auto &[arguments, text] : cases) {
        const ToolRun r = run_tool(arguments);
        EXPECT_EQ(r.exit_code(), 1) << arguments;
        EXPECT_EQ(r.lines(), 1) << arguments << ": " << r.output;
        EXPECT_TRUE(r.has(text)) << arguments << ": " << r.output;
    }
}

TEST(VelmFiles, EveryCommandAnswersHelp)
{
    for (const char *command : {"info", "render", "convert", "edit"}) {
        const ToolRun r = run_tool(std::string(command) + " --help");
        EXPECT_EQ(r.exit_code(), 0) << command;
        EXPECT_TRUE(r.has(std::string("usage: velm ") + command)) << r.output;
    }
    const ToolRun r = run_tool("--help");
    EXPECT_EQ(r.exit_code(), 0);
    EXPECT_TRUE(r.has("usage: velm COMMAND")) << r.output;
}
