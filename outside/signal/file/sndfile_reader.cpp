#include "outside/signal/file/sndfile_reader_internal.hpp"

#include <fcntl.h>
#include <sndfile.h>

#include <algorithm>
#include <cstring>
#include <mutex>
#include <vector>

#include "outside/signal/file/direct_pcm_internal.hpp"
#include "outside/signal/file/formats_internal.hpp"
#include "outside/signal/file/lasterror_internal.hpp"
#include "outside/signal/file/metadata_internal.hpp"
#include "outside/signal/file/sfmap_internal.hpp"
#include "outside/signal/file/vfile_internal.hpp"

namespace velmsig {

namespace {

// Compressed files cannot be checked against their size exactly; no coding
// we read packs more frames than this into one byte.
constexpr int64_t kMaxFramesPerByte = 8192;

int error_of_sf(int sf_error, bool io_failed) {
    if (io_failed) return AUDIO_ERROR_READ;
    switch (sf_error) {
        case SF_ERR_UNRECOGNISED_FORMAT: case SF_ERR_UNSUPPORTED_ENCODING: return AUDIO_ERROR_UNSUPPORTED_FORMAT;
        case SF_ERR_SYSTEM: return AUDIO_ERROR_READ;
        default: return AUDIO_ERROR_CORRUPT_DATA;
    }
}

int bytes_per_sample(int coding) {
    switch (coding) {
        case AUDIO_FORMAT_PCM_16: return 2;
        case AUDIO_FORMAT_PCM_24: return 3;
        case AUDIO_FORMAT_PCM_32: case AUDIO_FORMAT_FLOAT: return 4;
        case AUDIO_FORMAT_DOUBLE: return 8;
        default: return 1;
    }
}

// The byte order of a file's samples: libsndfile names it where it differs
// from the container's own (little-endian AIFF and CAF, big-endian WAVE).
bool big_endian(int sf_format, int container) {
    int order = sf_format & SF_FORMAT_ENDMASK;
    if (order != SF_ENDIAN_FILE) return order == SF_ENDIAN_BIG;  // the host's order is little-endian
    return container == AUDIO_CONTAINER_AIFF || container == AUDIO_CONTAINER_CAF;
}

// The SF_INFO that opens a headerless file as the format string says.
bool raw_info(const ParsedFormat &f, SF_INFO *info) {
    bool floating = f.coding == AUDIO_FORMAT_FLOAT;
    int bits = f.bits ? f.bits : floating ? 32 : 16;
    int coding = pcm_coding_for_bits(AUDIO_CONTAINER_RAW, bits, floating);
    int sf = coding ? sf_format_of(AUDIO_CONTAINER_RAW, coding, bits) : 0;
    if (!sf || f.sample_rate <= 0 || f.channels <= 0) return false;
    *info = SF_INFO{};
    info->samplerate = f.sample_rate;
    info->channels = f.channels;
    info->format = sf | (f.big_endian ? SF_ENDIAN_BIG : SF_ENDIAN_LITTLE);
    return true;
}

class SndfileReader final : public FileReader {
public:
    SndfileReader(UniqueFd fd, int64_t size, int64_t base) : fd_(std::move(fd)), vfile_(fd_.get(), base, size, false) {}
    ~SndfileReader() override {
        if (sf_) sf_close(sf_);
        AUDIOMETADATA_Destroy(meta_);
    }

    // Opens with `info` (zeroed for detection); returns an AUDIO_ERROR_* code.
    int open(SF_INFO info, int64_t size) {
        sf_ = sf_open_virtual(VirtualFile::io(), SFM_READ, &info, &vfile_);
        if (!sf_) return error_of_sf(sf_error(nullptr), vfile_.failed());
        if (info.channels < 1 || info.channels > AUDIO_MAX_CHANNELS || info.samplerate < 1 ||
            info.samplerate > AUDIO_MAX_SAMPLE_RATE || info.frames < 0)
            return AUDIO_ERROR_CORRUPT_DATA;
        int container = container_of_sf(info.format), coding = coding_of_sf(info.format);
        if (!container || !coding) return AUDIO_ERROR_UNSUPPORTED_FORMAT;
        format_.sampleRate = info.samplerate;
        format_.numChannels = static_cast<int16_t>(info.channels);
        format_.bitsPerSample = static_cast<int16_t>(bits_of_sf(info.format));
        format_.containerKind = static_cast<uint16_t>(container);
        format_.audioFormatKind = static_cast<uint16_t>(coding);
        random_ = coding_is_random_access(coding);
        const int type = info.format & SF_FORMAT_TYPEMASK;
        counts_in_32_bits_ = type == SF_FORMAT_WAV || type == SF_FORMAT_WAVEX;
        // Never trust the header's length beyond what the file can hold.
        int64_t capacity = random_ ? size / (int64_t{bytes_per_sample(coding)} * info.channels)
                                   : (size > INT64_MAX / kMaxFramesPerByte ? INT64_MAX : size * kMaxFramesPerByte);
        frames_ = std::min<int64_t>(info.frames, capacity);
        meta_ = metadata_from_sndfile(sf_);
        if (random_ && DirectPcm::handles(coding)) enable_direct_reads(big_endian(info.format, container));
        return AUDIO_ERROR_NONE;
    }

    const _audio_format &format() const override { return format_; }
    int64_t frames() const override { return frames_; }
    bool random_access() const override { return random_; }
    AUDIOMETADATA *metadata() override { return meta_; }
    const char *format_name() const override { return format_name_for(format_.containerKind, format_.audioFormatKind); }

