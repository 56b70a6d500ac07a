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

/* Limits every reader and writer enforces: a header claiming more is refused
 * as corrupt data before anything is allocated for it. */
#define AUDIO_MAX_CHANNELS     64
#define AUDIO_MAX_SAMPLE_RATE  1536000

/* File containers (containerKind). */
#define AUDIO_CONTAINER_NONE   0  /* samples in memory, no file */
#define AUDIO_CONTAINER_WAVE   1
#define AUDIO_CONTAINER_RF64   2  /* WAVE with 64-bit sizes, for files over 4 GB */
#define AUDIO_CONTAINER_W64    3
#define AUDIO_CONTAINER_AIFF   4
#define AUDIO_CONTAINER_CAF    5
#define AUDIO_CONTAINER_RAW    6  /* headerless samples, described by the format string */
#define AUDIO_CONTAINER_FLAC   7
#define AUDIO_CONTAINER_OGG    8
#define AUDIO_CONTAINER_MPEG   9
#define AUDIO_CONTAINER_LINK   14 /* a settings document naming an audio file */

/* Sample codings inside a container (audioFormatKind). */
#define AUDIO_FORMAT_NONE      0
#define AUDIO_FORMAT_PCM_U8    1
#define AUDIO_FORMAT_PCM_S8    2
#define AUDIO_FORMAT_PCM_16    3
#define AUDIO_FORMAT_PCM_24    4
#define AUDIO_FORMAT_PCM_32    5
#define AUDIO_FORMAT_FLOAT     6  /* 32-bit IEEE float */
#define AUDIO_FORMAT_DOUBLE    7  /* 64-bit IEEE float */
#define AUDIO_FORMAT_ULAW      8
#define AUDIO_FORMAT_ALAW      9
#define AUDIO_FORMAT_FLAC      10
#define AUDIO_FORMAT_VORBIS    11
#define AUDIO_FORMAT_OPUS      12
#define AUDIO_FORMAT_MP3       13

/* Format filter mask (AUDIO_FormatFilterMaskFromAudioFormat) and format
 * capability flags (AUDIO_FORMAT_DESCR.flags) share these bits: a sound
 * device or a file type accepts a format when (mask AND format mask) equals
 * the format mask.  Callers look only at AUDIO_FILTER_ALL; the low byte of a
 * descriptor's flags holds the AUDIO_DESCR_* bits. */
#define AUDIO_FILTER_RATE_96000   0x00000100
#define AUDIO_FILTER_RATE_48000   0x00000200
#define AUDIO_FILTER_RATE_44100   0x00000400
#define AUDIO_FILTER_RATE_32000   0x00000800
#define AUDIO_FILTER_RATE_22050   0x00001000
#define AUDIO_FILTER_RATE_16000   0x00002000
#define AUDIO_FILTER_RATE_11025   0x00004000
#define AUDIO_FILTER_RATE_8000    0x00008000
#define AUDIO_FILTER_RATE_6000    0x00010000
#define AUDIO_FILTER_STEREO       0x00100000
#define AUDIO_FILTER_MONO         0x00200000
#define AUDIO_FILTER_MULTICHANNEL 0x00400000 /* three channels or more */
#define AUDIO_FILTER_16BIT        0x01000000
#define AUDIO_FILTER_8BIT         0x02000000
#define AUDIO_FILTER_24BIT        0x04000000
#define AUDIO_FILTER_32BIT        0x08000000 /* 32-bit integer */
#define AUDIO_FILTER_FLOAT        0x10000000 /* 32-bit float */
#define AUDIO_FILTER_DOUBLE       0x20000000
#define AUDIO_FILTER_RATE_OTHER   0x40000000 /* any rate not listed above */
#define AUDIO_FILTER_ALL          0x7FFFFF00
#define AUDIO_FILTER_ANY_RATE     0x4001FF00

/* Low byte of AUDIO_FORMAT_DESCR.flags. */
#define AUDIO_DESCR_READ          0x01 /* files of this type can be opened */
#define AUDIO_DESCR_WRITE         0x02 /* ... and saved (by the installed codecs) */
#define AUDIO_DESCR_RANDOM_ACCESS 0x04 /* samples are read in place, not decoded */
#define AUDIO_DESCR_LOSSY         0x08

