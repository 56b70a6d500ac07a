/*
 * The view state: everything about how a document is shown and where the user
 * is in it, in one flat record that the renderer and the undo history copy.
 */
#ifndef VELMSTATE_H
#define VELMSTATE_H

#include <stdint.h>

#include "core/velm_api.h"
#include "outside/base/blbase.h"

VELM_EXTERN_C_BEGIN

typedef struct _VELMAUDIO *VELMAUDIO;
struct VELMCOLORMAP;

/* Document status flags, kept in the view state. */
#define STATUS_VISUAL_CHANGED   0x01u
#define STATUS_MODIFIED         0x02u
#define STATUS_HAS_FILE         0x04u
#define STATUS_UNRESOLVED_LINK  0x08u
#define STATUS_NOT_LOADED       0x10u
#define STATUS_BUSY             0x40u
#define STATUS_HAS_REGIONS_FILE 0x80u

/* Change bits: what must be redrawn.  Bit 31 asks for a full rebuild. */
#define VELMSTATE_CHANGE_SCROLL          0x00000001u
#define VELMSTATE_CHANGE_SELECTING       0x00000002u
#define VELMSTATE_CHANGE_SELECTIONS      0x00000004u
#define VELMSTATE_CHANGE_VERT_SCALES     0x00000008u
#define VELMSTATE_CHANGE_HORZ_SCALE      0x00000010u
#define VELMSTATE_CHANGE_RECORDING       0x00000020u
#define VELMSTATE_CHANGE_FOCUS           0x00000040u
#define VELMSTATE_CHANGE_FOCUS_BEGIN     0x00000080u
#define VELMSTATE_CHANGE_FOCUS_LENGTH    0x00000100u
#define VELMSTATE_CHANGE_QUICKBOX        0x00000200u
#define VELMSTATE_CHANGE_WINDOW          0x00000800u
#define VELMSTATE_CHANGE_TRACK_COLORS    0x00002000u
#define VELMSTATE_CHANGE_SCALE_SELECTION 0x00004000u
#define VELMSTATE_CHANGE_FULL            0x80000000u
#define VELMSTATE_CHANGE_EVERYTHING      0x80001C18u

/* Selecting kinds: how the selection being dragged is committed. */
#define SELECTING_REPLACE  1
#define SELECTING_ADD      2
#define SELECTING_SUBTRACT 3

#define VELM_MAX_CUSTOM_TRACKS 8
#define VELM_MAX_CHANNEL_SLOTS 7

/* One time selection, in seconds; committed selections form a list. */
typedef struct _VELMSELECTION {
    double begin;
    double end;
    struct _VELMSELECTION *next;
} VELMSELECTION;

typedef struct _VELMCURSOR {
    int32_t kind;             /* 0 edit cursor, 1 play cursor */
    int64_t position;
    int64_t secondPosition;   /* play cursor: where it was last set */
    uint8_t changed;          /* moved and not yet read */
    uint8_t shown;
    uint8_t flag;
} VELMCURSOR;

/* A snapshot of a region as it was when the state was written: comparing two
 * snapshots tells whether the region moved or changed length. */
typedef struct _VELMREGIONCOPY {
    void    *region;            /* the region's handle; null when none */
    double   begin;             /* seconds */
    double   length;            /* seconds */
    uint32_t flags;             /* low four bits: custom track */
} VELMREGIONCOPY;

typedef struct _VELMQUICKBOX {
    int32_t x, y, width, height, cornerX, cornerY;
} VELMQUICKBOX;

typedef struct _VELMSPECTRALCONFIG {
    int32_t fftLength;
    double  dynamicRange;
    double  preEmphasis;
    int32_t windowSize;
    int32_t windowType;
    uint8_t normalize;
    const struct VELMCOLORMAP *colorScheme; /* 256-entry colour map */
} VELMSPECTRALCONFIG;

typedef struct _VELMTRACKDISPLAY {
    uint8_t  visible;
    uint32_t options;
    int32_t  minimumHeight;
    int32_t  lineCount;
    int32_t  backgroundColor;
    uint8_t  backgroundAlpha;
    float    fontSize;
    int32_t  fontColor;
    int32_t  inactiveFontColor;
} VELMTRACKDISPLAY;

typedef struct _VELMSTATE {
    BLMEM   pool;
    uint8_t ownsPool;
    int64_t fileId;            /* catalogue id; -1 once the content left the saved file */
    uint32_t status;           /* STATUS_* */
    uint32_t changes;          /* pending change bits since the last finished draw */
    int32_t selectingKind;     /* SELECTING_* */
    VELMSELECTION selecting;   /* the selection being dragged */
    VELMSELECTION *selections; /* committed selections, ascending, disjoint */
    VELMCURSOR cursor;
    VELMCURSOR playCursor;
    uint32_t controls;                               /* 0x1 smart zoom, 0x2 zoom-limit control */
    uint32_t channelControls[VELM_MAX_CHANNEL_SLOTS]; /* mute indicators per channel slot */
    int32_t smartZoomAction;
    uint32_t channelMask;
    int64_t viewBegin, viewEnd;
    int64_t zoomLowerLimit, zoomUpperLimit;
    double  vertMax, vertMin;
    double  spectralMin, spectralMax;
    int32_t scaleFrameLength;  /* milliseconds */
    VELMREGIONCOPY focusedRegion;
    VELMREGIONCOPY focusedTopParent;
    VELMREGIONCOPY currentRegion;
    VELMQUICKBOX quickBox;
    int64_t recordStart, recordPosition;
    double  vertSelectionStart, vertSelectionEnd;
    double  spectralSelectionStart, spectralSelectionEnd;
    int32_t drawWidth, drawHeight;
    int32_t navigatorHeight;
    uint32_t viewFlags;
    int32_t horzScaleKind;
    int32_t vertScaleKind;
    int32_t spectralScaleKind;
    VELMSPECTRALCONFIG spectral;
    float   waveHeightFraction;
    VELMTRACKDISPLAY tracks[VELM_MAX_CUSTOM_TRACKS];
    uint64_t changeStamp;
    uint64_t settingsStamp;
} VELMSTATE;

VELM_API VELMSTATE *VELMSTATE_Create(void);
VELM_API void       VELMSTATE_Destroy(VELMSTATE *state);
/* Copies into pool (null: a private pool owned by the copy). */
VELM_API VELMSTATE *VELMSTATE_CreateCopy(BLMEM pool, const VELMSTATE *state);
/* Replaces *destination by source, keeping the destination's display
 * configuration, draw size and play cursor. */
VELM_API int        VELMSTATE_Assign(const VELMSTATE *source, VELMSTATE **destination);
/* These two rebuild the record; the caller stores the returned one. */
VELM_API VELMSTATE *VELMSTATE_ClearSelection(VELMSTATE *state);
VELM_API VELMSTATE *VELMSTATE_InvertSelection(VELMSTATE *state, double duration);
VELM_API int64_t    VELMSTATE_SelectionSize(VELMAUDIO doc, const VELMSTATE *state);
VELM_API uint32_t   VELMSTATE_EvalChanges(VELMAUDIO doc, const VELMSTATE *current, const VELMSTATE *previous);
VELM_API int        VELMSTATE_NotifyChanges(VELMAUDIO doc, uint32_t changes);
VELM_API int        VELMSTATE_ResetChanges(VELMAUDIO doc);
VELM_API int        VELMSTATE_ResetVisualChanges(VELMAUDIO doc);

VELM_EXTERN_C_END

#endif /* VELMSTATE_H */
