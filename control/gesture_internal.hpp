// Helpers shared by the pointer gesture handlers.  Private to the library.
#ifndef VELM_GESTURE_INTERNAL_HPP
#define VELM_GESTURE_INTERNAL_HPP

#include <cstdint>

#include "control/control_internal.hpp"
#include "core/document_internal.hpp"
#include "render/view/drawer_internal.hpp"

namespace velm::control {

constexpr uint32_t kPrimary = 0x20u;

// Marks the controller busy for one handler; ok is false for a null or
// undrawn drawer, a document without signal, or a re-entered call.
class Busy {
public:
    explicit Busy(VELMDRAW drawer);
    ~Busy();
    Busy(const Busy &) = delete;
    Busy &operator=(const Busy &) = delete;
    bool ok() const { return drawer_ != nullptr; }

private:
    VELMDRAW drawer_ = nullptr;
};

// Stores the pointer (clamped to a sane canvas range) and runs the hit test.
int point_at(VELMDRAW d, int x, int y);
int64_t display_sample(VELMDRAW d, int x);
int64_t navigator_sample(VELMDRAW d, int x);
void send(VELMDRAW d, uint32_t kind, void *data1, void *data2);
void kill_timer(VELMTIMER &timer);
// Moves both ends of the visible range by the given samples.
void shift_view(VELMDRAW d, int64_t by);
// The scroll of a selection drag when the pointer leaves the display sideways.
int64_t autoscroll_step(VELMDRAW d, int x);
int smart_zoom_update(VELMDRAW d);
// While nothing plays, selects the lane's channel alone when the code is in
// its channel-select band, else all channels.
void set_channel_mask(VELMDRAW d, uint32_t code);
// The lane index of a code, or -1 when it names no drawn lane.
int lane_of(VELMDRAW d, uint32_t code);
// The amplitude (waveform) or scale value (spectrogram) of canvas row y in a lane.
double lane_value(VELMDRAW d, int lane, int y);

// The timers' callbacks; user is the drawer.
int hover_tick(void *drawer);
int press_tick(void *drawer);
int navigator_scroll_tick(void *drawer);

// Handlers run under the busy guard.
int move(VELMDRAW d, int x, int y, uint32_t flags);

} // namespace velm::control

#endif
