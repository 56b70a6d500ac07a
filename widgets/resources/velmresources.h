/*
 * The library's pictures: region frame pieces, cursor and selection handles,
 * the smart-zoom button's faces, the gain button's volume glyphs and a few
 * icons.  Their PNG data are built into the library; VELMRESOURCES_Load turns
 * them into canvas images once per process (VELMCANVAS_CreateCanvasQT calls
 * it, so any program with a canvas has them).  A handle is null until then.
 * The images belong to the library: never destroy them.
 *
 * Sizes, and where the view places them:
 * - Region frame, around a region at (x, y, width, height): RegionRound*Open
 *   corners 12 x 12 (top) and 12 x 16 (bottom) at x - 6 and x + width - 6,
 *   y - 3 and y + height - 8; RegionRoundLeftOpen / RightOpen 12 x 12,
 *   stretched down from y + 9; RegionRectTopOpen 12 x 12 and
 *   RegionRectBottomOpen 12 x 16, stretched across.  Narrow regions use the
 *   square RegionRect* corners and sides, 2 pixels wide, at x and
 *   x + width - 2.  RegionRectOpen is the whole square frame of a 12 x 17
 *   region (12 x 28).  RegionRaggedLeft / Right (12 x 12) replace a side
 *   where the region runs on past the view; tile them down.  The SelRegion*
 *   pieces are the same shapes for selected regions.
 * - Handles, 11 x 17, centred on their column and on the row above the
 *   horizontal scale: BottomCursorSlider (edit cursor), TopCursorSlider (its
 *   tip-down twin), RedCursorSlider (play cursor), TransparentCursorSlider
 *   (selection ends), Left- and RightSelectionSlider (a selection's begin and
 *   end, body inside the selection).
 * - Smart-zoom button faces, 20 x 20: ZoomSelection, ZoomIn, ZoomOut,
 *   ZoomFull, ZoomVertIn, ZoomVertOut.
 * - Gain button glyphs, 30 x 30: VolumeOn, Volume66, Volume33, VolumeOff.
 * - Icons: Lupa (16 x 16 magnifier), LupaMenu (24 x 16, with a menu arrow),
 *   Mouse and Cancel (16 x 16), PlayOverlay (48 x 48), Background (32 x 32
 *   tile of the default window colour).
 */
#ifndef VELMRESOURCES_H
#define VELMRESOURCES_H

#include "core/velm_api.h"
#include "render/canvas/velmcanvas.h"

VELM_EXTERN_C_BEGIN

/* Loads every picture whose handle is still null; handles already loaded
 * are kept.  Returns 1 when all handles are loaded afterwards, 0 when some
 * picture could not be loaded (for example without a QGuiApplication; a
 * later call tries those again). */
VELM_API int VELMRESOURCES_Load(void);

VELM_API extern VELMCANVASIMAGE Img_Background;
VELM_API extern VELMCANVASIMAGE Img_BottomCursorSlider;
VELM_API extern VELMCANVASIMAGE Img_Cancel;
VELM_API extern VELMCANVASIMAGE Img_LeftSelectionSlider;
VELM_API extern VELMCANVASIMAGE Img_Lupa;
VELM_API extern VELMCANVASIMAGE Img_LupaMenu;
VELM_API extern VELMCANVASIMAGE Img_Mouse;
VELM_API extern VELMCANVASIMAGE Img_PlayOverlay;
VELM_API extern VELMCANVASIMAGE Img_RedCursorSlider;
VELM_API extern VELMCANVASIMAGE Img_RegionRaggedLeft;
VELM_API extern VELMCANVASIMAGE Img_RegionRaggedRight;
VELM_API extern VELMCANVASIMAGE Img_RegionRectBottomLeft;
VELM_API extern VELMCANVASIMAGE Img_RegionRectBottomOpen;
VELM_API extern VELMCANVASIMAGE Img_RegionRectBottomRight;
VELM_API extern VELMCANVASIMAGE Img_RegionRectLeft;
VELM_API extern VELMCANVASIMAGE Img_RegionRectOpen;
VELM_API extern VELMCANVASIMAGE Img_RegionRectRight;
VELM_API extern VELMCANVASIMAGE Img_RegionRectTopLeft;
VELM_API extern VELMCANVASIMAGE Img_RegionRectTopOpen;
VELM_API extern VELMCANVASIMAGE Img_RegionRectTopRight;
VELM_API extern VELMCANVASIMAGE Img_RegionRoundBottomLeftOpen;
VELM_API extern VELMCANVASIMAGE Img_RegionRoundBottomRightOpen;
VELM_API extern VELMCANVASIMAGE Img_RegionRoundLeftOpen;
VELM_API extern VELMCANVASIMAGE Img_RegionRoundRightOpen;
VELM_API extern VELMCANVASIMAGE Img_RegionRoundTopLeftOpen;
VELM_API extern VELMCANVASIMAGE Img_RegionRoundTopRightOpen;
VELM_API extern VELMCANVASIMAGE Img_RightSelectionSlider;
VELM_API extern VELMCANVASIMAGE Img_SelRegionRectBottomOpen;
VELM_API extern VELMCANVASIMAGE Img_SelRegionRectLeft;
VELM_API extern VELMCANVASIMAGE Img_SelRegionRectOpen;
VELM_API extern VELMCANVASIMAGE Img_SelRegionRectRight;
VELM_API extern VELMCANVASIMAGE Img_SelRegionRectTopOpen;
VELM_API extern VELMCANVASIMAGE Img_SelRegionRoundBottomLeftOpen;
VELM_API extern VELMCANVASIMAGE Img_SelRegionRoundBottomRightOpen;
VELM_API extern VELMCANVASIMAGE Img_SelRegionRoundLeftOpen;
VELM_API extern VELMCANVASIMAGE Img_SelRegionRoundRightOpen;
VELM_API extern VELMCANVASIMAGE Img_SelRegionRoundTopLeftOpen;
VELM_API extern VELMCANVASIMAGE Img_SelRegionRoundTopRightOpen;
VELM_API extern VELMCANVASIMAGE Img_TopCursorSlider;
VELM_API extern VELMCANVASIMAGE Img_TransparentCursorSlider;
VELM_API extern VELMCANVASIMAGE Img_Volume33;
VELM_API extern VELMCANVASIMAGE Img_Volume66;
VELM_API extern VELMCANVASIMAGE Img_VolumeOff;
VELM_API extern VELMCANVASIMAGE Img_VolumeOn;
VELM_API extern VELMCANVASIMAGE Img_ZoomFull;
VELM_API extern VELMCANVASIMAGE Img_ZoomIn;
VELM_API extern VELMCANVASIMAGE Img_ZoomOut;
VELM_API extern VELMCANVASIMAGE Img_ZoomSelection;
VELM_API extern VELMCANVASIMAGE Img_ZoomVertIn;
VELM_API extern VELMCANVASIMAGE Img_ZoomVertOut;

VELM_EXTERN_C_END

#endif /* VELMRESOURCES_H */
