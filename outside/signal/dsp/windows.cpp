// Analysis windows in their periodic form, w[n] = f(n / L): the form whose
// DFT has the textbook sidelobes when the frame is L samples long.
#include "outside/signal/dspb.h"

#include "outside/base/blbase.h"

#include <array>
#include <cmath>
#include <numbers>
#include <optional>

namespace {

// Generalised cosine windows: w = a0 - a1 cos x + a2 cos 2x - a3 cos 3x.
using CosineTerms = std::array<double, 4>;

std::optional<CosineTerms> cosine_terms(int kind)
{
    switch (kind) {
    case DSPB_WINDOW_RECTANGULAR: return CosineTerms{1.0, 0.0, 0.0, 0.0};
    case DSPB_WINDOW_HANNING: return CosineTerms{0.5, 0.5, 0.0, 0.0};
    case DSPB_WINDOW_HAMMING: return CosineTerms{0.54, 0.46, 0.0, 0.0};
    case DSPB_WINDOW_BLACKMAN: return CosineTerms{0.42, 0.5, 0.08, 0.0};
    case DSPB_WINDOW_BLACKMAN_HARRIS: return CosineTerms{0.35875, 0.48829, 0.14128, 0.01168};
    case DSPB_WINDOW_BLACKMAN_NUTTALL:
        return CosineTerms{0.3635819, 0.4891775, 0.1365995, 0.0106411};
    default: return std::nullopt;
    }
}

bool valid_length(int length)
{
    return length >= 1 && length <= DSPB_MAX_WINDOW_LENGTH;
}

}  // namespace

extern "C" {

int DSPB_CreateWindow(int kind, float *window, int length)
{
    if (!window || !valid_length(length)) {
        BLDEBUG_Error(0, "DSPB_CreateWindow: invalid window buffer or length %d", length);
        return 0;
    }
    const auto terms = cosine_terms(kind);
    if (!terms && kind != DSPB_WINDOW_TRIANGULAR) {
        BLDEBUG_Error(0, "DSPB_CreateWindow: unknown window kind %d", kind);
        return 0;
    }
    if (length == 1) {  // every periodic form would be 0 or 1 here; 1 keeps the frame
        window[0] = 1.0f;
        return 1;
    }
    const double half = length / 2.0;
    const double step = 2.0 * std::numbers::pi / length;
    for (int n = 0; n < length; ++n) {
        double w;
        if (terms) {
            const auto &a = *terms;
            const double x = step * n;
            w = a[0] - a[1] * std::cos(x) + a[2] * std::cos(2 * x) - a[3] * std::cos(3 * x);
        } else {
            w = 1.0 - std::fabs(n - half) / half;
        }
        window[n] = static_cast<float>(w);
    }
    return 1;
}

int DSPB_ApplyWindow(const float *window, float *buffer, int length)
{
    if (!window || !buffer || !valid_length(length))
        return 0;
    for (int n = 0; n < length; ++n)
        buffer[n] *= window[n];
    return 1;
}

double DSPB_GetWindowNormFactor(const float *window, int length)
{
    if (!window || !valid_length(length))
        return 0.0;
    double sum = 0.0;
    for (int n = 0; n < length; ++n)
        sum += window[n];
    return sum;
}

}  // extern "C"
