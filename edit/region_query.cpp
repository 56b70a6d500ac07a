// Questions about regions, answered through the document's signal, and region files.
#include <cstring>

#include "core/document_internal.hpp"
#include "edit/velmcustomtrack.h"
#include "edit/velmregion.h"

namespace {

AUDIOSIGNAL *signal_of(VELMAUDIO doc)
{
    return doc ? doc->signal : nullptr;
}

bool has_flag(const AUDIOREGION *region, uint32_t flag)
{
    return region && (region->flags & flag);
}

} // namespace

int VELMAUDIO_CountSelectedRegions(VELMAUDIO doc, int track)
{
    return signal_of(doc) ? AUDIOSIGNAL_CountSelectedRegionsOfTrack(doc->signal, track) : 0;
}

int VELMAUDIO_GetSelectedRegions(VELMAUDIO doc, int track, AUDIOREGION **array, int max)
{
    return signal_of(doc) ? AUDIOSIGNAL_GetSelectedRegions(doc->signal, track, array, max) : 0;
}

int VELMAUDIO_CountVisibleRegions(VELMAUDIO doc, int64_t begin, int64_t end, uint32_t tracks, uint32_t skip,
                                  AUDIOREGION_Filter filter)
{
    return signal_of(doc) ? AUDIOSIGNAL_CountVisibleRegionsOfTrack(doc->signal, begin, end, tracks, skip, filter) : 0;
}

int VELMAUDIO_GetVisibleRegions(VELMAUDIO doc, int64_t begin, int64_t end, uint32_t tracks, uint32_t skip,
                                AUDIOREGION_Filter filter, AUDIOREGION **array, int max)
{
    if (!signal_of(doc)) return 0;
    return AUDIOSIGNAL_GetVisibleRegionsOfTrack(doc->signal, array, max, begin, end, tracks, skip, filter);
}

int VELMAUDIO_IsRegionVisible(VELMAUDIO doc, const AUDIOREGION *region, int full)
{
    if (!doc || !doc->state || !region) return 0;
    const VELMSTATE *s = doc->state;
    return full ? AUDIOREGION_IsFullVisible(region, s->viewBegin, s->viewEnd)
                : AUDIOREGION_IsBetween(region, s->viewBegin, s->viewEnd);
}

int VELMAUDIO_IsRegionSelected(VELMAUDIO doc, const AUDIOREGION *r) { return doc && r ? AUDIOREGION_IsSelected(r) : 0; }
int VELMAUDIO_IsRegionDeleted(VELMAUDIO doc, const AUDIOREGION *r) { return doc && r ? AUDIOREGION_IsDeleted(r) : 0; }
int VELMAUDIO_RegionHasChanges(VELMAUDIO doc, const AUDIOREGION *r) { return doc && r ? AUDIOREGION_IsChanged(r) : 0; }
int VELMAUDIO_IsRegionTemporary(VELMAUDIO doc, const AUDIOREGION *r) { return doc && has_flag(r, AUDIOREGION_FLAG_TEMPORARY); }
int VELMAUDIO_IsRegionReadOnly(VELMAUDIO doc, const AUDIOREGION *r) { return doc && has_flag(r, AUDIOREGION_FLAG_READONLY); }
int VELMAUDIO_IsRegionTextHide(VELMAUDIO doc, const AUDIOREGION *r) { return doc && has_flag(r, AUDIOREGION_FLAG_HIDETEXT); }

int VELMAUDIO_SetRegionTextHide(VELMAUDIO doc, AUDIOREGION *r, int on)
{
    return doc && r ? AUDIOREGION_SetHideText(r, static_cast<uint8_t>(on)) : 0;
}

int VELMAUDIO_SetRegionChanged(VELMAUDIO doc, AUDIOREGION *r, int on)
{
    return doc && r ? AUDIOREGION_SetChanged(r, static_cast<uint8_t>(on)) : 0;
}

int VELMAUDIO_SetRegionReadOnly(VELMAUDIO doc, AUDIOREGION *r, int on)
{
    return doc && r ? AUDIOREGION_SetReadOnly(r, static_cast<uint8_t>(on)) : 0;
}

