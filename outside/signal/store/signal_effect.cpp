// Effect scripts run over a range of a signal, or over all of it into a new one.
#include <algorithm>
#include <vector>

#include "outside/signal/audiofx.h"
#include "outside/signal/store/signal_internal.hpp"

using namespace velmsig;

namespace {

struct PathDeleter {
    void operator()(AUDIOFX *path) const { AUDIOFX_DestroyPath(path); }
};
using Path = std::unique_ptr<AUDIOFX, PathDeleter>;

// Collects interleaved output into one new sequence per channel, in full chunks.
class ChannelSinks {
public:
    explicit ChannelSinks(size_t channels) : pending_(channels), builders_(channels) {}

    void add(const float *interleaved, int64_t frames)
    {
        const size_t width = pending_.size();
        for (size_t c = 0; c < width; ++c) {
            std::vector<float> &pending = pending_[c];
            for (int64_t i = 0; i < frames; ++i) pending.push_back(interleaved[size_t(i) * width + c]);
            const int64_t full = int64_t(pending.size()) / kChunkFrames * kChunkFrames;
            builders_[c].append_samples(pending.data(), full);
            pending.erase(pending.begin(), pending.begin() + full);
        }
    }
    std::vector<SegmentsPtr> finish()
    {
        std::vector<SegmentsPtr> result;
        for (size_t c = 0; c < pending_.size(); ++c) {
            builders_[c].append_samples(pending_[c].data(), int64_t(pending_[c].size()));
            result.push_back(builders_[c].build());
        }
        return result;
    }

private:
    std::vector<std::vector<float>> pending_;
    std::vector<SegmentsBuilder> builders_;
};

// Runs [begin, end) of the chosen channels through the path, then drains it.
bool run_path(AUDIOFX *path, int input_rate, const std::vector<SegmentsPtr> &input, int64_t begin, int64_t end,
              ChannelSinks &sinks)
{
    const size_t width = input.size();
    const AUDIO_FORMAT output = AUDIOFX_GetOutputFormat(path);
    // Room for one piece at the path's rate ratio; what does not fit waits
    // in the path for the next call.
    const int64_t ratio = (int64_t(output.sampleRate) + input_rate - 1) / input_rate;
    const int64_t room = kChunkFrames * ratio + 4096;
    std::vector<float> samples(static_cast<size_t>(kChunkFrames));
    std::vector<float> frames(size_t(kChunkFrames) * width);
    std::vector<float> out(size_t(room) * size_t(output.numChannels));
    for (int64_t at = begin;; at += kChunkFrames) {
        const int64_t n = std::min(kChunkFrames, end - at);
        for (size_t c = 0; c < width && n > 0; ++c) {
            if (!input[c]->read(at, n, samples.data())) return false;
            for (int64_t i = 0; i < n; ++i) frames[size_t(i) * width + c] = samples[size_t(i)];
        }
        // Past the end: drain what the stages still hold.
        const int64_t made = n > 0 ? AUDIOFX_ProcessSamples(path, frames.data(), n, out.data(), room)
                                   : AUDIOFX_ProcessSamples(path, nullptr, 0, out.data(), room);
        if (made < 0) return false;
        sinks.add(out.data(), made);
        if (n <= 0 && made == 0) return true;
    }
}

}  // namespace

extern "C" {

int AUDIOSIGNAL_ApplyEffectEx(AUDIOSIGNAL *signal, int flags, int64_t begin, int64_t end, const char *effect)
{
    if (!signal || !effect) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return 0;
    }
    std::unique_lock<std::shared_mutex> writer(signal->access);
    const std::vector<SegmentsPtr> current = all_segments(*signal);
    const uint32_t mask = AUDIOSIGNAL_GetActiveChannelMask(signal);
    std::vector<SegmentsPtr> active;
    for (size_t c = 0; c < current.size(); ++c) {
        if (mask >> c & 1u) active.push_back(current[c]);
    }
    AUDIO_FORMAT input;
    AUDIOSIGNAL_GetFormat(signal, &input);
    input.numChannels = int16_t(active.size());
    clamp_range(current[0]->length(), begin, end);
    if (active.empty() || begin == end) return active.empty() ? 0 : 1;

    Path path(AUDIOFX_CreatePathEx(input, end - begin, kChunkFrames, "%s", effect));
    if (!path) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return 0;
    }
    // The result replaces the range in place: same rate and channels only.
    const AUDIO_FORMAT output = AUDIOFX_GetOutputFormat(path.get());
    if (output.sampleRate != input.sampleRate || output.numChannels != input.numChannels) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return 0;
    }
    ChannelSinks sinks(active.size());
    if (!run_path(path.get(), input.sampleRate, active, begin, end, sinks)) {
        set_last_error(AUDIO_ERROR_READ);
        return 0;
    }
    const std::vector<SegmentsPtr> made = sinks.finish();
    std::vector<SegmentsPtr> next(current.size());
    int64_t longest = 0;
    for (size_t c = 0, i = 0; c < current.size(); ++c) {
        if (!(mask >> c & 1u)) continue;
        SegmentsBuilder builder;
        builder.append_range(*current[c], 0, begin);
        builder.append_range(*made[i], 0, made[i]->length());
        builder.append_range(*current[c], end, current[c]->length());
        next[c] = builder.build();
        longest = std::max(longest, next[c]->length());
        ++i;
    }
    // A path that gave fewer or more frames than it took: keep one length.
    for (size_t c = 0; c < current.size(); ++c) {
        const Segments &now = next[c] ? *next[c] : *current[c];
        if (now.length() == longest) continue;
        SegmentsBuilder builder;
        builder.append_range(now, 0, longest);
        builder.append_silence(longest - now.length());
        next[c] = builder.build();
    }
    install_segments(*signal, next);
    return 1;
}

AUDIOSIGNAL *AUDIOSIGNAL_ApplyTransform(AUDIOSIGNAL *signal, const char *effect)
{
    if (!signal || !effect) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return nullptr;
    }
    std::shared_lock<std::shared_mutex> reader(signal->access);
    const std::vector<SegmentsPtr> current = all_segments(*signal);
    AUDIO_FORMAT input;
    AUDIOSIGNAL_GetFormat(signal, &input);
    const int64_t length = current[0]->length();
    Path path(AUDIOFX_CreatePathEx(input, length, kChunkFrames, "%s", effect));
    if (!path) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return nullptr;
    }
    const AUDIO_FORMAT output = AUDIOFX_GetOutputFormat(path.get());
    if (!valid_format(&output)) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return nullptr;
    }
    ChannelSinks sinks(size_t(output.numChannels));
    if (!run_path(path.get(), input.sampleRate, current, 0, length, sinks)) {
        set_last_error(AUDIO_ERROR_READ);
        return nullptr;
    }
    _audio_signal *result = create_signal(output);
    install_segments(*result, sinks.finish());
    result->metadata = signal->metadata ? AUDIOMETADATA_Duplicate(signal->metadata) : nullptr;
    if (signal->regions) signal_regions(result)->copy_from(*signal->regions);
    return result;
}

}  // extern "C"
