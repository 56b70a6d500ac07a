// The focused and current regions, and selecting regions.
#include <cstring>

#include "core/velmnavigation.h"
#include "edit/region_internal.hpp"
#include "edit/velmcustomtrack.h"
#include "edit/velmselection.h"

namespace {

constexpr uint32_t kNoScrollOnSelection = 0x400;

VELMREGIONCOPY copy_of(const AUDIOREGION *region)
{
    return VELMREGIONCOPY{velm::identity(region), region->begin, region->length, region->flags};
}

int send(VELMAUDIO doc, uint32_t code, void *first, void *second)
{
    return BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, code, first, second);
}

// Scrolls the view so that a selected region shows, unless its track says not to.
int keep_visible(VELMAUDIO doc, AUDIOREGION *region)
{
    if ((velm::region_track_options(doc, region) & kNoScrollOnSelection) || VELMAUDIO_IsRegionVisible(doc, region, 1))
        return 1;
    const VELMSTATE *s = doc->state;
    const int64_t begin = AUDIOREGION_BeginSample(region), end = AUDIOREGION_EndSample(region);
    int64_t shift = 0;
    if (end > s->viewEnd)
        shift = end - s->viewEnd;
    else if (begin < s->viewBegin)
        shift = begin - s->viewBegin;
    return shift ? VELMAUDIO_Zoom(doc, s->viewBegin + shift, s->viewEnd + shift) : 1;
}

} // namespace

namespace velm {

AUDIOREGION *identity(const AUDIOREGION *region)
{
    return region ? region->identity : nullptr;
}

bool owns_region(VELMAUDIO doc, const AUDIOREGION *region)
{
    return doc && doc->signal && region && AUDIOREGION_GetParentSignal(identity(region)) == doc->signal;
}

bool region_track_editable(VELMAUDIO doc, const AUDIOREGION *region)
{
    const char *identifier = VELMAUDIO_GetCustomTrackUniqId(doc, static_cast<int>(region->flags & AUDIOREGION_TRACK_MASK));
    return !identifier || VELMAUDIO_EditableCustomTrack(doc, identifier);
}

uint32_t region_track_options(VELMAUDIO doc, const AUDIOREGION *region)
{
    return static_cast<uint32_t>(
        VELMAUDIO_GetCustomTrackProperty(doc, static_cast<int>(region->flags & AUDIOREGION_TRACK_MASK), 2));
}

void clear_current(VELMAUDIO doc)
{
    doc->state->currentRegion = VELMREGIONCOPY{};
}

void drop_focus_on(VELMAUDIO doc, const AUDIOREGION *region)
{
    if (doc->state->focusedRegion.region == identity(region)) doc->state->focusedRegion = VELMREGIONCOPY{};
}

} // namespace velm

AUDIOREGION *VELMAUDIO_GetRegionOnFocus(VELMAUDIO doc)
{
    return doc && doc->state ? static_cast<AUDIOREGION *>(doc->state->focusedRegion.region) : nullptr;
}

AUDIOREGION *VELMAUDIO_GetCurrentRegion(VELMAUDIO doc)
{
    return doc && doc->state ? static_cast<AUDIOREGION *>(doc->state->currentRegion.region) : nullptr;
}

int VELMAUDIO_EventOverFocusedRegion(VELMAUDIO doc)
{
    if (!doc || !doc->state) return 0;
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_FOCUS);
    return 1;
}

int VELMAUDIO_SetFocusOnRegion(VELMAUDIO doc, const AUDIOREGION *region)
{
    if (!doc || !doc->state) return 0;
    void *old = doc->state->focusedRegion.region;
    if (velm::identity(region) == old && region) return 1;
    if (!region) {
        if (!old) return 1;
        send(doc, 0x20022, old, nullptr);
        doc->state->focusedRegion = VELMREGIONCOPY{};
    } else {
        if (!send(doc, 0x20021, velm::identity(region), old)) return 1;
        doc->state->focusedRegion = copy_of(region);
    }
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    return 1;
}

