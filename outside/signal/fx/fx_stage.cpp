#include "outside/signal/fx/fx_stage.hpp"

#include <string_view>

namespace velmsig::fx {

std::span<const float> FrameStage::process(std::span<const float> in)
{
    if (buffer_.size() < in.size())
        buffer_.resize(in.size());
    apply(in.data(), buffer_.data(), static_cast<int64_t>(in.size()) / input_.numChannels);
    return {buffer_.data(), in.size()};
}

std::span<const float> FrameStage::drain()
{
    restart();
    return {};
}

void FrameStage::reserve(int64_t frames)
{
    buffer_.reserve(static_cast<size_t>(frames) * input_.numChannels);
}

std::unique_ptr<Stage> build_stage(const StageText &text, const StageContext &context)
{
    using Builder = std::unique_ptr<Stage> (*)(StageParams &, const StageContext &);
    static constexpr struct {
        std::string_view name;
        Builder build;
    } builders[] = {
        {"fmtconv", build_fmtconv}, {"quantizer", build_quantizer}, {"gain", build_gain},
        {"amplify", build_amplify}, {"invert", build_invert},       {"normalize", build_normalize},
        {"fadein", build_fadein},   {"fadeout", build_fadeout},
    };
    for (const auto &entry : builders) {
        if (entry.name == text.name) {
            StageParams params(text);
            std::unique_ptr<Stage> stage = entry.build(params, context);
            params.finish();
            return stage;
        }
    }
    throw ScriptError("unknown stage \"" + text.text.substr(0, text.name.size()) + "\"");
}

}  // namespace velmsig::fx
