// Composite operations built on the table: tiling, single characters and the
// picture frame around regions.
#include "render/canvas/canvas_internal.h"
#include "widgets/resources/velmresources.h"

#include <algorithm>

int VELMCANVAS_TileImage(VELMCANVAS canvas, VELMCANVASIMAGE image, const _VELMRECT *rect)
{
    if (!velm::canvas::Usable(canvas) || !image || !rect) return 0;
    const int image_width = VELMCANVAS_ImageWidth(canvas, image);
    const int image_height = VELMCANVAS_ImageHeight(canvas, image);
    int max_width = 0, max_height = 0;
    if (image_width < 1 || image_height < 1 || !VELMCANVAS_GetMaxDimension(canvas, &max_width, &max_height) ||
        !VELMCANVAS_SetDrawArea(canvas, rect)) {
        return 0;
    }
    // Tiles that start past the surface cannot show, so a huge rectangle
    // costs no more than the surface.
    const int columns_end = std::min(rect->width, max_width - rect->left);
    const int rows_end = std::min(rect->height, max_height - rect->top);
    bool tiling = true;
    for (int dx = 0; tiling && dx < columns_end; dx += image_width) {
        for (int dy = 0; tiling && dy < rows_end; dy += image_height) {
            tiling = VELMCANVAS_PasteImage(canvas, image, rect->left + dx, rect->top + dy);
        }
    }
    // The clip is always lifted, so a failed paste does not leave it on.
    const int cleared = VELMCANVAS_ClearDrawArea(canvas);
    return tiling && cleared;
}

int VELMCANVAS_DrawChar(VELMCANVAS canvas, int x, int y, char character, int min_width)
{
    if (!velm::canvas::Usable(canvas)) return 0;
    const char text[2] = {character, '\0'};
    const int width = VELMCANVAS_TextWidth(canvas, text);
    const int cell = std::max(width, min_width);
    VELMCANVAS_TextOut(canvas, x + (cell - width) / 2, y, text);
    return x + cell;
}

namespace {

// Pastes a picture of the set, when the set is linked in.
void PastePiece(VELMCANVAS canvas, VELMCANVASIMAGE piece, int x, int y)
{
    if (piece) VELMCANVAS_PasteImage(canvas, piece, x, y);
}

void PastePieceScaled(VELMCANVAS canvas, VELMCANVASIMAGE piece, int x, int y, int width, int height)
{
    if (piece) VELMCANVAS_PasteImageScaled(canvas, piece, x, y, width, height);
}

} // namespace

int VELMCANVAS_BevelRect(VELMCANVAS canvas, int x, int y, int width, int height)
{
    int corner = 32;
    if (!velm::canvas::ConstrainRect(canvas, x, y, width, height, corner)) return 0;
    const int bottom = y + height - 8;
    const int side_height = height - 17;
    if (width > 12) {
        const int right = x + width - 6;
        PastePiece(canvas, Img_RegionRoundTopLeftOpen, x - 6, y - 3);
        PastePieceScaled(canvas, Img_RegionRoundLeftOpen, x - 6, y + 9, 12, side_height);
        PastePiece(canvas, Img_RegionRoundBottomLeftOpen, x - 6, bottom);
        PastePiece(canvas, Img_RegionRoundTopRightOpen, right, y - 3);
        PastePieceScaled(canvas, Img_RegionRoundRightOpen, right, y + 9, 12, side_height);
        PastePiece(canvas, Img_RegionRoundBottomRightOpen, right, bottom);
        PastePieceScaled(canvas, Img_RegionRectTopOpen, x + 6, y - 3, width - 12, 12);
        PastePieceScaled(canvas, Img_RegionRectBottomOpen, x + 6, bottom, width - 12, 16);
    } else {
        const int right = x + width - 2;
        PastePiece(canvas, Img_RegionRectTopLeft, x, y - 3);
        PastePieceScaled(canvas, Img_RegionRectLeft, x, y + 9, 2, side_height);
        PastePiece(canvas, Img_RegionRectBottomLeft, x, bottom);
        PastePiece(canvas, Img_RegionRectTopRight, right, y - 3);
        PastePieceScaled(canvas, Img_RegionRectRight, right, y + 9, 2, side_height);
        PastePiece(canvas, Img_RegionRectBottomRight, right, bottom);
        PastePieceScaled(canvas, Img_RegionRectTopOpen, x + 2, y - 3, width - 4, 12);
        PastePieceScaled(canvas, Img_RegionRectBottomOpen, x + 2, bottom, width - 4, 16);
    }
    return 1;
}
