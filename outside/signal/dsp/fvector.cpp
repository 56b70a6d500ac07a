// Extremes of float vectors.
#include "outside/signal/dspb.h"

#include <cmath>

namespace {

// Keeps the value `better` prefers; NaNs never win and are never kept.
template <typename Better>
float extreme(const float *values, int64_t n, Better better)
{
    if (!values || n < 1)
        return 0.0f;
    float best = NAN;
    for (int64_t i = 0; i < n; ++i) {
        const float v = values[i];
        if (better(v, best) || (std::isnan(best) && !std::isnan(v)))
            best = v;
    }
    return std::isnan(best) ? 0.0f : best;
}

}  // namespace

extern "C" {

float FVectorMin(const float *values, int64_t n)
{
    return extreme(values, n, [](float a, float b) { return a < b; });
}

float FVectorMax(const float *values, int64_t n)
{
    return extreme(values, n, [](float a, float b) { return a > b; });
}

}  // extern "C"
