// Linear fade in and fade out over the first frames of a stream.
#include "outside/signal/fx/fx_stage.hpp"

#include <algorithm>

namespace velmsig::fx {
namespace {

class FadeStage final : public FrameStage {
public:
    FadeStage(const _audio_format &input, int64_t length, bool rising)
        : FrameStage(input), length_(length), rising_(rising)
    {
    }

private:
    // Fade in: i / N.  Fade out: its mirror (N - 1 - i) / N, ending on silence.
    double gain(int64_t frame) const
    {
        if (frame >= length_)
            return rising_ ? 1.0 : 0.0;
        const int64_t steps = rising_ ? frame : length_ - 1 - frame;
        return static_cast<double>(steps) / static_cast<double>(length_);
    }

    void apply(const float *in, float *out, int64_t frames) override
    {
        const int channels = input_.numChannels;
        for (int64_t f = 0; f < frames; ++f, ++position_) {
            const double g = gain(position_);
            for (int c = 0; c < channels; ++c, ++in, ++out)
                *out = static_cast<float>(*in * g);
        }
    }

    void restart() override { position_ = 0; }

    int64_t length_;
    bool rising_;
    int64_t position_ = 0;
};

std::unique_ptr<Stage> build_fade(StageParams &params, const StageContext &context, bool rising)
{
    auto length = params.integer("length", 1, INT64_MAX);
    if (!length) {
        if (context.length <= 0)
            params.fail("length", "needed (in frames) when the stream length is unknown");
        length = context.length;
    }
    return std::make_unique<FadeStage>(context.input, *length, rising);
}

}  // namespace

std::unique_ptr<Stage> build_fadein(StageParams &params, const StageContext &context)
{
    return build_fade(params, context, true);
}

std::unique_ptr<Stage> build_fadeout(StageParams &params, const StageContext &context)
{
    return build_fade(params, context, false);
}

}  // namespace velmsig::fx
