// Running the velm tool as a program from the tests, and reading what it left.
#ifndef VELM_TESTS_TOOL_RUN_HPP
#define VELM_TESTS_TOOL_RUN_HPP

#include <gtest/gtest.h>
#include <sys/wait.h>

#include <QImage>
#include <algorithm>
#include <cstdio>
#include <fstream>
#include <set>
#include <sstream>
#include <string>

namespace velmtest {

struct ToolRun {
    int status;          // as pclose gives it
    std::string output;  // standard output and standard error together
    int exit_code() const { return WIFEXITED(status) ? WEXITSTATUS(status) : -1; }
    bool has(const std::string &text) const { return output.find(text) != std::string::npos; }
    long lines() const { return std::count(output.begin(), output.end(), '\n'); }
};

inline ToolRun run_tool(const std::string &arguments)
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

// Runs the tool and expects the exit status and a message holding text.
inline void expect_failure(const std::string &arguments, int status, const std::string &text)
{
    const ToolRun r = run_tool(arguments);
    EXPECT_EQ(r.exit_code(), status) << arguments;
    EXPECT_TRUE(r.has(text)) << arguments << ": " << r.output;
}

inline size_t distinct_colours(const QImage &image)
{
    std::set<QRgb> colours;
    for (int y = 0; y < image.height(); ++y)
        for (int x = 0; x < image.width(); ++x) colours.insert(image.pixel(x, y));
    return colours.size();
}

inline std::string contents(const std::string &path)
{
    std::ifstream in(path, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
}

} // namespace velmtest

#endif
