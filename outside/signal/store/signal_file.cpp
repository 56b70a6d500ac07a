// Opening signals from files and saving them, through the file part's
// readers and writers.
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <string>
#include <thread>
#include <vector>

#include "outside/signal/file/audiofile_internal.hpp"
#include "outside/signal/file/progress_internal.hpp"
#include "outside/signal/store/sample_source.hpp"
#include "outside/signal/store/signal_internal.hpp"

using namespace velmsig;

namespace {

// An open file read in place by the chunks that refer to it.
class ReaderSource final : public SampleSource {
public:
    explicit ReaderSource(std::unique_ptr<FileReader> reader) : reader_(std::move(reader)) {}
    int channels() const override { return reader_->format().numChannels; }
    int64_t frames() const override { return reader_->frames(); }
    int64_t read(int64_t first, float *out, int64_t count) override { return reader_->read(first, out, count); }

private:
    std::unique_ptr<FileReader> reader_;
};

// Frames read per step of the scan: a whole number of windows, few enough
// that the converted floats are still in the cache when they are summarised.
constexpr int64_t kScanFrames = 32 * kWindowFrames;

// Reads n frames from at and returns every channel's summaries, one step at
// a time; empty when the read comes up short.
std::vector<std::vector<MinMax>> summarize_piece(SampleSource &source, int64_t at, int64_t n, std::vector<float> &frames)
{
    const int channels = source.channels();
    const size_t windows = size_t((n + kWindowFrames - 1) / kWindowFrames);
    std::vector<std::vector<MinMax>> result(static_cast<size_t>(channels), std::vector<MinMax>(windows));
    MinMax window[AUDIOSIGNAL_MAX_CHANNELS];
    for (int64_t step = 0; step < n; step += kScanFrames) {
        const int64_t count = std::min(kScanFrames, n - step);
        if (source.read(at + step, frames.data(), count) != count) return {};
        for (int64_t begin = 0; begin < count; begin += kWindowFrames) {
            scan_frames(frames.data() + begin * channels, std::min(kWindowFrames, count - begin), channels, window);
            const size_t w = size_t((step + begin) / kWindowFrames);
            for (int c = 0; c < channels; ++c) result[size_t(c)][w] = window[c];
        }
    }
    return result;
}

// PCM read in place: chunks keep only their summaries and read the file
// later.  The pieces are independent, so threads share the scan; the
// calling thread alone reports the progress, counting every thread's pieces.
bool scan_in_place(const std::shared_ptr<SampleSource> &source, std::vector<SegmentsPtr> &result)
{
    const int channels = source->channels();
    const int64_t pieces = (source->frames() + kSourceChunkFrames - 1) / kSourceChunkFrames;
    std::vector<std::vector<ChunkPtr>> chunks(static_cast<size_t>(channels),
                                             std::vector<ChunkPtr>(static_cast<size_t>(pieces)));
    std::atomic<int64_t> next{0};
    std::atomic<int64_t> done{0};
    std::atomic<bool> failed{false};
    ProgressReport progress(pieces);
    auto work = [&](bool reporting) {
        std::vector<float> frames(size_t(kScanFrames) * size_t(channels));
        for (int64_t k = next++; k < pieces && !failed; k = next++) {
            const int64_t at = k * kSourceChunkFrames, n = std::min(kSourceChunkFrames, source->frames() - at);
            std::vector<std::vector<MinMax>> windows = summarize_piece(*source, at, n, frames);
            if (windows.empty()) {
                failed = true;
                return;
            }
            for (int c = 0; c < channels; ++c) {
                chunks[size_t(c)][size_t(k)] = make_source_chunk(source, c, at, n, std::move(windows[size_t(c)]));
            }
            const int64_t pieces_done = ++done;
            if (reporting) progress.advance(pieces_done);
        }
    };
    const unsigned helpers = std::min(3u, std::max(1u, std::thread::hardware_concurrency()) - 1);
    std::vector<std::thread> threads;
    for (unsigned t = 0; t < helpers && int64_t(t + 1) < pieces; ++t) threads.emplace_back(work, false);
    work(true);
    for (std::thread &thread : threads) thread.join();
    if (failed) return false;
    for (int c = 0; c < channels; ++c) {
        SegmentsBuilder builder;
        for (int64_t k = 0; k < pieces; ++k) {
            const ChunkPtr &chunk = chunks[size_t(c)][size_t(k)];
            builder.append({chunk, 0, chunk->frames()});
        }
        result.push_back(builder.build());
    }
    progress.finish();
    return true;
}

// Other codings are decoded once, in order, into the block file; the
// reader's frame count is only a claim, so reading goes on to a short read.
bool scan_decoded(SampleSource &source, std::vector<SegmentsPtr> &result)
{
    const int channels = source.channels();
    std::vector<float> frames(size_t(kChunkFrames) * size_t(channels));
    std::vector<float> samples(static_cast<size_t>(kChunkFrames));
    std::vector<SegmentsBuilder> builders(static_cast<size_t>(channels));
    ProgressReport progress(source.frames());
    for (int64_t at = 0, n = kChunkFrames; n == kChunkFrames; at += n) {
        progress.advance(at);
        n = source.read(at, frames.data(), kChunkFrames);
        if (n < 0) return false;
        for (int c = 0; c < channels; ++c) {
            for (int64_t i = 0; i < n; ++i) samples[size_t(i)] = frames[size_t(i * channels + c)];
            builders[size_t(c)].append_samples(samples.data(), n, Placement::BlockFile);
        }
    }
    for (SegmentsBuilder &builder : builders) result.push_back(builder.build());
    progress.finish();
    return true;
}

// Records the file a signal was opened from or saved to.
void bind_file(_audio_signal &signal, const char *path, std::string format_text)
{
    struct stat info{};
    const bool known = ::stat(path, &info) == 0;
    std::lock_guard<std::mutex> guard(signal.lock);
    signal.file_name = path;
    signal.format_text = std::move(format_text);
    signal.file_size = known ? int64_t(info.st_size) : 0;
    signal.file_time = known ? uint64_t(info.st_mtim.tv_sec) * 1000000000u + uint64_t(info.st_mtim.tv_nsec) : 0;
    signal.read_only = ::access(path, W_OK) != 0;
}

// The format text with "AUTO" replaced by the detected format's name.
std::string resolved_format_text(const char *text, const char *detected)
{
    std::string result = text && *text ? text : "AUTO";
    const size_t at = result.find("AUTO");
    if (at != std::string::npos && detected && *detected) result.replace(at, 4, detected);
    return result;
}

}  // namespace

