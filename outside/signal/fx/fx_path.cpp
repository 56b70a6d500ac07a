#include "outside/signal/fx/fx_path.hpp"

#include "outside/signal/audiofx.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <stdexcept>
#include <string>

namespace velmsig::fx {
namespace {

// Input is cut into chunks that make at most about this many samples in any
// stage, so that buffers stay small whatever the caller hands in.
constexpr int64_t kChunkSamples = 1 << 16;
// Output the caller had no room for is kept up to this many samples.
constexpr int64_t kMaxPendingSamples = 1 << 23;
// Frames a resampler may hand out beyond the rate ratio (its delay line).
constexpr int64_t kResamplerSlack = 8192;

int64_t scale_frames(int64_t frames, int to_rate, int from_rate)
{
    const __int128 scaled = (static_cast<__int128>(frames) * to_rate + from_rate / 2) / from_rate;
    return scaled > INT64_MAX ? INT64_MAX : static_cast<int64_t>(scaled);
}

}  // namespace

Path::Path(const _audio_format &input, int64_t length, int64_t max_block, std::string_view script)
    : input_(input), length_(length), max_block_(max_block)
{
    if (input.sampleRate < 1 || input.sampleRate > AUDIOFX_MAX_SAMPLE_RATE || input.numChannels < 1 ||
        input.numChannels > AUDIOFX_MAX_CHANNELS)
        throw ScriptError("bad input format (rate " + std::to_string(input.sampleRate) + ", channels " +
                          std::to_string(input.numChannels) + ")");
    texts_ = split_script(script);
    stages_ = build(texts_, 0, input_);
    reserve_buffers();
}

void Path::reserve_buffers()
{
    if (max_block_ <= 0)
        return;
    const int64_t block = std::min(max_block_, chunk_frames());
    for (const auto &stage : stages_)
        stage->reserve(scale_frames(block, stage->input().sampleRate, input_.sampleRate) + 1);
    pending_.reserve(static_cast<size_t>(estimate_output(block)) * output().numChannels);
}

std::vector<std::unique_ptr<Stage>> Path::build(const std::vector<StageText> &texts, size_t from,
                                                _audio_format format) const
{
    std::vector<std::unique_ptr<Stage>> stages;
    for (size_t i = from; i < texts.size(); ++i) {
        const StageContext context{
            format, length_ > 0 ? scale_frames(length_, format.sampleRate, input_.sampleRate) : -1};
        stages.push_back(build_stage(texts[i], context));
        format = stages.back()->output();
    }
    return stages;
}

void Path::reconfigure(std::string_view script)
{
    std::vector<StageText> texts = split_script(script);
    size_t kept = 0;
    while (kept < texts.size() && kept < texts_.size() && texts[kept].text == texts_[kept].text)
        ++kept;
    std::vector<std::unique_ptr<Stage>> fresh =
        build(texts, kept, kept ? stages_[kept - 1]->output() : input_);

    const _audio_format before = output();
    stages_.resize(kept);
    for (auto &stage : fresh)
        stages_.push_back(std::move(stage));
    texts_ = std::move(texts);
    reserve_buffers();
    const _audio_format &after = output();
    if (before.sampleRate != after.sampleRate || before.numChannels != after.numChannels) {
        pending_.clear();
        pending_start_ = 0;
    }
}

int64_t Path::chunk_frames() const
{
    double growth = input_.numChannels;  // samples per input frame, at the most
    for (const auto &stage : stages_) {
        const _audio_format &f = stage->output();
        growth = std::max(growth, static_cast<double>(f.numChannels) * f.sampleRate / input_.sampleRate);
    }
    return std::max<int64_t>(1, static_cast<int64_t>(kChunkSamples / std::ceil(growth)));
}

int64_t Path::estimate_output(int64_t frames) const
{
    const _audio_format &out = output();
    const int64_t resamplers = std::count_if(stages_.begin(), stages_.end(), [](const auto &s) {
        return s->input().sampleRate != s->output().sampleRate;
    });
    const int64_t slack = 1 + resamplers * kResamplerSlack;
    const int64_t scaled = scale_frames(frames, out.sampleRate, input_.sampleRate);
    return scaled > INT64_MAX - slack ? INT64_MAX : scaled + slack;
}

void Path::run(std::span<const float> samples, size_t first)
{
    for (size_t i = first; i < stages_.size(); ++i)
        samples = stages_[i]->process(samples);
    pending_.insert(pending_.end(), samples.begin(), samples.end());
}

int64_t Path::hand_out(float *out, int64_t room)
{
    const int channels = output().numChannels;
    const int64_t waiting = static_cast<int64_t>(pending_.size() - pending_start_) / channels;
    const int64_t frames = std::min(waiting, room);
    if (frames > 0)
        std::memcpy(out, pending_.data() + pending_start_,
                    static_cast<size_t>(frames) * channels * sizeof(float));
    pending_start_ += static_cast<size_t>(frames) * channels;
    if (pending_start_ == pending_.size()) {
        pending_.clear();
        pending_start_ = 0;
    }
    return frames;
}

int64_t Path::process(const float *in, int64_t frames, float *out, int64_t room)
{
    const int64_t waiting = static_cast<int64_t>(pending_.size() - pending_start_) / output().numChannels;
    const __int128 kept = static_cast<__int128>(waiting) + estimate_output(frames) - room;
    if (in && kept > kMaxPendingSamples / output().numChannels)
        throw std::runtime_error("output kept back for want of room (" + std::to_string(room) +
                                 " frames) would exceed " + std::to_string(kMaxPendingSamples) + " samples");

    int64_t written = hand_out(out, room);
    // Keep what is left at the front so that new output lands behind it.
    if (pending_start_ > 0) {
        pending_.erase(pending_.begin(), pending_.begin() + static_cast<std::ptrdiff_t>(pending_start_));
        pending_start_ = 0;
    }
    if (in) {
        const int64_t chunk = chunk_frames();
        const int channels = input_.numChannels;
        for (int64_t done = 0; done < frames;) {
            const int64_t n = std::min(chunk, frames - done);
            run({in + done * channels, static_cast<size_t>(n * channels)}, 0);
            done += n;
            written += hand_out(out + written * output().numChannels, room - written);
        }
    } else {
        for (size_t i = 0; i < stages_.size(); ++i)
            run(stages_[i]->drain(), i + 1);
        written += hand_out(out + written * output().numChannels, room - written);
    }
    return written;
}

int64_t Path::map_output_to_input(int64_t frames) const
{
    for (auto it = stages_.rbegin(); it != stages_.rend(); ++it)
        frames = scale_frames(frames, (*it)->input().sampleRate, (*it)->output().sampleRate);
    return frames;
}

}  // namespace velmsig::fx
