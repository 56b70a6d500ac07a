// Channel mixing and resampling on the way out of a reader.
//
// Channels: fewer output channels average the source channels that fold onto
// them (channel k goes to k mod n), so stereo to mono is (L + R) / 2; more
// output channels repeat the source ones (mono to stereo copies).
#include "outside/signal/file/convert_reader_internal.hpp"

#include <soxr.h>

#include <algorithm>
#include <cmath>
#include <mutex>
#include <vector>

#include "outside/signal/file/lasterror_internal.hpp"

namespace velmsig {

namespace {

constexpr int64_t kChunkFrames = 4096;

void mix_channels(const float *in, int from, float *out, int to, int64_t frames) {
    if (from == to) {
        std::copy(in, in + frames * from, out);
        return;
    }
    for (int64_t f = 0; f < frames; ++f, in += from, out += to) {
        if (to > from) {
            for (int c = 0; c < to; ++c) out[c] = in[c % from];
            continue;
        }
        for (int c = 0; c < to; ++c) {
            float sum = 0;
            int n = 0;
            for (int k = c; k < from; k += to, ++n) sum += in[k];
            out[c] = sum / n;
        }
    }
}

class ConvertReader final : public FileReader {
public:
    ConvertReader(std::unique_ptr<FileReader> source, _audio_format format)
        : source_(std::move(source)), format_(format) {}
    ~ConvertReader() override {
        if (resampler_) soxr_delete(resampler_);
    }

    bool start() {
        if (format_.sampleRate == source_->format().sampleRate) return true;
        soxr_io_spec_t io = soxr_io_spec(SOXR_FLOAT32_I, SOXR_FLOAT32_I);
        soxr_quality_spec_t quality = soxr_quality_spec(SOXR_HQ, 0);
        soxr_error_t error = nullptr;
        resampler_ = soxr_create(source_->format().sampleRate, format_.sampleRate, format_.numChannels, &error, &io,
                                 &quality, nullptr);
        return resampler_ && !error;
    }

    const _audio_format &format() const override { return format_; }
    int64_t frames() const override {
        double ratio = static_cast<double>(format_.sampleRate) / source_->format().sampleRate;
        double frames = static_cast<double>(source_->frames()) * ratio;
        return frames >= 9.2e18 ? INT64_MAX : std::llround(frames);
    }
    // Channel mixing alone keeps every frame where it was.
    bool random_access() const override { return !resampler_ && source_->random_access(); }
    AUDIOMETADATA *metadata() override { return source_->metadata(); }
    const char *format_name() const override { return source_->format_name(); }

    int64_t read(int64_t first, float *out, int64_t count) override {
        if (!out || first < 0 || count < 0) {
            set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
            return -1;
        }
        std::lock_guard lock(mutex_);
        try {
            return resampler_ ? resample(first, out, count) : mix(first, out, count);
        } catch (const std::bad_alloc &) {
            set_last_error(AUDIO_ERROR_OUT_OF_MEMORY);
            return -1;
        }
    }

private:
    // Reads up to `count` source frames at `first`, mixed to our channels.
    int64_t mix(int64_t first, float *out, int64_t count) {
        int from = source_->format().numChannels, to = format_.numChannels;
        int64_t done = 0;
        while (done < count) {
            int64_t n = std::min(kChunkFrames, count - done);
            buffer_.resize(static_cast<size_t>(n * from));
            int64_t got = source_->read(first + done, buffer_.data(), n);
            if (got < 0) return -1;
            mix_channels(buffer_.data(), from, out + done * to, to, got);
            done += got;
            if (got < n) break;
        }
        return done;
    }

    int64_t resample(int64_t first, float *out, int64_t count) {
        int to = format_.numChannels;
        if (first != next_out_) {
            // A jump: restart the filter where the source holds that time.
            soxr_clear(resampler_);
            next_in_ = static_cast<int64_t>(static_cast<double>(first) * source_->format().sampleRate /
                                            format_.sampleRate);
            next_out_ = first;
            pending_.clear();
            at_end_ = false;
        }
        int64_t done = 0;
        while (done < count) {
            if (pending_.empty() && !at_end_) {
                pending_.resize(static_cast<size_t>(kChunkFrames * to));
                int64_t got = mix(next_in_, pending_.data(), kChunkFrames);
                if (got < 0) return -1;
                pending_.resize(static_cast<size_t>(got * to));
                next_in_ += got;
                at_end_ = got == 0;
            }
            size_t used = 0, produced = 0;
            // At the end a null input tells the resampler to flush its tail.
            soxr_error_t error = soxr_process(resampler_, at_end_ ? nullptr : pending_.data(), pending_.size() / to,
                                              &used, out + done * to, static_cast<size_t>(count - done), &produced);
            if (error || (!at_end_ && used == 0 && produced == 0)) {
                set_last_error(AUDIO_ERROR_READ);
                return -1;
            }
            pending_.erase(pending_.begin(), pending_.begin() + static_cast<std::ptrdiff_t>(used * to));
            done += static_cast<int64_t>(produced);
            if (at_end_ && produced == 0) break;
        }
        next_out_ = first + done;
        return done;
    }

    std::unique_ptr<FileReader> source_;
    _audio_format format_;
    soxr_t resampler_ = nullptr;
    std::vector<float> buffer_;   // source frames before mixing
    std::vector<float> pending_;  // mixed frames the resampler has not taken
    int64_t next_in_ = 0, next_out_ = 0;
    bool at_end_ = false;
    std::mutex mutex_;
};

}  // namespace

std::unique_ptr<FileReader> convert_reader(std::unique_ptr<FileReader> source, const FormatConversion &conversion) {
    _audio_format format = source->format();
    if (conversion.sample_rate) format.sampleRate = conversion.sample_rate;
    if (conversion.channels) format.numChannels = static_cast<int16_t>(conversion.channels);
    if (conversion.bits) format.bitsPerSample = static_cast<int16_t>(conversion.bits);
    const _audio_format &old = source->format();
    if (format.sampleRate == old.sampleRate && format.numChannels == old.numChannels &&
        format.bitsPerSample == old.bitsPerSample)
        return source;
    auto reader = std::make_unique<ConvertReader>(std::move(source), format);
    if (!reader->start()) {
        set_last_error(AUDIO_ERROR_OUT_OF_MEMORY);
        return nullptr;
    }
    return reader;
}

}  // namespace velmsig
