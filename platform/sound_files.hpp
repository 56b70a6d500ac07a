// Audio files as sound devices see them: a sink that keeps what a device
// played as a 16-bit WAV file, and a source that hands out a file's frames
// as 16-bit samples of the stream's format, then silence.
#ifndef VELMPLATFORM_SOUND_FILES_HPP
#define VELMPLATFORM_SOUND_FILES_HPP

#include "outside/signal/audioformat.h"

#include <cstdint>
#include <string>
#include <vector>

namespace velmsound {

class WavSink {
public:
    // An empty path keeps nothing.
    WavSink(const std::string &path, const _audio_format &format);
    ~WavSink(); // finishes and closes the file
    WavSink(const WavSink &) = delete;
    WavSink &operator=(const WavSink &) = delete;

    void Write(const int16_t *samples, int64_t frames);

private:
    AUDIO_FILE *file_ = nullptr;
    int channels_;
    std::vector<float> floats_;
};

class FileSource {
public:
    // An empty path, or a file that cannot be read as the format, gives silence.
    FileSource(const std::string &path, const _audio_format &format);
    ~FileSource();
    FileSource(const FileSource &) = delete;
    FileSource &operator=(const FileSource &) = delete;

    // Fills frames frames: the file's next ones, silence after its end.
    void Read(int16_t *samples, int64_t frames);

private:
    AUDIO_FILE *file_ = nullptr;
    int channels_;
    std::vector<float> floats_;
};

// The text of a settings key, read with an empty default.
std::string SettingText(const char *key_with_default);

} // namespace velmsound

#endif // VELMPLATFORM_SOUND_FILES_HPP
