// Copying the configuration into a view state, and filling the draw
// configuration records.
#include <cstdio>
#include <cstring>
#include <string>

#include "core/document_internal.hpp"
#include "core/state_internal.hpp"
#include "core/velmconfig.h"
#include "edit/velmcustomtrack.h"

namespace {

bool refresh_spectral(VELMSTATE *s)
{
    std::string preset = BLSETTINGS_GetStringEx(nullptr, "libvelm.spectral.preset=[narrow]");
    if (preset.size() > 512) preset.resize(512);
    const char *p = preset.c_str();
    VELMSPECTRALCONFIG c = s->spectral;
    c.fftLength = BLSETTINGS_GetIntEx(nullptr, "libvelm.spectral.%s.fftlen=[%d]", p, c.fftLength);
    c.windowSize = BLSETTINGS_GetIntEx(nullptr, "libvelm.spectral.%s.winsize=[%d]", p, c.windowSize);
    c.normalize = static_cast<uint8_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.spectral.%s.normalize=[%d]", p, c.normalize));
    c.dynamicRange = BLSETTINGS_GetFloatEx(nullptr, "libvelm.spectral.%s.dynrange=[%f]", p, c.dynamicRange);
    c.preEmphasis = BLSETTINGS_GetFloatEx(nullptr, "libvelm.spectral.%s.preemphcoef=[%f]", p, c.preEmphasis);
    c.windowType = VELMCONFIG_DecodeWinType(BLSETTINGS_GetStringEx(nullptr, "libvelm.spectral.%s.wintype", p), c.windowType);
    c.colorScheme = VELMCONFIG_DecodeColorScheme(BLSETTINGS_GetStringEx(nullptr, "libvelm.spectral.%s.colorscheme", p),
                                                 c.colorScheme);
    const bool differs = velm::spectral_differs(c, s->spectral);
    if (differs) s->spectral = c;
    return differs;
}

bool refresh_scale_kinds(VELMSTATE *s)
{
    const int h = VELMCONFIG_DecodeHorzScaleKind(BLSETTINGS_GetStringEx(nullptr, "libvelm.draw.horzscalekind"), s->horzScaleKind);
    const int v = VELMCONFIG_DecodeVertScaleKind(BLSETTINGS_GetStringEx(nullptr, "libvelm.draw.vertscalekind"), s->vertScaleKind);
    const int f = VELMCONFIG_DecodeSpecScaleKind(BLSETTINGS_GetStringEx(nullptr, "libvelm.draw.specscalekind"), s->spectralScaleKind);
    const bool changed = h != s->horzScaleKind || v != s->vertScaleKind || f != s->spectralScaleKind;
    s->horzScaleKind = h;
    s->vertScaleKind = v;
    s->spectralScaleKind = f;
    return changed;
}

void refresh_track(VELMTRACKDISPLAY &t, const char *id)
{
    char encoded[256];
    VELMDEFINES_EncodeCustomTrackOption(VELMTRACK_SHOWRGNCOMMENT | VELMTRACK_ALLOWPARTIALTEXT, encoded, sizeof encoded);
    t.minimumHeight = BLSETTINGS_GetIntEx(nullptr, "libvelm.customtrack.%s.minheight=[%d]", id, t.minimumHeight);
    t.options = VELMDEFINES_DecodeCustomTrackOption(
        BLSETTINGS_GetStringEx(nullptr, "libvelm.customtrack.%s.options=[%s]", id, encoded));
    t.backgroundColor = BLSETTINGS_GetIntEx(nullptr, "libvelm.customtrack.%s.color=[%d]", id, t.backgroundColor);
    t.backgroundAlpha = static_cast<uint8_t>(
        BLSETTINGS_GetIntEx(nullptr, "libvelm.customtrack.%s.alpha=[0x%X]", id, t.backgroundAlpha));
    t.lineCount = BLSETTINGS_GetIntEx(nullptr, "libvelm.customtrack.%s.numlines=[%d]", id, t.lineCount);
    const char *font = (t.options & VELMTRACK_USEPHONETICFONT) ? "PhoneticTextFont" : "RegionTextFont";
    const double size = BLSETTINGS_GetFloatEx(nullptr, "libvelm.draw.%s.Size", font);
    t.fontSize = static_cast<float>(BLSETTINGS_GetFloatEx(nullptr, "libvelm.customtrack.%s.fontsize=[%f]", id, size) * 0.75);
    const int color = BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.%s.Color", font);
    const int inactive = BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.%s.InactiveColor", font);
    t.fontColor = BLSETTINGS_GetIntEx(nullptr, "libvelm.customtrack.%s.fontcolor=[%d]", id, color);
    t.inactiveFontColor = BLSETTINGS_GetIntEx(nullptr, "libvelm.customtrack.%s.fontcolor=[%d]", id, inactive);
}

void refresh_tracks(VELMAUDIO doc, VELMSTATE *s)
{
    VELMTRACKDISPLAY *first = nullptr, *last = nullptr;
    for (int i = 0; i < doc->customTrackCount; ++i) {
        const VELMCUSTOMTRACK &slot = doc->customTracks[i];
        if (!slot.inUse || slot.id < 0 || slot.id >= VELM_MAX_CUSTOM_TRACKS) continue;
        VELMTRACKDISPLAY &t = s->tracks[slot.id];
        t.visible = static_cast<uint8_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.customtrack.%s.visible=[%d]", slot.name, t.visible));
        if (!t.visible) continue;
        refresh_track(t, slot.name);
        if (!first) first = &t;
        last = &t;
    }
    if (first) first->options |= VELMTRACK_FIRST_VISIBLE;
    if (last) last->options |= VELMTRACK_LAST_VISIBLE;
}

void read_font(VELMCONFIGFONT &f, const char *name)
{
    f.color = static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.%s.Color", name));
    f.inactiveColor = static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.%s.InactiveColor", name));
}

void read_named_font(VELMCONFIGFONT &f, const char *name)
{
    std::snprintf(f.familyName, sizeof f.familyName, "%s", BLSETTINGS_GetStringEx(nullptr, "libvelm.draw.%s.FamilyName", name));
    f.properties = BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.%s.Properties", name);
    read_font(f, name);
    f.size = static_cast<float>(BLSETTINGS_GetFloatEx(nullptr, "libvelm.draw.%s.Size", name) * 0.75);
}

void set_font(VELMCONFIGFONT &f, const char *family, float size, int properties)
{
    std::snprintf(f.familyName, sizeof f.familyName, "%s", family);
    f.size = size;
    f.properties = properties;
}

uint32_t color(const char *key)
{
    return static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.%s", key));
}

} // namespace

