// The exported guards: each checks its own arguments, then forwards to the
// operations table through Call(), which checks the canvas and the slot.
#include "render/canvas/canvas_internal.h"

using velm::canvas::Call;
using velm::canvas::CallWithoutData;
using velm::canvas::ConstrainRect;
using Ops = _VELMCANVASOPS;

void *VELMCANVAS_GetOutputHandle(VELMCANVAS canvas)
{
    return Call<&Ops::GetOutputHandle>(canvas, static_cast<void *>(nullptr));
}

void *VELMCANVAS_GetDrawObject(VELMCANVAS canvas)
{
    return Call<&Ops::GetDrawObject>(canvas, static_cast<void *>(nullptr));
}

int VELMCANVAS_SetDrawObject(VELMCANVAS canvas, void *object)
{
    if (!object) return 0;
    return Call<&Ops::SetDrawObject>(canvas, 0, object);
}

int VELMCANVAS_SelectTarget(VELMCANVAS canvas, int target)
{
    return Call<&Ops::SelectTarget>(canvas, 0, target);
}

int VELMCANVAS_BeginDraw(VELMCANVAS canvas, void *painter)
{
    return Call<&Ops::BeginDraw>(canvas, 0, painter);
}

int VELMCANVAS_EndDraw(VELMCANVAS canvas)
{
    return Call<&Ops::EndDraw>(canvas, 0);
}

int VELMCANVAS_UseLowProfile(VELMCANVAS canvas, int on)
{
    return Call<&Ops::UseLowProfile>(canvas, 0, on);
}

int VELMCANVAS_CopyCanvas(VELMCANVAS canvas, int source, int destination)
{
    return Call<&Ops::CopyCanvas>(canvas, 0, source, destination);
}

int VELMCANVAS_InitPath(VELMCANVAS canvas)
{
    return Call<&Ops::InitPath>(canvas, 0);
}

int VELMCANVAS_ClosePath(VELMCANVAS canvas)
{
    return Call<&Ops::ClosePath>(canvas, 0);
}

int VELMCANVAS_Clear(VELMCANVAS canvas)
{
    return Call<&Ops::Clear>(canvas, 0);
}

int VELMCANVAS_ProtectDrawArea(VELMCANVAS canvas, const _VELMRECT *rect)
{
    if (!rect) return 0;
    return Call<&Ops::ProtectDrawArea>(canvas, 0, rect);
}

int VELMCANVAS_SetDrawArea(VELMCANVAS canvas, const _VELMRECT *rect)
{
    if (!rect) return 0;
    return Call<&Ops::SetDrawArea>(canvas, 0, rect);
}

int VELMCANVAS_ClearDrawArea(VELMCANVAS canvas)
{
    return Call<&Ops::ClearDrawArea>(canvas, 0);
}

int VELMCANVAS_GetDimension(VELMCANVAS canvas, int *width, int *height)
{
    if (!width || !height) return 0;
    return Call<&Ops::GetDimension>(canvas, 0, width, height);
}

int VELMCANVAS_GetMaxDimension(VELMCANVAS canvas, int *width, int *height)
{
    if (!width || !height) return 0;
    return Call<&Ops::GetMaxDimension>(canvas, 0, width, height);
}

int VELMCANVAS_DrawPoint(VELMCANVAS canvas, int x, int y, uint32_t color)
{
    if (x < 0 || y < 0) return 0;
    return Call<&Ops::DrawPoint>(canvas, 0, x, y, color);
}

int VELMCANVAS_MoveTo(VELMCANVAS canvas, int x, int y)
{
    return Call<&Ops::MoveTo>(canvas, 0, x, y);
}

int VELMCANVAS_LineTo(VELMCANVAS canvas, int x, int y)
{
    return Call<&Ops::LineTo>(canvas, 0, x, y);
}

int VELMCANVAS_DrawPolygon(VELMCANVAS canvas, const int *xs, const int *ys, int count, uint32_t fill)
{
    if (!xs || !ys || count < 1) return 0;
    return Call<&Ops::DrawPolygon>(canvas, 0, xs, ys, count, fill);
}

int VELMCANVAS_DrawPolyline(VELMCANVAS canvas, const int *xs, const int *ys, int count)
{
    if (!xs || !ys || count < 1) return 0;
    return Call<&Ops::DrawPolyline>(canvas, 0, xs, ys, count);
}

int VELMCANVAS_DrawLine(VELMCANVAS canvas, int x1, int y1, int x2, int y2)
{
    return Call<&Ops::DrawLine>(canvas, 0, x1, y1, x2, y2);
}

int VELMCANVAS_TextOut(VELMCANVAS canvas, int x, int y, const char *text)
{
    if (!text) return 0;
    return Call<&Ops::TextOut>(canvas, 0, x, y, text);
}

