/*
 * The canvas: the one abstract drawing surface through which every pixel of
 * the library is drawn.  A canvas is a small record holding its size, the
 * host's native handle, a table of back-end operations and the back-end's
 * private data.  The exported VELMCANVAS_ calls check the canvas and forward
 * to the table; a null canvas, table, back-end data or table slot answers 0
 * (null, or -1.0 for VELMCANVAS_SetAlphaFactor) and calls nothing.
 *
 * Calling order: create; per paint VELMCANVAS_BeginDraw with the host's
 * painter, VELMCANVAS_SelectTarget, any drawing calls, VELMCANVAS_EndDraw;
 * VELMCANVAS_GetOutputHandle gives the host what to show; destroy.
 *
 * Colours are 0x00BBGGRR words (red in the lowest byte); where a call honours
 * a top byte it is an alpha, 255 opaque.
 */
#ifndef VELMCANVAS_H
#define VELMCANVAS_H

#include <stdint.h>

#include "core/velm_api.h"
#include "render/canvas/velmrect.h"

VELM_EXTERN_C_BEGIN

/* ---- Targets, options, kinds ------------------------------------------ */

/* The three surfaces of every canvas; any other value means the current one. */
typedef enum VELMCANVASTARGET {
    VELMCANVASTARGET_OUTPUT = 1,  /* what the host shows */
    VELMCANVASTARGET_MEMORY = 2,  /* off-screen copy of the finished view */
    VELMCANVASTARGET_OVERLAY = 3  /* backing store of the pixels under overlays */
} VELMCANVASTARGET;

/* Rectangle option word of FillRect, BorderRect, the gradient fills and
 * ShadowRect: the corner rounding (diameter of the corner arc) in the low
 * ten bits, and these flags. */
typedef enum VELMCANVASRECTOPT {
    VELMCANVASRECTOPT_CORNERMASK = 0x3FF,
    VELMCANVASRECTOPT_GRADIENTALPHA = 0x400,        /* gradient colours keep their top-byte alpha */
    VELMCANVASRECTOPT_NOSHADOWTOPLEFT = 0x1000,
    VELMCANVASRECTOPT_NOSHADOWTOPRIGHT = 0x2000,
    VELMCANVASRECTOPT_NOSHADOWBOTTOMLEFT = 0x4000,
    VELMCANVASRECTOPT_NOSHADOWBOTTOMRIGHT = 0x8000,
    VELMCANVASRECTOPT_SQUARETOPLEFT = 0x10000,
    VELMCANVASRECTOPT_SQUARETOPRIGHT = 0x20000,
    VELMCANVASRECTOPT_SQUAREBOTTOMLEFT = 0x40000,
    VELMCANVASRECTOPT_SQUAREBOTTOMRIGHT = 0x80000,
    VELMCANVASRECTOPT_NOSHADOWLEFT = 0x100000,
    VELMCANVASRECTOPT_NOSHADOWTOP = 0x200000,
    VELMCANVASRECTOPT_NOSHADOWRIGHT = 0x400000,
    VELMCANVASRECTOPT_NOSHADOWBOTTOM = 0x800000
    /* bits 24-31: ShadowRect's opacity at the rectangle's edge (0-255) */
} VELMCANVASRECTOPT;

/* DrawAlphaRect: a gradient from black at alpha 50 to transparent. */
typedef enum VELMCANVASALPHAOBJECT {
    VELMCANVASALPHA_DARKRIGHT = 256,
    VELMCANVASALPHA_DARKLEFT = 512,
    VELMCANVASALPHA_DARKTOP = 1024,
    VELMCANVASALPHA_DARKBOTTOM = 2048
} VELMCANVASALPHAOBJECT;

/* PutImage pixel formats. */
typedef enum VELMIMAGEFORMAT {
    VELMIMAGEFORMAT_ARGB32_PREMULTIPLIED = 0,
    VELMIMAGEFORMAT_INDEXED8 = 1 /* indices into the canvas's colour map */
} VELMIMAGEFORMAT;

