// One stage of an effect path and the builders that make stages from script text.
#ifndef VELMSIG_FX_STAGE_HPP
#define VELMSIG_FX_STAGE_HPP

#include "outside/signal/audioformat.h"
#include "outside/signal/fx/fx_script.hpp"

#include <cstdint>
#include <memory>
#include <span>
#include <vector>

namespace velmsig::fx {

class Stage {
public:
    explicit Stage(const _audio_format &input) : input_(input), output_(input) {}
    virtual ~Stage() = default;
    Stage(const Stage &) = delete;
    Stage &operator=(const Stage &) = delete;

    const _audio_format &input() const { return input_; }
    const _audio_format &output() const { return output_; }

    // Takes interleaved input samples (whole frames) and returns the output
    // they make, held by the stage until its next call.
    virtual std::span<const float> process(std::span<const float> in) = 0;
    // End of stream: returns what the stage still holds and starts afresh.
    virtual std::span<const float> drain() = 0;
    // Sizes the stage's buffers for input blocks of up to frames frames.
    virtual void reserve(int64_t frames) = 0;

protected:
    _audio_format input_;
    _audio_format output_;
};

// A stage that maps each frame to one frame of the same format.
class FrameStage : public Stage {
public:
    using Stage::Stage;
    std::span<const float> process(std::span<const float> in) final;
    std::span<const float> drain() final;
    void reserve(int64_t frames) final;

protected:
    virtual void apply(const float *in, float *out, int64_t frames) = 0;
    // Called at the end of a stream.
    virtual void restart() {}

private:
    std::vector<float> buffer_;
};

// What a builder knows besides its keys.
struct StageContext {
    _audio_format input;
    int64_t length;  // input frames of the whole stream, -1 when unknown
};

// Builds the stage a text names; throws ScriptError for unknown names and bad keys.
std::unique_ptr<Stage> build_stage(const StageText &text, const StageContext &context);

std::unique_ptr<Stage> build_fmtconv(StageParams &params, const StageContext &context);
std::unique_ptr<Stage> build_quantizer(StageParams &params, const StageContext &context);
std::unique_ptr<Stage> build_gain(StageParams &params, const StageContext &context);
std::unique_ptr<Stage> build_amplify(StageParams &params, const StageContext &context);
std::unique_ptr<Stage> build_invert(StageParams &params, const StageContext &context);
std::unique_ptr<Stage> build_normalize(StageParams &params, const StageContext &context);
std::unique_ptr<Stage> build_fadein(StageParams &params, const StageContext &context);
std::unique_ptr<Stage> build_fadeout(StageParams &params, const StageContext &context);

}  // namespace velmsig::fx

#endif
