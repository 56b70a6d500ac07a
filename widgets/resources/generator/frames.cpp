// The region frame pieces.  The canvas assembles a frame around a region at
// (x, y, width, height) from them:
//
//   wide regions:  round corners 12 x 12 at (x - 6, y - 3) and their mirrors,
//                  round bottom corners 12 x 16 at (x - 6, y + height - 8),
//                  round sides 12 wide from y + 9, stretched down,
//                  top and bottom edges 12 and 16 high, stretched across;
//   narrow ones:   the same with square corners 2 pixels wide and no shade
//                  beside the region.
//
// So every piece reaches 3 rows above the region, 8 below it and, when
// rounded, 6 columns either side.  Rather than drawing each piece on its
// own, a whole model frame is drawn and cut up, so the pieces meet without
// seams; the stretched pieces repeat one middle row or column of the model
// so that stretching leaves them unchanged.
#include "widgets/resources/generator/drawing.h"
#include "widgets/resources/generator/pictures.h"

#include <algorithm>
#include <cmath>

namespace velm::pictures {
namespace {

constexpr int kBeside = 6;     // columns of a rounded piece outside the region
constexpr int kAbove = 3;      // rows of a top piece above the region
constexpr int kBelow = 8;      // rows of a bottom piece below the region
constexpr int kTopHeight = 12; // top pieces: 3 above, 9 inside
constexpr int kBottomHeight = 16;
constexpr int kCornerWidth = 12;
constexpr int kRectSide = 2;   // width of a square corner and side
// Close to the region fill's own rounding (corner size 14), and the arcs end
// exactly where the corner pieces do, so the straight edges join them cleanly.
constexpr qreal kRadius = 6.0;
constexpr int kModelSide = 40; // big enough for straight stretches between corners

// Signed distance from p to a rectangle with rounded corners (negative inside).
qreal Distance(QPointF p, const QRectF &rect, qreal radius)
{
    const QPointF centre = rect.center();
    const qreal qx = std::abs(p.x() - centre.x()) - rect.width() / 2 + radius;
    const qreal qy = std::abs(p.y() - centre.y()) - rect.height() / 2 + radius;
    const qreal outside = std::hypot(std::max(qx, 0.0), std::max(qy, 0.0));
    return outside + std::min(std::max(qx, qy), 0.0) - radius;
}

// The shade outside the region: a soft drop shadow below a plain frame, an
// even white glow around a selected one.  Nothing falls on the region itself,
// whose own fill the canvas draws first.
void PaintShade(QImage &image, FrameLook look, const QRectF &region, qreal radius)
{
    const QRectF dropped = region.translated(0, 2);
    for (int y = 0; y < image.height(); ++y) {
        for (int x = 0; x < image.width(); ++x) {
            const QPointF p(x + 0.5, y + 0.5);
            const qreal outside = std::clamp(Distance(p, region, radius) + 0.5, 0.0, 1.0);
            QColor colour;
            if (look == FrameLook::Plain) {
                const qreal fade = std::clamp(1.0 - std::max(Distance(p, dropped, radius), 0.0) / 6.0, 0.0, 1.0);
                colour = QColor(0, 0, 0);
                colour.setAlphaF(0.55 * fade * fade * outside);
            } else {
                const qreal fade = std::clamp(1.0 - std::max(Distance(p, region, radius), 0.0) / 3.0, 0.0, 1.0);
                colour = QColor(255, 255, 255);
                colour.setAlphaF(0.8 * fade * fade * outside);
            }
            image.setPixelColor(x, y, colour);
        }
    }
}

// The part of the plane lit from the top left: everything above the
// diagonals through the top-right and bottom-left corner arcs.
QPainterPath LitSide(const QRectF &region, qreal radius)
{
    constexpr qreal far = 1000.0;
    const QPointF top_right(region.right() - radius, region.top() + radius);
    const QPointF bottom_left(region.left() + radius, region.bottom() - radius);
    QPainterPath lit;
    lit.moveTo(-far, -far);
    lit.lineTo(top_right + QPointF(far, -far));
    lit.lineTo(top_right);
    lit.lineTo(bottom_left);
    lit.lineTo(bottom_left + QPointF(-far, far));
    lit.closeSubpath();
    return lit;
}

// The rim: a one-pixel line on the region's edge and, one pixel inside, a
// bevel that is light on the top and left and dark on the bottom and right
// (plain), or a faint white line all round (selected).
void PaintRim(QImage &image, FrameLook look, const QRectF &region, qreal radius)
{
    PicturePainter painter(&image);
    painter.setBrush(Qt::NoBrush);
    const bool plain = look == FrameLook::Plain;
    const qreal edge_radius = std::max(radius - 0.5, 0.0);
    painter.setPen(QPen(plain ? QColor(0, 0, 0, 110) : QColor(255, 255, 255, 235), 1.0));
    painter.drawRoundedRect(region.adjusted(0.5, 0.5, -0.5, -0.5), edge_radius, edge_radius);

    const qreal bevel_radius = std::max(radius - 1.5, 0.0);
    const QRectF bevel = region.adjusted(1.5, 1.5, -1.5, -1.5);
    const QPainterPath lit = LitSide(region, radius);
    painter.setClipPath(lit);
    painter.setPen(QPen(plain ? QColor(255, 255, 255, 85) : QColor(255, 255, 255, 95), 1.0));
    painter.drawRoundedRect(bevel, bevel_radius, bevel_radius);
    QPainterPath everything;
    everything.addRect(QRectF(image.rect()));
    painter.setClipPath(everything.subtracted(lit));
    painter.setPen(QPen(plain ? QColor(0, 0, 0, 70) : QColor(255, 255, 255, 95), 1.0));
    painter.drawRoundedRect(bevel, bevel_radius, bevel_radius);
}

// A whole frame around a region of the given size, with the margins the
// pieces of its kind reach into.
QImage DrawModel(FrameLook look, bool rounded, int width, int height)
{
    const int beside = rounded ? kBeside : 0;
    const qreal radius = rounded ? kRadius : 0.0;
    QImage image = NewPicture(width + 2 * beside, height + kAbove + kBelow);
    const QRectF region(beside, kAbove, width, height);
    PaintShade(image, look, region, radius);
    PaintRim(image, look, region, radius);
    return image;
}

// A side where the region runs on past the view: a torn, zigzag edge, drawn
// tiled (its teeth repeat every 6 rows, so 12 rows tile seamlessly).
QImage DrawRaggedLeft()
{
    QImage image = NewPicture(kCornerWidth, kCornerWidth);
    PicturePainter painter(&image);
    QPainterPath edge;
    for (int y = -6, i = 0; y <= kCornerWidth + 6; y += 3, ++i) {
        const QPointF point(kBeside + (i % 2 == 0 ? 0.5 : 3.5), y);
        if (i == 0) edge.moveTo(point);
        else edge.lineTo(point);
    }
    // The strip between the region's straight side and the teeth is shaded.
    QPainterPath teeth = edge;
    teeth.lineTo(kBeside, kCornerWidth + 6);
    teeth.lineTo(kBeside, -6);
    teeth.closeSubpath();
    painter.setPen(Qt::NoPen);
    painter.setBrush(QColor(0, 0, 0, 70));
    painter.drawPath(teeth);
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(QColor(255, 255, 255, 90), 1.0));
    painter.drawPath(edge.translated(1.0, 0));
    painter.setPen(QPen(QColor(0, 0, 0, 130), 1.0));
    painter.drawPath(edge);
    return image;
}

} // namespace