/* One named way of storing samples in a file type: the name (first field)
 * is what format strings use, e.g. "WAVE" or "WAVFLOAT". */
typedef struct _audio_format_entry {
    const char *name;
    const char *label;       /* for people: "PCM 16-bit" */
    uint16_t audioFormatKind;
    int16_t  bitsPerSample;  /* 0: follows the signal */
} AUDIO_FORMAT_ENTRY;

/* A file type and the codings it holds.  Descriptors are static: never freed. */
typedef struct _audio_format_descr {
    const char *name;                 /* container name, e.g. "WAVE" */
    const char *label;                /* "Microsoft WAVE" */
    const char *extensions;           /* "wav" or "aif,aiff" */
    uint16_t containerKind;
    uint32_t flags;                   /* AUDIO_FILTER_* capabilities | AUDIO_DESCR_* */
    int numEntries;
    const AUDIO_FORMAT_ENTRY *entries;
} AUDIO_FORMAT_DESCR;

/* Format strings name a file type and its options: NAME or NAME[key=value,...],
 * names and keys without regard to case, no spaces.  Names: AUTO (detect on
 * open; on save, by the file name's extension, else WAVE), WAVE (WAV, WAVPCM),
 * WAVFLOAT, RF64, W64, AIFF (AIF), AIFFFLOAT, CAF, CAFFLOAT, RAW, RAWFLOAT,
 * FLAC, OGG (VORBIS), OPUS, MP3, LINK.  Keys:
 *   sr=rate, nc=channels   headerless files (RAW; AUTO reads a file it does
 *                          not recognise as headerless when both are given);
 *                          saves always write the signal's own
 *   nbits=8|16|24|32|64    stored depth (bps is the same key); 64 with floats
 *   endian=little|big      headerless files (little unless told)
 *   offset=bytes           header bytes to skip in a headerless file
 *   quality=0..1           lossy encoders
 * A reading conversion may follow: "AUTO:FMTCONV[sr=8000,nc=1,nbits=16]".
 * Anything else, or a value out of range, is AUDIO_ERROR_BAD_FORMAT_STRING.
 * Saving WAVE writes RF64 once a file passes 4 GB. */

/* Opaque audio file opened by AUDIO_LoadFile or AUDIO_CreateFileEx. */
typedef struct _audio_file AUDIO_FILE;

/* Start and stop the library: counted; Finalize answers 0 when nothing was
 * started.  The calls of this header work without them. */
AUDIO_API int  AUDIO_Initialize(void);
AUDIO_API int  AUDIO_Finalize(void);

/* Format records.  InitFormat leaves the container at AUDIO_CONTAINER_NONE
 * and picks the coding from the depth: 32 bits are floats, 8 to 24 bits
 * integers.  NullFormat is all zeros. */
AUDIO_API _audio_format AUDIO_InitFormat(int sampleRate, int numChannels, int bitsPerSample);
AUDIO_API _audio_format AUDIO_NullFormat(void);
/* 1 when the record describes samples that can exist: rate and channels in
 * range, bits 0 (unspecified: saved as 16) to 64. */
AUDIO_API int AUDIO_IsValidFormat(const _audio_format *format);
/* "sr=44100,nc=2,nbits=16" in a per-thread buffer of 64 bytes valid until the
 * thread's next call; "invalid" for a null or unusable format. */
AUDIO_API const char *AUDIO_ComposeFormatString(const _audio_format *format);

/* Descriptors: the file type of format->containerKind; *index (may be null)
 * receives the entry matching the coding.  Null when the container is unknown. */
