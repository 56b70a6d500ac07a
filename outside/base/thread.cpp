/* Worker threads over std::thread. */
#include "outside/base/blbase.h"

#include <new>
#include <system_error>
#include <thread>

struct BLThread {
    std::thread thread;
};

BLTHREAD BLTHREAD_AddThread(BLTHREAD_Body body, void *arguments, int flags)
{
    if (!body) return nullptr;
    auto *handle = new (std::nothrow) BLThread;
    if (!handle) return nullptr;
    try {
        handle->thread = std::thread([body, arguments] { body(arguments); });
    } catch (const std::system_error &failure) {
        BLDEBUG_Error(-1, "BLTHREAD_AddThread: unable to start a thread: %s", failure.what());
        delete handle;
        return nullptr;
    }
    return handle;
}

int BLTHREAD_EndThread(BLTHREAD thread, int wait)
{
    if (!thread) return 0;
    // A worker ending its own handle cannot wait for itself: it is let go instead.
    const bool self = thread->thread.get_id() == std::this_thread::get_id();
    if (thread->thread.joinable()) {
        if (wait && !self)
            thread->thread.join();
        else
            thread->thread.detach();
    }
    delete thread;
    return 1;
}

void ThreadChildNotifyExit(int code)
{
    // Workers end by returning from their body; this only marks the point in the log.
    BLDEBUG_Log(BLDEBUG_LEVEL_ALL, "ThreadChildNotifyExit: worker ends with code %d", code);
}
