// The record's life, its three targets, the borrowed painter and the copies
// between targets.
#include "outside/base/blbase.h"
#include "render/canvas/qt/qtcanvas_internal.h"

#include <QGuiApplication>

#include <algorithm>
#include <new>
#include <optional>

namespace velm::canvas::qt {
namespace {

// A side of 16384 pixels, and at most 32 mega-pixels (128 MB) a pixmap.
constexpr int kMaxSide = 16384;
constexpr long long kMaxPixels = 32LL * 1024 * 1024;

QPixmap TransparentPixmap(int width, int height)
{
    QPixmap pixmap(width, height);
    pixmap.fill(Qt::transparent);
    return pixmap;
}

// Coordinates are kept within this reach of the origin.
constexpr long long kReach = 1LL << 24;

int Clamped(long long value)
{
    return static_cast<int>(std::clamp(value, -kReach, kReach));
}

// The part of an area that lies on the pixmap, and where it lands when the
// area is moved to (dest_x, dest_y).  Copying only that part keeps absurd
// areas cheap; nothing when no part lies on the pixmap.
struct Block {
    QPixmap pixels;
    QPoint dest;
};

std::optional<Block> CopyBlock(const QPixmap &from, int x, int y, int width, int height, int dest_x, int dest_y)
{
    const QRect part = SafeRect(x, y, width, height) & from.rect();
    if (part.isEmpty()) return std::nullopt;
    const QPoint dest(Clamped(static_cast<long long>(dest_x) + part.left() - x),
                      Clamped(static_cast<long long>(dest_y) + part.top() - y));
    return Block{from.copy(part), dest};
}

void ApplyHints(QPainter *painter, bool low_profile)
{
    painter->setRenderHint(QPainter::Antialiasing, !low_profile);
    painter->setRenderHint(QPainter::TextAntialiasing, !low_profile);
    painter->setRenderHint(QPainter::SmoothPixmapTransform, !low_profile);
}

} // namespace

QRect SafeRect(int x, int y, int width, int height)
{
    const int left = Clamped(x), top = Clamped(y);
    const int right = Clamped(static_cast<long long>(x) + std::max(width, 0));
    const int bottom = Clamped(static_cast<long long>(y) + std::max(height, 0));
    return QRect(left, top, right - left, bottom - top);
}

bool HaveGuiApplication()
{
    return qobject_cast<QGuiApplication *>(QCoreApplication::instance()) != nullptr;
}

bool SizeAllowed(int width, int height)
{
    return width > 0 && height > 0 && width <= kMaxSide && height <= kMaxSide &&
           static_cast<long long>(width) * height <= kMaxPixels;
}

QColor ToColor(uint32_t color, int alpha)
{
    return QColor(color & 0xFF, (color >> 8) & 0xFF, (color >> 16) & 0xFF, alpha);
}

namespace {

// True when the record exists and holds the host's painter; logs otherwise.
bool HoldsPainter(_VELMCANVASDATA *d)
{
    if (!d) {
        BLDEBUG_TerminalError(-1, "VELM CANVAS QT: Invalid Canvas");
        return false;
    }
    if (!d->painter) {
        BLDEBUG_TerminalError(-1, "VELM CANVAS QT: Missing VELMCANVAS_BeginDraw(...)");
        return false;
    }
    return true;
}

} // namespace

QPainter *Painting(_VELMCANVASDATA *d)
{
    if (!HoldsPainter(d)) return nullptr;
    // Between BeginDraw and the first SelectTarget the painter is not on any
    // target yet; Qt would only warn, so refuse here.
    if (!d->painter->isActive()) {
        BLDEBUG_TerminalError(-1, "VELM CANVAS QT: Missing VELMCANVAS_SelectTarget(...)");
        return nullptr;
    }
    return d->painter;
}

bool StartPainter(_VELMCANVASDATA *d, QPixmap *pixmap)
{
    QPainter *painter = d->painter;
    if (painter->isActive()) painter->end();
    if (!painter->begin(pixmap)) return false;
    ApplyHints(painter, d->low_profile);
    painter->setPen(d->pen);
    painter->setBrush(d->brush);
    painter->setFont(d->font);
    return true;
}

bool ResumeTarget(_VELMCANVASDATA *d)
{
    if (!StartPainter(d, d->target)) return false;
    if (d->clip) d->painter->setClipRegion(*d->clip);
    return true;
}

QPixmap *TargetPixmap(_VELMCANVASDATA *d, int target)
{
    switch (target) {
    case VELMCANVASTARGET_OUTPUT: return &d->output;
    case VELMCANVASTARGET_MEMORY: return &d->memory;
    case VELMCANVASTARGET_OVERLAY: return &d->overlay;
    default: return d->target;
    }
}

_VELMCANVASDATA *_CreateCanvas(void *, int width, int height)
{
    if (!HaveGuiApplication()) {
        BLDEBUG_Error(-1, "VELM CANVAS QT: A QGuiApplication must exist before a canvas is created");
        return nullptr;
    }
    if (!SizeAllowed(width, height)) {
        BLDEBUG_Error(-1, "VELM CANVAS QT: Refused canvas dimensions (%d,%d)", width, height);
        return nullptr;
    }
    auto *d = new (std::nothrow) _VELMCANVASDATA;
    if (!d) return nullptr;
    d->output = TransparentPixmap(width, height);
    d->memory = TransparentPixmap(width, height);
    d->overlay = TransparentPixmap(width, height);
    if (d->output.isNull() || d->memory.isNull() || d->overlay.isNull()) {
        delete d;
        return nullptr;
    }
    d->target = &d->output;
    d->allocated_width = width;
    d->allocated_height = height;
    d->brush = QBrush(QColor(0, 0, 0, 0), Qt::SolidPattern);
    d->pen = QPen(d->brush, 1.0, Qt::SolidLine, Qt::SquareCap, Qt::BevelJoin);
    _SelectColorMap(d, &VELMCOLORMAP_INVLINEARGRAYSCALE);
    return d;
}

int _DestroyCanvas(_VELMCANVASDATA *d)
{
    if (!d) return 0;
    // The host keeps its painter: it must not stay on a pixmap that goes
    // away, but may by now be painting another canvas.
    if (d->painter && d->painter->isActive()) {
        const QPaintDevice *device = d->painter->device();
        if (device == &d->output || device == &d->memory || device == &d->overlay) d->painter->end();
    }
    delete d;
    return 1;
}

void *_GetOutputHandle(_VELMCANVASDATA *d)
{
    return d ? &d->output : nullptr;
}

void *_GetDrawObject(_VELMCANVASDATA *d)
{
    return d ? d->draw_object : nullptr;
}

int _SetDrawObject(_VELMCANVASDATA *d, void *object)
{
    if (!d) return 0;
    d->draw_object = object;
    return 1;
}

int _BeginDraw(_VELMCANVASDATA *d, void *painter)
{
    if (!d || !painter) return 0;
    d->painter = static_cast<QPainter *>(painter);
    if (d->painter->isActive()) d->painter->end();
    return 1;
}

int _EndDraw(_VELMCANVASDATA *d)
{
    if (!d) return 0;
    if (d->painter && d->painter->isActive()) d->painter->end();
    d->painter = nullptr;
    return 1;
}

int _SelectTarget(_VELMCANVASDATA *d, int target)
{
    if (!HoldsPainter(d)) return 0;
    d->target = TargetPixmap(d, target);
    return ResumeTarget(d);
}

int _UseLowProfile(_VELMCANVASDATA *d, int on)
{
    if (!d) return 0;
    d->low_profile = on != 0;
    if (d->painter && d->painter->isActive()) ApplyHints(d->painter, d->low_profile);
    return 1;
}

int _ResizeCanvas(_VELMCANVASDATA *d, int width, int height)
{
    if (!d) return 0;
    d->width = std::min(width, d->allocated_width);
    d->height = std::min(height, d->allocated_height);
    return 1;
}

int _GetDimension(_VELMCANVASDATA *d, int *width, int *height)
{
    if (!d) return 0;
    *width = d->width;
    *height = d->height;
    return 1;
}

int _GetMaxDimension(_VELMCANVASDATA *d, int *width, int *height)
{
    if (!d) return 0;
    *width = d->allocated_width;
    *height = d->allocated_height;
    return 1;
}

float _SetAlphaFactor(_VELMCANVASDATA *d, float factor)
{
    if (!d) return -1.0f;
    const float previous = d->alpha_factor;
    d->alpha_factor = factor;
    return previous;
}

int _Clear(_VELMCANVASDATA *d)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    painter->save();
    painter->setCompositionMode(QPainter::CompositionMode_Source);
    painter->fillRect(d->target->rect(), Qt::transparent);
    painter->restore();
    return 1;
}

