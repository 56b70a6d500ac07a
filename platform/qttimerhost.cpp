#include "platform/qttimerhost.h"

#include <QCoreApplication>
#include <QThread>
#include <QTimerEvent>

#include <memory>

namespace velm::platform {

bool QtDeliversOnThisThread()
{
    QCoreApplication *app = QCoreApplication::instance();
    if (!app)
        return false;
    // The application's thread counts before exec() starts: that is where a
    // host creates its first timers.
    QThread *thread = QThread::currentThread();
    return thread == app->thread() || thread->loopLevel() > 0;
}

QtTimerHost *QtTimerHost::ForThisThread()
{
    // Destroyed when the thread ends, before any static of the process.
    thread_local std::unique_ptr<QtTimerHost> host;
    if (!host)
        host.reset(new QtTimerHost);
    return host.get();
}

QtTimerHost::~QtTimerHost()
{
    ForgetQtTimerHost(this);
}

int QtTimerHost::Start(uintptr_t id, uint32_t interval_ms)
{
    int qt_timer_id = startTimer(static_cast<int>(interval_ms));
    if (qt_timer_id != 0)
        native_ids_[qt_timer_id] = id;
    return qt_timer_id;
}

void QtTimerHost::Stop(int qt_timer_id)
{
    if (native_ids_.erase(qt_timer_id) != 0)
        killTimer(qt_timer_id);
}

void QtTimerHost::StopLater(int qt_timer_id)
{
    // Posted to this object, so Qt drops it when the host is destroyed first.
    QMetaObject::invokeMethod(this, [this, qt_timer_id] { Stop(qt_timer_id); }, Qt::QueuedConnection);
}

void QtTimerHost::timerEvent(QTimerEvent *event)
{
    auto it = native_ids_.find(event->timerId());
    if (it == native_ids_.end())
        return;
    DeliverQtTick(it->second);
}

} // namespace velm::platform
