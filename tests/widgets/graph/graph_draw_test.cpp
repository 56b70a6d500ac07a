// The graph drawn on a real Qt canvas and driven by the mouse: golden
// pictures, rubber-band zoom, pans, resets, keys and the graph's events.
#include <gtest/gtest.h>

#include <QImage>
#include <QPainter>
#include <cmath>
#include <cstdint>
#include <memory>
#include <vector>

#include "../../render/view/view_support.hpp"
#include "../guiapp.h"
#include "widgets/graph/velmgraph.h"

namespace {

constexpr int kWidth = 320;
constexpr int kHeight = 200;
// Plot area of the default layout without a title: margins 5, scale
// column 40 wide, scale row 20 high.
constexpr int kLeft = 45, kRight = 314, kTop = 5, kBottom = 174;

struct GraphDeleter {
    void operator()(_VELMGRAPH *g) const { VELMGRAPH_Destroy(g); }
};
using Graph = std::unique_ptr<_VELMGRAPH, GraphDeleter>;

const VELMGRAPHSTATE &state(const Graph &g) { return *VELMGRAPH_GetState(g.get()); }

// y = x - 5 over [0, 10], both axes auto-scaled and the view reset.
Graph ramp_graph()
{
    Graph g(VELMGRAPH_Create());
    const int id = VELMGRAPH_CreateDataSet(g.get(), 0, 11);
    float y[11];
    for (int i = 0; i < 11; ++i) y[i] = static_cast<float>(i - 5);
    VELMGRAPH_SetRealData(g.get(), id, 0.0, 10.0, y, 11);
    VELMGRAPH_SetAutoScale(g.get(), 1, 1);
    VELMGRAPH_ResetZoom(g.get());
    return g;
}

QImage draw(VELMGRAPH graph)
{
    MakeGuiApplication();
    viewtest::Canvas canvas(kWidth, kHeight);
    QPainter painter;
    VELMCANVAS_BeginDraw(canvas.get(), &painter);
    VELMCANVAS_SelectTarget(canvas.get(), VELMCANVASTARGET_OUTPUT);
    EXPECT_EQ(VELMGRAPH_Draw(canvas.get(), graph), 1);
    VELMCANVAS_EndDraw(canvas.get());
    return canvas.output();
}

int column_of(double x) { return kLeft + static_cast<int>(std::lround(x / 10.0 * (kRight - kLeft))); }
int row_of(double y) { return kBottom - static_cast<int>(std::lround((y + 5.0) / 10.0 * (kBottom - kTop))); }
constexpr double kPixelX = 10.0 / (kRight - kLeft);
constexpr double kPixelY = 10.0 / (kBottom - kTop);

struct Recorder {
    std::vector<std::pair<uint32_t, intptr_t>> events;
    static int handler(const BLNotifyEvent *e, void *user)
    {
        static_cast<Recorder *>(user)->events.emplace_back(e->event, reinterpret_cast<intptr_t>(e->data1));
        return 1;
    }
};

TEST(GraphControl, MouseInputIsRefusedBeforeTheFirstDraw)
{
    Graph g = ramp_graph();
    EXPECT_EQ(VELMGRAPH_MouseDown(g.get(), 100, 100, VELMGRAPH_BUTTON_LEFT), 0);
    EXPECT_EQ(VELMGRAPH_MouseMove(g.get(), 100, 100, 0), 0);
    EXPECT_EQ(VELMGRAPH_AccKeyDown(g.get(), VELMGRAPH_KEY_TRACK), 0);
    EXPECT_EQ(VELMGRAPH_MouseWheel(g.get(), 100, 100, 120), 0);
    EXPECT_EQ(state(g).trackEnabled, 0);
    draw(g.get());
    EXPECT_EQ(VELMGRAPH_MouseMove(g.get(), 100, 100, 0), 1);
    // The drawer belongs to the graph: asking again gives the same one.
    VELMGRAPHDRAW drawer = VELMGRAPHDRAW_Create(g.get());
    ASSERT_NE(drawer, nullptr);
    EXPECT_EQ(VELMGRAPHDRAW_Create(g.get()), drawer);
    EXPECT_EQ(VELMGRAPHDRAW_Update(drawer, nullptr, nullptr), 0);
    EXPECT_EQ(VELMGRAPH_MouseMove(nullptr, 100, 100, 0), 0);
}

TEST(GraphControl, RubberBandSelectionZoomsToItAndClears)
{
    Graph g = ramp_graph();
    draw(g.get());
    Recorder rec;
    ASSERT_EQ(VELMGRAPH_AddEventHandler(g.get(), &Recorder::handler, &rec), 1);
    ASSERT_EQ(VELMGRAPH_MouseDown(g.get(), column_of(2), row_of(-2), VELMGRAPH_BUTTON_LEFT), 1);
    ASSERT_EQ(VELMGRAPH_MouseMove(g.get(), column_of(6), row_of(3), VELMGRAPH_BUTTON_LEFT), 1);
    // During the drag the selection follows the mouse.
    EXPECT_NEAR(state(g).selection[0], 2, kPixelX);
    EXPECT_NEAR(state(g).selection[2], 6, kPixelX);
    EXPECT_NEAR(state(g).selection[1], -2, kPixelY);
    EXPECT_NEAR(state(g).selection[3], 3, kPixelY);
    ASSERT_EQ(VELMGRAPH_MouseUp(g.get(), column_of(6), row_of(3), 0), 1);
    EXPECT_NEAR(state(g).viewXMin, 2, kPixelX);
    EXPECT_NEAR(state(g).viewXMax, 6, kPixelX);
    EXPECT_NEAR(state(g).viewYMin, -2, kPixelY);
    EXPECT_NEAR(state(g).viewYMax, 3, kPixelY);
    EXPECT_EQ(state(g).selection[2], 0);
    // The press was announced with the plot as the mouse-over kind.
    ASSERT_FALSE(rec.events.empty());
    bool pressed = false;
    for (const auto &[code, kind] : rec.events)
        if (code == VELMGRAPH_EVENT_MOUSEDOWN) pressed = kind == VELMGRAPH_OVER_PLOT;
    EXPECT_TRUE(pressed);
    // A double click on the plot brings the whole range back.
    draw(g.get());
    ASSERT_EQ(VELMGRAPH_MouseDblClick(g.get(), 150, 100, VELMGRAPH_BUTTON_LEFT), 1);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, 0);
    EXPECT_DOUBLE_EQ(state(g).viewXMax, 10);
    EXPECT_DOUBLE_EQ(state(g).viewYMax, 5);
    VELMGRAPH_DelEventHandler(g.get(), &Recorder::handler, &rec);
}