int VELMAUDIO_SetCurrentRegion(VELMAUDIO doc, const AUDIOREGION *region)
{
    if (!doc || !doc->state) return 0;
    void *old = doc->state->currentRegion.region;
    if (region && velm::identity(region) == old) return 1;
    if (!region) {
        velm::clear_current(doc);
    } else {
        if (!send(doc, 0x20020, velm::identity(region), old)) return 0;
        doc->state->currentRegion = copy_of(region);
    }
    VELMSTATE_NotifyChanges(doc, 0);
    return 1;
}

int VELMAUDIO_SelectFocusedRegion(VELMAUDIO doc)
{
    AUDIOREGION *focused = VELMAUDIO_GetRegionOnFocus(doc);
    if (!focused) return 0;
    const int64_t begin = AUDIOREGION_BeginSample(focused);
    VELMAUDIO_SelectAudio(doc, begin, AUDIOREGION_EndSample(focused));
    return VELMAUDIO_SetCursorPosition(doc, begin);
}

int VELMAUDIO_SelectRegion(VELMAUDIO doc, AUDIOREGION *region)
{
    if (!velm::owns_region(doc, region)) return 0;
    AUDIOREGION *live = velm::identity(region);
    if (!AUDIOREGION_IsSelected(live)) {
        if (!AUDIOREGION_Select(live)) return 0;
        VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    }
    doc->state->cursor.shown = 0;
    VELMAUDIO_SetCurrentRegion(doc, live);
    return keep_visible(doc, live);
}

int VELMAUDIO_UnselectRegion(VELMAUDIO doc, AUDIOREGION *region)
{
    if (!velm::owns_region(doc, region)) return 0;
    AUDIOREGION *live = velm::identity(region);
    if (!AUDIOREGION_IsSelected(live)) return 1;
    AUDIOREGION_Unselect(live);
    velm::clear_current(doc);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    return 1;
}

int VELMAUDIO_UnselectAllRegions(VELMAUDIO doc)
{
    if (!doc || !doc->signal || !AUDIOSIGNAL_UnselectAllRegions(doc->signal)) return 0;
    velm::clear_current(doc);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    return 1;
}

int VELMAUDIO_UnselectAllRegionsOfTrack(VELMAUDIO doc, int track)
{
    if (!doc || !doc->signal || !AUDIOSIGNAL_UnselectAllRegionsOfTrack(doc->signal, track)) return 0;
    velm::clear_current(doc);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    return 1;
}

int VELMAUDIO_SelectRegions(VELMAUDIO doc, const AUDIOREGION *from, const AUDIOREGION *to)
{
    if (!doc || !doc->signal || !from || !to) return 0;
    AUDIOREGION *start = velm::identity(from), *stop = velm::identity(to);
    const bool backwards = AUDIOREGION_Begin(stop) < AUDIOREGION_Begin(start);
    auto step = [&](const AUDIOREGION *r) {
        return backwards ? VELMAUDIO_GetPrevRegion(doc, r) : VELMAUDIO_GetNextRegion(doc, r);
    };
    AUDIOREGION *previous = start;
    int steps = 0;
    for (AUDIOREGION *r = step(start); r; previous = r, r = step(r)) {
        if (AUDIOREGION_IsSelected(r)) VELMAUDIO_UnselectRegion(doc, previous);
        VELMAUDIO_SelectRegion(doc, r);
        ++steps;
        if (r == stop) break;
    }
    return steps > 0 ? 1 : 0;
}

static int select_to_end(VELMAUDIO doc, const AUDIOREGION *region, bool last)
{
    if (!doc || !doc->signal) return 0;
    if (!region) region = VELMAUDIO_GetCurrentRegion(doc);
    const int track = region ? static_cast<int>(region->flags & AUDIOREGION_TRACK_MASK) : -1;
    AUDIOREGION *end = last ? AUDIOSIGNAL_FindLastRegion(doc->signal, track) : AUDIOSIGNAL_FindFirstRegion(doc->signal, track);
    return region && end ? VELMAUDIO_SelectRegions(doc, region, end) : 0;
}

int VELMAUDIO_SelectToFirstRegion(VELMAUDIO doc, const AUDIOREGION *region)
{
    return select_to_end(doc, region, false);
}

int VELMAUDIO_SelectToLastRegion(VELMAUDIO doc, const AUDIOREGION *region)
{
    return select_to_end(doc, region, true);
}
