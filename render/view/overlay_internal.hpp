// Helpers shared by the overlays: sample-to-column mapping, the band of
// lanes and custom tracks that cursors and selections cross, translucent
// fills and the handle pictures.  Private to the renderer.
#ifndef VELM_OVERLAY_INTERNAL_HPP
#define VELM_OVERLAY_INTERNAL_HPP

#include <cstdint>

#include "render/view/drawer_internal.hpp"

namespace velm::view {

// Columns far outside the view are clamped to this distance from it, so
// absurd positions never overflow the integer arithmetic that follows.
constexpr int kColumnReach = 1 << 20;

// The column of a sample through a time base (nearest column).
int column_of(const VELMTIMEBASE *base, double sample);
// The column of a time in seconds through a time base.
int column_of_time(VELMDRAW d, const VELMTIMEBASE *base, double seconds);

// A waveform or spectrogram lane that shows data of an active channel.
bool active_main_lane(const Lane &lane);
// Whether a custom track's area is shown.
bool track_shown(VELMDRAW d, int track);
// The lanes area extended down to the lowest shown custom track.
_VELMRECT overlay_band(VELMDRAW d);

// Fills a rectangle in a colour whose top byte is its alpha.
void fill_translucent(VELMCANVAS canvas, const _VELMRECT &r, uint32_t color, int corner = 0);
// Fills a rectangle in a plain colour at an alpha factor, then back to opaque.
void fill_alpha(VELMCANVAS canvas, const _VELMRECT &r, uint32_t color, float alpha, int corner = 0);

// The rectangle of a handle picture centred on column x (canvas) and on the
// row above the horizontal scale's top line; empty without that scale.
_VELMRECT handle_rect(VELMDRAW d, VELMCANVASIMAGE image, int x);
// Saves what the rectangle covers and pastes the picture over it.
void paste_handle(VELMDRAW d, VELMCANVASIMAGE image, const _VELMRECT &r);

// Copies columns first .. last of the band from the memory target to the
// output target.
void restore_band(VELMDRAW d, int first, int last);

void mark_dirty_rect(VELMDRAW d, const _VELMRECT &r);
_VELMRECT intersect(const _VELMRECT &a, const _VELMRECT &b);
bool is_empty(const _VELMRECT &r);

// Overlay steps of a frame.
int draw_selection_list(VELMDRAW d, const VELMSTATE *state, int first, int last);
// The same over the custom tracks only, after the region layers copied
// columns of the tracks from the memory target.
int draw_track_selections(VELMDRAW d, const VELMSTATE *state, int first, int last);
int update_selecting(VELMDRAW d, const VELMSTATE *drawn, const VELMSTATE *state);
int draw_selecting_label(VELMDRAW d, const VELMSTATE *state);
int draw_zoom_limit_bar(VELMDRAW d, int which);
// While playing, a gain button over each shown channel button of a lane.
int draw_gain_buttons(VELMDRAW d);
int draw_cursor(VELMDRAW d, const VELMCURSOR &cursor);
int draw_navigator_cursor(VELMDRAW d, const VELMCURSOR &cursor);
// Committed selections (mode 0) and the selection being made (its own mode)
// over the navigator lanes.
int draw_navigator_selections(VELMDRAW d);

} // namespace velm::view

#endif
