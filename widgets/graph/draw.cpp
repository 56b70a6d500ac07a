/* Drawing the graph: settings, layout, background, scales, data and overlays. */
#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <vector>

#include "widgets/graph/graph_internal.h"

namespace {

constexpr int kColorSlots = 4;
constexpr double kTickSpacing = 40.0;
const uint32_t kContour[kColorSlots] = {0x000098EC, 0x0000EC98, 0x00EC0098, 0x00EC9800};
const uint32_t kFill[kColorSlots] = {0xA00098EC, 0xA000EC98, 0xA0EC0098, 0xA0EC9800};

struct FontSetting {
    const char *name;
    const char *family;
    int properties;
    uint32_t color, inactive;
    int size;
};
const FontSetting kFonts[] = {{"titlefont", "Arial", 0, 0x00FFFFFF, 0x00A0A0A0, 16},
                              {"scalefont", "Arial", 128, 0x00A0A0A0, 0x00A0A0A0, 7},
                              {"trackfont", "Arial", 0, 0, 0, 7}};

struct Settings {
    uint32_t bg, gradStart, gradEnd, scale, grid, track, contour[kColorSlots], fill[kColorSlots];
    int margin, top, left, right, bottom, vScaleWidth, hScaleHeight;
    _VELMCANVASFONT title, scaleFont, trackFont;
};

uint32_t color_setting(const char *key)
{
    return static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.velmgraph.%s=[0x%08X]", key, 0));
}

_VELMCANVASFONT font_setting(const char *name)
{
    _VELMCANVASFONT font{};
    const char *family = BLSETTINGS_GetStringEx(nullptr, "libvelm.velmgraph.%s.familyname=[%s]", name, "");
    std::snprintf(font.name, sizeof font.name, "%s", family ? family : "");
    font.size = static_cast<float>(BLSETTINGS_GetIntEx(nullptr, "libvelm.velmgraph.%s.Size=[%d]", name, 0));
    font.style = static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.velmgraph.%s.Properties=[%d]", name, 0));
    const uint32_t c =
        static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.velmgraph.%s.Color=[0x%08X]", name, 0));
    font.color[0] = c & 0xFF;
    font.color[1] = (c >> 8) & 0xFF;
    font.color[2] = (c >> 16) & 0xFF;
    return font;
}

Settings read_settings()
{
    Settings s{};
    s.bg = color_setting("graphbgcolor");
    s.gradStart = color_setting("bgstartgradient");
    s.gradEnd = color_setting("bgendgradient");
    s.scale = color_setting("scalecolor");
    s.grid = color_setting("gridcolor");
    s.track = color_setting("gridpositiontrackcolor");
    char key[64];
    for (int i = 0; i < kColorSlots; ++i) {
        std::snprintf(key, sizeof key, "countourcolor.%d", i);
        s.contour[i] = color_setting(key);
        std::snprintf(key, sizeof key, "fillcolor.%d", i);
        s.fill[i] = color_setting(key);
    }
    /* Negative sizes from a damaged settings file would turn the layout inside out. */
    auto size = [](const char *k, int fallback) {
        return std::clamp(BLSETTINGS_GetIntEx(nullptr, "libvelm.velmgraph.%s=[%d]", k, fallback), 0, 1000);
    };
    s.margin = size("margin", 0);
    s.top = size("topmargin", s.margin);
    s.left = size("leftmargin", s.margin);
    s.right = size("rightpmargin", s.margin);
    s.bottom = size("bottommargin", s.margin);
    s.vScaleWidth = size("vertscalewidth", 0);
    s.hScaleHeight = size("horzscaleheight", 0);
    s.title = font_setting("titlefont");
    s.scaleFont = font_setting("scalefont");
    s.trackFont = font_setting("trackfont");
    return s;
}

double first_tick(double from, double step) { return std::ceil(from / step) * step; }

void draw_scales(_VELMGRAPHDRAW *d, const VELMGRAPHSTATE &st, const Settings &s, VELMCANVAS canvas)
{
    char text[48];
    VELMCANVAS_SelectFont(canvas, &s.scaleFont);
    const double xStep = VELMGRAPHDRAW_TickStep(d->right - d->left + 1, st.viewXMax - st.viewXMin);
    if (xStep > 0) {
        for (double v = first_tick(st.viewXMin, xStep); v <= st.viewXMax + xStep * 1e-9; v += xStep) {
            const int px = graph_real_to_display_x(d, v);
            VELMCANVAS_SelectColor(canvas, s.grid);
            VELMCANVAS_DrawLine(canvas, px, d->top, px, d->bottom);
            VELMCANVAS_SelectColor(canvas, s.scale);
            VELMCANVAS_DrawLine(canvas, px, d->bottom + 1, px, d->bottom + 4);
            std::snprintf(text, sizeof text, "%.*f%s", st.xDecimals, v, st.xUnit);
            VELMCANVAS_TextOut(canvas, px - VELMCANVAS_TextWidth(canvas, text) / 2, d->bottom + 5, text);
        }
    }
    const double yStep = VELMGRAPHDRAW_TickStep(d->bottom - d->top + 1, st.viewYMax - st.viewYMin);
    if (yStep > 0) {
        for (double v = first_tick(st.viewYMin, yStep); v <= st.viewYMax + yStep * 1e-9; v += yStep) {
            const int py = graph_real_to_display_y(d, v);
            VELMCANVAS_SelectColor(canvas, s.grid);
            VELMCANVAS_DrawLine(canvas, d->left, py, d->right, py);
            VELMCANVAS_SelectColor(canvas, s.scale);
            VELMCANVAS_DrawLine(canvas, d->left - 4, py, d->left - 1, py);
            std::snprintf(text, sizeof text, "%.*f%s", st.yDecimals, v, st.yUnit);
            VELMCANVAS_TextOut(canvas, d->left - 6 - VELMCANVAS_TextWidth(canvas, text),
                               py - VELMCANVAS_TextHeight(canvas, text) / 2, text);
        }
    }
    VELMCANVAS_SelectColor(canvas, s.scale);
    VELMCANVAS_BorderRect(canvas, d->left - 1, d->top - 1, d->right - d->left + 3, d->bottom - d->top + 3, 0);
}

void draw_data(_VELMGRAPHDRAW *d, const VELMGRAPHSTATE &st, const Settings &s, VELMCANVAS canvas)
{
    const int columns = d->right - d->left + 1;
    std::vector<float> xs(columns), ys(columns);
    /* The canvas fills an envelope: the curve left to right, then the
     * baseline below the plot back from right to left. */
    std::vector<int> px(2 * columns), py(2 * columns);
    int slot = 0;
    for (const auto &set : d->graph->sets) {
        if (set->kind != VELMGRAPH_KIND_REAL || set->count < 1) continue;
        /* One sample per column: the window spans the view plus one column's worth. */
        const double span = (st.viewXMax - st.viewXMin) * columns / std::max(columns - 1, 1);
        if (!VELMGRAPH_ExtractDataWindow(d->graph, set->id, st.viewXMin, st.viewXMin + span, xs.data(), ys.data(),
                                         columns))
            continue;
        for (int i = 0; i < columns; ++i) {
            px[i] = d->left + i;
            py[i] = std::clamp(graph_real_to_display_y(d, ys[i]), d->top, d->bottom + 1);
            px[2 * columns - 1 - i] = d->left + i;
            py[2 * columns - 1 - i] = d->bottom + 1;
        }
        VELMCANVAS_SelectColor(canvas, s.contour[slot]);
        VELMCANVAS_DrawPolygon(canvas, px.data(), py.data(), 2 * columns, s.fill[slot]);
        VELMCANVAS_DrawPolyline(canvas, px.data(), py.data(), columns);
        slot = (slot + 1) % kColorSlots;
    }
}

void draw_overlays(_VELMGRAPHDRAW *d, const VELMGRAPHSTATE &st, const Settings &s, VELMCANVAS canvas)
{
    const double *sel = st.selection;
    if (sel[2] - sel[0] != 0 || sel[3] - sel[1] != 0) {
        const int x0 = graph_real_to_display_x(d, sel[0]), x1 = graph_real_to_display_x(d, sel[2]);
        const int y0 = graph_real_to_display_y(d, sel[3]), y1 = graph_real_to_display_y(d, sel[1]);
        VELMCANVAS_SelectColor(canvas, s.track);
        const float previous = VELMCANVAS_SetAlphaFactor(canvas, 0.25f);
        VELMCANVAS_FillRect(canvas, x0, y0, x1 - x0 + 1, y1 - y0 + 1, 0);
        VELMCANVAS_SetAlphaFactor(canvas, previous);
        VELMCANVAS_BorderRect(canvas, x0, y0, x1 - x0 + 1, y1 - y0 + 1, 0);
    }
    if (st.trackEnabled && st.trackVisible && st.trackX >= d->left && st.trackX <= d->right &&
        st.trackY >= d->top && st.trackY <= d->bottom) {
        VELMCANVAS_SelectColor(canvas, s.track);
        VELMCANVAS_DrawLine(canvas, st.trackX, d->top, st.trackX, d->bottom);
        VELMCANVAS_DrawLine(canvas, d->left, st.trackY, d->right, st.trackY);
        char label[16];
        VELMCANVAS_SelectFont(canvas, &s.trackFont);
        std::snprintf(label, sizeof label, "%3.*f %s", st.xDecimals, graph_display_to_real_x(d, st.trackX), st.xUnit);
        int w = VELMCANVAS_TextWidth(canvas, label), h = VELMCANVAS_TextHeight(canvas, label);
        VELMCANVAS_FillRect(canvas, st.trackX + 2, d->bottom - h - 2, w + 4, h + 2, 0);
        VELMCANVAS_TextOut(canvas, st.trackX + 4, d->bottom - h - 1, label);
        std::snprintf(label, sizeof label, "%3.*f %s", st.yDecimals, graph_display_to_real_y(d, st.trackY), st.yUnit);
        w = VELMCANVAS_TextWidth(canvas, label);
        VELMCANVAS_FillRect(canvas, d->left + 2, st.trackY - h - 2, w + 4, h + 2, 0);
        VELMCANVAS_TextOut(canvas, d->left + 4, st.trackY - h - 1, label);
    }
}

} // namespace

