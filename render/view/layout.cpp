// The layout: frame, navigator strip, view-kind buttons, lanes, dividers,
// custom tracks and scale areas, from the view state's size and flags.
#include <algorithm>
#include <cmath>

#include "core/document_internal.hpp"
#include "render/view/drawer_internal.hpp"

using namespace velm::view;

namespace {

bool on(uint32_t flags, uint32_t bit)
{
    return (flags & bit) != 0;
}

// Gives the lanes their kinds, channels, time bases and display data when
// the channel count changed.
void build_lanes(VELMDRAW d)
{
    const int channels = std::min(AUDIOSIGNAL_NumChannels(d->document->signal), VELMDRAW_MAX_CHANNELS);
    if (channels == d->channels && d->laneCount == 3 * channels) return;
    for (Lane &lane : d->lanes) {
        destroy_wave_data(d->pool, lane.wave);
        destroy_spectral_data(lane.spectral);
        lane = Lane{};
    }
    d->channels = channels;
    d->laneCount = 3 * channels;
    for (int c = 0; c < channels; ++c) {
        Lane &wave = d->lanes[static_cast<size_t>(c)];
        wave.kind = VELMDRAW_LANE_WAVEFORM;
        wave.drawsGrid = wave.drawsScale = 1;
        Lane &spectral = d->lanes[static_cast<size_t>(channels + c)];
        spectral.kind = VELMDRAW_LANE_SPECTROGRAM;
        Lane &navigator = d->lanes[static_cast<size_t>(2 * channels + c)];
        navigator.kind = VELMDRAW_LANE_NAVIGATOR;
        for (Lane *lane : {&wave, &spectral, &navigator}) {
            lane->channel = c;
            lane->timeBase = lane == &navigator ? &d->navigatorBase : &d->mainBase;
        }
    }
}

// Keeps every lane's display data as large as the canvas.
void refresh_display_data(VELMDRAW d, int capacity)
{
    for (int i = 0; i < d->laneCount; ++i) {
        Lane &lane = d->lanes[static_cast<size_t>(i)];
        if (lane.kind == VELMDRAW_LANE_SPECTROGRAM)
            lane.spectral = create_spectral_data(d, lane.spectral, capacity);
        else
            lane.wave = create_wave_data(d->pool, lane.wave, capacity);
    }
}

int canvas_capacity(VELMDRAW d)
{
    int width = 0, height = 0;
    if (d->canvas && VELMCANVAS_GetMaxDimension(d->canvas, &width, &height) && width > 0) return width;
    return std::max(d->state->drawWidth, 1);
}

void place_buttons(VELMDRAW d, int32_t left, int32_t top)
{
    static const char *const labels[3] = {"Wave Form", "Spectrogram", "Wave Form & Spectrogram"};
    const bool has_samples = AUDIOSIGNAL_NumSamples(d->document->signal) > 0;
    const _VELMCANVASFONT font = canvas_font(d->config.selectorFont);
    if (d->canvas) VELMCANVAS_SelectFont(d->canvas, &font);
    for (int i = 0; i < 3; ++i) {
        ViewButton &b = d->buttons[static_cast<size_t>(i)];
        b.id = i + 1;
        b.label = labels[i];
        b.enabled = has_samples;
        b.selected = has_samples && static_cast<int>(d->state->viewFlags & 3u) == b.id;
        const int text = d->canvas ? VELMCANVAS_TextWidth(d->canvas, b.label) : 0;
        b.rect = make_rect(left, top, b.selected ? 20 : 18, text + 32);
        top += b.rect.height + 1;
    }
}

// Splits total among count lanes, the remainder one pixel each to the first.
int32_t share(int32_t total, int count, int index)
{
    if (count <= 0) return 0;
    return total / count + (index < total % count ? 1 : 0);
}

void place_lane_extras(Lane &lane, uint32_t f)
{
    const _VELMRECT &a = lane.area;
    lane.vertScale = make_rect(a.right + 1 + (on(f, 0x80) ? 0 : 1), a.top, on(f, 0x8) ? 0 : 55, a.height);
    if (a.height > 50) {
        lane.buttons[1] = make_rect(a.right - 58, a.bottom - 5 - 40, 48, 40);
        lane.buttons[0] = make_rect(a.right - 58, a.top + 5, 48, 40);
    } else {
        const int32_t h = std::max(0, a.height / 2 - 2);
        const int32_t w = std::min(48, h * 6 / 5);
        lane.buttons[1] = make_rect(a.right - 10 - w, a.bottom - 1 - h, w, h);
        lane.buttons[0] = make_rect(a.right - 10 - w, a.top + 1, w, h);
    }
}

void assign_ranges(VELMDRAW d, Lane &lane)
{
    const VELMSTATE *s = d->state;
    lane.viewStart = static_cast<double>(s->viewBegin);
    lane.viewLength = std::max(1.0, static_cast<double>(s->viewEnd - s->viewBegin));
    lane.active = AUDIOSIGNAL_ChannelActive(d->document->signal, lane.channel) ? 1 : 0;
    const int32_t h = lane.area.height;
    if (lane.kind == VELMDRAW_LANE_WAVEFORM) {
        lane.rangeTop = s->vertMax;
        lane.rangeBottom = s->vertMin;
        const double extent = lane.rangeTop - lane.rangeBottom;
        lane.zeroRow = extent != 0.0 ? static_cast<int32_t>(std::lround(h + lane.rangeBottom * h / extent)) : h / 2;
    } else if (lane.kind == VELMDRAW_LANE_NAVIGATOR) {
        lane.rangeTop = 1.0;
        lane.rangeBottom = -1.0;
        lane.viewStart = 0.0;
        lane.viewLength = std::max<double>(1.0, static_cast<double>(AUDIOSIGNAL_NumSamples(d->document->signal)));
        lane.zeroRow = h / 2;
    } else {
        const double nyquist = AUDIOSIGNAL_SampleRate(d->document->signal) / 2.0;
        const double low = std::clamp(s->spectralMin, 0.0, nyquist);
        const double high = s->spectralMax > low ? std::min(s->spectralMax, nyquist) : nyquist;
        const bool mels = s->spectralScaleKind == 1;
        lane.nyquist = nyquist;
        lane.scaleTop = mels ? DSPBUTIL_Freq2Mels(nyquist) : nyquist;
        lane.rangeBottom = mels ? DSPBUTIL_Freq2Mels(low) : low;
        lane.rangeTop = mels ? DSPBUTIL_Freq2Mels(high) : high;
    }
}

} // namespace

