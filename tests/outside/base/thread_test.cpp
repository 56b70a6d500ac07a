#include "base_test_support.h"

#include <atomic>
#include <thread>

namespace {

struct Work {
    std::atomic<int> counter{0};
    BLMUTEX lock = nullptr;
    int guarded = 0;
};

void *CountUp(void *arguments)
{
    auto *work = static_cast<Work *>(arguments);
    for (int i = 0; i < 1000; ++i) {
        MutexLock(work->lock);
        ++work->guarded;
        MutexUnlock(work->lock);
        ++work->counter;
    }
    ThreadChildNotifyExit(0);
    return nullptr;
}

} // namespace

using Threads = BaseTest;

TEST_F(Threads, EndThreadWithWaitJoinsTheWorker)
{
    Work work;
    work.lock = MutexInit();
    BLTHREAD a = BLTHREAD_AddThread(CountUp, &work, 0);
    BLTHREAD b = BLTHREAD_AddThread(CountUp, &work, 0);
    ASSERT_NE(a, nullptr);
    ASSERT_NE(b, nullptr);
    EXPECT_EQ(BLTHREAD_EndThread(a, 1), 1);
    EXPECT_EQ(BLTHREAD_EndThread(b, 1), 1);
    // Both workers are finished once EndThread returned.
    EXPECT_EQ(work.counter.load(), 2000);
    EXPECT_EQ(work.guarded, 2000);
    EXPECT_EQ(MutexDestroy(work.lock), 1);
}

TEST_F(Threads, EndThreadWithoutWaitLetsTheWorkerFinish)
{
    static std::atomic<bool> finished{false};
    finished = false;
    BLTHREAD t = BLTHREAD_AddThread(
        [](void *) -> void * {
            finished = true;
            return nullptr;
        },
        nullptr, 0);
    ASSERT_NE(t, nullptr);
    EXPECT_EQ(BLTHREAD_EndThread(t, 0), 1);
    while (!finished) std::this_thread::yield();
}

TEST_F(Threads, NullArgumentsFail)
{
    EXPECT_EQ(BLTHREAD_AddThread(nullptr, nullptr, 0), nullptr);
    EXPECT_EQ(BLTHREAD_EndThread(nullptr, 1), 0);
    EXPECT_EQ(MutexLock(nullptr), 0);
    EXPECT_EQ(MutexTryLock(nullptr), 0);
    EXPECT_EQ(MutexUnlock(nullptr), 0);
    EXPECT_EQ(MutexDestroy(nullptr), 0);
}

using Mutexes = BaseTest;

TEST_F(Mutexes, OwnerMayLockAgainOthersMustWait)
{
    BLMUTEX m = MutexInit();
    ASSERT_NE(m, nullptr);
    EXPECT_EQ(MutexLock(m), 1);
    EXPECT_EQ(MutexTryLock(m), 1) << "the owner may take its lock again";
    int other_try = -1, other_unlock = -1;
    std::thread([&] {
        other_try = MutexTryLock(m);
        other_unlock = MutexUnlock(m);
    }).join();
    EXPECT_EQ(other_try, 0);
    EXPECT_EQ(other_unlock, 0) << "only the owner may unlock";
    EXPECT_EQ(MutexDestroy(m), 0) << "a held lock is not destroyed";
    EXPECT_EQ(MutexUnlock(m), 1);
    EXPECT_EQ(MutexUnlock(m), 1);
    EXPECT_EQ(MutexUnlock(m), 0) << "nothing left to unlock";
    std::thread([&] { other_try = MutexTryLock(m); MutexUnlock(m); }).join();
    EXPECT_EQ(other_try, 1);
    EXPECT_EQ(MutexDestroy(m), 1);
}
