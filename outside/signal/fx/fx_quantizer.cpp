// Rounding to a PCM grid with triangular (TPDF) dither.
#include "outside/signal/fx/fx_stage.hpp"

#include <cmath>
#include <string_view>

namespace velmsig::fx {
namespace {

// Small fast generator (xorshift64*); the dither needs no more.
class Noise {
public:
    // Uniform in [0, 1).
    double next()
    {
        state_ ^= state_ >> 12;
        state_ ^= state_ << 25;
        state_ ^= state_ >> 27;
        return static_cast<double>((state_ * 0x2545F4914F6CDD1DULL) >> 11) * 0x1.0p-53;
    }

private:
    uint64_t state_ = 0x9E3779B97F4A7C15ULL;
};

class QuantizerStage final : public FrameStage {
public:
    QuantizerStage(const _audio_format &input, int bits, bool dither)
        : FrameStage(input), scale_(std::ldexp(1.0, bits - 1)), dither_(dither)
    {
        output_.bitsPerSample = static_cast<int16_t>(bits);
    }

private:
    void apply(const float *in, float *out, int64_t frames) override
    {
        const int64_t count = frames * input_.numChannels;
        const double low = -scale_, high = scale_ - 1;
        for (int64_t i = 0; i < count; ++i) {
            // The difference of two uniform values is triangular over +-1 step.
            const double d = dither_ ? noise_.next() - noise_.next() : 0.0;
            double level = std::floor(in[i] * scale_ + d + 0.5);
            level = level < low ? low : (level > high ? high : level);
            out[i] = static_cast<float>(level / scale_);
        }
    }

    double scale_;  // steps per unit of full scale
    bool dither_;
    Noise noise_;
};

}  // namespace

std::unique_ptr<Stage> build_quantizer(StageParams &params, const StageContext &context)
{
    static constexpr struct {
        std::string_view name;
        int bits;
    } types[] = {{"pcm8", 8}, {"pcm16", 16}, {"pcm24", 24}, {"pcm32", 32}};
    auto type = params.word("type");
    if (!type)
        params.fail("type", "needed (PCM8, PCM16, PCM24 or PCM32)");
    int bits = 0;
    for (const auto &t : types)
        if (t.name == *type)
            bits = t.bits;
    if (bits == 0)
        params.fail("type", "is not PCM8, PCM16, PCM24 or PCM32");
    const std::string dither = params.word("dither").value_or("tpdf");
    if (dither != "tpdf" && dither != "none")
        params.fail("dither", "is not tpdf or none");
    return std::make_unique<QuantizerStage>(context.input, bits, dither == "tpdf");
}

}  // namespace velmsig::fx
