/* Conversions between samples, seconds and frames through a document's format,
 * and position texts in the unit of its horizontal scale. */
#ifndef VELMTIMECONV_H
#define VELMTIMECONV_H

#include <stdint.h>

#include "core/velm_api.h"
#include "core/velmstate.h"

VELM_EXTERN_C_BEGIN

/* -1.0 / -1 for a document without a signal. */
VELM_API double  VELMAUDIO_SampleToTime(VELMAUDIO doc, int64_t sample);
VELM_API int64_t VELMAUDIO_TimeToSample(VELMAUDIO doc, double seconds);
VELM_API double  VELMAUDIO_Duration(VELMAUDIO doc);
VELM_API int32_t VELMAUDIO_ScaleFrameMsTime(VELMAUDIO doc);
VELM_API int64_t VELMAUDIO_ScaleFrameLength(VELMAUDIO doc);
VELM_API int64_t VELMAUDIO_TimeToFrame(VELMAUDIO doc, double seconds);
VELM_API int64_t VELMAUDIO_TimeToFrameSample(VELMAUDIO doc, double seconds);
VELM_API int VELMAUDIO_SampleToTimeString(VELMAUDIO doc, int64_t sample, char *buffer, int size);
VELM_API int VELMAUDIO_RealSampleToTimeString(VELMAUDIO doc, int64_t sample, int64_t reference, char *buffer, int size);
VELM_API int VELMAUDIO_HorzScaleLabelKindString(VELMAUDIO doc, int unused, char *buffer, int size);

VELM_EXTERN_C_END

#endif /* VELMTIMECONV_H */
