/* Regions at the document level: queries, region files, focus and current
 * region, selection, and undoable edits guarded by the track's editability. */
#ifndef VELMREGION_H
#define VELMREGION_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmaudio.h"
#include "outside/signal/audioregion.h"

VELM_EXTERN_C_BEGIN

/* DeleteRegionEx / UndeleteRegionEx flag: an internal call, no track check, no undo. */
#define VELMREGION_INTERNAL     0x08
/* CreateRegionEx flags: no undo step / merge into the newest step. */
#define VELMREGION_NO_UNDO      0x20
#define VELMREGION_MERGE_UNDO   0x40

VELM_API int VELMAUDIO_CountSelectedRegions(VELMAUDIO doc, int track);
VELM_API int VELMAUDIO_GetSelectedRegions(VELMAUDIO doc, int track, AUDIOREGION **array, int max);
VELM_API int VELMAUDIO_CountVisibleRegions(VELMAUDIO doc, int64_t begin, int64_t end, uint32_t tracks,
                                           uint32_t skip_flags, AUDIOREGION_Filter filter);
VELM_API int VELMAUDIO_GetVisibleRegions(VELMAUDIO doc, int64_t begin, int64_t end, uint32_t tracks,
                                         uint32_t skip_flags, AUDIOREGION_Filter filter, AUDIOREGION **array,
                                         int max);
VELM_API int VELMAUDIO_IsRegionVisible(VELMAUDIO doc, const AUDIOREGION *region, int full);
VELM_API int VELMAUDIO_IsRegionSelected(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int VELMAUDIO_IsRegionDeleted(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int VELMAUDIO_RegionHasChanges(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int VELMAUDIO_IsRegionTemporary(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int VELMAUDIO_IsRegionReadOnly(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int VELMAUDIO_IsRegionTextHide(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int VELMAUDIO_SetRegionTextHide(VELMAUDIO doc, AUDIOREGION *region, int on);
VELM_API int VELMAUDIO_SetRegionChanged(VELMAUDIO doc, AUDIOREGION *region, int on);
VELM_API int VELMAUDIO_SetRegionReadOnly(VELMAUDIO doc, AUDIOREGION *region, int on);
VELM_API const char *VELMAUDIO_GetRegionLabel(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API const char *VELMAUDIO_GetRegionComment(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int     VELMAUDIO_GetRegionTrackId(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int64_t VELMAUDIO_GetRegionBeginSample(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int64_t VELMAUDIO_GetRegionEndSample(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int64_t VELMAUDIO_GetRegionNumSamples(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API double  VELMAUDIO_GetRegionBegin(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API double  VELMAUDIO_GetRegionEnd(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API double  VELMAUDIO_GetRegionDuration(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API AUDIOREGION *VELMAUDIO_GetNextRegion(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API AUDIOREGION *VELMAUDIO_GetPrevRegion(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API AUDIOREGION *VELMAUDIO_GetFirstRegion(VELMAUDIO doc, const char *identifier);
VELM_API AUDIOREGION *VELMAUDIO_GetLastRegion(VELMAUDIO doc, const char *identifier);
VELM_API AUDIOREGION *VELMAUDIO_FindRegion(VELMAUDIO doc, const char *identifier, int64_t begin, int64_t end,
                                           const char *label, const char *comment, int match);

VELM_API int VELMAUDIO_ReadRegions(VELMAUDIO doc, const char *file_name, const char *format);
VELM_API int VELMAUDIO_SaveRegions(VELMAUDIO doc);
VELM_API int VELMAUDIO_SaveRegionsAs(VELMAUDIO doc, const char *file_name, const char *format);

VELM_API AUDIOREGION *VELMAUDIO_GetRegionOnFocus(VELMAUDIO doc);
VELM_API AUDIOREGION *VELMAUDIO_GetCurrentRegion(VELMAUDIO doc);
VELM_API int VELMAUDIO_EventOverFocusedRegion(VELMAUDIO doc);
VELM_API int VELMAUDIO_SetFocusOnRegion(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int VELMAUDIO_SetCurrentRegion(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int VELMAUDIO_SelectFocusedRegion(VELMAUDIO doc);
VELM_API int VELMAUDIO_SelectRegion(VELMAUDIO doc, AUDIOREGION *region);
VELM_API int VELMAUDIO_UnselectRegion(VELMAUDIO doc, AUDIOREGION *region);
VELM_API int VELMAUDIO_UnselectAllRegions(VELMAUDIO doc);
VELM_API int VELMAUDIO_UnselectAllRegionsOfTrack(VELMAUDIO doc, int track);
VELM_API int VELMAUDIO_SelectRegions(VELMAUDIO doc, const AUDIOREGION *from, const AUDIOREGION *to);
VELM_API int VELMAUDIO_SelectToFirstRegion(VELMAUDIO doc, const AUDIOREGION *region);
VELM_API int VELMAUDIO_SelectToLastRegion(VELMAUDIO doc, const AUDIOREGION *region);

VELM_API int VELMAUDIO_ChangeRegionBegin(VELMAUDIO doc, AUDIOREGION *region, double time, int mode);
VELM_API int VELMAUDIO_ChangeRegionEnd(VELMAUDIO doc, AUDIOREGION *region, double time, int mode);
VELM_API int VELMAUDIO_ChangeRegionOnFocusBegin(VELMAUDIO doc, double time, int mode);
VELM_API int VELMAUDIO_ChangeRegionOnFocusEnd(VELMAUDIO doc, double time, int mode);
VELM_API int VELMAUDIO_OffsetRegions(VELMAUDIO doc, int64_t offset);
VELM_API int VELMAUDIO_SetRegionTrackId(VELMAUDIO doc, AUDIOREGION *region, int track);
VELM_API int VELMAUDIO_SetRegionLabel(VELMAUDIO doc, AUDIOREGION *region, const char *label);
VELM_API int VELMAUDIO_SetRegionComment(VELMAUDIO doc, AUDIOREGION *region, const char *comment);
VELM_API int VELMAUDIO_DelSelectedRegions(VELMAUDIO doc);
VELM_API int VELMAUDIO_DelSelectedRegionsOfTrack(VELMAUDIO doc, const char *identifier);
VELM_API int VELMAUDIO_DeleteRegionEx(VELMAUDIO doc, AUDIOREGION *region, int flags);
VELM_API int VELMAUDIO_UndeleteRegionEx(VELMAUDIO doc, AUDIOREGION *region, int flags);
VELM_API AUDIOREGION *VELMAUDIO_AddRegion(VELMAUDIO doc, const char *identifier, const char *label,
                                          const char *comment);
VELM_API AUDIOREGION *VELMAUDIO_CreateRegionEx(VELMAUDIO doc, const char *identifier, int64_t begin, int64_t end,
                                               const char *label, const char *comment, int flags);

VELM_EXTERN_C_END

#endif /* VELMREGION_H */