int VELMGRAPHDRAW_SetDefaultSettings(void)
{
    auto def = [](const char *key, uint32_t v) {
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.%s=0x%08X", key, v);
    };
    def("graphbgcolor", 0x00000000);
    def("bgstartgradient", 0x00303000);
    def("bgendgradient", 0x00101000);
    def("scalecolor", 0x00A0A0A0);
    def("gridcolor", 0x00303030);
    def("gridpositiontrackcolor", 0x00F0F0F0);
    for (int i = 0; i < kColorSlots; ++i) {
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.countourcolor.%d=0x%08X", i, kContour[i]);
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.fillcolor.%d=0x%08X", i, kFill[i]);
    }
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.margin=%d", 5);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.topmargin=%d", 5);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.vertscalewidth=%d", 40);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.horzscaleheight=%d", 20);
    for (const FontSetting &f : kFonts) {
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.%s.familyname=%s", f.name, f.family);
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.%s.Properties=%d", f.name, f.properties);
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.%s.Color=0x%08X", f.name, f.color);
        if (std::strcmp(f.name, "scalefont") == 0)
            BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.scalefont.InactiveColor=[0x%08X]", f.inactive);
        else
            BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.%s.InactiveColor=0x%08X", f.name, f.inactive);
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.velmgraph.%s.Size=%d", f.name, f.size);
    }
    return 1;
}

