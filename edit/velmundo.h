/* The undo history: a bounded stack of scripts per document.  A script holds
 * a label, the view state before a change and the actions that revert the
 * signal and its regions.  There is no redo. */
#ifndef VELMUNDO_H
#define VELMUNDO_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmaudio.h"
#include "outside/signal/audioregion.h"

VELM_EXTERN_C_BEGIN

#define VELMUNDO_MAX_SCRIPTS 1024
#define VELMUNDO_LABEL_SIZE  256

typedef struct _VELMUNDOSCRIPT VELMUNDOSCRIPT;

VELM_API VELMUNDOSCRIPT *VELMUNDO_CreateUndoScript(const char *label, const VELMSTATE *state);
VELM_API int  VELMUNDO_DestroyUndoScript(VELMUNDOSCRIPT *script);
VELM_API const char *VELMUNDO_ScriptLabel(const VELMUNDOSCRIPT *script);

VELM_API int VELMUNDO_AddNoAction(VELMUNDOSCRIPT *script);
VELM_API int VELMUNDO_AddRevertAudioBlocks(VELMUNDOSCRIPT *script, AUDIOSIGNAL *signal);
VELM_API int VELMUNDO_AddRevertAllRegionsState(VELMUNDOSCRIPT *script, AUDIOSIGNAL *signal);
VELM_API int VELMUNDO_AddRevertRegionState(VELMUNDOSCRIPT *script, AUDIOREGION *region);
VELM_API int VELMUNDO_AddRevertRegionGroupState(VELMUNDOSCRIPT *script, AUDIOREGION *region);
VELM_API int VELMUNDO_AddRevertCreateRegion(VELMUNDOSCRIPT *script, AUDIOREGION *region);
/* The script takes the earlier signal and gives it back on undo. */
VELM_API int VELMUNDO_ReplaceSignal(VELMUNDOSCRIPT *script, AUDIOSIGNAL *earlier);
VELM_API int VELMUNDO_AddChangeRegionComment(VELMUNDOSCRIPT *script, AUDIOREGION *region, const char *previous);
VELM_API int VELMUNDO_AddChangeRegionLabel(VELMUNDOSCRIPT *script, AUDIOREGION *region, const char *previous);
VELM_API int VELMUNDO_AddSetSampleRate(VELMUNDOSCRIPT *script, int32_t previous_rate);
VELM_API int VELMUNDO_AddSwapChannels(VELMUNDOSCRIPT *script);

/* A script without actions is destroyed and refused (0). */
VELM_API int  VELMUNDO_PushUndoScript(VELMAUDIO doc, VELMUNDOSCRIPT *script);
VELM_API VELMUNDOSCRIPT *VELMUNDO_PopUndoScript(VELMAUDIO doc);
VELM_API int  VELMUNDO_DestroyStack(VELMAUDIO doc);
VELM_API int  VELMUNDO_Count(VELMAUDIO doc);
VELM_API int64_t VELMUNDO_SizeInMemory(VELMAUDIO doc);
VELM_API int  VELMUNDO_FreeMemory(VELMAUDIO doc);

VELM_API int VELMAUDIO_CreateUndo(VELMAUDIO doc, const char *label);
VELM_API int VELMAUDIO_CreateSignalUndo(VELMAUDIO doc, const char *label);
VELM_API int VELMAUDIO_Undo(VELMAUDIO doc);
VELM_API const char *VELMAUDIO_NextUndoLabel(VELMAUDIO doc);
VELM_API VELMSTATE *VELMAUDIO_SaveState(VELMAUDIO doc);
VELM_API int VELMAUDIO_RestoreState(VELMAUDIO doc, VELMSTATE *saved);

VELM_EXTERN_C_END

#endif /* VELMUNDO_H */
