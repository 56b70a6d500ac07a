/* Delivery of native timers through a thread's Qt event loop. */
#ifndef VELMNATIVE_QTTIMERHOST_H
#define VELMNATIVE_QTTIMERHOST_H

#include <QObject>

#include <cstdint>
#include <unordered_map>

namespace velm::platform {

/* True when timers created on the calling thread should tick from its Qt event
 * loop: a QCoreApplication exists and this is its thread, or this thread is
 * already running an event loop. */
bool QtDeliversOnThisThread();

/* One per thread that has Qt-delivered timers, living in that thread until it
 * ends. Its Qt timers are only touched on that thread. */
class QtTimerHost final : public QObject {
public:
    /* The calling thread's host, created on first use. */
    static QtTimerHost *ForThisThread();

    ~QtTimerHost() override;

    /* Starts a Qt timer that delivers ticks of native timer `id`; returns the
     * Qt timer id, or 0 when Qt cannot start one. Owner thread only. */
    int Start(uintptr_t id, uint32_t interval_ms);
    /* Stops a Qt timer. Owner thread only; safe inside its own tick. */
    void Stop(int qt_timer_id);
    /* Asks the owner thread to stop a Qt timer; callable from any thread
     * while the host is known to be alive. */
    void StopLater(int qt_timer_id);

protected:
    void timerEvent(QTimerEvent *event) override;

private:
    QtTimerHost() = default;

    std::unordered_map<int, uintptr_t> native_ids_; /* Qt timer id -> native id */
};

/* Implemented by the timer registry. */
/* Runs one tick of native timer `id` on the calling thread. */
void DeliverQtTick(uintptr_t id);
/* Tells the registry a host is going away with its thread. */
void ForgetQtTimerHost(QtTimerHost *host);

} // namespace velm::platform

#endif /* VELMNATIVE_QTTIMERHOST_H */
