// Colours and small drawing helpers shared by the picture painters.
#pragma once

#include <QColor>
#include <QImage>
#include <QPainter>
#include <QPainterPath>

namespace velm::pictures {

// The view's own colours, so the pictures sit well on its dark teal frame.
inline const QColor kTeal{0, 64, 64};            // window background
inline const QColor kGlyph{238, 246, 246};       // light ink of every glyph
inline const QColor kHalo{0, 24, 24, 150};       // dark rim that keeps glyphs legible
inline const QColor kPlayRed{255, 33, 25};       // the play cursor's colour
inline const QColor kPlayRedDark{150, 14, 10};

// A transparent ARGB32 picture to draw on.
QImage NewPicture(int width, int height);

// A painter with antialiasing on; shapes are placed on pixel centres by the
// callers so straight edges stay crisp at 1x.
class PicturePainter : public QPainter {
public:
    explicit PicturePainter(QImage *image);
};

// Strokes a path in light ink over a slightly wider dark halo.
void StrokeGlyph(QPainter &painter, const QPainterPath &path, qreal width);
// Fills a path in light ink with a one-pixel dark halo around it.
void FillGlyph(QPainter &painter, const QPainterPath &path);

// The two strokes of an X from corner to corner of the box.
QPainterPath Cross(const QRectF &box);

// A magnifier: lens centred at (cx, cy) with the given radius, handle
// towards the bottom right.  Returns nothing; draws with StrokeGlyph.
void DrawMagnifier(QPainter &painter, qreal cx, qreal cy, qreal radius);

// A copy of the image whose every row repeats row `row` of the source:
// a piece that may be stretched vertically without changing.
QImage RepeatRow(const QImage &source, int x, int row, int width, int height);
// The same with one column repeated across.
QImage RepeatColumn(const QImage &source, int column, int y, int width, int height);

} // namespace velm::pictures
