// 16-bit integer and float samples.
#include <cmath>

#include "outside/signal/audioformat.h"

extern "C" {

AUDIO_API int AUDIO_Word16ToFloatIEEE(const int16_t *in, float *out, int n) {
    if (!in || !out || n < 0) return 0;
    for (int i = 0; i < n; ++i) out[i] = static_cast<float>(in[i]) * (1.0f / 32768.0f);
    return n;
}

AUDIO_API int AUDIO_IEEEFloatToWord16(const float *in, int16_t *out, int n) {
    if (!in || !out || n < 0) return 0;
    for (int i = 0; i < n; ++i) {
        float v = in[i] * 32768.0f;
        // NaN reads as silence; the rest is clamped, then rounded to nearest.
        v = std::isnan(v) ? 0.0f : v > 32767.0f ? 32767.0f : v < -32768.0f ? -32768.0f : v;
        out[i] = static_cast<int16_t>(std::lrintf(v));
    }
    return n;
}

AUDIO_API int64_t AUDIO_SamplesSize16(const _audio_format *format, int64_t bytes) {
    if (!format || format->numChannels <= 0 || bytes < 0) return -1;
    return bytes / (2 * int64_t{format->numChannels});
}

}  // extern "C"
