// Graph labels, scales and the view: zoom, offset, selection and reset rules.
#include <gtest/gtest.h>

#include <cmath>
#include <memory>
#include <string>

#include "widgets/graph/velmgraph.h"

namespace {

struct GraphDeleter {
    void operator()(_VELMGRAPH *g) const { VELMGRAPH_Destroy(g); }
};
using Graph = std::unique_ptr<_VELMGRAPH, GraphDeleter>;

// A graph holding y = x over [0, 10] and [-5, 5] in Y, view reset to its full range.
Graph ramp_graph(double x_margin = 0.0)
{
    Graph g(VELMGRAPH_Create());
    const int id = VELMGRAPH_CreateDataSet(g.get(), 0, 11);
    float y[11];
    for (int i = 0; i < 11; ++i) y[i] = static_cast<float>(i - 5);
    VELMGRAPH_SetRealData(g.get(), id, 0.0, 10.0, y, 11);
    VELMGRAPH_SetAutoScale(g.get(), 1, 1);
    VELMGRAPH_SetScaleMargin(g.get(), 0, x_margin);
    VELMGRAPH_ResetZoom(g.get());
    return g;
}

const VELMGRAPHSTATE &state(const Graph &g) { return *VELMGRAPH_GetState(g.get()); }

TEST(GraphLabels, TitleUnitsAndDecimals)
{
    Graph g(VELMGRAPH_Create());
    EXPECT_EQ(VELMGRAPH_GetTitle(g.get()), nullptr);
    EXPECT_EQ(VELMGRAPH_GetScaleDecimalPlaces(g.get(), 0), 2);
    const std::string forty(40, 't');
    ASSERT_EQ(VELMGRAPH_SetTitle(g.get(), forty.c_str()), 1);
    EXPECT_EQ(std::string(VELMGRAPH_GetTitle(g.get())), forty.substr(0, 31));
    EXPECT_TRUE(state(g).flags & VELMGRAPHSTATE_FLAG_TITLE);
    ASSERT_EQ(VELMGRAPH_SetTitle(g.get(), ""), 1);
    EXPECT_EQ(VELMGRAPH_GetTitle(g.get()), nullptr);
    EXPECT_FALSE(state(g).flags & VELMGRAPHSTATE_FLAG_TITLE);

    ASSERT_EQ(VELMGRAPH_SetScaleUnit(g.get(), 1, "dBFSxyz!"), 1);
    EXPECT_STREQ(VELMGRAPH_GetScaleUnit(g.get(), 1), "dBFSxyz");
    EXPECT_EQ(VELMGRAPH_GetScaleUnit(g.get(), 0), nullptr);
    ASSERT_EQ(VELMGRAPH_SetScaleUnit(g.get(), 1, nullptr), 1);
    EXPECT_EQ(VELMGRAPH_GetScaleUnit(g.get(), 1), nullptr);

    ASSERT_EQ(VELMGRAPH_SetScaleDecimalPlaces(g.get(), 0, 9), 1);
    ASSERT_EQ(VELMGRAPH_SetScaleDecimalPlaces(g.get(), 1, -4), 1);
    EXPECT_EQ(VELMGRAPH_GetScaleDecimalPlaces(g.get(), 0), 3);
    EXPECT_EQ(VELMGRAPH_GetScaleDecimalPlaces(g.get(), 1), 0);

    EXPECT_EQ(VELMGRAPH_SetScaleUnit(g.get(), 2, "s"), 0);
    EXPECT_EQ(VELMGRAPH_SetScaleDecimalPlaces(g.get(), -1, 1), 0);
    EXPECT_EQ(VELMGRAPH_SetAutoScale(g.get(), 5, 1), 0);
    EXPECT_EQ(VELMGRAPH_SetScaleViewLimit(g.get(), 2, 0, 1), 0);
    EXPECT_EQ(VELMGRAPH_SetScaleMargin(g.get(), 0, NAN), 0);
    EXPECT_EQ(VELMGRAPH_SetTitle(nullptr, "x"), 0);
}

TEST(GraphView, AutoScaleUsesMarginsAndHardLimits)
{
    Graph g = ramp_graph(1.5);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, -1.5);
    EXPECT_DOUBLE_EQ(state(g).viewXMax, 11.5);
    EXPECT_DOUBLE_EQ(state(g).viewYMin, -5);
    EXPECT_DOUBLE_EQ(state(g).viewYMax, 5);
    // Hard limits cut the full range; given in either order.
    ASSERT_EQ(VELMGRAPH_SetScaleViewLimit(g.get(), 0, 8.0, 0.0), 1);
    ASSERT_EQ(VELMGRAPH_ResetZoomHorz(g.get()), 1);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, 0);
    EXPECT_DOUBLE_EQ(state(g).viewXMax, 8);
    // Without auto-scale the full range stays where it was.
    ASSERT_EQ(VELMGRAPH_SetAutoScale(g.get(), 0, 0), 1);
    ASSERT_EQ(VELMGRAPH_SetScaleViewArea(g.get(), 0, -100, 100), 1);
    ASSERT_EQ(VELMGRAPH_ResetZoomHorz(g.get()), 1);
    EXPECT_DOUBLE_EQ(state(g).viewXMax, 8);
}

