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

/* Error codes of the signal library (AUDIOSIGNAL_GetLastError).  Several
 * may be ORed when one call meets more than one problem. */
#define AUDIO_ERROR_NONE               0x0000
#define AUDIO_ERROR_READ               0x0001 /* the file could not be read */
#define AUDIO_ERROR_FILE_NOT_FOUND     0x0002
#define AUDIO_ERROR_WRITE              0x0004 /* the file could not be written */
#define AUDIO_ERROR_ACCESS_DENIED      0x0008
#define AUDIO_ERROR_BAD_ARGUMENT       0x0010 /* null handle, range or size out of bounds */
#define AUDIO_ERROR_BAD_FORMAT_STRING  0x0020
#define AUDIO_ERROR_UNSUPPORTED_FORMAT 0x0040 /* not an audio file we can read or write */
#define AUDIO_ERROR_CORRUPT_DATA       0x0800 /* header or data do not make sense */
#define AUDIO_ERROR_OUT_OF_MEMORY      0x1000

#ifdef __cplusplus
}
#endif

#endif /* AUDIOFORMAT_H */
