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

// Canvases are drawn on and destroyed on the shell's interface thread, and
// the drawers' workers never touch the canvas: no drawer lock is taken here,
// which also keeps this lock from ever being taken inside a drawer's.
void forget_canvas(VELMCANVAS canvas)
{
    std::lock_guard guard(registry_lock);
    for (VELMDRAW drawer : live_drawers())
        if (drawer->canvas == canvas) drawer->canvas = nullptr;
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
