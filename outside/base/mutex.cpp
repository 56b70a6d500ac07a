/*
 * Locks.  They are recursive, so a caller that already holds a lock may call
 * code that takes it again; only the owning thread may unlock.
 */
#include "outside/base/blbase.h"

#include <atomic>
#include <mutex>
#include <new>
#include <thread>

struct BLMutex {
    std::recursive_mutex lock;
    std::atomic<std::thread::id> owner{};
    int depth = 0; // only touched by the owner

    void Acquired()
    {
        if (depth++ == 0) owner = std::this_thread::get_id();
    }
};

BLMUTEX MutexInit(void)
{
    return new (std::nothrow) BLMutex;
}

int MutexLock(BLMUTEX mutex)
{
    if (!mutex) return 0;
    mutex->lock.lock();
    mutex->Acquired();
    return 1;
}

int MutexTryLock(BLMUTEX mutex)
{
    if (!mutex || !mutex->lock.try_lock()) return 0;
    mutex->Acquired();
    return 1;
}

int MutexUnlock(BLMUTEX mutex)
{
    if (!mutex || mutex->owner != std::this_thread::get_id()) return 0;
    if (--mutex->depth == 0) mutex->owner = std::thread::id();
    mutex->lock.unlock();
    return 1;
}

int MutexDestroy(BLMUTEX mutex)
{
    if (!mutex) return 0;
    // Destroying a held lock would strand its owner; refuse instead.
    if (mutex->owner != std::thread::id()) {
        BLDEBUG_Error(-1, "MutexDestroy: the lock is still held");
        return 0;
    }
    delete mutex;
    return 1;
}
