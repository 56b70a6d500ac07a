/*
 * Audio signal library: DSP routines for spectral displays and curves.
 *
 * Analysis windows, pre-emphasis weights, power spectra through FFT
 * processors, decibel conversion, the mel scale, natural cubic splines and
 * float vector extremes.
 *
 * An FFT length N is a power of two from 2 to DSPB_MAX_FFT_LENGTH; a power
 * spectrum of length N has N/2 + 1 bins.  Calls that take N refuse any other
 * value (failure value and a log message).  Every call checks its arguments
 * and answers with its failure value (0, null) instead of crashing.
 */
#ifndef DSPB_H
#define DSPB_H

#include <stdint.h>

#if defined(AUDIO_BUILDING_LIBRARY)
#define DSPB_API __attribute__((visibility("default")))
#else
#define DSPB_API
#endif

#ifdef __cplusplus
extern "C" {
#endif

#define DSPB_MAX_FFT_LENGTH (1 << 20)
#define DSPB_MAX_WINDOW_LENGTH DSPB_MAX_FFT_LENGTH

/* ---- Start-up --------------------------------------------------------- */

/* Nested start-ups are counted.  When the setting "dspb.fftw.prepare_plans"
 * is 1, the first start-up prepares the FFT plans of the common lengths
 * (256 to 8192); otherwise plans are made on first use of a length. */
DSPB_API int  DSPB_Initialize(void);
/* The last finalize releases the prepared plans (processors still alive
 * keep theirs until destroyed). */
DSPB_API void DSPB_Finalize(void);

/* ---- Windows ---------------------------------------------------------- */

/* Window kinds; 2 is not a window. */
#define DSPB_WINDOW_RECTANGULAR      0
#define DSPB_WINDOW_TRIANGULAR       1
#define DSPB_WINDOW_HANNING          3
#define DSPB_WINDOW_HAMMING          4
#define DSPB_WINDOW_BLACKMAN         5
#define DSPB_WINDOW_BLACKMAN_HARRIS  6 /* four terms, sidelobes at -92 dB */
#define DSPB_WINDOW_BLACKMAN_NUTTALL 7 /* four terms, sidelobes at -98 dB */

/* Fills window[0 .. length-1] with the periodic (spectral analysis) form of
 * the window; a window of length 1 is 1.  Returns 1, or 0 for an unknown
 * kind, a null buffer or a length outside 1 .. DSPB_MAX_WINDOW_LENGTH. */
DSPB_API int    DSPB_CreateWindow(int kind, float *window, int length);
/* buffer[i] *= window[i] for i < length.  Returns 1, or 0 on bad arguments. */
DSPB_API int    DSPB_ApplyWindow(const float *window, float *buffer, int length);
/* The window's amplitude normalisation: the sum of its values (a sine of
 * amplitude A centred on a bin has |X| = A/2 times this sum).  0 on bad
 * arguments. */
DSPB_API double DSPB_GetWindowNormFactor(const float *window, int length);

/* ---- Power spectra ---------------------------------------------------- */

typedef struct _DSPB_FFTPROC DSPB_FFTPROC;

/* A processor for one FFT length; null for a refused length.  One processor
 * may be used from several threads at once (a call that finds the
 * processor's buffers busy works in buffers of its own); one processor per
 * thread avoids that cost.  Destroy it once no thread uses it any more. */
DSPB_API DSPB_FFTPROC *DSPB_FFTProcCreate(int fftLength);
DSPB_API void          DSPB_FFTProcDestroy(DSPB_FFTPROC *proc);
/* Power spectrum of in[0 .. N-1] (left untouched): out[k] = |X[k]|^2 for
 * k = 0 .. N/2, unscaled.  Returns the bin count N/2 + 1, or 0 on bad
 * arguments or when no memory was left. */
DSPB_API int DSPB_FFTProcExecutePSD(DSPB_FFTPROC *proc, const float *in, float *out);

/* Per-bin power weights of the pre-emphasis filter y[n] = x[n] - c x[n-1]
 * for an FFT of length N: weights[k] = 1 - 2c cos(2 pi k / N) + c^2 for
 * k = 0 .. N-1 (so the first N/2 + 1 are those of the spectrum bins).
 * Coefficient 0 gives all ones.  Returns 1, or 0 on bad arguments. */
DSPB_API int DSPB_CreatePreEmphAdjust(float *weights, int fftLength, double coefficient);

/* Converts the N/2 + 1 bins of a power spectrum of length N to decibels
 * relative to full scale: a sine of amplitude 1 centred on a bin, analysed
 * through a window whose norm factor is `norm`, reads 0 dB (so does a
 * constant 1 in bin 0).  Each power is first multiplied by weights[k]
 * when weights is not null.  Results are clamped to -range .. 0 (silence,
 * NaN and negative powers read -range) and are within 1e-4 dB of
 * 10 log10.  in and out may be the same array but must not otherwise
 * overlap.  Returns the bin count, or 0 on bad arguments (norm and range
 * must be finite and above 0). */
DSPB_API int DSPB_PSDtoDB(int fftLength, const float *in, float *out, const float *weights,
                          double norm, double range);

/* ---- Mel scale -------------------------------------------------------- */

/* mel = 2595 log10(1 + f / 700), and its inverse; negative values mirror
 * positive ones, so no frequency gives NaN. */
DSPB_API double DSPBUTIL_Freq2Mels(double frequency);
DSPB_API double DSPBUTIL_Mels2Freq(double mels);

/* ---- Cubic splines ---------------------------------------------------- */

/* Fits a cubic spline through the n points (xs[i], ys[i]), xs strictly
 * increasing, and writes the second derivative at every point to d2[0 ..
 * n-1].  d2First and d2Last are the second derivatives imposed at the two
 * ends: 0 and 0 give the natural spline.  Returns 1, or 0 for null arrays,
 * n < 1, non-finite values or xs not strictly increasing. */
DSPB_API int   DSPBSPLINE_Estimate(const float *xs, const float *ys, int64_t n,
                                   double d2First, double d2Last, float *d2);
/* The spline's value at x, with the second derivatives of
 * DSPBSPLINE_Estimate.  Beyond the first and last points the curve goes on
 * as a straight line with the end slope.  0 on bad arguments. */
DSPB_API float DSPBSPLINE_Interpolate(const float *xs, const float *ys, const float *d2,
                                      int64_t n, double x);

/* ---- Vectors ---------------------------------------------------------- */

/* Smallest and largest of values[0 .. n-1], NaNs ignored; 0 for a null
 * vector, n < 1 or only NaNs. */
DSPB_API float FVectorMin(const float *values, int64_t n);
DSPB_API float FVectorMax(const float *values, int64_t n);

#ifdef __cplusplus
}
#endif

#endif /* DSPB_H */
