#include "platform/manualclock.h"
#include "platform/nativetimer.h"

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <functional>
#include <future>
#include <mutex>
#include <thread>
#include <vector>

namespace {

struct Tick {
    void *window;
    uint32_t message;
    uintptr_t id;
    uint32_t time_ms;
    std::thread::id thread;
};

// Timer procs get no user value, so the tests share one journal.
std::mutex journal_lock;
std::vector<Tick> journal;
std::function<void(uintptr_t)> on_tick;

void RecordingProc(void *window, uint32_t message, uintptr_t id, uint32_t time_ms)
{
    {
        std::lock_guard guard(journal_lock);
        journal.push_back({window, message, id, time_ms, std::this_thread::get_id()});
    }
    if (on_tick)
        on_tick(id);
}

int TicksOf(uintptr_t id)
{
    std::lock_guard guard(journal_lock);
    int count = 0;
    for (const Tick &tick : journal)
        count += tick.id == id;
    return count;
}

class NativeTimer : public ::testing::Test {
protected:
    void SetUp() override
    {
        journal.clear();
        on_tick = nullptr;
    }
    void TearDown() override { on_tick = nullptr; }

    ManualClock clock;
};

TEST_F(NativeTimer, TicksEveryIntervalWithTimerMessageAndClockTime)
{
    uintptr_t id = VELMNATIVE_SetTimer(nullptr, 0, 100, RecordingProc);
    ASSERT_NE(id, 0u);

    EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
    clock.Advance(99);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
    clock.Advance(1);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
    clock.Advance(100);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);

    ASSERT_EQ(journal.size(), 2u);
    EXPECT_EQ(journal[1].window, nullptr);
    EXPECT_EQ(journal[1].message, VELMNATIVE_WM_TIMER);
    EXPECT_EQ(journal[1].id, id);
    EXPECT_EQ(journal[1].time_ms, static_cast<uint32_t>(clock.Now()));
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 1);
}

TEST_F(NativeTimer, LateTimerFiresOnceAndRestartsItsInterval)
{
    uintptr_t id = VELMNATIVE_SetTimer(nullptr, 0, 50, RecordingProc);
    clock.Advance(10 * 50 + 20);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
    clock.Advance(49);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
    clock.Advance(1);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);
    EXPECT_EQ(TicksOf(id), 2);
    VELMNATIVE_KillTimer(nullptr, id);
}

TEST_F(NativeTimer, ShortIntervalsAreRaisedToTheMinimum)
{
    uintptr_t id = VELMNATIVE_SetTimer(nullptr, 0, 0, RecordingProc);
    ASSERT_NE(id, 0u);
    clock.Advance(VELMNATIVE_TIMER_MINIMUM_MS - 1);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
    clock.Advance(1);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);
    VELMNATIVE_KillTimer(nullptr, id);
}

TEST_F(NativeTimer, DueTimersFireInCreationOrder)
{
    uintptr_t first = VELMNATIVE_SetTimer(nullptr, 0, 30, RecordingProc);
    uintptr_t second = VELMNATIVE_SetTimer(nullptr, 0, 20, RecordingProc);
    clock.Advance(30);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 2);
    ASSERT_EQ(journal.size(), 2u);
    EXPECT_EQ(journal[0].id, first);
    EXPECT_EQ(journal[1].id, second);
    VELMNATIVE_KillTimer(nullptr, first);
    VELMNATIVE_KillTimer(nullptr, second);
}

TEST_F(NativeTimer, RefusesBadArgumentsAndUnknownTimers)
{
    int window = 0;
    EXPECT_EQ(VELMNATIVE_SetTimer(&window, 0, 10, RecordingProc), 0u);
    EXPECT_EQ(VELMNATIVE_SetTimer(nullptr, 0, 10, nullptr), 0u);
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, 0), 0);

    uintptr_t id = VELMNATIVE_SetTimer(nullptr, 0, 10, RecordingProc);
    EXPECT_EQ(VELMNATIVE_KillTimer(&window, id), 0);
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 1);
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 0);

    // A new timer never takes a killed one's id, so a stale kill misses.
    uintptr_t next = VELMNATIVE_SetTimer(nullptr, 0, 10, RecordingProc);
    EXPECT_NE(next, id);
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 0);
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, next), 1);
}

