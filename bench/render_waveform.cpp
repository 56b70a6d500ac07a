// Drawing a one-hour stereo document offscreen: the whole hour at 2000
// columns (display data computed from the signal's summaries), a scroll by a
// tenth of a ten-minute window, a zoom step, the whole hour with spectrogram
// lanes, and the frames that only move overlays: the cursor, and the end of
// a selection being dragged.
//
//   bench_render_waveform     (run with QT_QPA_PLATFORM=offscreen)
//
// The 16-bit WAV file (about 635 MB) is made once in the temporary folder.
#include <benchmark/benchmark.h>
#include <sndfile.h>

#include <QGuiApplication>
#include <QPainter>
#include <cmath>
#include <filesystem>
#include <string>
#include <vector>

#include "core/velmaudio.h"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "edit/velmselection.h"
#include "render/view/velmdraw.h"
#include "bench/hour_source.hpp"

namespace {

using velmbench::kFrames;
using velmbench::kRate;
constexpr int kColumns = 2000;
// No margins, borders or scales: the lanes are exactly kColumns wide.
constexpr uint32_t kBareFlags = 0x4 | 0x8 | 0x40 | 0x80 | 0x100;

struct Session {
    VELMAUDIO doc = nullptr;
    VELMCANVAS canvas = nullptr;

    Session(uint32_t kind, int height)
    {
        static int argc = 1;
        static char name[] = "bench_render_waveform";
        static char *argv[] = {name, nullptr};
        if (!QGuiApplication::instance()) new QGuiApplication(argc, argv);
        doc = VELMAUDIO_Open(velmbench::hour_source().c_str(), "AUTO");
        canvas = VELMCANVAS_CreateCanvasQT(nullptr, kColumns, height);
        VELMCANVAS_ResizeCanvas(canvas, kColumns, height);
        VELMAUDIO_SetDrawProperty(doc, 2, static_cast<int32_t>(kBareFlags | kind));
    }
    ~Session()
    {
        VELMAUDIO_Close(doc);
        VELMCANVAS_DestroyCanvas(canvas);
    }
    bool draw()
    {
        QPainter painter;
        VELMCANVAS_BeginDraw(canvas, &painter);
        const int ok = VELMAUDIO_Draw(canvas, doc, nullptr);
        VELMCANVAS_EndDraw(canvas);
        return ok != 0;
    }
};

// The whole hour; the view end moves by one sample each time, so every
// column is computed anew.
void whole_hour(benchmark::State &state, uint32_t kind)
{
    Session s(kind, 1080);
    s.draw();
    int64_t i = 0;
    for (auto _ : state) {
        VELMAUDIO_Zoom(s.doc, 0, kFrames - (++i % 2));
        if (!s.draw()) state.SkipWithError("draw failed");
    }
}

void BM_WholeHourWaveform(benchmark::State &state)
{
    whole_hour(state, 0x1);
}

void BM_WholeHourSpectrogram(benchmark::State &state)
{
    whole_hour(state, 0x3);
}

// A ten-minute window scrolled by a tenth of itself, to and fro.
void BM_ScrollTenth(benchmark::State &state)
{
    Session s(0x1, 1080);
    const int64_t window = int64_t{600} * kRate;
    VELMAUDIO_Zoom(s.doc, 0, window);
    s.draw();
    int64_t at = 0;
    for (auto _ : state) {
        at = at == 0 ? window / 10 : 0;
        VELMAUDIO_Zoom(s.doc, at, at + window);
        if (!s.draw()) state.SkipWithError("draw failed");
    }
}

// Zooming in and out by a factor of two around the middle.
void BM_ZoomStep(benchmark::State &state)
{
    Session s(0x1, 1080);
    s.draw();
    bool in = true;
    for (auto _ : state) {
        VELMAUDIO_ZoomByFactor(s.doc, kFrames / 2, in ? 0.5 : 2.0);
        in = !in;
        if (!s.draw()) state.SkipWithError("draw failed");
    }
}

// The cursor stepping by a column over the whole hour: only overlays change.
void BM_CursorMove(benchmark::State &state)
{
    Session s(0x3, 1080);
    s.draw();
    const int64_t column = kFrames / kColumns;
    int64_t at = column;
    for (auto _ : state) {
        at = at + column < kFrames ? at + column : column;
        VELMAUDIO_SetCursorPosition(s.doc, at);
        if (!s.draw()) state.SkipWithError("draw failed");
    }
}

// The end of a selection being dragged across the hour, a few columns a frame:
// only the columns it gains or gives back are painted.
void BM_SelectingDrag(benchmark::State &state)
{
    Session s(0x3, 1080);
    s.draw();
    const int64_t step = 3 * (kFrames / kColumns);
    const int64_t anchor = kFrames / 4;
    int64_t end = anchor;
    for (auto _ : state) {
        end = end + step < kFrames ? end + step : anchor;
        VELMAUDIO_UpdateSelecting(s.doc, anchor, end);
        if (!s.draw()) state.SkipWithError("draw failed");
    }
}

} // namespace

BENCHMARK(BM_WholeHourWaveform)->Unit(benchmark::kMillisecond)->Iterations(20);
BENCHMARK(BM_ScrollTenth)->Unit(benchmark::kMillisecond)->Iterations(40);
BENCHMARK(BM_ZoomStep)->Unit(benchmark::kMillisecond)->Iterations(20);
BENCHMARK(BM_WholeHourSpectrogram)->Unit(benchmark::kMillisecond)->Iterations(10);
BENCHMARK(BM_CursorMove)->Unit(benchmark::kMillisecond)->Iterations(200);
BENCHMARK(BM_SelectingDrag)->Unit(benchmark::kMillisecond)->Iterations(200);

BENCHMARK_MAIN();
