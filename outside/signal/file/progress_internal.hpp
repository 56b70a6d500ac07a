// Progress of a long file read or write, told to the calling thread's
// progress callback (AUDIO_SetProgressCallback).
#pragma once

#include <cstdint>

#include "outside/signal/audioformat.h"

namespace velmsig {

// Reports done/total in hundredths, so a file makes at most about a hundred
// calls however it is cut into steps; the callback is the one of the thread
// that made the report, and only that thread may advance it.
class ProgressReport {
public:
    explicit ProgressReport(int64_t total);
    ProgressReport(const ProgressReport &) = delete;
    ProgressReport &operator=(const ProgressReport &) = delete;

    // Below 1.0 until finish(): a claimed total may be short of the truth.
    void advance(int64_t done);
    // The work is complete: reports 1.0 once.
    void finish();

private:
    void tell(double fraction);

    AUDIO_PROGRESS_CALLBACK callback_;
    void *user_;
    int64_t total_;
    int hundredths_ = 0;  // nothing done is not news
};

}  // namespace velmsig
