// The gain button's volume glyphs, the play overlay, the cancel and mouse
// icons and the background tile.
#include "widgets/resources/generator/drawing.h"
#include "widgets/resources/generator/pictures.h"

namespace velm::pictures {

// 30 x 30: the gain button (48 x 40 in a full-height lane) shows it scaled
// to three quarters of its height, so at that size it is not scaled at all.
QImage DrawVolume(int waves)
{
    QImage image = NewPicture(30, 30);
    PicturePainter painter(&image);
    QPainterPath speaker;
    speaker.addRect(QRectF(3.5, 11.5, 5, 7));
    speaker.moveTo(8.5, 11.5);
    speaker.lineTo(14.5, 5.5);
    speaker.lineTo(14.5, 24.5);
    speaker.lineTo(8.5, 18.5);
    speaker.closeSubpath();
    FillGlyph(painter, speaker.simplified());
    // Muted: a cross where the waves would be.
    QPainterPath marks = waves < 0 ? Cross(QRectF(18.5, 11.5, 7, 7)) : QPainterPath();
    for (int wave = 1; wave <= waves; ++wave) {
        const qreal radius = 0.5 + 4.0 * wave;
        const QRectF box(14.5 - radius, 15.0 - radius, 2 * radius, 2 * radius);
        marks.arcMoveTo(box, 45);
        marks.arcTo(box, 45, -90);
    }
    StrokeGlyph(painter, marks, 2.0);
    return image;
}

// Shown over the view to say "press to play": a large, see-through disc.
QImage DrawPlayOverlay()
{
    QImage image = NewPicture(48, 48);
    PicturePainter painter(&image);
    painter.setBrush(QColor(0, 0, 0, 110));
    painter.setPen(QPen(QColor(255, 255, 255, 170), 2.0));
    painter.drawEllipse(QPointF(24, 24), 22, 22);
    QPainterPath triangle;
    triangle.moveTo(19, 14);
    triangle.lineTo(35, 24);
    triangle.lineTo(19, 34);
    triangle.closeSubpath();
    painter.setPen(Qt::NoPen);
    painter.setBrush(QColor(255, 255, 255, 230));
    painter.drawPath(triangle);
    return image;
}

QImage DrawCancel()
{
    QImage image = NewPicture(16, 16);
    PicturePainter painter(&image);
    painter.setBrush(QColor(190, 40, 30));
    painter.setPen(QPen(QColor(80, 10, 5, 220), 1.0));
    painter.drawEllipse(QPointF(8, 8), 6.5, 6.5);
    painter.setPen(QPen(kGlyph, 1.6, Qt::SolidLine, Qt::RoundCap));
    painter.drawPath(Cross(QRectF(5.5, 5.5, 5, 5)));
    return image;
}

// A mouse seen from above, for hints about pointer gestures.
QImage DrawMouse()
{
    QImage image = NewPicture(16, 16);
    PicturePainter painter(&image);
    QPainterPath body;
    body.addRoundedRect(QRectF(3.5, 1.5, 9, 13), 4.5, 4.5);
    body.moveTo(3.5, 6.5);
    body.lineTo(12.5, 6.5);
    body.moveTo(8, 1.5);
    body.lineTo(8, 6.5);
    StrokeGlyph(painter, body, 1.0);
    return image;
}

// The window background, to be tiled: the default colour with a sparse dot
// grid one shade lighter.
QImage DrawBackgroundTile()
{
    QImage image = NewPicture(32, 32);
    image.fill(kTeal);
    const QColor dot = kTeal.lighter(118);
    for (int y = 4; y < 32; y += 8) {
        for (int x = 4; x < 32; x += 8) image.setPixelColor(x, y, dot);
    }
    return image;
}

} // namespace velm::pictures
