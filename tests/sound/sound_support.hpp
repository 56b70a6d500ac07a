// Shared by the sound tests: settings that last one test, 16-bit tones, a
// playback source and a capture sink, and waiting for a stream.
#ifndef VELM_TESTS_SOUND_SUPPORT_HPP
#define VELM_TESTS_SOUND_SUPPORT_HPP

#include "outside/base/blbase.h"
#include "platform/nativetimer.h"
#include "sound/velmsound.h"
#include "testaudio.hpp"

#include <atomic>
#include <chrono>
#include <cmath>
#include <cstring>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

namespace soundtest {

// Sets a process-wide setting and removes it again.
class Setting {
public:
    Setting(std::string key, const std::string &value) : key_(std::move(key))
    {
        BLSETTINGS_ChangeEx(nullptr, "%s=%s", key_.c_str(), value.c_str());
    }
    ~Setting() { BLSETTINGS_DeleteEx(nullptr, "%s", key_.c_str()); }
    Setting(const Setting &) = delete;
    Setting &operator=(const Setting &) = delete;

private:
    std::string key_;
};

// Lists the devices a setting brings in (refreshing the list), and leaves
// them out again.
class Plugged {
public:
    Plugged(std::string key, const std::string &value) : key_(std::move(key))
    {
        BLSETTINGS_ChangeEx(nullptr, "%s=%s", key_.c_str(), value.c_str());
        VELMSOUND_Initialize();
    }
    ~Plugged()
    {
        BLSETTINGS_DeleteEx(nullptr, "%s", key_.c_str());
        VELMSOUND_UpdateDeviceList();
    }
    Plugged(const Plugged &) = delete;
    Plugged &operator=(const Plugged &) = delete;

private:
    std::string key_;
};

// Keeps the log messages of one kind (BLDEBUG_KIND_*) while it lives.
class LogLines {
public:
    explicit LogLines(int kind) : kind_(kind) { BLDEBUG_SetSink(&LogLines::Sink, this); }
    ~LogLines() { BLDEBUG_SetSink(nullptr, nullptr); }
    LogLines(const LogLines &) = delete;
    LogLines &operator=(const LogLines &) = delete;

    std::vector<std::string> lines;

private:
    static void Sink(int kind, int, const char *message, void *self)
    {
        auto *log = static_cast<LogLines *>(self);
        if (kind == log->kind_) log->lines.emplace_back(message);
    }
    int kind_;
};

// A sine as the 16-bit samples a device plays.
inline std::vector<int16_t> Tone(int rate, int channels, double seconds, double hz = 440.0)
{
    const auto frames = static_cast<int64_t>(std::lround(rate * seconds));
    std::vector<int16_t> out;
    for (float f : velmtest::sine(rate, channels, frames, hz, 0.5))
        out.push_back(static_cast<int16_t>(std::lround(f * 32767.0f)));
    return out;
}

// A 16-bit file's samples, as written.
inline std::vector<int16_t> ReadPcm16(const std::string &path, int *rate = nullptr, int *channels = nullptr)
{
    std::vector<int16_t> out;
    for (float f : velmtest::read_audio(path, rate, channels))
        out.push_back(static_cast<int16_t>(std::lround(f * 32768.0f)));
    return out;
}

// Writes the samples unchanged into a 16-bit WAV file.
inline bool WritePcm16(const std::string &path, const std::vector<int16_t> &samples, int rate, int channels)
{
    SF_INFO info{};
    info.samplerate = rate;
    info.channels = channels;
    info.format = SF_FORMAT_WAV | SF_FORMAT_PCM_16;
    SNDFILE *f = sf_open(path.c_str(), SFM_WRITE, &info);
    if (!f) return false;
    const auto n = static_cast<sf_count_t>(samples.size());
    const bool ok = sf_write_short(f, samples.data(), n) == n;
    return sf_close(f) == 0 && ok;
}

// Hands out samples to a playback stream, then nothing.
struct ToneSource {
    explicit ToneSource(std::vector<int16_t> s) : samples(std::move(s)) {}

    static int32_t Fill(void *self, void *buffer, int32_t bytes)
    {
        auto *source = static_cast<ToneSource *>(self);
        source->calls++;
        const size_t at = source->offered.load();
        const size_t n = std::min(static_cast<size_t>(bytes) / 2, source->samples.size() - at);
        if (n) std::memcpy(buffer, source->samples.data() + at, n * 2);
        source->offered = at + n;
        return static_cast<int32_t>(n * 2);
    }

    std::vector<int16_t> samples;
    std::atomic<size_t> offered{0};
    std::atomic<int> calls{0};
};

// Keeps what a capture stream delivers; refuses everything when told to.
struct CaptureSink {
    static int32_t Take(void *self, void *buffer, int32_t bytes)
    {
        auto *sink = static_cast<CaptureSink *>(self);
        sink->calls++;
        if (sink->refuse) return 0;
        std::lock_guard guard(sink->lock);
        const auto *samples = static_cast<const int16_t *>(buffer);
        sink->samples.insert(sink->samples.end(), samples, samples + bytes / 2);
        return bytes;
    }
    size_t Size()
    {
        std::lock_guard guard(lock);
        return samples.size();
    }

    bool refuse = false;
    std::atomic<int> calls{0};
    std::mutex lock;
    std::vector<int16_t> samples;
};

// Polls until done() holds, delivering this thread's timer ticks meanwhile;
// false when it never did (a generous bound, so that a hung stream fails
// the test instead of hanging it).
template <class Done> bool WaitFor(Done done)
{
    const auto give_up = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    while (!done()) {
        if (std::chrono::steady_clock::now() > give_up) return false;
        VELMNATIVE_PumpTimers();
        std::this_thread::sleep_for(std::chrono::milliseconds(2));
    }
    return true;
}

inline _audio_format Format(int rate, int channels) { return AUDIO_InitFormat(rate, channels, 16); }

} // namespace soundtest

#endif // VELM_TESTS_SOUND_SUPPORT_HPP
