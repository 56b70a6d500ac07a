// Stages that scale and shift each channel: GAIN, amplify, invert, normalize.
#include "outside/signal/fx/fx_stage.hpp"

#include <cmath>

namespace velmsig::fx {
namespace {

double db_to_factor(double db)
{
    return std::pow(10.0, db / 20.0);
}

// y = (x + offset) * gain, per channel.
class LinearStage final : public FrameStage {
public:
    LinearStage(const _audio_format &input, std::vector<double> gains, std::vector<double> offsets)
        : FrameStage(input), gains_(std::move(gains)), offsets_(std::move(offsets))
    {
    }

private:
    void apply(const float *in, float *out, int64_t frames) override
    {
        const size_t channels = gains_.size();
        for (int64_t f = 0; f < frames; ++f) {
            for (size_t c = 0; c < channels; ++c, ++in, ++out)
                *out = static_cast<float>((*in + offsets_[c]) * gains_[c]);
        }
    }

    std::vector<double> gains_;
    std::vector<double> offsets_;
};

// Refuses factors that would turn samples into infinities.
std::unique_ptr<Stage> make_linear(StageParams &params, const StageContext &context,
                                   std::vector<double> gains, std::vector<double> offsets = {})
{
    offsets.resize(gains.size(), 0.0);
    for (size_t c = 0; c < gains.size(); ++c)
        if (!std::isfinite(static_cast<float>(gains[c])) || !std::isfinite(static_cast<float>(offsets[c])))
            params.fail("gain", "or offset out of range");
    return std::make_unique<LinearStage>(context.input, std::move(gains), std::move(offsets));
}

std::vector<double> same_for_all(const StageContext &context, double value)
{
    return std::vector<double>(context.input.numChannels, value);
}

}  // namespace

std::unique_ptr<Stage> build_gain(StageParams &params, const StageContext &context)
{
    const int channels = context.input.numChannels;
    auto offsets = params.per_channel("offsets", channels);
    auto gains = params.per_channel("gains", channels);
    if (auto db = params.per_channel("db", channels)) {
        if (gains)
            params.fail("db", "and \"gains\" both given");
        gains = db;
    }
    std::vector<double> factors = same_for_all(context, 1.0);
    if (gains)
        for (int c = 0; c < channels; ++c)
            factors[c] = db_to_factor((*gains)[c]);
    return make_linear(params, context, std::move(factors), offsets.value_or(std::vector<double>{}));
}

std::unique_ptr<Stage> build_amplify(StageParams &params, const StageContext &context)
{
    auto db = params.number("db");
    auto factor = params.number("factor");
    if (db.has_value() == factor.has_value())
        params.fail("db", "or \"factor\" needed (one of them)");
    return make_linear(params, context, same_for_all(context, factor ? *factor : db_to_factor(*db)));
}

std::unique_ptr<Stage> build_invert(StageParams &params, const StageContext &context)
{
    return make_linear(params, context, same_for_all(context, -1.0));
}

std::unique_ptr<Stage> build_normalize(StageParams &params, const StageContext &context)
{
    auto peaks = params.per_channel("peak", context.input.numChannels);
    if (!peaks)
        params.fail("peak", "needed (the peak magnitude of the audio)");
    const double level = db_to_factor(params.number("level").value_or(0.0));
    std::vector<double> factors = *peaks;
    for (double &f : factors) {
        if (f < 0)
            params.fail("peak", "must not be negative");
        f = f > 0 ? level / f : 1.0;
    }
    return make_linear(params, context, std::move(factors));
}

}  // namespace velmsig::fx
