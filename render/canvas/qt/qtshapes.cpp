// Rectangles with rounded corners, gradient fills, soft shadows and the
// darkening alpha rectangles.
#include "render/canvas/qt/qtcanvas_internal.h"

#include <QLinearGradient>
#include <QPainterPath>
#include <QRadialGradient>

namespace velm::canvas::qt {
namespace {

constexpr uint32_t kSquareTopLeft = VELMCANVASRECTOPT_SQUARETOPLEFT;
constexpr uint32_t kSquareTopRight = VELMCANVASRECTOPT_SQUARETOPRIGHT;
constexpr uint32_t kSquareBottomLeft = VELMCANVASRECTOPT_SQUAREBOTTOMLEFT;
constexpr uint32_t kSquareBottomRight = VELMCANVASRECTOPT_SQUAREBOTTOMRIGHT;

// The shared shape of the rectangle operations: plain, or a closed path
// whose corners are arcs of diameter `corner` unless marked square.
void _DrawRect(QPainter *painter, qreal x, qreal y, qreal w, qreal h, int corner, uint32_t corners)
{
    if (corner <= 0) {
        painter->drawRect(QRectF(x, y, w, h));
        return;
    }
    const qreal r = corner;
    QPainterPath path;
    if (corners & kSquareTopLeft) {
        path.moveTo(x, y);
    } else {
        path.moveTo(x, y + corner / 2);
        path.arcTo(QRectF(x, y, r, r), 180, -90);
    }
    if (corners & kSquareTopRight) path.lineTo(x + w, y);
    else path.arcTo(QRectF(x + w - r, y, r, r), 90, -90);
    if (corners & kSquareBottomRight) path.lineTo(x + w, y + h);
    else path.arcTo(QRectF(x + w - r, y + h - r, r, r), 0, -90);
    if (corners & kSquareBottomLeft) path.lineTo(x, y + h);
    else path.arcTo(QRectF(x, y + h - r, r, r), -90, -90);
    path.closeSubpath();
    painter->drawPath(path);
}

int GradientRect(_VELMCANVASDATA *d, int x, int y, int width, int height, uint32_t options, QPointF end)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    const bool keep_alpha = options & VELMCANVASRECTOPT_GRADIENTALPHA;
    QLinearGradient gradient(QPointF(x, y), end);
    gradient.setColorAt(0, ToColor(d->gradient_first, keep_alpha ? d->gradient_first >> 24 : 255));
    gradient.setColorAt(1, ToColor(d->gradient_second, keep_alpha ? d->gradient_second >> 24 : 255));
    painter->save();
    painter->setPen(Qt::NoPen);
    painter->setBrush(gradient);
    _DrawRect(painter, x, y, width, height, options & VELMCANVASRECTOPT_CORNERMASK, options & 0xF0000);
    painter->restore();
    return 1;
}

// A band of shadow fading from `start` (full colour) to `end` (none).
void ShadowBand(QPainter *painter, const QRectF &band, QPointF start, QPointF end, const QColor &color,
                const QColor &clear)
{
    if (band.width() <= 0 || band.height() <= 0) return;
    QLinearGradient gradient(start, end);
    gradient.setColorAt(0, color);
    gradient.setColorAt(1, clear);
    painter->fillRect(band, gradient);
}

// A corner of the shadow: a quarter disc around a square corner, or a
// quarter ring around a rounded one.  `angle` is where the quarter starts.
void ShadowCorner(QPainter *painter, QPointF centre, qreal inner, qreal outer, qreal angle, const QColor &color,
                  const QColor &clear)
{
    QRadialGradient gradient(centre, outer);
    gradient.setColorAt(0, color);
    if (inner > 0) gradient.setColorAt(inner / outer, color);
    gradient.setColorAt(1, clear);
    const QRectF outer_box(centre.x() - outer, centre.y() - outer, 2 * outer, 2 * outer);
    QPainterPath path;
    if (inner > 0) {
        const QRectF inner_box(centre.x() - inner, centre.y() - inner, 2 * inner, 2 * inner);
        path.arcMoveTo(outer_box, angle);
        path.arcTo(outer_box, angle, 90);
        path.arcTo(inner_box, angle + 90, -90);
    } else {
        path.moveTo(centre);
        path.arcTo(outer_box, angle, 90);
    }
    path.closeSubpath();
    painter->setBrush(gradient);
    painter->drawPath(path);
}

} // namespace

int _FillRect(_VELMCANVASDATA *d, int x, int y, int width, int height, int corner, uint32_t corner_flags, uint32_t)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    painter->save();
    painter->setPen(Qt::NoPen);
    if (d->alpha_factor < 1.0f) {
        QColor color = d->brush.color();
        color.setAlphaF(d->alpha_factor);
        painter->setBrush(color);
    }
    _DrawRect(painter, x, y, width, height, corner, corner_flags);
    painter->restore();
    return 1;
}

int _BorderRect(_VELMCANVASDATA *d, int x, int y, int width, int height, int corner, uint32_t corner_flags,
                uint32_t)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    const qreal pen_width = d->pen.widthF();
    painter->save();
    painter->setBrush(Qt::NoBrush);
    _DrawRect(painter, x + 0.5, y + 0.5, width - pen_width, height - pen_width, corner, corner_flags);
    painter->restore();
    return 1;
}

