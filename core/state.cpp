// The view-state record: creation, copies, selection rebuilds and change evaluation.
#include "core/velmstate.h"

#include <cstring>
#include <vector>

#include "core/state_internal.hpp"

namespace {

VELMSTATE *new_record(BLMEM pool)
{
    return static_cast<VELMSTATE *>(BLMEM_New(pool, sizeof(VELMSTATE)));
}

void set_initial_values(VELMSTATE *s)
{
    s->ownsPool = 1;
    s->selectingKind = SELECTING_REPLACE;
    s->cursor.kind = 0;
    s->playCursor.kind = 1;
    s->controls = 1;
    s->smartZoomAction = 2;
    s->channelMask = 0xFFFF;
    s->scaleFrameLength = 20;
    s->recordStart = -1;
    s->recordPosition = -1;
    s->navigatorHeight = 40;
    s->viewFlags = 0x1F1;
    s->horzScaleKind = 1;
    s->spectral.fftLength = 256;
    s->spectral.dynamicRange = 110.0;
    s->spectral.preEmphasis = 0.9;
    s->spectral.windowSize = 256;
    s->spectral.windowType = 5;
    s->spectral.normalize = 1;
    s->spectral.colorScheme = velm::default_color_scheme();
    s->waveHeightFraction = 0.5f;
    const float font_size = static_cast<float>(BLSETTINGS_GetFloatEx(nullptr, "libvelm.draw.RegionTextFont.Size"));
    const int font_color = BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.RegionTextFont.Color");
    const int inactive_color = BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.RegionTextFont.InactiveColor");
    for (VELMTRACKDISPLAY &t : s->tracks) {
        t.minimumHeight = 24;
        t.lineCount = 1;
        t.backgroundColor = 0xFFFFFF;
        t.backgroundAlpha = 0x66;
        t.fontSize = font_size;
        t.fontColor = font_color;
        t.inactiveFontColor = inactive_color;
    }
}

bool same_region_copy(const VELMREGIONCOPY &a, const VELMREGIONCOPY &b)
{
    return a.region == b.region;
}

bool selections_differ(const VELMSTATE *a, const VELMSTATE *b)
{
    const VELMSELECTION *x = a->selections;
    const VELMSELECTION *y = b->selections;
    for (; x && y; x = x->next, y = y->next)
        if (x->begin != y->begin || x->end != y->end) return true;
    return x != y; // different lengths
}

bool uses_frame_scale(const VELMSTATE *s)
{
    return s->horzScaleKind == 2 || s->horzScaleKind == 5;
}

uint32_t layout_changes(const VELMSTATE *a, const VELMSTATE *b)
{
    uint32_t r = 0;
    if (a->waveHeightFraction != b->waveHeightFraction) r |= 0x80001418u;
    if ((a->viewFlags & 0x2u) && velm::spectral_differs(a->spectral, b->spectral)) r |= 0x80000000u;
    if (a->horzScaleKind != b->horzScaleKind) r |= 0x80000010u;
    if (a->vertScaleKind != b->vertScaleKind || a->spectralScaleKind != b->spectralScaleKind) r |= 0x80000008u;
    if (a->zoomLowerLimit != b->zoomLowerLimit || a->zoomUpperLimit != b->zoomUpperLimit) r |= 0x80000810u;
    if (a->vertMax != b->vertMax || a->vertMin != b->vertMin || a->spectralMin != b->spectralMin ||
        a->spectralMax != b->spectralMax)
        r |= 0x80000008u;
    if ((uses_frame_scale(a) || uses_frame_scale(b)) && a->scaleFrameLength != b->scaleFrameLength)
        r |= 0x80000010u;
    return r;
}

uint32_t focus_changes(const VELMREGIONCOPY &a, const VELMREGIONCOPY &b)
{
    if (!same_region_copy(a, b)) return VELMSTATE_CHANGE_FOCUS;
    uint32_t r = 0;
    const uint32_t on_track_zero = (a.flags & 0xFu) == 0 ? VELMSTATE_CHANGE_FOCUS : 0u;
    if (a.begin != b.begin) r |= VELMSTATE_CHANGE_FOCUS_BEGIN | on_track_zero;
    if (a.length != b.length) r |= VELMSTATE_CHANGE_FOCUS_LENGTH | on_track_zero;
    return r;
}

uint32_t overlay_changes(const VELMSTATE *a, const VELMSTATE *b)
{
    uint32_t r = 0;
    if (std::memcmp(&a->quickBox, &b->quickBox, sizeof a->quickBox) != 0) r |= VELMSTATE_CHANGE_QUICKBOX;
    if (a->recordStart != b->recordStart || a->recordPosition != b->recordPosition) {
        r |= VELMSTATE_CHANGE_RECORDING;
        if (a->recordStart == -1 || b->recordStart == -1) r |= VELMSTATE_CHANGE_FULL;
    }
    if (selections_differ(a, b)) r |= VELMSTATE_CHANGE_SELECTIONS;
    if (a->selecting.begin != b->selecting.begin || a->selecting.end != b->selecting.end ||
        a->selectingKind != b->selectingKind)
        r |= VELMSTATE_CHANGE_SELECTING;
    if (a->vertSelectionStart != b->vertSelectionStart || a->vertSelectionEnd != b->vertSelectionEnd ||
        a->spectralSelectionStart != b->spectralSelectionStart || a->spectralSelectionEnd != b->spectralSelectionEnd)
        r |= VELMSTATE_CHANGE_SCALE_SELECTION;
    if (a->viewBegin != b->viewBegin || a->viewEnd != b->viewEnd) {
        const bool same_length = a->viewEnd - a->viewBegin == b->viewEnd - b->viewBegin;
        const bool overlap = a->viewBegin < b->viewEnd && b->viewBegin < a->viewEnd;
        r |= (same_length && overlap) ? 0x811u : 0x80000810u;
    }
    r |= focus_changes(a->focusedRegion, b->focusedRegion);
    for (int i = 0; i < VELM_MAX_CUSTOM_TRACKS; ++i) {
        const VELMTRACKDISPLAY &x = a->tracks[i];
        const VELMTRACKDISPLAY &y = b->tracks[i];
        if (x.visible != y.visible || x.options != y.options || x.minimumHeight != y.minimumHeight ||
            x.fontSize != y.fontSize || x.lineCount != y.lineCount)
            r |= VELMSTATE_CHANGE_EVERYTHING;
        if (x.backgroundColor != y.backgroundColor || x.backgroundAlpha != y.backgroundAlpha ||
            x.fontColor != y.fontColor || x.inactiveFontColor != y.inactiveFontColor)
            r |= VELMSTATE_CHANGE_TRACK_COLORS;
    }
    return r;
}

} // namespace

