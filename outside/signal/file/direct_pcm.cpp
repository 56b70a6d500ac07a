#include "outside/signal/file/direct_pcm_internal.hpp"

#include <unistd.h>

#include <algorithm>
#include <bit>
#include <cerrno>
#include <cstring>

#include "outside/signal/audioformat.h"

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace velmsig {

namespace {

int bytes_of(int coding) {
    switch (coding) {
        case AUDIO_FORMAT_PCM_U8: case AUDIO_FORMAT_PCM_S8: return 1;
        case AUDIO_FORMAT_PCM_16: return 2;
        case AUDIO_FORMAT_PCM_24: return 3;
        case AUDIO_FORMAT_PCM_32: case AUDIO_FORMAT_FLOAT: return 4;
        default: return 0;
    }
}

// Bytes read per positioned read: small enough to stay in the cache
// between the read and the conversion.
constexpr int64_t kChunkBytes = 32768;

// Reads up to size bytes at offset; the bytes read, or -1.
int64_t pread_fully(int fd, void *buffer, int64_t size, int64_t offset) {
    auto *p = static_cast<char *>(buffer);
    int64_t done = 0;
    while (done < size) {
        ssize_t n = pread(fd, p + done, static_cast<size_t>(size - done), offset + done);
        if (n < 0 && errno == EINTR) continue;
        if (n < 0) return -1;
        if (n == 0) break;  // the file got shorter since it was opened
        done += n;
    }
    return done;
}

// Reads `count` frames in cache-sized chunks of Sample words and widens each
// chunk with widen(words, out, samples).
template <typename Sample, typename Widen>
int64_t read_chunked(int fd, int64_t offset, int64_t bytes_per_frame, int channels, float *out, int64_t count,
                     Widen widen) {
    Sample raw[kChunkBytes / sizeof(Sample)];
    const int64_t chunk_frames = kChunkBytes / bytes_per_frame;
    int64_t done = 0;
    while (done < count) {
        int64_t frames = std::min(chunk_frames, count - done);
        int64_t got = pread_fully(fd, raw, frames * bytes_per_frame, offset + done * bytes_per_frame);
        if (got < 0) return -1;
        int64_t whole = got / bytes_per_frame;
        widen(raw, out + done * channels, whole * channels);
        done += whole;
        if (whole < frames) break;
    }
    return done;
}

// The scales libsndfile uses: full scale reads as 1.0.
template <typename Sample>
void scale(const Sample *raw, float *out, int64_t n, float factor) {
    for (int64_t i = 0; i < n; ++i) out[i] = static_cast<float>(raw[i]) * factor;
}

// The two widenings that carry nearly every file, eight or four samples at a
// time (the compiler leaves these loops scalar at -O2).  Conversion and a
// power-of-two scale are exact or round as the scalar code does, so the
// results are the same bit for bit.
template <bool Swap>
void widen16(const uint16_t *raw, float *out, int64_t n) {
    int64_t i = 0;
#ifdef __SSE2__
    const __m128 factor = _mm_set1_ps(1.0f / 32768);
    for (; i + 8 <= n; i += 8) {
        __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(raw + i));
        if constexpr (Swap) x = _mm_or_si128(_mm_slli_epi16(x, 8), _mm_srli_epi16(x, 8));
        // Each word to the top half of a 32-bit lane, then down keeping the sign.
        const __m128i lo = _mm_srai_epi32(_mm_unpacklo_epi16(x, x), 16);
        const __m128i hi = _mm_srai_epi32(_mm_unpackhi_epi16(x, x), 16);
        _mm_storeu_ps(out + i, _mm_mul_ps(_mm_cvtepi32_ps(lo), factor));
        _mm_storeu_ps(out + i + 4, _mm_mul_ps(_mm_cvtepi32_ps(hi), factor));
    }
#endif
    for (; i < n; ++i) {
        const uint16_t word = Swap ? __builtin_bswap16(raw[i]) : raw[i];
        out[i] = static_cast<float>(static_cast<int16_t>(word)) * (1.0f / 32768);
    }
}

void widen32(const int32_t *raw, float *out, int64_t n) {
    int64_t i = 0;
#ifdef __SSE2__
    const __m128 factor = _mm_set1_ps(1.0f / 2147483648.0f);
    for (; i + 4 <= n; i += 4) {
        const __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(raw + i));
        _mm_storeu_ps(out + i, _mm_mul_ps(_mm_cvtepi32_ps(x), factor));
    }
#endif
    scale(raw + i, out + i, n - i, 1.0f / 2147483648.0f);
}

