// The Qt back-end's record, its operations and the helpers they share.
#ifndef VELM_QTCANVAS_INTERNAL_H
#define VELM_QTCANVAS_INTERNAL_H

#include "render/canvas/velmcanvas.h"

#include <QBrush>
#include <QColor>
#include <QFont>
#include <QList>
#include <QPainter>
#include <QPen>
#include <QPixmap>
#include <QPoint>
#include <QRegion>

#include <cstdint>
#include <optional>

struct _VELMCANVASDATA {
    int width = 0; // visible size, 0 x 0 until the first resize
    int height = 0;
    int allocated_width = 0; // size of the three pixmaps
    int allocated_height = 0;
    void *draw_object = nullptr;
    float alpha_factor = 1.0f; // FillRect only
    bool path_open = false;
    uint32_t gradient_first = 0;
    uint32_t gradient_second = 0;
    QPixmap output;
    QPixmap memory;
    QPixmap overlay;
    QPixmap *target = nullptr;            // where the painter paints
    std::optional<QRegion> saved_overlay; // union of the areas saved since the last restore
    QPainter *painter = nullptr;          // the host's, between BeginDraw and EndDraw
    QFont font;
    QPen pen;
    QBrush brush;
    uint32_t shadow_color = 0;
    QColor font_color{0, 0, 0, 0};
    bool shadow_text = false;
    QList<QRgb> color_table;
    _VELMRECT draw_area{};
    int clip_depth = 0;
    std::optional<QRegion> clip; // the clip of the current target, kept across painter restarts
    QPoint current_point{0, 0};
    bool low_profile = false;
};

