// The virtual device: always present, so that playback and recording work
// without a sound card.  Its cursor follows the monotonic clock, times the
// speed setting; what it plays goes to a WAV file and what it records comes
// from an audio file, both named by settings read when a stream opens.
#include "platform/sound_backends.hpp"
#include "platform/sound_files.hpp"
#include "platform/sound_ring.hpp"
#include "sound/sound_internal.hpp"

#include "outside/base/blbase.h"

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstring>
#include <mutex>
#include <vector>

namespace velmsound {

namespace {

constexpr uint32_t kFormats = 0x13FFF00;
constexpr uint32_t kMaxRate = 96000;

double SpeedSetting()
{
    const double speed = BLSETTINGS_GetFloatEx(nullptr, "libvelm.sound.virtual.speed=[%f]", 1.0);
    return std::isfinite(speed) ? std::clamp(speed, 0.01, 1000.0) : 1.0;
}

// Frames due since the last call while running, at rate x speed; fractions
// carry over so that no frame is lost to rounding.
class VirtualClock {
public:
    VirtualClock(int rate, double speed) : frames_per_second_(rate * speed) {}

    void Run()
    {
        if (running_) return;
        running_ = true;
        last_ = std::chrono::steady_clock::now();
    }
    void Halt()
    {
        Due();
        running_ = false;
        carry_ = 0.0;
    }
    int64_t Due()
    {
        if (!running_) return 0;
        const auto now = std::chrono::steady_clock::now();
        const double frames = std::chrono::duration<double>(now - last_).count() * frames_per_second_ + carry_;
        last_ = now;
        const double whole = std::floor(frames);
        carry_ = frames - whole;
        return static_cast<int64_t>(whole);
    }
    // Frames the device could not take (it does not run ahead of its data).
    void Drop() { carry_ = 0.0; }

private:
    const double frames_per_second_;
    bool running_ = false;
    double carry_ = 0.0;
    std::chrono::steady_clock::time_point last_;
};

class VirtualPlayback final : public PlaybackEndpoint {
public:
    VirtualPlayback(const _audio_format &format, float buffer_time, double speed, const std::string &path)
        : channels_(format.numChannels), speed_(speed),
          ring_(PlaybackRingBytes(&format, buffer_time) / 2), clock_(format.sampleRate, speed), sink_(path, format)
    {
    }

    uint32_t RingBytes() const override { return static_cast<uint32_t>(ring_.size() * 2); }
    double Speed() const override { return speed_; }
    bool Start() override
    {
        std::lock_guard guard(lock_);
        clock_.Run();
        return true;
    }
    bool Pause() override
    {
        std::lock_guard guard(lock_);
        Advance();
        clock_.Halt();
        return true;
    }
    void Stop() override { Pause(); }
    int64_t Played() override
    {
        std::lock_guard guard(lock_);
        Advance();
        return played_ * 2;
    }
    bool Write(const uint8_t *data, uint32_t bytes) override
    {
        std::lock_guard guard(lock_);
        const size_t count = bytes / 2;
        for (size_t done = 0; done < count;) {
            const size_t at = static_cast<size_t>((written_ + done) % ring_.size());
            const size_t n = std::min(count - done, ring_.size() - at);
            std::memcpy(&ring_[at], data + done * 2, n * 2);
            done += n;
        }
        written_ += static_cast<int64_t>(count);
        return true;
    }

private:
    // Plays the due frames out of the ring into the sink; the cursor never
    // passes what was written, so the device waits rather than repeat old data.
    void Advance()
    {
        int64_t samples = clock_.Due() * channels_;
        if (samples >= written_ - played_) {
            samples = written_ - played_;
            clock_.Drop();
        }
        while (samples > 0) {
            const size_t at = static_cast<size_t>(played_ % static_cast<int64_t>(ring_.size()));
            const int64_t n = std::min<int64_t>(samples, static_cast<int64_t>(ring_.size() - at));
            sink_.Write(&ring_[at], n / channels_);
            played_ += n;
            samples -= n;
        }
    }