int VELMCANVAS_TextOutVertical(VELMCANVAS canvas, int x, int y, const char *text)
{
    if (!text) return 0;
    return Call<&Ops::TextOutVertical>(canvas, 0, x, y, text);
}

int VELMCANVAS_SaveOverlay(VELMCANVAS canvas, int x, int y, int width, int height)
{
    return Call<&Ops::SaveOverlay>(canvas, 0, x, y, width, height);
}

int VELMCANVAS_SaveOverlayRect(VELMCANVAS canvas, const _VELMRECT *rect)
{
    if (!rect) return 0;
    return VELMCANVAS_SaveOverlay(canvas, rect->left, rect->top, rect->width, rect->height);
}

int VELMCANVAS_GetOverlayRect(VELMCANVAS canvas, _VELMRECT *rect)
{
    if (!rect) return 0;
    return Call<&Ops::GetOverlayRect>(canvas, 0, rect);
}

int VELMCANVAS_RestoreOverlay(VELMCANVAS canvas)
{
    return Call<&Ops::RestoreOverlay>(canvas, 0);
}

VELMCANVASIMAGE VELMCANVAS_CreateImage(VELMCANVAS canvas, int width, int height)
{
    if (width < 1 || height < 1) return nullptr;
    return Call<&Ops::CreateImage>(canvas, VELMCANVASIMAGE{}, width, height);
}

int VELMCANVAS_CopyImage(VELMCANVAS canvas, int x, int y, int width, int height, VELMCANVASIMAGE image)
{
    if (!image || width < 1 || height < 1) return 0;
    return Call<&Ops::CopyImage>(canvas, 0, x, y, width, height, image);
}

int VELMCANVAS_PasteImage(VELMCANVAS canvas, VELMCANVASIMAGE image, int x, int y)
{
    if (!image) return 0;
    return Call<&Ops::PasteImage>(canvas, 0, image, x, y);
}

int VELMCANVAS_PasteImageScaled(VELMCANVAS canvas, VELMCANVASIMAGE image, int x, int y, int width,
                                int height)
{
    if (!image) return 0;
    return Call<&Ops::PasteImageScaled>(canvas, 0, image, x, y, width, height);
}

int VELMCANVAS_DestroyImage(VELMCANVAS canvas, VELMCANVASIMAGE image)
{
    if (!image) return 0;
    return CallWithoutData<&Ops::DestroyImage>(canvas, 0, image);
}

int VELMCANVAS_ImageWidth(VELMCANVAS canvas, VELMCANVASIMAGE image)
{
    if (!image) return 0;
    return CallWithoutData<&Ops::ImageWidth>(canvas, 0, image);
}

int VELMCANVAS_ImageHeight(VELMCANVAS canvas, VELMCANVASIMAGE image)
{
    if (!image) return 0;
    return CallWithoutData<&Ops::ImageHeight>(canvas, 0, image);
}

int VELMCANVAS_PutImage(VELMCANVAS canvas, int x, int y, int width, int height, const void *pixels,
                        int image_width, int image_height, int format, int source_x, int source_y,
                        int source_width, int source_height)
{
    if (!pixels) return 0;
    return Call<&Ops::PutImage>(canvas, 0, x, y, width, height, pixels, image_width, image_height,
                                format, source_x, source_y, source_width, source_height);
}

namespace {

constexpr uint32_t kCornerMask = VELMCANVASRECTOPT_CORNERMASK;
constexpr uint32_t kSquareCorners = 0xF0000;   // bits 16-19
constexpr uint32_t kShapeFlags = 0xFFFFF800;   // bits 11-31
constexpr uint32_t kGradientFlags = 0xFFC00;   // bits 10-19
constexpr uint32_t kShadowSides = 0xF00000;    // bits 20-23

using RectSlot = int (*_VELMCANVASOPS::*)(_VELMCANVASDATA *, int, int, int, int, int, uint32_t, uint32_t);
using GradientSlot = int (*_VELMCANVASOPS::*)(_VELMCANVASDATA *, int, int, int, int, uint32_t);

template <RectSlot Slot>
int PlainRect(VELMCANVAS canvas, int x, int y, int width, int height, uint32_t options)
{
    int corner = static_cast<int>(options & kCornerMask);
    if (!ConstrainRect(canvas, x, y, width, height, corner)) return 0;
    return Call<Slot>(canvas, 0, x, y, width, height, corner, options & kSquareCorners, options & kShapeFlags);
}

template <GradientSlot Slot>
int GradientRect(VELMCANVAS canvas, int x, int y, int width, int height, uint32_t options)
{
    int corner = static_cast<int>(options & kCornerMask);
    if (!ConstrainRect(canvas, x, y, width, height, corner)) return 0;
    return Call<Slot>(canvas, 0, x, y, width, height, (options & kGradientFlags) | static_cast<uint32_t>(corner));
}

} // namespace

