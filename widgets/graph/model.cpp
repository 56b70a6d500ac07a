/* The graph record, its labels and scale settings. */
#include <cmath>
#include <cstring>
#include <limits>

#include "widgets/graph/graph_internal.h"

namespace {

bool valid_axis(int axis) { return axis == 0 || axis == 1; }

/* Copies text into a fixed field, cutting it to the field's size. */
void copy_text(char *field, size_t size, const char *text)
{
    std::memset(field, 0, size);
    if (text) std::strncpy(field, text, size - 1);
}

} // namespace

VELMGRAPH VELMGRAPH_Create(void)
{
    auto graph = std::make_unique<_VELMGRAPH>();
    graph->dispatcher = BLNOTIFY_CreateDispatcher(graph.get());
    if (!graph->dispatcher) return nullptr;
    VELMGRAPHSTATE_Reset(&graph->state);
    const double inf = std::numeric_limits<double>::infinity();
    graph->hard[0] = graph->hard[1] = {-inf, inf};
    graph->minX = graph->minY = std::numeric_limits<float>::infinity();
    graph->maxX = graph->maxY = -std::numeric_limits<float>::infinity();
    return graph.release();
}

int VELMGRAPH_Destroy(VELMGRAPH graph)
{
    if (!graph) return 0;
    graph_destroy_drawer(graph->drawer);
    BLNOTIFY_DestroyDispatcher(graph->dispatcher);
    delete graph;
    return 1;
}

const VELMGRAPHSTATE *VELMGRAPH_GetState(VELMGRAPH graph) { return graph ? &graph->state : nullptr; }

int VELMGRAPH_SetTitle(VELMGRAPH graph, const char *text)
{
    if (!graph) return 0;
    copy_text(graph->state.title, sizeof graph->state.title, text);
    if (graph->state.title[0])
        graph->state.flags |= VELMGRAPHSTATE_FLAG_TITLE;
    else
        graph->state.flags &= ~VELMGRAPHSTATE_FLAG_TITLE;
    graph->state.changed = 1;
    return 1;
}

const char *VELMGRAPH_GetTitle(VELMGRAPH graph)
{
    if (!graph || !(graph->state.flags & VELMGRAPHSTATE_FLAG_TITLE)) return nullptr;
    return graph->state.title;
}

int VELMGRAPH_SetScaleUnit(VELMGRAPH graph, int axis, const char *text)
{
    if (!graph || !valid_axis(axis)) return 0;
    char *unit = axis == 0 ? graph->state.xUnit : graph->state.yUnit;
    copy_text(unit, VELMGRAPH_UNIT_SIZE, text);
    graph->state.changed = 1;
    return 1;
}

const char *VELMGRAPH_GetScaleUnit(VELMGRAPH graph, int axis)
{
    if (!graph || !valid_axis(axis)) return nullptr;
    const char *unit = axis == 0 ? graph->state.xUnit : graph->state.yUnit;
    return unit[0] ? unit : nullptr;
}

int VELMGRAPH_SetScaleDecimalPlaces(VELMGRAPH graph, int axis, int n)
{
    if (!graph || !valid_axis(axis)) return 0;
    const int clamped = n < 0 ? 0 : n > 3 ? 3 : n;
    (axis == 0 ? graph->state.xDecimals : graph->state.yDecimals) = clamped;
    graph->state.changed = 1;
    return 1;
}

int VELMGRAPH_GetScaleDecimalPlaces(VELMGRAPH graph, int axis)
{
    if (!graph || !valid_axis(axis)) return -1;
    return axis == 0 ? graph->state.xDecimals : graph->state.yDecimals;
}

int VELMGRAPH_SetScaleViewLimit(VELMGRAPH graph, int axis, double a, double b)
{
    if (!graph || !valid_axis(axis) || std::isnan(a) || std::isnan(b)) return 0;
    graph->hard[axis] = {std::fmin(a, b), std::fmax(a, b)};
    graph->state.changed = 1;
    return 1;
}

int VELMGRAPH_SetScaleViewArea(VELMGRAPH graph, int axis, double a, double b)
{
    return VELMGRAPH_SetScaleViewLimit(graph, axis, a, b);
}

int VELMGRAPH_SetAutoScale(VELMGRAPH graph, int axis, int on)
{
    if (!graph || !valid_axis(axis)) return 0;
    graph->autoScale[axis] = on != 0;
    graph->state.changed = 1;
    return 1;
}

int VELMGRAPH_SetScaleMargin(VELMGRAPH graph, int axis, double margin)
{
    if (!graph || !valid_axis(axis) || !std::isfinite(margin)) return 0;
    (axis == 0 ? graph->state.xMargin : graph->state.yMargin) = margin;
    graph->state.changed = 1;
    return 1;
}

double VELMGRAPH_GetMinX(VELMGRAPH graph) { return graph ? graph->minX : 0; }
double VELMGRAPH_GetMaxX(VELMGRAPH graph) { return graph ? graph->maxX : 0; }
double VELMGRAPH_GetMinY(VELMGRAPH graph) { return graph ? graph->minY : 0; }
double VELMGRAPH_GetMaxY(VELMGRAPH graph) { return graph ? graph->maxY : 0; }

BLNOTIFY VELMGRAPH_Dispatcher(VELMGRAPH graph) { return graph ? graph->dispatcher : nullptr; }

int VELMGRAPH_AddEventHandler(VELMGRAPH graph, BLNOTIFY_Handler handler, void *user)
{
    return graph && handler ? BLNOTIFY_AddHandler(graph->dispatcher, handler, user) : 0;
}

int VELMGRAPH_DelEventHandler(VELMGRAPH graph, BLNOTIFY_Handler handler, void *user)
{
    return graph && handler ? BLNOTIFY_DelHandler(graph->dispatcher, handler, user) : 0;
}
