/* A clock for timer tests that only moves when told to. */
#ifndef VELM_TESTS_MANUALCLOCK_H
#define VELM_TESTS_MANUALCLOCK_H

#include "platform/nativetimer.h"

#include <atomic>
#include <cstdint>

class ManualClock {
public:
    explicit ManualClock(uint64_t start_ms = 5000) : now_(start_ms) { VELMNATIVE_SetClock(&ManualClock::Read, this); }
    ~ManualClock() { VELMNATIVE_SetClock(nullptr, nullptr); }
    ManualClock(const ManualClock &) = delete;
    ManualClock &operator=(const ManualClock &) = delete;

    void Advance(uint64_t ms) { now_ += ms; }
    uint64_t Now() const { return now_; }

private:
    static uint64_t Read(void *self) { return static_cast<ManualClock *>(self)->now_; }

    std::atomic<uint64_t> now_;
};

#endif /* VELM_TESTS_MANUALCLOCK_H */