    const int channels_;
    const double speed_;
    std::mutex lock_;
    std::vector<int16_t> ring_;
    int64_t written_ = 0; // samples
    int64_t played_ = 0;  // samples
    VirtualClock clock_;
    WavSink sink_;
};

class VirtualCapture final : public CaptureEndpoint {
public:
    VirtualCapture(const _audio_format &format, float buffer_time, double speed, const std::string &path)
        : channels_(format.numChannels), ring_bytes_(CaptureRingBytes(&format, buffer_time)), speed_(speed),
          clock_(format.sampleRate, speed), source_(path, format)
    {
    }

    uint32_t RingBytes() const override { return ring_bytes_; }
    double Speed() const override { return speed_; }
    bool Start() override
    {
        std::lock_guard guard(lock_);
        clock_.Run();
        return true;
    }
    void Stop() override
    {
        std::lock_guard guard(lock_);
        clock_.Halt();
    }
    // Records the due frames; more than a ring's worth at once is cut, as a
    // device would overwrite what nobody fetched in time.
    int64_t Read(uint8_t *buffer, uint32_t max) override
    {
        std::lock_guard guard(lock_);
        const int64_t frames = std::min<int64_t>(clock_.Due(), max / (2 * channels_));
        source_.Read(reinterpret_cast<int16_t *>(buffer), frames);
        return frames * 2 * channels_;
    }

private:
    const int channels_;
    const uint32_t ring_bytes_;
    const double speed_;
    std::mutex lock_;
    VirtualClock clock_;
    FileSource source_;
};

void *OpenPlayback(void *, float buffer_time, VELMSOUND_StreamCallback callback, void *user,
                   const _audio_format *format)
{
    if (!UsableStreamFormat(format)) return nullptr;
    auto endpoint = std::make_unique<VirtualPlayback>(
        *format, buffer_time, SpeedSetting(), SettingText("libvelm.sound.virtual.playbackfile=[]"));
    return OpenPlaybackRing(std::move(endpoint), buffer_time, callback, user, format);
}

void *OpenCapture(void *, float buffer_time, VELMSOUND_StreamCallback callback, void *user,
                  const _audio_format *format)
{
    if (!UsableStreamFormat(format)) return nullptr;
    auto endpoint = std::make_unique<VirtualCapture>(*format, buffer_time, SpeedSetting(),
                                                     SettingText("libvelm.sound.virtual.capturefile=[]"));
    return OpenCaptureRing(std::move(endpoint), buffer_time, callback, user, format);
}

VELMSOUNDDEVICE NewVirtualDevice()
{
    VELMSOUNDDEVICE device = NewDevice(VELMSOUND_KIND_SYSTEM, kVirtualIdentity, "Virtual Device", "");
    VELMSOUNDDEVICEINFO &info = device->info;
    info.playback = info.capture = 1;
    info.maxPlaybackRate = info.maxCaptureRate = kMaxRate;
    info.playbackFormats = info.captureFormats = kFormats;
    UseDeviceAsHandle(device);
    InstallPlaybackRingOps(device);
    InstallCaptureRingOps(device);
    device->ops.OpenPlayback = OpenPlayback;
    device->ops.OpenCapture = OpenCapture;
    return device;
}

} // namespace

int EnumerateVirtualDevice(VELMSOUNDDEVICE *list, int count, bool default_playback, bool default_capture)
{
    VELMSOUNDDEVICE device = FindDevice(list, count, VELMSOUND_KIND_SYSTEM, kVirtualIdentity);
    if (!device) {
        device = NewVirtualDevice();
        const int grown = AppendDevice(list, count, device);
        if (grown == count) return count;
        count = grown;
    }
    device->present = 1;
    device->info.defaultPlayback = default_playback;
    device->info.defaultCapture = default_capture;
    return count;
}

} // namespace velmsound
