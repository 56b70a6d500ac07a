// Per-channel gains that glide toward their targets (the playback volume).
#include "outside/signal/audiofx.h"

#include <algorithm>
#include <cmath>

int AUDIO_ChangeGainsWidthFade(float *samples, int64_t frames, const double *target, double *current,
                               double step, int channels)
{
    if ((!samples && frames > 0) || frames < 0 || !target || !current || channels < 1 || !(step >= 0) ||
        !std::isfinite(step))
        return 0;
    const int faded = std::min(channels, AUDIO_GAIN_CHANNELS);
    for (int64_t f = 0; f < frames; ++f, samples += channels) {
        for (int c = 0; c < faded; ++c) {
            const double delta = std::clamp(target[c] - current[c], -step, step);
            current[c] += delta;
            samples[c] = static_cast<float>(samples[c] * current[c]);
        }
    }
    return 1;
}
