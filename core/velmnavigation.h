/* Moving the audio view: the visible window inside the zoom limits, the
 * amplitude and frequency ranges, the edit and play cursors, the channels
 * shown and a few optional controls. */
#ifndef VELMNAVIGATION_H
#define VELMNAVIGATION_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmstate.h"

VELM_EXTERN_C_BEGIN

/* ---- Window and limits ---- */
VELM_API int64_t VELMAUDIO_ViewBegin(VELMAUDIO doc);
VELM_API int64_t VELMAUDIO_ViewEnd(VELMAUDIO doc);
VELM_API int64_t VELMAUDIO_ViewLength(VELMAUDIO doc);
VELM_API int64_t VELMAUDIO_ViewBeginLimit(VELMAUDIO doc);
VELM_API int64_t VELMAUDIO_ViewEndLimit(VELMAUDIO doc);
VELM_API int64_t VELMAUDIO_ViewLengthLimit(VELMAUDIO doc);
VELM_API int VELMAUDIO_Zoom(VELMAUDIO doc, int64_t a, int64_t b);
VELM_API int VELMAUDIO_ZoomArea(VELMAUDIO doc, int64_t a, float top, int64_t b, float bottom);
VELM_API int VELMAUDIO_ZoomReset(VELMAUDIO doc);
VELM_API int VELMAUDIO_ZoomFullReset(VELMAUDIO doc);
VELM_API int VELMAUDIO_ZoomOffset(VELMAUDIO doc, int64_t offset);
VELM_API void VELMAUDIO_ZoomByFactor(VELMAUDIO doc, int64_t centre, double factor);
VELM_API int VELMAUDIO_ZoomIn(VELMAUDIO doc);
VELM_API int VELMAUDIO_ZoomOut(VELMAUDIO doc);
VELM_API int VELMAUDIO_ZoomCursor(VELMAUDIO doc);
VELM_API int VELMAUDIO_ZoomPlayCursor(VELMAUDIO doc);
VELM_API int VELMAUDIO_SetZoomLimits(VELMAUDIO doc, int64_t a, int64_t b);
VELM_API int VELMAUDIO_ResetZoomLimits(VELMAUDIO doc);
VELM_API int VELMAUDIO_SetZoomLimitsToView(VELMAUDIO doc);
VELM_API int VELMAUDIO_SetZoomLimitsToSelection(VELMAUDIO doc);
VELM_API int VELMAUDIO_ZoomSelection(VELMAUDIO doc);
/* Samples per pixel column of the drawn view; -1 for a null document, 0 before the first draw. */
VELM_API int32_t VELMAUDIO_SamplesPerPixel(VELMAUDIO doc);
VELM_API int VELMAUDIO_CanZoomIn(VELMAUDIO doc);
VELM_API int VELMAUDIO_CanZoomOut(VELMAUDIO doc);
VELM_API int VELMAUDIO_HasZoom(VELMAUDIO doc);
VELM_API int VELMAUDIO_HasZoomLimit(VELMAUDIO doc);

/* ---- Vertical and spectral ranges ---- */
VELM_API int VELMAUDIO_ZoomVertical(VELMAUDIO doc, float a, float b);
VELM_API int VELMAUDIO_ZoomVerticalReset(VELMAUDIO doc);
VELM_API int VELMAUDIO_ZoomVerticalFactor(VELMAUDIO doc, double factor);
VELM_API int VELMAUDIO_ZoomVerticalOut(VELMAUDIO doc);
VELM_API int VELMAUDIO_ZoomVerticalIn(VELMAUDIO doc);
VELM_API int VELMAUDIO_ScrollVertical(VELMAUDIO doc, float delta);
VELM_API int VELMAUDIO_ZoomSpectral(VELMAUDIO doc, float a, float b);
VELM_API int VELMAUDIO_ZoomSpectralReset(VELMAUDIO doc);
VELM_API int VELMAUDIO_ZoomSpectralFactor(VELMAUDIO doc, double factor);
VELM_API int VELMAUDIO_ZoomSpectralFactorAround(VELMAUDIO doc, float centre, double factor);
VELM_API int VELMAUDIO_ScrollSpectral(VELMAUDIO doc, float delta);