namespace velm::view {

int32_t lanes_height_left(const _VELMDRAW *d)
{
    const uint32_t f = d->state->viewFlags;
    int n = 0;
    for (int i = 0; i < 2 * d->channels; ++i)
        if (d->lanes[static_cast<size_t>(i)].shown) ++n;
    int t = 0, track_heights = 0;
    for (int track = 0; track < VELM_MAX_CUSTOM_TRACKS; ++track)
        if (d->trackShown[static_cast<size_t>(track)]) {
            ++t;
            track_heights += d->trackAreas[static_cast<size_t>(track)].height;
        }
    const int32_t borders = (on(f, 0x80) ? 0 : 2 * n) + (on(f, 0x100) ? 0 : 4) + std::max(0, n - 1) +
                            (on(f, 0x4) || on(f, 0x80) ? 0 : 1);
    const int32_t tracks = t ? (on(f, 0x80) ? 0 : 2 * t - 1) + t + track_heights : 0;
    return d->frame.height - borders - tracks - (on(f, 0x4) ? 0 : 20);
}

} // namespace velm::view

int VELMDRAW_UpdateDrawAreas(VELMDRAW d, uint32_t)
{
    if (!d || !d->state || !d->document->signal) return 0;
    // Workers read the lanes being laid out.
    join_workers(d);
    VELMSTATE *s = d->state;
    if (s->viewEnd == s->viewBegin) {
        s->viewEnd += 1;
        BLDEBUG_Log(0, "(VELMDRAW)_AssignAudioZoomLimits: SampleEndView adjusted to avoid division by zero!");
    }
    const uint32_t f = s->viewFlags;
    const int32_t W = s->drawWidth, H = s->drawHeight;
    build_lanes(d);

    d->frame = on(f, 0x40) ? make_rect(0, 0, W, H) : make_rect(6, 6, W - 12, H - 12);

    // Navigator strip.
    d->navigatorPosition = on(f, 0x2000) ? 1 : on(f, 0x4000) ? 2 : 0;
    d->navigator = _VELMRECT{};
    const int32_t inset = (on(f, 0x80) ? 0 : 1) + (on(f, 0x100) ? 0 : 2);
    if (d->navigatorPosition) {
        const int32_t strip = s->navigatorHeight + (on(f, 0x80) ? 0 : 2) + (on(f, 0x100) ? 0 : 2);
        const int32_t width = d->frame.width - (on(f, 0x8000) ? 20 : 0);
        const int32_t top = d->navigatorPosition == 1 ? d->frame.top : d->frame.bottom - strip + 1;
        d->navigator = make_rect(d->frame.left, top, width, strip);
        d->frame = make_rect(d->frame.left, d->frame.top + (d->navigatorPosition == 1 ? strip : 0), d->frame.width,
                             d->frame.height - strip);
    }

    // View-kind buttons.
    if (on(f, 0x8000)) {
        d->frame = make_rect(d->frame.left, d->frame.top, d->frame.width - 20, d->frame.height);
        place_buttons(d, d->frame.right + 1, d->frame.top);
    } else {
        for (ViewButton &b : d->buttons) b = ViewButton{};
    }

    // Which lanes and custom tracks show.
    const bool navigator = d->navigatorPosition != 0;
    for (int i = 0; i < d->laneCount; ++i) {
        Lane &lane = d->lanes[static_cast<size_t>(i)];
        lane.shown = lane.kind == VELMDRAW_LANE_WAVEFORM      ? on(f, 0x1)
                     : lane.kind == VELMDRAW_LANE_SPECTROGRAM ? on(f, 0x2)
                                                              : navigator;
    }
    // Each lane has a one-pixel border (unless 0x80); neighbours are one
    // pixel apart besides, and that pixel is their separator.
    const int32_t border = on(f, 0x80) ? 0 : 1;
    const int32_t gap = border;
    const int32_t x = d->frame.left + inset;
    const int32_t width = d->frame.width - (on(f, 0x100) ? (on(f, 0x80) ? 0 : 2) : 4 + (on(f, 0x80) ? 0 : 2)) -
                          (on(f, 0x8) ? 0 : 55 + gap);
    for (int track = 0; track < VELM_MAX_CUSTOM_TRACKS; ++track) {
        const bool shown = !on(f, 0x800) && d->document->customTracks[track].inUse && s->tracks[track].visible;
        d->trackShown[static_cast<size_t>(track)] = shown;
        d->trackAreas[static_cast<size_t>(track)] =
            shown ? make_rect(x, 0, width, VELMDRAW_CustomTrackHeight(d, track)) : _VELMRECT{};
    }
    const int32_t height = lanes_height_left(d);

    // Lane heights: both kinds share by the wave height fraction.
    const bool waves = on(f, 0x1), spectra = on(f, 0x2);
    const int channels = d->channels;
    int32_t wave_total = 0, spectral_total = 0;
    if (waves && spectra) {
        wave_total = static_cast<int32_t>((height - 2) * s->waveHeightFraction);
        spectral_total = height - 2 - wave_total;
    } else {
        (waves ? wave_total : spectral_total) = height;
    }
    d->dividers.clear();
    d->separators.clear();
    d->trackSeparators.clear();
    int32_t top = d->frame.top + inset;
    const int32_t first_top = top;
    bool placed = false;
    for (int kind = 0; kind < 2; ++kind) {
        const bool shown = kind == 0 ? waves : spectra;
        if (!shown) continue;
        for (int c = 0; c < channels; ++c) {
            Lane &lane = d->lanes[static_cast<size_t>(kind * channels + c)];
            const int32_t h = std::max(0, share(kind == 0 ? wave_total : spectral_total, channels, c));
            if (placed) {
                const bool divider = kind == 1 && c == 0;
                const int32_t strip = divider ? gap + 2 : gap;
                top += border;
                if (strip > 0) (divider ? d->dividers : d->separators).add(make_rect(x, top, width, strip));
                top += strip + border;
            }
            lane.area = make_rect(x, top, width, h);
            place_lane_extras(lane, f);
            top += h;
            placed = true;
        }
    }
    d->lanesArea = make_rect(x, first_top, width, top - first_top);
    d->display = d->lanesArea;

    // Custom tracks follow the lanes.
    for (int track = 0; track < VELM_MAX_CUSTOM_TRACKS; ++track) {
        if (!d->trackShown[static_cast<size_t>(track)]) continue;
        top += border;
        d->trackSeparators.add(make_rect(x, top, width, 1));
        top += 1 + border;
        _VELMRECT &area = d->trackAreas[static_cast<size_t>(track)];
        area = make_rect(x, top, width, area.height);
        d->trackScales[static_cast<size_t>(track)] = make_rect(area.right + 1 + gap, top, on(f, 0x8) ? 0 : 55, area.height);
        top += area.height;
    }

    // Navigator lanes, stacked in the strip.
    for (int c = 0; c < channels; ++c) {
        Lane &lane = d->lanes[static_cast<size_t>(2 * channels + c)];
        if (!navigator) {
            lane.area = _VELMRECT{};
            continue;
        }
        const int32_t h = s->navigatorHeight / std::max(1, channels);
        lane.area = make_rect(x, d->navigator.top + inset + c * h, width, h);
    }

    d->horzScale = on(f, 0x4) ? _VELMRECT{} : make_rect(x, top + 2 * border + gap, width, 20);
    d->zoomButton = _VELMRECT{};
    if ((f & 0x140008u) == 0x40000u && navigator) {
        d->zoomButton = make_rect(x + width + 17, d->navigator.top + (d->navigator.height - 20) / 2, 20, 20);
        d->state->controls |= 0x1u;
    }
    if (on(f, 0x80000)) {
        d->sliders[0] = d->sliders[1] = _VELMRECT{};
    } else {
        d->sliders[0] = make_rect(d->display.left, d->display.top, 50, std::max(0, d->lanesArea.height - 1));
        d->sliders[1] = make_rect(d->display.right - 49, d->display.top, 50, std::max(0, d->lanesArea.height - 1));
    }

    d->columns = std::max(0, width);
    for (int i = 0; i < d->laneCount; ++i) assign_ranges(d, d->lanes[static_cast<size_t>(i)]);
    refresh_display_data(d, std::max(canvas_capacity(d), d->columns + 1));
    d->laidOut = 1;
    return 1;
}
