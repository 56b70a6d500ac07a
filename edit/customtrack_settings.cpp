// Per-track switches and display properties of custom tracks.  The switches
// live in the document's settings under keys built from the track identifier.
#include <algorithm>
#include <cmath>
#include <cstring>

#include "core/document_internal.hpp"
#include "edit/velmcustomtrack.h"
#include "render/view/velmdraw.h"

namespace {

// The used slot with this identifier, or null.
const VELMCUSTOMTRACK *find(VELMAUDIO doc, const char *identifier)
{
    const int position = doc && identifier ? VELMAUDIO_CustomTrackPosition(doc, identifier) : -1;
    return position >= 0 ? &doc->customTracks[position] : nullptr;
}

bool has_settings(VELMAUDIO doc)
{
    return doc && doc->settings;
}

const VELMTRACKDISPLAY *display(VELMAUDIO doc, int track)
{
    if (!doc || !doc->state || track < 0 || track >= VELM_MAX_CUSTOM_TRACKS) return nullptr;
    return VELMAUDIO_GetCustomTrackUniqId(doc, track) ? &doc->state->tracks[track] : nullptr;
}

int write_switch(VELMAUDIO doc, const char *identifier, const char *name, int on)
{
    const VELMCUSTOMTRACK *slot = find(doc, identifier);
    if (!slot || !has_settings(doc)) return 0;
    return BLSETTINGS_ChangeEx(doc->settings, "libvelm.customtrack.%s.%s=%d", slot->name, name, (on & 0xFF) ? 1 : 0);
}

} // namespace

const char *VELMAUDIO_CustomTrackLabelInPosition(VELMAUDIO doc, int position)
{
    const char *identifier = VELMAUDIO_CustomTrackIdentifierInPosition(doc, position);
    if (!identifier) return nullptr;
    return BLSETTINGS_GetStringEx(nullptr, "libvelm.customtrack.%s.label=[%s]", identifier, identifier);
}

int32_t VELMAUDIO_GetCustomTrackProperty(VELMAUDIO doc, int track, int property)
{
    const VELMTRACKDISPLAY *t = display(doc, track);
    if (!t) return 0;
    switch (property) {
    case 0: return t->visible;
    case 1: return t->minimumHeight;
    case 2: return static_cast<int32_t>(t->options);
    case 3: return t->backgroundColor;
    case 4: return t->backgroundAlpha;
    case 6: return t->lineCount;
    case 7: return static_cast<int32_t>(std::lround(t->fontSize * 100.0f));
    case 8: return t->fontColor;
    case 9: return t->inactiveFontColor;
    default: return 0;
    }
}

int VELMAUDIO_VisibleCustomTrack(VELMAUDIO doc, const char *identifier)
{
    const VELMCUSTOMTRACK *slot = find(doc, identifier);
    if (!slot || !has_settings(doc) || !doc->state) return 0;
    return BLSETTINGS_GetBoolEx(doc->settings, "libvelm.customtrack.%s.visible=[%d]", slot->name,
                                doc->state->tracks[slot->id].visible);
}

int VELMAUDIO_ShowCustomTrack(VELMAUDIO doc, const char *identifier)
{
    const VELMCUSTOMTRACK *slot = find(doc, identifier);
    if (!slot || !has_settings(doc)) return 0;
    BLSETTINGS_ChangeEx(doc->settings, "libvelm.customtrack.%s.visible=%d", slot->name, 1);
    return VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
}

int VELMAUDIO_HideCustomTrack(VELMAUDIO doc, const char *identifier)
{
    const VELMCUSTOMTRACK *slot = find(doc, identifier);
    if (!slot || !has_settings(doc) || !doc->state) return 0;
    VELMSTATE *s = doc->state;
    s->tracks[slot->id].visible = 0;
    if (doc->renderer) {
        s->drawWidth = std::max(s->drawWidth, VELMDRAW_MinDrawWidth(doc->renderer, s));
        s->drawHeight = std::max(s->drawHeight, VELMDRAW_MinDrawHeight(doc->renderer, s));
    }
    s->viewFlags |= 0x80000000u;
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    return BLSETTINGS_ChangeEx(doc->settings, "libvelm.customtrack.%s.visible=%d", slot->name, 0) ? 1 : 0;
}

const char *VELMAUDIO_CustomTrackLabel(VELMAUDIO doc, const char *identifier)
{
    const VELMCUSTOMTRACK *slot = find(doc, identifier);
    if (!slot || !has_settings(doc)) return nullptr;
    return BLSETTINGS_GetStringEx(doc->settings, "libvelm.customtrack.%s.label=[%s]", slot->name, slot->name);
}

int VELMAUDIO_SetCustomTrackLabel(VELMAUDIO doc, const char *identifier, const char *label)
{
    const VELMCUSTOMTRACK *slot = find(doc, identifier);
    if (!slot || !has_settings(doc) || !label) return 0;
    return BLSETTINGS_ChangeEx(doc->settings, "libvelm.customtrack.%s.label=%s", slot->name, label);
}

int VELMAUDIO_CustomTrackNotifyChanges(VELMAUDIO doc, const char *identifier)
{
    const VELMCUSTOMTRACK *slot = find(doc, identifier);
    if (!slot || !has_settings(doc)) return 0;
    return BLSETTINGS_GetBoolEx(doc->settings, "libvelm.customtrack.%s.notifychanges=[1]", slot->name);
}

int VELMAUDIO_SetCustomTrackNotifyChanges(VELMAUDIO doc, const char *identifier, int on)
{
    return write_switch(doc, identifier, "notifychanges", on);
}

int VELMAUDIO_CustomTrackReadOnly(VELMAUDIO doc, const char *identifier)
{
    const VELMCUSTOMTRACK *slot = find(doc, identifier);
    if (!slot || !has_settings(doc)) return 0;
    return BLSETTINGS_GetBoolEx(doc->settings, "libvelm.customtrack.%s.readonly=[%d]", slot->name, 0);
}

int VELMAUDIO_SetCustomTrackReadOnly(VELMAUDIO doc, const char *identifier, int on)
{
    return write_switch(doc, identifier, "readonly", on);
}

int VELMAUDIO_EditableCustomTrack(VELMAUDIO doc, const char *identifier)
{
    return VELMAUDIO_CustomTrackReadOnly(doc, identifier) ? 0 : 1;
}
