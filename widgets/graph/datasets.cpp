/* Data sets: creation, lookup, storage of samples and the statistics. */
#include <algorithm>
#include <climits>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <limits>
#include <numeric>

#include "outside/signal/dspb.h"
#include "widgets/graph/graph_internal.h"

namespace {

constexpr float kInf = std::numeric_limits<float>::infinity();

void empty_ranges(GraphDataSet &set)
{
    set.minX = set.minY = kInf;
    set.maxX = set.maxY = -kInf;
}

void recompute_statistics(VELMGRAPH graph)
{
    graph->minX = graph->minY = kInf;
    graph->maxX = graph->maxY = -kInf;
    for (const auto &set : graph->sets) {
        if (set->kind != VELMGRAPH_KIND_REAL || set->count < 1) continue;
        graph->minX = std::min(graph->minX, set->minX);
        graph->maxX = std::max(graph->maxX, set->maxX);
        graph->minY = std::min(graph->minY, set->minY);
        graph->maxY = std::max(graph->maxY, set->maxY);
    }
    graph->state.changed = 1;
}

bool all_finite(const float *v, int64_t n)
{
    return std::all_of(v, v + n, [](float f) { return std::isfinite(f); });
}

/* Grows the three vectors to n when needed; the tail past n is zeroed. */
void reserve_samples(GraphDataSet &set, int64_t n)
{
    if (n > static_cast<int64_t>(set.x.size())) {
        set.x.assign(n, 0.0f);
        set.y.assign(n, 0.0f);
        set.d2.assign(n, 0.0f);
    }
    std::fill(set.x.begin() + n, set.x.end(), 0.0f);
    std::fill(set.y.begin() + n, set.y.end(), 0.0f);
    std::fill(set.d2.begin(), set.d2.end(), 0.0f);
}

/* Count, spline and ranges of a set whose n sorted samples are in place. */
int finish_samples(VELMGRAPH graph, GraphDataSet &set, int64_t n)
{
    set.count = n;
    DSPBSPLINE_Estimate(set.x.data(), set.y.data(), n, 0.0, 0.0, set.d2.data());
    set.minX = set.x[0];
    set.maxX = set.x[n - 1];
    set.minY = FVectorMin(set.y.data(), n);
    set.maxY = FVectorMax(set.y.data(), n);
    set.changed = true;
    recompute_statistics(graph);
    return 1;
}

GraphDataSet *real_set(VELMGRAPH graph, int id)
{
    GraphDataSet *set = graph_find_set(graph, id);
    return set && set->kind == VELMGRAPH_KIND_REAL ? set : nullptr;
}

} // namespace

GraphDataSet *graph_find_set(VELMGRAPH graph, int id)
{
    if (!graph) return nullptr;
    for (auto &set : graph->sets)
        if (set->id == id) return set.get();
    return nullptr;
}

int VELMGRAPH_CreateDataSet(VELMGRAPH graph, int kind, int64_t capacity)
{
    if (!graph || kind < 0 || capacity < 0 || capacity > VELMGRAPH_MAX_SAMPLES) return -1;
    /* Ids only grow; once they are used up no further set can be made. */
    if (graph->nextId == INT_MAX) return -1;
    auto set = std::make_unique<GraphDataSet>();
    set->id = graph->nextId++;
    set->kind = kind;
    std::snprintf(set->label, sizeof set->label, "DataSet #%d", set->id);
    if (kind == VELMGRAPH_KIND_REAL) {
        set->x.assign(capacity, 0.0f);
        set->y.assign(capacity, 0.0f);
        set->d2.assign(capacity, 0.0f);
    }
    empty_ranges(*set);
    const int id = set->id;
    graph->sets.push_back(std::move(set));
    graph->state.changed = 1;
    BLDEBUG_Log(BLDEBUG_LEVEL_INFO, "Dataset %d created\n", id);
    return id;
}

int VELMGRAPH_RemoveDataSet(VELMGRAPH graph, int id)
{
    if (!graph) return 0;
    auto it = std::find_if(graph->sets.begin(), graph->sets.end(), [id](const auto &s) { return s->id == id; });
    if (it == graph->sets.end()) return 0;
    graph->sets.erase(it);
    recompute_statistics(graph);
    return 1;
}

int VELMGRAPH_RemoveAllDataSets(VELMGRAPH graph)
{
    if (!graph) return 0;
    graph->sets.clear();
    recompute_statistics(graph);
    return 1;
}

int VELMGRAPH_ExistsDataSet(VELMGRAPH graph, int id) { return graph_find_set(graph, id) ? 1 : 0; }

int VELMGRAPH_SetDataLabel(VELMGRAPH graph, int id, const char *text)
{
    GraphDataSet *set = graph_find_set(graph, id);
    if (!set || !text) return 0;
    std::memset(set->label, 0, sizeof set->label);
    std::strncpy(set->label, text, sizeof set->label - 1);
    graph->state.changed = 1;
    return 1;
}

const char *VELMGRAPH_GetDataLabel(VELMGRAPH graph, int id)
{
    GraphDataSet *set = graph_find_set(graph, id);
    return set ? set->label : nullptr;
}

