#include "platform/nativetimer.h"

#include "platform/qttimerhost.h"

#include <algorithm>
#include <chrono>
#include <condition_variable>
#include <map>
#include <mutex>
#include <thread>
#include <vector>

namespace {

using velm::platform::QtTimerHost;

struct Timer {
    VELMNATIVE_TimerProc proc = nullptr;
    uint32_t interval_ms = 0;
    std::thread::id owner;
    bool pumped = false;
    uint64_t due_ms = 0;            // pumped timers: when the next tick is due
    QtTimerHost *host = nullptr;    // Qt timers: the owner's host; null once the owner thread ended
    int qt_timer_id = 0;
    std::thread::id running_on;     // the thread inside proc right now, or none
};

// Every timer of the process. Procs are called without the lock held, so a
// proc may create, kill and pump timers freely.
struct Registry {
    std::mutex lock;
    std::condition_variable proc_returned;
    std::map<uintptr_t, Timer> timers; // ordered by id, which is creation order
    uintptr_t last_id = 0;
    VELMNATIVE_ClockProc clock = nullptr;
    void *clock_user = nullptr;
};

Registry &TheRegistry()
{
    static Registry registry;
    return registry;
}

uint64_t MonotonicMs()
{
    using namespace std::chrono;
    return static_cast<uint64_t>(duration_cast<milliseconds>(steady_clock::now().time_since_epoch()).count());
}

uint64_t NowMs()
{
    Registry &r = TheRegistry();
    VELMNATIVE_ClockProc clock;
    void *user;
    {
        std::lock_guard guard(r.lock);
        clock = r.clock;
        user = r.clock_user;
    }
    return clock ? clock(user) : MonotonicMs();
}

// Ids are not reused, so a stale id can never reach a newer timer.
uintptr_t NextId(Registry &r)
{
    do {
        ++r.last_id;
    } while (r.last_id == 0 || r.timers.count(r.last_id) != 0);
    return r.last_id;
}

// Calls one timer's proc on this thread; false when it is gone, not due, or
// already inside its proc (a nested loop must not re-enter a callback).
bool Deliver(uintptr_t id, uint64_t now)
{
    Registry &r = TheRegistry();
    VELMNATIVE_TimerProc proc;
    {
        std::lock_guard guard(r.lock);
        auto it = r.timers.find(id);
        if (it == r.timers.end())
            return false;
        Timer &timer = it->second;
        if (timer.running_on != std::thread::id() || (timer.pumped && now < timer.due_ms))
            return false;
        // Rescheduled from now: a late timer fires once, not once per interval missed.
        if (timer.pumped)
            timer.due_ms = now + timer.interval_ms;
        timer.running_on = std::this_thread::get_id();
        proc = timer.proc;
    }
    proc(nullptr, VELMNATIVE_WM_TIMER, id, static_cast<uint32_t>(now));
    {
        std::lock_guard guard(r.lock);
        auto it = r.timers.find(id);
        if (it != r.timers.end())
            it->second.running_on = std::thread::id();
    }
    r.proc_returned.notify_all();
    return true;
}

} // namespace

namespace velm::platform {

void DeliverQtTick(uintptr_t id)
{
    Deliver(id, NowMs());
}

void ForgetQtTimerHost(QtTimerHost *host)
{
    Registry &r = TheRegistry();
    std::lock_guard guard(r.lock);
    for (auto &entry : r.timers) {
        if (entry.second.host == host)
            entry.second.host = nullptr;
    }
}

} // namespace velm::platform

uintptr_t VELMNATIVE_SetTimer(void *window, uintptr_t id, uint32_t interval_ms, VELMNATIVE_TimerProc proc)
{
    if (window != nullptr || proc == nullptr)
        return 0;
    Timer timer;
    timer.proc = proc;
    timer.interval_ms = std::clamp(interval_ms, VELMNATIVE_TIMER_MINIMUM_MS, VELMNATIVE_TIMER_MAXIMUM_MS);
    timer.owner = std::this_thread::get_id();
    timer.pumped = !velm::platform::QtDeliversOnThisThread();
    if (timer.pumped)
        timer.due_ms = NowMs() + timer.interval_ms;

    Registry &r = TheRegistry();
    std::lock_guard guard(r.lock);
    if (r.timers.size() >= VELMNATIVE_MAX_TIMERS)
        return 0;
    uintptr_t new_id = NextId(r);
    if (!timer.pumped) {
        timer.host = QtTimerHost::ForThisThread();
        timer.qt_timer_id = timer.host->Start(new_id, timer.interval_ms);
        if (timer.qt_timer_id == 0)
            return 0;
    }
    r.timers.emplace(new_id, timer);
    return new_id;
}

int VELMNATIVE_KillTimer(void *window, uintptr_t timer_id)
{
    if (window != nullptr || timer_id == 0)
        return 0;
    Registry &r = TheRegistry();
    const std::thread::id me = std::this_thread::get_id();
    std::unique_lock guard(r.lock);
    auto it = r.timers.find(timer_id);
    if (it == r.timers.end())
        return 0;
    // A proc running on another thread finishes first; one running on this
    // thread is the caller itself and is simply never called again.
    if (it->second.running_on != std::thread::id() && it->second.running_on != me) {
        r.proc_returned.wait(guard, [&] {
            it = r.timers.find(timer_id);
            return it == r.timers.end() || it->second.running_on == std::thread::id() ||
                   it->second.running_on == me;
        });
        if (it == r.timers.end())
            return 0;
    }
    Timer &timer = it->second;
    if (timer.host != nullptr) {
        if (timer.owner == me)
            timer.host->Stop(timer.qt_timer_id);
        else
            timer.host->StopLater(timer.qt_timer_id);
    }
    r.timers.erase(it);
    return 1;
}

int VELMNATIVE_PumpTimers(void)
{
    const uint64_t now = NowMs();
    const std::thread::id me = std::this_thread::get_id();
    std::vector<uintptr_t> due;
    {
        Registry &r = TheRegistry();
        std::lock_guard guard(r.lock);
        for (const auto &[id, timer] : r.timers) {
            if (timer.pumped && timer.owner == me && now >= timer.due_ms)
                due.push_back(id);
        }
    }
    // Each is checked again when its turn comes: an earlier proc may have
    // killed it.
    int delivered = 0;
    for (uintptr_t id : due) {
        if (Deliver(id, now))
            ++delivered;
    }
    return delivered;
}

void VELMNATIVE_SetClock(VELMNATIVE_ClockProc now_ms, void *user)
{
    const uint64_t now = now_ms ? now_ms(user) : MonotonicMs();
    Registry &r = TheRegistry();
    std::lock_guard guard(r.lock);
    r.clock = now_ms;
    r.clock_user = now_ms ? user : nullptr;
    for (auto &entry : r.timers) {
        if (entry.second.pumped)
            entry.second.due_ms = now + entry.second.interval_ms;
    }
}