    int64_t read(int64_t first, float *out, int64_t count) override {
        if (!out || first < 0 || count < 0 || count > INT64_MAX / format_.numChannels) {
            set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
            return -1;
        }
        if (random_) {
            if (first >= frames_) return 0;
            count = std::min(count, frames_ - first);
        }
        if (count == 0) return 0;
        if (direct_) {
            int64_t n = direct_->read(first, out, count);
            if (n < 0) set_last_error(AUDIO_ERROR_READ);
            return n;
        }
        std::lock_guard lock(mutex_);
        if (first != next_) {
            if (sf_seek(sf_, first, SEEK_SET) != first) {
                // Past the real end of a compressed stream: nothing to read.
                if (!random_ && sf_error(sf_) == SF_ERR_NO_ERROR && !vfile_.failed()) return 0;
                set_last_error(AUDIO_ERROR_READ);
                return -1;
            }
            next_ = first;
        }
        sf_count_t n = sf_readf_float(sf_, out, count);
        if (n < 0 || vfile_.failed() || (n < count && sf_error(sf_) != SF_ERR_NO_ERROR)) {
            next_ = -1;  // unknown: seek before the next read
            set_last_error(vfile_.failed() ? AUDIO_ERROR_READ : AUDIO_ERROR_CORRUPT_DATA);
            return -1;
        }
        next_ = first + n;
        return n;
    }

private:
    // Where the samples start is where libsndfile seeks for frame 0; the
    // first frames must then read the same both ways before the direct path
    // is trusted.
    void enable_direct_reads(bool big_endian) {
        // A RIFF size that wrapped to less than a frame claims none: there is
        // no second frame to find and nothing to compare, only the start.
        const bool claims_none = frames_ == 0 && counts_in_32_bits_;
        int64_t second = 0;
        if (!claims_none) {
            if (sf_seek(sf_, 1, SEEK_SET) != 1) return;
            second = vfile_.file_offset();
        }
        if (sf_seek(sf_, 0, SEEK_SET) != 0) return;
        next_ = 0;
        const int64_t start = vfile_.file_offset();
        auto direct = std::make_unique<DirectPcm>(fd_.get(), start, format_.audioFormatKind, format_.numChannels,
                                                  big_endian);
        if (!claims_none && second - start != direct->bytes_per_frame()) return;
        // Now the length is known exactly: the frames after the first one.
        frames_ = std::min(frames_, (vfile_.file_size() - start) / direct->bytes_per_frame());
        int64_t n = std::min<int64_t>(frames_, 1024);
        if (n > 0) {
            std::vector<float> theirs(static_cast<size_t>(n * format_.numChannels)), ours(theirs.size());
            if (sf_readf_float(sf_, theirs.data(), n) != n || direct->read(0, ours.data(), n) != n) return;
            next_ = n;
            if (std::memcmp(theirs.data(), ours.data(), theirs.size() * sizeof(float)) != 0) return;
        }
        if (counts_in_32_bits_)
            frames_ = unwrapped_length(frames_, vfile_.file_size() - start, direct->bytes_per_frame());
        direct_ = std::move(direct);
    }

    // A RIFF header counts the data bytes in 32 bits, so a recording of more
    // than 4 GB written by a tool that does not switch to a 64-bit header
    // claims its length modulo 4 GB.  The file itself tells how many whole
    // wraps were written: trailing chunks are far smaller than 4 GB.  The
    // claimed frames drop the bytes of a frame cut by the wrap, so the whole
    // count rounds up, within what the file holds.
    static int64_t unwrapped_length(int64_t frames, int64_t bytes_after_start, int64_t bytes_per_frame) {
        const int64_t claimed = frames * bytes_per_frame;
        const int64_t wraps = (bytes_after_start - claimed) >> 32;
        if (wraps <= 0) return frames;
        const int64_t bytes = claimed + (wraps << 32);
        return std::min((bytes + bytes_per_frame - 1) / bytes_per_frame, bytes_after_start / bytes_per_frame);
    }

    UniqueFd fd_;
    VirtualFile vfile_;
    SNDFILE *sf_ = nullptr;
    _audio_format format_{};
    int64_t frames_ = 0;
    int64_t next_ = 0;  // the frame libsndfile reads next
    bool random_ = false;
    bool counts_in_32_bits_ = false;  // RIFF sizes: 32 bits, may have wrapped
    AUDIOMETADATA *meta_ = nullptr;
    std::unique_ptr<DirectPcm> direct_;  // set when samples are read straight from the file
    std::mutex mutex_;
};

}  // namespace

std::unique_ptr<FileReader> open_sndfile_reader(UniqueFd fd, int64_t size, const ParsedFormat &format) {
    SF_INFO info{};
    bool raw = format.container == AUDIO_CONTAINER_RAW;
    if (raw && !raw_info(format, &info)) {
        set_last_error(AUDIO_ERROR_BAD_FORMAT_STRING);
        return nullptr;
    }
    int64_t base = raw ? format.offset : 0;
    int fd_number = fd.get();
    auto reader = std::make_unique<SndfileReader>(std::move(fd), size, base);
    int error = reader->open(info, size - std::min(size, base));
    // "AUTO[sr=..,nc=..]": a file no header describes is read as headerless.
    if (error == AUDIO_ERROR_UNSUPPORTED_FORMAT && format.container == 0 && format.sample_rate && format.channels &&
        raw_info(format, &info)) {
        UniqueFd again(fcntl(fd_number, F_DUPFD_CLOEXEC, 0));
        if (!again) {
            set_last_error(AUDIO_ERROR_READ);
            return nullptr;
        }
        reader = std::make_unique<SndfileReader>(std::move(again), size, format.offset);
        error = reader->open(info, size - std::min(size, format.offset));
    }
    if (error != AUDIO_ERROR_NONE) {
        set_last_error(error);
        return nullptr;
    }
    return reader;
}

}  // namespace velmsig
