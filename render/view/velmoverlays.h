/*
 * Overlays of the audio view: what moves often is drawn over the finished
 * picture on the output target (cursors, selections and their sliders, the
 * selection being made with its duration label, the navigator's window box,
 * zoom-limit bars, the quick box), each saving the pixels it covers so that
 * the next frame erases all of them in one restore.  Regions and custom-track
 * backgrounds are drawn into the memory target with the slow layers, from a
 * list of the regions in view that every full redraw rebuilds.
 */
#ifndef VELMOVERLAYS_H
#define VELMOVERLAYS_H

#include <stdint.h>

#include "core/velmconfig.h"
#include "core/velmstate.h"
#include "outside/signal/audioregion.h"
#include "render/view/velmdraw.h"

VELM_EXTERN_C_BEGIN

/* ---- Cursors, selections, navigator, zoom limits, quick box ------------ */

/* Selection modes: 0 committed, 1 and 2 being added, 3 being subtracted. */
VELM_API uint32_t VELMDRAW_SelectTransparencyColor(VELMDRAW drawer, int mode);
/* Draws a selection list over columns first .. last of every lane and
 * custom track that shows selections. */
VELM_API int VELMDRAW_DrawSelections(VELMDRAW drawer, const VELMSELECTION *list, int first, int last, int mode);
/* Redraws the committed selections, or only the columns of the selection
 * being made that differ between the drawn state and the given one. */
VELM_API int VELMDRAW_UpdateSelections(VELMDRAW drawer, const VELMSTATE *state);
VELM_API int VELMDRAW_UpdateSelecting(VELMDRAW drawer, const VELMSTATE *state);
VELM_API int VELMDRAW_DrawSelectionsSlider(VELMDRAW drawer, int first, int last);
/* The navigator's lanes, its visible-window box and its selections. */
VELM_API int VELMDRAW_UpdateNavigator(VELMDRAW drawer);
VELM_API int VELMDRAW_UpdateNavigatorSelecting(VELMDRAW drawer);
VELM_API int VELMDRAW_DrawNavigatorState(VELMDRAW drawer);
VELM_API int VELMDRAW_DrawZoomButton(VELMDRAW drawer);
/* Orders the corners of a quick box and cuts it to the lane under its first
 * corner; with area_coordinates the result is relative to that lane.  0 when
 * no lane holds the corner or the box is empty. */
VELM_API int VELMDRAW_AdjustQuickBox(VELMDRAW drawer, const VELMQUICKBOX *box, _VELMRECT *out, int area_coordinates);
VELM_API int VELMDRAW_ShowQuickBox(VELMDRAW drawer, const VELMQUICKBOX *box);
/* Canvas rectangle of the committed selections over the lanes; 0 when none
 * is in view. */
VELM_API int VELMDRAW_SelectionRect(VELMDRAW drawer, _VELMRECT *out);
/* Canvas rectangle of one selection over the lanes; 0 when it is not in view. */
VELM_API int VELMDRAW_SelectionDragAreaRect(VELMDRAW drawer, const VELMSELECTION *selection, _VELMRECT *out);

/* ---- Regions and custom tracks ------------------------------------------ */

VELM_API int VELMDRAW_UpdateVisibleRegion(VELMDRAW drawer);
VELM_API int VELMDRAW_DrawCustomCanvas(VELMDRAW drawer, int first, int last);
VELM_API int VELMDRAW_DrawVertCustomTracks(VELMDRAW drawer);
VELM_API int VELMDRAW_DrawRegionsAndCues(VELMDRAW drawer, int first, int last);
VELM_API int VELMDRAW_DrawCustomTrackRegions(VELMDRAW drawer, int first, int last);
VELM_API int VELMDRAW_DrawRegionOnFocus(VELMDRAW drawer, int first, int last);
/* After the focused region (whose snapshot is given) changed its edges:
 * redraws the tracks' columns of every region whose place changed, into
 * the memory target and out to the output.  1 when done, 0 on failure, -1
 * (drawing nothing) when a changed region shows over the lanes: only a full
 * redraw shows that. */
VELM_API int VELMDRAW_UpdateChangedRegion(VELMDRAW drawer, const VELMREGIONCOPY *region);
VELM_API int VELMDRAW_DrawCustomTrackRegionShadows(VELMDRAW drawer);
/* Canvas rectangle of a drawn region (a copy of a region finds its
 * original), cut to the display area; 0 when it is not drawn. */
VELM_API int VELMDRAW_GetVisibleRegionRect(VELMDRAW drawer, const AUDIOREGION *region, _VELMRECT *out);
/* Fills out with the font of custom track 0 .. 7 (by track number): the
 * configured region text font, or the phonetic text font for a track with
 * option 0x10000, at the track's font size, colour and inactive colour.
 * Returns out, or null for a bad argument. */
VELM_API const VELMCONFIGFONT *VELMDRAW_GetCustomTrackFont(VELMDRAW drawer, int track, VELMCONFIGFONT *out);

/* ---- Document entry points ---------------------------------------------- */

/* The renderer's selection rectangle; an all-zero rectangle (and 0) without
 * a renderer. */
VELM_API int VELMAUDIO_GetSelectionRect(_VELMRECT *out, VELMAUDIO doc);
/* Where the renderer drew a region (VELMDRAW_GetVisibleRegionRect); 0
 * before the first draw. */
VELM_API int VELMAUDIO_GetRegionDrawRect(VELMAUDIO doc, const AUDIOREGION *region, _VELMRECT *out);
/* The renderer's font of a custom track (VELMDRAW_GetCustomTrackFont); null
 * before the first draw. */
VELM_API const VELMCONFIGFONT *VELMAUDIO_GetCustomTrackFont(VELMAUDIO doc, int track, VELMCONFIGFONT *out);

VELM_EXTERN_C_END

#endif /* VELMOVERLAYS_H */
