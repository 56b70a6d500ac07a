// The drawer record, its lanes, time bases and display data.  Private to the
// renderer.
#ifndef VELM_DRAWER_INTERNAL_HPP
#define VELM_DRAWER_INTERNAL_HPP

#include <array>
#include <cstdint>

#include "control/control_internal.hpp"
#include "core/velmconfig.h"
#include "outside/base/blbase.h"
#include "outside/signal/audiosignal.h"
#include "outside/signal/dspb.h"
#include "render/view/overlay_layout.hpp"
#include "render/view/region_layer.hpp"
#include "render/view/velmdraw.h"

struct _VELMTIMEBASE {
    double  *positions = nullptr; // count + 1 entries: first sample of each column, then the end
    int32_t  capacity = 0;        // entries allocated
    int32_t  count = 0;           // columns
    double   step = 0.0;          // samples per column
    int64_t  start = 0, end = 0;  // the window it was built for, rounded
    int64_t  origin = 0;          // positions[i] = (origin + i) * step, clamped to limit
    double   limit = 0.0;
};

namespace velm::view {

// What a lane's display data were computed for; data are current while all
// of it matches.
struct DataKey {
    int32_t  count = 0;
    int64_t  start = -1, end = -1;
    uint64_t changeTime = 0;
};

struct WaveData {
    float   *first = nullptr;    // digital: column minimum; analog: spline value
    float   *second = nullptr;   // digital: column maximum; analog: the samples from view start - 10
    int32_t  analog = 0;
    int32_t  capacity = 0;       // columns; second holds capacity + 2 * kSplineMargin values
    int32_t  samples = 0;        // analog: samples held in second
    DataKey  key;
    int32_t  polygonCapacity = 0;
    int32_t *polygonX = nullptr, *polygonY = nullptr;
};

struct SpectralData {
    BLMEM    pool = nullptr;     // "Spectral Data Channel"
    int32_t  capacity = 0;       // columns, a multiple of 16
    int32_t  bins = 0;
    int32_t  fftLength = 0;
    double   dynamicRange = 0.0;
    double   preEmphasis = 0.0;
    int32_t  windowLength = 0;
    uint8_t  normalize = 0;
    int32_t  windowKind = 0;
    int32_t  scaleKind = 0;
    float   *window = nullptr;
    double   windowNorm = 0.0;
    float   *weights = nullptr;
    DSPB_FFTPROC *fft = nullptr;
    uint8_t *image = nullptr;    // bins x capacity, top row = highest bin
    uint16_t *levels = nullptr;  // same layout
    DataKey  key;
    uint64_t dataStamp = 0;      // 0: invalid; grows with each computation
    uint64_t imageStamp = 0;
};

struct Lane;

// What a worker computes: columns first .. last of one lane.
struct WorkOrder {
    struct ::_VELMDRAW *drawer = nullptr;
    Lane    *lane = nullptr;
    int32_t  first = 0, last = 0;
    int32_t  threaded = 0;
    uint64_t changeTime = 0;     // the document's change stamp when ordered
};

struct Lane {
    int32_t  kind = 0;
    VELMTIMEBASE *timeBase = nullptr;
    int32_t  channel = 0;
    _VELMRECT area{};
    double   viewStart = 0.0, viewLength = 1.0;
    double   rangeTop = 1.0, rangeBottom = -1.0; // waveform: amplitudes; spectrogram: scale units
    double   scaleTop = 0.0;                     // spectrogram: the Nyquist frequency in scale units
    double   nyquist = 0.0;
    int32_t  zeroRow = 0;
    WaveData *wave = nullptr;
    SpectralData *spectral = nullptr;
    _VELMRECT vertScale{};
    _VELMRECT buttons[2]{};
    BLTHREAD worker = nullptr;
    WorkOrder order;
    uint8_t  drawsGrid = 0, drawsScale = 0, active = 0, shown = 0;
};

struct ViewButton {
    int32_t  id = 0;
    const char *label = "";
    uint8_t  enabled = 0, selected = 0;
    _VELMRECT rect{};
};

// A counted set of rectangles (separators and strips).
struct RectList {
    std::array<_VELMRECT, 32> rect{};
    int32_t count = 0;
    void clear() { count = 0; }
    void add(const _VELMRECT &r)
    {
        if (count < static_cast<int32_t>(rect.size())) rect[static_cast<size_t>(count++)] = r;
    }
};

constexpr int kMaxLanes = 3 * VELMDRAW_MAX_CHANNELS;
// Samples read on each side of the view for the spline (analog mode).
constexpr int kSplineMargin = 10;

// The scale steps of a frame: the horizontal scale strip (computed and drawn
// whole, since a scroll moves every label) and the grid lines through the
// lanes over columns first .. last.
int draw_horz_scale(VELMDRAW drawer);
int draw_scale_grids(VELMDRAW drawer, int first, int last);

// Ticks of the horizontal scale: positions origin + k * step that fall on
// the display (or a little left of it, for labels reaching in).
struct HorzTick {
    int32_t x = 0;        // column
    int64_t sample = 0;
    uint8_t major = 0;    // labelled
};

constexpr int kMaxHorzTicks = 512;

struct HorzScale {
    int64_t step = 0;
    int64_t count = 0;
    int64_t origin = 0;
    int64_t spacing = 0;  // columns between the first two ticks
    std::array<HorzTick, kMaxHorzTicks + 1> ticks{}; // count entries, then a sentinel
};

// Samples between ticks of a horizontal scale kind so that ticks stand at
// least min_spacing columns apart; rate is the sample rate, or the frame
// length in samples for the frame kinds.
int64_t horz_scale_step(int kind, double rate, double columns, double view_length, double min_spacing);

// The registry of live drawers; a canvas the host destroys is forgotten by
// each of them.
void register_drawer(VELMDRAW drawer);
void unregister_drawer(VELMDRAW drawer);

// Widens the dirty rectangle by the given output pixels.
void mark_dirty(VELMDRAW drawer, int32_t left, int32_t top, int32_t right, int32_t bottom);

// Small rectangle helpers.
_VELMRECT make_rect(int32_t left, int32_t top, int32_t width, int32_t height);
// Makes a rectangle of the current target fully transparent (the
// background of a transparent view).
void clear_rect(VELMCANVAS canvas, const _VELMRECT &rect);
// Axis-aligned lines of the selected colour covering both end points.
void draw_hline(VELMCANVAS canvas, int x1, int x2, int y);
void draw_vline(VELMCANVAS canvas, int x, int y1, int y2);
// The canvas font record of a configured font.
_VELMCANVASFONT canvas_font(const VELMCONFIGFONT &config);

// Time bases.
bool prepare_time_base(VELMTIMEBASE *base, double start, double end, int columns, int64_t signal_length);
// Shifts by whole columns; start and end name the window it now serves.
void offset_time_base(VELMTIMEBASE *base, int columns, double start, double end, int64_t signal_length);
bool reserve_time_base(BLMEM pool, VELMTIMEBASE *base, int columns);

// Layout pieces that do not need the whole frame.
int32_t lanes_height_left(const _VELMDRAW *drawer);

// Waveform display data (one block in the drawer's pool).
WaveData *create_wave_data(BLMEM pool, WaveData *old, int capacity);
void destroy_wave_data(BLMEM pool, WaveData *data);
int process_wave(VELMDRAW drawer, Lane *lane, int first, int last);
int draw_wave(VELMDRAW drawer, Lane *lane, int first, int last);
int draw_wave_background(VELMDRAW drawer, Lane *lane, int first, int last);
int move_wave_data(WaveData *data, int from, int to, int count);

// Spectral display data (own pool).
SpectralData *create_spectral_data(VELMDRAW drawer, SpectralData *old, int capacity);
void destroy_spectral_data(SpectralData *data);
int process_spectral(VELMDRAW drawer, Lane *lane, int first, int last);
int draw_spectral(VELMDRAW drawer, Lane *lane, int first, int last);
int move_spectral_data(SpectralData *data, int from, int to, int count);

// Workers: at most one per lane; joined before any lane is drawn.  An order
// of more than `threshold` columns runs in a worker, a smaller one at once.
int run_order(VELMDRAW drawer, Lane *lane, int first, int last, int threshold, BLTHREAD_Body body);
// Waits for the lane's worker, if any, so its data may be read.
void finish_worker(Lane *lane);
void join_workers(VELMDRAW drawer);

// Whether a lane's data still belong to its time base and the document.
bool key_matches(const DataKey &key, const VELMTIMEBASE *base, uint64_t change_time);
DataKey key_for(const VELMTIMEBASE *base, uint64_t change_time);

} // namespace velm::view

