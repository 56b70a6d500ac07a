// Positions along the horizontal scale: a tenth of its step for fine moves,
// two steps for tick moves.
#include <algorithm>
#include <cstdint>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "render/view/velmscales.h"

namespace {

int64_t scale_step(VELMAUDIO doc)
{
    return VELMDRAW_GetHorzScaleStep(doc->renderer);
}

// Both stay on the last multiple the 64-bit positions hold instead of wrapping.
int64_t next_multiple(int64_t p, int64_t s)
{
    if (p > INT64_MAX - s) return INT64_MAX - INT64_MAX % s;
    return (p + s) - ((p + s) % s);
}

int64_t previous_multiple(int64_t p, int64_t s)
{
    if (p % s != 0) return p - (p % s);
    return p < INT64_MIN + s ? p : p - s;
}

bool ready(VELMAUDIO doc)
{
    return doc && doc->signal && doc->renderer;
}

int64_t fine_step(VELMAUDIO doc)
{
    return std::max<int64_t>(scale_step(doc) / 10, 1);
}

int64_t tick_step(VELMAUDIO doc)
{
    return std::max<int64_t>(scale_step(doc) * 2, 1);
}

} // namespace

int64_t VELMAUDIO_GetNextPosition(VELMAUDIO doc, int64_t p)
{
    return ready(doc) ? next_multiple(p, fine_step(doc)) : 0;
}

int64_t VELMAUDIO_GetPrevPosition(VELMAUDIO doc, int64_t p)
{
    return ready(doc) ? previous_multiple(p, fine_step(doc)) : 0;
}

int64_t VELMAUDIO_GetNextTickPosition(VELMAUDIO doc, int64_t p)
{
    return ready(doc) ? next_multiple(p, tick_step(doc)) : 0;
}

int64_t VELMAUDIO_GetPrevTickPosition(VELMAUDIO doc, int64_t p)
{
    return ready(doc) ? previous_multiple(p, tick_step(doc)) : 0;
}
