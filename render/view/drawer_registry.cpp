// The live drawers, so that a canvas the host destroys is forgotten by every
// drawer that drew on it: the drawer keeps the canvas of its last frame for
// measuring text between frames.
#include <algorithm>
#include <mutex>
#include <vector>

#include "render/canvas/canvas_internal.h"
#include "render/view/drawer_internal.hpp"

namespace {

std::mutex registry_lock;
std::vector<VELMDRAW> &live_drawers()
{
    static std::vector<VELMDRAW> drawers;
    return drawers;
}

void forget_canvas(VELMCANVAS canvas)
{
    std::lock_guard guard(registry_lock);
    for (VELMDRAW drawer : live_drawers()) {
        MutexLock(drawer->lock);
        if (drawer->canvas == canvas) drawer->canvas = nullptr;
        MutexUnlock(drawer->lock);
    }
}

} // namespace

void velm::view::register_drawer(VELMDRAW drawer)
{
    std::lock_guard guard(registry_lock);
    if (live_drawers().empty()) velm::canvas::SetDestroyListener(forget_canvas);
    live_drawers().push_back(drawer);
}

void velm::view::unregister_drawer(VELMDRAW drawer)
{
    std::lock_guard guard(registry_lock);
    std::vector<VELMDRAW> &drawers = live_drawers();
    drawers.erase(std::remove(drawers.begin(), drawers.end(), drawer), drawers.end());
}
