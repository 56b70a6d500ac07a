// Format conversion: channel mixing through a gain matrix and sample-rate
// conversion through a streaming soxr resampler.
#include "outside/signal/fx/fx_stage.hpp"

#include "outside/signal/audiofx.h"

#include <soxr.h>

#include <algorithm>
#include <cmath>
#include <stdexcept>
#include <string>
#include <type_traits>

namespace velmsig::fx {
namespace {

struct SoxrDeleter {
    void operator()(soxr_t s) const { soxr_delete(s); }
};
using Resampler = std::unique_ptr<std::remove_pointer_t<soxr_t>, SoxrDeleter>;

// Output j averages the inputs that fold onto it (j, j + out, ...) when there
// are fewer outputs, and repeats input j mod in when there are more.
Matrix default_mix(int in, int out)
{
    Matrix m{out, in, std::vector<double>(static_cast<size_t>(in) * out, 0.0)};
    for (int j = 0; j < out; ++j) {
        if (out >= in) {
            m.values[static_cast<size_t>(j) * in + j % in] = 1.0;
            continue;
        }
        const int folded = (in - j + out - 1) / out;  // inputs j, j + out, ... below in
        for (int k = j; k < in; k += out)
            m.values[static_cast<size_t>(j) * in + k] = 1.0 / folded;
    }
    return m;
}

bool is_identity(const Matrix &m)
{
    if (m.rows != m.columns)
        return false;
    for (int r = 0; r < m.rows; ++r)
        for (int c = 0; c < m.columns; ++c)
            if (m.values[static_cast<size_t>(r) * m.columns + c] != (r == c ? 1.0 : 0.0))
                return false;
    return true;
}

class FmtconvStage final : public Stage {
public:
    FmtconvStage(const _audio_format &input, int rate, Matrix mix)
        : Stage(input), mix_(std::move(mix)), mixing_(!is_identity(mix_))
    {
        output_.sampleRate = rate;
        output_.numChannels = static_cast<int16_t>(mix_.rows);
        if (rate != input.sampleRate) {
            const unsigned channels = resampled_channels();
            soxr_error_t error = nullptr;
            const soxr_quality_spec_t quality = soxr_quality_spec(SOXR_HQ, 0);
            resampler_.reset(
                soxr_create(input.sampleRate, rate, channels, &error, nullptr, &quality, nullptr));
            if (!resampler_ || error)
                throw ScriptError(std::string("resampler not created: ") + soxr_strerror(error));
        }
    }

    std::span<const float> process(std::span<const float> in) override
    {
        std::span<const float> data = in;
        if (mixing_ && mix_first())
            data = mix(data);
        if (resampler_)
            data = resample(data.data(), static_cast<int64_t>(data.size()) / resampled_channels());
        if (mixing_ && !mix_first())
            data = mix(data);
        return data;
    }

    std::span<const float> drain() override
    {
        if (!resampler_)
            return {};
        std::span<const float> data = resample(nullptr, 0);
        soxr_clear(resampler_.get());
        if (mixing_ && !mix_first())
            data = mix(data);
        return data;
    }

    void reserve(int64_t frames) override
    {
        const double ratio = static_cast<double>(output_.sampleRate) / input_.sampleRate;
        const auto out_frames = static_cast<size_t>(std::ceil(frames * ratio)) + kSlack;
        mixed_.reserve(std::max<size_t>(frames, out_frames) * std::max(mix_.rows, mix_.columns));
        resampled_.reserve(out_frames * resampled_channels());
    }

private:
    static constexpr size_t kSlack = 1024;  // frames the resampler may give beyond the ratio

    // Mixing comes before resampling when that leaves fewer channels to resample.
    bool mix_first() const { return mix_.rows <= mix_.columns; }
    int resampled_channels() const { return std::min(mix_.rows, mix_.columns); }

    std::span<const float> mix(std::span<const float> data)
    {
        std::vector<float> &out = mixed_;
        const int in = mix_.columns, outs = mix_.rows;
        const int64_t frames = static_cast<int64_t>(data.size()) / in;
        out.resize(static_cast<size_t>(frames) * outs);
        const float *src = data.data();
        float *dst = out.data();
        for (int64_t f = 0; f < frames; ++f, src += in) {
            const double *row = mix_.values.data();
            for (int r = 0; r < outs; ++r, row += in) {
                double sum = 0;
                for (int c = 0; c < in; ++c)
                    sum += row[c] * src[c];
                *dst++ = static_cast<float>(sum);
            }
        }
        return out;
    }

    // Streams frames through the resampler (null in: end of input) and
    // returns all it gives back.
    std::span<const float> resample(const float *in, int64_t frames)
    {
        const int channels = resampled_channels();
        const double ratio = static_cast<double>(output_.sampleRate) / input_.sampleRate;
        size_t capacity = static_cast<size_t>(std::ceil(frames * ratio)) + kSlack;
        size_t produced = 0;
        int64_t consumed = 0;
        while (true) {
            if (resampled_.size() < capacity * channels)
                resampled_.resize(capacity * channels);
            size_t idone = 0, odone = 0;
            const size_t room = capacity - produced;
            const soxr_error_t error = soxr_process(resampler_.get(), in ? in + consumed * channels : nullptr,
                                                    static_cast<size_t>(frames - consumed), &idone,
                                                    resampled_.data() + produced * channels, room, &odone);
            if (error)
                throw std::runtime_error(std::string("resampler failed: ") + error);
            consumed += static_cast<int64_t>(idone);
            produced += odone;
            if (consumed == frames && odone < room)
                break;
            capacity += capacity / 2 + kSlack;
        }
        return {resampled_.data(), produced * channels};
    }

    Matrix mix_;  // rows: output channels, columns: input channels
    bool mixing_;
    Resampler resampler_;
    std::vector<float> mixed_;
    std::vector<float> resampled_;
};

}  // namespace

std::unique_ptr<Stage> build_fmtconv(StageParams &params, const StageContext &context)
{
    const _audio_format &in = context.input;
    const int rate =
        static_cast<int>(params.integer("sr", 1, AUDIOFX_MAX_SAMPLE_RATE).value_or(in.sampleRate));
    if (rate > static_cast<int64_t>(in.sampleRate) * AUDIOFX_MAX_RATE_RATIO ||
        in.sampleRate > static_cast<int64_t>(rate) * AUDIOFX_MAX_RATE_RATIO)
        params.fail("sr", "differs from the input rate by more than a factor of " +
                              std::to_string(AUDIOFX_MAX_RATE_RATIO));
    auto channels = params.integer("nc", 1, AUDIOFX_MAX_CHANNELS);
    auto gains = params.matrix("mixergains");
    if (gains) {
        if (gains->columns != in.numChannels || gains->rows > AUDIOFX_MAX_CHANNELS)
            params.fail("mixergains", "is " + std::to_string(gains->rows) + "x" +
                                          std::to_string(gains->columns) + " for " +
                                          std::to_string(in.numChannels) + " input channels");
        for (double g : gains->values)
            if (!std::isfinite(static_cast<float>(g)))
                params.fail("mixergains", "holds a gain out of range");
        if (channels && *channels != gains->rows)
            params.fail("mixergains",
                        "has " + std::to_string(gains->rows) + " rows for nc=" + std::to_string(*channels));
    }
    Matrix mix = gains ? std::move(*gains)
                       : default_mix(in.numChannels, static_cast<int>(channels.value_or(in.numChannels)));
    return std::make_unique<FmtconvStage>(in, rate, std::move(mix));
}

}  // namespace velmsig::fx
