#include "outside/signal/file/progress_internal.hpp"

#include <algorithm>

namespace velmsig {

namespace {

struct ThreadCallback {
    AUDIO_PROGRESS_CALLBACK callback = nullptr;
    void *user = nullptr;
};
thread_local ThreadCallback thread_callback;

}  // namespace

ProgressReport::ProgressReport(int64_t total)
    : callback_(thread_callback.callback), user_(thread_callback.user), total_(total)
{
}

void ProgressReport::advance(int64_t done)
{
    if (!callback_ || total_ <= 0) return;
    tell(std::min(double(done) / double(total_), 0.99));
}

void ProgressReport::finish()
{
    if (callback_) tell(1.0);
}

void ProgressReport::tell(double fraction)
{
    const int hundredths = int(fraction * 100.0);
    if (hundredths <= hundredths_) return;
    hundredths_ = hundredths;
    callback_(user_, fraction);
}

}  // namespace velmsig

extern "C" {

AUDIO_API int AUDIO_SetProgressCallback(AUDIO_PROGRESS_CALLBACK callback, void *user)
{
    velmsig::thread_callback = {callback, callback ? user : nullptr};
    return 1;
}

}  // extern "C"
