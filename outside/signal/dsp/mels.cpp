// The mel scale in its common form, mel = 2595 log10(1 + f / 700).
#include "outside/signal/dspb.h"

#include <cmath>

extern "C" {

double DSPBUTIL_Freq2Mels(double frequency)
{
    const double mels = 2595.0 * std::log10(1.0 + std::fabs(frequency) / 700.0);
    return std::copysign(mels, frequency);
}

double DSPBUTIL_Mels2Freq(double mels)
{
    const double frequency = 700.0 * (std::pow(10.0, std::fabs(mels) / 2595.0) - 1.0);
    return std::copysign(frequency, mels);
}

}  // extern "C"
