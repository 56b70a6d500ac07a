/* Mouse and key interaction: hover kinds, selection drag, pan, resets. */
#include <cstdint>

#include "widgets/graph/graph_internal.h"

namespace {

/* Refuses re-entrant calls (an event handler calling back into the graph). */
class BusyGuard {
  public:
    explicit BusyGuard(VELMGRAPHDRAW d) : d_(d), ok_(d && !d->busy)
    {
        if (ok_) d_->busy = true;
    }
    ~BusyGuard()
    {
        if (ok_) d_->busy = false;
    }
    explicit operator bool() const { return ok_; }

  private:
    VELMGRAPHDRAW d_;
    bool ok_;
};

void *word(int v) { return reinterpret_cast<void *>(static_cast<intptr_t>(v)); }

/* The left scale column and the right margin strip are the vertical scale
 * areas; the strip above the plot and the scale row below are the horizontal ones. */
int hit_test(const _VELMGRAPHDRAW *d, int x, int y)
{
    if (x < 0 || y < 0 || x >= d->width || y >= d->height) return VELMGRAPH_OVER_NONE;
    const bool rows = y >= d->top && y <= d->bottom;
    const bool cols = x >= d->left && x <= d->right;
    if (rows && x >= d->left - d->vScaleWidth && x < d->left) return VELMGRAPH_OVER_VSCALE_LEFT;
    if (rows && x > d->right) return VELMGRAPH_OVER_VSCALE_RIGHT;
    if (cols && y < d->top) return VELMGRAPH_OVER_HSCALE_TOP;
    if (cols && y > d->bottom && y <= d->bottom + d->hScaleHeight) return VELMGRAPH_OVER_HSCALE_BOTTOM;
    if (rows && cols) return VELMGRAPH_OVER_PLOT;
    return VELMGRAPH_OVER_WIDGET;
}

bool is_hscale(int kind) { return (kind & 0x110) == 0x110; }
bool is_vscale(int kind) { return (kind & 0x120) == 0x120; }

void update_hover(VELMGRAPHDRAW d, int x, int y)
{
    const int kind = hit_test(d, x, y);
    if (kind != d->overKind) {
        d->overKind = kind;
        if (d->drag == _VELMGRAPHDRAW::NONE && !d->hoverStopped)
            BLNOTIFY_SendEvent(d->graph->dispatcher, nullptr, 0, VELMGRAPH_EVENT_MOUSEOVER, word(kind), word(d->keys));
    }
    if (kind == VELMGRAPH_OVER_PLOT) {
        VELMGRAPH_PositionTrackVisible(d->graph, 1);
        VELMGRAPH_UpdatePositionTrack(d->graph, x, y);
    } else if (d->graph->state.trackVisible) {
        VELMGRAPH_PositionTrackVisible(d->graph, 0);
    }
}

} // namespace

