/*
 * Audio signal library: the sample format record shared by signals, files,
 * effect paths and sound devices.
 */
#ifndef AUDIOFORMAT_H
#define AUDIOFORMAT_H

#include <stdint.h>

#if defined(AUDIO_BUILDING_LIBRARY)
#define AUDIO_API __attribute__((visibility("default")))
#else
#define AUDIO_API
#endif

#ifdef __cplusplus
extern "C" {
#endif

/* A value record of three 32-bit words. */
typedef struct _audio_format {
    int32_t  sampleRate;      /* frames per second */
    int16_t  numChannels;
    int16_t  bitsPerSample;   /* of the stored or device samples */
    uint16_t containerKind;   /* file container, AUDIO_CONTAINER_* */
    uint16_t audioFormatKind; /* sample coding inside it, AUDIO_FORMAT_* */
} _audio_format;

typedef _audio_format AUDIO_FORMAT;

#ifdef __cplusplus
}
#endif

#endif /* AUDIOFORMAT_H */
