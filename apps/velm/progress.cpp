// The tool's progress bar.
#include "apps/velm/progress.hpp"

#include <unistd.h>

#include <algorithm>
#include <chrono>

#include "outside/signal/audioformat.h"

namespace velmtool {

namespace {

constexpr double kQuietSeconds = 0.5;
constexpr int kBarWidth = 40;

double monotonic_seconds()
{
    using namespace std::chrono;
    return duration<double>(steady_clock::now().time_since_epoch()).count();
}

} // namespace

ProgressBar::ProgressBar(FILE *out, bool terminal, Clock clock)
    : out_(out), terminal_(terminal), clock_(std::move(clock)), start_(clock_())
{
}

ProgressBar::~ProgressBar()
{
    erase();
}

void ProgressBar::report(double fraction)
{
    if (!terminal_) return;
    if (fraction >= 1.0) {
        erase();
        return;
    }
    if (clock_() - start_ <= kQuietSeconds) return;
    const double done = std::clamp(fraction, 0.0, 1.0);
    const int filled = static_cast<int>(done * kBarWidth);
    std::string line = "\r[" + std::string(static_cast<size_t>(filled), '#') +
                       std::string(static_cast<size_t>(kBarWidth - filled), '.') + "]";
    char percent[8];
    std::snprintf(percent, sizeof percent, " %3d%%", static_cast<int>(done * 100.0));
    line += percent;
    if (line == drawn_) return;
    std::fputs(line.c_str(), out_);
    std::fflush(out_);
    drawn_ = line;
}

void ProgressBar::report_to(void *bar, double fraction)
{
    static_cast<ProgressBar *>(bar)->report(fraction);
}

// Blanks over the bar and returns to the line's start.
void ProgressBar::erase()
{
    if (drawn_.empty()) return;
    std::fprintf(out_, "\r%*s\r", static_cast<int>(drawn_.size() - 1), "");
    std::fflush(out_);
    drawn_.clear();
}

ProgressScope::ProgressScope() : bar_(stderr, isatty(fileno(stderr)) == 1, monotonic_seconds)
{
    AUDIO_SetProgressCallback(ProgressBar::report_to, &bar_);
}

ProgressScope::~ProgressScope()
{
    AUDIO_SetProgressCallback(nullptr, nullptr);
}

} // namespace velmtool
