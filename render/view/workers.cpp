// Worker threads of the lanes: at most one per lane, joined before drawing.
#include "core/document_internal.hpp"
#include "core/velmqueries.h"
#include "render/view/drawer_internal.hpp"

namespace velm::view {

void finish_worker(Lane *lane)
{
    if (!lane->worker) return;
    BLTHREAD_EndThread(lane->worker, 1);
    lane->worker = nullptr;
}

int run_order(VELMDRAW drawer, Lane *lane, int first, int last, int threshold, BLTHREAD_Body body)
{
    // The previous worker still reads the order: end it before rewriting.
    finish_worker(lane);
    lane->order = WorkOrder{drawer, lane, first, last, 0, VELMAUDIO_GetChangeTime(drawer->document)};
    if (last - first <= threshold) {
        body(&lane->order);
        return 1;
    }
    lane->order.threaded = 1;
    lane->worker = BLTHREAD_AddThread(body, &lane->order, 0);
    return lane->worker != nullptr;
}

void join_workers(VELMDRAW drawer)
{
    for (Lane &lane : drawer->lanes) finish_worker(&lane);
}

} // namespace velm::view

int VELMDRAW_ClearProcessThreads(VELMDRAW drawer)
{
    if (!drawer) return 0;
    // Workers write into the lanes' display data, which outlive this call;
    // joining is the only safe end for them.
    velm::view::join_workers(drawer);
    return 1;
}