namespace velm::canvas::qt {

// The process-wide table, filled on first use.
const _VELMCANVASOPS &Operations();
void VELMcanvas_QT_Initialize(_VELMCANVASOPS *ops);

// The painter of a record that may paint now, or null after logging why not.
QPainter *Painting(_VELMCANVASDATA *d);
// (Re)starts the painter on a pixmap with the record's hints, pen, brush
// and font; false when the pixmap cannot be painted on.
bool StartPainter(_VELMCANVASDATA *d, QPixmap *pixmap);
// Starts it again on the current target and puts the clip back.
bool ResumeTarget(_VELMCANVASDATA *d);
// Target numbers 1-3 name the three pixmaps; anything else the current one.
QPixmap *TargetPixmap(_VELMCANVASDATA *d, int target);
// A caller's rectangle as a QRect, cut to a range far beyond any surface so
// that no edge arithmetic can overflow; a negative size gives an empty one.
QRect SafeRect(int x, int y, int width, int height);
// A 0x00BBGGRR word as a colour of the given alpha.
QColor ToColor(uint32_t color, int alpha);
// False unless the host made a QGuiApplication, which pixmaps need.
bool HaveGuiApplication();
// Pixmaps larger than this are refused rather than attempted.
bool SizeAllowed(int width, int height);
inline QPixmap *AsPixmap(VELMCANVASIMAGE image) { return reinterpret_cast<QPixmap *>(image); }
inline VELMCANVASIMAGE AsImage(QPixmap *pixmap) { return reinterpret_cast<VELMCANVASIMAGE>(pixmap); }
// The library's texts: Latin-1 with backslash escapes for phonetic symbols.
QString _Convert2QString(const char *text);

// The operations, in slot order.
_VELMCANVASDATA *_CreateCanvas(void *native, int width, int height);
void *_GetOutputHandle(_VELMCANVASDATA *d);
void *_GetDrawObject(_VELMCANVASDATA *d);
int _SetDrawObject(_VELMCANVASDATA *d, void *object);
int _SelectTarget(_VELMCANVASDATA *d, int target);
int _BeginDraw(_VELMCANVASDATA *d, void *painter);
int _EndDraw(_VELMCANVASDATA *d);
int _UseLowProfile(_VELMCANVASDATA *d, int on);
int _ResizeCanvas(_VELMCANVASDATA *d, int width, int height);
int _DestroyCanvas(_VELMCANVASDATA *d);
int _CopyCanvas(_VELMCANVASDATA *d, int source, int destination);
int _InitPath(_VELMCANVASDATA *d);
int _ClosePath(_VELMCANVASDATA *d);
int _Clear(_VELMCANVASDATA *d);
int _ProtectDrawArea(_VELMCANVASDATA *d, const _VELMRECT *rect);
int _SetDrawArea(_VELMCANVASDATA *d, const _VELMRECT *rect);
int _ClearDrawArea(_VELMCANVASDATA *d);
int _GetDimension(_VELMCANVASDATA *d, int *width, int *height);
int _GetMaxDimension(_VELMCANVASDATA *d, int *width, int *height);
int _DrawPoint(_VELMCANVASDATA *d, int x, int y, uint32_t color);
int _MoveTo(_VELMCANVASDATA *d, int x, int y);
int _LineTo(_VELMCANVASDATA *d, int x, int y);
int _DrawPolygon(_VELMCANVASDATA *d, const int *xs, const int *ys, int count, uint32_t fill);
int _DrawPolyline(_VELMCANVASDATA *d, const int *xs, const int *ys, int count);
int _DrawLine(_VELMCANVASDATA *d, int x1, int y1, int x2, int y2);
int _TextOut(_VELMCANVASDATA *d, int x, int y, const char *text);
int _TextOutVertical(_VELMCANVASDATA *d, int x, int y, const char *text);
int _SaveOverlay(_VELMCANVASDATA *d, int x, int y, int width, int height);
int _GetOverlayRect(_VELMCANVASDATA *d, _VELMRECT *rect);
int _RestoreOverlay(_VELMCANVASDATA *d);
VELMCANVASIMAGE _CreateImage(_VELMCANVASDATA *d, int width, int height);
int _CopyImage(_VELMCANVASDATA *d, int x, int y, int width, int height, VELMCANVASIMAGE image);
int _PasteImage(_VELMCANVASDATA *d, VELMCANVASIMAGE image, int x, int y);
int _PasteImageScaled(_VELMCANVASDATA *d, VELMCANVASIMAGE image, int x, int y, int width, int height);
int _DestroyImage(VELMCANVASIMAGE image);
int _ImageWidth(VELMCANVASIMAGE image);
int _ImageHeight(VELMCANVASIMAGE image);
int _PutImage(_VELMCANVASDATA *d, int x, int y, int width, int height, const void *pixels, int image_width,
              int image_height, int format, int source_x, int source_y, int source_width, int source_height);
int _FillRect(_VELMCANVASDATA *d, int x, int y, int width, int height, int corner, uint32_t corner_flags,
              uint32_t flags);
int _BorderRect(_VELMCANVASDATA *d, int x, int y, int width, int height, int corner, uint32_t corner_flags,
                uint32_t flags);
int _FillHorzGradientRect(_VELMCANVASDATA *d, int x, int y, int width, int height, uint32_t options);
int _FillVertGradientRect(_VELMCANVASDATA *d, int x, int y, int width, int height, uint32_t options);
int _ShadowRect(_VELMCANVASDATA *d, int x, int y, int width, int height, int size, int corner,
                uint32_t corner_bits, uint32_t side_bits, int opacity);
int _SelectColor(_VELMCANVASDATA *d, uint32_t color);
int _SelectColorMap(_VELMCANVASDATA *d, const VELMCOLORMAP *map);
int _SelectShadowColor(_VELMCANVASDATA *d, uint32_t color);
int _SelectFont(_VELMCANVASDATA *d, const _VELMCANVASFONT *font);
int _SelectFontColor(_VELMCANVASDATA *d, uint32_t color);
int _SelectGradient(_VELMCANVASDATA *d, uint32_t first, uint32_t second);
float _SetAlphaFactor(_VELMCANVASDATA *d, float factor);
int _MoveBlock(_VELMCANVASDATA *d, int x, int y, int width, int height, int dest_x, int dest_y);
int _MoveBlock2(_VELMCANVASDATA *d, int source, int x, int y, int width, int height, int destination,
                int dest_x, int dest_y);
int _TextWidth(_VELMCANVASDATA *d, const char *text);
int _TextHeight(_VELMCANVASDATA *d, const char *text);
int _DrawAlphaRect(_VELMCANVASDATA *d, int x, int y, int width, int height, int kind);
int _DrawImage(_VELMCANVASDATA *d, int x, int y, int width, int height, const char *path);
VELMCANVASIMAGE _LoadImage(const void *bytes, int64_t length);

} // namespace velm::canvas::qt

#endif // VELM_QTCANVAS_INTERNAL_H
