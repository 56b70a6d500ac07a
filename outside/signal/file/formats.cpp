// Format names, descriptors, labels and format filter masks.
#include "outside/signal/file/formats_internal.hpp"

#include <sndfile.h>

#include <cmath>
#include <cstdio>
#include <vector>

#include "outside/signal/audioformat.h"
#include "outside/signal/file/text_internal.hpp"

namespace velmsig {

namespace {

constexpr FormatName kNames[] = {
    {"AUTO", 0, 0},
    {"WAVE", AUDIO_CONTAINER_WAVE, 0},
    {"WAV", AUDIO_CONTAINER_WAVE, 0},
    {"WAVPCM", AUDIO_CONTAINER_WAVE, 0},
    {"WAVFLOAT", AUDIO_CONTAINER_WAVE, AUDIO_FORMAT_FLOAT},
    {"RF64", AUDIO_CONTAINER_RF64, 0},
    {"W64", AUDIO_CONTAINER_W64, 0},
    {"AIFF", AUDIO_CONTAINER_AIFF, 0},
    {"AIF", AUDIO_CONTAINER_AIFF, 0},
    {"AIFFFLOAT", AUDIO_CONTAINER_AIFF, AUDIO_FORMAT_FLOAT},
    {"CAF", AUDIO_CONTAINER_CAF, 0},
    {"CAFFLOAT", AUDIO_CONTAINER_CAF, AUDIO_FORMAT_FLOAT},
    {"RAW", AUDIO_CONTAINER_RAW, 0},
    {"RAWFLOAT", AUDIO_CONTAINER_RAW, AUDIO_FORMAT_FLOAT},
    {"FLAC", AUDIO_CONTAINER_FLAC, AUDIO_FORMAT_FLAC},
    {"OGG", AUDIO_CONTAINER_OGG, AUDIO_FORMAT_VORBIS},
    {"VORBIS", AUDIO_CONTAINER_OGG, AUDIO_FORMAT_VORBIS},
    {"OPUS", AUDIO_CONTAINER_OGG, AUDIO_FORMAT_OPUS},
    {"MP3", AUDIO_CONTAINER_MPEG, AUDIO_FORMAT_MP3},
    {"LINK", AUDIO_CONTAINER_LINK, 0},
};

constexpr uint32_t kAllChannels = AUDIO_FILTER_MONO | AUDIO_FILTER_STEREO | AUDIO_FILTER_MULTICHANNEL;
constexpr uint32_t kAllIntBits = AUDIO_FILTER_8BIT | AUDIO_FILTER_16BIT | AUDIO_FILTER_24BIT | AUDIO_FILTER_32BIT;
constexpr uint32_t kAllBits = kAllIntBits | AUDIO_FILTER_FLOAT | AUDIO_FILTER_DOUBLE;
constexpr uint32_t kPcmFile = AUDIO_FILTER_ANY_RATE | kAllChannels | kAllBits | AUDIO_DESCR_READ |
                              AUDIO_DESCR_WRITE | AUDIO_DESCR_RANDOM_ACCESS;
// Lossy codings store any bit depth: the samples are re-encoded anyway.
constexpr uint32_t kLossy = kAllBits | AUDIO_DESCR_READ | AUDIO_DESCR_LOSSY;

constexpr AUDIO_FORMAT_ENTRY kWaveEntries[] = {
    {"WAVE", "PCM 16-bit", AUDIO_FORMAT_PCM_16, 16},
    {"WAVE", "PCM 24-bit", AUDIO_FORMAT_PCM_24, 24},
    {"WAVE", "PCM 32-bit", AUDIO_FORMAT_PCM_32, 32},
    {"WAVE", "PCM 8-bit", AUDIO_FORMAT_PCM_U8, 8},
    {"WAVFLOAT", "Float 32-bit", AUDIO_FORMAT_FLOAT, 32},
    {"WAVFLOAT", "Float 64-bit", AUDIO_FORMAT_DOUBLE, 64},
    {"WAVE", "u-Law", AUDIO_FORMAT_ULAW, 16},
    {"WAVE", "A-Law", AUDIO_FORMAT_ALAW, 16},
};
constexpr AUDIO_FORMAT_ENTRY kRf64Entries[] = {
    {"RF64", "PCM 16-bit", AUDIO_FORMAT_PCM_16, 16},
    {"RF64", "PCM 24-bit", AUDIO_FORMAT_PCM_24, 24},
    {"RF64", "PCM 32-bit", AUDIO_FORMAT_PCM_32, 32},
    {"RF64", "PCM 8-bit", AUDIO_FORMAT_PCM_U8, 8},
    {"RF64", "Float 32-bit", AUDIO_FORMAT_FLOAT, 32},
    {"RF64", "Float 64-bit", AUDIO_FORMAT_DOUBLE, 64},
};
constexpr AUDIO_FORMAT_ENTRY kW64Entries[] = {
    {"W64", "PCM 16-bit", AUDIO_FORMAT_PCM_16, 16},
    {"W64", "PCM 24-bit", AUDIO_FORMAT_PCM_24, 24},
    {"W64", "PCM 32-bit", AUDIO_FORMAT_PCM_32, 32},
    {"W64", "PCM 8-bit", AUDIO_FORMAT_PCM_U8, 8},
    {"W64", "Float 32-bit", AUDIO_FORMAT_FLOAT, 32},
    {"W64", "Float 64-bit", AUDIO_FORMAT_DOUBLE, 64},
};
constexpr AUDIO_FORMAT_ENTRY kAiffEntries[] = {
    {"AIFF", "PCM 16-bit", AUDIO_FORMAT_PCM_16, 16},
    {"AIFF", "PCM 24-bit", AUDIO_FORMAT_PCM_24, 24},
    {"AIFF", "PCM 32-bit", AUDIO_FORMAT_PCM_32, 32},
    {"AIFF", "PCM 8-bit", AUDIO_FORMAT_PCM_S8, 8},
    {"AIFFFLOAT", "Float 32-bit", AUDIO_FORMAT_FLOAT, 32},
    {"AIFFFLOAT", "Float 64-bit", AUDIO_FORMAT_DOUBLE, 64},
    {"AIFF", "u-Law", AUDIO_FORMAT_ULAW, 16},
    {"AIFF", "A-Law", AUDIO_FORMAT_ALAW, 16},
};
constexpr AUDIO_FORMAT_ENTRY kCafEntries[] = {
    {"CAF", "PCM 16-bit", AUDIO_FORMAT_PCM_16, 16},
    {"CAF", "PCM 24-bit", AUDIO_FORMAT_PCM_24, 24},
    {"CAF", "PCM 32-bit", AUDIO_FORMAT_PCM_32, 32},
    {"CAF", "PCM 8-bit", AUDIO_FORMAT_PCM_S8, 8},
    {"CAFFLOAT", "Float 32-bit", AUDIO_FORMAT_FLOAT, 32},
    {"CAFFLOAT", "Float 64-bit", AUDIO_FORMAT_DOUBLE, 64},
};
constexpr AUDIO_FORMAT_ENTRY kRawEntries[] = {
    {"RAW", "PCM 16-bit", AUDIO_FORMAT_PCM_16, 16},
    {"RAW", "PCM 24-bit", AUDIO_FORMAT_PCM_24, 24},
    {"RAW", "PCM 32-bit", AUDIO_FORMAT_PCM_32, 32},
    {"RAW", "PCM 8-bit", AUDIO_FORMAT_PCM_S8, 8},
    {"RAWFLOAT", "Float 32-bit", AUDIO_FORMAT_FLOAT, 32},
    {"RAWFLOAT", "Float 64-bit", AUDIO_FORMAT_DOUBLE, 64},
};
constexpr AUDIO_FORMAT_ENTRY kFlacEntries[] = {
    {"FLAC", "FLAC", AUDIO_FORMAT_FLAC, 16},
};
constexpr AUDIO_FORMAT_ENTRY kOggEntries[] = {
    {"OGG", "Vorbis", AUDIO_FORMAT_VORBIS, 16},
    {"OPUS", "Opus", AUDIO_FORMAT_OPUS, 16},
};
constexpr AUDIO_FORMAT_ENTRY kMpegEntries[] = {
    {"MP3", "MPEG Layer III", AUDIO_FORMAT_MP3, 16},
};
constexpr AUDIO_FORMAT_ENTRY kLinkEntries[] = {
    {"LINK", "Link", AUDIO_FORMAT_NONE, 0},
};

template <size_t N>
constexpr AUDIO_FORMAT_DESCR descr(const char *name, const char *label, const char *ext, int container,
                                   uint32_t flags, const AUDIO_FORMAT_ENTRY (&entries)[N]) {
    return {name, label, ext, static_cast<uint16_t>(container), flags, static_cast<int>(N), entries};
}

// Whether the installed libsndfile encodes a lossy coding is known at run
// time only.
uint32_t write_flag_if_encodes(int sf_format) {
    SF_INFO info{};
    info.samplerate = 48000;
    info.channels = 2;
    info.format = sf_format;
    return sf_format_check(&info) ? AUDIO_DESCR_WRITE : 0;
}

// FLAC holds 8 channels of up to 24-bit integers; MP3 and Opus at most two
// channels at their own rates.  Opus also encodes 12000 and 24000 Hz, which
// fall under "other rates".
std::vector<AUDIO_FORMAT_DESCR> make_descrs() {
    return {
        descr("WAVE", "Microsoft WAVE", "wav", AUDIO_CONTAINER_WAVE, kPcmFile, kWaveEntries),
        descr("RF64", "RF64 WAVE", "rf64", AUDIO_CONTAINER_RF64, kPcmFile, kRf64Entries),
        descr("W64", "Sony Wave64", "w64", AUDIO_CONTAINER_W64, kPcmFile, kW64Entries),
        descr("AIFF", "Apple AIFF", "aif,aiff,aifc", AUDIO_CONTAINER_AIFF, kPcmFile, kAiffEntries),
        descr("CAF", "Apple Core Audio", "caf", AUDIO_CONTAINER_CAF, kPcmFile, kCafEntries),
        descr("RAW", "Headerless", "raw,pcm", AUDIO_CONTAINER_RAW, kPcmFile, kRawEntries),
        descr("FLAC", "FLAC", "flac", AUDIO_CONTAINER_FLAC,
              AUDIO_FILTER_ANY_RATE | kAllChannels | AUDIO_FILTER_8BIT | AUDIO_FILTER_16BIT | AUDIO_FILTER_24BIT |
                  AUDIO_DESCR_READ | AUDIO_DESCR_WRITE,
              kFlacEntries),
        descr("OGG", "Ogg", "ogg,oga,opus", AUDIO_CONTAINER_OGG,
              AUDIO_FILTER_ANY_RATE | kAllChannels | kLossy | write_flag_if_encodes(SF_FORMAT_OGG | SF_FORMAT_VORBIS),
              kOggEntries),
        descr("MP3", "MPEG Audio", "mp3", AUDIO_CONTAINER_MPEG,
              AUDIO_FILTER_RATE_48000 | AUDIO_FILTER_RATE_44100 | AUDIO_FILTER_RATE_32000 | AUDIO_FILTER_RATE_22050 |
                  AUDIO_FILTER_RATE_16000 | AUDIO_FILTER_RATE_11025 | AUDIO_FILTER_RATE_8000 | AUDIO_FILTER_MONO |
                  AUDIO_FILTER_STEREO | kLossy | write_flag_if_encodes(SF_FORMAT_MPEG | SF_FORMAT_MPEG_LAYER_III),
              kMpegEntries),
        descr("LINK", "Link document", "velmlink", AUDIO_CONTAINER_LINK,
              AUDIO_FILTER_ALL | AUDIO_DESCR_READ | AUDIO_DESCR_WRITE, kLinkEntries),
    };
}

const std::vector<AUDIO_FORMAT_DESCR> &descrs() {
    static const std::vector<AUDIO_FORMAT_DESCR> table = make_descrs();
    return table;
}

struct RateBit {
    int rate;
    uint32_t bit;
};
constexpr RateBit kRateBits[] = {
    {96000, AUDIO_FILTER_RATE_96000}, {48000, AUDIO_FILTER_RATE_48000}, {44100, AUDIO_FILTER_RATE_44100},
    {32000, AUDIO_FILTER_RATE_32000}, {22050, AUDIO_FILTER_RATE_22050}, {16000, AUDIO_FILTER_RATE_16000},
    {11025, AUDIO_FILTER_RATE_11025}, {8000, AUDIO_FILTER_RATE_8000},   {6000, AUDIO_FILTER_RATE_6000},
};

const AUDIO_FORMAT_DESCR *descr_of_container(int container) {
    for (const auto &d : descrs())
        if (d.containerKind == container) return &d;
    return nullptr;
}

int entry_index(const AUDIO_FORMAT_DESCR &d, int coding) {
    for (int i = 0; i < d.numEntries; ++i)
        if (d.entries[i].audioFormatKind == coding) return i;
    return -1;
}

bool is_float_coding(int coding) { return coding == AUDIO_FORMAT_FLOAT || coding == AUDIO_FORMAT_DOUBLE; }

}  // namespace

const FormatName *find_format_name(std::string_view name) {
    for (const auto &n : kNames)
        if (equals_nocase(name, n.name)) return &n;
    return nullptr;
}

int pcm_coding_for_bits(int container, int bits, bool floating) {
    switch (container) {
        case AUDIO_CONTAINER_WAVE: case AUDIO_CONTAINER_RF64: case AUDIO_CONTAINER_W64:
        case AUDIO_CONTAINER_AIFF: case AUDIO_CONTAINER_CAF: case AUDIO_CONTAINER_RAW:
            break;
        case AUDIO_CONTAINER_FLAC:
            return (!floating && (bits == 8 || bits == 16 || bits == 24)) ? AUDIO_FORMAT_FLAC : 0;
        default:
            return 0;
    }
    if (floating) return bits == 32 ? AUDIO_FORMAT_FLOAT : bits == 64 ? AUDIO_FORMAT_DOUBLE : 0;
    switch (bits) {
        case 8: {
            // WAVE-family files store 8-bit samples unsigned, the others signed.
            bool wave = container == AUDIO_CONTAINER_WAVE || container == AUDIO_CONTAINER_RF64 ||
                        container == AUDIO_CONTAINER_W64;
            return wave ? AUDIO_FORMAT_PCM_U8 : AUDIO_FORMAT_PCM_S8;
        }
        case 16: return AUDIO_FORMAT_PCM_16;
        case 24: return AUDIO_FORMAT_PCM_24;
        case 32: return AUDIO_FORMAT_PCM_32;
        default: return 0;
    }
}

int bits_of_coding(int coding) {
    switch (coding) {
        case AUDIO_FORMAT_PCM_U8: case AUDIO_FORMAT_PCM_S8: return 8;
        case AUDIO_FORMAT_PCM_24: return 24;
        case AUDIO_FORMAT_PCM_32: case AUDIO_FORMAT_FLOAT: return 32;
        case AUDIO_FORMAT_DOUBLE: return 64;
        default: return 16;
    }
}

bool coding_is_random_access(int coding) {
    switch (coding) {
        case AUDIO_FORMAT_PCM_U8: case AUDIO_FORMAT_PCM_S8: case AUDIO_FORMAT_PCM_16: case AUDIO_FORMAT_PCM_24:
        case AUDIO_FORMAT_PCM_32: case AUDIO_FORMAT_FLOAT: case AUDIO_FORMAT_DOUBLE: case AUDIO_FORMAT_ULAW:
        case AUDIO_FORMAT_ALAW:
            return true;
        default:
            return false;
    }
}

const char *format_name_for(int container, int coding) {
    const AUDIO_FORMAT_DESCR *d = descr_of_container(container);
    if (!d) return nullptr;
    int i = entry_index(*d, coding);
    return d->entries[i < 0 ? 0 : i].name;
}

}  // namespace velmsig

