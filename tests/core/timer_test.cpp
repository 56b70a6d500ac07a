#include "core/velmtimer.h"
#include "platform/manualclock.h"
#include "platform/nativetimer.h"

#include <gtest/gtest.h>

#include <functional>
#include <set>
#include <thread>
#include <vector>

namespace {

// What one timer does on a tick; the timer's user value points to it.
struct Probe {
    int ticks = 0;
    std::function<void()> action;
};

int CountTick(void *user)
{
    auto *probe = static_cast<Probe *>(user);
    ++probe->ticks;
    if (probe->action)
        probe->action();
    return 0; // ignored: the timer keeps running
}

class VelmTimer : public ::testing::Test {
protected:
    void TearDown() override
    {
        for (VELMTIMER timer : live)
            VELMTIMER_KillTimer(timer);
    }

    VELMTIMER Create(uint32_t interval_ms, Probe *probe)
    {
        VELMTIMER timer = VELMTIMER_CreateTimer(interval_ms, CountTick, probe);
        if (timer)
            live.push_back(timer);
        return timer;
    }

    ManualClock clock;
    std::vector<VELMTIMER> live;
};

TEST_F(VelmTimer, CallsCallbackWithUserValueEveryInterval)
{
    Probe probe;
    ASSERT_NE(Create(33, &probe), nullptr);
    clock.Advance(32);
    VELMNATIVE_PumpTimers();
    EXPECT_EQ(probe.ticks, 0);
    for (int i = 0; i < 3; ++i) {
        clock.Advance(33);
        VELMNATIVE_PumpTimers();
    }
    EXPECT_EQ(probe.ticks, 3);
    // A long stall is caught up with one tick.
    clock.Advance(33 * 20);
    VELMNATIVE_PumpTimers();
    VELMNATIVE_PumpTimers();
    EXPECT_EQ(probe.ticks, 4);
}

TEST_F(VelmTimer, ThirtySlotsThenRefusalAndLowestFreeSlotReused)
{
    Probe probe;
    std::set<VELMTIMER> handles;
    for (int i = 0; i < VELMTIMER_MAX_TIMERS; ++i) {
        VELMTIMER timer = Create(100, &probe);
        ASSERT_NE(timer, nullptr) << i;
        handles.insert(timer);
    }
    EXPECT_EQ(handles.size(), size_t(VELMTIMER_MAX_TIMERS));
    EXPECT_EQ(VELMTIMER_CreateTimer(100, CountTick, &probe), nullptr);

    EXPECT_EQ(VELMTIMER_KillTimer(live[20]), 1);
    EXPECT_EQ(VELMTIMER_KillTimer(live[5]), 1);
    EXPECT_EQ(VELMTIMER_CreateTimer(100, CountTick, &probe), live[5]);
    EXPECT_EQ(VELMTIMER_CreateTimer(100, CountTick, &probe), live[20]);
    EXPECT_EQ(VELMTIMER_CreateTimer(100, CountTick, &probe), nullptr);

    clock.Advance(100);
    VELMNATIVE_PumpTimers();
    EXPECT_EQ(probe.ticks, VELMTIMER_MAX_TIMERS);
}

TEST_F(VelmTimer, KillRefusesNullUnusedAndForeignHandles)
{
    Probe probe;
    int not_a_timer = 0;
    EXPECT_EQ(VELMTIMER_KillTimer(nullptr), 0);
    EXPECT_EQ(VELMTIMER_KillTimer(reinterpret_cast<VELMTIMER>(&not_a_timer)), 0);

    VELMTIMER timer = Create(10, &probe);
    ASSERT_NE(timer, nullptr);
    EXPECT_EQ(VELMTIMER_KillTimer(timer), 1);
    EXPECT_EQ(VELMTIMER_KillTimer(timer), 0);
    clock.Advance(10);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
    EXPECT_EQ(probe.ticks, 0);
}

TEST_F(VelmTimer, NullCallbackTicksHarmlessly)
{
    VELMTIMER timer = VELMTIMER_CreateTimer(10, nullptr, nullptr);
    ASSERT_NE(timer, nullptr);
    live.push_back(timer);
    clock.Advance(10);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);
}

TEST_F(VelmTimer, OneShotKillsItselfAndAnotherFromItsCallback)
{
    Probe one_shot, other;
    VELMTIMER one_shot_timer = Create(50, &one_shot);
    VELMTIMER other_timer = Create(50, &other);
    int kills = 0;
    one_shot.action = [&] {
        kills += VELMTIMER_KillTimer(one_shot_timer);
        kills += VELMTIMER_KillTimer(other_timer);
    };
    for (int i = 0; i < 3; ++i) {
        clock.Advance(50);
        VELMNATIVE_PumpTimers();
    }
    EXPECT_EQ(one_shot.ticks, 1);
    EXPECT_EQ(other.ticks, 0);
    EXPECT_EQ(kills, 2);
}

TEST_F(VelmTimer, CallbackReplacesItselfInItsOwnSlot)
{
    Probe first, second;
    VELMTIMER first_timer = Create(20, &first);
    VELMTIMER replacement = nullptr;
    first.action = [&] {
        VELMTIMER_KillTimer(first_timer);
        replacement = Create(20, &second);
    };
    clock.Advance(20);
    VELMNATIVE_PumpTimers();
    EXPECT_EQ(replacement, first_timer);
    clock.Advance(20);
    VELMNATIVE_PumpTimers();
    EXPECT_EQ(first.ticks, 1);
    EXPECT_EQ(second.ticks, 1);
}

TEST_F(VelmTimer, TimerOfAnotherThreadTicksOnlyThere)
{
    Probe probe;
    std::thread::id tick_thread;
    probe.action = [&] { tick_thread = std::this_thread::get_id(); };
    std::thread worker([&] {
        VELMTIMER timer = VELMTIMER_CreateTimer(40, CountTick, &probe);
        ASSERT_NE(timer, nullptr);
        clock.Advance(40);
        EXPECT_EQ(VELMNATIVE_PumpTimers(), 1);
        EXPECT_EQ(VELMTIMER_KillTimer(timer), 1);
    });
    const std::thread::id worker_id = worker.get_id();
    worker.join();
    EXPECT_EQ(probe.ticks, 1);
    EXPECT_EQ(tick_thread, worker_id);

    // The main thread's pump never delivers a worker's timer.
    worker = std::thread([&] { live.push_back(VELMTIMER_CreateTimer(40, CountTick, &probe)); });
    worker.join();
    clock.Advance(40);
    EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
    EXPECT_EQ(probe.ticks, 1);
}

} // namespace
