/* Configuration: the defaults of every "libvelm." setting, the text forms of
 * scale kinds, window types and colour schemes, the draw configuration
 * records, and the document entry points for draw options and properties. */
#ifndef VELMCONFIG_H
#define VELMCONFIG_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmstate.h"

VELM_EXTERN_C_BEGIN

typedef struct _VELMCONFIGFONT {
    char     familyName[256];
    float    size;
    int32_t  properties;
    uint32_t color;
    uint32_t inactiveColor;
} VELMCONFIGFONT;

typedef struct _VELMDRAWCONFIG {
    uint8_t  lowGraphicsDetails;
    uint32_t windowBgColor, roundBorderColor, appBorderBrush, innerBorderColor, outerBorderColor;
    uint32_t kindSeparatorMiddleColor, scaleLinePen, scaleTickPen;
    uint32_t waveformBgGradientTopBegin, waveformBgGradientTopEnd;
    uint32_t waveformBgGradientBottomBegin, waveformBgGradientBottomEnd;
    uint32_t spectralFormBgBrush, scaleBgBrush, zeroLinePen, inactiveZeroLinePen;
    uint32_t analogWaveformPen, digitalWaveformPen, digitalWaveformContourPen;
    uint32_t inactiveWaveformPen, inactiveWaveformContourPen;
    uint32_t customTrackBgGradientTopBegin, customTrackBgGradientTopEnd;
    uint32_t customTrackBgGradientBottomBegin, customTrackBgGradientBottomEnd, customTrackBgBrush;
    uint32_t defaultTransparency, darkTransparency, redTransparency, greenTransparency, whiteTransparency;
    uint32_t mainCursorActiveColor, playCursorActiveColor, mainCursorInactiveColor, playCursorInactiveColor;
    uint8_t  mainCursorDrawShadow, playCursorDrawShadow, mainCursorDrawSlider, playCursorDrawSlider;
    uint32_t regionBackgroundGradientBegin, regionBackgroundGradientEnd;
    uint32_t regionBorderColor, selectedRegionBorderColor, regionFocusBorderColor;
    VELMCONFIGFONT scaleFont, selectorFont, selectingLabelFont, selectingLabelInfoFont;
    VELMCONFIGFONT regionTextFont, phoneticTextFont;
} VELMDRAWCONFIG;

typedef struct _VELMDISPLAYDRAWCONFIG {
    uint32_t gradientOn[3];
    uint32_t gradientOff[3];
    VELMCONFIGFONT mainFont, editFont, infoFont, audioFormatFont;
} VELMDISPLAYDRAWCONFIG;

VELM_API int VELMCONFIG_ResetConfiguration(void);
VELM_API int VELMCONFIG_ApplyStateConfiguration(VELMAUDIO doc, VELMSTATE *state);
VELM_API int VELMCONFIG_InitDrawConfig(VELMDRAWCONFIG *config);
VELM_API int VELMCONFIG_GetDrawConfig(VELMDRAWCONFIG *config);
VELM_API int VELMCONFIG_InitDisplayDrawConfig(VELMDISPLAYDRAWCONFIG *config);
VELM_API int VELMCONFIG_GetDisplayDrawConfig(VELMDISPLAYDRAWCONFIG *config);

/* Decoding compares the whole text (case matters) and answers the default
 * for anything else; encoding answers "undef" for unknown values. */
VELM_API const char *VELMCONFIG_EncodeWinType(int value);
VELM_API int         VELMCONFIG_DecodeWinType(const char *text, int default_value);
VELM_API const char *VELMCONFIG_EncodeHorzScaleKind(int value);
VELM_API int         VELMCONFIG_DecodeHorzScaleKind(const char *text, int default_value);
VELM_API const char *VELMCONFIG_EncodeVertScaleKind(int value);
VELM_API int         VELMCONFIG_DecodeVertScaleKind(const char *text, int default_value);
VELM_API const char *VELMCONFIG_EncodeSpecScaleKind(int value);
VELM_API int         VELMCONFIG_DecodeSpecScaleKind(const char *text, int default_value);
VELM_API const char *VELMCONFIG_EncodeColorScheme(const struct VELMCOLORMAP *colormap);
VELM_API const struct VELMCOLORMAP *VELMCONFIG_DecodeColorScheme(const char *text, const struct VELMCOLORMAP *default_map);

/* Draw options (the view flags) and draw properties of a document. */
VELM_API int      VELMAUDIO_ChkDrawOption(VELMAUDIO doc, uint32_t mask);
VELM_API int      VELMAUDIO_SetDrawOption(VELMAUDIO doc, uint32_t mask);
VELM_API int      VELMAUDIO_ClrDrawOption(VELMAUDIO doc, uint32_t mask);
VELM_API uint32_t VELMAUDIO_GetDrawKindOption(VELMAUDIO doc);
VELM_API int      VELMAUDIO_SetDrawKindOption(VELMAUDIO doc, uint32_t kind);
VELM_API int      VELMAUDIO_IsVisible(VELMAUDIO doc);
VELM_API int      VELMAUDIO_SetDrawProperty(VELMAUDIO doc, int kind, int32_t value);
VELM_API int32_t  VELMAUDIO_GetDrawProperty(VELMAUDIO doc, int kind);
VELM_API int      VELMAUDIO_GetDrawSpectralConfig(VELMAUDIO doc, VELMSPECTRALCONFIG *out);
VELM_API int      VELMAUDIO_SetDrawSpectralConfig(VELMAUDIO doc, const VELMSPECTRALCONFIG *in);
VELM_API int      VELMAUDIO_SelectNextHorzScaleKind(VELMAUDIO doc);
VELM_API int      VELMAUDIO_SelectNextVertScaleKind(VELMAUDIO doc);
VELM_API int      VELMAUDIO_SelectNextSpecScaleKind(VELMAUDIO doc);

VELM_EXTERN_C_END

#endif /* VELMCONFIG_H */