namespace velm {

bool spectral_differs(const VELMSPECTRALCONFIG &a, const VELMSPECTRALCONFIG &b)
{
    return a.fftLength != b.fftLength || a.dynamicRange != b.dynamicRange || a.preEmphasis != b.preEmphasis ||
           a.windowSize != b.windowSize || a.windowType != b.windowType || a.normalize != b.normalize ||
           a.colorScheme != b.colorScheme;
}

VELMSELECTION *append_selection(VELMSTATE *state, VELMSELECTION **tail, double begin, double end)
{
    auto *rec = static_cast<VELMSELECTION *>(BLMEM_New(state->pool, sizeof(VELMSELECTION)));
    if (!rec) return nullptr;
    rec->begin = begin;
    rec->end = end;
    *tail = rec;
    return rec;
}

// Re-creates the record without selections.  A record that owns its pool empties
// the pool in one step; one living in a caller's pool releases only its own parts.
VELMSTATE *rebuild_without_selections(VELMSTATE *state)
{
    VELMSTATE saved = *state;
    if (!state->ownsPool) {
        for (VELMSELECTION *s = state->selections; s;) {
            VELMSELECTION *next = s->next;
            BLMEM_Delete(state->pool, s);
            s = next;
        }
        state->selections = nullptr;
        return state;
    }
    BLMEM_ResetMemSpace(saved.pool);
    VELMSTATE *fresh = new_record(saved.pool);
    if (!fresh) return nullptr;
    *fresh = saved;
    fresh->selections = nullptr;
    return fresh;
}

} // namespace velm

VELMSTATE *VELMSTATE_Create(void)
{
    BLMEM pool = BLMEM_CreateMemDescrEx("VELMSTATE Memory", 4096, 8);
    if (!pool) return nullptr;
    VELMSTATE *s = new_record(pool);
    if (!s) {
        BLMEM_DisposeMemDescr(pool);
        return nullptr;
    }
    s->pool = pool;
    set_initial_values(s);
    return s;
}

void VELMSTATE_Destroy(VELMSTATE *state)
{
    if (!state) return;
    if (state->ownsPool)
        BLMEM_DisposeMemDescr(state->pool);
    else
        BLMEM_Delete(state->pool, state);
}

