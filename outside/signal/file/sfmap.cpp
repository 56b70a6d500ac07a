#include "outside/signal/file/sfmap_internal.hpp"

#include <sndfile.h>

#include "outside/signal/audioformat.h"
#include "outside/signal/file/formats_internal.hpp"

namespace velmsig {

namespace {

struct Container {
    int sf;
    int ours;
};
constexpr Container kContainers[] = {
    {SF_FORMAT_WAV, AUDIO_CONTAINER_WAVE},   {SF_FORMAT_WAVEX, AUDIO_CONTAINER_WAVE},
    {SF_FORMAT_RF64, AUDIO_CONTAINER_RF64},  {SF_FORMAT_W64, AUDIO_CONTAINER_W64},
    {SF_FORMAT_AIFF, AUDIO_CONTAINER_AIFF},  {SF_FORMAT_CAF, AUDIO_CONTAINER_CAF},
    {SF_FORMAT_RAW, AUDIO_CONTAINER_RAW},    {SF_FORMAT_FLAC, AUDIO_CONTAINER_FLAC},
    {SF_FORMAT_OGG, AUDIO_CONTAINER_OGG},    {SF_FORMAT_MPEG, AUDIO_CONTAINER_MPEG},
};

struct Coding {
    int sf;
    int ours;
};
constexpr Coding kCodings[] = {
    {SF_FORMAT_PCM_U8, AUDIO_FORMAT_PCM_U8}, {SF_FORMAT_PCM_S8, AUDIO_FORMAT_PCM_S8},
    {SF_FORMAT_PCM_16, AUDIO_FORMAT_PCM_16}, {SF_FORMAT_PCM_24, AUDIO_FORMAT_PCM_24},
    {SF_FORMAT_PCM_32, AUDIO_FORMAT_PCM_32}, {SF_FORMAT_FLOAT, AUDIO_FORMAT_FLOAT},
    {SF_FORMAT_DOUBLE, AUDIO_FORMAT_DOUBLE}, {SF_FORMAT_ULAW, AUDIO_FORMAT_ULAW},
    {SF_FORMAT_ALAW, AUDIO_FORMAT_ALAW},     {SF_FORMAT_VORBIS, AUDIO_FORMAT_VORBIS},
    {SF_FORMAT_OPUS, AUDIO_FORMAT_OPUS},     {SF_FORMAT_MPEG_LAYER_III, AUDIO_FORMAT_MP3},
    {SF_FORMAT_MPEG_LAYER_II, AUDIO_FORMAT_MP3}, {SF_FORMAT_MPEG_LAYER_I, AUDIO_FORMAT_MP3},
};

}  // namespace

int container_of_sf(int sf_format) {
    for (const auto &c : kContainers)
        if (c.sf == (sf_format & SF_FORMAT_TYPEMASK)) return c.ours;
    return 0;
}

int coding_of_sf(int sf_format) {
    int sub = sf_format & SF_FORMAT_SUBMASK;
    int coding = 0;
    for (const auto &c : kCodings)
        if (c.sf == sub) coding = c.ours;
    if ((sf_format & SF_FORMAT_TYPEMASK) == SF_FORMAT_FLAC)
        return (coding == AUDIO_FORMAT_PCM_S8 || coding == AUDIO_FORMAT_PCM_16 || coding == AUDIO_FORMAT_PCM_24)
                   ? AUDIO_FORMAT_FLAC
                   : 0;
    return coding;
}

int bits_of_sf(int sf_format) {
    int sub = sf_format & SF_FORMAT_SUBMASK;
    for (const auto &c : kCodings)
        if (c.sf == sub) return bits_of_coding(c.ours);
    return 16;
}

int sf_format_of(int container, int coding, int bits) {
    int major = 0;
    for (const auto &c : kContainers)
        if (c.ours == container && !major) major = c.sf;
    if (!major) return 0;
    if (coding == AUDIO_FORMAT_FLAC) {
        // FLAC keeps integers of the bit depth asked for.
        int sub = bits == 8 ? SF_FORMAT_PCM_S8 : bits == 24 ? SF_FORMAT_PCM_24 : bits == 16 ? SF_FORMAT_PCM_16 : 0;
        return sub ? major | sub : 0;
    }
    for (const auto &c : kCodings)
        if (c.ours == coding) return major | c.sf;
    return 0;
}

}  // namespace velmsig
