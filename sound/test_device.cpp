// The test back-end: one device driven by a library timer on the thread that
// starts its streams.  Playback keeps every buffer the callback fills in the
// WAV file named by "libvelm.sound.test.playbackfile", capture reads the
// file named by "libvelm.sound.test.capturefile" (silence without one).
// Tests of device selection may give the device another name, other format
// masks and a maximum rate ("libvelm.sound.test.name", ".playbackformats",
// ".captureformats", ".maxrate"), read when the device is created.
#include "sound/sound_internal.hpp"

#include "core/velmtimer.h"
#include "outside/base/blbase.h"
#include "platform/sound_files.hpp"

#include <algorithm>
#include <cmath>
#include <memory>
#include <vector>

namespace {

using velmsound::FileSource;
using velmsound::WavSink;

enum State : int { kPlaying = 1, kCapturing = 2, kReady = 3, kEnded = 4 };

class TestStream {
public:
    TestStream(bool capture, float buffer_time, VELMSOUND_StreamCallback callback, void *user,
               const _audio_format &format)
        : capture_(capture), callback_(callback), user_(user), format_(format),
          period_ms_(static_cast<uint32_t>(std::lround(buffer_time * 1000.0))),
          buffer_(static_cast<size_t>(std::lround(format.sampleRate * buffer_time)) * 2 * format.numChannels)
    {
        if (capture)
            source_ = std::make_unique<FileSource>(
                velmsound::SettingText("libvelm.sound.test.capturefile=[]"), format);
        else
            sink_ = std::make_unique<WavSink>(velmsound::SettingText("libvelm.sound.test.playbackfile=[]"), format);
    }
    ~TestStream() { Halt(kEnded); }

    bool Usable() const { return !buffer_.empty(); }

    int Start()
    {
        if (state_ != kReady) return 0;
        timer_ = VELMTIMER_CreateTimer(period_ms_, &TestStream::Tick, this);
        if (!timer_) return 0;
        state_ = capture_ ? kCapturing : kPlaying;
        return 1;
    }
    int Pause()
    {
        if (state_ != kPlaying) return 0;
        Halt(kReady);
        return 1;
    }
    int Stop()
    {
        if (state_ == kEnded) return 0;
        Halt(kEnded);
        return 1;
    }
    int64_t Position() const { return AUDIO_SamplesSize16(&format_, bytes_moved_); }
    int Running() const { return state_ != kEnded; }

private:
    void Halt(State next)
    {
        if (timer_) VELMTIMER_KillTimer(timer_);
        timer_ = nullptr;
        state_ = next;
    }

    static int Tick(void *self)
    {
        auto *stream = static_cast<TestStream *>(self);
        if (stream->capture_)
            stream->Record();
        else
            stream->Play();
        return 1;
    }

    void Play()
    {
        const int32_t got = callback_(user_, buffer_.data(), static_cast<int32_t>(buffer_.size()));
        if (got <= 0) {
            Halt(kEnded);
            return;
        }
        const int64_t bytes = std::min<int64_t>(got, static_cast<int64_t>(buffer_.size()));
        sink_->Write(reinterpret_cast<const int16_t *>(buffer_.data()), bytes / (2 * format_.numChannels));
        bytes_moved_ += bytes;
    }

    void Record()
    {
        source_->Read(reinterpret_cast<int16_t *>(buffer_.data()),
                      static_cast<int64_t>(buffer_.size()) / (2 * format_.numChannels));
        const int32_t bytes = static_cast<int32_t>(buffer_.size());
        if (callback_(user_, buffer_.data(), bytes) != bytes) {
            Halt(kEnded);
            return;
        }
        bytes_moved_ += bytes;
    }

    const bool capture_;
    VELMSOUND_StreamCallback callback_;
    void *user_;
    const _audio_format format_;
    const uint32_t period_ms_;
    std::vector<uint8_t> buffer_;
    std::unique_ptr<WavSink> sink_;
    std::unique_ptr<FileSource> source_;
    VELMTIMER timer_ = nullptr;
    int64_t bytes_moved_ = 0;
    State state_ = kReady;
};

void *Open(bool capture, float buffer_time, VELMSOUND_StreamCallback callback, void *user,
           const _audio_format *format)
{
    if (!callback || !velmsound::UsableStreamFormat(format)) return nullptr;
    auto stream = std::make_unique<TestStream>(capture, buffer_time, callback, user, *format);
    return stream->Usable() ? stream.release() : nullptr;
}

void *OpenPlayback(void *, float buffer_time, VELMSOUND_StreamCallback callback, void *user,
                   const _audio_format *format)
{
    return Open(false, buffer_time, callback, user, format);
}

void *OpenCapture(void *, float buffer_time, VELMSOUND_StreamCallback callback, void *user,
                  const _audio_format *format)
{
    return Open(true, buffer_time, callback, user, format);
}

TestStream *Cast(void *stream) { return static_cast<TestStream *>(stream); }
int Start(void *stream) { return stream ? Cast(stream)->Start() : 0; }
int Pause(void *stream) { return stream ? Cast(stream)->Pause() : 0; }
int Stop(void *stream) { return stream ? Cast(stream)->Stop() : 0; }
int64_t Position(void *stream) { return stream ? Cast(stream)->Position() : 0; }
int Running(void *stream) { return stream ? Cast(stream)->Running() : 0; }
int Close(void *stream)
{
    delete Cast(stream);
    return stream != nullptr;
}

VELMSOUNDDEVICE NewTestDevice()
{
    const char *name = BLSETTINGS_GetStringEx(nullptr, "libvelm.sound.test.name=[%s]", "Audio IO Test Device");
    VELMSOUNDDEVICE device = velmsound::NewDevice(VELMSOUND_KIND_TEST, "test", name, "VelmAudio");
    VELMSOUNDDEVICEINFO &info = device->info;
    info.playback = info.defaultPlayback = info.capture = info.defaultCapture = 1;
    info.maxPlaybackRate = info.maxCaptureRate =
        static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.sound.test.maxrate=[%d]", 96000));
    info.playbackFormats =
        static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.sound.test.playbackformats=[%d]", 0x11FFF00));
    info.captureFormats =
        static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.sound.test.captureformats=[%d]", 0x13FFF00));
    velmsound::UseDeviceAsHandle(device);
    VelmSoundOps &ops = device->ops;
    ops.OpenPlayback = OpenPlayback;
    ops.StartPlayback = Start;
    ops.PausePlayback = Pause;
    ops.StopPlayback = Stop;
    ops.ClosePlayback = Close;
    ops.PlayCursorPosition = Position;
    ops.IsPlaying = Running;
    ops.OpenCapture = OpenCapture;
    ops.CloseCapture = Close;
    ops.StartCapture = Start;
    ops.StopCapture = Stop;
    ops.IsCapturing = Running;
    return device;
}

} // namespace

int VELMSOUND_TEST_EnumerateDevices(VELMSOUNDDEVICE *list, int count)
{
    if (!list || count < 0 || count > VELMSOUND_MAX_DEVICES) return count;
    for (int i = 0; i < count; ++i) {
        if (list[i]->info.kind == VELMSOUND_KIND_TEST) {
            list[i]->present = 1;
            return count;
        }
    }
    return velmsound::AppendDevice(list, count, NewTestDevice());
}