/* Font style bits. */
#define VELMCANVASFONT_ITALIC 0x02
#define VELMCANVASFONT_BOLD 0x04
#define VELMCANVASFONT_UNDERLINE 0x08
#define VELMCANVASFONT_STRIKEOUT 0x10
#define VELMCANVASFONT_CONDENSED 0x20 /* stretch 87 %; wins over expanded */
#define VELMCANVASFONT_EXPANDED 0x40  /* stretch 200 % */
#define VELMCANVASFONT_SHADOW 0x80    /* drawn first in black, one pixel right and down */

/* FillRectangleText flags: alignment in bits 0-1, and the ellipsis. */
#define VELMCANVASTEXT_CENTER 0x0
#define VELMCANVASTEXT_LEFT 0x1
#define VELMCANVASTEXT_RIGHT 0x2
#define VELMCANVASTEXT_ELLIPSIS 0x4

/* ---- Records ---------------------------------------------------------- */

typedef struct _VELMCANVASFONT {
    char name[256];         /* family name, ASCII, NUL-terminated */
    float size;             /* point size */
    uint32_t style;         /* VELMCANVASFONT_ bits */
    unsigned char color[4]; /* red, green, blue, alpha; alpha 0 means opaque */
} _VELMCANVASFONT;

/* A colour map: 256 entries of red, green, blue and a spare byte. */
typedef struct VELMCOLORMAPENTRY {
    unsigned char red, green, blue, spare;
} VELMCOLORMAPENTRY;

typedef struct VELMCOLORMAP {
    VELMCOLORMAPENTRY entry[256];
} VELMCOLORMAP;

/* An image: an opaque back-end object, owned by the caller, released with
 * VELMCANVAS_DestroyImage. */
typedef struct _VELMCANVASIMAGE *VELMCANVASIMAGE;

/* The back-end's private record. */
typedef struct _VELMCANVASDATA _VELMCANVASDATA;

/* The back-end operations, in their fixed slot order (0-56).  Results are 1
 * for success and 0 for failure unless noted. */
