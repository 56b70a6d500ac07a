// Recording pipes: frames inserted at a moving position as they arrive.
#include <algorithm>
#include <vector>

#include "outside/signal/store/signal_internal.hpp"

using namespace velmsig;

// The frames since the last full chunk stay in the pipe: each append makes
// one new chunk of them, so the signal holds full chunks plus one short one.
struct _audio_signal_pipe {
    _audio_signal *signal;
    int64_t position;                       // where the next frame goes
    std::vector<std::vector<float>> open;   // per channel: frames of the short chunk
    std::vector<SegmentsPtr> installed;     // the sequences of the last append
};

extern "C" {

AUDIOSIGNAL_PIPE *AUDIOSIGNAL_CreatePipe(AUDIOSIGNAL *signal, int64_t position)
{
    if (!signal) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return nullptr;
    }
    auto *pipe = new _audio_signal_pipe;
    pipe->signal = signal;
    pipe->position = std::clamp<int64_t>(position, 0, signal_length(*signal));
    pipe->open.resize(size_t(signal->format.numChannels));
    return pipe;
}

int64_t AUDIOSIGNAL_AppendToPipe(AUDIOSIGNAL_PIPE *pipe, const float *interleaved, int64_t frames)
{
    if (!pipe || !interleaved || frames < 0) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return -1;
    }
    if (frames == 0) return 0;
    _audio_signal &signal = *pipe->signal;
    std::unique_lock<std::shared_mutex> writer(signal.access);
    const std::vector<SegmentsPtr> current = all_segments(signal);
    const size_t channels = current.size();
    // Edits made while recording may have shortened the signal.
    const int64_t length = current[0]->length();
    pipe->position = std::min(pipe->position, length);
    // After another change the short chunk may have moved or been edited:
    // rewriting it would undo that change, so it stays as it is.
    if (current != pipe->installed) {
        for (std::vector<float> &open : pipe->open) open.clear();
    }
    const int64_t open_frames = std::min<int64_t>(int64_t(pipe->open[0].size()), pipe->position);

    std::vector<SegmentsPtr> next(channels);
    for (size_t c = 0; c < channels; ++c) {
        std::vector<float> &open = pipe->open[c];
        open.erase(open.begin(), open.end() - open_frames);
        for (int64_t i = 0; i < frames; ++i) open.push_back(interleaved[size_t(i) * channels + c]);
        SegmentsBuilder builder;
        builder.append_range(*current[c], 0, pipe->position - open_frames);
        builder.append_samples(open.data(), int64_t(open.size()));
        builder.append_range(*current[c], pipe->position, length);
        next[c] = builder.build();
        // Full chunks are done; the rest stays open for the next append.
        open.erase(open.begin(), open.end() - int64_t(open.size()) % kChunkFrames);
    }
    install_segments(signal, next);
    pipe->installed = std::move(next);
    if (signal.regions) signal.regions->on_insert(pipe->position, frames);
    pipe->position += frames;
    return frames;
}

int AUDIOSIGNAL_ClosePipe(AUDIOSIGNAL_PIPE *pipe)
{
    if (!pipe) return 0;
    delete pipe;
    return 1;
}

}  // extern "C"