int _FillHorzGradientRect(_VELMCANVASDATA *d, int x, int y, int width, int height, uint32_t options)
{
    return GradientRect(d, x, y, width, height, options, QPointF(qreal(x) + width, y));
}

int _FillVertGradientRect(_VELMCANVASDATA *d, int x, int y, int width, int height, uint32_t options)
{
    return GradientRect(d, x, y, width, height, options, QPointF(x, qreal(y) + height));
}

int _ShadowRect(_VELMCANVASDATA *d, int x, int y, int width, int height, int size, int corner,
                uint32_t corner_bits, uint32_t side_bits, int opacity)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    const qreal s = size, half = corner / 2.0, reach = s + half;
    const QColor color = ToColor(d->shadow_color, opacity & 0xFF);
    const QColor clear = ToColor(d->shadow_color, 0);
    const bool left = !(side_bits & VELMCANVASRECTOPT_NOSHADOWLEFT);
    const bool top = !(side_bits & VELMCANVASRECTOPT_NOSHADOWTOP);
    const bool right = !(side_bits & VELMCANVASRECTOPT_NOSHADOWRIGHT);
    const bool bottom = !(side_bits & VELMCANVASRECTOPT_NOSHADOWBOTTOM);
    // Where each corner's arc leaves the side (none for a square corner).
    const qreal inset_tl = (corner_bits & kSquareTopLeft) ? 0 : half;
    const qreal inset_tr = (corner_bits & kSquareTopRight) ? 0 : half;
    const qreal inset_bl = (corner_bits & kSquareBottomLeft) ? 0 : half;
    const qreal inset_br = (corner_bits & kSquareBottomRight) ? 0 : half;
    const qreal x0 = x, y0 = y, x1 = x0 + width, y1 = y0 + height;

    painter->save();
    painter->setPen(Qt::NoPen);
    if (left) {
        ShadowBand(painter, QRectF(x0 - s, y0 + inset_tl, s, height - inset_tl - inset_bl), {x0, y0}, {x0 - s, y0},
                   color, clear);
    }
    if (right) {
        ShadowBand(painter, QRectF(x1, y0 + inset_tr, s, height - inset_tr - inset_br), {x1, y0}, {x1 + s, y0},
                   color, clear);
    }
    if (top) {
        ShadowBand(painter, QRectF(x0 + inset_tl, y0 - s, width - inset_tl - inset_tr, s), {x0, y0}, {x0, y0 - s},
                   color, clear);
    }
    if (bottom) {
        ShadowBand(painter, QRectF(x0 + inset_bl, y1, width - inset_bl - inset_br, s), {x0, y1}, {x0, y1 + s},
                   color, clear);
    }
    struct Corner {
        bool shown;
        qreal inset;
        QPointF square_point; // the rectangle's corner
        QPointF towards;      // unit steps from that corner to the arc's centre
        qreal angle;          // start of the outward quarter
    };
    const Corner corners[] = {
        {top && left && !(corner_bits & VELMCANVASRECTOPT_NOSHADOWTOPLEFT), inset_tl, {x0, y0}, {1, 1}, 90},
        {top && right && !(corner_bits & VELMCANVASRECTOPT_NOSHADOWTOPRIGHT), inset_tr, {x1, y0}, {-1, 1}, 0},
        {bottom && left && !(corner_bits & VELMCANVASRECTOPT_NOSHADOWBOTTOMLEFT), inset_bl, {x0, y1}, {1, -1}, 180},
        {bottom && right && !(corner_bits & VELMCANVASRECTOPT_NOSHADOWBOTTOMRIGHT), inset_br, {x1, y1}, {-1, -1},
         270},
    };
    for (const Corner &c : corners) {
        if (!c.shown) continue;
        const QPointF centre = c.square_point + c.towards * c.inset;
        ShadowCorner(painter, centre, c.inset, c.inset > 0 ? reach : s, c.angle, color, clear);
    }
    painter->restore();
    return 1;
}

int _DrawAlphaRect(_VELMCANVASDATA *d, int x, int y, int width, int height, int kind)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    static const QColor dark(0, 0, 0, 50);
    static const QColor clear(0, 0, 0, 0);
    QLinearGradient gradient;
    switch (kind) {
    case VELMCANVASALPHA_DARKRIGHT:
    case VELMCANVASALPHA_DARKLEFT:
        gradient = QLinearGradient(x, y, qreal(x) + width, y);
        break;
    case VELMCANVASALPHA_DARKTOP:
    case VELMCANVASALPHA_DARKBOTTOM:
        gradient = QLinearGradient(x, qreal(y) + height, x, y);
        break;
    default:
        return 0;
    }
    const bool dark_at_end = kind == VELMCANVASALPHA_DARKRIGHT || kind == VELMCANVASALPHA_DARKTOP;
    gradient.setColorAt(0, dark_at_end ? clear : dark);
    gradient.setColorAt(1, dark_at_end ? dark : clear);
    painter->save();
    painter->setPen(Qt::NoPen);
    painter->fillRect(SafeRect(x, y, width, height), gradient);
    painter->restore();
    return 1;
}

} // namespace velm::canvas::qt