typedef struct _VELMCANVASOPS {
    _VELMCANVASDATA *(*CreateCanvas)(void *native, int width, int height);           /* 0 */
    void *(*GetOutputHandle)(_VELMCANVASDATA *d);                                     /* 1 */
    void *(*GetDrawObject)(_VELMCANVASDATA *d);                                       /* 2 */
    int (*SetDrawObject)(_VELMCANVASDATA *d, void *object);                           /* 3 */
    int (*SelectTarget)(_VELMCANVASDATA *d, int target);                              /* 4 */
    int (*BeginDraw)(_VELMCANVASDATA *d, void *painter);                              /* 5 */
    int (*EndDraw)(_VELMCANVASDATA *d);                                               /* 6 */
    int (*UseLowProfile)(_VELMCANVASDATA *d, int on);                                 /* 7 */
    int (*ResizeCanvas)(_VELMCANVASDATA *d, int width, int height);                   /* 8 */
    int (*DestroyCanvas)(_VELMCANVASDATA *d);                                         /* 9 */
    int (*CopyCanvas)(_VELMCANVASDATA *d, int source, int destination);               /* 10 */
    int (*InitPath)(_VELMCANVASDATA *d);                                              /* 11 */
    int (*ClosePath)(_VELMCANVASDATA *d);                                             /* 12 */
    int (*Clear)(_VELMCANVASDATA *d);                                                 /* 13 */
    int (*ProtectDrawArea)(_VELMCANVASDATA *d, const _VELMRECT *rect);                /* 14 */
    int (*SetDrawArea)(_VELMCANVASDATA *d, const _VELMRECT *rect);                    /* 15 */
    int (*ClearDrawArea)(_VELMCANVASDATA *d);                                         /* 16 */
    int (*GetDimension)(_VELMCANVASDATA *d, int *width, int *height);                 /* 17 */
    int (*GetMaxDimension)(_VELMCANVASDATA *d, int *width, int *height);              /* 18 */
    int (*DrawPoint)(_VELMCANVASDATA *d, int x, int y, uint32_t color);               /* 19 */
    int (*MoveTo)(_VELMCANVASDATA *d, int x, int y);                                  /* 20 */
    int (*LineTo)(_VELMCANVASDATA *d, int x, int y);                                  /* 21 */
    int (*DrawPolygon)(_VELMCANVASDATA *d, const int *xs, const int *ys, int count,
                       uint32_t fill);                                                /* 22 */
    int (*DrawPolyline)(_VELMCANVASDATA *d, const int *xs, const int *ys, int count); /* 23 */
    int (*DrawLine)(_VELMCANVASDATA *d, int x1, int y1, int x2, int y2);              /* 24 */
    int (*TextOut)(_VELMCANVASDATA *d, int x, int y, const char *text);               /* 25 */
    int (*TextOutVertical)(_VELMCANVASDATA *d, int x, int y, const char *text);       /* 26 */
    int (*SaveOverlay)(_VELMCANVASDATA *d, int x, int y, int width, int height);      /* 27 */
    int (*GetOverlayRect)(_VELMCANVASDATA *d, _VELMRECT *rect);                       /* 28 */
    int (*RestoreOverlay)(_VELMCANVASDATA *d);                                        /* 29 */
    VELMCANVASIMAGE (*CreateImage)(_VELMCANVASDATA *d, int width, int height);        /* 30 */
    int (*CopyImage)(_VELMCANVASDATA *d, int x, int y, int width, int height,
                     VELMCANVASIMAGE image);                                          /* 31 */
    int (*PasteImage)(_VELMCANVASDATA *d, VELMCANVASIMAGE image, int x, int y);       /* 32 */
    int (*PasteImageScaled)(_VELMCANVASDATA *d, VELMCANVASIMAGE image, int x, int y, int width,
                            int height);                                              /* 33 */
    int (*DestroyImage)(VELMCANVASIMAGE image);                                       /* 34 */
    int (*ImageWidth)(VELMCANVASIMAGE image);                                         /* 35 */
    int (*ImageHeight)(VELMCANVASIMAGE image);                                        /* 36 */
    int (*PutImage)(_VELMCANVASDATA *d, int x, int y, int width, int height, const void *pixels,
                    int image_width, int image_height, int format, int source_x, int source_y,
                    int source_width, int source_height);                             /* 37 */
    int (*FillRect)(_VELMCANVASDATA *d, int x, int y, int width, int height, int corner,
                    uint32_t corner_flags, uint32_t flags);                           /* 38 */
    int (*BorderRect)(_VELMCANVASDATA *d, int x, int y, int width, int height, int corner,
                      uint32_t corner_flags, uint32_t flags);                         /* 39 */
    int (*FillHorzGradientRect)(_VELMCANVASDATA *d, int x, int y, int width, int height,
                                uint32_t options);                                    /* 40 */
    int (*FillVertGradientRect)(_VELMCANVASDATA *d, int x, int y, int width, int height,
                                uint32_t options);                                    /* 41 */
    int (*ShadowRect)(_VELMCANVASDATA *d, int x, int y, int width, int height, int size,
                      int corner, uint32_t corner_bits, uint32_t side_bits,
                      int opacity);                                                   /* 42 */
    int (*SelectColor)(_VELMCANVASDATA *d, uint32_t color);                           /* 43 */
    int (*SelectColorMap)(_VELMCANVASDATA *d, const VELMCOLORMAP *map);               /* 44 */
    int (*SelectShadowColor)(_VELMCANVASDATA *d, uint32_t color);                     /* 45 */
    int (*SelectFont)(_VELMCANVASDATA *d, const _VELMCANVASFONT *font);               /* 46 */
    int (*SelectFontColor)(_VELMCANVASDATA *d, uint32_t color);                       /* 47 */
    int (*SelectGradient)(_VELMCANVASDATA *d, uint32_t first, uint32_t second);       /* 48 */
    float (*SetAlphaFactor)(_VELMCANVASDATA *d, float factor);                        /* 49: previous */
    int (*MoveBlock)(_VELMCANVASDATA *d, int x, int y, int width, int height, int dest_x,
                     int dest_y);                                                     /* 50 */
    int (*MoveBlock2)(_VELMCANVASDATA *d, int source, int x, int y, int width, int height,
                      int destination, int dest_x, int dest_y);                       /* 51 */
    int (*TextWidth)(_VELMCANVASDATA *d, const char *text);                           /* 52: pixels */
    int (*TextHeight)(_VELMCANVASDATA *d, const char *text);                          /* 53: pixels */
    int (*DrawAlphaRect)(_VELMCANVASDATA *d, int x, int y, int width, int height, int kind); /* 54 */
    int (*DrawImage)(_VELMCANVASDATA *d, int x, int y, int width, int height,
                     const char *path);                                               /* 55 */
    VELMCANVASIMAGE (*LoadImage)(const void *bytes, int64_t length);                  /* 56 */
} _VELMCANVASOPS;

