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

// A QThread running its event loop, and a way to run code inside it.
class WorkerLoop {
public:
    WorkerLoop()
    {
        context_.moveToThread(&thread_);
        thread_.start();
    }
    ~WorkerLoop() { Stop(); }

    QThread *Thread() { return &thread_; }

    // Creates a timer on the worker thread and returns its id.
    uintptr_t StartTimer(VELMNATIVE_TimerProc proc)
    {
        uintptr_t id = 0;
        Run([&] { id = VELMNATIVE_SetTimer(nullptr, 0, 10, proc); });
        return id;
    }
    template <typename Function> void Post(Function function) { QMetaObject::invokeMethod(&context_, function); }
    // Returns once the worker's loop has handled everything posted before.
    template <typename Function> void Run(Function function)
    {
        QMetaObject::invokeMethod(&context_, function, Qt::BlockingQueuedConnection);
    }
    bool Stop()
    {
        thread_.quit();
        return thread_.wait(kWatchdogMs);
    }

private:
    QThread thread_;
    QObject context_;
};

TEST_F(QtTimerDelivery, QThreadTicksOnItsOwnThread)
{
    ticked_on = nullptr;
    worker_ticks = 0;
    WorkerLoop worker;
    worker.Post([] { VELMNATIVE_SetTimer(nullptr, 0, 10, QuitWorkerOnTick); });

    ASSERT_TRUE(worker.Thread()->wait(kWatchdogMs));
    EXPECT_EQ(ticked_on.load(), worker.Thread());
    EXPECT_EQ(worker_ticks.load(), 1);
}

TEST_F(QtTimerDelivery, TimerOutlivingItsQThreadCanStillBeKilled)
{
    WorkerLoop worker;
    uintptr_t id = worker.StartTimer(CountWorkerTick);
    ASSERT_NE(id, 0u);
    ASSERT_TRUE(worker.Stop());

    EXPECT_EQ(VELMNATIVE_PumpTimers(), 0);
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 1);
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 0);
}

TEST_F(QtTimerDelivery, KillFromAnotherThreadStopsAQThreadTimer)
{
    worker_ticks = 0;
    WorkerLoop worker;
    uintptr_t id = worker.StartTimer(CountWorkerTick);
    ASSERT_NE(id, 0u);
    std::promise<void> ticked;
    // Waits on the worker's loop until the first tick has been delivered.
    worker.Post([&] {
        while (worker_ticks == 0)
            QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
        ticked.set_value();
    });
    ticked.get_future().wait();

    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 1);
    const int ticks_at_kill = worker_ticks;
    // The stop posted by the kill runs before this returns.
    worker.Run([] {});
    ASSERT_TRUE(worker.Stop());
    EXPECT_EQ(worker_ticks.load(), ticks_at_kill);
    EXPECT_EQ(VELMNATIVE_KillTimer(nullptr, id), 0);
}

} // namespace
