// Undoable region edits.  Each checks that the region's track may be edited,
// records what it changes, and announces the change.
#include <algorithm>
#include <vector>

#include "control/velmcontrol.h"
#include "core/velmnavigation.h"
#include "edit/region_internal.hpp"
#include "edit/velmcustomtrack.h"
#include "edit/velmselection.h"
#include "edit/velmundo.h"

namespace {

constexpr uint32_t kNoScrollOnMove = 0x200;

VELMUNDOSCRIPT *new_script(VELMAUDIO doc, const char *label)
{
    return VELMUNDO_CreateUndoScript(VELM_TranslateString(label), doc->state);
}

// While the user drags regions, every step of the drag changes them without a
// script: the first change, made before the drag began, holds the state the
// whole drag undoes to.
VELMUNDOSCRIPT *new_drag_script(VELMAUDIO doc, const char *label)
{
    return VELMCONTROL_IsInteracting(doc->renderer) ? nullptr : new_script(doc, label);
}

// Pushes the script when there is one; the result of the push, or 1 without one.
int push(VELMAUDIO doc, VELMUNDOSCRIPT *script)
{
    return script ? VELMUNDO_PushUndoScript(doc, script) : 1;
}

bool usable(VELMAUDIO doc, const AUDIOREGION *region)
{
    return velm::owns_region(doc, region) && doc->state && velm::region_track_editable(doc, region);
}

using EdgeChange = int (*)(AUDIOREGION *, double, int);

int change_edge(VELMAUDIO doc, AUDIOREGION *region, double time, int mode, EdgeChange change, const char *label)
{
    if (!usable(doc, region)) return 0;
    VELMUNDOSCRIPT *script = new_drag_script(doc, label);
    VELMUNDO_AddRevertRegionGroupState(script, velm::identity(region));
    if (!change(region, time, mode)) {
        VELMUNDO_DestroyUndoScript(script);
        return 0;
    }
    push(doc, script);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_FOCUS_LENGTH);
    return 1;
}

// How far the view follows a region moved by offset, so that it stays in sight.
int64_t follow_shift(VELMAUDIO doc, const AUDIOREGION *region, int64_t offset)
{
    const VELMSTATE *s = doc->state;
    if ((velm::region_track_options(doc, region) & kNoScrollOnMove) || !VELMAUDIO_IsRegionVisible(doc, region, 0) ||
        AUDIOREGION_NumSamples(region) >= VELMAUDIO_ViewLength(doc))
        return 0;
    const int64_t begin = AUDIOREGION_BeginSample(region), end = AUDIOREGION_EndSample(region);
    if (offset > 0) {
        if (end + offset <= s->viewEnd) return 0;
        return std::min(end + offset - s->viewEnd, AUDIOSIGNAL_NumSamples(doc->signal) - s->viewEnd);
    }
    if (begin + offset >= s->viewBegin) return 0;
    return std::max(begin + offset - s->viewBegin, -s->viewBegin);
}

// Deletes the selected regions of one track number (or all with -1) on deletable tracks.
int delete_selected(VELMAUDIO doc, int track, bool (*deletable)(VELMAUDIO, int))
{
    const int count = AUDIOSIGNAL_CountSelectedRegionsOfTrack(doc->signal, track);
    if (count < 1) return 1;
    VELMUNDOSCRIPT *script = new_script(doc, "Delete Regions");
    std::vector<AUDIOREGION *> regions(static_cast<size_t>(count));
    const int n = AUDIOSIGNAL_GetSelectedRegions(doc->signal, track, regions.data(), count);
    int result = 1;
    for (int i = 0; i < n; ++i) {
        AUDIOREGION *r = regions[static_cast<size_t>(i)];
        if (!deletable(doc, static_cast<int>(r->flags & AUDIOREGION_TRACK_MASK))) continue;
        if (!AUDIOREGION_CanDelete(r)) {
            result = 0;
            continue;
        }
        velm::drop_focus_on(doc, r);
        VELMUNDO_AddRevertRegionGroupState(script, r);
        if (!AUDIOREGION_DeleteEx(r, 0)) result = 0;
    }
    push(doc, script);
    velm::clear_current(doc);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    return result;
}

bool editable_and_visible(VELMAUDIO doc, int number)
{
    const char *identifier = VELMAUDIO_GetCustomTrackUniqId(doc, number);
    return identifier && VELMAUDIO_EditableCustomTrack(doc, identifier) && VELMAUDIO_VisibleCustomTrack(doc, identifier);
}

bool any_track(VELMAUDIO, int)
{
    return true;
}

