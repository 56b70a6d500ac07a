// Creating, growing and destroying canvases; the Qt entry points.
#include "control/velmacckeys.h"
#include "outside/base/blbase.h"
#include "render/canvas/canvas_internal.h"
#include "widgets/resources/velmresources.h"
#include "render/canvas/qt/qtcanvas_internal.h"

#include <algorithm>
#include <atomic>
#include <new>

using velm::canvas::Call;
using Ops = _VELMCANVASOPS;

namespace {

// Canvases are never shorter than this: the view's fixed strips need it.
constexpr int kMinimumHeight = 80;

std::atomic<velm::canvas::DestroyListener> destroy_listener{nullptr};

} // namespace

void velm::canvas::SetDestroyListener(DestroyListener listener)
{
    destroy_listener = listener;
}

VELMCANVAS VELMCANVAS_CreateCanvas(const _VELMCANVASOPS *ops, void *native, int width, int height)
{
    if (!ops || !ops->CreateCanvas || width <= 0 || height <= 0) return nullptr;
    _VELMCANVASDATA *data = ops->CreateCanvas(native, width, height);
    if (!data) return nullptr;
    auto *canvas = new (std::nothrow) _VELMCANVAS{width, height, native, ops, data};
    if (!canvas && ops->DestroyCanvas) ops->DestroyCanvas(data);
    return canvas;
}

VELMCANVAS VELMCANVAS_CreateCanvasQT(void *native, int width, int height)
{
    VELMCANVAS canvas = VELMCANVAS_CreateCanvas(&velm::canvas::qt::Operations(), native, width, height);
    if (canvas) VELMRESOURCES_Load();
    return canvas;
}

VELMCANVASIMAGE VELMCANVAS_LoadImageQT(const void *bytes, int64_t length)
{
    const _VELMCANVASOPS &ops = velm::canvas::qt::Operations();
    if (!bytes || length <= 0 || !ops.LoadImage) return nullptr;
    return ops.LoadImage(bytes, length);
}

int VELMCANVAS_DestroyCanvas(VELMCANVAS canvas)
{
    if (!canvas) return 0;
    if (const velm::canvas::DestroyListener listener = destroy_listener) listener(canvas);
    Call<&Ops::DestroyCanvas>(canvas, 0);
    delete canvas;
    return 1;
}

int VELMCANVAS_ResizeCanvas(VELMCANVAS canvas, int width, int height)
{
    if (!velm::canvas::Usable(canvas) || width <= 0 || height <= 0) return 0;
    height = std::max(height, kMinimumHeight);
    if (width > canvas->width || height > canvas->height) {
        canvas->width = std::max(canvas->width, width);
        canvas->height = std::max(canvas->height, height);
        Call<&Ops::DestroyCanvas>(canvas, 0);
        canvas->data = canvas->ops->CreateCanvas ? canvas->ops->CreateCanvas(canvas->native, canvas->width, canvas->height)
                                                 : nullptr;
        if (!canvas->data) {
            BLDEBUG_TerminalError(-1, "VELMCANVAS_ResizeCanvas: Unable to create new canvas with dimensions = (%d,%d)",
                                  canvas->width, canvas->height);
            return 0;
        }
        BLDEBUG_Log(0, "VELMCANVAS_ResizeCanvas: Canvas resized (%d,%d)", canvas->width, canvas->height);
    }
    return Call<&Ops::ResizeCanvas>(canvas, 0, width, height);
}

int VELMCANVAS_GetDisplayWidth(void)
{
    return BLUTILS_GetDisplayWidth();
}

int VELMCANVAS_GetDisplayHeight(void)
{
    return BLUTILS_GetDisplayHeight();
}

uint32_t VELMCANVAS_TranslateAccKeys(uint32_t keys)
{
    return VELMDEFINES_TranslateAccKeys(keys);
}