struct _VELMDRAW {
    BLMEM        pool = nullptr;       // "VELMDRAW Memory": time bases and waveform data
    VELMAUDIO    document = nullptr;
    VELMCANVAS   canvas = nullptr;
    VELMSTATE   *state = nullptr;      // what the pixels now show
    velm::control::Interaction control; // the pointer controller's fields
    _VELMRECT    dirty{};              // output pixels changed since the last report
    int32_t      channels = 0;         // laid out, at most 6
    int32_t      laneCount = 0;
    int32_t      columns = 0;
    VELMTIMEBASE mainBase;
    std::array<velm::view::Lane, velm::view::kMaxLanes> lanes{};
    int32_t      navigatorPosition = 0; // 0 none, 1 top, 2 bottom
    _VELMRECT    navigator{};
    _VELMRECT    frame{};
    VELMTIMEBASE navigatorBase;
    _VELMRECT    horzScale{};
    _VELMRECT    display{}, lanesArea{};
    std::array<_VELMRECT, VELM_MAX_CUSTOM_TRACKS> trackAreas{}, trackScales{};
    std::array<int8_t, VELM_MAX_CUSTOM_TRACKS> trackShown{};
    velm::view::RectList dividers, separators, trackSeparators;
    _VELMRECT    zoomButton{};
    _VELMRECT    sliders[2]{};
    std::array<velm::view::ViewButton, 3> buttons{};
    VELMDRAWCONFIG config{};
    BLMUTEX      lock = nullptr;
    uint8_t      laidOut = 0;
    uint64_t     drawnChangeTime = 0;
    uint64_t     drawnSamplesTime = 0;  // the signal's samples stamp of the last frame   // the document's change stamp of the last frame
    velm::view::HorzScale horzTicks;
    velm::view::OverlayLayout overlay;
    velm::view::RegionLayer regionLayer;
};

#endif
