/*
 * The audio view renderer: one drawer per document, created at its first
 * draw.  It lays the view out (frame, navigator strip, channel lanes, custom
 * tracks, buttons, scale areas), computes waveform and spectrogram display
 * data in worker threads and paints the view on a canvas: the slow picture on
 * the memory target, copied to the output target, overlays on the output.
 *
 * Columns are pixel columns of the display area (0 .. columns - 1); lanes are
 * numbered c (waveform of channel c), channels + c (spectrogram) and
 * 2 * channels + c (navigator).  Every call answers its failure value (0,
 * -1 for sizes and positions) for a null drawer.
 */
#ifndef VELMDRAW_H
#define VELMDRAW_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmstate.h"
#include "render/canvas/velmcanvas.h"

VELM_EXTERN_C_BEGIN

typedef struct _VELMDRAW *VELMDRAW;
typedef struct _VELMTIMEBASE VELMTIMEBASE;

#define VELMDRAW_MAX_CHANNELS 6

/* Lane kinds. */
#define VELMDRAW_LANE_WAVEFORM    1
#define VELMDRAW_LANE_SPECTROGRAM 2
#define VELMDRAW_LANE_NAVIGATOR   4

/* Areas of VELMDRAW_GetDrawAreaRect besides the lanes (0 .. 17). */
#define VELMDRAW_AREA_FRAME      100
#define VELMDRAW_AREA_DISPLAY    101
#define VELMDRAW_AREA_NAVIGATOR  102
#define VELMDRAW_AREA_HORZSCALE  103

/* ---- Life cycle ------------------------------------------------------- */

/* Null without a document or signal. */
VELM_API VELMDRAW VELMDRAW_Create(VELMAUDIO doc);
/* Joins the workers and releases everything; 1, 0 for null. */
VELM_API int      VELMDRAW_Destroy(VELMDRAW drawer);
/* Re-reads the draw configuration (colours, fonts). */
VELM_API int      VELMDRAW_UpdateConfig(VELMDRAW drawer);
VELM_API int64_t  VELMDRAW_SizeInMemory(VELMDRAW drawer);

/* ---- Frame ------------------------------------------------------------ */

/* Draws what changed between the drawer's last state and state; changed
 * receives the output pixels touched (all zero when none).  1, or 0 when a
 * step failed.  The host has begun drawing on the canvas. */
VELM_API int VELMDRAW_UpdateDraw(VELMDRAW drawer, VELMCANVAS canvas, const VELMSTATE *state,
                                 _VELMRECT *changed);
/* Lays the view out from the drawer's state; flags are reserved (the frame
 * passes 0x80000000). */
VELM_API int VELMDRAW_UpdateDrawAreas(VELMDRAW drawer, uint32_t flags);
/* Scrolls the memory target to the drawer's (new) state by whole columns,
 * computing and drawing only the new ones; a move the grid cannot follow
 * redraws everything. */
VELM_API int VELMDRAW_UpdateViewWindow(VELMDRAW drawer);
VELM_API int VELMDRAW_ProcessAudioToDisplay(VELMDRAW drawer, int first, int last);
VELM_API int VELMDRAW_DrawAudioForm(VELMDRAW drawer, int first, int last);
VELM_API int VELMDRAW_DrawCanvas(VELMDRAW drawer, int first, int last);
/* Ends every worker without waiting for it. */
VELM_API int VELMDRAW_ClearProcessThreads(VELMDRAW drawer);
VELM_API int VELMDRAW_FullRedrawFromMemory(VELMDRAW drawer);
VELM_API int VELMDRAW_RestoreMemoryCanvas(VELMDRAW drawer, int first, int last);
VELM_API int VELMDRAW_MoveAudioCanvas(VELMDRAW drawer, int from, int to, int count);
VELM_API int VELMDRAW_DrawBackground(VELMDRAW drawer);
VELM_API int VELMDRAW_DrawChannelSeparators(VELMDRAW drawer);

/* ---- Sizes and conversions -------------------------------------------- */

VELM_API int32_t  VELMDRAW_MinDrawWidth(VELMDRAW drawer, const VELMSTATE *state);
VELM_API int32_t  VELMDRAW_MinDrawHeight(VELMDRAW drawer, const VELMSTATE *state);
/* Samples per column of the current view: 1 when below 1, -1 before the
 * first layout. */
VELM_API int64_t  VELMDRAW_SamplesPerPixel(VELMDRAW drawer);
VELM_API int      VELMDRAW_ChannelKind(VELMDRAW drawer, int lane);
VELM_API int      VELMDRAW_ChannelNumber(VELMDRAW drawer, int lane);
VELM_API int      VELMDRAW_ConvertAreaXtoCanvasX(VELMDRAW drawer, int x);
VELM_API int      VELMDRAW_ConvertCanvasXtoAreaX(VELMDRAW drawer, int x);
VELM_API int      VELMDRAW_ConvertCanvasYtoAreaY(VELMDRAW drawer, int y);
/* Sample to (fractional) column and back through the main time base. */
VELM_API double   VELMDRAW_ConvertRealXtoDisplayX(VELMDRAW drawer, double sample);
VELM_API double   VELMDRAW_ConvertDisplayXtoRealX(VELMDRAW drawer, double column);
/* The same through a given time base (main or navigator). */
VELM_API const VELMTIMEBASE *VELMDRAW_MainTimeBase(VELMDRAW drawer);
VELM_API const VELMTIMEBASE *VELMDRAW_NavigatorTimeBase(VELMDRAW drawer);
VELM_API double   VELMDRAW_TBConvertRealXtoDisplayX(const VELMTIMEBASE *base, double sample);
VELM_API double   VELMDRAW_TBConvertDisplayXtoRealX(const VELMTIMEBASE *base, double column);
/* Lane 0 .. 17 or a VELMDRAW_AREA_ code; 0 when it is not laid out. */
VELM_API int      VELMDRAW_GetDrawAreaRect(VELMDRAW drawer, int area, _VELMRECT *out);
VELM_API uint32_t VELMDRAW_SelectBGColor(VELMDRAW drawer);
/* Height of custom track 0 .. 7 from its line count, minimum height and the
 * text height of its font on the last canvas; 0 without a canvas. */
VELM_API int32_t  VELMDRAW_CustomTrackHeight(VELMDRAW drawer, int track);
/* Waveform share of the lanes' height, in pixels and as a fraction. */
VELM_API double   VELMDRAW_ConvertWaveHeightToPerc(VELMDRAW drawer, int32_t height);
VELM_API int32_t  VELMDRAW_ConvertWavePercToHeight(VELMDRAW drawer, double fraction);

/* ---- Document entry points -------------------------------------------- */

/* Renders the document onto the canvas when a visual change is pending;
 * declines (0) while a writer holds the signal or when called recursively. */
VELM_API int VELMAUDIO_Draw(VELMCANVAS canvas, VELMAUDIO doc, _VELMRECT *changed);
/* Whether VELMAUDIO_Draw would change the picture. */
VELM_API int VELMAUDIO_RedrawNeeded(VELMCANVAS canvas, VELMAUDIO doc);
VELM_API int VELMAUDIO_UpdateConfig(VELMAUDIO doc);
VELM_API int VELMAUDIO_GetDrawAreaRect(VELMAUDIO doc, int area, _VELMRECT *out);

VELM_EXTERN_C_END

#endif /* VELMDRAW_H */