/* ---- Edit cursor ---- */
VELM_API int     VELMAUDIO_SetCursorPosition(VELMAUDIO doc, int64_t position);
VELM_API int64_t VELMAUDIO_GetCursorPosition(VELMAUDIO doc);
VELM_API int     VELMAUDIO_CursorPositionChanged(VELMAUDIO doc);
VELM_API int64_t VELMAUDIO_GetCursorChangedPosition(VELMAUDIO doc);
VELM_API int64_t VELMAUDIO_GetAnchorChangedPosition(VELMAUDIO doc);
VELM_API double  VELMAUDIO_GetDisplayTime(VELMAUDIO doc);
VELM_API int     VELMAUDIO_CursorVisible(VELMAUDIO doc);
VELM_API int     VELMAUDIO_ShowMainCursor(VELMAUDIO doc);
VELM_API int     VELMAUDIO_HideMainCursor(VELMAUDIO doc);
VELM_API int     VELMAUDIO_ScrollToKeepCursorVisible(VELMAUDIO doc);

/* ---- Positions along the horizontal scale (0 without a renderer) ---- */
VELM_API int64_t VELMAUDIO_GetNextPosition(VELMAUDIO doc, int64_t position);
VELM_API int64_t VELMAUDIO_GetPrevPosition(VELMAUDIO doc, int64_t position);
VELM_API int64_t VELMAUDIO_GetNextTickPosition(VELMAUDIO doc, int64_t position);
VELM_API int64_t VELMAUDIO_GetPrevTickPosition(VELMAUDIO doc, int64_t position);

/* ---- Channels and controls ---- */
VELM_API int      VELMAUDIO_SetChannelMask(VELMAUDIO doc, uint32_t mask);
VELM_API uint32_t VELMAUDIO_ActiveChannelMask(VELMAUDIO doc);
VELM_API uint32_t VELMAUDIO_DisabledChannelMask(VELMAUDIO doc);
VELM_API int VELMAUDIO_ChangeSmartZoomAction(VELMAUDIO doc, int action);
VELM_API int VELMAUDIO_ChangeControlVisibility(VELMAUDIO doc, int control, int show);
VELM_API int VELMAUDIO_IsControlVisible(VELMAUDIO doc, uint32_t mask);
VELM_API int VELMAUDIO_ChangeChannelControlVisibility(VELMAUDIO doc, int slot, int control, int show);
VELM_API int VELMAUDIO_IsChannelControlVisible(VELMAUDIO doc, int slot, uint32_t mask);

/* The play cursor: its position while shown (else -1), whether it is shown,
 * showing and hiding it.  Showing needs a live player.  Set (the user moves
 * it; playback follows) and Update (playback advances it) answer the
 * previous position, 0 when nothing changed, -1 when no shown play cursor of
 * a live player exists. */
VELM_API int64_t VELMAUDIO_GetPlayCursorPosition(VELMAUDIO doc);
VELM_API int     VELMAUDIO_PlayCursorVisible(VELMAUDIO doc);
VELM_API int     VELMAUDIO_ShowPlayCursor(VELMAUDIO doc);
VELM_API int     VELMAUDIO_HidePlayCursor(VELMAUDIO doc);
VELM_API int64_t VELMAUDIO_SetPlayCursorPosition(VELMAUDIO doc, int64_t position);
VELM_API int64_t VELMAUDIO_UpdatePlayCursorPosition(VELMAUDIO doc, int64_t position);
/* Shows the mute indicator of each waveform display of an active channel
 * whose playback gain is zero (all of them with force); needs a renderer. */
VELM_API int     VELMAUDIO_UpdateMuteChannelControlsVisibility(VELMAUDIO doc, int force);

VELM_EXTERN_C_END

#endif /* VELMNAVIGATION_H */
