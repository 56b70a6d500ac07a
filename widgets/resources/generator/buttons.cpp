// The smart-zoom button (20 x 20, the size the view lays out for it), one
// face per zoom action, and the magnifier icons.
#include "widgets/resources/generator/drawing.h"
#include "widgets/resources/generator/pictures.h"

#include <QLinearGradient>

namespace velm::pictures {
namespace {

constexpr int kButton = 20;

// The button itself: a rounded teal key, lit from above.
void PaintKey(QPainter &painter)
{
    QLinearGradient face(0, 0, 0, kButton);
    face.setColorAt(0, QColor(0, 112, 112, 235));
    face.setColorAt(1, QColor(0, 44, 44, 235));
    painter.setBrush(face);
    painter.setPen(QPen(QColor(0, 16, 16, 210), 1.0));
    painter.drawRoundedRect(QRectF(0.5, 0.5, kButton - 1, kButton - 1), 4, 4);
    QLinearGradient shine(0, 1, 0, kButton / 2);
    shine.setColorAt(0, QColor(255, 255, 255, 80));
    shine.setColorAt(1, QColor(255, 255, 255, 0));
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(QBrush(shine), 1.0));
    painter.drawRoundedRect(QRectF(1.5, 1.5, kButton - 3, kButton - 3), 3, 3);
}

// A straight line drawn without antialiasing, for crisp one-pixel strokes.
void CrispLine(QPainter &painter, const QColor &colour, int x1, int y1, int x2, int y2)
{
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing, false);
    painter.setPen(colour);
    painter.drawLine(x1, y1, x2, y2);
    painter.restore();
}

// An arrow along a line, with a head at its end.
QPainterPath Arrow(QPointF from, QPointF to)
{
    const QPointF along = (to - from) / QLineF(from, to).length();
    const QPointF across(-along.y(), along.x());
    QPainterPath arrow;
    arrow.moveTo(from);
    arrow.lineTo(to);
    arrow.moveTo(to - 2.5 * along + 2.5 * across);
    arrow.lineTo(to);
    arrow.lineTo(to - 2.5 * along - 2.5 * across);
    return arrow;
}

// Two arrows from the middle row outwards (stretch) or from the edges
// inwards (squeeze), over a faint zero line.
void PaintVerticalZoom(QPainter &painter, bool stretch)
{
    CrispLine(painter, QColor(255, 255, 255, 120), 4, 10, 15, 10);
    const qreal x = 10.0;
    QPainterPath arrows;
    if (stretch) {
        arrows.addPath(Arrow({x, 8.0}, {x, 3.5}));
        arrows.addPath(Arrow({x, 12.0}, {x, 16.5}));
    } else {
        arrows.addPath(Arrow({x, 2.5}, {x, 7.5}));
        arrows.addPath(Arrow({x, 17.5}, {x, 12.5}));
    }
    StrokeGlyph(painter, arrows, 1.3);
}

} // namespace

QImage DrawZoomButton(ZoomFace face)
{
    QImage image = NewPicture(kButton, kButton);
    PicturePainter painter(&image);
    PaintKey(painter);
    const qreal lens_x = 8.5, lens_y = 8.5, lens = 4.5;
    switch (face) {
    case ZoomFace::Selection:
        // A selected stretch of the view with the magnifier over it.
        painter.fillRect(QRect(4, 3, 12, 14), QColor(255, 255, 255, 55));
        CrispLine(painter, QColor(255, 255, 255, 200), 4, 3, 4, 16);
        CrispLine(painter, QColor(255, 255, 255, 200), 15, 3, 15, 16);
        DrawMagnifier(painter, lens_x, lens_y, lens);
        break;
    case ZoomFace::In:
    case ZoomFace::Out:
        DrawMagnifier(painter, lens_x, lens_y, lens);
        CrispLine(painter, kGlyph, 6, 8, 10, 8);
        if (face == ZoomFace::In) CrispLine(painter, kGlyph, 8, 6, 8, 10);
        break;
    case ZoomFace::Full: {
        // The whole signal: an arrow from end to end between two bars.
        QPainterPath arrows = Arrow({10.0, 10.0}, {5.5, 10.0});
        arrows.addPath(Arrow({10.0, 10.0}, {14.5, 10.0}));
        StrokeGlyph(painter, arrows, 1.3);
        CrispLine(painter, kGlyph, 3, 5, 3, 14);
        CrispLine(painter, kGlyph, 16, 5, 16, 14);
        break;
    }
    case ZoomFace::VerticalIn: PaintVerticalZoom(painter, true); break;
    case ZoomFace::VerticalOut: PaintVerticalZoom(painter, false); break;
    }
    return image;
}

QImage DrawMagnifierIcon(bool with_menu_arrow)
{
    QImage image = NewPicture(with_menu_arrow ? 24 : 16, 16);
    PicturePainter painter(&image);
    DrawMagnifier(painter, 6.5, 6.5, 4.5);
    if (with_menu_arrow) {
        // A small drop-down arrow: the icon opens a menu.
        QPainterPath arrow;
        arrow.moveTo(17.5, 6.5);
        arrow.lineTo(22.5, 6.5);
        arrow.lineTo(20.0, 9.5);
        arrow.closeSubpath();
        FillGlyph(painter, arrow);
    }
    return image;
}

} // namespace velm::pictures
