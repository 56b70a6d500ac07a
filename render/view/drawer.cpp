// The drawer's life cycle, its configuration and the size queries.
#include <algorithm>
#include <cmath>
#include <cstdio>
#include <new>

#include "control/velmcontrol.h"
#include "core/document_internal.hpp"
#include "render/view/drawer_internal.hpp"
#include "render/view/velmoverlays.h"

using namespace velm::view;

namespace velm::view {

_VELMRECT make_rect(int32_t left, int32_t top, int32_t width, int32_t height)
{
    return _VELMRECT{left, top, width, height, left + width - 1, top + height - 1};
}

void clear_rect(VELMCANVAS canvas, const _VELMRECT &rect)
{
    if (rect.width <= 0 || rect.height <= 0) return;
    VELMCANVAS_SetDrawArea(canvas, &rect);
    VELMCANVAS_Clear(canvas);
    VELMCANVAS_ClearDrawArea(canvas);
}

void draw_hline(VELMCANVAS canvas, int x1, int x2, int y)
{
    if (x2 >= x1) VELMCANVAS_FillRect(canvas, x1, y, x2 - x1 + 1, 1, 0);
}

void draw_vline(VELMCANVAS canvas, int x, int y1, int y2)
{
    if (y2 >= y1) VELMCANVAS_FillRect(canvas, x, y1, 1, y2 - y1 + 1, 0);
}

_VELMCANVASFONT canvas_font(const VELMCONFIGFONT &config)
{
    _VELMCANVASFONT font{};
    std::snprintf(font.name, sizeof font.name, "%s", config.familyName);
    font.size = config.size;
    font.style = static_cast<uint32_t>(config.properties);
    return font;
}

} // namespace velm::view

VELMDRAW VELMDRAW_Create(VELMAUDIO doc)
{
    if (!doc || !doc->signal) return nullptr;
    BLMEM pool = BLMEM_CreateMemDescrEx("VELMDRAW Memory", 0, 0);
    if (!pool) return nullptr;
    auto *drawer = new (std::nothrow) _VELMDRAW;
    BLMUTEX lock = MutexInit();
    if (!drawer || !lock) {
        delete drawer;
        if (lock) MutexDestroy(lock);
        BLMEM_DisposeMemDescr(pool);
        return nullptr;
    }
    drawer->pool = pool;
    drawer->lock = lock;
    drawer->document = doc;
    drawer->channels = std::min(AUDIOSIGNAL_NumChannels(doc->signal), VELMDRAW_MAX_CHANNELS);
    VELMCONFIG_InitDrawConfig(&drawer->config);
    VELMCONTROL_Reset(drawer);
    register_drawer(drawer);
    return drawer;
}

int VELMDRAW_Destroy(VELMDRAW drawer)
{
    if (!drawer) return 0;
    unregister_drawer(drawer);
    VELMCONTROL_Stop(drawer);
    join_workers(drawer);
    for (Lane &lane : drawer->lanes) {
        destroy_wave_data(drawer->pool, lane.wave);
        destroy_spectral_data(lane.spectral);
    }
    // The canvas belongs to the host: not touched.
    if (drawer->state) VELMSTATE_Destroy(drawer->state);
    MutexDestroy(drawer->lock);
    BLMEM_DisposeMemDescr(drawer->pool);
    delete drawer;
    return 1;
}

int VELMDRAW_UpdateConfig(VELMDRAW drawer)
{
    return drawer ? VELMCONFIG_GetDrawConfig(&drawer->config) : 0;
}

int64_t VELMDRAW_SizeInMemory(VELMDRAW drawer)
{
    if (!drawer) return 0;
    int64_t total = static_cast<int64_t>(sizeof(_VELMDRAW)) + BLMEM_SizeInMemory(drawer->pool);
    for (const Lane &lane : drawer->lanes)
        if (lane.spectral) total += BLMEM_SizeInMemory(lane.spectral->pool);
    return total;
}

int32_t VELMDRAW_MinDrawWidth(VELMDRAW drawer, const VELMSTATE *state)
{
    if (!drawer || !state) return 0;
    const uint32_t f = state->viewFlags;
    return 30 + (f & 0x8 ? 0 : 56) + (f & 0x80 ? 0 : 2) + (f & 0x100 ? 0 : 4) + (f & 0x10 ? 0 : 12);
}