TEST(GraphView, ZoomOrdersClampsAndSkipsTheCurrentView)
{
    Graph g = ramp_graph();
    ASSERT_EQ(VELMGRAPH_ZoomHorz(g.get(), 7.0, 2.0), 1);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, 2);
    EXPECT_DOUBLE_EQ(state(g).viewXMax, 7);
    ASSERT_EQ(VELMGRAPH_ZoomVert(g.get(), -50.0, 3.0), 1);
    EXPECT_DOUBLE_EQ(state(g).viewYMin, -5); // clamped into the full range
    EXPECT_DOUBLE_EQ(state(g).viewYMax, 3);

    const_cast<VELMGRAPHSTATE &>(state(g)).changed = 0;
    ASSERT_EQ(VELMGRAPH_ZoomHorz(g.get(), 2.0, 7.0), 1);
    EXPECT_EQ(state(g).changed, 0); // same view: nothing to redraw
    ASSERT_EQ(VELMGRAPH_Zoom(g.get(), 1, 3, -1, 1), 1);
    EXPECT_EQ(state(g).changed, 1);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, 1);
    EXPECT_DOUBLE_EQ(state(g).viewYMax, 1);
    EXPECT_EQ(VELMGRAPH_ZoomHorz(g.get(), NAN, 1), 0);
    ASSERT_EQ(VELMGRAPH_ResetZoom(g.get()), 1);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, 0);
    EXPECT_DOUBLE_EQ(state(g).viewXMax, 10);
    EXPECT_DOUBLE_EQ(state(g).viewYMin, -5);
}

TEST(GraphView, OffsetStopsAtTheEndsWithoutNarrowing)
{
    Graph g = ramp_graph();
    ASSERT_EQ(VELMGRAPH_Zoom(g.get(), 2, 6, -1, 1), 1);
    ASSERT_EQ(VELMGRAPH_Offset(g.get(), 1.5, 0.5), 1);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, 3.5);
    EXPECT_DOUBLE_EQ(state(g).viewXMax, 7.5);
    EXPECT_DOUBLE_EQ(state(g).viewYMin, -0.5);
    ASSERT_EQ(VELMGRAPH_Offset(g.get(), 100, -100), 1);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, 6);
    EXPECT_DOUBLE_EQ(state(g).viewXMax, 10);
    EXPECT_DOUBLE_EQ(state(g).viewYMin, -5);
    EXPECT_DOUBLE_EQ(state(g).viewYMax, -3);
    ASSERT_EQ(VELMGRAPH_Offset(g.get(), -100, 0), 1);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, 0);
    EXPECT_DOUBLE_EQ(state(g).viewXMax, 4);
    EXPECT_EQ(VELMGRAPH_Offset(g.get(), INFINITY, 0), 0);
    EXPECT_DOUBLE_EQ(state(g).viewXMax, 4);
}

