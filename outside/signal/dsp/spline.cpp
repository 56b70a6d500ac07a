// Cubic splines through sampled points, described by their second
// derivatives M[i] at the points: on [x[i], x[i+1]] with h = x[i+1] - x[i],
//   s(x) = a y[i] + b y[i+1] + ((a^3 - a) M[i] + (b^3 - b) M[i+1]) h^2 / 6,
// where b = (x - x[i]) / h and a = 1 - b.
#include "outside/signal/dspb.h"

#include "outside/base/blbase.h"

#include <algorithm>
#include <cmath>
#include <stdexcept>
#include <vector>

namespace {

bool valid_points(const float *xs, const float *ys, int64_t n)
{
    for (int64_t i = 0; i < n; ++i) {
        if (!std::isfinite(xs[i]) || !std::isfinite(ys[i]))
            return false;
        if (i > 0 && !(xs[i] > xs[i - 1]))
            return false;
    }
    return true;
}

// Interior equations, for i = 1 .. n-2,
//   h[i-1] M[i-1] + 2 (h[i-1] + h[i]) M[i] + h[i] M[i+1]
//     = 6 ((y[i+1] - y[i]) / h[i] - (y[i] - y[i-1]) / h[i-1]),
// with M[0] and M[n-1] given, solved by forward elimination and back
// substitution in doubles.
void solve_second_derivatives(const float *xs, const float *ys, int64_t n, double first,
                              double last, float *d2)
{
    // After elimination row i reads M[i] + upper[i] M[i+1] = rhs[i].
    std::vector<double> upper(n), rhs(n);
    upper[0] = 0.0;
    rhs[0] = first;
    for (int64_t i = 1; i < n - 1; ++i) {
        const double h0 = double(xs[i]) - xs[i - 1];
        const double h1 = double(xs[i + 1]) - xs[i];
        double r = 6.0 * ((double(ys[i + 1]) - ys[i]) / h1 - (double(ys[i]) - ys[i - 1]) / h0);
        const double pivot = 2.0 * (h0 + h1) - h0 * upper[i - 1];
        r -= h0 * rhs[i - 1];
        upper[i] = h1 / pivot;
        rhs[i] = r / pivot;
    }
    double next = last;
    d2[n - 1] = static_cast<float>(last);
    for (int64_t i = n - 2; i >= 0; --i) {
        next = rhs[i] - upper[i] * next;
        d2[i] = static_cast<float>(next);
    }
}

// The end slope of the curve at point `end` (0 or n-1), for going on beyond it.
double end_slope(const float *xs, const float *ys, const float *d2, int64_t lo, bool at_right)
{
    const double h = double(xs[lo + 1]) - xs[lo];
    const double secant = (double(ys[lo + 1]) - ys[lo]) / h;
    if (at_right)
        return secant + h * (double(d2[lo]) + 2.0 * d2[lo + 1]) / 6.0;
    return secant - h * (2.0 * double(d2[lo]) + d2[lo + 1]) / 6.0;
}

}  // namespace

extern "C" {

int DSPBSPLINE_Estimate(const float *xs, const float *ys, int64_t n, double d2First,
                        double d2Last, float *d2)
{
    if (!xs || !ys || !d2 || n < 1 || !std::isfinite(d2First) || !std::isfinite(d2Last)) {
        BLDEBUG_Error(0, "DSPBSPLINE_Estimate: invalid arguments (n = %lld)", (long long)n);
        return 0;
    }
    if (!valid_points(xs, ys, n)) {
        BLDEBUG_Error(0, "DSPBSPLINE_Estimate: points not finite or x not strictly increasing");
        return 0;
    }
    if (n == 1) {
        d2[0] = 0.0f;
        return 1;
    }
    try {
        solve_second_derivatives(xs, ys, n, d2First, d2Last, d2);
    } catch (const std::exception &) {  // bad_alloc or length_error
        BLDEBUG_Error(0, "DSPBSPLINE_Estimate: out of memory for %lld points", (long long)n);
        return 0;
    }
    return 1;
}

float DSPBSPLINE_Interpolate(const float *xs, const float *ys, const float *d2, int64_t n,
                             double x)
{
    if (!xs || !ys || !d2 || n < 1)
        return 0.0f;
    if (n == 1)
        return ys[0];
    if (x < xs[0])
        return static_cast<float>(ys[0] + end_slope(xs, ys, d2, 0, false) * (x - xs[0]));
    if (x > xs[n - 1])
        return static_cast<float>(ys[n - 1] +
                                  end_slope(xs, ys, d2, n - 2, true) * (x - xs[n - 1]));
    // The segment [lo, lo + 1] holding x; the search range keeps lo inside
    // 0 .. n-2 whatever x is (NaN included).
    const float *hi = std::upper_bound(xs + 1, xs + n - 1, x,
                                       [](double v, float e) { return v < e; });
    const int64_t lo = (hi - xs) - 1;
    const double h = double(xs[lo + 1]) - xs[lo];
    const double b = (x - xs[lo]) / h;
    const double a = 1.0 - b;
    const double curve = ((a * a * a - a) * d2[lo] + (b * b * b - b) * d2[lo + 1]) * h * h / 6.0;
    return static_cast<float>(a * ys[lo] + b * ys[lo + 1] + curve);
}

}  // extern "C"
