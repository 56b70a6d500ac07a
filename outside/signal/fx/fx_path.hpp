// An effect path: the chain of stages behind an AUDIOFX handle.
#ifndef VELMSIG_FX_PATH_HPP
#define VELMSIG_FX_PATH_HPP

#include "outside/signal/fx/fx_stage.hpp"

#include <memory>
#include <string_view>
#include <vector>

namespace velmsig::fx {

class Path {
public:
    // Throws ScriptError when the format or the script is bad.
    Path(const _audio_format &input, int64_t length, int64_t max_block, std::string_view script);

    // Strong guarantee: on ScriptError the path is unchanged.
    void reconfigure(std::string_view script);

    // in == nullptr with frames == 0 drains.  Throws std::runtime_error when
    // the output kept back would grow too large (nothing consumed then).
    int64_t process(const float *in, int64_t frames, float *out, int64_t room);

    const _audio_format &output() const { return stages_.back()->output(); }
    int64_t map_output_to_input(int64_t frames) const;

private:
    std::vector<std::unique_ptr<Stage>> build(const std::vector<StageText> &texts, size_t from,
                                              _audio_format input) const;
    // Sizes every buffer for blocks of max_block_ frames.
    void reserve_buffers();
    int64_t chunk_frames() const;
    int64_t estimate_output(int64_t frames) const;
    // Runs samples through the stages from first on and keeps the result.
    void run(std::span<const float> samples, size_t first);
    int64_t hand_out(float *out, int64_t room);

    _audio_format input_;
    int64_t length_;
    int64_t max_block_;
    std::vector<StageText> texts_;
    std::vector<std::unique_ptr<Stage>> stages_;
    std::vector<float> pending_;  // output not yet handed out
    size_t pending_start_ = 0;    // samples of pending_ already handed out
};

}  // namespace velmsig::fx

#endif