double VELMGRAPHDRAW_TickStep(int pixels, double width)
{
    if (pixels <= 0 || !(width > 0) || !std::isfinite(width)) return 0;
    const double p = pixels / width;
    double m = 1;
    if (std::fabs(p - kTickSpacing) < kTickSpacing) {
        /* Bounded: beyond 1e30 the spacing can no longer be near 40 pixels. */
        for (m = 10; m < 1e30 && std::fabs(p * m - kTickSpacing) < kTickSpacing; m *= 10) {
        }
    }
    static const double kFactors[] = {1, 0.5, 0.25, 0.2, 0.1, 0.05, 0.025, 0.01, 0.005, 0.0025, 0.002, 0.001};
    double best = m, bestDistance = INFINITY;
    for (double f : kFactors) {
        const double distance = std::fabs(p * m * f - kTickSpacing);
        if (distance < bestDistance) best = m * f, bestDistance = distance;
    }
    return best;
}

VELMGRAPHDRAW VELMGRAPHDRAW_Create(VELMGRAPH graph)
{
    if (!graph) return nullptr;
    if (!graph->drawer) {
        graph->drawer = new _VELMGRAPHDRAW;
        graph->drawer->graph = graph;
    }
    return graph->drawer;
}

void graph_destroy_drawer(VELMGRAPHDRAW drawer)
{
    delete drawer;
}

