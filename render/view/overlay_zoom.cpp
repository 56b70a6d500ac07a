// Zoom overlays: the bars at the zoom limits (handles for the hit test), the
// smart-zoom button and the rubber-band quick box.
#include <algorithm>
#include <array>
#include <cstdint>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "render/view/overlay_internal.hpp"
#include "render/view/velmoverlays.h"
#include "widgets/resources/velmresources.h"

using namespace velm::view;

namespace {

constexpr int kBarWidth = 9;
constexpr int kBarShadow = 5;

// Arrow glyphs, 3 x 5 premultiplied ARGB, bottom row first.
constexpr uint32_t W = 0xFFFFFFFFu, O = 0;
constexpr std::array<uint32_t, 15> kArrowRight = {W, O, O, W, W, O, W, W, W, W, W, O, W, O, O};
constexpr std::array<uint32_t, 15> kArrowLeft = {O, O, W, O, W, W, W, W, W, O, W, W, O, O, W};

void put_arrow(VELMCANVAS canvas, const std::array<uint32_t, 15> &glyph, int x, int y)
{
    VELMCANVAS_PutImage(canvas, x, y, 3, 5, glyph.data(), 3, 5, VELMIMAGEFORMAT_ARGB32_PREMULTIPLIED, 0, 0, 3, 5);
}

// The face of each smart-zoom action (1 to 6).
VELMCANVASIMAGE zoom_face(int action)
{
    switch (action) {
    case 1: return Img_ZoomSelection;
    case 2: return Img_ZoomIn;
    case 3: return Img_ZoomOut;
    case 4: return Img_ZoomFull;
    case 5: return Img_ZoomVertIn;
    case 6: return Img_ZoomVertOut;
    default: return nullptr;
    }
}

} // namespace

namespace velm::view {

int draw_zoom_limit_bar(VELMDRAW d, int which)
{
    _VELMRECT &handle = d->overlay.zoomLimitHandles[which == 1 ? 0 : 1];
    handle = _VELMRECT{};
    const bool begin = which == 1;
    const int64_t limit = begin ? VELMAUDIO_ViewBeginLimit(d->document) : VELMAUDIO_ViewEndLimit(d->document);
    const int column = column_of(&d->mainBase, static_cast<double>(limit));
    const int left = d->display.left + column - (begin ? 0 : kBarWidth - 1);
    const int height = std::max(0, d->lanesArea.height - 1);
    handle = intersect(make_rect(left, d->display.top, kBarWidth, height), d->display);
    if (is_empty(handle)) return 1;
    const _VELMRECT &bar = handle;
    VELMCANVAS canvas = d->canvas;
    // The shadow falls inside the view, the outer side may be hit: both are
    // saved.
    const _VELMRECT covered = make_rect(bar.left - kBarShadow, bar.top, bar.width + 2 * kBarShadow, bar.height);
    VELMCANVAS_SaveOverlayRect(canvas, &covered);
    mark_dirty_rect(d, covered);
    VELMCANVAS_SetDrawArea(canvas, &d->display);
    const int outer = begin ? left : left + kBarWidth - 1;
    const int inner = begin ? outer + kBarWidth - 1 : outer - (kBarWidth - 1);
    fill_alpha(canvas, bar, 0xFFFFFFu, 0.4f);
    VELMCANVAS_SetAlphaFactor(canvas, 0.4f);
    draw_hline(canvas, bar.left, bar.right, bar.top);
    draw_hline(canvas, bar.left, bar.right, bar.bottom);
    draw_vline(canvas, outer, bar.top, bar.bottom);
    draw_vline(canvas, inner, bar.top, bar.bottom);
    VELMCANVAS_SetAlphaFactor(canvas, 1.0f);
    VELMCANVAS_SelectShadowColor(canvas, 0);
    VELMCANVAS_ShadowRect(canvas, bar.left, bar.top, bar.width, bar.height, kBarShadow,
                          begin ? 0x66BFF000u : 0x66EFF000u);
    // Arrows in the bar's middle columns: towards the inside at the top and
    // near the bottom, back out just under them.
    const int x = begin ? left + 3 : left + kBarWidth - 6;
    const auto &in = begin ? kArrowRight : kArrowLeft;
    const auto &out = begin ? kArrowLeft : kArrowRight;
    put_arrow(canvas, in, x, bar.top + 17);
    put_arrow(canvas, in, x, bar.bottom - 22);
    put_arrow(canvas, out, x, bar.bottom - 15);
    VELMCANVAS_ClearDrawArea(canvas);
    return 1;
}

} // namespace velm::view

int VELMDRAW_DrawZoomButton(VELMDRAW drawer)
{
    if (!drawer || !drawer->canvas || !drawer->state) return 0;
    const _VELMRECT &r = drawer->zoomButton;
    const VELMCANVASIMAGE face = zoom_face(drawer->state->smartZoomAction);
    if (is_empty(r) || !face) return 1;
    VELMCANVAS_SaveOverlayRect(drawer->canvas, &r);
    VELMCANVAS_PasteImageScaled(drawer->canvas, face, r.left, r.top, r.width, r.height);
    mark_dirty_rect(drawer, r);
    return 1;
}

int VELMDRAW_AdjustQuickBox(VELMDRAW drawer, const VELMQUICKBOX *box, _VELMRECT *out, int area_coordinates)
{
    if (!out) return 0;
    *out = _VELMRECT{};
    if (!drawer || !drawer->laidOut || !box || box->width == 0 || box->height == 0) return 0;
    // The corner opposite the origin: the size is corner - origin + 1, also
    // when dragged up or left.
    const int64_t x2 = static_cast<int64_t>(box->x) + box->width - 1;
    const int64_t y2 = static_cast<int64_t>(box->y) + box->height - 1;
    for (int i = 0; i < drawer->laneCount; ++i) {
        const Lane &lane = drawer->lanes[static_cast<size_t>(i)];
        const _VELMRECT &a = lane.area;
        if (!lane.shown || lane.kind == VELMDRAW_LANE_NAVIGATOR || is_empty(a)) continue;
        if (box->x < a.left || box->x > a.right || box->y < a.top || box->y > a.bottom) continue;
        const int32_t left = static_cast<int32_t>(std::clamp<int64_t>(std::min<int64_t>(box->x, x2), a.left, a.right));
        const int32_t right = static_cast<int32_t>(std::clamp<int64_t>(std::max<int64_t>(box->x, x2), a.left, a.right));
        const int32_t top = static_cast<int32_t>(std::clamp<int64_t>(std::min<int64_t>(box->y, y2), a.top, a.bottom));
        const int32_t bottom = static_cast<int32_t>(std::clamp<int64_t>(std::max<int64_t>(box->y, y2), a.top, a.bottom));
        *out = make_rect(left, top, right - left + 1, bottom - top + 1);
        if (area_coordinates) *out = make_rect(left - a.left, top - a.top, out->width, out->height);
        return 1;
    }
    return 0;
}

int VELMDRAW_ShowQuickBox(VELMDRAW drawer, const VELMQUICKBOX *box)
{
    if (!drawer || !drawer->canvas || !box) return 0;
    _VELMRECT r{};
    if (!VELMDRAW_AdjustQuickBox(drawer, box, &r, 0)) return 1;
    fill_alpha(drawer->canvas, r, 0xFFFFFFu, 0.25f);
    fill_alpha(drawer->canvas, make_rect(r.left + 1, r.top + 1, r.width - 2, r.height - 2), 0, 0.15f);
    mark_dirty_rect(drawer, r);
    return 1;
}
