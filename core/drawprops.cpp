// Draw options (the view flags) and draw properties of a document.
#include <algorithm>
#include <cstring>

#include "core/document_internal.hpp"
#include "core/state_internal.hpp"
#include "core/velmconfig.h"
#include "render/view/velmdraw.h"

namespace {

bool has_state(VELMAUDIO doc)
{
    return doc && doc->state;
}

// Until a renderer is attached, the view has no minimum size.
int32_t minimum_width(VELMAUDIO doc)
{
    return doc->renderer ? VELMDRAW_MinDrawWidth(doc->renderer, doc->state) : 0;
}

int32_t minimum_height(VELMAUDIO doc)
{
    return doc->renderer ? VELMDRAW_MinDrawHeight(doc->renderer, doc->state) : 0;
}

// The waveform's share of the lanes, given in pixels; the renderer knows the
// lanes' height once it has laid them out.
int set_wave_height(VELMAUDIO doc, int32_t height)
{
    if (!doc->renderer) doc->renderer = VELMDRAW_Create(doc);
    const double fraction = VELMDRAW_ConvertWaveHeightToPerc(doc->renderer, height);
    if (fraction < 0.0) return 0;
    const float clamped = static_cast<float>(std::clamp(fraction, 0.2, 0.8));
    if (doc->state->waveHeightFraction != clamped) {
        doc->state->waveHeightFraction = clamped;
        VELMSTATE_NotifyChanges(doc, 0);
    }
    return 1;
}

void store_size(VELMAUDIO doc, int32_t VELMSTATE::*field, int32_t value)
{
    if (doc->state->*field != value) {
        doc->state->*field = value;
        VELMSTATE_NotifyChanges(doc, 0);
    }
}

void raise_to_minimum(VELMAUDIO doc)
{
    store_size(doc, &VELMSTATE::drawWidth, std::max(doc->state->drawWidth, minimum_width(doc)));
    store_size(doc, &VELMSTATE::drawHeight, std::max(doc->state->drawHeight, minimum_height(doc)));
}

// Scale kinds live in the global registry: every document follows them.
int set_scale_kind(VELMAUDIO doc, const char *key, const char *name, uint32_t event, int32_t kind)
{
    if (BLSETTINGS_ChangeEx(nullptr, "libvelm.draw.%s=%s", key, name)) {
        VELMSTATE_NotifyChanges(doc, 0);
        BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, event, &kind, nullptr);
    }
    return 1;
}

} // namespace

int VELMAUDIO_ChkDrawOption(VELMAUDIO doc, uint32_t mask)
{
    return has_state(doc) && (doc->state->viewFlags & mask) ? 1 : 0;
}

int VELMAUDIO_SetDrawOption(VELMAUDIO doc, uint32_t mask)
{
    if (!has_state(doc)) return 0;
    doc->state->viewFlags |= mask;
    raise_to_minimum(doc);
    VELMSTATE_NotifyChanges(doc, 0);
    return 1;
}

int VELMAUDIO_ClrDrawOption(VELMAUDIO doc, uint32_t mask)
{
    if (!has_state(doc)) return 0;
    doc->state->viewFlags &= ~mask;
    raise_to_minimum(doc);
    VELMSTATE_NotifyChanges(doc, 0);
    return 1;
}

uint32_t VELMAUDIO_GetDrawKindOption(VELMAUDIO doc)
{
    return has_state(doc) ? (doc->state->viewFlags & 0x3u) : 0;
}

int VELMAUDIO_SetDrawKindOption(VELMAUDIO doc, uint32_t kind)
{
    if (!has_state(doc)) return 0;
    doc->state->viewFlags = (doc->state->viewFlags & ~0x3u) | kind;
    VELMSTATE_NotifyChanges(doc, 0);
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x20028, nullptr, nullptr);
    return 1;
}

int VELMAUDIO_IsVisible(VELMAUDIO doc)
{
    return VELMAUDIO_ChkDrawOption(doc, 0x200000u);
}