int _CopyCanvas(_VELMCANVASDATA *d, int source, int destination)
{
    if (!Painting(d)) return 0;
    QPixmap *from = TargetPixmap(d, source);
    QPixmap *to = TargetPixmap(d, destination);
    if (from == to) return 1;
    if (!StartPainter(d, to)) return 0;
    d->painter->setCompositionMode(QPainter::CompositionMode_Source);
    d->painter->drawPixmap(0, 0, *from);
    return ResumeTarget(d);
}

int _MoveBlock(_VELMCANVASDATA *d, int x, int y, int width, int height, int dest_x, int dest_y)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    // Through a copy, so that overlapping areas move intact.
    const std::optional<Block> block = CopyBlock(*d->target, x, y, width, height, dest_x, dest_y);
    if (!block) return 1;
    painter->save();
    painter->setCompositionMode(QPainter::CompositionMode_Source);
    painter->drawPixmap(block->dest, block->pixels);
    painter->restore();
    return 1;
}

int _MoveBlock2(_VELMCANVASDATA *d, int source, int x, int y, int width, int height, int destination,
                int dest_x, int dest_y)
{
    if (!Painting(d)) return 0;
    const std::optional<Block> block = CopyBlock(*TargetPixmap(d, source), x, y, width, height, dest_x, dest_y);
    if (!block) return 1;
    if (!StartPainter(d, TargetPixmap(d, destination))) return 0;
    d->painter->setCompositionMode(QPainter::CompositionMode_Source);
    d->painter->drawPixmap(block->dest, block->pixels);
    return ResumeTarget(d);
}

namespace {

QRect DrawArea(const _VELMCANVASDATA *d)
{
    return SafeRect(d->draw_area.left, d->draw_area.top, d->draw_area.width, d->draw_area.height);
}

} // namespace

int _SetDrawArea(_VELMCANVASDATA *d, const _VELMRECT *rect)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    d->draw_area = *rect;
    ++d->clip_depth;
    d->clip = QRegion(DrawArea(d));
    painter->setClipRegion(*d->clip);
    return 1;
}

int _ProtectDrawArea(_VELMCANVASDATA *d, const _VELMRECT *rect)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    QRegion region = QRegion(0, 0, d->width, d->height) - SafeRect(rect->left, rect->top, rect->width, rect->height);
    if (d->clip_depth != 0) region &= DrawArea(d);
    d->clip = region;
    painter->setClipRegion(region);
    ++d->clip_depth;
    return 1;
}

int _ClearDrawArea(_VELMCANVASDATA *d)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    painter->setClipping(false);
    d->clip.reset();
    if (d->clip_depth >= 2) {
        d->clip = QRegion(DrawArea(d));
        painter->setClipRegion(*d->clip);
    }
    if (d->clip_depth > 0) --d->clip_depth;
    return 1;
}

} // namespace velm::canvas::qt