// The number of an existing track the caller may add regions to, or -1.
int writable_track(VELMAUDIO doc, const char *identifier, bool check_editable)
{
    const int track = VELMAUDIO_FindCustomTrackId(doc, identifier);
    if (track < 0 || (check_editable && !VELMAUDIO_EditableCustomTrack(doc, identifier))) return -1;
    return track;
}

} // namespace

int VELMAUDIO_ChangeRegionBegin(VELMAUDIO doc, AUDIOREGION *region, double time, int mode)
{
    return change_edge(doc, region, time, mode, AUDIOREGION_ChangeBegin, "Change Region Begin");
}

int VELMAUDIO_ChangeRegionEnd(VELMAUDIO doc, AUDIOREGION *region, double time, int mode)
{
    return change_edge(doc, region, time, mode, AUDIOREGION_ChangeEnd, "Change Region End");
}

int VELMAUDIO_ChangeRegionOnFocusBegin(VELMAUDIO doc, double time, int mode)
{
    return VELMAUDIO_ChangeRegionBegin(doc, VELMAUDIO_GetRegionOnFocus(doc), time, mode);
}

int VELMAUDIO_ChangeRegionOnFocusEnd(VELMAUDIO doc, double time, int mode)
{
    return VELMAUDIO_ChangeRegionEnd(doc, VELMAUDIO_GetRegionOnFocus(doc), time, mode);
}

int VELMAUDIO_OffsetRegions(VELMAUDIO doc, int64_t offset)
{
    AUDIOREGION *focused = VELMAUDIO_GetRegionOnFocus(doc);
    if (!usable(doc, focused)) return 0;
    const int64_t shift = follow_shift(doc, focused, offset);
    if (offset == 0) return 1;
    VELMUNDOSCRIPT *script = new_drag_script(doc, "Offset Region");
    const int track = static_cast<int>(focused->flags & AUDIOREGION_TRACK_MASK);
    uint32_t mask;
    bool moved;
    if (AUDIOREGION_IsSelected(focused) && AUDIOSIGNAL_CountSelectedRegionsOfTrack(doc->signal, track) > 1) {
        VELMUNDO_AddRevertAllRegionsState(script, doc->signal);
        moved = AUDIOSIGNAL_OffsetRegions(doc->signal, offset, track, AUDIOREGION_IsSelected) != 0;
        mask = VELMSTATE_CHANGE_TRACK_COLORS;
    } else {
        VELMUNDO_AddRevertRegionState(script, focused);
        moved = AUDIOREGION_Offset(focused, offset) != 0;
        mask = VELMSTATE_CHANGE_FOCUS_BEGIN;
    }
    if (!moved) {
        VELMUNDO_DestroyUndoScript(script);
        return 0;
    }
    VELMSTATE *s = doc->state;
    s->focusedRegion.begin = focused->begin;
    s->focusedRegion.length = focused->length;
    s->focusedRegion.flags = focused->flags;
    if (shift) VELMAUDIO_Zoom(doc, s->viewBegin + shift, s->viewEnd + shift);
    push(doc, script);
    VELMSTATE_NotifyChanges(doc, mask);
    return 1;
}

int VELMAUDIO_SetRegionTrackId(VELMAUDIO doc, AUDIOREGION *region, int track)
{
    if (!usable(doc, region)) return 0;
    VELMUNDOSCRIPT *script = new_script(doc, "Change Region Track");
    const int recorded = VELMUNDO_AddRevertRegionState(script, velm::identity(region));
    const int applied = AUDIOREGION_SetTrackId(region, track);
    const int pushed = push(doc, script);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    return recorded && applied && pushed;
}

int VELMAUDIO_SetRegionLabel(VELMAUDIO doc, AUDIOREGION *region, const char *label)
{
    if (!usable(doc, region)) return 0;
    VELMUNDOSCRIPT *script = new_script(doc, "Change Region Label");
    const int recorded = VELMUNDO_AddChangeRegionLabel(script, velm::identity(region), AUDIOREGION_GetLabel(region));
    const int applied = AUDIOREGION_SetLabel(region, label);
    const int pushed = push(doc, script);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    return recorded && applied && pushed;
}

int VELMAUDIO_SetRegionComment(VELMAUDIO doc, AUDIOREGION *region, const char *comment)
{
    if (!usable(doc, region)) return 0;
    VELMUNDOSCRIPT *script = new_script(doc, "Change Region Comment");
    const int recorded = VELMUNDO_AddChangeRegionComment(script, velm::identity(region), AUDIOREGION_GetComment(region));
    const int applied = AUDIOREGION_SetComment(region, comment);
    const int pushed = push(doc, script);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    return recorded && applied && pushed;
}

