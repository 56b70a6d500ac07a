// WAV sink and file source shared by the file-backed sound devices.
#include "platform/sound_files.hpp"

#include "outside/base/blbase.h"

#include <algorithm>
#include <cstdio>

namespace velmsound {

namespace {

constexpr int64_t kChunkFrames = 4096;

} // namespace

WavSink::WavSink(const std::string &path, const _audio_format &format) : channels_(format.numChannels)
{
    if (path.empty()) return;
    const _audio_format pcm = AUDIO_InitFormat(format.sampleRate, format.numChannels, 16);
    file_ = AUDIO_CreateFileEx(path.c_str(), &pcm, "WAVPCM");
    if (!file_) BLDEBUG_Error(-1, "(VELMSOUND)_WavSink: Unable to create %s!", path.c_str());
    floats_.resize(static_cast<size_t>(kChunkFrames * channels_));
}

WavSink::~WavSink()
{
    if (file_) AUDIO_CloseFile(file_);
}

void WavSink::Write(const int16_t *samples, int64_t frames)
{
    while (file_ && frames > 0) {
        const int64_t n = std::min(frames, kChunkFrames);
        AUDIO_Word16ToFloatIEEE(samples, floats_.data(), static_cast<int>(n * channels_));
        if (AUDIO_WriteIEEEFloat(file_, floats_.data(), n) != n) {
            AUDIO_CloseFile(file_);
            file_ = nullptr;
            return;
        }
        samples += n * channels_;
        frames -= n;
    }
}

FileSource::FileSource(const std::string &path, const _audio_format &format) : channels_(format.numChannels)
{
    if (path.empty()) return;
    char conversion[96];
    std::snprintf(conversion, sizeof conversion, "AUTO:FMTCONV[sr=%d,nc=%d,nbits=16]", format.sampleRate,
                  format.numChannels);
    file_ = AUDIO_LoadFile(path.c_str(), conversion);
    const _audio_format got = file_ ? AUDIO_GetAudioFileFormat(file_) : AUDIO_NullFormat();
    if (file_ && (got.numChannels != format.numChannels || got.sampleRate != format.sampleRate)) {
        AUDIO_CloseFile(file_);
        file_ = nullptr;
    }
    if (!file_) BLDEBUG_Error(-1, "(VELMSOUND)_FileSource: Unable to read %s as %s!", path.c_str(), conversion);
    floats_.resize(static_cast<size_t>(kChunkFrames * channels_));
}

FileSource::~FileSource()
{
    if (file_) AUDIO_CloseFile(file_);
}

void FileSource::Read(int16_t *samples, int64_t frames)
{
    while (file_ && frames > 0) {
        const int64_t got = AUDIO_ReadIEEEFloat(file_, floats_.data(), std::min(frames, kChunkFrames));
        if (got <= 0) {
            AUDIO_CloseFile(file_);
            file_ = nullptr;
            break;
        }
        AUDIO_IEEEFloatToWord16(floats_.data(), samples, static_cast<int>(got * channels_));
        samples += got * channels_;
        frames -= got;
    }
    std::fill(samples, samples + std::max<int64_t>(frames, 0) * channels_, int16_t{0});
}

std::string SettingText(const char *key_with_default)
{
    const char *text = BLSETTINGS_GetStringEx(nullptr, "%s", key_with_default);
    return text ? text : "";
}

} // namespace velmsound