int VELMCANVAS_FillRect(VELMCANVAS canvas, int x, int y, int width, int height, uint32_t options)
{
    return PlainRect<&Ops::FillRect>(canvas, x, y, width, height, options);
}

int VELMCANVAS_BorderRect(VELMCANVAS canvas, int x, int y, int width, int height, uint32_t options)
{
    return PlainRect<&Ops::BorderRect>(canvas, x, y, width, height, options);
}

int VELMCANVAS_FillHorzGradientRect(VELMCANVAS canvas, int x, int y, int width, int height, uint32_t options)
{
    return GradientRect<&Ops::FillHorzGradientRect>(canvas, x, y, width, height, options);
}

int VELMCANVAS_FillVertGradientRect(VELMCANVAS canvas, int x, int y, int width, int height, uint32_t options)
{
    return GradientRect<&Ops::FillVertGradientRect>(canvas, x, y, width, height, options);
}

int VELMCANVAS_ShadowRect(VELMCANVAS canvas, int x, int y, int width, int height, int size, uint32_t options)
{
    if (size <= 0) return 0;
    int corner = static_cast<int>(options & kCornerMask);
    if (!ConstrainRect(canvas, x, y, width, height, corner)) return 0;
    return Call<&Ops::ShadowRect>(canvas, 0, x, y, width, height, size, corner, options & kGradientFlags,
                                  options & kShadowSides, static_cast<int>(options >> 24));
}

int VELMCANVAS_SelectColor(VELMCANVAS canvas, uint32_t color)
{
    return Call<&Ops::SelectColor>(canvas, 0, color & 0xFFFFFF);
}

int VELMCANVAS_SelectColorMap(VELMCANVAS canvas, const VELMCOLORMAP *map)
{
    if (!map) return 0;
    return Call<&Ops::SelectColorMap>(canvas, 0, map);
}

int VELMCANVAS_SelectShadowColor(VELMCANVAS canvas, uint32_t color)
{
    return Call<&Ops::SelectShadowColor>(canvas, 0, color & 0xFFFFFF);
}

int VELMCANVAS_SelectFont(VELMCANVAS canvas, const _VELMCANVASFONT *font)
{
    if (!font) return 0;
    return Call<&Ops::SelectFont>(canvas, 0, font);
}

int VELMCANVAS_SelectFontColor(VELMCANVAS canvas, uint32_t color)
{
    return Call<&Ops::SelectFontColor>(canvas, 0, color);
}

int VELMCANVAS_SelectGradient(VELMCANVAS canvas, uint32_t first, uint32_t second)
{
    return Call<&Ops::SelectGradient>(canvas, 0, first, second);
}

float VELMCANVAS_SetAlphaFactor(VELMCANVAS canvas, float factor)
{
    // Written so that a NaN factor is refused too.
    if (!(factor >= 0.0f && factor <= 1.0f)) return -1.0f;
    return Call<&Ops::SetAlphaFactor>(canvas, -1.0f, factor);
}

int VELMCANVAS_MoveBlock(VELMCANVAS canvas, int x, int y, int width, int height, int dest_x, int dest_y)
{
    if (width < 1 || height < 1) return 0;
    return Call<&Ops::MoveBlock>(canvas, 0, x, y, width, height, dest_x, dest_y);
}

int VELMCANVAS_MoveBlock2(VELMCANVAS canvas, int source, int x, int y, int width, int height,
                          int destination, int dest_x, int dest_y)
{
    if (width < 1 || height < 1) return 0;
    return Call<&Ops::MoveBlock2>(canvas, 0, source, x, y, width, height, destination, dest_x, dest_y);
}

int VELMCANVAS_TextWidth(VELMCANVAS canvas, const char *text)
{
    if (!text) return 0;
    return Call<&Ops::TextWidth>(canvas, 0, text);
}

int VELMCANVAS_TextHeight(VELMCANVAS canvas, const char *text)
{
    if (!text) return 0;
    return Call<&Ops::TextHeight>(canvas, 0, text);
}

int VELMCANVAS_DrawAlphaRect(VELMCANVAS canvas, int x, int y, int width, int height, int kind)
{
    if (width < 1 || height < 1) return 0;
    return Call<&Ops::DrawAlphaRect>(canvas, 0, x, y, width, height, kind);
}

int VELMCANVAS_DrawImage(VELMCANVAS canvas, int x, int y, int width, int height, const char *path)
{
    if (!path) return 0;
    return Call<&Ops::DrawImage>(canvas, 0, x, y, width, height, path);
}