typedef struct _VELMCANVAS {
    int32_t width;               /* allocated size: only grows */
    int32_t height;
    void *native;                /* the host's handle, given again to CreateCanvas on re-creation */
    const _VELMCANVASOPS *ops;   /* shared by every canvas of one back-end */
    _VELMCANVASDATA *data;       /* owned by the back-end; null makes the canvas inert */
} _VELMCANVAS;

typedef _VELMCANVAS *VELMCANVAS;

/* ---- Colour maps (read-only data) ------------------------------------- */

VELM_API extern const VELMCOLORMAP VELMCOLORMAP_CE2K;               /* black-blue-red-yellow-white heat */
VELM_API extern const VELMCOLORMAP VELMCOLORMAP_GRAYSCALE;          /* floor(255 (i/255)^1.8) */
VELM_API extern const VELMCOLORMAP VELMCOLORMAP_INVGRAYSCALE;       /* GRAYSCALE reversed */
VELM_API extern const VELMCOLORMAP VELMCOLORMAP_LINEARGRAYSCALE;    /* i */
VELM_API extern const VELMCOLORMAP VELMCOLORMAP_INVLINEARGRAYSCALE; /* 255 - i, spare byte 255 */

/* ---- Life cycle ------------------------------------------------------- */

/* A canvas on the Qt back-end.  Needs width > 0, height > 0 and a
 * QGuiApplication made by the host (the library never makes one); null
 * otherwise.  The native handle is stored but not used by this back-end. */
VELM_API VELMCANVAS VELMCANVAS_CreateCanvasQT(void *native, int width, int height);
/* A canvas on any back-end: ops must stay valid for the canvas's life. */
VELM_API VELMCANVAS VELMCANVAS_CreateCanvas(const _VELMCANVASOPS *ops, void *native, int width,
                                            int height);
/* Destroys the back-end data, then frees the record; 1, or 0 for null. */
VELM_API int VELMCANVAS_DestroyCanvas(VELMCANVAS canvas);
/* Shows width x max(height, 80); grows the allocated size (re-creating the
 * back-end data) when the request exceeds it.  A failed re-creation leaves
 * the canvas inert until destroyed. */
VELM_API int VELMCANVAS_ResizeCanvas(VELMCANVAS canvas, int width, int height);

/* An image decoded (PNG or any format Qt reads) from bytes; null when the
 * data cannot be read or no QGuiApplication exists. */
VELM_API VELMCANVASIMAGE VELMCANVAS_LoadImageQT(const void *bytes, int64_t length);

/* ---- Forwarded operations --------------------------------------------- */

