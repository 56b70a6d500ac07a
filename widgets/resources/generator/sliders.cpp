// Cursor and selection handles.  The view centres a handle on its cursor's
// (or selection end's) column and on the row above the horizontal scale, so
// every handle has odd sides, 11 x 17: column 5 is the cursor's, row 8 the
// scale's edge.  The tip points along the cursor line into the lanes.
#include "widgets/resources/generator/drawing.h"
#include "widgets/resources/generator/pictures.h"

#include <QLinearGradient>

namespace velm::pictures {
namespace {

constexpr int kWidth = 11;
constexpr int kHeight = 17;

struct SliderLook {
    QColor top, bottom;   // body gradient
    QColor outline;
    QColor grip;
};

// A house shape: the tip on the cursor column at the top, a body with
// rounded lower corners.  `left` and `right` bound the body, so the begin
// and end handles of a selection keep a straight edge on its column.
QPainterPath HandleShape(qreal left, qreal right)
{
    const qreal tip_x = 5.5, tip_y = 0.5, shoulder = 5.5, bottom = kHeight - 0.5, round = 2.5;
    QPainterPath shape;
    shape.moveTo(tip_x, tip_y);
    shape.lineTo(right, right > tip_x ? shoulder : tip_y);
    shape.lineTo(right, bottom - (right > tip_x ? round : 0));
    if (right > tip_x) shape.quadTo(right, bottom, right - round, bottom);
    shape.lineTo(left + (left < tip_x ? round : 0), bottom);
    if (left < tip_x) shape.quadTo(left, bottom, left, bottom - round);
    shape.lineTo(left, left < tip_x ? shoulder : tip_y);
    shape.closeSubpath();
    return shape;
}

QImage DrawHandle(const SliderLook &look, qreal left, qreal right)
{
    QImage image = NewPicture(kWidth, kHeight);
    PicturePainter painter(&image);
    QLinearGradient body(0, 0, 0, kHeight);
    body.setColorAt(0, look.top);
    body.setColorAt(1, look.bottom);
    painter.setBrush(body);
    painter.setPen(QPen(look.outline, 1.0));
    painter.drawPath(HandleShape(left, right));
    // Three grip lines across the body, within its sides.
    painter.setRenderHint(QPainter::Antialiasing, false);
    painter.setPen(look.grip);
    const int inset = right - left > 6 ? 2 : 1;
    const int from = static_cast<int>(left + 0.5) + inset, to = static_cast<int>(right - 1.5) - inset;
    for (int y : {8, 10, 12}) painter.drawLine(from, y, to, y);
    return image;
}

const SliderLook kEditLook{{250, 253, 253}, {190, 208, 208}, {0, 30, 30, 230}, {70, 100, 100}};
const SliderLook kPlayLook{kPlayRed, kPlayRedDark, {70, 0, 0, 230}, {255, 190, 185}};
const SliderLook kSelectionLook{{255, 255, 255, 110}, {255, 255, 255, 50}, {255, 255, 255, 220},
                                {255, 255, 255, 190}};

} // namespace

QImage DrawSlider(SliderKind kind)
{
    const qreal left = 0.5, right = kWidth - 0.5, centre = 5.5;
    switch (kind) {
    case SliderKind::EditTop:
        // The top handle hangs from the view's top edge: tip down.
        return DrawHandle(kEditLook, left, right).mirrored(false, true);
    case SliderKind::EditBottom: return DrawHandle(kEditLook, left, right);
    case SliderKind::Play: return DrawHandle(kPlayLook, left, right);
    case SliderKind::Selection: return DrawHandle(kSelectionLook, left, right);
    case SliderKind::SelectionBegin: return DrawHandle(kSelectionLook, centre, right);
    case SliderKind::SelectionEnd: return DrawHandle(kSelectionLook, left, centre);
    }
    return {};
}

} // namespace velm::pictures
