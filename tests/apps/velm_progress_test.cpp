// The tool's progress bar: what it writes, and when it keeps quiet.
#include "apps/velm/progress.hpp"

#include <gtest/gtest.h>

#include <cstdio>
#include <string>

namespace {

// The bar's output, caught in a temporary file, on a clock the test moves.
class Bar {
public:
    Bar(bool terminal) : file_(std::tmpfile()), bar_(new velmtool::ProgressBar(file_, terminal, [this] { return now; })) {}
    ~Bar()
    {
        delete bar_;
        std::fclose(file_);
    }
    void report(double fraction) { velmtool::ProgressBar::report_to(bar_, fraction); }
    void end()
    {
        delete bar_;
        bar_ = nullptr;
    }
    std::string written()
    {
        std::fflush(file_);
        std::string text;
        std::rewind(file_);
        for (int c; (c = std::fgetc(file_)) != EOF;) text += static_cast<char>(c);
        return text;
    }
    double now = 100.0;

private:
    FILE *file_;
    velmtool::ProgressBar *bar_;
};

const std::string kHalf = "\r[####################....................]  50%";
const std::string kBlank = "\r" + std::string(kHalf.size() - 1, ' ') + "\r";

} // namespace

TEST(VelmProgressBar, QuietForHalfASecondThenDrawnAndErasedAtTheEnd)
{
    Bar bar(true);
    bar.now += 0.4;
    bar.report(0.3);
    EXPECT_EQ(bar.written(), "");
    bar.now += 0.2;
    bar.report(0.5);
    EXPECT_EQ(bar.written(), kHalf);
    bar.report(0.505); // the same picture is not drawn twice
    EXPECT_EQ(bar.written(), kHalf);
    bar.report(0.75);
    bar.report(1.0);
    EXPECT_EQ(bar.written(), kHalf + "\r[##############################..........]  75%" + kBlank);
    bar.end();
    EXPECT_EQ(bar.written(), kHalf + "\r[##############################..........]  75%" + kBlank);
}

TEST(VelmProgressBar, WorkThatEndsEarlyOrFailsLeavesACleanLine)
{
    Bar quick(true);
    quick.report(0.5);
    quick.report(1.0);
    quick.end();
    EXPECT_EQ(quick.written(), "");

    Bar failed(true);
    failed.now += 2.0;
    failed.report(0.5);
    failed.end(); // no 1.0: the work broke off
    EXPECT_EQ(failed.written(), kHalf + kBlank);
}

TEST(VelmProgressBar, NothingGoesToWhatIsNotATerminal)
{
    Bar bar(false);
    bar.now += 5.0;
    for (double f = 0.01; f < 1.0; f += 0.01) bar.report(f);
    bar.report(1.0);
    bar.end();
    EXPECT_EQ(bar.written(), "");
}