int VELMGRAPHDRAW_Update(VELMGRAPHDRAW d, VELMGRAPHSTATE *st, VELMCANVAS canvas)
{
    if (!d || !st || !canvas) return 0;
    int width = 0, height = 0;
    if (!VELMCANVAS_GetDimension(canvas, &width, &height) || width <= 0 || height <= 0) return 0;
    const Settings s = read_settings();
    VELMCANVAS_SelectFont(canvas, &s.title);
    const int titleHeight =
        (st->flags & VELMGRAPHSTATE_FLAG_TITLE) ? VELMCANVAS_TextHeight(canvas, st->title) + 2 : 0;
    d->width = width;
    d->height = height;
    d->vScaleWidth = s.vScaleWidth;
    d->hScaleHeight = s.hScaleHeight;
    d->left = s.left + s.vScaleWidth;
    d->top = s.top + titleHeight;
    d->right = width - 1 - s.right;
    d->bottom = height - 1 - s.bottom - s.hScaleHeight;
    st->changed = 0;

    VELMCANVAS_SelectColor(canvas, s.bg);
    VELMCANVAS_FillRect(canvas, 0, 0, width, height, 0);
    if (d->right <= d->left || d->bottom <= d->top) return 1; /* too small for a plot */
    VELMCANVAS_SelectGradient(canvas, s.gradStart, s.gradEnd);
    VELMCANVAS_FillVertGradientRect(canvas, d->left, d->top, d->right - d->left + 1, d->bottom - d->top + 1, 0);
    if (titleHeight) {
        VELMCANVAS_SelectFont(canvas, &s.title);
        VELMCANVAS_TextOut(canvas, (width - VELMCANVAS_TextWidth(canvas, st->title)) / 2, s.top, st->title);
    }
    draw_scales(d, *st, s, canvas);
    draw_data(d, *st, s, canvas);
    draw_overlays(d, *st, s, canvas);
    return 1;
}

/* Pixel and real coordinates of the plot area; a view of zero width maps
 * everything onto its left (or bottom) edge instead of dividing by zero. */
double graph_display_to_real_x(const _VELMGRAPHDRAW *d, int column)
{
    const VELMGRAPHSTATE &st = d->graph->state;
    const int span = std::max(d->right - d->left, 1);
    return st.viewXMin + (st.viewXMax - st.viewXMin) * (column - d->left) / span;
}

double graph_display_to_real_y(const _VELMGRAPHDRAW *d, int row)
{
    const VELMGRAPHSTATE &st = d->graph->state;
    const int span = std::max(d->bottom - d->top, 1);
    return st.viewYMin + (st.viewYMax - st.viewYMin) * (d->bottom - row) / span;
}

namespace {
int to_pixel(double v)
{
    if (std::isnan(v)) return 0;
    return static_cast<int>(std::lround(std::clamp(v, -1e6, 1e6)));
}
} // namespace

int graph_real_to_display_x(const _VELMGRAPHDRAW *d, double x)
{
    const VELMGRAPHSTATE &st = d->graph->state;
    const double w = st.viewXMax - st.viewXMin;
    if (!(w > 0)) return d->left;
    return to_pixel(d->left + (x - st.viewXMin) * (d->right - d->left) / w);
}

int graph_real_to_display_y(const _VELMGRAPHDRAW *d, double y)
{
    const VELMGRAPHSTATE &st = d->graph->state;
    const double h = st.viewYMax - st.viewYMin;
    if (!(h > 0)) return d->bottom;
    return to_pixel(d->bottom - (y - st.viewYMin) * (d->bottom - d->top) / h);
}

int VELMGRAPH_Draw(VELMCANVAS canvas, VELMGRAPH graph)
{
    if (!canvas || !graph) return 0;
    VELMGRAPHDRAW drawer = VELMGRAPHDRAW_Create(graph);
    graph_recompute_full_ranges(graph);
    return VELMGRAPHDRAW_Update(drawer, &graph->state, canvas);
}

int VELMGRAPH_RedrawNeeded(void) { return 1; }
