#include "outside/signal/file/direct_pcm_internal.hpp"

#include <unistd.h>

#include <bit>
#include <cerrno>
#include <cstring>

#include "outside/signal/audioformat.h"

namespace velmsig {

namespace {

int bytes_of(int coding) {
    switch (coding) {
        case AUDIO_FORMAT_PCM_U8: return 1;
        case AUDIO_FORMAT_PCM_16: return 2;
        case AUDIO_FORMAT_PCM_24: return 3;
        case AUDIO_FORMAT_PCM_32: case AUDIO_FORMAT_FLOAT: return 4;
        default: return 0;
    }
}

// Widens n samples stored at the start of `out` as raw bytes into floats
// (the scale libsndfile uses: full scale is 1.0).  Samples grow, so the
// last is converted first and nothing is overwritten before it is read.
void widen_in_place(float *out, int64_t n, int coding) {
    auto *raw = reinterpret_cast<const unsigned char *>(out);
    switch (coding) {
        case AUDIO_FORMAT_PCM_U8:
            for (int64_t i = n - 1; i >= 0; --i) out[i] = static_cast<float>(raw[i] - 128) * (1.0f / 128);
            break;
        case AUDIO_FORMAT_PCM_16:
            for (int64_t i = n - 1; i >= 0; --i) {
                int16_t v;
                std::memcpy(&v, raw + 2 * i, 2);
                out[i] = static_cast<float>(v) * (1.0f / 32768);
            }
            break;
        case AUDIO_FORMAT_PCM_24:
            for (int64_t i = n - 1; i >= 0; --i) {
                const unsigned char *b = raw + 3 * i;
                auto v = static_cast<int32_t>(uint32_t{b[0]} << 8 | uint32_t{b[1]} << 16 | uint32_t{b[2]} << 24);
                out[i] = static_cast<float>(v >> 8) * (1.0f / 8388608);
            }
            break;
        case AUDIO_FORMAT_PCM_32:
            for (int64_t i = 0; i < n; ++i) {
                int32_t v;
                std::memcpy(&v, raw + 4 * i, 4);
                out[i] = static_cast<float>(v) * (1.0f / 2147483648.0f);
            }
            break;
        default:  // floats are stored as they are
            break;
    }
}

}  // namespace

bool DirectPcm::handles(int coding) { return std::endian::native == std::endian::little && bytes_of(coding) > 0; }

DirectPcm::DirectPcm(int fd, int64_t data_offset, int coding, int channels)
    : fd_(fd),
      data_offset_(data_offset),
      coding_(coding),
      channels_(channels),
      bytes_per_sample_(bytes_of(coding)),
      bytes_per_frame_(int64_t{bytes_of(coding)} * channels) {}

int64_t DirectPcm::read(int64_t first, float *out, int64_t count) const {
    auto *p = reinterpret_cast<char *>(out);
    int64_t want = count * bytes_per_frame_, done = 0;
    int64_t at = data_offset_ + first * bytes_per_frame_;
    while (done < want) {
        ssize_t n = pread(fd_, p + done, static_cast<size_t>(want - done), at + done);
        if (n < 0 && errno == EINTR) continue;
        if (n < 0) return -1;
        if (n == 0) break;  // the file got shorter since it was opened
        done += n;
    }
    int64_t frames = done / bytes_per_frame_;
    widen_in_place(out, frames * channels_, coding_);
    return frames;
}

}  // namespace velmsig