QImage DrawFramePiece(FrameLook look, FramePiece piece)
{
    const int middle = kAbove + kModelSide / 2;
    const int bottom = kAbove + kModelSide - kBelow;
    const int right = kModelSide; // left column of a right-hand rounded piece
    switch (piece) {
    case FramePiece::RoundTopLeft:
        return DrawModel(look, true, kModelSide, kModelSide).copy(0, 0, kCornerWidth, kTopHeight);
    case FramePiece::RoundTopRight:
        return DrawModel(look, true, kModelSide, kModelSide).copy(right, 0, kCornerWidth, kTopHeight);
    case FramePiece::RoundBottomLeft:
        return DrawModel(look, true, kModelSide, kModelSide).copy(0, bottom, kCornerWidth, kBottomHeight);
    case FramePiece::RoundBottomRight:
        return DrawModel(look, true, kModelSide, kModelSide).copy(right, bottom, kCornerWidth, kBottomHeight);
    case FramePiece::RoundLeft:
        return RepeatRow(DrawModel(look, true, kModelSide, kModelSide), 0, middle, kCornerWidth, kCornerWidth);
    case FramePiece::RoundRight:
        return RepeatRow(DrawModel(look, true, kModelSide, kModelSide), right, middle, kCornerWidth, kCornerWidth);
    case FramePiece::RectTop:
        return RepeatColumn(DrawModel(look, false, kModelSide, kModelSide), kModelSide / 2, 0, kCornerWidth,
                            kTopHeight);
    case FramePiece::RectBottom:
        return RepeatColumn(DrawModel(look, false, kModelSide, kModelSide), kModelSide / 2, bottom, kCornerWidth,
                            kBottomHeight);
    case FramePiece::RectTopLeft:
        return DrawModel(look, false, kModelSide, kModelSide).copy(0, 0, kRectSide, kTopHeight);
    case FramePiece::RectTopRight:
        return DrawModel(look, false, kModelSide, kModelSide).copy(kModelSide - kRectSide, 0, kRectSide, kTopHeight);
    case FramePiece::RectBottomLeft:
        return DrawModel(look, false, kModelSide, kModelSide).copy(0, bottom, kRectSide, kBottomHeight);
    case FramePiece::RectBottomRight:
        return DrawModel(look, false, kModelSide, kModelSide)
            .copy(kModelSide - kRectSide, bottom, kRectSide, kBottomHeight);
    case FramePiece::RectLeft:
        return RepeatRow(DrawModel(look, false, kModelSide, kModelSide), 0, middle, kRectSide, kCornerWidth);
    case FramePiece::RectRight:
        return RepeatRow(DrawModel(look, false, kModelSide, kModelSide), kModelSide - kRectSide, middle, kRectSide,
                         kCornerWidth);
    case FramePiece::RectWhole:
        // The frame of the narrowest region a wide frame is not used for, at
        // the smallest height whose sides are not stretched below nothing.
        return DrawModel(look, false, kCornerWidth, kTopHeight - kAbove + kBottomHeight - kBelow);
    case FramePiece::RaggedLeft:
        return DrawRaggedLeft();
    case FramePiece::RaggedRight:
        return DrawRaggedLeft().mirrored(true, false);
    }
    return {};
}

} // namespace velm::pictures