VELMSTATE *VELMSTATE_CreateCopy(BLMEM pool, const VELMSTATE *state)
{
    if (!state) return nullptr;
    const bool own = pool == nullptr;
    if (own) pool = BLMEM_CreateMemDescrEx("State Memory", 0, 0);
    if (!pool) return nullptr;

    size_t count = 0;
    for (const VELMSELECTION *s = state->selections; s; s = s->next) ++count;
    auto *copy = static_cast<VELMSTATE *>(BLMEM_New(pool, sizeof(VELMSTATE) + count * sizeof(VELMSELECTION)));
    if (!copy) {
        if (own) BLMEM_DisposeMemDescr(pool);
        return nullptr;
    }
    *copy = *state;
    copy->pool = pool;
    copy->ownsPool = own ? 1 : 0;
    velm::refresh_top_parent(copy);

    // The selections lie in the same block, right behind the record, in list order.
    auto *laid = reinterpret_cast<VELMSELECTION *>(copy + 1);
    VELMSELECTION **link = &copy->selections;
    *link = nullptr;
    for (const VELMSELECTION *s = state->selections; s; s = s->next, ++laid) {
        laid->begin = s->begin;
        laid->end = s->end;
        laid->next = nullptr;
        *link = laid;
        link = &laid->next;
    }
    return copy;
}

int VELMSTATE_Assign(const VELMSTATE *source, VELMSTATE **destination)
{
    if (!source || !destination || !*destination) return 0;
    const VELMSTATE kept = **destination;
    // The source may live in the destination's pool; copy what we need first.
    const VELMSTATE src = *source;
    std::vector<VELMSELECTION> ranges;
    for (const VELMSELECTION *s = source->selections; s; s = s->next) ranges.push_back(*s);

    BLMEM_ResetMemSpace(kept.pool);
    VELMSTATE *d = new_record(kept.pool);
    if (!d) {
        *destination = nullptr;
        return 0;
    }
    *d = src;
    d->pool = kept.pool;
    d->ownsPool = kept.ownsPool;
    d->cursor.changed = kept.cursor.changed;
    d->playCursor = kept.playCursor;
    d->controls = kept.controls;
    std::memcpy(d->channelControls, kept.channelControls, sizeof d->channelControls);
    d->scaleFrameLength = kept.scaleFrameLength;
    d->drawWidth = kept.drawWidth;
    d->drawHeight = kept.drawHeight;
    d->navigatorHeight = kept.navigatorHeight;
    d->viewFlags = kept.viewFlags;
    d->horzScaleKind = kept.horzScaleKind;
    d->vertScaleKind = kept.vertScaleKind;
    d->spectralScaleKind = kept.spectralScaleKind;
    d->spectral = kept.spectral;
    d->waveHeightFraction = kept.waveHeightFraction;

    d->selections = nullptr;
    VELMSELECTION **tail = &d->selections;
    for (const VELMSELECTION &range : ranges) {
        VELMSELECTION *rec = velm::append_selection(d, tail, range.begin, range.end);
        if (!rec) break;
        tail = &rec->next;
    }
    *destination = d;
    return 1;
}

VELMSTATE *VELMSTATE_ClearSelection(VELMSTATE *state)
{
    if (!state) return nullptr;
    return velm::rebuild_without_selections(state);
}

VELMSTATE *VELMSTATE_InvertSelection(VELMSTATE *state, double duration)
{
    if (!state) return nullptr;
    if (!state->selections) return state;

    struct Gap { double begin, end; };
    std::vector<Gap> gaps;
    const VELMSELECTION *s = state->selections;
    double start = 0.0;
    if (s->begin == 0.0) {
        start = s->end;
        s = s->next;
    }
    const VELMSELECTION *last = nullptr;
    for (; s; s = s->next) {
        gaps.push_back({start, s->begin});
        start = s->end;
    }
    for (last = state->selections; last->next;) last = last->next;
    if (last->end < duration) gaps.push_back({last->end, duration});

    VELMSTATE *fresh = velm::rebuild_without_selections(state);
    if (fresh) {
        VELMSELECTION **tail = &fresh->selections;
        for (const Gap &gap : gaps) {
            VELMSELECTION *rec = velm::append_selection(fresh, tail, gap.begin, gap.end);
            if (!rec) break;
            tail = &rec->next;
        }
    }
    return fresh;
}

uint32_t VELMSTATE_EvalChanges(VELMAUDIO doc, const VELMSTATE *a, const VELMSTATE *b)
{
    (void)doc;
    if (!a || !b || (b->viewFlags & 0x80000000u) || a->drawWidth != b->drawWidth || a->drawHeight != b->drawHeight ||
        a->navigatorHeight != b->navigatorHeight || a->viewFlags != b->viewFlags)
        return VELMSTATE_CHANGE_EVERYTHING;
    const uint32_t layout = layout_changes(a, b);
    if (a->channelMask != b->channelMask) return 0x80000008u;
    if (layout) return layout;
    return overlay_changes(a, b);
}
