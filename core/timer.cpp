#include "core/velmtimer.h"

#include "platform/nativetimer.h"

#include <mutex>

struct _VELMTIMER {
    int in_use;
    void *window;
    uintptr_t timer_id;
    VELMTIMER_Callback callback;
    void *user;
};

namespace {

// Timers may be created on several threads (each delivers its own), so the
// table is locked; callbacks run without the lock.
std::mutex table_lock;
_VELMTIMER timer_table[VELMTIMER_MAX_TIMERS];

void _TimerProc(void *window, uint32_t message, uintptr_t timer_id, uint32_t time_ms)
{
    VELMTIMER_Callback callback = nullptr;
    void *user = nullptr;
    {
        std::lock_guard guard(table_lock);
        for (const _VELMTIMER &slot : timer_table) {
            if (slot.in_use && slot.window == window && slot.timer_id == timer_id) {
                callback = slot.callback;
                user = slot.user;
                break;
            }
        }
    }
    if (callback)
        callback(user);
}

bool _IsSlot(const _VELMTIMER *timer)
{
    for (const _VELMTIMER &slot : timer_table) {
        if (&slot == timer)
            return true;
    }
    return false;
}

} // namespace

VELMTIMER VELMTIMER_CreateTimer(uint32_t interval_ms, VELMTIMER_Callback callback, void *user)
{
    std::lock_guard guard(table_lock);
    for (_VELMTIMER &slot : timer_table) {
        if (slot.in_use)
            continue;
        const uintptr_t timer_id = VELMNATIVE_SetTimer(nullptr, 0, interval_ms, _TimerProc);
        if (timer_id == 0)
            return nullptr;
        slot = _VELMTIMER{1, nullptr, timer_id, callback, user};
        return &slot;
    }
    return nullptr;
}

int VELMTIMER_KillTimer(VELMTIMER timer)
{
    void *window;
    uintptr_t timer_id;
    {
        std::lock_guard guard(table_lock);
        if (!_IsSlot(timer) || !timer->in_use)
            return 0;
        window = timer->window;
        timer_id = timer->timer_id;
    }
    // Not under the table lock: the native kill may wait for this timer's
    // callback running on another thread, which may itself use the table.
    // Only the caller whose native kill succeeds frees the slot.
    if (!VELMNATIVE_KillTimer(window, timer_id))
        return 0;
    std::lock_guard guard(table_lock);
    *timer = _VELMTIMER{};
    return 1;
}