TEST(GraphControl, PansFollowTheMouseAndStopAtTheEnds)
{
    Graph g = ramp_graph();
    VELMGRAPH_Zoom(g.get(), 2, 6, -2, 2);
    draw(g.get());
    const double unitsPerPixelX = 4.0 / (kRight - kLeft);
    // Pan key held: dragging the plot 50 pixels left moves the view right.
    ASSERT_EQ(VELMGRAPH_AccKeyDown(g.get(), VELMGRAPH_KEY_PAN), 1);
    ASSERT_EQ(VELMGRAPH_MouseDown(g.get(), 200, 90, VELMGRAPH_BUTTON_LEFT), 1);
    ASSERT_EQ(VELMGRAPH_MouseMove(g.get(), 150, 90, VELMGRAPH_BUTTON_LEFT), 1);
    EXPECT_NEAR(state(g).viewXMin, 2 + 50 * unitsPerPixelX, 1e-9);
    EXPECT_NEAR(state(g).viewXMax - state(g).viewXMin, 4, 1e-9);
    EXPECT_NEAR(state(g).viewYMin, -2, 1e-9);
    EXPECT_EQ(state(g).selection[2], 0); // panning selects nothing
    // Far past the end: the view stops at the full range, same width.
    ASSERT_EQ(VELMGRAPH_MouseMove(g.get(), -2000, 90, VELMGRAPH_BUTTON_LEFT), 1);
    EXPECT_DOUBLE_EQ(state(g).viewXMax, 10);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, 6);
    ASSERT_EQ(VELMGRAPH_MouseUp(g.get(), -2000, 90, 0), 1);
    ASSERT_EQ(VELMGRAPH_AccKeyUp(g.get(), VELMGRAPH_KEY_PAN), 1);
    // The vertical scale pans Y only.
    ASSERT_EQ(VELMGRAPH_MouseDown(g.get(), 20, 100, VELMGRAPH_BUTTON_LEFT), 1);
    ASSERT_EQ(VELMGRAPH_MouseMove(g.get(), 20, 120, VELMGRAPH_BUTTON_LEFT), 1);
    ASSERT_EQ(VELMGRAPH_MouseUp(g.get(), 20, 120, 0), 1);
    EXPECT_NEAR(state(g).viewYMin, -2 + 20 * 4.0 / (kBottom - kTop), 1e-9);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, 6);
    // Double click on the horizontal scale resets X alone.
    ASSERT_EQ(VELMGRAPH_MouseDblClick(g.get(), 150, kBottom + 10, VELMGRAPH_BUTTON_LEFT), 1);
    EXPECT_DOUBLE_EQ(state(g).viewXMin, 0);
    EXPECT_GT(state(g).viewYMin, -2);
    // The wheel changes nothing.
    const VELMGRAPHSTATE before = state(g);
    EXPECT_EQ(VELMGRAPH_MouseWheel(g.get(), 150, 90, 120), 1);
    EXPECT_EQ(VELMGRAPH_MouseHWheel(g.get(), 150, 90, -120), 1);
    EXPECT_EQ(VELMGRAPHSTATE_EvalChanges(&before, &state(g)), 0);
}