AUDIO_API const AUDIO_FORMAT_DESCR *AUDIO_GetFormatDescr(const _audio_format *format, int *index);
AUDIO_API const AUDIO_FORMAT_DESCR *AUDIO_GetFormatDescrByName(const char *name, int *index);
AUDIO_API int AUDIO_NumFormatDescrs(void);
AUDIO_API const AUDIO_FORMAT_DESCR *AUDIO_GetFormatDescrByIndex(int i);
AUDIO_API uint32_t AUDIO_FormatFilterMaskFromAudioFormat(const _audio_format *format);
/* 1 when a file type with capability flags `mask` can hold `format`. */
AUDIO_API int AUDIO_IsCompatible(const _audio_format *format, uint32_t mask);
/* Labels for people; null for an unknown kind. */
AUDIO_API const char *AUDIODEF_ContainerString(int containerKind);
AUDIO_API const char *AUDIODEF_AudioFormatString(int audioFormatKind);

/* Time and samples: Time2Sample rounds to the nearest frame; both answer -1
 * for a null format or a format without a rate. */
AUDIO_API int64_t AUDIO_Time2Sample(const _audio_format *format, double seconds);
AUDIO_API double  AUDIO_Sample2Time(const _audio_format *format, int64_t sample);

/* 16-bit conversions: float 1.0 is 32768, so -1.0 .. 32767/32768 maps onto the
 * whole 16-bit range; floats are rounded to nearest and clamped.  Return n. */
AUDIO_API int AUDIO_Word16ToFloatIEEE(const int16_t *in, float *out, int n);
AUDIO_API int AUDIO_IEEEFloatToWord16(const float *in, int16_t *out, int n);
/* Frames of 16-bit samples of `format` in `bytes` bytes (-1 for a bad format). */
AUDIO_API int64_t AUDIO_SamplesSize16(const _audio_format *format, int64_t bytes);

/* Audio files read and written frame by frame as interleaved floats.
 * LoadFile takes a format string, optionally followed by a conversion:
 * "AUTO:FMTCONV[sr=8000,nc=1]" (the file's frames are resampled and mixed). */
AUDIO_API AUDIO_FILE *AUDIO_LoadFile(const char *path, const char *formatText);
/* Creates `path` (atomically, at AUDIO_CloseFile) holding `format`'s samples,
 * stored as the format string says ("WAVE", "FLAC[nbits=24]"...). */
AUDIO_API AUDIO_FILE *AUDIO_CreateFileEx(const char *path, const _audio_format *format,
                                         const char *formatText);
/* Frames read into `out` (interleaved), 0 at the end, -1 on error. */
AUDIO_API int64_t AUDIO_ReadIEEEFloat(AUDIO_FILE *file, float *out, int64_t frames);
/* Frames written, -1 on error (the file is then discarded at close). */
AUDIO_API int64_t AUDIO_WriteIEEEFloat(AUDIO_FILE *file, const float *in, int64_t frames);
/* The format of the frames the file hands out or takes. */
AUDIO_API _audio_format AUDIO_GetAudioFileFormat(const AUDIO_FILE *file);
/* Closes; a written file is committed.  1 on success. */
AUDIO_API int AUDIO_CloseFile(AUDIO_FILE *file);

/* Progress of the calling thread's long file work: opening a signal from a
 * file (AUDIOSIGNAL_OpenEx) and saving one (AUDIOSIGNAL_Save) call back with
 * the fraction done, rising, at most once in each hundredth, and ending with
 * exactly 1.0 when the work succeeds.  The callback runs on the calling
 * thread, inside the call; null turns reporting off.  Returns 1. */
typedef void (*AUDIO_PROGRESS_CALLBACK)(void *user, double fraction);
AUDIO_API int AUDIO_SetProgressCallback(AUDIO_PROGRESS_CALLBACK callback, void *user);

/* The calling thread's last error (AUDIO_ERROR_* bits; 0 after a reset).
 * Calls that fail set it; calls that succeed leave it alone. */
AUDIO_API int  AUDIOSIGNAL_GetLastError(void);
AUDIO_API void AUDIOSIGNAL_ResetLastError(void);
/* 1 when the file opens with this format string, reading its header only;
 * with AUDIO_CANOPEN_DECODE the first frames are decoded too.  On failure
 * the last error says why. */
#define AUDIO_CANOPEN_DECODE 0x1
AUDIO_API int  AUDIOSIGNAL_CanOpen(const char *path, const char *formatText, int flags);

#ifdef __cplusplus
}
#endif

#endif /* AUDIOFORMAT_H */