VELM_API void *VELMCANVAS_GetOutputHandle(VELMCANVAS canvas); /* Qt: the output QPixmap* */
VELM_API void *VELMCANVAS_GetDrawObject(VELMCANVAS canvas);
VELM_API int VELMCANVAS_SetDrawObject(VELMCANVAS canvas, void *object);
VELM_API int VELMCANVAS_SelectTarget(VELMCANVAS canvas, int target);
/* Qt: painter is a QPainter* owned by the host; it is ended if active. */
VELM_API int VELMCANVAS_BeginDraw(VELMCANVAS canvas, void *painter);
VELM_API int VELMCANVAS_EndDraw(VELMCANVAS canvas);
/* Low profile: no antialiasing and no smooth scaling. */
VELM_API int VELMCANVAS_UseLowProfile(VELMCANVAS canvas, int on);
VELM_API int VELMCANVAS_CopyCanvas(VELMCANVAS canvas, int source, int destination);
VELM_API int VELMCANVAS_InitPath(VELMCANVAS canvas);
VELM_API int VELMCANVAS_ClosePath(VELMCANVAS canvas);
VELM_API int VELMCANVAS_Clear(VELMCANVAS canvas);
VELM_API int VELMCANVAS_ProtectDrawArea(VELMCANVAS canvas, const _VELMRECT *rect);
VELM_API int VELMCANVAS_SetDrawArea(VELMCANVAS canvas, const _VELMRECT *rect);
VELM_API int VELMCANVAS_ClearDrawArea(VELMCANVAS canvas);
VELM_API int VELMCANVAS_GetDimension(VELMCANVAS canvas, int *width, int *height);
VELM_API int VELMCANVAS_GetMaxDimension(VELMCANVAS canvas, int *width, int *height);
VELM_API int VELMCANVAS_DrawPoint(VELMCANVAS canvas, int x, int y, uint32_t color);
VELM_API int VELMCANVAS_MoveTo(VELMCANVAS canvas, int x, int y);
VELM_API int VELMCANVAS_LineTo(VELMCANVAS canvas, int x, int y);
/* An envelope: the first half of the points along the top edge left to
 * right, the second half back along the bottom; fill alpha 0 means opaque. */
VELM_API int VELMCANVAS_DrawPolygon(VELMCANVAS canvas, const int *xs, const int *ys, int count,
                                    uint32_t fill);
VELM_API int VELMCANVAS_DrawPolyline(VELMCANVAS canvas, const int *xs, const int *ys, int count);
VELM_API int VELMCANVAS_DrawLine(VELMCANVAS canvas, int x1, int y1, int x2, int y2);
/* Texts are Latin-1 with backslash escapes for phonetic symbols. */
VELM_API int VELMCANVAS_TextOut(VELMCANVAS canvas, int x, int y, const char *text);
VELM_API int VELMCANVAS_TextOutVertical(VELMCANVAS canvas, int x, int y, const char *text);
VELM_API int VELMCANVAS_SaveOverlay(VELMCANVAS canvas, int x, int y, int width, int height);
VELM_API int VELMCANVAS_SaveOverlayRect(VELMCANVAS canvas, const _VELMRECT *rect);
VELM_API int VELMCANVAS_GetOverlayRect(VELMCANVAS canvas, _VELMRECT *rect);
VELM_API int VELMCANVAS_RestoreOverlay(VELMCANVAS canvas);
VELM_API VELMCANVASIMAGE VELMCANVAS_CreateImage(VELMCANVAS canvas, int width, int height);
VELM_API int VELMCANVAS_CopyImage(VELMCANVAS canvas, int x, int y, int width, int height,
                                  VELMCANVASIMAGE image);
VELM_API int VELMCANVAS_PasteImage(VELMCANVAS canvas, VELMCANVASIMAGE image, int x, int y);
VELM_API int VELMCANVAS_PasteImageScaled(VELMCANVAS canvas, VELMCANVASIMAGE image, int x, int y,
                                         int width, int height);
VELM_API int VELMCANVAS_DestroyImage(VELMCANVAS canvas, VELMCANVASIMAGE image);
VELM_API int VELMCANVAS_ImageWidth(VELMCANVAS canvas, VELMCANVASIMAGE image);
VELM_API int VELMCANVAS_ImageHeight(VELMCANVAS canvas, VELMCANVASIMAGE image);
/* Source rows are counted from the bottom of the image. */
VELM_API int VELMCANVAS_PutImage(VELMCANVAS canvas, int x, int y, int width, int height,
                                 const void *pixels, int image_width, int image_height, int format,
                                 int source_x, int source_y, int source_width, int source_height);
/* options: VELMCANVASRECTOPT word (corner size in bits 0-9). */
VELM_API int VELMCANVAS_FillRect(VELMCANVAS canvas, int x, int y, int width, int height,
                                 uint32_t options);