// The three bytes go to the top of a 32-bit word, a batch at a time, and
// widen as 32-bit samples: the low byte is zero, so the result is exactly
// the 24-bit value over 2^23.
template <bool BigEndian>
void widen24(const uint8_t *raw, float *out, int64_t n) {
    constexpr int64_t kBatch = 1024;
    int32_t words[kBatch];
    for (int64_t done = 0; done < n; done += kBatch) {
        const int64_t count = std::min(kBatch, n - done);
        for (int64_t i = 0; i < count; ++i, raw += 3)
            words[i] = static_cast<int32_t>(BigEndian ? uint32_t{raw[0]} << 24 | uint32_t{raw[1]} << 16 | uint32_t{raw[2]} << 8
                                                      : uint32_t{raw[0]} << 8 | uint32_t{raw[1]} << 16 | uint32_t{raw[2]} << 24);
        widen32(words, out + done, count);
    }
}

}  // namespace

bool DirectPcm::handles(int coding) { return std::endian::native == std::endian::little && bytes_of(coding) > 0; }

DirectPcm::DirectPcm(int fd, int64_t data_offset, int coding, int channels, bool big_endian)
    : fd_(fd),
      data_offset_(data_offset),
      coding_(coding),
      channels_(channels),
      big_endian_(big_endian),
      bytes_per_frame_(int64_t{bytes_of(coding)} * channels) {}

int64_t DirectPcm::read(int64_t first, float *out, int64_t count) const {
    int64_t at = data_offset_ + first * bytes_per_frame_;
    auto read = [&](auto sample, auto widen) {
        return read_chunked<decltype(sample)>(fd_, at, bytes_per_frame_, channels_, out, count, widen);
    };
    switch (coding_) {
        case AUDIO_FORMAT_PCM_U8:
            return read(uint8_t{}, [](const uint8_t *raw, float *o, int64_t n) {
                for (int64_t i = 0; i < n; ++i) o[i] = static_cast<float>(raw[i] - 128) * (1.0f / 128);
            });
        case AUDIO_FORMAT_PCM_S8:
            return read(int8_t{}, [](const int8_t *raw, float *o, int64_t n) { scale(raw, o, n, 1.0f / 128); });
        case AUDIO_FORMAT_PCM_16:
            if (big_endian_) return read(uint16_t{}, widen16<true>);
            return read(uint16_t{}, widen16<false>);
        case AUDIO_FORMAT_PCM_24:
            if (big_endian_) return read(uint8_t{}, widen24<true>);
            return read(uint8_t{}, widen24<false>);
        case AUDIO_FORMAT_PCM_32:
            if (big_endian_)
                return read(uint32_t{}, [](const uint32_t *raw, float *o, int64_t n) {
                    for (int64_t i = 0; i < n; ++i)
                        o[i] = static_cast<float>(static_cast<int32_t>(__builtin_bswap32(raw[i]))) * (1.0f / 2147483648.0f);
                });
            return read(int32_t{}, widen32);
        default:  // floats are stored as they are
            if (big_endian_)
                return read(uint32_t{}, [](const uint32_t *raw, float *o, int64_t n) {
                    for (int64_t i = 0; i < n; ++i) o[i] = std::bit_cast<float>(__builtin_bswap32(raw[i]));
                });
            return read(float{}, [](const float *raw, float *o, int64_t n) { std::copy(raw, raw + n, o); });
    }
}

}  // namespace velmsig
