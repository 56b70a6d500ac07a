// The backing store under overlays: saved by the union of the areas, so the
// oldest saved pixels win, and restored in one copy.
#include "render/canvas/qt/qtcanvas_internal.h"

namespace velm::canvas::qt {

int _SaveOverlay(_VELMCANVASDATA *d, int x, int y, int width, int height)
{
    if (!Painting(d)) return 0;
    QRegion fresh(SafeRect(x, y, width, height));
    if (d->saved_overlay) {
        fresh -= *d->saved_overlay;
        *d->saved_overlay += fresh;
    } else {
        d->saved_overlay = fresh;
    }
    if (d->target == &d->overlay || fresh.isEmpty()) return 1;
    if (!StartPainter(d, &d->overlay)) return 0;
    d->painter->setClipRegion(fresh);
    d->painter->setCompositionMode(QPainter::CompositionMode_Source);
    d->painter->drawPixmap(x, y, *d->target, x, y, width, height);
    return ResumeTarget(d);
}

int _GetOverlayRect(_VELMCANVASDATA *d, _VELMRECT *rect)
{
    if (!d || !d->saved_overlay || d->saved_overlay->isEmpty()) return 0;
    const QRect bounds = d->saved_overlay->boundingRect();
    rect->left = bounds.left();
    rect->top = bounds.top();
    rect->right = bounds.right();
    rect->bottom = bounds.bottom();
    rect->width = rect->right + 1 - rect->left;
    rect->height = rect->bottom + 1 - rect->top;
    return 1;
}

int _RestoreOverlay(_VELMCANVASDATA *d)
{
    QPainter *painter = Painting(d);
    if (!painter) return 0;
    if (!d->saved_overlay) return 1;
    const QRegion saved = *d->saved_overlay;
    d->saved_overlay.reset();
    if (d->target == &d->overlay) return 1;
    const QRect bounds = saved.boundingRect();
    painter->save();
    painter->setClipRegion(saved);
    painter->setCompositionMode(QPainter::CompositionMode_Source);
    painter->drawPixmap(bounds.topLeft(), d->overlay, bounds);
    painter->restore();
    return 1;
}

} // namespace velm::canvas::qt