int VELMCONFIG_ApplyStateConfiguration(VELMAUDIO doc, VELMSTATE *state)
{
    if (!state) return 0;
    const uint64_t stamp = BLSETTINGS_GetTimeStampEx(nullptr);
    if (state->settingsStamp >= stamp && state->settingsStamp != 0) return 1;
    if (refresh_spectral(state)) state->status |= STATUS_VISUAL_CHANGED;
    if (refresh_scale_kinds(state)) state->status |= STATUS_VISUAL_CHANGED;
    if (doc) refresh_tracks(doc, state);
    state->scaleFrameLength =
        BLSETTINGS_GetIntEx(nullptr, "libvelm.general.msscaleframeduration=[%d]", state->scaleFrameLength);
    state->settingsStamp = stamp;
    return 1;
}

int VELMCONFIG_GetDrawConfig(VELMDRAWCONFIG *c)
{
    if (!c) return 0;
    c->lowGraphicsDetails = BLSETTINGS_GetBoolEx(nullptr, "libvelm.draw.lowgraphicsdetails") ? 1 : 0;
    uint32_t *colors[] = {
        &c->windowBgColor, &c->roundBorderColor, &c->appBorderBrush, &c->innerBorderColor, &c->outerBorderColor,
        &c->kindSeparatorMiddleColor, &c->scaleLinePen, &c->scaleTickPen, &c->waveformBgGradientTopBegin,
        &c->waveformBgGradientTopEnd, &c->waveformBgGradientBottomBegin, &c->waveformBgGradientBottomEnd,
        &c->spectralFormBgBrush, &c->scaleBgBrush, &c->zeroLinePen, &c->inactiveZeroLinePen, &c->analogWaveformPen,
        &c->digitalWaveformPen, &c->digitalWaveformContourPen, &c->inactiveWaveformPen, &c->inactiveWaveformContourPen,
        &c->customTrackBgGradientTopBegin, &c->customTrackBgGradientTopEnd, &c->customTrackBgGradientBottomBegin,
        &c->customTrackBgGradientBottomEnd, &c->customTrackBgBrush, &c->defaultTransparency, &c->darkTransparency,
        &c->redTransparency, &c->greenTransparency, &c->whiteTransparency};
    static const char *const keys[] = {
        "windowbgcolor", "roundbordercolor", "appborderbrush", "innerbordercolor", "outerbordercolor",
        "kindseparatormiddlecolor", "scalelinepen", "scaletickpen", "waveformbggradienttopbegin",
        "waveformbggradienttopend", "waveformbggradientbottombegin", "waveformbggradientbottomend",
        "spectralformbgbrush", "scalebgbrush", "zerolinepen", "inactivezerolinepen", "analogwaveformpen",
        "digitalwaveformpen", "digitalwaveformcontourpen", "inactivewaveformpen", "inactivewaveformcontourpen",
        "customtrackbggradienttopbegin", "customtrackbggradienttopend", "customtrackbggradientbottombegin",
        "customtrackbggradientbottomend", "customtrackbgbrush", "defaulttransparency", "darktransparency",
        "redtransparency", "greentransparency", "whitetransparency"};
    static_assert(sizeof keys / sizeof keys[0] == sizeof colors / sizeof colors[0]);
    for (size_t i = 0; i < sizeof keys / sizeof keys[0]; ++i) *colors[i] = color(keys[i]);
    c->mainCursorActiveColor = color("maincursor.activecolor");
    c->playCursorActiveColor = color("playcursor.activecolor");
    c->mainCursorInactiveColor = color("maincursor.inactivecolor");
    c->playCursorInactiveColor = color("playcursor.inactivecolor");
    c->mainCursorDrawShadow = BLSETTINGS_GetBoolEx(nullptr, "libvelm.draw.maincursor.drawshadow") ? 1 : 0;
    c->playCursorDrawShadow = BLSETTINGS_GetBoolEx(nullptr, "libvelm.draw.playcursor.drawshadow") ? 1 : 0;
    c->mainCursorDrawSlider = BLSETTINGS_GetBoolEx(nullptr, "libvelm.draw.maincursor.drawslider") ? 1 : 0;
    c->playCursorDrawSlider = BLSETTINGS_GetBoolEx(nullptr, "libvelm.draw.playcursor.drawslider") ? 1 : 0;
    c->regionBackgroundGradientBegin = color("regionbackgroundgradientbegin");
    c->regionBackgroundGradientEnd = color("regionbackgroundgradientend");
    c->regionBorderColor = color("regionbordercolor");
    c->selectedRegionBorderColor = color("selectedregionbordercolor");
    c->regionFocusBorderColor = color("regionfocusbordercolor");
    read_font(c->scaleFont, "scaleFont");
    read_font(c->selectorFont, "SelectorFont");
    read_font(c->selectingLabelFont, "SelectingLabelFont");
    read_font(c->selectingLabelInfoFont, "selectinglabelinfofont");
    read_named_font(c->regionTextFont, "RegionTextFont");
    read_named_font(c->phoneticTextFont, "PhoneticTextFont");
    return 1;
}