VELM_API int VELMCANVAS_BorderRect(VELMCANVAS canvas, int x, int y, int width, int height,
                                   uint32_t options);
VELM_API int VELMCANVAS_FillHorzGradientRect(VELMCANVAS canvas, int x, int y, int width,
                                             int height, uint32_t options);
VELM_API int VELMCANVAS_FillVertGradientRect(VELMCANVAS canvas, int x, int y, int width,
                                             int height, uint32_t options);
VELM_API int VELMCANVAS_ShadowRect(VELMCANVAS canvas, int x, int y, int width, int height,
                                   int size, uint32_t options);
VELM_API int VELMCANVAS_SelectColor(VELMCANVAS canvas, uint32_t color);
VELM_API int VELMCANVAS_SelectColorMap(VELMCANVAS canvas, const VELMCOLORMAP *map);
VELM_API int VELMCANVAS_SelectShadowColor(VELMCANVAS canvas, uint32_t color);
VELM_API int VELMCANVAS_SelectFont(VELMCANVAS canvas, const _VELMCANVASFONT *font);
VELM_API int VELMCANVAS_SelectFontColor(VELMCANVAS canvas, uint32_t color);
VELM_API int VELMCANVAS_SelectGradient(VELMCANVAS canvas, uint32_t first, uint32_t second);
/* Only FillRect honours the factor.  Returns the previous factor, or -1.0
 * (changing nothing) unless 0 <= factor <= 1. */
VELM_API float VELMCANVAS_SetAlphaFactor(VELMCANVAS canvas, float factor);
VELM_API int VELMCANVAS_MoveBlock(VELMCANVAS canvas, int x, int y, int width, int height,
                                  int dest_x, int dest_y);
VELM_API int VELMCANVAS_MoveBlock2(VELMCANVAS canvas, int source, int x, int y, int width,
                                   int height, int destination, int dest_x, int dest_y);
VELM_API int VELMCANVAS_TextWidth(VELMCANVAS canvas, const char *text);
VELM_API int VELMCANVAS_TextHeight(VELMCANVAS canvas, const char *text);
VELM_API int VELMCANVAS_DrawAlphaRect(VELMCANVAS canvas, int x, int y, int width, int height,
                                      int kind);
/* Loads the image file at path and fits it into the rectangle, keeping its
 * aspect ratio. */
VELM_API int VELMCANVAS_DrawImage(VELMCANVAS canvas, int x, int y, int width, int height,
                                  const char *path);

/* ---- Composite operations --------------------------------------------- */

/* Pastes the image over the rectangle, clipped to it; 0 when a paste
 * failed (the clip is lifted all the same). */
VELM_API int VELMCANVAS_TileImage(VELMCANVAS canvas, VELMCANVASIMAGE image, const _VELMRECT *rect);
/* Word-wrapped text centred vertically in the rectangle (it fills nothing);
 * flags: VELMCANVASTEXT_ alignment and ellipsis.  1 whatever fits; 0 only
 * for a null canvas, rectangle or text. */
VELM_API int VELMCANVAS_FillRectangleText(VELMCANVAS canvas, const _VELMRECT *rect,
                                          const char *text, int flags);
/* Draws the character centred in a cell of max(its width, min_width);
 * returns the next pen position x + cell (0 for an unusable canvas). */
VELM_API int VELMCANVAS_DrawChar(VELMCANVAS canvas, int x, int y, char character, int min_width);
/* A frame of the library's region pictures around the rectangle, fitted to
 * the canvas like a shape with corner size 32. */
VELM_API int VELMCANVAS_BevelRect(VELMCANVAS canvas, int x, int y, int width, int height);

/* The screen size, as the base services know it. */
VELM_API int VELMCANVAS_GetDisplayWidth(void);
VELM_API int VELMCANVAS_GetDisplayHeight(void);
/* The shell's key and button bits as the library's pointer and key flags. */
VELM_API uint32_t VELMCANVAS_TranslateAccKeys(uint32_t keys);

VELM_EXTERN_C_END

#endif /* VELMCANVAS_H */
