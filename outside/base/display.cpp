/* The screen size the host reports, and sleeping. */
#include "outside/base/blbase.h"

#include <atomic>
#include <chrono>
#include <thread>

namespace {

std::atomic<int> display_width{1920};
std::atomic<int> display_height{1080};

} // namespace

int BLUTILS_GetDisplayWidth(void)
{
    return display_width;
}

int BLUTILS_GetDisplayHeight(void)
{
    return display_height;
}

void BLUTILS_SetDisplaySize(int width, int height)
{
    if (width <= 0 || height <= 0) return;
    display_width = width;
    display_height = height;
}

void BLUTILS_sleep_msec(int milliseconds)
{
    if (milliseconds > 0) std::this_thread::sleep_for(std::chrono::milliseconds(milliseconds));
}
