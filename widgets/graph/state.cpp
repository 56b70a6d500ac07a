/* The graph's state record: reset and change evaluation. */
#include <cstring>

#include "widgets/graph/velmgraph.h"

int VELMGRAPHSTATE_Reset(VELMGRAPHSTATE *state)
{
    if (!state) return 0;
    std::memset(state, 0, sizeof *state);
    state->changed = 1;
    state->xDecimals = 2;
    state->yDecimals = 2;
    return 1;
}

int VELMGRAPHSTATE_EvalChanges(const VELMGRAPHSTATE *a, const VELMGRAPHSTATE *b)
{
    if (!a || !b) return -1;
    const bool viewDiffers = a->viewXMin != b->viewXMin || a->viewXMax != b->viewXMax ||
                             a->viewYMin != b->viewYMin || a->viewYMax != b->viewYMax;
    const bool scaleDiffers = a->xDecimals != b->xDecimals || a->yDecimals != b->yDecimals ||
                              std::strcmp(a->xUnit, b->xUnit) != 0 || std::strcmp(a->yUnit, b->yUnit) != 0;
    const bool flagsDiffer = (a->flags & ~VELMGRAPHSTATE_FLAG_TITLE) != (b->flags & ~VELMGRAPHSTATE_FLAG_TITLE);
    if (viewDiffers || scaleDiffers || flagsDiffer) return -1;
    int result = 0;
    if (a->trackEnabled != b->trackEnabled || a->trackVisible != b->trackVisible || a->trackX != b->trackX ||
        a->trackY != b->trackY)
        result = 2;
    else if (std::memcmp(a->selection, b->selection, sizeof a->selection) != 0)
        result = 8;
    if ((a->flags & VELMGRAPHSTATE_FLAG_TITLE) != (b->flags & VELMGRAPHSTATE_FLAG_TITLE)) result += 4;
    return result;
}