TEST(GraphView, SelectionIsOrderedClampedAndZoomedTo)
{
    Graph g = ramp_graph();
    ASSERT_EQ(VELMGRAPH_ZoomSelection(g.get()), 0); // no selection
    ASSERT_EQ(VELMGRAPH_UpdateSelection(g.get(), 8, 2, 20, -1), 1);
    const double *s = state(g).selection;
    EXPECT_DOUBLE_EQ(s[0], 2);
    EXPECT_DOUBLE_EQ(s[1], -1);
    EXPECT_DOUBLE_EQ(s[2], 8);
    EXPECT_DOUBLE_EQ(s[3], 5);
    ASSERT_EQ(VELMGRAPH_ZoomSelection(g.get()), 1);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, 2);
    EXPECT_DOUBLE_EQ(state(g).viewYMin, -1);
    ASSERT_EQ(VELMGRAPH_UpdateSelection(g.get(), 3, 3, 0, 1), 1);
    EXPECT_EQ(VELMGRAPH_ZoomSelection(g.get()), 0); // zero width
    ASSERT_EQ(VELMGRAPH_ClearSelection(g.get()), 1);
    for (int i = 0; i < 4; ++i) EXPECT_EQ(state(g).selection[i], 0);
}

TEST(GraphState, ChangesAreRankedByWhatMustBeRedrawn)
{
    VELMGRAPHSTATE a, b;
    VELMGRAPHSTATE_Reset(&a);
    EXPECT_EQ(a.changed, 1);
    EXPECT_EQ(a.yDecimals, 2);
    b = a;
    EXPECT_EQ(VELMGRAPHSTATE_EvalChanges(&a, &b), 0);
    b.trackX = 12;
    EXPECT_EQ(VELMGRAPHSTATE_EvalChanges(&a, &b), 2);
    b.selection[2] = 1;
    EXPECT_EQ(VELMGRAPHSTATE_EvalChanges(&a, &b), 2); // the track wins
    b.trackX = a.trackX;
    EXPECT_EQ(VELMGRAPHSTATE_EvalChanges(&a, &b), 8);
    b.flags |= VELMGRAPHSTATE_FLAG_TITLE;
    EXPECT_EQ(VELMGRAPHSTATE_EvalChanges(&a, &b), 12);
    b.viewXMax = 3;
    EXPECT_EQ(VELMGRAPHSTATE_EvalChanges(&a, &b), -1);
    b = a;
    b.yDecimals = 3;
    EXPECT_EQ(VELMGRAPHSTATE_EvalChanges(&a, &b), -1);
    EXPECT_EQ(VELMGRAPHSTATE_Reset(nullptr), 0);
}

TEST(GraphSettings, DefaultsAreRegisteredWhenTheLibraryStarts)
{
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.velmgraph.vertscalewidth=[%d]", -1), 40);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.velmgraph.horzscaleheight=[%d]", -1), 20);
    EXPECT_EQ(static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.velmgraph.fillcolor.2=[0x%08X]", 0)),
              0xA0EC0098u);
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "libvelm.velmgraph.titlefont.familyname=[%s]", "none"), "Arial");
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.velmgraph.scalefont.Properties=[%d]", -1), 128);
}

TEST(GraphScale, TickStepAimsAtFortyPixels)
{
    EXPECT_DOUBLE_EQ(VELMGRAPHDRAW_TickStep(400, 10.0), 1.0);     // 40 px per unit
    EXPECT_DOUBLE_EQ(VELMGRAPHDRAW_TickStep(400, 100.0), 10.0);   // 4 px per unit
    EXPECT_DOUBLE_EQ(VELMGRAPHDRAW_TickStep(400, 1.0), 0.1);      // 400 px per unit
    EXPECT_DOUBLE_EQ(VELMGRAPHDRAW_TickStep(400, 0.01), 0.001);
    EXPECT_DOUBLE_EQ(VELMGRAPHDRAW_TickStep(200, 50.0), 10.0);
    EXPECT_EQ(VELMGRAPHDRAW_TickStep(400, 0.0), 0);
    EXPECT_EQ(VELMGRAPHDRAW_TickStep(0, 1.0), 0);
    EXPECT_EQ(VELMGRAPHDRAW_TickStep(400, INFINITY), 0);
    EXPECT_GT(VELMGRAPHDRAW_TickStep(400, 1e-300), 0); // tiny spans still end
}

} // namespace
