// Images: pixmaps made, copied, pasted, decoded and loaded; raw pixel data
// put on the canvas; colour maps and the remaining colour setters.
#include "render/canvas/qt/qtcanvas_internal.h"

#include <QByteArrayView>
#include <QImage>
#include <QImageReader>

#include <algorithm>
#include <climits>
#include <new>

namespace velm::canvas::qt {
namespace {

// Scales the pixmap into the rectangle while drawing, smoothly whatever the
// profile, so no scaled copy is ever allocated.
void DrawScaled(QPainter *painter, const QRect &into, const QPixmap &pixmap)
{
    painter->save();
    painter->setRenderHint(QPainter::SmoothPixmapTransform, true);
    painter->drawPixmap(into, pixmap);
    painter->restore();
}

VELMCANVASIMAGE NewImage(QPixmap pixmap)
{
    if (pixmap.isNull()) return nullptr;
    return AsImage(new (std::nothrow) QPixmap(std::move(pixmap)));
}

} // namespace

VELMCANVASIMAGE _CreateImage(_VELMCANVASDATA *d, int width, int height)
{
    if (!d || !SizeAllowed(width, height)) return nullptr;
    QPixmap pixmap(width, height);
    // Cleared, so that no stale memory ever reaches the screen.
    pixmap.fill(Qt::transparent);
    return NewImage(std::move(pixmap));
}

VELMCANVASIMAGE _LoadImage(const void *bytes, int64_t length)
{
    if (!bytes || length <= 0 || length > INT_MAX || !HaveGuiApplication()) return nullptr;
    QImage image;
    if (!image.loadFromData(QByteArrayView(static_cast<const char *>(bytes), static_cast<qsizetype>(length)))) {
        return nullptr;
    }
    return NewImage(QPixmap::fromImage(image));
}

int _DestroyImage(VELMCANVASIMAGE image)
{
    delete AsPixmap(image);
    return 1;
}

int _ImageWidth(VELMCANVASIMAGE image)
{
    return image ? AsPixmap(image)->width() : 0;
}

int _ImageHeight(VELMCANVASIMAGE image)
{
    return image ? AsPixmap(image)->height() : 0;
}

int _CopyImage(_VELMCANVASDATA *d, int x, int y, int width, int height, VELMCANVASIMAGE image)
{
    if (!Painting(d) || !image) return 0;
    QPixmap *into = AsPixmap(image);
    if (!StartPainter(d, into)) {
        ResumeTarget(d);
        return 0;
    }
    d->painter->setCompositionMode(QPainter::CompositionMode_Source);
    d->painter->drawPixmap(0, 0, *d->target, x, y, width, height);
    return ResumeTarget(d);
}

int _PasteImage(_VELMCANVASDATA *d, VELMCANVASIMAGE image, int x, int y)
{
    QPainter *painter = Painting(d);
    if (!painter || !image) return 0;
    painter->drawPixmap(x, y, *AsPixmap(image));
    return 1;
}

int _PasteImageScaled(_VELMCANVASDATA *d, VELMCANVASIMAGE image, int x, int y, int width, int height)
{
    QPainter *painter = Painting(d);
    if (!painter || !image || width <= 0 || height <= 0) return 0;
    DrawScaled(painter, SafeRect(x, y, width, height), *AsPixmap(image));
    return 1;
}

int _DrawImage(_VELMCANVASDATA *d, int x, int y, int width, int height, const char *path)
{
    QPainter *painter = Painting(d);
    if (!painter || width <= 0 || height <= 0) return 0;
    QImageReader reader(QString::fromLocal8Bit(path));
    const QImage image = reader.read();
    if (image.isNull()) return 0;
    const QSize fitted = image.size().scaled(width, height, Qt::KeepAspectRatio);
    DrawScaled(painter, SafeRect(x, y, fitted.width(), fitted.height()), QPixmap::fromImage(image));
    return 1;
}

int _PutImage(_VELMCANVASDATA *d, int x, int y, int width, int height, const void *pixels, int image_width,
              int image_height, int format, int source_x, int source_y, int source_width, int source_height)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    if (format != VELMIMAGEFORMAT_ARGB32_PREMULTIPLIED && format != VELMIMAGEFORMAT_INDEXED8) return 0;
    if (!SizeAllowed(image_width, image_height)) return 0;
    const uchar *data = static_cast<const uchar *>(pixels);
    // The caller's pixels are wrapped, not copied.
    QImage image = format == VELMIMAGEFORMAT_INDEXED8
                       ? QImage(data, image_width, image_height, image_width, QImage::Format_Indexed8)
                       : QImage(data, image_width, image_height, image_width * 4, QImage::Format_ARGB32_Premultiplied);
    if (format == VELMIMAGEFORMAT_INDEXED8) image.setColorTable(d->color_table);
    // Source rows are counted from the bottom of the image.
    const long long source_top = static_cast<long long>(image_height) - source_y - source_height;
    const QRect source = SafeRect(source_x, static_cast<int>(std::clamp<long long>(source_top, INT_MIN, INT_MAX)),
                                  source_width, source_height);
    painter->drawImage(SafeRect(x, y, width, height), image, source);
    return 1;
}

int _SelectColor(_VELMCANVASDATA *d, uint32_t color)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    const QColor opaque = ToColor(color, 255);
    d->brush.setColor(opaque);
    d->pen.setColor(opaque);
    painter->setBrush(d->brush);
    painter->setPen(d->pen);
    return 1;
}

int _SelectColorMap(_VELMCANVASDATA *d, const VELMCOLORMAP *map)
{
    if (!d) return 0;
    d->color_table.resize(256);
    for (int i = 0; i < 256; ++i) {
        const VELMCOLORMAPENTRY &e = map->entry[i];
        d->color_table[i] = qRgb(e.red, e.green, e.blue);
    }
    return 1;
}

int _SelectShadowColor(_VELMCANVASDATA *d, uint32_t color)
{
    if (!d) return 0;
    d->shadow_color = color;
    return 1;
}

int _SelectGradient(_VELMCANVASDATA *d, uint32_t first, uint32_t second)
{
    if (!d) return 0;
    d->gradient_first = first;
    d->gradient_second = second;
    return 1;
}

} // namespace velm::canvas::qt