TEST(GraphControl, HoverKindsTrackAndKeysAreAnnounced)
{
    Graph g = ramp_graph();
    draw(g.get());
    Recorder rec;
    ASSERT_EQ(VELMGRAPH_AddEventHandler(g.get(), &Recorder::handler, &rec), 1);
    VELMGRAPH_MouseMove(g.get(), 20, 100, 0);           // left scale
    VELMGRAPH_MouseMove(g.get(), 150, kBottom + 10, 0); // bottom scale
    VELMGRAPH_MouseMove(g.get(), 150, 100, 0);          // plot
    VELMGRAPH_MouseMove(g.get(), 151, 101, 0);          // still the plot: no event
    VELMGRAPH_MouseMove(g.get(), 2, 2, 0);              // the corner
    VELMGRAPH_MouseMove(g.get(), 500, 2, 0);            // outside
    const std::vector<intptr_t> expected = {VELMGRAPH_OVER_VSCALE_LEFT, VELMGRAPH_OVER_HSCALE_BOTTOM,
                                            VELMGRAPH_OVER_PLOT, VELMGRAPH_OVER_WIDGET, VELMGRAPH_OVER_NONE};
    std::vector<intptr_t> kinds;
    for (const auto &[code, kind] : rec.events) {
        EXPECT_EQ(code, VELMGRAPH_EVENT_MOUSEOVER);
        kinds.push_back(kind);
    }
    EXPECT_EQ(kinds, expected);
    // Over the plot the track follows the mouse; elsewhere it hides.
    VELMGRAPH_MouseMove(g.get(), 120, 60, 0);
    EXPECT_EQ(state(g).trackVisible, 1);
    EXPECT_EQ(state(g).trackX, 120);
    EXPECT_EQ(state(g).trackY, 60);
    VELMGRAPH_MouseMove(g.get(), 20, 60, 0);
    EXPECT_EQ(state(g).trackVisible, 0);
    ASSERT_EQ(VELMGRAPH_AccKeyDown(g.get(), VELMGRAPH_KEY_TRACK), 1);
    EXPECT_EQ(state(g).trackEnabled, 1);
    ASSERT_EQ(VELMGRAPH_AccKeyUp(g.get(), VELMGRAPH_KEY_TRACK), 1);
    EXPECT_EQ(state(g).trackEnabled, 0);
    rec.events.clear();
    ASSERT_EQ(VELMGRAPH_AccKeyDown(g.get(), VELMGRAPH_KEY_PAN), 1);
    ASSERT_EQ(rec.events.size(), 1u);
    EXPECT_EQ(rec.events[0].first, VELMGRAPH_EVENT_MOUSEOVER);
    VELMGRAPH_DelEventHandler(g.get(), &Recorder::handler, &rec);
}

