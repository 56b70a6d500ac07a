#include "core/velmtimer.h"
#include "platform/nativetimer.h"

#include <QCoreApplication>
#include <QThread>
#include <QTimer>

#include <gtest/gtest.h>

#include <atomic>
#include <future>

namespace {

// A test that never sees its ticks fails instead of hanging.
constexpr int kWatchdogMs = 20000;

class QtTimerDelivery : public ::testing::Test {
protected:
    int argc = 1;
    char name[8] = "timers";
    char *argv[2] = {name, nullptr};
    QCoreApplication app{argc, argv};
};

struct MainLoopProbe {
    int ticks = 0;
    int pumped_during_ticks = 0;
    VELMTIMER timer = nullptr;
};

int QuitAfterThreeTicks(void *user)
{
    auto *probe = static_cast<MainLoopProbe *>(user);
    ++probe->ticks;
    // Qt-delivered timers are not the pump's to deliver.
    probe->pumped_during_ticks += VELMNATIVE_PumpTimers();
    if (probe->ticks == 3) {
        EXPECT_EQ(VELMTIMER_KillTimer(probe->timer), 1);
        QCoreApplication::quit();
    }
    return 1;
}

TEST_F(QtTimerDelivery, ApplicationThreadTicksFromItsEventLoop)
{
    MainLoopProbe probe;
    probe.timer = VELMTIMER_CreateTimer(10, QuitAfterThreeTicks, &probe);
    ASSERT_NE(probe.timer, nullptr);
    bool timed_out = false;
    QTimer::singleShot(kWatchdogMs, &app, [&] {
        timed_out = true;
        QCoreApplication::quit();
    });

    QCoreApplication::exec();

    ASSERT_FALSE(timed_out);
    EXPECT_EQ(probe.ticks, 3);
    EXPECT_EQ(probe.pumped_during_ticks, 0);
    // The slot was freed by the kill inside the callback.
    EXPECT_EQ(VELMTIMER_KillTimer(probe.timer), 0);
}

// Ticks of timers made inside a QThread's event loop.
std::atomic<QThread *> ticked_on{nullptr};
std::atomic<int> worker_ticks{0};

void QuitWorkerOnTick(void *, uint32_t, uintptr_t id, uint32_t)
{
    ticked_on = QThread::currentThread();
    ++worker_ticks;
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 1);
    QThread::currentThread()->quit();
}

void CountWorkerTick(void *, uint32_t, uintptr_t, uint32_t)
{
    ++worker_ticks;
}

TEST_F(QtTimerDelivery, QThreadTicksOnItsOwnThread)
{
    ticked_on = nullptr;
    worker_ticks = 0;
    QThread worker;
    QObject context;
    context.moveToThread(&worker);
    worker.start();
    QMetaObject::invokeMethod(&context, [] { VELMNATIVE_SetTimer(nullptr, 0, 10, QuitWorkerOnTick); });

    ASSERT_TRUE(worker.wait(kWatchdogMs));
    EXPECT_EQ(ticked_on.load(), &worker);
    EXPECT_EQ(worker_ticks.load(), 1);
}

TEST_F(QtTimerDelivery, KillFromAnotherThreadStopsAQThreadTimer)
{
    worker_ticks = 0;
    QThread worker;
    QObject context;
    context.moveToThread(&worker);
    worker.start();
    uintptr_t id = 0;
    QMetaObject::invokeMethod(&context, [&] { id = VELMNATIVE_SetTimer(nullptr, 0, 10, CountWorkerTick); },
                              Qt::BlockingQueuedConnection);
    ASSERT_NE(id, 0u);
    std::promise<void> ticked;
    // Waits on the worker's loop until the first tick has been delivered.
    QMetaObject::invokeMethod(&context, [&] {
        while (worker_ticks == 0)
            QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
        ticked.set_value();
    });
    ticked.get_future().wait();

    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 1);
    const int ticks_at_kill = worker_ticks;
    // Let the worker's loop run the posted stop, then end it.
    QMetaObject::invokeMethod(&context, [] {}, Qt::BlockingQueuedConnection);
    worker.quit();
    ASSERT_TRUE(worker.wait(kWatchdogMs));
    EXPECT_EQ(worker_ticks.load(), ticks_at_kill);
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 0);
}

} // namespace
