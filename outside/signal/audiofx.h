/*
 * Audio signal library: effect paths.
 *
 * An effect path runs interleaved 32-bit float frames through a chain of
 * stages written as a script: stages "name[key=value,...]" joined by ":",
 * for example "fmtconv[sr=48000,nc=1]:quantizer[type=PCM16]".  Stage and key
 * names are compared without regard to case.  Values are numbers, or vectors
 * "[a,b,...]" and matrices "[[a,b],[c,d]]" (row by row).  Where a key takes
 * "one value per channel", a single number or a one-element vector applies to
 * every channel of the stage.
 *
 *   fmtconv[sr=R,nc=N,mixergains=M]
 *       Sample rate R (high-quality streaming resampler) and channel count N;
 *       each may be left out to keep the input's.  M has one row per output
 *       channel and one column per input channel; with M the output channel
 *       count is its row count (nc, when also given, must agree).  Without M,
 *       fewer channels average the inputs that fold onto them (output j takes
 *       the mean of inputs j, j+N, j+2N, ...; mono takes the mean of all) and
 *       more channels repeat the inputs (output j takes input j mod inputs).
 *   quantizer[type=T,dither=D]
 *       Rounds to the grid of the sample type T: "PCM8", "PCM16", "PCM24" or
 *       "PCM32" (full scale -1 .. 1, clipped); D is "tpdf" (triangular dither
 *       of +-1 step, the default) or "none".  Sets the output's bits.
 *   GAIN[offsets=O,gains=G] or GAIN[offsets=O,db=G]
 *       y = (x + O) * 10^(G/20), one value per channel each (both optional).
 *   amplify[db=G] or amplify[factor=F]
 *       Multiplies by 10^(G/20), or by F.
 *   invert
 *       Multiplies by -1.
 *   normalize[peak=P,level=L]
 *       Scales so that a peak magnitude P (which the caller measured over
 *       the audio it will pass; one value per channel) becomes L dBFS
 *       (default 0).  A zero peak leaves the samples unchanged.
 *   fadein[length=N], fadeout[length=N]
 *       Linear fade over the first N frames the stage sees: fade in rises
 *       from 0 (frame i has gain i/N), fade out falls to 0 (frame i has gain
 *       (N-1-i)/N, silence after N).  N defaults to the stream length given
 *       to AUDIOFX_CreatePathEx, converted to the stage's rate.
 *
 * A path keeps its state between calls, so audio may stream through it in
 * blocks of any size; the result is the same as in one call.  A path is used
 * by one thread at a time.  Failures are logged (BLDEBUG_Error) with the name
 * of the exported call.
 */
#ifndef AUDIOFX_H
#define AUDIOFX_H

#include "outside/signal/audioformat.h"

#ifdef __cplusplus
extern "C" {
#endif

typedef struct AUDIOFX AUDIOFX;

/* Largest sample rate and channel count a path accepts; a conversion may
 * change the rate by a factor of AUDIOFX_MAX_RATE_RATIO at the most. */
#define AUDIOFX_MAX_SAMPLE_RATE 1000000
#define AUDIOFX_MAX_CHANNELS    64
#define AUDIOFX_MAX_RATE_RATIO  256

/* Channels whose gains AUDIO_ChangeGainsWidthFade moves. */
#define AUDIO_GAIN_CHANNELS 6

/* Builds a path for input in the given format from a script formatted
 * printf-style.  length: the number of input frames the path will see, -1
 * when unknown (a stream); it is the default fade length.  max_block: the
 * largest input block of one AUDIOFX_ProcessSamples call, -1 when unknown;
 * with it the path sizes its buffers once and does not allocate while it
 * processes blocks up to that size.  Returns null when the format or the
 * script is bad (nothing is created). */
AUDIO_API AUDIOFX *AUDIOFX_CreatePathEx(_audio_format input, int64_t length, int64_t max_block,
                                        const char *script, ...)
    __attribute__((format(printf, 4, 5)));

/* Replaces the path's stages by a new script (same input format and hints).
 * Stages at the front that are written exactly as before keep their state;
 * output waiting in the path is kept when the output format stays the same
 * and dropped otherwise.  Returns 1, or 0 leaving the path as it was. */
AUDIO_API int AUDIOFX_ReconfigurePath(AUDIOFX *path, const char *script, ...)
    __attribute__((format(printf, 2, 3)));

/* Runs frames of input (input format, interleaved) through the path and
 * writes at most room frames (output format) to out.  Output that does not
 * fit is kept and handed out first by the next call.  Returns the frames
 * written, or -1 on bad arguments or when the kept output would exceed
 * 2^23 samples (nothing is consumed then).
 *
 * End of stream: call with in = NULL and frames = 0 to drain what the stages
 * still hold (the resampler's tail); repeat until it returns 0.  After the
 * drain the path starts a new stream. */
AUDIO_API int64_t AUDIOFX_ProcessSamples(AUDIOFX *path, const float *in, int64_t frames,
                                         float *out, int64_t room);

/* The format of the path's output; all zero for a null path. */
AUDIO_API _audio_format AUDIOFX_GetOutputFormat(const AUDIOFX *path);

/* Number of input frames that make the given number of output frames,
 * through every rate change (rounded); -1 for a null path or a negative count. */
AUDIO_API int64_t AUDIOFX_MapOutputToInput(const AUDIOFX *path, int64_t frames);

AUDIO_API int AUDIOFX_DestroyPath(AUDIOFX *path);

/* Multiplies frames of interleaved samples by per-channel gains that move
 * toward their targets by at most step per frame (a smooth fade instead of a
 * click).  target and current hold min(channels, AUDIO_GAIN_CHANNELS) values;
 * current is updated; channels beyond AUDIO_GAIN_CHANNELS are left as they
 * are.  Returns 1, or 0 on bad arguments (a negative step included). */
AUDIO_API int AUDIO_ChangeGainsWidthFade(float *samples, int64_t frames, const double *target,
                                         double *current, double step, int channels);

#ifdef __cplusplus
}
#endif

#endif /* AUDIOFX_H */