int VELMAUDIO_DelSelectedRegions(VELMAUDIO doc)
{
    if (!doc || !doc->signal || !doc->state) return 0;
    return delete_selected(doc, -1, editable_and_visible);
}

int VELMAUDIO_DelSelectedRegionsOfTrack(VELMAUDIO doc, const char *identifier)
{
    if (!doc || !doc->signal || !doc->state) return 0;
    const int track = writable_track(doc, identifier, true);
    return track >= 0 ? delete_selected(doc, track, any_track) : 0;
}

static int delete_or_undelete(VELMAUDIO doc, AUDIOREGION *region, int flags, bool undelete)
{
    if (!doc || !doc->signal || !doc->state || !region) return 0;
    const bool internal = flags & VELMREGION_INTERNAL;
    if (!internal && !velm::region_track_editable(doc, region)) return 0;
    VELMUNDOSCRIPT *script = internal ? nullptr : new_script(doc, undelete ? "Undelete Region" : "Delete Region");
    AUDIOREGION *live = velm::identity(region);
    if (doc->state->currentRegion.region == live) velm::clear_current(doc);
    const bool eligible = internal || (undelete ? AUDIOREGION_IsDeleted(live) : AUDIOREGION_CanDelete(live));
    int result = 1;
    if (eligible) {
        if (!undelete) velm::drop_focus_on(doc, live);
        VELMUNDO_AddRevertRegionGroupState(script, live);
        const int done = undelete ? AUDIOREGION_UndeleteEx(live, flags) : AUDIOREGION_DeleteEx(live, flags);
        if (done) {
            result = push(doc, script);
            script = nullptr;
        }
    }
    VELMUNDO_DestroyUndoScript(script);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    return result;
}

int VELMAUDIO_DeleteRegionEx(VELMAUDIO doc, AUDIOREGION *region, int flags)
{
    return delete_or_undelete(doc, region, flags, false);
}

int VELMAUDIO_UndeleteRegionEx(VELMAUDIO doc, AUDIOREGION *region, int flags)
{
    return delete_or_undelete(doc, region, flags, true);
}

AUDIOREGION *VELMAUDIO_AddRegion(VELMAUDIO doc, const char *identifier, const char *label, const char *comment)
{
    if (!doc || !doc->signal || !doc->state || !doc->state->selections) return nullptr;
    const int track = writable_track(doc, identifier, true);
    if (track < 0) return nullptr;
    VELMUNDOSCRIPT *script = new_script(doc, "Add Region");
    AUDIOREGION *last = nullptr;
    for (const VELMSELECTION *s = doc->state->selections; s; s = s->next) {
        AUDIOREGION *r = AUDIOSIGNAL_AddRegionToTrackEx(doc->signal, 0, s->begin, s->end, label ? label : "undef",
                                                        comment, track);
        if (!r) continue;
        VELMUNDO_AddRevertCreateRegion(script, r);
        last = r;
    }
    push(doc, script);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    return last;
}

AUDIOREGION *VELMAUDIO_CreateRegionEx(VELMAUDIO doc, const char *identifier, int64_t begin, int64_t end,
                                      const char *label, const char *comment, int flags)
{
    if (!doc || !doc->signal || !doc->state) return nullptr;
    const int track = writable_track(doc, identifier, !(flags & VELMREGION_INTERNAL));
    if (track < 0) return nullptr;
    const bool notify = VELMAUDIO_CustomTrackNotifyChanges(doc, identifier) != 0;
    VELMUNDOSCRIPT *script = nullptr;
    if (!(flags & VELMREGION_NO_UNDO)) {
        if (flags & VELMREGION_MERGE_UNDO) script = VELMUNDO_PopUndoScript(doc);
        if (!script) script = new_script(doc, "Add Region");
    }
    _audio_format format;
    AUDIOSIGNAL_GetFormat(doc->signal, &format);
    AUDIOREGION *region = AUDIOSIGNAL_AddRegionToTrackEx(doc->signal, notify ? 0 : AUDIOREGION_ADD_QUIET,
                                                         AUDIO_Sample2Time(&format, begin), AUDIO_Sample2Time(&format, end),
                                                         label ? label : "undef", comment, track);
    if (region) VELMUNDO_AddRevertCreateRegion(script, region);
    push(doc, script);
    VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_TRACK_COLORS);
    return region;
}