TEST_F(NativeTimer, ProcessWideLimitRefusesOneMore)
{
    std::vector<uintptr_t> ids;
    for (int i = 0; i < VELMNATIVE_MAX_TIMERS; ++i) {
        ids.push_back(VELMNATIVE_SetTimer(nullptr, 0, 1000, RecordingProc));
        ASSERT_NE(ids.back(), 0u) << i;
    }
    EXPECT_EQ(VELMNATIVE_SetTimer(nullptr, 0, 1000, RecordingProc), 0u);
    for (uintptr_t id : ids)
        EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 1);
    uintptr_t id = VELMNATIVE_SetTimer(nullptr, 0, 1000, RecordingProc);
    EXPECT_NE(id, 0u);
    VELMNATIVE_KillTimer(nullptr, id);
}

TEST_F(NativeTimer, KillInsideCallbacks)
{
    uintptr_t self_killing = VELMNATIVE_SetTimer(nullptr, 0, 10, RecordingProc);
    uintptr_t killer = VELMNATIVE_SetTimer(nullptr, 0, 10, RecordingProc);
    uintptr_t victim = VELMNATIVE_SetTimer(nullptr, 0, 10, RecordingProc);
    int nested_pump = -1;
    int victim_kills = 0;
    on_tick = [&](uintptr_t id) {
        if (id == self_killing) {
            nested_pump = VELMNATIVE_PumpTimers();
            EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 1);
        } else if (id == killer) {
            victim_kills += VELMNATIVE_KillTimer(nullptr, victim);
        }
    };

    clock.Advance(10);
    // The nested pump sees the other two due timers, the killer kills the
    // victim there, and the outer pump then skips both.
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);
    EXPECT_EQ(nested_pump, 1);
    clock.Advance(10);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);
    EXPECT_EQ(TicksOf(self_killing), 1);
    EXPECT_EQ(TicksOf(killer), 2);
    EXPECT_EQ(TicksOf(victim), 0);
    EXPECT_EQ(victim_kills, 1);
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, killer), 1);
}

TEST_F(NativeTimer, CallbackCanStartTimersThatWaitAFullInterval)
{
    uintptr_t started = 0;
    uintptr_t starter = VELMNATIVE_SetTimer(nullptr, 0, 10, RecordingProc);
    on_tick = [&](uintptr_t id) {
        if (id == starter && started == 0)
            started = VELMNATIVE_SetTimer(nullptr, 0, 10, RecordingProc);
    };
    clock.Advance(10);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);
    ASSERT_NE(started, 0u);
    clock.Advance(10);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 2);
    EXPECT_EQ(TicksOf(started), 1);
    VELMNATIVE_KillTimer(nullptr, starter);
    VELMNATIVE_KillTimer(nullptr, started);
}

TEST_F(NativeTimer, ClockChangeRestartsIntervalsFromTheNewTime)
{
    uintptr_t id = VELMNATIVE_SetTimer(nullptr, 0, 40, RecordingProc);
    {
        ManualClock earlier(100);
        EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
        earlier.Advance(39);
        EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
        earlier.Advance(1);
        EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);
        EXPECT_EQ(journal.back().time_ms, 140u);
    }
    // Back on the monotonic clock the interval starts afresh: nothing is due.
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 1);
}

TEST_F(NativeTimer, TicksReachOnlyTheCreatingThread)
{
    std::thread::id creator_thread;
    uintptr_t id = 0;
    std::promise<void> created, advanced;
    std::thread creator([&] {
        creator_thread = std::this_thread::get_id();
        id = VELMNATIVE_SetTimer(nullptr, 0, 25, RecordingProc);
        created.set_value();
        advanced.get_future().wait();
        EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);
    });
    created.get_future().wait();
    clock.Advance(25);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
    std::thread bystander([] { EXPECT_EQ(VELMNATIVE_PumpTimers(), 0); });
    bystander.join();
    advanced.set_value();
    creator.join();

    ASSERT_EQ(journal.size(), 1u);
    EXPECT_EQ(journal[0].thread, creator_thread);
    // The creator has ended; its timer can still be killed from here.
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 1);
}

TEST_F(NativeTimer, KillFromAnotherThreadWaitsForTheRunningCallback)
{
    std::atomic<bool> callback_finished{false};
    std::promise<void> entered, killed;
    std::promise<uintptr_t> created;
    on_tick = [&](uintptr_t) {
        entered.set_value();
        // Long enough that a kill which did not wait would return first.
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
        callback_finished = true;
    };
    std::thread owner([&] {
        created.set_value(VELMNATIVE_SetTimer(nullptr, 0, 10, RecordingProc));
        clock.Advance(10);
        EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);
        killed.get_future().wait();
        clock.Advance(10);
        EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
    });
    uintptr_t id = created.get_future().get();
    entered.get_future().wait();
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 1);
    EXPECT_TRUE(callback_finished);
    killed.set_value();
    owner.join();
    EXPECT_EQ(TicksOf(id), 1);
}

} // namespace
