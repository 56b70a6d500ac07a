/*
 * Native thread timers without a window.
 *
 * A timer belongs to the thread that creates it and is only ever delivered on
 * that thread, in one of two ways chosen when it is created:
 *
 *   - through Qt: when a QCoreApplication exists and the creating thread is
 *     the application's thread or a thread already running a Qt event loop
 *     (a QThread in exec()), ticks arrive from that thread's event loop;
 *   - through the pump: on any other thread the host calls
 *     VELMNATIVE_PumpTimers() on that thread, as often as it wants ticks.
 *
 * The library never creates a QCoreApplication. A Qt host creates its
 * application object (QCoreApplication, QGuiApplication or QApplication)
 * before the library creates timers and runs exec() on that thread; worker
 * QThreads that create timers run their own exec(). A host without Qt calls
 * VELMNATIVE_PumpTimers() from its own loop on every thread that creates
 * timers.
 *
 * A timer that falls behind fires once when it is next delivered, not once
 * per missed interval. A killed timer is never called again, including when
 * it is killed from inside its own callback or another timer's.
 */
#ifndef VELMNATIVE_NATIVETIMER_H
#define VELMNATIVE_NATIVETIMER_H

#include "core/velm_api.h"

#include <stdint.h>

VELM_EXTERN_C_BEGIN

/* The message code handed to every timer procedure. */
#define VELMNATIVE_WM_TIMER 0x0113u

/* Intervals are raised to this minimum and cut to the maximum. */
#define VELMNATIVE_TIMER_MINIMUM_MS 10u
#define VELMNATIVE_TIMER_MAXIMUM_MS 0x7FFFFFFFu

/* At most this many timers exist in the process at once. */
#define VELMNATIVE_MAX_TIMERS 10000

/* Called on each tick with the window and timer id given at creation, the
 * message VELMNATIVE_WM_TIMER and the clock's time in milliseconds. */
typedef void (*VELMNATIVE_TimerProc)(void *window, uint32_t message, uintptr_t timer_id, uint32_t time_ms);

/* Answers the current time in milliseconds. */
typedef uint64_t (*VELMNATIVE_ClockProc)(void *user);

/*
 * Creates a timer on the calling thread that calls proc every interval_ms
 * milliseconds. window must be null (there are no windows) and proc must not
 * be null; id is ignored, every call makes a new timer. Returns the new
 * timer's id, never reused within the process, or 0 on failure.
 */
VELM_API uintptr_t VELMNATIVE_SetTimer(void *window, uintptr_t id, uint32_t interval_ms, VELMNATIVE_TimerProc proc);

/*
 * Destroys a timer; returns 1, or 0 when window is not null or no such timer
 * exists. May be called from any thread: when the timer's callback is running
 * on another thread at that moment, the call waits until it returns, so after
 * a successful kill the callback never runs again.
 */
VELM_API int VELMNATIVE_KillTimer(void *window, uintptr_t timer_id);

/*
 * Delivers the due ticks of the calling thread's pumped timers, each due
 * timer once, in order of creation; returns how many were delivered. Timers
 * delivered through Qt are never pumped.
 */
VELM_API int VELMNATIVE_PumpTimers(void);

/*
 * Replaces the clock that pumped timers are scheduled by and that stamps
 * every tick; null restores the monotonic clock. Every pumped timer then
 * starts its current interval afresh from the new clock's time.
 */
VELM_API void VELMNATIVE_SetClock(VELMNATIVE_ClockProc now_ms, void *user);

VELM_EXTERN_C_END

#endif /* VELMNATIVE_NATIVETIMER_H */
