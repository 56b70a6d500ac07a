#include "widgets/resources/generator/drawing.h"

namespace velm::pictures {

QImage NewPicture(int width, int height)
{
    QImage image(width, height, QImage::Format_ARGB32);
    image.fill(Qt::transparent);
    return image;
}

PicturePainter::PicturePainter(QImage *image) : QPainter(image)
{
    setRenderHint(QPainter::Antialiasing, true);
}

void StrokeGlyph(QPainter &painter, const QPainterPath &path, qreal width)
{
    painter.save();
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(kHalo, width + 2.0, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    painter.drawPath(path);
    painter.setPen(QPen(kGlyph, width, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    painter.drawPath(path);
    painter.restore();
}

void FillGlyph(QPainter &painter, const QPainterPath &path)
{
    painter.save();
    painter.setPen(QPen(kHalo, 2.0, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    painter.setBrush(kHalo);
    painter.drawPath(path);
    painter.setPen(Qt::NoPen);
    painter.setBrush(kGlyph);
    painter.drawPath(path);
    painter.restore();
}

QPainterPath Cross(const QRectF &box)
{
    QPainterPath cross;
    cross.moveTo(box.topLeft());
    cross.lineTo(box.bottomRight());
    cross.moveTo(box.topRight());
    cross.lineTo(box.bottomLeft());
    return cross;
}

void DrawMagnifier(QPainter &painter, qreal cx, qreal cy, qreal radius)
{
    QPainterPath lens;
    lens.addEllipse(QPointF(cx, cy), radius, radius);
    // The handle leaves the rim at 45 degrees and is twice as thick.
    const qreal rim = radius * 0.7071 + 0.8;
    const qreal reach = radius * 0.95;
    QPainterPath handle;
    handle.moveTo(cx + rim, cy + rim);
    handle.lineTo(cx + rim + reach, cy + rim + reach);
    painter.save();
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(kHalo, 4.2, Qt::SolidLine, Qt::RoundCap));
    painter.drawPath(handle);
    painter.restore();
    StrokeGlyph(painter, lens, 1.5);
    painter.save();
    painter.setPen(QPen(kGlyph, 2.4, Qt::SolidLine, Qt::RoundCap));
    painter.drawPath(handle);
    painter.restore();
}

QImage RepeatRow(const QImage &source, int x, int row, int width, int height)
{
    QImage piece = NewPicture(width, height);
    for (int y = 0; y < height; ++y) {
        for (int i = 0; i < width; ++i) piece.setPixelColor(i, y, source.pixelColor(x + i, row));
    }
    return piece;
}

QImage RepeatColumn(const QImage &source, int column, int y, int width, int height)
{
    QImage piece = NewPicture(width, height);
    for (int j = 0; j < height; ++j) {
        for (int i = 0; i < width; ++i) piece.setPixelColor(i, j, source.pixelColor(column, y + j));
    }
    return piece;
}

} // namespace velm::pictures
