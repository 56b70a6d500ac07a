/* Custom tracks: up to eight named lanes of regions per document, and the
 * text form of their option flags. */
#ifndef VELMCUSTOMTRACK_H
#define VELMCUSTOMTRACK_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmstate.h"

VELM_EXTERN_C_BEGIN

typedef struct VELMCUSTOMTRACK VELMCUSTOMTRACK;

/* Track option flags. */
#define VELMTRACK_NOHORZGRID             0x00001u
#define VELMTRACK_FIRST_VISIBLE          0x00002u
#define VELMTRACK_LAST_VISIBLE           0x00004u
#define VELMTRACK_NOSHOWAUDIOSELECTION   0x00010u
#define VELMTRACK_RGNSQUARECORNER        0x00020u
#define VELMTRACK_SHOWRGNLABEL           0x00080u
#define VELMTRACK_SHOWRGNCOMMENT         0x00100u
#define VELMTRACK_NOOFFSETONRGNMOVE      0x00200u
#define VELMTRACK_NOOFFSETONRGNSELECTION 0x00400u
#define VELMTRACK_ALIGNLABELLEFT         0x00800u
#define VELMTRACK_ALIGNLABELRIGHT        0x01000u
#define VELMTRACK_ALIGNCOMMENTLEFT       0x02000u
#define VELMTRACK_ALIGNCOMMENTRIGHT      0x04000u
#define VELMTRACK_ALLOWPARTIALTEXT       0x08000u
#define VELMTRACK_USEPHONETICFONT        0x10000u

VELM_API int  VELMAUDIO_AddCustomTrack(VELMAUDIO doc, const char *identifier);
VELM_API int  VELMAUDIO_RemoveCustomTrack(VELMAUDIO doc, const char *identifier);
VELM_API int  VELMAUDIO_FindCustomTrackId(VELMAUDIO doc, const char *identifier);
VELM_API int  VELMAUDIO_ExistCustomTrack(VELMAUDIO doc, const char *identifier);
VELM_API int  VELMAUDIO_CustomTrackPosition(VELMAUDIO doc, const char *identifier);
VELM_API const char *VELMAUDIO_GetCustomTrackUniqId(VELMAUDIO doc, int track);
VELM_API int  VELMAUDIO_NumCustomTracks(VELMAUDIO doc);
VELM_API const VELMCUSTOMTRACK *VELMAUDIO_CustomTrackInPosition(VELMAUDIO doc, int position);
VELM_API const char *VELMAUDIO_CustomTrackIdentifierInPosition(VELMAUDIO doc, int position);

/* The label of the track at a position, from the process-wide settings. */
VELM_API const char *VELMAUDIO_CustomTrackLabelInPosition(VELMAUDIO doc, int position);
/* Display properties 0..9 of a track number (see the view state's track entries). */
VELM_API int32_t VELMAUDIO_GetCustomTrackProperty(VELMAUDIO doc, int track, int property);

/* Per-track switches, kept in the document's settings under
 * "libvelm.customtrack.<identifier>."; 0 for an unknown identifier. */
VELM_API int VELMAUDIO_VisibleCustomTrack(VELMAUDIO doc, const char *identifier);
VELM_API int VELMAUDIO_ShowCustomTrack(VELMAUDIO doc, const char *identifier);
VELM_API int VELMAUDIO_HideCustomTrack(VELMAUDIO doc, const char *identifier);
VELM_API const char *VELMAUDIO_CustomTrackLabel(VELMAUDIO doc, const char *identifier);
VELM_API int VELMAUDIO_SetCustomTrackLabel(VELMAUDIO doc, const char *identifier, const char *label);
VELM_API int VELMAUDIO_CustomTrackNotifyChanges(VELMAUDIO doc, const char *identifier);
VELM_API int VELMAUDIO_SetCustomTrackNotifyChanges(VELMAUDIO doc, const char *identifier, int on);
VELM_API int VELMAUDIO_CustomTrackReadOnly(VELMAUDIO doc, const char *identifier);
VELM_API int VELMAUDIO_SetCustomTrackReadOnly(VELMAUDIO doc, const char *identifier, int on);
VELM_API int VELMAUDIO_EditableCustomTrack(VELMAUDIO doc, const char *identifier);

VELM_API uint32_t VELMDEFINES_DecodeCustomTrackOption(const char *text);
VELM_API int      VELMDEFINES_EncodeCustomTrackOption(uint32_t flags, char *buffer, int size);

VELM_EXTERN_C_END

#endif /* VELMCUSTOMTRACK_H */
