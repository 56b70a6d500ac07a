/*
 * Audio signal library: regions, named time spans of a signal grouped in
 * up to 16 numbered tracks, possibly nested, and the region files.
 *
 * A region is reached through a pointer to its record.  The record is
 * public so that callers may keep full copies of it (a copy keeps the
 * identity of the region it was copied from): queries read the record they
 * are given, edits resolve it through its identity and refresh the record
 * they were given as well.  Regions live as long as their signal: a deleted
 * region only carries AUDIOREGION_FLAG_DELETED and can be brought back.
 *
 * Times are seconds (double), positions samples (int64_t) at the signal's
 * rate.  Every call accepts null and zeroed records and answers with its
 * failure value (0, null, -1 or -1.0).  Returned texts stay owned by the
 * region and are valid until the text is changed or the signal destroyed.
 * Region calls are not locked: one thread at a time per signal.
 */
#ifndef AUDIOREGION_H
#define AUDIOREGION_H

#include <stdint.h>

#include "outside/signal/audioformat.h"

#ifdef __cplusplus
extern "C" {
#endif

typedef struct _audio_signal AUDIOSIGNAL;
typedef struct _audio_region AUDIOREGION;

/* The region record. */
struct _audio_region {
    uint32_t     flags;    /* track number in the low four bits, AUDIOREGION_FLAG_* above */
    uint32_t     spare;    /* zero */
    double       begin;    /* seconds */
    double       length;   /* seconds, >= 0 */
    AUDIOREGION *identity; /* the region this record stands for (itself for the region) */
};

#define AUDIOREGION_MAX_TRACKS     16
#define AUDIOREGION_TRACK_MASK     0x000Fu
#define AUDIOREGION_FLAG_SELECTED  0x0010u
#define AUDIOREGION_FLAG_CHANGED   0x0020u /* edited since read or written */
#define AUDIOREGION_FLAG_DELETED   0x0040u
#define AUDIOREGION_FLAG_TEMPORARY 0x0400u /* never written to region files */
#define AUDIOREGION_FLAG_HIDETEXT  0x0800u
#define AUDIOREGION_FLAG_READONLY  0x1000u /* cannot be deleted */

/* Region filters: 1 keeps the region.  AUDIOREGION_IsSelected is one. */
typedef int (*AUDIOREGION_Filter)(const AUDIOREGION *region);

/* Bit of one track in a track mask (0 as a mask means every track). */
#define AUDIOREGION_TRACK_BIT(track) (1u << (track))

/* ---- One region --------------------------------------------------------- */

AUDIO_API double  AUDIOREGION_Begin(const AUDIOREGION *region);
AUDIO_API double  AUDIOREGION_End(const AUDIOREGION *region);
AUDIO_API double  AUDIOREGION_Length(const AUDIOREGION *region);
/* Samples at the signal's rate: begin and end rounded, NumSamples = End - Begin. */
AUDIO_API int64_t AUDIOREGION_BeginSample(const AUDIOREGION *region);
AUDIO_API int64_t AUDIOREGION_EndSample(const AUDIOREGION *region);
AUDIO_API int64_t AUDIOREGION_NumSamples(const AUDIOREGION *region);
AUDIO_API AUDIOSIGNAL *AUDIOREGION_GetParentSignal(const AUDIOREGION *region);
AUDIO_API int     AUDIOREGION_GetTrackId(const AUDIOREGION *region);

/* Edge changes, in seconds.  The edge stays within the signal, within the
 * parent region and on its side of the other edge.  mode 0: descendants keep
 * their times, cut to the new span, and those that touched the moved edge
 * follow it; AUDIOREGION_CHANGE_SCALE: descendants scale with the region.
 * 1, or 0 for a deleted or bad region. */
#define AUDIOREGION_CHANGE_SCALE 0x02
AUDIO_API int AUDIOREGION_ChangeBegin(AUDIOREGION *region, double time, int mode);
AUDIO_API int AUDIOREGION_ChangeEnd(AUDIOREGION *region, double time, int mode);
/* Moves the region and its descendants by offset samples, limited so that
 * they stay within the signal and the parent region. */
AUDIO_API int AUDIOREGION_Offset(AUDIOREGION *region, int64_t offset);
AUDIO_API int AUDIOREGION_SetTrackId(AUDIOREGION *region, int track);

/* Texts: null clears them (Get then answers null). */
AUDIO_API const char *AUDIOREGION_GetLabel(const AUDIOREGION *region);
AUDIO_API const char *AUDIOREGION_GetComment(const AUDIOREGION *region);
AUDIO_API int AUDIOREGION_SetLabel(AUDIOREGION *region, const char *label);
AUDIO_API int AUDIOREGION_SetComment(AUDIOREGION *region, const char *comment);

AUDIO_API int AUDIOREGION_IsSelected(const AUDIOREGION *region);
AUDIO_API int AUDIOREGION_IsDeleted(const AUDIOREGION *region);
AUDIO_API int AUDIOREGION_IsChanged(const AUDIOREGION *region);
/* Meets [begin, end] (samples) / lies wholly inside it. */
AUDIO_API int AUDIOREGION_IsBetween(const AUDIOREGION *region, int64_t begin, int64_t end);
AUDIO_API int AUDIOREGION_IsFullVisible(const AUDIOREGION *region, int64_t begin, int64_t end);
AUDIO_API int AUDIOREGION_Select(AUDIOREGION *region);
AUDIO_API int AUDIOREGION_Unselect(AUDIOREGION *region);
AUDIO_API int AUDIOREGION_SetChanged(AUDIOREGION *region, uint8_t on);
AUDIO_API int AUDIOREGION_SetHideText(AUDIOREGION *region, uint8_t on);
AUDIO_API int AUDIOREGION_SetReadOnly(AUDIOREGION *region, uint8_t on);

/* Whether a user may delete the region: not deleted and not read-only. */
AUDIO_API int AUDIOREGION_CanDelete(const AUDIOREGION *region);
/* Marks the region and its descendants deleted / not deleted (read-only
 * ones too: callers ask CanDelete first); flags are reserved. */
AUDIO_API int AUDIOREGION_DeleteEx(AUDIOREGION *region, int flags);
AUDIO_API int AUDIOREGION_UndeleteEx(AUDIOREGION *region, int flags);

/* Nesting.  A child lies within its parent; its share is its begin offset
 * and length as fractions of the parent's length (see
 * AUDIOSIGNAL_AdjustRegionChildShares).  SetParent(region, null) detaches;
 * a parent of another signal, or one that would make a cycle, is refused. */
AUDIO_API AUDIOREGION *AUDIOREGION_GetParent(const AUDIOREGION *region);
AUDIO_API int AUDIOREGION_SetParent(AUDIOREGION *region, AUDIOREGION *parent);
/* The outermost parent (the region itself when it has none). */
AUDIO_API AUDIOREGION *AUDIOREGION_TopParent(const AUDIOREGION *region);
AUDIO_API int AUDIOREGION_GetChildShare(const AUDIOREGION *region, double *begin_share,
                                        double *length_share);
/* Every descendant, depth first; GetDescendents fills at most max handles
 * and answers how many it wrote. */
AUDIO_API int AUDIOREGION_GetNumDescendents(const AUDIOREGION *region);
AUDIO_API int AUDIOREGION_GetDescendents(const AUDIOREGION *region, AUDIOREGION **array, int max);

/* ---- Regions of a signal ------------------------------------------------ */

/* Adds a region on track 0..15 from begin to end seconds (swapped when
 * reversed, clamped to the signal).  flags: AUDIOREGION_ADD_QUIET makes no
 * change notification; the bits TEMPORARY, HIDETEXT and READONLY are copied
 * into the region; other bits are ignored.  Null on failure. */
#define AUDIOREGION_ADD_QUIET 0x02
AUDIO_API AUDIOREGION *AUDIOSIGNAL_AddRegionToTrackEx(AUDIOSIGNAL *signal, int flags, double begin,
                                                      double end, const char *label,
                                                      const char *comment, int track);

/* The general filter of the counting and listing calls, all-zero meaning
 * every region: the region meets [begin, end] in samples (no time condition
 * when end <= begin), lies on a track of the track mask (0: any), carries
 * none of the skip flags, and the filter function (null: any) keeps it.
 * Lists are in time order (begin, then end, then creation). */
AUDIO_API int AUDIOSIGNAL_CountRegions(AUDIOSIGNAL *signal, int64_t begin, int64_t end,
                                       uint32_t tracks, uint32_t skip_flags,
                                       AUDIOREGION_Filter filter);
AUDIO_API int AUDIOSIGNAL_GetRegions(AUDIOSIGNAL *signal, AUDIOREGION **array, int max,
                                     int64_t begin, int64_t end, uint32_t tracks,
                                     uint32_t skip_flags, AUDIOREGION_Filter filter);
/* Regions that are not deleted and meet [begin, end] (samples; end <= begin:
 * any time), any track. */
AUDIO_API int AUDIOSIGNAL_CountVisibleRegions(AUDIOSIGNAL *signal, int64_t begin, int64_t end);
AUDIO_API int AUDIOSIGNAL_GetVisibleRegions(AUDIOSIGNAL *signal, AUDIOREGION **array, int max,
                                            int64_t begin, int64_t end);
/* The general filter with deleted regions always left out. */
AUDIO_API int AUDIOSIGNAL_CountVisibleRegionsOfTrack(AUDIOSIGNAL *signal, int64_t begin,
                                                     int64_t end, uint32_t tracks,
                                                     uint32_t skip_flags,
                                                     AUDIOREGION_Filter filter);
AUDIO_API int AUDIOSIGNAL_GetVisibleRegionsOfTrack(AUDIOSIGNAL *signal, AUDIOREGION **array,
                                                   int max, int64_t begin, int64_t end,
                                                   uint32_t tracks, uint32_t skip_flags,
                                                   AUDIOREGION_Filter filter);
/* Selected, not deleted regions of one track (-1: all tracks). */
AUDIO_API int AUDIOSIGNAL_CountSelectedRegionsOfTrack(AUDIOSIGNAL *signal, int track);
AUDIO_API int AUDIOSIGNAL_GetSelectedRegions(AUDIOSIGNAL *signal, int track, AUDIOREGION **array,
                                             int max);

/* Walking a track in time order, deleted regions left out.  First/Last take
 * a track number (-1: any track); Next/Prev stay on the region's track. */
AUDIO_API AUDIOREGION *AUDIOSIGNAL_FindFirstRegion(AUDIOSIGNAL *signal, int track);
AUDIO_API AUDIOREGION *AUDIOSIGNAL_FindLastRegion(AUDIOSIGNAL *signal, int track);
AUDIO_API AUDIOREGION *AUDIOSIGNAL_FindNextRegion(AUDIOSIGNAL *signal, const AUDIOREGION *region);
AUDIO_API AUDIOREGION *AUDIOSIGNAL_FindPrevRegion(AUDIOSIGNAL *signal, const AUDIOREGION *region);

/* The first region in time order of a track (-1: any) that is not deleted,
 * whose label and comment equal the given ones (null: any), and whose span
 * relates to [begin, end] (samples) as match says; end < 0: any span. */
#define AUDIOREGION_MATCH_EXACT    0 /* same begin and end */
#define AUDIOREGION_MATCH_OVERLAP  1 /* meets the range */
#define AUDIOREGION_MATCH_INSIDE   2 /* lies within the range */
#define AUDIOREGION_MATCH_CONTAINS 3 /* covers the range */
AUDIO_API AUDIOREGION *AUDIOSIGNAL_FindRegion(AUDIOSIGNAL *signal, int64_t begin, int64_t end,
                                              const char *label, const char *comment, int track,
                                              int match);

/* Moves, by offset samples, the regions of a track (-1: all) that the
 * filter keeps (null: all not deleted), with their descendants, all by the
 * same amount, limited so that every one stays within the signal. */
AUDIO_API int AUDIOSIGNAL_OffsetRegions(AUDIOSIGNAL *signal, int64_t offset, int track,
                                        AUDIOREGION_Filter filter);
AUDIO_API int AUDIOSIGNAL_UnselectAllRegions(AUDIOSIGNAL *signal);
AUDIO_API int AUDIOSIGNAL_UnselectAllRegionsOfTrack(AUDIOSIGNAL *signal, int track);
/* Marks every region deleted (handles stay valid). */
AUDIO_API int AUDIOSIGNAL_DeleteAllRegions(AUDIOSIGNAL *signal);
/* Recomputes every child's share from the current times, after a caller
 * wrote begin and length into region records itself. */
AUDIO_API int AUDIOSIGNAL_AdjustRegionChildShares(AUDIOSIGNAL *signal);

/* ---- Region files ------------------------------------------------------- */

/* Format texts, without regard to case, optionally with "[track=NAME]":
 *   "LABELS" (or "TXT")  tab-separated text, one "begin<TAB>end<TAB>label" line per
 *             region, times in seconds (point labels have begin = end;
 *             frequency lines starting with a backslash are skipped);
 *   "WAVE" (or "WAV")  cue points and labelled ranges inside a WAV file (cue and
 *             LIST/adtl chunks); writing rewrites an existing WAV file;
 *   "VRGN"    this library's own text format: tracks, nesting, comments
 *             and flags, read back without loss;
 *   "AUTO" or null: chosen by the file's contents (reading) or its name
 *             (writing: ".wav", ".vrgn", else LABELS).
 * With track=NAME, regions read go to that track and only that track is
 * written; track names are turned into numbers by the signal's parent
 * (callback 0x10025).  Reading adds the file's regions to the signal's;
 * lines it cannot use are skipped and logged, regions outside the signal
 * are clamped.  Writing leaves out deleted and temporary regions and goes
 * through a temporary file renamed over the target.  1 / 0 with the last
 * error set. */
AUDIO_API int AUDIOSIGNAL_ReadRegions(AUDIOSIGNAL *signal, const char *file, const char *format);
AUDIO_API int AUDIOSIGNAL_WriteRegions(AUDIOSIGNAL *signal, const char *file, const char *format);

#ifdef __cplusplus
}
#endif

#endif /* AUDIOREGION_H */
