/*
 * Audio signal library: signals, their sample blocks, reading, statistics,
 * edits, saved states and recording pipes.
 *
 * A signal holds one list of shared, immutable sample blocks per channel.
 * Edits build new lists that share every untouched block, so duplicates,
 * saved states and undo cost memory only for what changed.
 *
 * Conventions: every call checks its arguments and answers with its failure
 * value (0, null or -1) and the last error (AUDIOSIGNAL_GetLastError) set to
 * one of the AUDIO_ERROR_* codes of audioformat.h.  Sample positions are
 * 64-bit frame indexes; ranges are [begin, end) and are clamped to the
 * signal, so 0 .. AUDIOSIGNAL_END stands for the whole signal and
 * AUDIOSIGNAL_END .. AUDIOSIGNAL_END for its end.
 */
#ifndef AUDIOSIGNAL_H
#define AUDIOSIGNAL_H

#include <stdint.h>

#include "audioformat.h"
#include "audiometadata.h"

#ifdef __cplusplus
extern "C" {
#endif

typedef struct _audio_signal AUDIOSIGNAL;
typedef struct _audio_blocks_list AUDIOBLOCKSLIST;
typedef struct _audio_signal_pipe AUDIOSIGNAL_PIPE;

/* Channel masks are 32 bits wide: a signal has at most this many channels. */
#define AUDIOSIGNAL_MAX_CHANNELS 32

/* The position past every sample: the end of any signal. */
#define AUDIOSIGNAL_END ((int64_t)0x7FFFFFFFFFFFFFFFLL)

/* Edit flags.  SERIES marks the first call of a command that makes one call
 * per selection; the library treats every call on its own, so the flag only
 * documents the grouping.  COPY_OPTION says that the low byte carries copy
 * options: COPY_ALLCHANNELS copies every channel instead of the active ones. */
#define AUDIOSIGNAL_FLAG_SERIES      0x400
#define AUDIOSIGNAL_COPY_OPTION      0x100
#define AUDIOSIGNAL_COPY_ALLCHANNELS 0x001

/* Codes of the signal callback (the parent object's answer is returned). */
#define AUDIOSIGNAL_CALLBACK_TRACK_ID    0x10025 /* data1: track name; data2: int32_t* id out */
#define AUDIOSIGNAL_CALLBACK_TRACK_LABEL 0x10026 /* data1: track name; data2: new label */

/* Time stamp kinds (AUDIOSIGNAL_GetTimeStamp). */
#define AUDIOSIGNAL_STAMP_CHANGES 0 /* grows with every change of samples, format or regions */
#define AUDIOSIGNAL_STAMP_REGIONS 1 /* grows with every change of the regions */
#define AUDIOSIGNAL_STAMP_FILE    2 /* modification time of the file at the last open or save,
                                       nanoseconds since the epoch; 0 without a file */
#define AUDIOSIGNAL_STAMP_SAMPLES 3 /* grows with every change of samples or format */

/* AUDIOSIGNAL_NotifyChange kinds. */
#define AUDIOSIGNAL_CHANGED_REGIONS 0x1
#define AUDIOSIGNAL_CHANGED_SAMPLES 0x2

/* AUDIOSIGNAL_OpenEx flags. */
#define AUDIOSIGNAL_OPEN_METADATA 0x1 /* keep the file's metadata with the signal */
#define AUDIOSIGNAL_OPEN_SAMPLES  0x2 /* load the samples (always done; kept for callers) */

/* The parent object's callback: answers the codes above. */
typedef int (*AUDIOSIGNAL_CALLBACK)(void *parent, int code, void *data1, void *data2);

/* ---- Creation and lifetime -------------------------------------------- */

/* An empty signal of the format's rate and channels (1 .. 32 channels, a
 * positive rate). */
AUDIO_API AUDIOSIGNAL *AUDIOSIGNAL_New(const AUDIO_FORMAT *format);
AUDIO_API AUDIOSIGNAL *AUDIOSIGNAL_NewEx(const AUDIO_FORMAT *format);
/* A signal of frames silent frames (at most 2^36); silence takes no sample
 * memory. */
AUDIO_API AUDIOSIGNAL *AUDIOSIGNAL_CreateSilence(const AUDIO_FORMAT *format, int64_t frames);
/* A copy sharing every block; format, masks, metadata, regions, stamps and
 * hash are copied, the parent object is not.  flags are reserved (pass 0). */
AUDIO_API AUDIOSIGNAL *AUDIOSIGNAL_DuplicateEx(AUDIOSIGNAL *signal, int flags);
AUDIO_API int          AUDIOSIGNAL_Destroy(AUDIOSIGNAL *signal);

/* Opens a file (format text as for the AUDIO_ calls, "AUTO" detects).  PCM
 * files are read in place; other codings are decoded once into the block
 * cache.  parent and callback may be null. */
AUDIO_API AUDIOSIGNAL *AUDIOSIGNAL_OpenEx(const char *file_name, const char *format_text, int flags,
                                          void *parent, AUDIOSIGNAL_CALLBACK callback);
/* Writes the signal to a temporary file beside file_name and renames it over
 * the target; on failure the old file is left as it was. */
AUDIO_API int AUDIOSIGNAL_Save(AUDIOSIGNAL *signal, const char *file_name, const char *format_text);

/* ---- Format and properties -------------------------------------------- */

AUDIO_API int         AUDIOSIGNAL_GetFormat(const AUDIOSIGNAL *signal, AUDIO_FORMAT *out);
/* The format with the channel count of the active channels only: the
 * format of what AUDIOSIGNAL_GetMaskedSamples gives for the active mask. */
AUDIO_API int         AUDIOSIGNAL_GetActiveFormat(const AUDIOSIGNAL *signal, AUDIO_FORMAT *out);
AUDIO_API int64_t     AUDIOSIGNAL_NumSamples(const AUDIOSIGNAL *signal);
AUDIO_API int         AUDIOSIGNAL_NumChannels(const AUDIOSIGNAL *signal);
AUDIO_API int         AUDIOSIGNAL_SampleRate(const AUDIOSIGNAL *signal);
/* The format text of the last open or save ("AUTO" replaced by the detected
 * format's name); empty for a new signal.  Cut to size; 1, or 0 on failure. */
AUDIO_API int         AUDIOSIGNAL_GetFormatString(const AUDIOSIGNAL *signal, char *buffer, int size);
/* The file of the last open or save, or null. */
AUDIO_API const char *AUDIOSIGNAL_GetFileName(const AUDIOSIGNAL *signal);
AUDIO_API int         AUDIOSIGNAL_ReadOnly(const AUDIOSIGNAL *signal);
AUDIO_API int         AUDIOSIGNAL_SetReadOnly(AUDIOSIGNAL *signal, int read_only);
/* The metadata object, owned by the signal, or null.  SetMetaData hands an
 * object to the signal (which destroys the one it had); duplicates get a
 * copy. */
AUDIO_API AUDIOMETADATA *AUDIOSIGNAL_GetMetaData(const AUDIOSIGNAL *signal);
AUDIO_API int            AUDIOSIGNAL_SetMetaData(AUDIOSIGNAL *signal, AUDIOMETADATA *metadata);

/* Relabels the samples with a new rate (no conversion). */
AUDIO_API int AUDIOSIGNAL_SetSampleRate(AUDIOSIGNAL *signal, int sample_rate);

/* ---- Changes, stamps, hash, memory ------------------------------------ */

AUDIO_API uint64_t AUDIOSIGNAL_GetTimeStamp(const AUDIOSIGNAL *signal, int kind);
/* Marks the current state as unchanged; HasChanges tells whether it moved since. */
AUDIO_API int      AUDIOSIGNAL_ResetChanges(AUDIOSIGNAL *signal);
AUDIO_API int      AUDIOSIGNAL_HasChanges(const AUDIOSIGNAL *signal);
/* Moves the change stamp for changes made outside the signal calls (what:
 * AUDIOSIGNAL_CHANGED_*). */
AUDIO_API int      AUDIOSIGNAL_NotifyChange(AUDIOSIGNAL *signal, int what);

typedef struct _audio_signal_hash {
    uint8_t bytes[16];
} AUDIOSIGNAL_HASH;

/* 1 when the hash of the current samples is known without reading them. */
AUDIO_API int               AUDIOSIGNAL_HasValidHash(const AUDIOSIGNAL *signal);
/* Hash of format, channels and samples (computed when not valid); returns
 * out, or null on failure. */
AUDIO_API AUDIOSIGNAL_HASH *AUDIOSIGNAL_GetSignalHash(AUDIOSIGNAL_HASH *out, AUDIOSIGNAL *signal);

/* Sample memory held by the signal: a block shared by several lists counts
 * for each holder's share, so duplicates and saved states are visible. */
AUDIO_API int64_t AUDIOSIGNAL_SizeInMemory(const AUDIOSIGNAL *signal);
/* Size of the file of the last open or save; 0 without a file. */
AUDIO_API int64_t AUDIOSIGNAL_SizeInDisk(const AUDIOSIGNAL *signal);
/* Moves the signal's in-memory blocks to the block cache file. */
AUDIO_API int     AUDIOSIGNAL_FreeDataMemory(AUDIOSIGNAL *signal);

/* ---- Parent object ---------------------------------------------------- */

AUDIO_API int AUDIOSIGNAL_SetParentObject(AUDIOSIGNAL *signal, void *parent, AUDIOSIGNAL_CALLBACK callback);
AUDIO_API void *AUDIOSIGNAL_GetParentObject(const AUDIOSIGNAL *signal);

/* ---- Channels --------------------------------------------------------- */

/* Enable and Disable answer 1 only when the channel's state changed. */
AUDIO_API int      AUDIOSIGNAL_EnableChannel(AUDIOSIGNAL *signal, int channel);
AUDIO_API int      AUDIOSIGNAL_DisableChannel(AUDIOSIGNAL *signal, int channel);
AUDIO_API int      AUDIOSIGNAL_ChannelActive(const AUDIOSIGNAL *signal, int channel);
AUDIO_API int      AUDIOSIGNAL_NumActiveChannels(const AUDIOSIGNAL *signal);
AUDIO_API uint32_t AUDIOSIGNAL_GetActiveChannelMask(const AUDIOSIGNAL *signal);
AUDIO_API uint32_t AUDIOSIGNAL_GetDisabledChannelMask(const AUDIOSIGNAL *signal);

/* ---- Read access ------------------------------------------------------ */

/* Shared access for a whole drawing frame; never waits.  1 when taken, 0
 * while an edit or pipe append holds the signal. */
AUDIO_API int AUDIOSIGNAL_TryReadAccess(AUDIOSIGNAL *signal);
AUDIO_API int AUDIOSIGNAL_ReleaseReadAccess(AUDIOSIGNAL *signal);

/* ---- Reading ---------------------------------------------------------- */

/* Fills count samples of one channel from first; positions outside the
 * signal read as 0.  Returns how many came from the signal, -1 on failure. */
AUDIO_API int64_t AUDIOSIGNAL_GetChannelSamples(AUDIOSIGNAL *signal, int channel, int64_t first,
                                                float *out, int64_t count);
/* Interleaved frames of the channels in mask (ascending) from first, up to
 * count frames and the signal's end.  Returns the frames read. */
AUDIO_API int64_t AUDIOSIGNAL_GetMaskedSamples(AUDIOSIGNAL *signal, uint32_t mask, int64_t first,
                                               float *out, int64_t count);
/* The same taking frame first + k * step for k = 0 .. count-1 (step may be
 * negative), stopping at either end of the signal. */
AUDIO_API int64_t AUDIOSIGNAL_GetMaskedSamplesWithStep(AUDIOSIGNAL *signal, uint32_t mask, int64_t first,
                                                       float *out, int64_t count, int step);

/* A running read position on one channel for exact min/max scans.  A value
 * record owning nothing; the fields after channel are private. */
typedef struct _audio_pointer {
    const AUDIOSIGNAL *signal;
    int64_t position;
    int32_t channel;
    int32_t cache_count;
    uint64_t cache_block;
    int64_t cache_window;
    float cache[256];
} AUDIOPOINTER;

AUDIO_API int     AUDIOSIGNAL_InitAudioPointer(AUDIOSIGNAL *signal, AUDIOPOINTER *pointer,
                                               int64_t start, int channel);
/* Exact extremes of the next count samples; advances the pointer.  Returns
 * the samples covered (fewer at the end; min = max = 0 when none), -1 for
 * a pointer not made for this signal. */
AUDIO_API int64_t AUDIOSIGNAL_GetChannelMinMaxFromAudioPointer(AUDIOSIGNAL *signal, AUDIOPOINTER *pointer,
                                                               int64_t count, float *min, float *max);
/* Exact extremes of count samples from first; 1, or 0 when the range holds
 * no sample.  min or max may be null. */
AUDIO_API int     AUDIOSIGNAL_GetChannelMinMax(AUDIOSIGNAL *signal, int channel, int64_t first, int64_t count,
                                               float *min, float *max);
/* Sum and sum of squares of count samples from first (for DC removal). */
AUDIO_API double  AUDIOSIGNAL_GetChannelSamplesSum(AUDIOSIGNAL *signal, int channel, int64_t first, int64_t count);
AUDIO_API double  AUDIOSIGNAL_GetChannelSamplesSum2(AUDIOSIGNAL *signal, int channel, int64_t first, int64_t count);

/* ---- Statistics ------------------------------------------------------- */

#define AUDIOSIGNAL_STATS_CHANNELS 6

/* What one accumulation covers.  window: length in milliseconds of the
 * windows whose RMS is tracked (0: 50 ms).  active_only: nonzero restricts
 * the statistics to the active channels. */
typedef struct _audio_stats_range {
    int64_t begin;
    int64_t end;
    int32_t window;
    uint8_t active_only;
} AUDIOSIGNAL_STATSRANGE;

typedef struct _audio_channel_stats_acc {
    int64_t count;
    double  sum, sum2;
    float   min, max;
    int64_t min_pos, max_pos;
    int64_t clipped;           /* samples with |x| >= 1 */
    int64_t zero_crossings;    /* sign changes inside each accumulated range */
    int64_t windows;           /* windows counted (a range's last may be short) */
    double  window_sum;        /* sum of window RMS values */
    double  window_min, window_max;
} AUDIOSIGNAL_CHANNELSTATSACC;

typedef struct _audio_stats_acc {
    int32_t numChannels;       /* channels accumulated (<= AUDIOSIGNAL_STATS_CHANNELS) */
    int32_t sampleRate;
    int32_t window;            /* window in frames */
    int32_t reserved;
    AUDIOSIGNAL_CHANNELSTATSACC channel[AUDIOSIGNAL_STATS_CHANNELS];
} AUDIOSIGNAL_STATSACC;

/* Per channel: 17 32-bit words. */
typedef struct _audio_channel_stats {
    float   min, max;
    double  mean;              /* DC offset */
    double  rms;
    float   peak_db;           /* 20 log10 max |x|; -200 for silence */
    float   rms_db;
    float   window_rms_min_db, window_rms_max_db, window_rms_mean_db;
    int64_t clipped;
    int64_t peak_pos;          /* position of the largest |x| */
    int64_t zero_crossings;
} __attribute__((packed, aligned(4))) AUDIOSIGNAL_CHANNELSTATS;

/* The statistics record: 106 32-bit words. */
typedef struct _audio_stats {
    int32_t numChannels;
    int32_t window;            /* window in milliseconds */
    int64_t numSamples;        /* frames accumulated per channel */
    AUDIOSIGNAL_CHANNELSTATS channel[AUDIOSIGNAL_STATS_CHANNELS];
} __attribute__((packed, aligned(4))) AUDIOSIGNAL_STATISTICS;

/* A fresh accumulator for the signal. */
AUDIO_API AUDIOSIGNAL_STATSACC AUDIOSIGNAL_CalculateStatStart(AUDIOSIGNAL *signal);
/* Adds the samples of range to acc (a fresh or earlier accumulator). */
AUDIO_API int AUDIOSIGNAL_CalculateStatsAcc(AUDIOSIGNAL_STATSACC *acc, AUDIOSIGNAL *signal,
                                            const AUDIOSIGNAL_STATSRANGE *range);
/* total += part (same channel layout). */
AUDIO_API int AUDIOSIGNAL_MergeStatsAcc(AUDIOSIGNAL_STATSACC *total, const AUDIOSIGNAL_STATSACC *part);
AUDIO_API int AUDIOSIGNAL_GetStatisticsFromAcc(AUDIOSIGNAL_STATISTICS *out, AUDIOSIGNAL *signal,
                                               const AUDIOSIGNAL_STATSACC *acc);

/* ---- Edits ------------------------------------------------------------ */
/* Edits act on the active channels.  Edits that change the length pad the
 * other channels with silence at their end so that every channel keeps one
 * length; regions move with the edited audio.  A failed edit leaves
 * samples, regions and stamps as they were. */

/* Copies begin..end into result (appending at its end) or into a new
 * signal when result is null.  Returns the result, null on failure. */
AUDIO_API AUDIOSIGNAL *AUDIOSIGNAL_CopyEx(AUDIOSIGNAL *signal, AUDIOSIGNAL *result, int flags,
                                          int64_t begin, int64_t end);
/* CopyEx, then removes the range. */
AUDIO_API AUDIOSIGNAL *AUDIOSIGNAL_CutEx(AUDIOSIGNAL *signal, AUDIOSIGNAL *result, int flags,
                                         int64_t begin, int64_t end);
AUDIO_API int AUDIOSIGNAL_ClearEx(AUDIOSIGNAL *signal, int flags, int64_t begin, int64_t end);
/* Replaces begin..end by the source (an insertion when begin == end).
 * Source channels map to the active channels in order, repeating the source
 * channels when it has fewer.  *length (may be null) gets the frames pasted. */
AUDIO_API int AUDIOSIGNAL_PasteEx(AUDIOSIGNAL *signal, AUDIOSIGNAL *source, int flags,
                                  int64_t begin, int64_t end, int64_t *length);
/* Adds gain * source to the signal from begin.  With end > begin at most
 * end - begin frames are mixed; with begin == end the whole source is mixed
 * and the signal grows when the source passes its end.  *length gets the
 * frames mixed. */
AUDIO_API int AUDIOSIGNAL_MixPasteEx(AUDIOSIGNAL *signal, AUDIOSIGNAL *source, int flags,
                                     int64_t begin, int64_t end, double gain, int64_t *length);
AUDIO_API int AUDIOSIGNAL_SilenceEx(AUDIOSIGNAL *signal, int flags, int64_t begin, int64_t end);
AUDIO_API int AUDIOSIGNAL_ReverseEx(AUDIOSIGNAL *signal, int flags, int64_t begin, int64_t end);
/* Runs begin..end of the active channels through an effect script (see
 * audiofx.h) that keeps the rate and channel count; the result replaces
 * the range.  A bad script fails with nothing changed. */
AUDIO_API int AUDIOSIGNAL_ApplyEffectEx(AUDIOSIGNAL *signal, int flags, int64_t begin, int64_t end,
                                        const char *effect);
/* A new signal: all of the signal through an effect script, which may
 * change rate, channels and bits ("fmtconv[sr=48000,nc=1]"); metadata and
 * regions come along.  Null for a bad script. */
AUDIO_API AUDIOSIGNAL *AUDIOSIGNAL_ApplyTransform(AUDIOSIGNAL *signal, const char *effect);
/* Returns the frames appended (frames, or -1 on failure, also when the
 * signal would grow beyond 2^36 frames). */
AUDIO_API int64_t AUDIOSIGNAL_AppendSilence(AUDIOSIGNAL *signal, int64_t frames);
/* Swaps the two channels of a stereo signal. */
AUDIO_API int AUDIOSIGNAL_SwapChannels(AUDIOSIGNAL *signal);
/* One channel as a mono signal (new, or appended at the end of result). */
AUDIO_API AUDIOSIGNAL *AUDIOSIGNAL_CopyChannelEx(AUDIOSIGNAL *signal, AUDIOSIGNAL *result, int channel);
/* A stereo signal of the first channels of left and right (same rate; the
 * shorter is padded with silence), new or appended at the end of result. */
AUDIO_API AUDIOSIGNAL *AUDIOSIGNAL_CombineToStereoEx(AUDIOSIGNAL *left, AUDIOSIGNAL *right, AUDIOSIGNAL *result);

/* ---- Saved states and block lists ------------------------------------- */

/* What SaveState keeps: each channel's block list.  A caller-owned value
 * record; the state holds its lists until RestoreState or ClearState. */
typedef struct _audio_signal_state {
    int32_t numChannels;       /* channels saved; 0 for an empty state */
    int32_t sampleRate;
    int64_t numSamples;
    AUDIOBLOCKSLIST *blocksList[AUDIOSIGNAL_MAX_CHANNELS];
} AUDIOSIGNAL_STATE;

AUDIO_API int AUDIOSIGNAL_SaveState(AUDIOSIGNAL *signal, AUDIOSIGNAL_STATE *state);
/* Makes the saved samples the signal's samples again (moving the change
 * stamp) and empties the state.  The state must come from a signal with the
 * same channel count.  SaveState overwrites the record: clear a used one first. */
AUDIO_API int AUDIOSIGNAL_RestoreState(AUDIOSIGNAL *signal, AUDIOSIGNAL_STATE *state);
/* Releases what the state holds and empties it. */
AUDIO_API int AUDIOSIGNAL_ClearState(AUDIOSIGNAL_STATE *state);

/* The current list of a channel: valid while it stays the signal's list or
 * a saved state holds it.  Every edit gives a changed channel a new list. */
AUDIO_API AUDIOBLOCKSLIST *AUDIOSIGNAL_GetChannelBlocksList(AUDIOSIGNAL *signal, int channel);
/* Lists never change once made (every edit gives a changed channel a new
 * list), so Desactive has nothing to freeze.  Lists are freed when neither
 * a signal uses them nor a saved state holds them (AUDIOSIGNAL_ClearState),
 * so Destroy frees nothing a signal or state still needs.  Both answer 1
 * for a list, 0 for null. */
AUDIO_API int     AUDIOBLOCKSLIST_Desactive(AUDIOBLOCKSLIST *list);
AUDIO_API int     AUDIOBLOCKSLIST_Destroy(AUDIOBLOCKSLIST *list);
/* The list's share of sample memory (see AUDIOSIGNAL_SizeInMemory). */
AUDIO_API int64_t AUDIOBLOCKSLIST_SizeInMemory(const AUDIOBLOCKSLIST *list);
AUDIO_API int64_t AUDIOBLOCKSLIST_NumSamples(const AUDIOBLOCKSLIST *list);

/* ---- Recording pipes -------------------------------------------------- */

/* Frames appended to a pipe are inserted into the signal at position (then
 * after them), visible to readers at once. */
AUDIO_API AUDIOSIGNAL_PIPE *AUDIOSIGNAL_CreatePipe(AUDIOSIGNAL *signal, int64_t position);
/* interleaved: frames of the signal's channel count.  Returns frames
 * appended, -1 on failure. */
AUDIO_API int64_t AUDIOSIGNAL_AppendToPipe(AUDIOSIGNAL_PIPE *pipe, const float *interleaved, int64_t frames);
AUDIO_API int     AUDIOSIGNAL_ClosePipe(AUDIOSIGNAL_PIPE *pipe);

#ifdef __cplusplus
}
#endif

#endif /* AUDIOSIGNAL_H */