using namespace velmsig;

extern "C" {

AUDIO_API _audio_format AUDIO_InitFormat(int sampleRate, int numChannels, int bitsPerSample) {
    _audio_format f{};
    f.sampleRate = sampleRate;
    f.numChannels = static_cast<int16_t>(numChannels);
    f.bitsPerSample = static_cast<int16_t>(bitsPerSample);
    f.audioFormatKind = static_cast<uint16_t>(
        bitsPerSample == 32 ? AUDIO_FORMAT_FLOAT : pcm_coding_for_bits(AUDIO_CONTAINER_RAW, bitsPerSample, false));
    return f;
}

AUDIO_API _audio_format AUDIO_NullFormat(void) { return _audio_format{}; }

AUDIO_API int AUDIO_IsValidFormat(const _audio_format *f) {
    return f && f->sampleRate > 0 && f->sampleRate <= AUDIO_MAX_SAMPLE_RATE && f->numChannels > 0 &&
           f->numChannels <= AUDIO_MAX_CHANNELS && f->bitsPerSample >= 0 && f->bitsPerSample <= 64;
}

AUDIO_API const char *AUDIO_ComposeFormatString(const _audio_format *f) {
    thread_local char text[64];
    if (!AUDIO_IsValidFormat(f)) return "invalid";
    std::snprintf(text, sizeof text, "sr=%d,nc=%d,nbits=%d", f->sampleRate, f->numChannels, f->bitsPerSample);
    return text;
}

AUDIO_API const AUDIO_FORMAT_DESCR *AUDIO_GetFormatDescr(const _audio_format *f, int *index) {
    if (!f) return nullptr;
    const AUDIO_FORMAT_DESCR *d = descr_of_container(f->containerKind);
    if (!d) return nullptr;
    if (index) {
        int i = entry_index(*d, f->audioFormatKind);
        *index = i < 0 ? 0 : i;
    }
    return d;
}

AUDIO_API const AUDIO_FORMAT_DESCR *AUDIO_GetFormatDescrByName(const char *name, int *index) {
    const FormatName *n = name ? find_format_name(name) : nullptr;
    if (!n || n->container == 0) return nullptr;
    const AUDIO_FORMAT_DESCR *d = descr_of_container(n->container);
    if (d && index) {
        int i = n->coding ? entry_index(*d, n->coding) : 0;
        *index = i < 0 ? 0 : i;
    }
    return d;
}

AUDIO_API int AUDIO_NumFormatDescrs(void) { return static_cast<int>(descrs().size()); }

AUDIO_API const AUDIO_FORMAT_DESCR *AUDIO_GetFormatDescrByIndex(int i) {
    return (i >= 0 && i < AUDIO_NumFormatDescrs()) ? &descrs()[static_cast<size_t>(i)] : nullptr;
}

AUDIO_API uint32_t AUDIO_FormatFilterMaskFromAudioFormat(const _audio_format *f) {
    if (!AUDIO_IsValidFormat(f)) return 0;
    uint32_t mask = AUDIO_FILTER_RATE_OTHER;
    for (const auto &r : kRateBits)
        if (r.rate == f->sampleRate) mask = r.bit;
    mask |= f->numChannels == 1 ? AUDIO_FILTER_MONO : f->numChannels == 2 ? AUDIO_FILTER_STEREO
                                                                         : AUDIO_FILTER_MULTICHANNEL;
    bool floating = is_float_coding(f->audioFormatKind);
    switch (f->bitsPerSample) {
        case 8: mask |= AUDIO_FILTER_8BIT; break;
        case 16: mask |= AUDIO_FILTER_16BIT; break;
        case 24: mask |= AUDIO_FILTER_24BIT; break;
        case 32: mask |= floating ? AUDIO_FILTER_FLOAT : AUDIO_FILTER_32BIT; break;
        case 64: mask |= AUDIO_FILTER_DOUBLE; break;
        default: break;  // other depths are stored widened: no constraint
    }
    return mask;
}

AUDIO_API int AUDIO_IsCompatible(const _audio_format *f, uint32_t mask) {
    uint32_t need = AUDIO_FormatFilterMaskFromAudioFormat(f);
    return need != 0 && (need & mask) == need;
}

AUDIO_API const char *AUDIODEF_ContainerString(int container) {
    const AUDIO_FORMAT_DESCR *d = descr_of_container(container);
    return d ? d->label : nullptr;
}

AUDIO_API const char *AUDIODEF_AudioFormatString(int coding) {
    switch (coding) {
        case AUDIO_FORMAT_PCM_U8: return "PCM 8-bit unsigned";
        case AUDIO_FORMAT_PCM_S8: return "PCM 8-bit";
        case AUDIO_FORMAT_PCM_16: return "PCM 16-bit";
        case AUDIO_FORMAT_PCM_24: return "PCM 24-bit";
        case AUDIO_FORMAT_PCM_32: return "PCM 32-bit";
        case AUDIO_FORMAT_FLOAT: return "Float 32-bit";
        case AUDIO_FORMAT_DOUBLE: return "Float 64-bit";
        case AUDIO_FORMAT_ULAW: return "u-Law";
        case AUDIO_FORMAT_ALAW: return "A-Law";
        case AUDIO_FORMAT_FLAC: return "FLAC";
        case AUDIO_FORMAT_VORBIS: return "Vorbis";
        case AUDIO_FORMAT_OPUS: return "Opus";
        case AUDIO_FORMAT_MP3: return "MPEG Layer III";
        default: return nullptr;
    }
}

AUDIO_API int64_t AUDIO_Time2Sample(const _audio_format *f, double seconds) {
    if (!f || f->sampleRate <= 0 || !std::isfinite(seconds)) return -1;
    double s = seconds * f->sampleRate;
    // Beyond what 64-bit positions hold: clamp instead of overflowing.
    if (s >= 9.2e18) return INT64_MAX;
    if (s <= -9.2e18) return INT64_MIN;
    return std::llround(s);
}

AUDIO_API double AUDIO_Sample2Time(const _audio_format *f, int64_t sample) {
    if (!f || f->sampleRate <= 0) return -1.0;
    return static_cast<double>(sample) / f->sampleRate;
}

}  // extern "C"
