// The built-in demo sound, synthesised so that the tool needs no file.
#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <vector>

#include "apps/velm/progress.hpp"
#include "apps/velm/tool.hpp"
#include "core/velmqueries.h"

namespace {

constexpr int kRate = 44100;
constexpr int kSeconds = 4;

// A two-pole resonator: the formant filter of the voice-like sweeps.
class Resonator {
public:
    float run(float x, double hz, double bandwidth)
    {
        const double r = std::exp(-M_PI * bandwidth / kRate);
        const double y = (1.0 - r) * x + 2.0 * r * std::cos(2.0 * M_PI * hz / kRate) * y1_ - r * r * y2_;
        y2_ = y1_;
        y1_ = y;
        return static_cast<float>(y);
    }

private:
    double y1_ = 0.0, y2_ = 0.0;
};

// A voice-like sweep: a pulse train at a gliding pitch through two formants
// that move from an "oo" towards an "ee" (or back when reversed).
class Voice {
public:
    Voice(double pitch, bool reversed) : pitch_(pitch), reversed_(reversed) {}
    float next(double progress)
    {
        const double p = reversed_ ? 1.0 - progress : progress;
        const double step = (pitch_ * (1.0 + 0.15 * std::sin(M_PI * progress))) / kRate;
        phase_ += step;
        // A pulse train without DC: the formants then carry none either.
        const float pulse = static_cast<float>((phase_ >= 1.0 ? (phase_ -= 1.0, 1.0) : 0.0) - step);
        const float f1 = first_.run(pulse, 300.0 + 500.0 * p, 80.0);
        const float f2 = second_.run(pulse, 900.0 + 1300.0 * p, 120.0);
        return 6.0f * f1 + 4.0f * f2;
    }

private:
    double pitch_, phase_ = 0.0;
    bool reversed_;
    Resonator first_, second_;
};

// Four seconds in stereo: a voice-like sweep, two tones, a burst of noise
// and the sweep again backwards, each with a soft start and end.
std::vector<float> synthesise()
{
    const int64_t frames = int64_t{kRate} * kSeconds;
    std::vector<float> out(static_cast<size_t>(frames * 2));
    Voice left(118.0, false), right(124.0, false), left_back(118.0, true), right_back(124.0, true);
    uint32_t noise = 0x2545F491u;
    for (int64_t i = 0; i < frames; ++i) {
        const double t = static_cast<double>(i) / kRate;
        double l = 0.0, r = 0.0;
        auto envelope = [t](double from, double to) {
            if (t < from || t >= to) return 0.0;
            return std::sin(M_PI * (t - from) / (to - from));
        };
        if (t < 1.5) {
            const double e = envelope(0.0, 1.5);
            l = e * left.next(t / 1.5);
            r = e * right.next(t / 1.5);
        } else if (t < 2.5) {
            const double e = 0.4 * envelope(1.5, 2.5);
            l = e * std::sin(2.0 * M_PI * 440.0 * t);
            r = e * std::sin(2.0 * M_PI * 660.0 * t);
        } else if (t < 3.0) {
            noise = noise * 1664525u + 1013904223u;
            const double white = static_cast<double>(noise >> 8) / 8388608.0 - 1.0;
            const double e = 0.5 * std::exp(-(t - 2.5) * 12.0);
            l = e * white;
            r = 0.7 * e * white;
        } else {
            const double e = envelope(3.0, 4.0);
            l = e * left_back.next((t - 3.0));
            r = e * right_back.next((t - 3.0));
        }
        out[static_cast<size_t>(2 * i)] = static_cast<float>(std::clamp(l, -1.0, 1.0));
        out[static_cast<size_t>(2 * i + 1)] = static_cast<float>(std::clamp(r, -1.0, 1.0));
    }
    return out;
}

} // namespace

namespace velmtool {

VELMAUDIO open_demo_sound()
{
    const _audio_format format = AUDIO_InitFormat(kRate, 2, 16);
    AUDIOSIGNAL *signal = AUDIOSIGNAL_New(&format);
    if (!signal) return nullptr;
    const std::vector<float> samples = synthesise();
    AUDIOSIGNAL_PIPE *pipe = AUDIOSIGNAL_CreatePipe(signal, 0);
    const int64_t frames = static_cast<int64_t>(samples.size() / 2);
    const bool filled = pipe && AUDIOSIGNAL_AppendToPipe(pipe, samples.data(), frames) == frames;
    if (pipe) AUDIOSIGNAL_ClosePipe(pipe);
    if (!filled) {
        AUDIOSIGNAL_Destroy(signal);
        return nullptr;
    }
    VELMAUDIO doc = VELMAUDIO_NewFromSignal(signal, 0);
    if (!doc) {
        AUDIOSIGNAL_Destroy(signal);
        return nullptr;
    }
    VELMAUDIO_SetTitle(doc, "Demo sound");
    return doc;
}

VELMAUDIO open_input(const char *file)
{
    if (!file) {
        VELMAUDIO doc = open_demo_sound();
        if (!doc) std::fprintf(stderr, "velm: could not make the demo sound\n");
        return doc;
    }
    VELMAUDIO doc = with_progress([file] { return VELMAUDIO_Open(file, "AUTO"); });
    if (!doc) std::fprintf(stderr, "velm: cannot open '%s': %s\n", file, why(file, false, AUDIOSIGNAL_GetLastError()).c_str());
    return doc;
}

} // namespace velmtool
