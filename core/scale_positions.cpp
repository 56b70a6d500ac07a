// Positions along the horizontal scale: a tenth of its step for fine moves,
// two steps for tick moves.
#include <algorithm>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "render/view/velmscales.h"

namespace {

int64_t scale_step(VELMAUDIO doc)
{
    return VELMDRAW_GetHorzScaleStep(doc->renderer);
}

int64_t next_multiple(int64_t p, int64_t s)
{
    return (p + s) - ((p + s) % s);
}

int64_t previous_multiple(int64_t p, int64_t s)
{
    return p % s != 0 ? p - (p % s) : p - s;
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
