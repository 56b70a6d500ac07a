/*
 * A small interactive XY graph: data sets of float samples over a real X
 * axis, title, units and decimals per axis, automatic or fixed scales,
 * mouse zoom and pan, rubber-band selection and a position track.
 *
 * Axis 0 is X, axis 1 is Y.  Calls answer 1 for success and 0 for failure
 * (a null graph, a bad axis, a missing data set) unless noted.
 */
#ifndef VELMGRAPH_H
#define VELMGRAPH_H

#include <stdint.h>

#include "core/velm_api.h"
#include "outside/base/blbase.h"
#include "render/canvas/velmcanvas.h"

VELM_EXTERN_C_BEGIN

typedef struct _VELMGRAPH *VELMGRAPH;
typedef struct _VELMGRAPHDRAW *VELMGRAPHDRAW;

#define VELMGRAPH_TITLE_SIZE 32
#define VELMGRAPH_UNIT_SIZE 8
#define VELMGRAPH_LABEL_SIZE 256
#define VELMGRAPH_KIND_REAL 0
/* Largest sample count a data set accepts. */
#define VELMGRAPH_MAX_SAMPLES ((int64_t)1 << 24)

/* Mouse-over kinds and events. */
#define VELMGRAPH_OVER_NONE 0
#define VELMGRAPH_OVER_WIDGET 0x200
#define VELMGRAPH_OVER_PLOT 0x400
#define VELMGRAPH_OVER_HSCALE_TOP 0x111
#define VELMGRAPH_OVER_HSCALE_BOTTOM 0x112
#define VELMGRAPH_OVER_VSCALE_LEFT 0x121
#define VELMGRAPH_OVER_VSCALE_RIGHT 0x122
#define VELMGRAPH_EVENT_MOUSEOVER 0x20052 /* data1: kind, data2: key state */
#define VELMGRAPH_EVENT_MOUSEDOWN 0x20053 /* data1: kind, data2: button flags */
#define VELMGRAPH_BUTTON_LEFT 32
#define VELMGRAPH_KEY_PAN 2
#define VELMGRAPH_KEY_TRACK 4

typedef struct VELMGRAPHSTATE {
    unsigned char changed;
    char title[VELMGRAPH_TITLE_SIZE];
    char xUnit[VELMGRAPH_UNIT_SIZE];
    char yUnit[VELMGRAPH_UNIT_SIZE];
    int32_t xDecimals, yDecimals;
    double viewXMin, viewXMax, viewYMin, viewYMax;
    double fullXMin, fullXMax, fullYMin, fullYMax;
    double xMargin, yMargin;
    unsigned char trackEnabled, trackVisible;
    int32_t trackX, trackY;
    double selection[4]; /* X min, Y min, X max, Y max */
    uint32_t flags;
} VELMGRAPHSTATE;
#define VELMGRAPHSTATE_FLAG_TITLE 0x80000000u

VELM_API int VELMGRAPHSTATE_Reset(VELMGRAPHSTATE *state);
/* -1: full redraw; else 2 track changed, else 8 selection changed; +4 when
 * the presence of a title changed; 0 when nothing changed. */
VELM_API int VELMGRAPHSTATE_EvalChanges(const VELMGRAPHSTATE *old_state, const VELMGRAPHSTATE *new_state);

VELM_API VELMGRAPH VELMGRAPH_Create(void);
VELM_API int VELMGRAPH_Destroy(VELMGRAPH graph);
/* The graph's state record (read-only for callers); null for a null graph. */
VELM_API const VELMGRAPHSTATE *VELMGRAPH_GetState(VELMGRAPH graph);

VELM_API int VELMGRAPH_SetTitle(VELMGRAPH graph, const char *text);
VELM_API const char *VELMGRAPH_GetTitle(VELMGRAPH graph);
VELM_API int VELMGRAPH_SetScaleUnit(VELMGRAPH graph, int axis, const char *text);
VELM_API const char *VELMGRAPH_GetScaleUnit(VELMGRAPH graph, int axis);
VELM_API int VELMGRAPH_SetScaleDecimalPlaces(VELMGRAPH graph, int axis, int n);
VELM_API int VELMGRAPH_GetScaleDecimalPlaces(VELMGRAPH graph, int axis); /* -1 on failure */
VELM_API int VELMGRAPH_SetScaleViewLimit(VELMGRAPH graph, int axis, double a, double b);
VELM_API int VELMGRAPH_SetScaleViewArea(VELMGRAPH graph, int axis, double a, double b);
VELM_API int VELMGRAPH_SetAutoScale(VELMGRAPH graph, int axis, int on);
VELM_API int VELMGRAPH_SetScaleMargin(VELMGRAPH graph, int axis, double margin);

/* Returns the new id or -1 (bad kind, capacity below 0 or above the limit). */
VELM_API int VELMGRAPH_CreateDataSet(VELMGRAPH graph, int kind, int64_t capacity);
VELM_API int VELMGRAPH_RemoveDataSet(VELMGRAPH graph, int id);
VELM_API int VELMGRAPH_RemoveAllDataSets(VELMGRAPH graph);
VELM_API int VELMGRAPH_ExistsDataSet(VELMGRAPH graph, int id);
VELM_API int VELMGRAPH_SetDataLabel(VELMGRAPH graph, int id, const char *text);
VELM_API const char *VELMGRAPH_GetDataLabel(VELMGRAPH graph, int id);
VELM_API int VELMGRAPH_DataSetCount(VELMGRAPH graph);
VELM_API int VELMGRAPH_FindListOfIds(VELMGRAPH graph, int kind, int *ids, int max);
VELM_API int VELMGRAPH_NextDataSet(VELMGRAPH graph, int id);
VELM_API int64_t VELMGRAPH_GetDataLength(VELMGRAPH graph, int id);
VELM_API int VELMGRAPH_GetDataType(VELMGRAPH graph, int id);
/* The set's own ranges; 1, or 0 when absent or empty. */
VELM_API int VELMGRAPH_GetProperties(VELMGRAPH graph, int id, float *min_x, float *max_x, float *min_y,
                                     float *max_y);