const char *VELMAUDIO_GetRegionLabel(VELMAUDIO doc, const AUDIOREGION *r) { return doc && r ? AUDIOREGION_GetLabel(r) : nullptr; }
const char *VELMAUDIO_GetRegionComment(VELMAUDIO doc, const AUDIOREGION *r) { return doc && r ? AUDIOREGION_GetComment(r) : nullptr; }
int VELMAUDIO_GetRegionTrackId(VELMAUDIO doc, const AUDIOREGION *r) { return doc && r ? static_cast<int>(r->flags & AUDIOREGION_TRACK_MASK) : -1; }
int64_t VELMAUDIO_GetRegionBeginSample(VELMAUDIO doc, const AUDIOREGION *r) { return doc && r ? AUDIOREGION_BeginSample(r) : -1; }
int64_t VELMAUDIO_GetRegionEndSample(VELMAUDIO doc, const AUDIOREGION *r) { return doc && r ? AUDIOREGION_EndSample(r) : -1; }
int64_t VELMAUDIO_GetRegionNumSamples(VELMAUDIO doc, const AUDIOREGION *r) { return doc && r ? AUDIOREGION_NumSamples(r) : -1; }
double VELMAUDIO_GetRegionBegin(VELMAUDIO doc, const AUDIOREGION *r) { return doc && r ? AUDIOREGION_Begin(r) : -1.0; }
double VELMAUDIO_GetRegionEnd(VELMAUDIO doc, const AUDIOREGION *r) { return doc && r ? AUDIOREGION_End(r) : -1.0; }
double VELMAUDIO_GetRegionDuration(VELMAUDIO doc, const AUDIOREGION *r) { return doc && r ? AUDIOREGION_Length(r) : -1.0; }

AUDIOREGION *VELMAUDIO_GetNextRegion(VELMAUDIO doc, const AUDIOREGION *r)
{
    return signal_of(doc) && r ? AUDIOSIGNAL_FindNextRegion(doc->signal, r) : nullptr;
}

AUDIOREGION *VELMAUDIO_GetPrevRegion(VELMAUDIO doc, const AUDIOREGION *r)
{
    return signal_of(doc) && r ? AUDIOSIGNAL_FindPrevRegion(doc->signal, r) : nullptr;
}

AUDIOREGION *VELMAUDIO_GetFirstRegion(VELMAUDIO doc, const char *identifier)
{
    return signal_of(doc) ? AUDIOSIGNAL_FindFirstRegion(doc->signal, VELMAUDIO_FindCustomTrackId(doc, identifier)) : nullptr;
}

AUDIOREGION *VELMAUDIO_GetLastRegion(VELMAUDIO doc, const char *identifier)
{
    return signal_of(doc) ? AUDIOSIGNAL_FindLastRegion(doc->signal, VELMAUDIO_FindCustomTrackId(doc, identifier)) : nullptr;
}

AUDIOREGION *VELMAUDIO_FindRegion(VELMAUDIO doc, const char *identifier, int64_t begin, int64_t end, const char *label,
                                  const char *comment, int match)
{
    if (!signal_of(doc)) return nullptr;
    return AUDIOSIGNAL_FindRegion(doc->signal, begin, end, label, comment, VELMAUDIO_FindCustomTrackId(doc, identifier),
                                  match);
}

int VELMAUDIO_ReadRegions(VELMAUDIO doc, const char *file_name, const char *format)
{
    if (!doc || !file_name || !format) return 0;
    if (!doc->signal && !(doc->state->status & STATUS_NOT_LOADED)) return 0;
    velm::copy_text(doc->regionsFileName, sizeof doc->regionsFileName, file_name);
    velm::copy_text(doc->regionsFileFormat, sizeof doc->regionsFileFormat, format);
    doc->state->status |= STATUS_HAS_REGIONS_FILE;
    return doc->signal ? AUDIOSIGNAL_ReadRegions(doc->signal, file_name, format) : 1;
}

int VELMAUDIO_SaveRegions(VELMAUDIO doc)
{
    if (!doc || !doc->state) return 0;
    if (!(doc->state->status & STATUS_HAS_REGIONS_FILE)) return 1;
    if (!doc->signal || !doc->regionsFileName[0] || !doc->regionsFileFormat[0]) return 0;
    return AUDIOSIGNAL_WriteRegions(doc->signal, doc->regionsFileName, doc->regionsFileFormat);
}

int VELMAUDIO_SaveRegionsAs(VELMAUDIO doc, const char *file_name, const char *format)
{
    return signal_of(doc) ? AUDIOSIGNAL_WriteRegions(doc->signal, file_name, format) : 0;
}