int VELMAUDIO_SetDrawProperty(VELMAUDIO doc, int kind, int32_t value)
{
    if (!has_state(doc)) return 0;
    switch (kind) {
    case 0: store_size(doc, &VELMSTATE::drawWidth, std::max(value, minimum_width(doc))); return 1;
    case 1: store_size(doc, &VELMSTATE::drawHeight, std::max(value, minimum_height(doc))); return 1;
    case 2:
        if (doc->state->viewFlags != static_cast<uint32_t>(value)) {
            doc->state->viewFlags = static_cast<uint32_t>(value);
            VELMSTATE_NotifyChanges(doc, 0);
        }
        raise_to_minimum(doc);
        return 1;
    case 3: return set_scale_kind(doc, "vertscalekind", VELMCONFIG_EncodeVertScaleKind(value), 0x2002A, value);
    case 4: return set_scale_kind(doc, "specscalekind", VELMCONFIG_EncodeSpecScaleKind(value), 0x2002B, value);
    case 5: return set_scale_kind(doc, "horzscalekind", VELMCONFIG_EncodeHorzScaleKind(value), 0x20029, value);
    case 6: return set_wave_height(doc, value);
    case 7: store_size(doc, &VELMSTATE::navigatorHeight, value); return 1;
    default: return 1;
    }
}

int32_t VELMAUDIO_GetDrawProperty(VELMAUDIO doc, int kind)
{
    if (!has_state(doc)) return 0;
    const VELMSTATE *s = doc->state;
    switch (kind) {
    case 0: return s->drawWidth;
    case 1: return s->drawHeight;
    case 2: return static_cast<int32_t>(s->viewFlags);
    case 3: return VELMCONFIG_DecodeVertScaleKind(BLSETTINGS_GetStringEx(nullptr, "libvelm.draw.vertscalekind"), s->vertScaleKind);
    case 4: return VELMCONFIG_DecodeSpecScaleKind(BLSETTINGS_GetStringEx(nullptr, "libvelm.draw.specscalekind"), s->spectralScaleKind);
    case 5: return VELMCONFIG_DecodeHorzScaleKind(BLSETTINGS_GetStringEx(nullptr, "libvelm.draw.horzscalekind"), s->horzScaleKind);
    case 6: return doc->renderer ? VELMDRAW_ConvertWavePercToHeight(doc->renderer, s->waveHeightFraction) : 0;
    default: return 0;
    }
}

int VELMAUDIO_GetDrawSpectralConfig(VELMAUDIO doc, VELMSPECTRALCONFIG *out)
{
    if (!has_state(doc) || !out) return 0;
    *out = doc->state->spectral;
    return 1;
}

int VELMAUDIO_SetDrawSpectralConfig(VELMAUDIO doc, const VELMSPECTRALCONFIG *in)
{
    if (!has_state(doc) || !in) return 0;
    VELMSPECTRALCONFIG &current = doc->state->spectral;
    if (velm::spectral_differs(*in, current)) {
        current = *in;
        VELMSTATE_NotifyChanges(doc, 0);
    }
    return 1;
}

int VELMAUDIO_SelectNextHorzScaleKind(VELMAUDIO doc)
{
    if (!has_state(doc)) return 0;
    return VELMAUDIO_SetDrawProperty(doc, 5, (doc->state->horzScaleKind + 1) % 6);
}

int VELMAUDIO_SelectNextVertScaleKind(VELMAUDIO doc)
{
    if (!has_state(doc)) return 0;
    static const int next[] = {3, 3, 0, 2};
    const int kind = doc->state->vertScaleKind;
    return VELMAUDIO_SetDrawProperty(doc, 3, kind >= 0 && kind <= 3 ? next[kind] : 0);
}

int VELMAUDIO_SelectNextSpecScaleKind(VELMAUDIO doc)
{
    if (!has_state(doc)) return 0;
    return VELMAUDIO_SetDrawProperty(doc, 4, doc->state->spectralScaleKind == 0 ? 1 : 0);
}