int VELMCONFIG_InitDrawConfig(VELMDRAWCONFIG *c)
{
    if (!c) return 0;
    set_font(c->scaleFont, "Tahoma", 6.5f, 0x80);
    set_font(c->selectorFont, "Tahoma", 7.2f, 0x80);
    set_font(c->selectingLabelFont, "Forgotten Futurist", 15.0f, 0);
    set_font(c->selectingLabelInfoFont, "Tahoma", 9.0f, 0);
    return VELMCONFIG_GetDrawConfig(c);
}

int VELMCONFIG_GetDisplayDrawConfig(VELMDISPLAYDRAWCONFIG *c)
{
    if (!c) return 0;
    for (int i = 0; i < 3; ++i) {
        c->gradientOn[i] = static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.display.gradient.on.%d", i));
        c->gradientOff[i] = static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.display.gradient.off.%d", i));
    }
    read_font(c->mainFont, "display.font");
    read_font(c->editFont, "display.editfont");
    read_font(c->infoFont, "display.infofont");
    read_font(c->audioFormatFont, "display.audioformatfont");
    return 1;
}

int VELMCONFIG_InitDisplayDrawConfig(VELMDISPLAYDRAWCONFIG *c)
{
    if (!c) return 0;
    set_font(c->mainFont, "Forgotten Futurist", 24.0f, 0);
    set_font(c->editFont, "Forgotten Futurist", 24.0f, 0);
    set_font(c->infoFont, "Arial", 7.5f, 0);
    set_font(c->audioFormatFont, "Arial", 8.0f, 0);
    return VELMCONFIG_GetDisplayDrawConfig(c);
}