// A handler that calls back into the graph while an input call runs.
struct Reentrant {
    VELMGRAPH graph;
    int answer = -1;
    static int handler(const BLNotifyEvent *e, void *user)
    {
        auto *self = static_cast<Reentrant *>(user);
        if (e->event == VELMGRAPH_EVENT_MOUSEDOWN) self->answer = VELMGRAPH_MouseMove(self->graph, 10, 10, 0);
        return 1;
    }
};

TEST(GraphControl, InputFromAnEventHandlerIsRefused)
{
    Graph g = ramp_graph();
    draw(g.get());
    Reentrant re{g.get()};
    ASSERT_EQ(VELMGRAPH_AddEventHandler(g.get(), &Reentrant::handler, &re), 1);
    ASSERT_EQ(VELMGRAPH_MouseDown(g.get(), 150, 100, 0), 1);
    EXPECT_EQ(re.answer, 0);
    VELMGRAPH_DelEventHandler(g.get(), &Reentrant::handler, &re);
}

TEST(GraphPicture, TwoSetsTitleUnitsSelectionAndTrack)
{
    Graph g(VELMGRAPH_Create());
    const int a = VELMGRAPH_CreateDataSet(g.get(), 0, 64);
    const int b = VELMGRAPH_CreateDataSet(g.get(), 0, 64);
    std::vector<float> sine(64), decay(16);
    for (int i = 0; i < 64; ++i) sine[i] = 0.8f * std::sin(i * 0.2f);
    for (int i = 0; i < 16; ++i) decay[i] = std::exp(-0.25f * i) - 0.5f;
    ASSERT_EQ(VELMGRAPH_SetRealData(g.get(), a, 0.0, 6.3, sine.data(), 64), 1);
    ASSERT_EQ(VELMGRAPH_SetRealData(g.get(), b, 0.0, 6.3, decay.data(), 16), 1);
    VELMGRAPH_SetTitle(g.get(), "Response");
    VELMGRAPH_SetScaleUnit(g.get(), 0, "s");
    VELMGRAPH_SetScaleUnit(g.get(), 1, "V");
    VELMGRAPH_SetScaleDecimalPlaces(g.get(), 0, 1);
    VELMGRAPH_SetScaleDecimalPlaces(g.get(), 1, 2);
    VELMGRAPH_SetAutoScale(g.get(), 1, 1);
    VELMGRAPH_SetScaleMargin(g.get(), 1, 0.1);
    VELMGRAPH_ResetZoom(g.get());
    VELMGRAPH_UpdateSelection(g.get(), 1.0, 2.5, -0.5, 0.6);
    VELMGRAPH_EnablePositionTrack(g.get());
    VELMGRAPH_PositionTrackVisible(g.get(), 1);
    VELMGRAPH_UpdatePositionTrack(g.get(), 230, 70);
    const QImage image = draw(g.get());
    EXPECT_EQ(viewtest::compare_golden(image, "graph_two_sets"), "");
    EXPECT_EQ(state(g).changed, 0); // drawn
    // The track's vertical line, and the second set's green fill over the first near the bottom left.
    const QColor track = image.pixelColor(230, 120);
    EXPECT_GT(track.red(), 200);
    EXPECT_GT(track.blue(), 200);
    const QColor fill = image.pixelColor(kLeft + 5, kBottom - 5);
    EXPECT_GT(fill.green(), fill.red());
    EXPECT_GT(fill.green(), fill.blue() + 100);
}

TEST(GraphPicture, EmptyAndFlatGraphsDrawWithoutData)
{
    Graph g(VELMGRAPH_Create());
    const QImage empty = draw(g.get()); // zero-width view
    EXPECT_EQ(empty.width(), kWidth);
    const int id = VELMGRAPH_CreateDataSet(g.get(), 0, 1);
    const float one = 2.0f;
    ASSERT_EQ(VELMGRAPH_SetRealData(g.get(), id, 3.0, 3.0, &one, 1), 1);
    VELMGRAPH_ResetZoom(g.get());
    const QImage flat = draw(g.get());
    // Only the background and frame: no fill colour anywhere.
    int filled = 0;
    for (int y = 0; y < flat.height(); ++y)
        for (int x = 0; x < flat.width(); ++x) {
            const QColor c = flat.pixelColor(x, y);
            if (c.blue() > 150 && c.red() < 80) ++filled;
        }
    EXPECT_EQ(filled, 0);
}

} // namespace
