// Playback of a one-hour stereo document through the virtual device:
//   - BM_StartStop: from the request to play the middle of the hour until the
//     first buffer has been taken, then the stop (what a user waits for);
//   - BM_PlayOneSecond: one second played in real time; the counter
//     cpu_percent is the whole process's processor time over that second
//     (device worker, player and timers together).
#include <benchmark/benchmark.h>
#include <sys/resource.h>

#include <chrono>
#include <thread>

#include "bench/hour_source.hpp"
#include "core/velmaudio.h"
#include "core/velmqueries.h"
#include "outside/base/blbase.h"
#include "platform/nativetimer.h"
#include "sound/velmplay.h"

namespace {

using velmbench::kFrames;
using velmbench::kRate;

double process_cpu_seconds()
{
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return static_cast<double>(usage.ru_utime.tv_sec + usage.ru_stime.tv_sec) +
           static_cast<double>(usage.ru_utime.tv_usec + usage.ru_stime.tv_usec) / 1e6;
}

struct Hour {
    VELMAUDIO doc = nullptr;

    Hour()
    {
        VELMPLAY_Initialize();
        BLSETTINGS_ChangeEx(nullptr, "libvelm.playback.devicename=Virtual Device");
        BLSETTINGS_ChangeEx(nullptr, "libvelm.sound.virtual.playbackfile=");
        BLSETTINGS_ChangeEx(nullptr, "libvelm.sound.virtual.speed=1");
        doc = VELMAUDIO_Open(velmbench::hour_source().c_str(), "AUTO");
    }
    ~Hour() { VELMAUDIO_Close(doc); }

    bool start(int64_t from, int64_t to)
    {
        return VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_RANGE | VELMPLAY_NO_NOTIFY, from, to) != 0;
    }
    // Pumps the update timer until the player has gone or the wall time ran out.
    void play_out(std::chrono::duration<double> limit)
    {
        const auto end = std::chrono::steady_clock::now() + limit;
        while (VELMAUDIO_Player(doc) && std::chrono::steady_clock::now() < end) {
            VELMNATIVE_PumpTimers();
            std::this_thread::sleep_for(std::chrono::milliseconds(5));
        }
    }
};

void BM_StartStop(benchmark::State &state)
{
    Hour h;
    const int64_t middle = kFrames / 2;
    for (auto _ : state) {
        if (!h.start(middle, middle + kRate)) state.SkipWithError("no player");
        VELMPLAYER player = VELMAUDIO_Player(h.doc);
        while (VELMPLAY_PlayPosition(player) <= middle && VELMAUDIO_IsPlaying(h.doc)) std::this_thread::yield();
        VELMAUDIO_PlayStop(h.doc);
    }
}

void BM_PlayOneSecond(benchmark::State &state)
{
    Hour h;
    double cpu = 0.0, wall = 0.0;
    for (auto _ : state) {
        const double cpu0 = process_cpu_seconds();
        const auto wall0 = std::chrono::steady_clock::now();
        if (!h.start(kFrames / 3, kFrames / 3 + kRate)) state.SkipWithError("no player");
        h.play_out(std::chrono::seconds(5));
        cpu += process_cpu_seconds() - cpu0;
        wall += std::chrono::duration<double>(std::chrono::steady_clock::now() - wall0).count();
    }
    state.counters["cpu_percent"] = wall > 0 ? 100.0 * cpu / wall : 0.0;
}

BENCHMARK(BM_StartStop)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_PlayOneSecond)->Unit(benchmark::kMillisecond)->Iterations(3)->UseRealTime();

} // namespace

BENCHMARK_MAIN();