extern "C" {

AUDIOSIGNAL *AUDIOSIGNAL_OpenEx(const char *file_name, const char *format_text, int flags, void *parent,
                                AUDIOSIGNAL_CALLBACK callback)
{
    if (!file_name) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return nullptr;
    }
    std::unique_ptr<FileReader> reader = open_reader(file_name, format_text);
    if (!reader) return nullptr;
    const AUDIO_FORMAT format = reader->format();
    if (!valid_format(&format)) {
        set_last_error(AUDIO_ERROR_UNSUPPORTED_FORMAT);  // more channels than a mask can name
        return nullptr;
    }
    const bool in_place = reader->random_access();
    const std::string text = resolved_format_text(format_text, reader->format_name());
    AUDIOMETADATA *metadata =
        (flags & AUDIOSIGNAL_OPEN_METADATA) && reader->metadata() ? AUDIOMETADATA_Duplicate(reader->metadata()) : nullptr;

    std::vector<SegmentsPtr> channels;
    auto source = std::make_shared<ReaderSource>(std::move(reader));
    if (!(in_place ? scan_in_place(source, channels) : scan_decoded(*source, channels))) {
        AUDIOMETADATA_Destroy(metadata);
        set_last_error(AUDIO_ERROR_READ);
        return nullptr;
    }
    _audio_signal *signal = create_signal(format);
    install_segments(*signal, channels);
    signal->reset_stamp = signal->stamp;
    signal->metadata = metadata;
    signal->parent = parent;
    signal->callback = callback;
    bind_file(*signal, file_name, text);
    return signal;
}

int AUDIOSIGNAL_Save(AUDIOSIGNAL *signal, const char *file_name, const char *format_text)
{
    if (!signal || !file_name) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return 0;
    }
    AUDIO_FORMAT format;
    AUDIOSIGNAL_GetFormat(signal, &format);
    std::unique_ptr<FileWriter> writer = create_writer(file_name, format, format_text, signal->metadata);
    if (!writer) return 0;
    const std::vector<SegmentsPtr> channels = all_segments(*signal);
    const size_t width = channels.size();
    const int64_t length = channels[0]->length();
    std::vector<float> samples(static_cast<size_t>(kChunkFrames));
    std::vector<float> frames(size_t(kChunkFrames) * width);
    ProgressReport progress(length);
    for (int64_t at = 0; at < length; at += kChunkFrames) {
        progress.advance(at);
        const int64_t n = std::min(kChunkFrames, length - at);
        for (size_t c = 0; c < width; ++c) {
            if (!channels[c]->read(at, n, samples.data())) {
                set_last_error(AUDIO_ERROR_READ);
                return 0;  // the writer goes without touching the target
            }
            for (int64_t i = 0; i < n; ++i) frames[size_t(i) * width + c] = samples[size_t(i)];
        }
        if (!writer->write(frames.data(), n)) return 0;
    }
    if (!writer->commit()) return 0;
    bind_file(*signal, file_name, format_text && *format_text ? format_text : "AUTO");
    progress.finish();
    return 1;
}

}  // extern "C"
