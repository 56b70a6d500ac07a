/*
 * Timers for the library's periodic work (play cursor updates, hover and
 * repeat gestures, blinking). A process has 32 timer slots; a timer's handle
 * is its slot. Ticks arrive on the thread that created the timer, through its
 * Qt event loop or VELMNATIVE_PumpTimers() (see platform/nativetimer.h).
 */
#ifndef VELMTIMER_H
#define VELMTIMER_H

#include "core/velm_api.h"

#include <stdint.h>

VELM_EXTERN_C_BEGIN

#define VELMTIMER_MAX_TIMERS 32

typedef struct _VELMTIMER *VELMTIMER;

/* Called with the user value on every tick; the result is ignored. */
typedef int (*VELMTIMER_Callback)(void *user);

/* Starts a timer in the lowest free slot, calling callback(user) every
 * interval_ms milliseconds. Returns its handle, or null when all 32 slots are
 * in use or no timer can be started. */
VELM_API VELMTIMER VELMTIMER_CreateTimer(uint32_t interval_ms, VELMTIMER_Callback callback, void *user);

/* Stops a timer and frees its slot; 1 on success, 0 for a null handle or a
 * slot not in use. Safe inside any timer's callback, its own included. */
VELM_API int VELMTIMER_KillTimer(VELMTIMER timer);

VELM_EXTERN_C_END

#endif /* VELMTIMER_H */
