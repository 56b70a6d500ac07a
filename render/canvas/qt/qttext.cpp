// Fonts, text colours, horizontal and vertical text and text metrics.
#include "render/canvas/qt/qtcanvas_internal.h"

#include <QFontMetrics>

#include <cmath>
#include <cstring>

namespace velm::canvas::qt {
namespace {

// Point sizes outside this range are refused rather than handed to Qt.
constexpr float kMaxPointSize = 1000.0f;

QColor FontColor(const unsigned char rgba[4])
{
    return QColor(rgba[0], rgba[1], rgba[2], rgba[3] ? rgba[3] : 255);
}

// Draws the text with its shadow (black, one pixel right and down) when the
// font asks for one.
void DrawShadowedText(_VELMCANVASDATA *d, QPainter *painter, QPointF origin, const QString &text)
{
    if (d->shadow_text) {
        painter->setPen(Qt::black);
        painter->drawText(origin + QPointF(1, 1), text);
    }
    painter->setPen(d->font_color);
    painter->drawText(origin, text);
}

} // namespace

int _SelectFont(_VELMCANVASDATA *d, const _VELMCANVASFONT *font)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    if (!std::isfinite(font->size) || font->size <= 0.0f || font->size > kMaxPointSize) return 0;
    const uint32_t style = font->style;
    QFont selected(QString::fromLatin1(font->name, static_cast<qsizetype>(strnlen(font->name, sizeof font->name))));
    selected.setPointSizeF(font->size);
    selected.setWeight((style & VELMCANVASFONT_BOLD) ? QFont::Bold : QFont::Normal);
    selected.setStretch((style & VELMCANVASFONT_CONDENSED) ? 87 : (style & VELMCANVASFONT_EXPANDED) ? 200 : 100);
    selected.setItalic(style & VELMCANVASFONT_ITALIC);
    selected.setUnderline(style & VELMCANVASFONT_UNDERLINE);
    selected.setStrikeOut(style & VELMCANVASFONT_STRIKEOUT);
    d->shadow_text = style & VELMCANVASFONT_SHADOW;
    d->font_color = FontColor(font->color);
    d->font = selected;
    painter->setFont(selected);
    return 1;
}

int _SelectFontColor(_VELMCANVASDATA *d, uint32_t color)
{
    if (!d) return 0;
    d->font_color = ToColor(color, 255);
    return 1;
}

int _TextOut(_VELMCANVASDATA *d, int x, int y, const char *text)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    painter->save();
    const qreal baseline = qreal(y) + painter->fontMetrics().ascent() + 1;
    DrawShadowedText(d, painter, QPointF(x, baseline), _Convert2QString(text));
    painter->restore();
    return 1;
}

int _TextOutVertical(_VELMCANVASDATA *d, int x, int y, const char *text)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    painter->save();
    painter->translate(x, y);
    painter->rotate(90);
    DrawShadowedText(d, painter, QPointF(0, painter->fontMetrics().ascent() + 1), _Convert2QString(text));
    painter->restore();
    return 1;
}

int _TextWidth(_VELMCANVASDATA *d, const char *text)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    return painter->fontMetrics().horizontalAdvance(_Convert2QString(text));
}

int _TextHeight(_VELMCANVASDATA *d, const char *)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    return painter->fontMetrics().height() + 2;
}

} // namespace velm::canvas::qt
