// A progress bar for the library's long file work (opening, saving).
#ifndef VELM_TOOL_PROGRESS_HPP
#define VELM_TOOL_PROGRESS_HPP

#include <cstdio>
#include <functional>
#include <string>

namespace velmtool {

// Draws "[#####.....]  50%" on one line of a terminal once the work has run
// for more than half a second: shorter work, and output that is not a
// terminal (a pipe, a log file), get nothing at all.  The line is erased
// when the work ends, so later messages start on a clean line.
class ProgressBar {
public:
    // Seconds on a clock that does not jump; a test may hand in its own.
    using Clock = std::function<double()>;

    ProgressBar(FILE *out, bool terminal, Clock clock);
    ~ProgressBar();
    ProgressBar(const ProgressBar &) = delete;
    ProgressBar &operator=(const ProgressBar &) = delete;

    // The fraction done, 0 to 1; 1 ends the work.
    void report(double fraction);
    // The signal library's progress callback, with the bar as user pointer.
    static void report_to(void *bar, double fraction);

private:
    void erase();

    FILE *out_;
    bool terminal_;
    Clock clock_;
    double start_;
    std::string drawn_;
};

// A bar on standard error told the calling thread's library progress for
// as long as it lives.
class ProgressScope {
public:
    ProgressScope();
    ~ProgressScope();
    ProgressScope(const ProgressScope &) = delete;
    ProgressScope &operator=(const ProgressScope &) = delete;

private:
    ProgressBar bar_;
};

// Runs work (a library call that opens or saves a file) with its own bar.
template <class Work>
auto with_progress(Work &&work)
{
    const ProgressScope scope;
    return work();
}

} // namespace velmtool

#endif
