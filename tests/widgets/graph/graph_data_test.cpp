// Graph data sets: storage, sorting, duplicates, statistics, ids and bad input.
#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include "widgets/graph/velmgraph.h"

namespace {

struct GraphDeleter {
    void operator()(_VELMGRAPH *g) const { VELMGRAPH_Destroy(g); }
};
using Graph = std::unique_ptr<_VELMGRAPH, GraphDeleter>;
Graph make_graph() { return Graph(VELMGRAPH_Create()); }

// Collects the log's warnings while alive.
struct LogCapture {
    std::vector<std::string> lines;
    LogCapture() { BLDEBUG_SetSink(&LogCapture::sink, this); }
    ~LogCapture() { BLDEBUG_SetSink(nullptr, nullptr); }
    static void sink(int, int, const char *message, void *user)
    {
        static_cast<LogCapture *>(user)->lines.emplace_back(message);
    }
};

TEST(GraphData, UnsortedPairsAreSortedWithTheirY)
{
    Graph g = make_graph();
    const int id = VELMGRAPH_CreateDataSet(g.get(), 0, 2);
    ASSERT_GE(id, 0);
    const float x[] = {3, 1, 2, -1};
    const float y[] = {30, 10, 20, -10};
    ASSERT_EQ(VELMGRAPH_SetRealXYData(g.get(), id, x, y, 4), 1);
    EXPECT_EQ(VELMGRAPH_GetDataLength(g.get(), id), 4);
    float ox[6], oy[6];
    ASSERT_EQ(VELMGRAPH_GetRealXYData(g.get(), id, ox, oy, 6), 1);
    const float ex[] = {-1, 1, 2, 3, 0, 0}, ey[] = {-10, 10, 20, 30, 0, 0};
    for (int i = 0; i < 6; ++i) {
        EXPECT_EQ(ox[i], ex[i]) << i;
        EXPECT_EQ(oy[i], ey[i]) << i;
    }
    EXPECT_EQ(VELMGRAPH_GetMinX(g.get()), -1);
    EXPECT_EQ(VELMGRAPH_GetMaxX(g.get()), 3);
    EXPECT_EQ(VELMGRAPH_GetMinY(g.get()), -10);
    EXPECT_EQ(VELMGRAPH_GetMaxY(g.get()), 30);
    // Fewer out than stored: only the first samples.
    float small[2], smally[2];
    ASSERT_EQ(VELMGRAPH_GetRealXYData(g.get(), id, small, smally, 2), 1);
    EXPECT_EQ(small[1], 1);
    EXPECT_EQ(smally[1], 10);
}

TEST(GraphData, DuplicatedXEmptiesTheSetAndIsLogged)
{
    Graph g = make_graph();
    const int id = VELMGRAPH_CreateDataSet(g.get(), 0, 4);
    const float good_x[] = {0, 1, 2}, good_y[] = {5, 6, 7};
    ASSERT_EQ(VELMGRAPH_SetRealXYData(g.get(), id, good_x, good_y, 3), 1);
    const float x[] = {2, 1.5f, 2, 4}, y[] = {1, 2, 3, 4};
    LogCapture log;
    EXPECT_EQ(VELMGRAPH_SetRealXYData(g.get(), id, x, y, 4), 0);
    ASSERT_EQ(log.lines.size(), 1u);
    EXPECT_NE(log.lines[0].find("VELMGRAPH_SetRealXYData: Duplicated value ( 2.00) in X data vector!"),
              std::string::npos)
        << log.lines[0];
    EXPECT_EQ(VELMGRAPH_GetDataLength(g.get(), id), 0);
    EXPECT_EQ(VELMGRAPH_GetProperties(g.get(), id, nullptr, nullptr, nullptr, nullptr), 0);
    // The graph now holds no data at all.
    EXPECT_TRUE(std::isinf(VELMGRAPH_GetMinX(g.get())) && VELMGRAPH_GetMinX(g.get()) > 0);
    EXPECT_TRUE(std::isinf(VELMGRAPH_GetMaxY(g.get())) && VELMGRAPH_GetMaxY(g.get()) < 0);
}

TEST(GraphData, EvenlySpacedDataAndStatisticsOverSets)
{
    Graph g = make_graph();
    const int a = VELMGRAPH_CreateDataSet(g.get(), 0, 0);
    const int b = VELMGRAPH_CreateDataSet(g.get(), 0, 0);
    const float ya[] = {1, -2, 3, 0, 5};
    ASSERT_EQ(VELMGRAPH_SetRealData(g.get(), a, 10.0, 12.0, ya, 5), 1);
    float x[5], y[5];
    ASSERT_EQ(VELMGRAPH_GetRealXYData(g.get(), a, x, y, 5), 1);
    for (int i = 0; i < 5; ++i) EXPECT_FLOAT_EQ(x[i], 10.0f + 0.5f * i);
    const float yb[] = {-7, 1};
    ASSERT_EQ(VELMGRAPH_SetRealData(g.get(), b, -1.0, 11.0, yb, 2), 1);
    EXPECT_EQ(VELMGRAPH_GetMinX(g.get()), -1);
    EXPECT_EQ(VELMGRAPH_GetMaxX(g.get()), 12);
    EXPECT_EQ(VELMGRAPH_GetMinY(g.get()), -7);
    EXPECT_EQ(VELMGRAPH_GetMaxY(g.get()), 5);
    float mnx, mxx, mny, mxy;
    ASSERT_EQ(VELMGRAPH_GetProperties(g.get(), a, &mnx, &mxx, &mny, &mxy), 1);
    EXPECT_EQ(mny, -2);
    EXPECT_EQ(mxy, 5);
    // Removing a set shrinks the union to the other one.
    ASSERT_EQ(VELMGRAPH_RemoveDataSet(g.get(), b), 1);
    EXPECT_EQ(VELMGRAPH_GetMinX(g.get()), 10);
    EXPECT_EQ(VELMGRAPH_GetMinY(g.get()), -2);
}

TEST(GraphData, ExtractWindowFollowsTheSpline)
{
    Graph g = make_graph();
    const int id = VELMGRAPH_CreateDataSet(g.get(), 0, 8);
    // A straight line: the natural spline reproduces it exactly.
    const float y[] = {0, 2, 4, 6, 8};
    ASSERT_EQ(VELMGRAPH_SetRealData(g.get(), id, 0.0, 4.0, y, 5), 1);
    float ox[8], oy[8];
    ASSERT_EQ(VELMGRAPH_ExtractDataWindow(g.get(), id, 0.0, 4.0, ox, oy, 8), 1);
    for (int i = 0; i < 8; ++i) {
        EXPECT_FLOAT_EQ(ox[i], 0.5f * i);
        EXPECT_NEAR(oy[i], 1.0f * i, 1e-4);
    }
    // A bump: the curve passes through every sample and stays smooth between.
    const float bump[] = {0, 1, 0};
    ASSERT_EQ(VELMGRAPH_SetRealData(g.get(), id, 0.0, 2.0, bump, 3), 1);
    ASSERT_EQ(VELMGRAPH_ExtractDataWindow(g.get(), id, 0.0, 2.0, ox, oy, 4), 1);
    EXPECT_NEAR(oy[0], 0.0f, 1e-5);
    EXPECT_NEAR(oy[2], 1.0f, 1e-5);
    EXPECT_GT(oy[1], 0.5f); // above the straight chord at x = 0.5
}

TEST(GraphData, BadValuesAreRefusedAndLoseNothing)
{
    Graph g = make_graph();
    const int id = VELMGRAPH_CreateDataSet(g.get(), 0, 4);
    const float x[] = {0, 1, 2}, y[] = {1, 2, 3};
    ASSERT_EQ(VELMGRAPH_SetRealXYData(g.get(), id, x, y, 3), 1);
    const float nan = std::numeric_limits<float>::quiet_NaN(), inf = std::numeric_limits<float>::infinity();
    const float bad_y[] = {1, nan, 3}, bad_x[] = {0, inf, 2};
    EXPECT_EQ(VELMGRAPH_SetRealXYData(g.get(), id, x, bad_y, 3), 0);
    EXPECT_EQ(VELMGRAPH_SetRealXYData(g.get(), id, bad_x, y, 3), 0);
    EXPECT_EQ(VELMGRAPH_SetRealData(g.get(), id, 0.0, 1.0, bad_y, 3), 0);
    EXPECT_EQ(VELMGRAPH_SetRealData(g.get(), id, 0.0, INFINITY, y, 3), 0);
    EXPECT_EQ(VELMGRAPH_SetRealData(g.get(), id, 0.0, 1.0, y, 0), 0);
    EXPECT_EQ(VELMGRAPH_SetRealData(g.get(), id, 0.0, 1.0, y, -5), 0);
    EXPECT_EQ(VELMGRAPH_SetRealData(g.get(), id, 0.0, 1.0, y, VELMGRAPH_MAX_SAMPLES + 1), 0);
    EXPECT_EQ(VELMGRAPH_SetRealData(g.get(), id, 2.0, 2.0, y, 3), 0); // every X equal
    EXPECT_EQ(VELMGRAPH_SetRealXYData(g.get(), id, nullptr, y, 3), 0);
    EXPECT_EQ(VELMGRAPH_SetRealXYData(g.get(), id + 1, x, y, 3), 0);
    // The set kept its data through all of that.
    EXPECT_EQ(VELMGRAPH_GetDataLength(g.get(), id), 3);
    EXPECT_EQ(VELMGRAPH_GetMaxY(g.get()), 3);
    EXPECT_EQ(VELMGRAPH_CreateDataSet(g.get(), 0, -1), -1);
    EXPECT_EQ(VELMGRAPH_CreateDataSet(g.get(), 0, INT64_MAX), -1);
    EXPECT_EQ(VELMGRAPH_CreateDataSet(g.get(), -3, 4), -1);
    EXPECT_EQ(VELMGRAPH_CreateDataSet(nullptr, 0, 4), -1);
    EXPECT_EQ(VELMGRAPH_DataSetCount(nullptr), -1);
    EXPECT_EQ(VELMGRAPH_GetMinX(nullptr), 0);
    float o[2];
    EXPECT_EQ(VELMGRAPH_ExtractDataWindow(g.get(), id, 0, 1, o, o, 0), 0);
}

TEST(GraphData, IdsOnlyGrowAndListsFollowKindAndOrder)
{
    Graph g = make_graph();
    EXPECT_EQ(VELMGRAPH_DataSetCount(g.get()), 0);
    LogCapture log;
    const int a = VELMGRAPH_CreateDataSet(g.get(), 0, 1);
    const int b = VELMGRAPH_CreateDataSet(g.get(), 1, 1);
    const int c = VELMGRAPH_CreateDataSet(g.get(), 0, 1);
    ASSERT_EQ(log.lines.size(), 3u);
    EXPECT_NE(log.lines[2].find("Dataset 2 created"), std::string::npos) << log.lines[2];
    EXPECT_EQ(a, 0);
    EXPECT_EQ(b, 1);
    EXPECT_EQ(c, 2);
    EXPECT_STREQ(VELMGRAPH_GetDataLabel(g.get(), c), "DataSet #2");
    EXPECT_EQ(VELMGRAPH_GetDataType(g.get(), b), 1);
    EXPECT_EQ(VELMGRAPH_GetDataLength(g.get(), b), -1); // not real data
    int ids[4] = {-9, -9, -9, -9};
    EXPECT_EQ(VELMGRAPH_FindListOfIds(g.get(), 0, ids, 4), 2);
    EXPECT_EQ(ids[0], a);
    EXPECT_EQ(ids[1], c);
    EXPECT_EQ(VELMGRAPH_FindListOfIds(g.get(), 0, ids, 1), 1);
    EXPECT_EQ(VELMGRAPH_FindListOfIds(g.get(), 0, nullptr, 4), -1);
    ASSERT_EQ(VELMGRAPH_RemoveDataSet(g.get(), b), 1);
    EXPECT_EQ(VELMGRAPH_ExistsDataSet(g.get(), b), 0);
    EXPECT_EQ(VELMGRAPH_GetDataType(g.get(), b), -1);
    EXPECT_EQ(VELMGRAPH_RemoveDataSet(g.get(), b), 0);
    EXPECT_EQ(VELMGRAPH_NextDataSet(g.get(), a), c); // skips the removed id
    EXPECT_GE(VELMGRAPH_NextDataSet(g.get(), c), 3);
    // A new set never reuses a removed id.
    EXPECT_EQ(VELMGRAPH_CreateDataSet(g.get(), 0, 1), 3);
    const std::string long_label(300, 'q');
    ASSERT_EQ(VELMGRAPH_SetDataLabel(g.get(), a, long_label.c_str()), 1);
    EXPECT_EQ(std::string(VELMGRAPH_GetDataLabel(g.get(), a)), long_label.substr(0, 255));
    ASSERT_EQ(VELMGRAPH_RemoveAllDataSets(g.get()), 1);
    EXPECT_EQ(VELMGRAPH_DataSetCount(g.get()), 0);
}

TEST(GraphData, GrowingASetKeepsOnlyTheNewSamples)
{
    Graph g = make_graph();
    const int id = VELMGRAPH_CreateDataSet(g.get(), 0, 2);
    std::vector<float> y(1000);
    for (size_t i = 0; i < y.size(); ++i) y[i] = std::sin(0.01f * i);
    ASSERT_EQ(VELMGRAPH_SetRealData(g.get(), id, 0.0, 999.0, y.data(), 1000), 1);
    EXPECT_EQ(VELMGRAPH_GetDataLength(g.get(), id), 1000);
    const float few[] = {4, 5};
    ASSERT_EQ(VELMGRAPH_SetRealData(g.get(), id, 0.0, 1.0, few, 2), 1);
    std::vector<float> ox(1000), oy(1000);
    ASSERT_EQ(VELMGRAPH_GetRealXYData(g.get(), id, ox.data(), oy.data(), 1000), 1);
    EXPECT_EQ(oy[1], 5);
    EXPECT_EQ(oy[2], 0); // the old tail is gone
    EXPECT_EQ(VELMGRAPH_GetMaxY(g.get()), 5);
}

} // namespace
