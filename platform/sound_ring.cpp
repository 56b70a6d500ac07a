// The ring model of playback and capture streams (see sound_ring.hpp).
#include "platform/sound_ring.hpp"

#include "sound/sound_internal.hpp"

#include <algorithm>
#include <atomic>
#include <chrono>
#include <cmath>
#include <condition_variable>
#include <cstring>
#include <mutex>
#include <thread>
#include <vector>

namespace velmsound {

namespace {

enum State : int { kPlaying = 1, kCapturing = 2, kReady = 3, kEnded = 4 };

constexpr float kLongestCapture = 20.0f; // seconds

uint32_t BlockAlign(const _audio_format *format) { return 2u * static_cast<uint32_t>(format->numChannels); }

uint32_t RingBytes(const _audio_format *format, float buffer_time, double buffer_count)
{
    const uint32_t block = BlockAlign(format);
    const double bytes = std::round(double(format->sampleRate) * block * buffer_time * buffer_count);
    return std::max<uint32_t>(block, static_cast<uint32_t>(bytes) / block * block);
}

// A worker's sleep in real time: the device's period shortened by its speed.
std::chrono::microseconds RealPeriod(double period_ms, double speed)
{
    const double us = period_ms * 1000.0 / std::max(speed, 1e-3);
    return std::chrono::microseconds(std::max<int64_t>(1000, static_cast<int64_t>(us)));
}

class Worker {
public:
    // Sleeps for period, or until done() holds when woken.
    template <class Pred> void Sleep(std::chrono::microseconds period, Pred done)
    {
        std::unique_lock lock(mutex);
        wake.wait_for(lock, period, done);
    }
    void Wake() { wake.notify_all(); }
    void Join()
    {
        Wake();
        if (thread.joinable()) thread.join();
    }

    std::mutex mutex; // the stream mutex: states against the worker's end
    std::condition_variable wake;
    std::thread thread;
};

class PlaybackRing {
public:
    PlaybackRing(std::unique_ptr<PlaybackEndpoint> endpoint, float buffer_time, VELMSOUND_StreamCallback callback,
                 void *user, const _audio_format *format)
        : endpoint_(std::move(endpoint)), callback_(callback), user_(user), block_(BlockAlign(format)),
          ring_(endpoint_->RingBytes() / block_ * block_), scratch_(ring_),
          period_(RealPeriod(std::round(buffer_time * 4.0 * 1000.0 * 0.125), endpoint_->Speed()))
    {
        worker_.thread = std::thread([this] { Run(); });
    }
    ~PlaybackRing()
    {
        Stop();
        worker_.Join();
    }

    int Start()
    {
        std::lock_guard guard(worker_.mutex);
        if (state_ != kReady || !endpoint_->Start()) return 0;
        state_ = kPlaying;
        return 1;
    }
    int Pause()
    {
        std::lock_guard guard(worker_.mutex);
        if (state_ != kPlaying || !endpoint_->Pause()) return 0;
        state_ = kReady;
        return 1;
    }
    int Stop()
    {
        {
            std::lock_guard guard(worker_.mutex);
            if (state_ != kPlaying && state_ != kReady) return 0;
            endpoint_->Stop();
            state_ = kEnded;
        }
        worker_.Wake();
        return 1;
    }
    int64_t Position() { return endpoint_->Played() / block_; }
    int IsPlaying() const { return state_ != kEnded; }

private:
    // Tops the ring up: data from the callback while it gives some, then
    // silence, so the cursor always runs over something defined.
    void Fill()
    {
        played_ = endpoint_->Played();
        uint32_t free = ring_ - static_cast<uint32_t>(written_ - played_);
        while (free > 0 && !data_ended_) {
            const int32_t got = callback_(user_, scratch_.data(), static_cast<int32_t>(free));
            if (got <= 0) {
                data_ended_ = true;
                break;
            }
            const uint32_t n = std::min<uint32_t>(static_cast<uint32_t>(got), free);
            if (!endpoint_->Write(scratch_.data(), n)) return;
            written_ += n;
            data_written_ += n;
            free -= n;
        }
        if (data_ended_ && free > 0) {
            std::memset(scratch_.data(), 0, free);
            if (endpoint_->Write(scratch_.data(), free)) written_ += free;
        }
    }

    void Run()
    {
        for (;;) {
            Fill();
            worker_.Sleep(period_, [this] { return state_ == kEnded; });
            played_ = endpoint_->Played();
            if (state_ == kEnded || played_ > data_written_) break;
        }
        std::lock_guard guard(worker_.mutex);
        if (state_ == kPlaying || state_ == kReady) {
            endpoint_->Stop();
            state_ = kEnded;
        }
    }

    std::unique_ptr<PlaybackEndpoint> endpoint_;
    VELMSOUND_StreamCallback callback_;
    void *user_;
    const uint32_t block_;
    const uint32_t ring_;
    std::vector<uint8_t> scratch_;
    const std::chrono::microseconds period_;
    int64_t written_ = 0;      // data and silence
    int64_t data_written_ = 0; // from the callback
    int64_t played_ = 0;
    bool data_ended_ = false;
    std::atomic<int> state_{kReady};
    Worker worker_;
};

class CaptureRing {
public:
    CaptureRing(std::unique_ptr<CaptureEndpoint> endpoint, float buffer_time, VELMSOUND_StreamCallback callback,
                void *user, const _audio_format *format)
        : endpoint_(std::move(endpoint)), callback_(callback), user_(user),
          buffer_(endpoint_->RingBytes() / BlockAlign(format) * BlockAlign(format)),
          period_(RealPeriod(std::min(200.0, std::round(buffer_time * 100.0 * 1000.0 * 0.125)), endpoint_->Speed()))
    {
        worker_.thread = std::thread([this] { Run(); });
    }
    ~CaptureRing()
    {
        Stop();
        worker_.Join();
    }