int32_t VELMDRAW_MinDrawHeight(VELMDRAW drawer, const VELMSTATE *state)
{
    if (!drawer || !state) return 0;
    const uint32_t f = state->viewFlags;
    const int kinds = (f & 0x1 ? 1 : 0) + (f & 0x2 ? 1 : 0);
    int32_t height = 30 * kinds * drawer->channels + (f & 0x80 ? 0 : 2);
    if (f & 0x100)
        height += f & 0x10 ? 0 : 12;
    else
        height += f & 0x10 ? 4 : 16;
    height += f & 0x8 ? 0 : 21;
    if (!(f & 0x800)) {
        int shown = 0;
        for (int track = 0; track < VELM_MAX_CUSTOM_TRACKS; ++track) {
            if (!drawer->document->customTracks[track].inUse || !state->tracks[track].visible) continue;
            ++shown;
            height += VELMDRAW_CustomTrackHeight(drawer, track);
        }
        if (shown) height += f & 0x80 ? shown : 2 * shown - 1;
    }
    return height;
}

int64_t VELMDRAW_SamplesPerPixel(VELMDRAW drawer)
{
    if (!drawer || !drawer->state || drawer->mainBase.step <= 0.0) return -1;
    return std::max<int64_t>(1, static_cast<int64_t>(drawer->mainBase.step));
}

int VELMDRAW_ChannelKind(VELMDRAW drawer, int lane)
{
    if (!drawer || lane < 0 || lane >= drawer->laneCount) return 0;
    return drawer->lanes[static_cast<size_t>(lane)].kind;
}

int VELMDRAW_ChannelNumber(VELMDRAW drawer, int lane)
{
    if (!drawer || lane < 0 || lane >= drawer->laneCount) return -1;
    return drawer->lanes[static_cast<size_t>(lane)].channel;
}

int VELMDRAW_ConvertAreaXtoCanvasX(VELMDRAW drawer, int x)
{
    return drawer ? x + drawer->display.left : 0;
}

int VELMDRAW_ConvertCanvasXtoAreaX(VELMDRAW drawer, int x)
{
    return drawer ? x - drawer->display.left : 0;
}

int VELMDRAW_ConvertCanvasYtoAreaY(VELMDRAW drawer, int y)
{
    return drawer ? y - drawer->display.top : 0;
}

int VELMDRAW_GetDrawAreaRect(VELMDRAW drawer, int area, _VELMRECT *out)
{
    if (!drawer || !out || !drawer->laidOut) return 0;
    if (area >= 0 && area < drawer->laneCount) {
        *out = drawer->lanes[static_cast<size_t>(area)].area;
        return 1;
    }
    switch (area) {
    case VELMDRAW_AREA_FRAME: *out = drawer->frame; return 1;
    case VELMDRAW_AREA_DISPLAY: *out = drawer->display; return 1;
    case VELMDRAW_AREA_NAVIGATOR: *out = drawer->navigator; return 1;
    case VELMDRAW_AREA_HORZSCALE: *out = drawer->horzScale; return 1;
    default: return 0;
    }
}

uint32_t VELMDRAW_SelectBGColor(VELMDRAW drawer)
{
    if (!drawer || !drawer->state) return 0;
    const uint32_t f = drawer->state->viewFlags;
    const VELMDRAWCONFIG &c = drawer->config;
    if (!(f & 0x10)) return c.windowBgColor;
    if (!(f & 0x100)) return c.outerBorderColor;
    return f & 0x80 ? c.scaleBgBrush : c.windowBgColor;
}

int32_t VELMDRAW_CustomTrackHeight(VELMDRAW drawer, int track)
{
    if (!drawer || !drawer->canvas || !drawer->state || track < 0 || track >= VELM_MAX_CUSTOM_TRACKS) return 0;
    const VELMTRACKDISPLAY &t = drawer->state->tracks[track];
    VELMCONFIGFONT config;
    const _VELMCANVASFONT font = canvas_font(*VELMDRAW_GetCustomTrackFont(drawer, track, &config));
    VELMCANVAS_SelectFont(drawer->canvas, &font);
    const int text = VELMCANVAS_TextHeight(drawer->canvas, "\xE5pple");
    return std::max(static_cast<int32_t>((0.5 + t.lineCount) * text), t.minimumHeight);
}

double VELMDRAW_ConvertWaveHeightToPerc(VELMDRAW drawer, int32_t height)
{
    if (!drawer || !drawer->laidOut) return -1.0;
    const int32_t total = lanes_height_left(drawer) - 2;
    return total > 0 ? static_cast<double>(height) / total : -1.0;
}

int32_t VELMDRAW_ConvertWavePercToHeight(VELMDRAW drawer, double fraction)
{
    if (!drawer || !drawer->laidOut) return -1;
    return static_cast<int32_t>(std::max(0, lanes_height_left(drawer) - 2) * fraction);
}
