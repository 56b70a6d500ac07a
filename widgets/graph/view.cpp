/* The visible window: zoom, pan, selection and the position track. */
#include <algorithm>
#include <cmath>

#include "widgets/graph/graph_internal.h"

namespace {

struct Axis {
    double *viewMin, *viewMax, *fullMin, *fullMax;
};

Axis axis_of(VELMGRAPH graph, int axis)
{
    VELMGRAPHSTATE &s = graph->state;
    return axis == 0 ? Axis{&s.viewXMin, &s.viewXMax, &s.fullXMin, &s.fullXMax}
                     : Axis{&s.viewYMin, &s.viewYMax, &s.fullYMin, &s.fullYMax};
}

void recompute_full(VELMGRAPH graph, int axis)
{
    Axis a = axis_of(graph, axis);
    const double dataMin = axis == 0 ? graph->minX : graph->minY;
    const double dataMax = axis == 0 ? graph->maxX : graph->maxY;
    const double margin = axis == 0 ? graph->state.xMargin : graph->state.yMargin;
    double lo = *a.fullMin, hi = *a.fullMax;
    if (graph->autoScale[axis] && dataMin <= dataMax) {
        lo = dataMin - margin;
        hi = dataMax + margin;
    }
    if (lo > hi) std::swap(lo, hi);
    const GraphAxisLimits &hard = graph->hard[axis];
    *a.fullMin = std::clamp(lo, hard.min, hard.max);
    *a.fullMax = std::clamp(hi, hard.min, hard.max);
}

void clamp_view(VELMGRAPH graph, int axis)
{
    Axis a = axis_of(graph, axis);
    *a.viewMin = std::max(*a.viewMin, *a.fullMin);
    *a.viewMax = std::min(*a.viewMax, *a.fullMax);
}

int zoom_axis(VELMGRAPH graph, int axis, double p, double q)
{
    if (!graph || std::isnan(p) || std::isnan(q)) return 0;
    Axis a = axis_of(graph, axis);
    const double lo = std::min(p, q), hi = std::max(p, q);
    if (lo == *a.viewMin && hi == *a.viewMax) return 1;
    graph->state.changed = 1;
    *a.viewMin = std::clamp(lo, *a.fullMin, *a.fullMax);
    *a.viewMax = std::clamp(hi, *a.fullMin, *a.fullMax);
    return 1;
}

int reset_axis(VELMGRAPH graph, int axis)
{
    if (!graph) return 0;
    recompute_full(graph, axis);
    Axis a = axis_of(graph, axis);
    *a.viewMin = *a.fullMin;
    *a.viewMax = *a.fullMax;
    graph->state.changed = 1;
    return 1;
}

void offset_axis(VELMGRAPH graph, int axis, double delta)
{
    Axis a = axis_of(graph, axis);
    const double width = *a.viewMax - *a.viewMin;
    double lo = *a.viewMin + delta;
    if (lo < *a.fullMin)
        lo = *a.fullMin;
    else if (lo + width > *a.fullMax)
        lo = *a.fullMax - width;
    *a.viewMin = lo;
    *a.viewMax = lo + width;
}

} // namespace

void graph_recompute_full_ranges(VELMGRAPH graph)
{
    for (int axis = 0; axis < 2; ++axis) {
        recompute_full(graph, axis);
        clamp_view(graph, axis);
    }
}

int VELMGRAPH_ZoomHorz(VELMGRAPH graph, double a, double b) { return zoom_axis(graph, 0, a, b); }
int VELMGRAPH_ZoomVert(VELMGRAPH graph, double a, double b) { return zoom_axis(graph, 1, a, b); }

int VELMGRAPH_Zoom(VELMGRAPH graph, double xa, double xb, double ya, double yb)
{
    return VELMGRAPH_ZoomVert(graph, ya, yb) && VELMGRAPH_ZoomHorz(graph, xa, xb);
}

int VELMGRAPH_ZoomSelection(VELMGRAPH graph)
{
    if (!graph) return 0;
    const double *s = graph->state.selection;
    if (s[2] - s[0] == 0 || s[3] - s[1] == 0) return 0;
    return VELMGRAPH_Zoom(graph, s[0], s[2], s[1], s[3]);
}

int VELMGRAPH_ResetZoomHorz(VELMGRAPH graph) { return reset_axis(graph, 0); }
int VELMGRAPH_ResetZoomVert(VELMGRAPH graph) { return reset_axis(graph, 1); }
int VELMGRAPH_ResetZoom(VELMGRAPH graph) { return reset_axis(graph, 0) && reset_axis(graph, 1); }

int VELMGRAPH_Offset(VELMGRAPH graph, double dx, double dy)
{
    if (!graph || !std::isfinite(dx) || !std::isfinite(dy)) return 0;
    offset_axis(graph, 0, dx);
    offset_axis(graph, 1, dy);
    graph->state.changed = 1;
    return 1;
}

int VELMGRAPH_UpdateSelection(VELMGRAPH graph, double xa, double xb, double ya, double yb)
{
    if (!graph || std::isnan(xa) || std::isnan(xb) || std::isnan(ya) || std::isnan(yb)) return 0;
    VELMGRAPHSTATE &s = graph->state;
    s.selection[0] = std::clamp(std::min(xa, xb), s.viewXMin, std::max(s.viewXMin, s.viewXMax));
    s.selection[2] = std::clamp(std::max(xa, xb), s.viewXMin, std::max(s.viewXMin, s.viewXMax));
    s.selection[1] = std::clamp(std::min(ya, yb), s.viewYMin, std::max(s.viewYMin, s.viewYMax));
    s.selection[3] = std::clamp(std::max(ya, yb), s.viewYMin, std::max(s.viewYMin, s.viewYMax));
    s.changed = 1;
    return 1;
}

int VELMGRAPH_ClearSelection(VELMGRAPH graph)
{
    if (!graph) return 0;
    std::fill(std::begin(graph->state.selection), std::end(graph->state.selection), 0.0);
    graph->state.changed = 1;
    return 1;
}

int VELMGRAPH_EnablePositionTrack(VELMGRAPH graph)
{
    if (!graph) return 0;
    graph->state.trackEnabled = 1;
    graph->state.changed = 1;
    return 1;
}

int VELMGRAPH_DisablePositionTrack(VELMGRAPH graph)
{
    if (!graph) return 0;
    graph->state.trackEnabled = 0;
    graph->state.changed = 1;
    return 1;
}

int VELMGRAPH_PositionTrackVisible(VELMGRAPH graph, int visible)
{
    if (!graph) return 0;
    graph->state.trackVisible = visible != 0;
    graph->state.changed = 1;
    return 1;
}

int VELMGRAPH_UpdatePositionTrack(VELMGRAPH graph, int x, int y)
{
    if (!graph) return 0;
    graph->state.trackX = x;
    graph->state.trackY = y;
    graph->state.changed = 1;
    return 1;
}
