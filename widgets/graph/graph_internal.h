/* Records shared by the graph's model, view, drawer and control files. */
#ifndef VELMGRAPH_INTERNAL_H
#define VELMGRAPH_INTERNAL_H

#include <memory>
#include <vector>

#include "widgets/graph/velmgraph.h"

struct GraphDataSet {
    int id = 0;
    int kind = 0;
    bool changed = false;
    char label[VELMGRAPH_LABEL_SIZE] = {};
    int64_t count = 0;
    std::vector<float> x, y, d2; /* all of the capacity's length */
    float minX = 0, maxX = 0, minY = 0, maxY = 0;
};

struct GraphAxisLimits {
    double min, max;
};

struct _VELMGRAPH {
    VELMGRAPHSTATE state{};
    bool autoScale[2] = {true, false};
    GraphAxisLimits hard[2];
    int nextId = 0;
    std::vector<std::unique_ptr<GraphDataSet>> sets;
    BLNOTIFY dispatcher = nullptr;
    VELMGRAPHDRAW drawer = nullptr;
    float minX, maxX, minY, maxY;
};

/* Plot layout and interaction state, kept by the drawer between draws. */
struct _VELMGRAPHDRAW {
    VELMGRAPH graph = nullptr;
    int width = 0, height = 0;
    int left = 0, top = 0, right = 0, bottom = 0; /* plot area, inclusive */
    int vScaleWidth = 40, hScaleHeight = 20;
    bool busy = false;
    int overKind = 0;
    bool hoverStopped = false;
    enum Drag { NONE, SELECT, PAN_XY, PAN_X, PAN_Y } drag = NONE;
    bool panKey = false;
    int keys = 0;
    double anchorX = 0, anchorY = 0;
};

GraphDataSet *graph_find_set(VELMGRAPH graph, int id);
void graph_recompute_full_ranges(VELMGRAPH graph);
double graph_display_to_real_x(const _VELMGRAPHDRAW *d, int column);
double graph_display_to_real_y(const _VELMGRAPHDRAW *d, int row);
int graph_real_to_display_x(const _VELMGRAPHDRAW *d, double x);
int graph_real_to_display_y(const _VELMGRAPHDRAW *d, double y);
void graph_destroy_drawer(VELMGRAPHDRAW drawer);

extern "C" {
int VELMGRAPHCONTROL_MousePositionUpdated(VELMGRAPHDRAW drawer, int x, int y);
int VELMGRAPHCONTROL_MouseMove(VELMGRAPHDRAW drawer, int x, int y, int buttons);
int VELMGRAPHCONTROL_MouseDown(VELMGRAPHDRAW drawer, int x, int y, int buttons);
int VELMGRAPHCONTROL_MouseUp(VELMGRAPHDRAW drawer, int x, int y, int buttons);
int VELMGRAPHCONTROL_MouseWheel(VELMGRAPHDRAW drawer, int x, int y, int delta);
int VELMGRAPHCONTROL_MouseHWheel(VELMGRAPHDRAW drawer, int x, int y, int delta);
int VELMGRAPHCONTROL_MouseDblClick(VELMGRAPHDRAW drawer, int x, int y, int buttons);
int VELMGRAPHCONTROL_AccKeyDown(VELMGRAPHDRAW drawer, int keys);
int VELMGRAPHCONTROL_AccKeyUp(VELMGRAPHDRAW drawer, int keys);
}

#endif