int VELMGRAPH_DataSetCount(VELMGRAPH graph) { return graph ? static_cast<int>(graph->sets.size()) : -1; }

int VELMGRAPH_FindListOfIds(VELMGRAPH graph, int kind, int *ids, int max)
{
    if (!graph || max < 0 || (max > 0 && !ids)) return -1;
    int count = 0;
    for (const auto &set : graph->sets)
        if (set->kind == kind && count < max) ids[count++] = set->id;
    return count;
}

int VELMGRAPH_NextDataSet(VELMGRAPH graph, int id)
{
    if (!graph) return -1;
    int next = graph->nextId;
    for (const auto &set : graph->sets)
        if (set->id > id && set->id < next) next = set->id;
    return next;
}

int64_t VELMGRAPH_GetDataLength(VELMGRAPH graph, int id)
{
    GraphDataSet *set = real_set(graph, id);
    return set ? set->count : -1;
}

int VELMGRAPH_GetDataType(VELMGRAPH graph, int id)
{
    GraphDataSet *set = graph_find_set(graph, id);
    return set ? set->kind : -1;
}

int VELMGRAPH_GetProperties(VELMGRAPH graph, int id, float *min_x, float *max_x, float *min_y, float *max_y)
{
    GraphDataSet *set = real_set(graph, id);
    if (!set || set->count < 1) return 0;
    if (min_x) *min_x = set->minX;
    if (max_x) *max_x = set->maxX;
    if (min_y) *min_y = set->minY;
    if (max_y) *max_y = set->maxY;
    return 1;
}

int VELMGRAPH_SetRealData(VELMGRAPH graph, int id, double x_first, double x_last, const float *y, int64_t n)
{
    GraphDataSet *set = real_set(graph, id);
    if (!set || !y || n < 1 || n > VELMGRAPH_MAX_SAMPLES || !std::isfinite(x_first) || !std::isfinite(x_last) ||
        !all_finite(y, n))
        return 0;
    /* A single sample or an empty span cannot give increasing X. */
    if (n > 1 && !(x_last > x_first)) return 0;
    reserve_samples(*set, n);
    const double step = n > 1 ? (x_last - x_first) / static_cast<double>(n - 1) : 0.0;
    for (int64_t i = 0; i < n; ++i) set->x[i] = static_cast<float>(x_first + step * static_cast<double>(i));
    std::copy(y, y + n, set->y.begin());
    for (int64_t i = 1; i < n; ++i)
        if (set->x[i] <= set->x[i - 1]) return 0; /* span too narrow for float steps */
    return finish_samples(graph, *set, n);
}

int VELMGRAPH_SetRealXYData(VELMGRAPH graph, int id, const float *x, const float *y, int64_t n)
{
    GraphDataSet *set = real_set(graph, id);
    if (!set || !x || !y || n < 1 || n > VELMGRAPH_MAX_SAMPLES || !all_finite(x, n) || !all_finite(y, n)) return 0;
    std::vector<int64_t> order(n);
    std::iota(order.begin(), order.end(), 0);
    std::stable_sort(order.begin(), order.end(), [x](int64_t a, int64_t b) { return x[a] < x[b]; });
    reserve_samples(*set, n);
    for (int64_t i = 0; i < n; ++i) {
        set->x[i] = x[order[i]];
        set->y[i] = y[order[i]];
    }
    for (int64_t i = 1; i < n; ++i) {
        if (set->x[i] == set->x[i - 1]) {
            BLDEBUG_Warning(0, "VELMGRAPH_SetRealXYData: Duplicated value (%5.2f) in X data vector!", set->x[i]);
            std::fill(set->x.begin(), set->x.end(), 0.0f);
            std::fill(set->y.begin(), set->y.end(), 0.0f);
            set->count = 0;
            empty_ranges(*set);
            recompute_statistics(graph);
            return 0;
        }
    }
    return finish_samples(graph, *set, n);
}

int VELMGRAPH_GetRealXYData(VELMGRAPH graph, int id, float *x, float *y, int64_t n)
{
    GraphDataSet *set = real_set(graph, id);
    if (!set || !x || !y || n < 0) return 0;
    const int64_t copied = std::min(n, set->count);
    std::copy_n(set->x.begin(), copied, x);
    std::copy_n(set->y.begin(), copied, y);
    std::fill(x + copied, x + n, 0.0f);
    std::fill(y + copied, y + n, 0.0f);
    return 1;
}

int VELMGRAPH_ExtractDataWindow(VELMGRAPH graph, int id, double x_from, double x_to, float *x, float *y, int64_t n)
{
    GraphDataSet *set = real_set(graph, id);
    if (!set || !x || !y || n < 1 || set->count < 1 || !std::isfinite(x_from) || !std::isfinite(x_to)) return 0;
    const double step = (x_to - x_from) / static_cast<double>(n);
    for (int64_t i = 0; i < n; ++i) {
        const double at = x_from + static_cast<double>(i) * step;
        x[i] = static_cast<float>(at);
        y[i] = DSPBSPLINE_Interpolate(set->x.data(), set->y.data(), set->d2.data(), set->count, at);
    }
    return 1;
}
