// Rectangles and the mapping between real values and the pixels of a drawing area.
#include "core/velmutil.h"

#include <algorithm>
#include <cmath>
#include <cstdint>

namespace {

// A degenerate area (zero size or extent) maps everything to its origin
// instead of dividing by zero.
double safe_ratio(double numerator, double denominator)
{
    return denominator != 0.0 ? numerator / denominator : 0.0;
}

int32_t to_pixel(double value)
{
    if (!std::isfinite(value)) return 0;
    return static_cast<int32_t>(std::clamp(std::trunc(value), -2147483648.0, 2147483647.0));
}

// Edges and sizes of rectangles near the ends of the 32-bit range stay at those ends.
int32_t saturated(int64_t value)
{
    return static_cast<int32_t>(std::clamp<int64_t>(value, INT32_MIN, INT32_MAX));
}

} // namespace

int VELMUTIL_IsInsideRect(const _VELMRECT *r, int x, int y)
{
    if (!r) return 0;
    return int64_t{r->left} <= x && x < int64_t{r->left} + r->width && int64_t{r->top} <= y &&
                   y < int64_t{r->top} + r->height
               ? 1
               : 0;
}

int VELMUTIL_IsInsideArea(const VELMAREA *area, int x, int y)
{
    return area ? VELMUTIL_IsInsideRect(&area->rect, x, y) : 0;
}

int VELMUTIL_IsOverRectBorder(const _VELMRECT *r, int mask, int x, int y)
{
    if (!VELMUTIL_IsInsideRect(r, x, y)) return 0;
    const int64_t right = int64_t{r->left} + r->width, bottom = int64_t{r->top} + r->height;
    if ((mask & VELMUTIL_BORDER_LEFT) && int64_t{r->left} - 1 <= x && x <= int64_t{r->left} + 2) return 1;
    if ((mask & VELMUTIL_BORDER_TOP) && int64_t{r->top} - 1 <= y && y <= int64_t{r->top} + 2) return 1;
    if ((mask & VELMUTIL_BORDER_RIGHT) && right - 2 <= x && x <= right + 1) return 1;
    if ((mask & VELMUTIL_BORDER_BOTTOM) && bottom - 2 <= y && y <= bottom + 1) return 1;
    return 0;
}

int VELMUTIL_IsOverAreaBorder(const VELMAREA *area, int mask, int x, int y)
{
    if (!VELMUTIL_IsInsideArea(area, x, y) || area->rect.width <= 30) return 0;
    return VELMUTIL_IsOverRectBorder(&area->rect, mask, x, y);
}

int VELMUTIL_CompareRect(const _VELMRECT *a, const _VELMRECT *b)
{
    return a && b && a->left == b->left && a->top == b->top && a->width == b->width && a->height == b->height;
}

int VELMUTIL_EvalDimensions(_VELMRECT *r, int mode)
{
    if (!r) return 0;
    switch (mode) {
    case 2:
        r->width = saturated(int64_t{r->right} + 1 - r->left);
        r->height = saturated(int64_t{r->bottom} + 1 - r->top);
        return r->width > 0 && r->height > 0;
    case 4:
        r->right = saturated(int64_t{r->left} + r->width - 1);
        r->bottom = saturated(int64_t{r->top} + r->height - 1);
        return 1;
    case 1:
        r->left = saturated(int64_t{r->right} + 1 - r->width);
        r->top = saturated(int64_t{r->bottom} + 1 - r->height);
        return 1;
    default:
        return 0;
    }
}

_VELMRECT *VELMUTIL_DefineRect(_VELMRECT *out, int left, int top, int width, int height)
{
    if (!out) return nullptr;
    out->left = left;
    out->top = top;
    out->width = width;
    out->height = height;
    VELMUTIL_EvalDimensions(out, 4);
    return out;
}

_VELMRECT *VELMUTIL_ComposeRect(_VELMRECT *out, const _VELMRECT *a, const _VELMRECT *b)
{
    if (!out || !a || !b) return out;
    const _VELMRECT x = *a, y = *b; // out may be a or b
    out->left = std::min(x.left, y.left);
    out->top = std::min(x.top, y.top);
    out->right = std::max(x.right, y.right);
    out->bottom = std::max(x.bottom, y.bottom);
    VELMUTIL_EvalDimensions(out, 2);
    return out;
}

_VELMRECT *VELMUTIL_ExtractRectFromArea(_VELMRECT *out, const VELMAREA *area)
{
    if (!out) return nullptr;
    if (area)
        *out = area->rect;
    else
        *out = _VELMRECT{0, 0, 0, 0, -1, -1};
    return out;
}

int32_t VELMUTIL_ConvertRealYtoDisplayY(const VELMAREA *area, double y)
{
    if (!area) return 0;
    const int32_t d = to_pixel(area->yOrigin - safe_ratio(area->rect.height * y, area->yExtent));
    return area->realToDisplayY ? to_pixel(area->realToDisplayY(d)) : d;
}

double VELMUTIL_ConvertDisplayYtoRealY(const VELMAREA *area, int32_t row)
{
    if (!area) return 0.0;
    const double v = safe_ratio((static_cast<double>(area->yOrigin) - row) * area->yExtent, area->rect.height);
    return area->displayToRealY ? area->displayToRealY(v) : v;
}

int32_t VELMUTIL_ConvertRealXtoDisplayX(const VELMAREA *area, double x)
{
    if (!area) return 0;
    const int32_t d = to_pixel(safe_ratio(area->rect.width * x, area->xExtent) + area->xOrigin);
    return area->realToDisplayX ? to_pixel(area->realToDisplayX(d)) : d;
}

double VELMUTIL_ConvertDisplayXtoRealX(const VELMAREA *area, int32_t column)
{
    if (!area) return 0.0;
    const double v = safe_ratio((static_cast<double>(column) - area->xOrigin) * area->xExtent, area->rect.width);
    return area->displayToRealX ? area->displayToRealX(v) : v;
}
