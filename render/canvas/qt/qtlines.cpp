// Points, lines, paths, polylines and envelope polygons.  Pixel centres are
// at +0.5, so one-pixel lines cover whole pixels.
#include "render/canvas/qt/qtcanvas_internal.h"

#include <QPolygonF>

namespace velm::canvas::qt {
namespace {

QPointF Centre(int x, int y)
{
    return QPointF(x + 0.5, y + 0.5);
}

} // namespace

int _InitPath(_VELMCANVASDATA *d)
{
    if (!d || d->path_open) return 0;
    d->path_open = true;
    return 1;
}

int _ClosePath(_VELMCANVASDATA *d)
{
    if (!d || !d->path_open) return 0;
    d->path_open = false;
    return 1;
}

int _MoveTo(_VELMCANVASDATA *d, int x, int y)
{
    if (!d) return 0;
    d->current_point = QPoint(x, y);
    return 1;
}

int _LineTo(_VELMCANVASDATA *d, int x, int y)
{
    QPainter *painter = Painting(d);
    if (!painter || !d->path_open) return 0;
    painter->drawLine(Centre(d->current_point.x(), d->current_point.y()), Centre(x, y));
    d->current_point = QPoint(x, y);
    return 1;
}

int _DrawLine(_VELMCANVASDATA *d, int x1, int y1, int x2, int y2)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    // Going right or down the last pixel is left out; going left or up the
    // line starts one pixel past the first point.  Callers rely on both.
    qreal start_x = x1, start_y = y1;
    if (x1 < x2) --x2;
    else if (x1 > x2) ++start_x;
    if (y1 < y2) --y2;
    else if (y1 > y2) ++start_y;
    painter->drawLine(QPointF(start_x + 0.5, start_y + 0.5), Centre(x2, y2));
    d->current_point = QPoint(x2, y2);
    return 1;
}

int _DrawPoint(_VELMCANVASDATA *d, int x, int y, uint32_t color)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    if (x >= d->allocated_width || y >= d->allocated_height) return 0;
    QPen pen = d->pen;
    pen.setColor(ToColor(color, 255));
    painter->save();
    painter->setPen(pen);
    // Qt places an integer point on its pixel whatever the antialiasing.
    painter->drawPoint(QPoint(x, y));
    painter->restore();
    return 1;
}

int _DrawPolyline(_VELMCANVASDATA *d, const int *xs, const int *ys, int count)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    QPolygonF line;
    line.reserve(count);
    for (int i = 0; i < count; ++i) line << Centre(xs[i], ys[i]);
    painter->drawPolyline(line);
    return 1;
}

int _DrawPolygon(_VELMCANVASDATA *d, const int *xs, const int *ys, int count, uint32_t fill)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    // The points are an envelope: the top edge left to right, then the
    // bottom edge back.  Fill it column by column, then outline it.
    const int alpha = (fill >> 24) ? static_cast<int>(fill >> 24) : 255;
    QPen fill_pen = d->pen;
    fill_pen.setColor(ToColor(fill, alpha));
    painter->save();
    painter->setPen(fill_pen);
    for (int i = 0; i < count / 2; ++i) painter->drawLine(Centre(xs[i], ys[i]), Centre(xs[i], ys[count - 1 - i]));
    painter->restore();
    QPolygonF outline;
    outline.reserve(count);
    for (int i = 0; i < count; ++i) outline << Centre(xs[i], ys[i]);
    painter->drawPolyline(outline);
    if (count > 1) painter->drawLine(outline.last(), outline.first());
    return 1;
}

} // namespace velm::canvas::qt