extern "C" {

int VELMGRAPHCONTROL_MousePositionUpdated(VELMGRAPHDRAW d, int x, int y)
{
    BusyGuard guard(d);
    if (!guard) return 0;
    update_hover(d, x, y);
    return 1;
}

int VELMGRAPHCONTROL_MouseDown(VELMGRAPHDRAW d, int x, int y, int buttons)
{
    BusyGuard guard(d);
    if (!guard) return 0;
    d->overKind = hit_test(d, x, y);
    d->hoverStopped = true;
    BLNOTIFY_SendEvent(d->graph->dispatcher, nullptr, 0, VELMGRAPH_EVENT_MOUSEDOWN, word(d->overKind), word(buttons));
    const int kind = d->overKind;
    if (kind == VELMGRAPH_OVER_PLOT || is_hscale(kind)) d->anchorX = graph_display_to_real_x(d, x);
    if (kind == VELMGRAPH_OVER_PLOT || is_vscale(kind)) d->anchorY = graph_display_to_real_y(d, y);
    if (buttons & VELMGRAPH_BUTTON_LEFT) {
        if (kind == VELMGRAPH_OVER_PLOT)
            d->drag = d->panKey ? _VELMGRAPHDRAW::PAN_XY : _VELMGRAPHDRAW::SELECT;
        else if (is_hscale(kind))
            d->drag = _VELMGRAPHDRAW::PAN_X;
        else if (is_vscale(kind))
            d->drag = _VELMGRAPHDRAW::PAN_Y;
    }
    return 1;
}

int VELMGRAPHCONTROL_MouseMove(VELMGRAPHDRAW d, int x, int y, int)
{
    BusyGuard guard(d);
    if (!guard) return 0;
    update_hover(d, x, y);
    const double rx = graph_display_to_real_x(d, x), ry = graph_display_to_real_y(d, y);
    switch (d->drag) {
    case _VELMGRAPHDRAW::SELECT:
        VELMGRAPH_UpdateSelection(d->graph, d->anchorX, rx, d->anchorY, ry);
        break;
    case _VELMGRAPHDRAW::PAN_XY:
    case _VELMGRAPHDRAW::PAN_X:
    case _VELMGRAPHDRAW::PAN_Y: {
        const bool panX = d->drag != _VELMGRAPHDRAW::PAN_Y, panY = d->drag != _VELMGRAPHDRAW::PAN_X;
        VELMGRAPH_Offset(d->graph, panX ? d->anchorX - rx : 0.0, panY ? d->anchorY - ry : 0.0);
        /* The view moved under the mouse: its new real position is the anchor. */
        d->anchorX = graph_display_to_real_x(d, x);
        d->anchorY = graph_display_to_real_y(d, y);
        break;
    }
    case _VELMGRAPHDRAW::NONE:
        break;
    }
    return 1;
}

int VELMGRAPHCONTROL_MouseUp(VELMGRAPHDRAW d, int, int, int)
{
    BusyGuard guard(d);
    if (!guard) return 0;
    if (d->drag == _VELMGRAPHDRAW::SELECT) {
        VELMGRAPH_ZoomSelection(d->graph);
        VELMGRAPH_ClearSelection(d->graph);
    }
    d->hoverStopped = false;
    d->drag = _VELMGRAPHDRAW::NONE;
    return 1;
}

int VELMGRAPHCONTROL_MouseDblClick(VELMGRAPHDRAW d, int x, int y, int)
{
    BusyGuard guard(d);
    if (!guard) return 0;
    const int kind = hit_test(d, x, y);
    if (is_vscale(kind))
        VELMGRAPH_ResetZoomVert(d->graph);
    else if (is_hscale(kind))
        VELMGRAPH_ResetZoomHorz(d->graph);
    else if (kind == VELMGRAPH_OVER_PLOT)
        VELMGRAPH_ResetZoom(d->graph);
    return 1;
}

/* The wheel has no meaning on this widget. */
int VELMGRAPHCONTROL_MouseWheel(VELMGRAPHDRAW d, int, int, int) { return d && !d->busy ? 1 : 0; }
int VELMGRAPHCONTROL_MouseHWheel(VELMGRAPHDRAW d, int, int, int) { return d && !d->busy ? 1 : 0; }

int VELMGRAPHCONTROL_AccKeyDown(VELMGRAPHDRAW d, int keys)
{
    BusyGuard guard(d);
    if (!guard) return 0;
    d->keys |= keys;
    if (keys & VELMGRAPH_KEY_TRACK) VELMGRAPH_EnablePositionTrack(d->graph);
    if (keys & VELMGRAPH_KEY_PAN) {
        d->panKey = true;
        BLNOTIFY_SendEvent(d->graph->dispatcher, nullptr, 0, VELMGRAPH_EVENT_MOUSEOVER, word(d->overKind), word(d->keys));
    }
    return 1;
}

int VELMGRAPHCONTROL_AccKeyUp(VELMGRAPHDRAW d, int keys)
{
    BusyGuard guard(d);
    if (!guard) return 0;
    d->keys &= ~keys;
    if (keys & VELMGRAPH_KEY_TRACK) VELMGRAPH_DisablePositionTrack(d->graph);
    if (keys & VELMGRAPH_KEY_PAN) {
        d->panKey = false;
        BLNOTIFY_SendEvent(d->graph->dispatcher, nullptr, 0, VELMGRAPH_EVENT_MOUSEOVER, word(d->overKind), word(d->keys));
    }
    return 1;
}

} // extern "C"

int VELMGRAPH_MouseMove(VELMGRAPH g, int x, int y, int b) { return g ? VELMGRAPHCONTROL_MouseMove(g->drawer, x, y, b) : 0; }
int VELMGRAPH_MouseDown(VELMGRAPH g, int x, int y, int b) { return g ? VELMGRAPHCONTROL_MouseDown(g->drawer, x, y, b) : 0; }
int VELMGRAPH_MouseUp(VELMGRAPH g, int x, int y, int b) { return g ? VELMGRAPHCONTROL_MouseUp(g->drawer, x, y, b) : 0; }
int VELMGRAPH_MouseWheel(VELMGRAPH g, int x, int y, int d) { return g ? VELMGRAPHCONTROL_MouseWheel(g->drawer, x, y, d) : 0; }
int VELMGRAPH_MouseHWheel(VELMGRAPH g, int x, int y, int d) { return g ? VELMGRAPHCONTROL_MouseHWheel(g->drawer, x, y, d) : 0; }
int VELMGRAPH_MouseDblClick(VELMGRAPH g, int x, int y, int b) { return g ? VELMGRAPHCONTROL_MouseDblClick(g->drawer, x, y, b) : 0; }
int VELMGRAPH_AccKeyDown(VELMGRAPH g, int keys) { return g ? VELMGRAPHCONTROL_AccKeyDown(g->drawer, keys) : 0; }
int VELMGRAPH_AccKeyUp(VELMGRAPH g, int keys) { return g ? VELMGRAPHCONTROL_AccKeyUp(g->drawer, keys) : 0; }