    int Start()
    {
        std::lock_guard guard(worker_.mutex);
        if (state_ != kReady || !endpoint_->Start()) return 0;
        state_ = kCapturing;
        return 1;
    }
    int Stop()
    {
        {
            std::lock_guard guard(worker_.mutex);
            if (state_ != kCapturing && state_ != kReady) return 0;
            endpoint_->Stop();
            state_ = kEnded;
        }
        worker_.Wake();
        return 1;
    }
    int IsCapturing() const { return state_ != kEnded; }

private:
    // Hands the consumer what was recorded; a consumer that takes less than
    // it was offered, or a failing device, ends the capture.
    bool Drain()
    {
        const int64_t got = endpoint_->Read(buffer_.data(), static_cast<uint32_t>(buffer_.size()));
        if (got < 0) return false;
        if (got == 0) return true;
        return callback_(user_, buffer_.data(), static_cast<int32_t>(got)) == got;
    }

    void Run()
    {
        bool alive = true;
        while (alive && state_ != kEnded) {
            alive = Drain();
            worker_.Sleep(period_, [this] { return state_ == kEnded; });
        }
        std::lock_guard guard(worker_.mutex);
        if (state_ != kEnded) {
            endpoint_->Stop();
            state_ = kEnded;
        }
    }

    std::unique_ptr<CaptureEndpoint> endpoint_;
    VELMSOUND_StreamCallback callback_;
    void *user_;
    std::vector<uint8_t> buffer_;
    const std::chrono::microseconds period_;
    std::atomic<int> state_{kReady};
    Worker worker_;
};

bool Usable(const _audio_format *format, VELMSOUND_StreamCallback callback)
{
    return callback && UsableStreamFormat(format);
}

} // namespace

void InstallPlaybackRingOps(VELMSOUNDDEVICE device)
{
    VelmSoundOps &ops = device->ops;
    ops.StartPlayback = StartPlaybackRing;
    ops.PausePlayback = PausePlaybackRing;
    ops.StopPlayback = StopPlaybackRing;
    ops.ClosePlayback = ClosePlaybackRing;
    ops.PlayCursorPosition = PlaybackRingPosition;
    ops.IsPlaying = PlaybackRingIsPlaying;
}

void InstallCaptureRingOps(VELMSOUNDDEVICE device)
{
    VelmSoundOps &ops = device->ops;
    ops.CloseCapture = CloseCaptureRing;
    ops.StartCapture = StartCaptureRing;
    ops.StopCapture = StopCaptureRing;
    ops.IsCapturing = CaptureRingIsCapturing;
}

uint32_t PlaybackRingBytes(const _audio_format *format, float buffer_time)
{
    return RingBytes(format, buffer_time, 4.0);
}

// A hundred buffer times, but never more than kLongestCapture seconds, so
// that a long buffer time cannot make the ring absurdly large.
uint32_t CaptureRingBytes(const _audio_format *format, float buffer_time)
{
    return RingBytes(format, std::min(buffer_time * 100.0f, kLongestCapture), 1.0);
}

void *OpenPlaybackRing(std::unique_ptr<PlaybackEndpoint> endpoint, float buffer_time,
                       VELMSOUND_StreamCallback callback, void *user, const _audio_format *format)
{
    if (!endpoint || !Usable(format, callback) || endpoint->RingBytes() < BlockAlign(format)) return nullptr;
    return new PlaybackRing(std::move(endpoint), buffer_time, callback, user, format);
}

void *OpenCaptureRing(std::unique_ptr<CaptureEndpoint> endpoint, float buffer_time,
                      VELMSOUND_StreamCallback callback, void *user, const _audio_format *format)
{
    if (!endpoint || !Usable(format, callback) || endpoint->RingBytes() < BlockAlign(format)) return nullptr;
    return new CaptureRing(std::move(endpoint), buffer_time, callback, user, format);
}

int StartPlaybackRing(void *stream) { return stream ? static_cast<PlaybackRing *>(stream)->Start() : 0; }
int PausePlaybackRing(void *stream) { return stream ? static_cast<PlaybackRing *>(stream)->Pause() : 0; }
int StopPlaybackRing(void *stream) { return stream ? static_cast<PlaybackRing *>(stream)->Stop() : 0; }
int64_t PlaybackRingPosition(void *stream) { return stream ? static_cast<PlaybackRing *>(stream)->Position() : 0; }
int PlaybackRingIsPlaying(void *stream) { return stream ? static_cast<PlaybackRing *>(stream)->IsPlaying() : 0; }

// Closing also stops a stream that still plays or is paused, so that no
// worker is left waiting for a cursor that will never move again.
int ClosePlaybackRing(void *stream)
{
    delete static_cast<PlaybackRing *>(stream);
    return stream != nullptr;
}

int CloseCaptureRing(void *stream)
{
    delete static_cast<CaptureRing *>(stream);
    return stream != nullptr;
}

int StartCaptureRing(void *stream) { return stream ? static_cast<CaptureRing *>(stream)->Start() : 0; }
int StopCaptureRing(void *stream) { return stream ? static_cast<CaptureRing *>(stream)->Stop() : 0; }
int CaptureRingIsCapturing(void *stream) { return stream ? static_cast<CaptureRing *>(stream)->IsCapturing() : 0; }

} // namespace velmsound