/* Non-finite values are refused (0), like n below 1 or above the limit. */
VELM_API int VELMGRAPH_SetRealData(VELMGRAPH graph, int id, double x_first, double x_last, const float *y,
                                   int64_t n);
VELM_API int VELMGRAPH_SetRealXYData(VELMGRAPH graph, int id, const float *x, const float *y, int64_t n);
VELM_API int VELMGRAPH_GetRealXYData(VELMGRAPH graph, int id, float *x, float *y, int64_t n);
VELM_API int VELMGRAPH_ExtractDataWindow(VELMGRAPH graph, int id, double x_from, double x_to, float *x,
                                         float *y, int64_t n);
VELM_API double VELMGRAPH_GetMinX(VELMGRAPH graph);
VELM_API double VELMGRAPH_GetMaxX(VELMGRAPH graph);
VELM_API double VELMGRAPH_GetMinY(VELMGRAPH graph);
VELM_API double VELMGRAPH_GetMaxY(VELMGRAPH graph);

VELM_API int VELMGRAPH_ZoomHorz(VELMGRAPH graph, double a, double b);
VELM_API int VELMGRAPH_ZoomVert(VELMGRAPH graph, double a, double b);
VELM_API int VELMGRAPH_Zoom(VELMGRAPH graph, double xa, double xb, double ya, double yb);
VELM_API int VELMGRAPH_ZoomSelection(VELMGRAPH graph);
VELM_API int VELMGRAPH_ResetZoomHorz(VELMGRAPH graph);
VELM_API int VELMGRAPH_ResetZoomVert(VELMGRAPH graph);
VELM_API int VELMGRAPH_ResetZoom(VELMGRAPH graph);
VELM_API int VELMGRAPH_Offset(VELMGRAPH graph, double dx, double dy);
VELM_API int VELMGRAPH_UpdateSelection(VELMGRAPH graph, double xa, double xb, double ya, double yb);
VELM_API int VELMGRAPH_ClearSelection(VELMGRAPH graph);
VELM_API int VELMGRAPH_EnablePositionTrack(VELMGRAPH graph);
VELM_API int VELMGRAPH_DisablePositionTrack(VELMGRAPH graph);
VELM_API int VELMGRAPH_PositionTrackVisible(VELMGRAPH graph, int visible);
VELM_API int VELMGRAPH_UpdatePositionTrack(VELMGRAPH graph, int x, int y);

/* Draws the whole graph on a painting canvas (full ranges recomputed, views
 * clamped, the changed flag cleared); mouse input is accepted from then on. */
VELM_API int VELMGRAPH_Draw(VELMCANVAS canvas, VELMGRAPH graph);
VELM_API int VELMGRAPH_RedrawNeeded(void);
VELM_API int VELMGRAPH_AddEventHandler(VELMGRAPH graph, BLNOTIFY_Handler handler, void *user);
VELM_API int VELMGRAPH_DelEventHandler(VELMGRAPH graph, BLNOTIFY_Handler handler, void *user);
VELM_API BLNOTIFY VELMGRAPH_Dispatcher(VELMGRAPH graph);

/* Mouse and key input, in widget pixels; 0 before the first draw. */
VELM_API int VELMGRAPH_MouseMove(VELMGRAPH graph, int x, int y, int buttons);
VELM_API int VELMGRAPH_MouseDown(VELMGRAPH graph, int x, int y, int buttons);
VELM_API int VELMGRAPH_MouseUp(VELMGRAPH graph, int x, int y, int buttons);
VELM_API int VELMGRAPH_MouseWheel(VELMGRAPH graph, int x, int y, int delta);
VELM_API int VELMGRAPH_MouseHWheel(VELMGRAPH graph, int x, int y, int delta);
VELM_API int VELMGRAPH_MouseDblClick(VELMGRAPH graph, int x, int y, int buttons);
VELM_API int VELMGRAPH_AccKeyDown(VELMGRAPH graph, int keys);
VELM_API int VELMGRAPH_AccKeyUp(VELMGRAPH graph, int keys);

VELM_API int VELMGRAPHDRAW_SetDefaultSettings(void);
/* The graph's drawer, made on the first call; owned and destroyed by the graph. */
VELM_API VELMGRAPHDRAW VELMGRAPHDRAW_Create(VELMGRAPH graph);
/* Lays out and paints state with the current settings; does not recompute ranges. */
VELM_API int VELMGRAPHDRAW_Update(VELMGRAPHDRAW drawer, VELMGRAPHSTATE *state, VELMCANVAS canvas);
/* Tick step of an axis of length pixels showing width units; 0 when either is not positive. */
VELM_API double VELMGRAPHDRAW_TickStep(int pixels, double width);

VELM_EXTERN_C_END

#endif /* VELMGRAPH_H */
