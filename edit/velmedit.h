/* Editing commands on a document's selections: copy, cut, clear, paste, mix
 * paste, append, trim, reverse, silence, effects, DC removal, format and
 * sample-rate changes and channel swaps.  Every change records an undo script
 * first and is rolled back when the signal refuses it.  Labels may be null:
 * each command has its own. */
#ifndef VELMEDIT_H
#define VELMEDIT_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmaudio.h"

VELM_EXTERN_C_BEGIN

/* The copy family returns a new signal owned by the caller, or null. */
VELM_API AUDIOSIGNAL *VELMAUDIO_Copy(VELMAUDIO doc);
VELM_API AUDIOSIGNAL *VELMAUDIO_CopySelectionsEx(VELMAUDIO doc, const VELMSELECTION *list, int option);
VELM_API AUDIOSIGNAL *VELMAUDIO_CopyAll(VELMAUDIO doc);
VELM_API AUDIOSIGNAL *VELMAUDIO_CopyChannel(VELMAUDIO doc, int channel);
VELM_API AUDIOSIGNAL *VELMAUDIO_CombineToStereo(VELMAUDIO doc, VELMAUDIO other);
VELM_API int VELMAUDIO_SaveSelectionAs(VELMAUDIO doc, const char *file_name, const char *format);

VELM_API int VELMAUDIO_SetSampleRate(VELMAUDIO doc, int32_t rate, const char *label);
VELM_API int VELMAUDIO_SwapChannels(VELMAUDIO doc, const char *label);
VELM_API int VELMAUDIO_Reverse(VELMAUDIO doc, const char *label);
VELM_API int VELMAUDIO_Silence(VELMAUDIO doc, const char *label);
VELM_API int VELMAUDIO_TransformSelection(VELMAUDIO doc, const char *effect, const char *label);
VELM_API int VELMAUDIO_RemoveDC(VELMAUDIO doc, const char *label);
VELM_API int VELMAUDIO_Trim(VELMAUDIO doc, const char *label);
VELM_API int VELMAUDIO_Clear(VELMAUDIO doc, const char *label);
/* The cut audio, owned by the caller; null on failure. */
VELM_API AUDIOSIGNAL *VELMAUDIO_CutSelectionsEx(VELMAUDIO doc, const VELMSELECTION *list, int option, const char *label);
VELM_API AUDIOSIGNAL *VELMAUDIO_Cut(VELMAUDIO doc, const char *label);
VELM_API int VELMAUDIO_Paste(VELMAUDIO doc, AUDIOSIGNAL *source, const char *label);
VELM_API int VELMAUDIO_PasteSilence(VELMAUDIO doc, int64_t frames, const char *label);
VELM_API int VELMAUDIO_PasteFromFile(VELMAUDIO doc, const char *file_name, const char *format, const char *label);
/* mode 0 mixes in at the cursor or selection begin, 1 mixes over the
 * selection or the source's length, 2 replaces the selection by the mix;
 * parameter is the gain of the source. */
VELM_API int VELMAUDIO_MixPaste(VELMAUDIO doc, AUDIOSIGNAL *source, int mode, double parameter, const char *label);
VELM_API int VELMAUDIO_Append(VELMAUDIO doc, AUDIOSIGNAL *source, const char *label);
VELM_API int VELMAUDIO_AppendFromFile(VELMAUDIO doc, const char *file_name, const char *format, const char *label);
VELM_API int VELMAUDIO_AppendSilence(VELMAUDIO doc, int64_t frames, const char *label);
/* Replaces the signal by a new one made through an effect script. */
VELM_API int VELMAUDIO_Transform(VELMAUDIO doc, const char *effect, const char *label);
/* format: the new rate and channel count; quantizer: null, "" or "NOCHANGES"
 * keeps the sample coding; gains: rows x columns mixer matrix or null. */
VELM_API int VELMAUDIO_ChangeAudioFormat(VELMAUDIO doc, const _audio_format *format, const char *quantizer,
                                         const double *gains, int rows, int columns, const char *label);

VELM_EXTERN_C_END

#endif /* VELMEDIT_H */
