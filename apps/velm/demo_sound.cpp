// The built-in demo sound, synthesised so that the tool needs no file.
#include <cmath>
#include <cstdio>
#include <vector>

#include "apps/velm/tool.hpp"
#include "core/velmqueries.h"

namespace {

constexpr int kRate = 44100;
constexpr int kSeconds = 4;

// A-minor chord with a slow swell and fade on both channels, and a short
// click every half second on the right channel only.
std::vector<float> synthesise()
{
    const double notes[] = {220.0, 261.63, 329.63};
    const int64_t frames = int64_t{kRate} * kSeconds;
    std::vector<float> out(static_cast<size_t>(frames * 2));
    for (int64_t i = 0; i < frames; ++i) {
        const double t = static_cast<double>(i) / kRate;
        const double envelope = std::sin(M_PI * t / kSeconds);
        double chord = 0.0;
        for (double f : notes) chord += std::sin(2.0 * M_PI * f * t);
        const double left = 0.25 * envelope * chord;
        const int64_t in_click = i % (kRate / 2);
        const double click = in_click < 200 ? 0.6 * std::exp(-in_click / 40.0) * std::sin(2.0 * M_PI * 2000.0 * t) : 0.0;
        out[static_cast<size_t>(2 * i)] = static_cast<float>(left);
        out[static_cast<size_t>(2 * i + 1)] = static_cast<float>(0.8 * left + click);
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
    VELMAUDIO_SetTitle(doc, "Demo chord");
    return doc;
}

VELMAUDIO open_input(const char *file)
{
    if (!file) {
        VELMAUDIO doc = open_demo_sound();
        if (!doc) std::fprintf(stderr, "velm: could not make the demo sound\n");
        return doc;
    }
    VELMAUDIO doc = VELMAUDIO_Open(file, "AUTO");
    if (!doc) std::fprintf(stderr, "velm: cannot open '%s' (error %d)\n", file, VELMAUDIO_GetLastError());
    return doc;
}

} // namespace velmtool
