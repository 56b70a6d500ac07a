// System sound devices through ALSA: the default PCM, one entry per card,
// and the PCMs named by "libvelm.sound.alsa.devices" (comma-separated).
// Streams write and read interleaved 16-bit samples; the PCM's own buffer
// is the ring, and its cursor is the frames handed over minus the delay.
#include "platform/sound_backends.hpp"
#include "platform/sound_files.hpp"
#include "platform/sound_ring.hpp"
#include "sound/sound_internal.hpp"

#include "outside/base/blbase.h"

#include <alsa/asoundlib.h>

#include <algorithm>
#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

namespace velmsound {

namespace {

// Rates above the highest standard one are never asked for.
constexpr unsigned kRateCeiling = 192000;

struct RateBit {
    unsigned rate;
    uint32_t bit;
};
constexpr RateBit kRateBits[] = {{6000, AUDIO_FILTER_RATE_6000},   {8000, AUDIO_FILTER_RATE_8000},
                                 {11025, AUDIO_FILTER_RATE_11025}, {16000, AUDIO_FILTER_RATE_16000},
                                 {22050, AUDIO_FILTER_RATE_22050}, {32000, AUDIO_FILTER_RATE_32000},
                                 {44100, AUDIO_FILTER_RATE_44100}, {48000, AUDIO_FILTER_RATE_48000},
                                 {96000, AUDIO_FILTER_RATE_96000}};

// ALSA's own complaints (a missing card, a server not running) go to the
// log at a detailed level instead of standard error.
void QuietErrors(const char *file, int line, const char *function, int err, const char *format, ...)
{
    char text[512];
    va_list args;
    va_start(args, format);
    std::vsnprintf(text, sizeof text, format, args);
    va_end(args);
    BLDEBUG_Log(18000, "(VELMSOUND)_Alsa: %s: %s", function ? function : "", text);
}

const char *Reason(int err)
{
    switch (-err) {
    case ENOENT: return "NO SUCH DEVICE";
    case EBUSY: return "DEVICE BUSY";
    case ENOMEM: return "OUT OF MEMORY";
    case EINVAL: return "INVALID PARAMETER";
    case ENODEV:
    case ENXIO: return "NO DRIVER";
    case EACCES:
    case EPERM: return "ACCESS DENIED";
    default: return "UNKNOWN REASON";
    }
}

struct PcmCloser {
    void operator()(snd_pcm_t *pcm) const { snd_pcm_close(pcm); }
};
using Pcm = std::unique_ptr<snd_pcm_t, PcmCloser>;

struct HwParams {
    HwParams() { snd_pcm_hw_params_malloc(&params); }
    ~HwParams() { snd_pcm_hw_params_free(params); }
    snd_pcm_hw_params_t *params = nullptr;
};

Pcm OpenPcm(const std::string &name, snd_pcm_stream_t direction, int *err)
{
    snd_pcm_t *pcm = nullptr;
    *err = snd_pcm_open(&pcm, name.c_str(), direction, SND_PCM_NONBLOCK);
    return Pcm(*err < 0 ? nullptr : pcm);
}

// Sets the stream's format and a buffer near ring_frames; the frames the
// PCM buffers, or 0 when it refuses the format.
snd_pcm_uframes_t Configure(snd_pcm_t *pcm, const _audio_format &format, snd_pcm_uframes_t ring_frames)
{
    HwParams hw;
    snd_pcm_uframes_t buffer = ring_frames, period = std::max<snd_pcm_uframes_t>(1, ring_frames / 8);
    if (!hw.params || snd_pcm_hw_params_any(pcm, hw.params) < 0 ||
        snd_pcm_hw_params_set_access(pcm, hw.params, SND_PCM_ACCESS_RW_INTERLEAVED) < 0 ||
        snd_pcm_hw_params_set_format(pcm, hw.params, SND_PCM_FORMAT_S16) < 0 ||
        snd_pcm_hw_params_set_channels(pcm, hw.params, static_cast<unsigned>(format.numChannels)) < 0 ||
        snd_pcm_hw_params_set_rate(pcm, hw.params, static_cast<unsigned>(format.sampleRate), 0) < 0 ||
        snd_pcm_hw_params_set_buffer_size_near(pcm, hw.params, &buffer) < 0 ||
        snd_pcm_hw_params_set_period_size_near(pcm, hw.params, &period, nullptr) < 0 ||
        snd_pcm_hw_params(pcm, hw.params) < 0 || snd_pcm_hw_params_get_buffer_size(hw.params, &buffer) < 0)
        return 0;
    snd_pcm_sw_params_t *sw = nullptr;
    if (snd_pcm_sw_params_malloc(&sw) < 0) return 0;
    snd_pcm_uframes_t boundary = 0;
    // The stream starts when told to, never by itself when data arrives.
    const bool ok = snd_pcm_sw_params_current(pcm, sw) >= 0 && snd_pcm_sw_params_get_boundary(sw, &boundary) >= 0 &&
                    snd_pcm_sw_params_set_start_threshold(pcm, sw, boundary) >= 0 && snd_pcm_sw_params(pcm, sw) >= 0;
    snd_pcm_sw_params_free(sw);
    return ok && snd_pcm_prepare(pcm) >= 0 ? buffer : 0;
}

// An open, configured PCM as both directions keep it.
struct AlsaStream {
    AlsaStream(Pcm p, snd_pcm_uframes_t frames, int channels)
        : pcm(std::move(p)), block(2u * channels), ring_bytes(static_cast<uint32_t>(frames) * block)
    {
    }

    Pcm pcm;
    const uint32_t block;
    const uint32_t ring_bytes;
    std::mutex lock;
    bool running = false;
};

class AlsaPlayback final : public PlaybackEndpoint, private AlsaStream {
public:
    using AlsaStream::AlsaStream;

    uint32_t RingBytes() const override { return ring_bytes; }
    // A PCM without data yet starts when its first frames arrive (Flush).
    bool Start() override
    {
        std::lock_guard guard(lock);
        const snd_pcm_state_t state = snd_pcm_state(pcm.get());
        int err = 0;
        if (state == SND_PCM_STATE_PAUSED)
            err = snd_pcm_pause(pcm.get(), 0);
        else if (handed_ > 0)
            err = snd_pcm_start(pcm.get());
        running = err >= 0;
        return running;
    }
    bool Pause() override
    {
        std::lock_guard guard(lock);
        // A PCM that has not begun yet (no data so far, or prepared again
        // after an underrun) cannot pause; it only has to stay unstarted.
        if (snd_pcm_state(pcm.get()) != SND_PCM_STATE_PREPARED && snd_pcm_pause(pcm.get(), 1) < 0) return false;
        running = false;
        return true;
    }
    // Keeps the position reached; what was still queued is never heard.
    void Stop() override
    {
        Played();
        std::lock_guard guard(lock);
        snd_pcm_drop(pcm.get());
        running = false;
        stopped_ = true;
    }
    int64_t Played() override
    {
        std::lock_guard guard(lock);
        if (stopped_) return played_ * block;
        Flush();
        snd_pcm_sframes_t delay = 0;
        const int err = snd_pcm_delay(pcm.get(), &delay);
        if (err < 0) {
            Recover(err);
            delay = 0;
        }
        const int64_t heard = handed_ - std::clamp<int64_t>(delay, 0, handed_);
        played_ = std::max(played_, heard);
        return played_ * block;
    }
    bool Write(const uint8_t *data, uint32_t bytes) override
    {
        std::lock_guard guard(lock);
        pending_.insert(pending_.end(), data, data + bytes);
        Flush();
        return true;
    }

private:
    // Hands over the whole frames the PCM has room for.
    void Flush()
    {
        while (pending_.size() >= block) {
            const snd_pcm_sframes_t n = snd_pcm_writei(pcm.get(), pending_.data(), pending_.size() / block);
            if (n == -EAGAIN || n == 0) break;
            if (n < 0) {
                if (!Recover(static_cast<int>(n))) break;
                continue;
            }
            pending_.erase(pending_.begin(), pending_.begin() + n * block);
            handed_ += n;
        }
        if (running && snd_pcm_state(pcm.get()) == SND_PCM_STATE_PREPARED) snd_pcm_start(pcm.get());
    }

    // After an underrun the PCM is prepared again; what was queued counts
    // as heard, and a running stream starts again with the next data.
    bool Recover(int err)
    {
        if (snd_pcm_recover(pcm.get(), err, 1) < 0) return false;
        played_ = handed_;
        return true;
    }

    std::vector<uint8_t> pending_;
    int64_t handed_ = 0; // frames
    int64_t played_ = 0; // frames
    bool stopped_ = false;
};

class AlsaCapture final : public CaptureEndpoint, private AlsaStream {
public:
    using AlsaStream::AlsaStream;

    uint32_t RingBytes() const override { return ring_bytes; }
    bool Start() override
    {
        std::lock_guard guard(lock);
        running = snd_pcm_start(pcm.get()) >= 0;
        return running;
    }
    void Stop() override
    {
        std::lock_guard guard(lock);
        snd_pcm_drop(pcm.get());
        running = false;
    }
    int64_t Read(uint8_t *buffer, uint32_t max) override
    {
        std::lock_guard guard(lock);
        if (!running) return 0;
        const snd_pcm_sframes_t n = snd_pcm_readi(pcm.get(), buffer, max / block);
        if (n >= 0) return n * block;
        if (n == -EAGAIN) return 0;
        // An overrun loses what the PCM could not keep; capture goes on.
        if (snd_pcm_recover(pcm.get(), static_cast<int>(n), 1) < 0 || snd_pcm_start(pcm.get()) < 0) return -1;
        return 0;
    }
};

template <class Endpoint>
std::unique_ptr<Endpoint> OpenEndpoint(void *devhandle, snd_pcm_stream_t direction, const _audio_format &format,
                                       uint32_t ring_bytes)
{
    auto *device = static_cast<VELMSOUNDDEVICE>(devhandle);
    int err = 0;
    Pcm pcm = OpenPcm(device->identity, direction, &err);
    if (!pcm) return nullptr;
    const snd_pcm_uframes_t frames = Configure(pcm.get(), format, ring_bytes / (2u * format.numChannels));
    if (!frames) return nullptr;
    return std::make_unique<Endpoint>(std::move(pcm), frames, format.numChannels);
}

void *OpenPlayback(void *devhandle, float buffer_time, VELMSOUND_StreamCallback callback, void *user,
                   const _audio_format *format)
{
    if (!UsableStreamFormat(format)) return nullptr;
    auto endpoint = OpenEndpoint<AlsaPlayback>(devhandle, SND_PCM_STREAM_PLAYBACK, *format,
                                               PlaybackRingBytes(format, buffer_time));
    return OpenPlaybackRing(std::move(endpoint), buffer_time, callback, user, format);
}

void *OpenCapture(void *devhandle, float buffer_time, VELMSOUND_StreamCallback callback, void *user,
                  const _audio_format *format)
{
    if (!UsableStreamFormat(format)) return nullptr;
    auto endpoint = OpenEndpoint<AlsaCapture>(devhandle, SND_PCM_STREAM_CAPTURE, *format,
                                              CaptureRingBytes(format, buffer_time));
    return OpenCaptureRing(std::move(endpoint), buffer_time, callback, user, format);
}

struct Candidate {
    std::string pcm;
    std::string name;
};

struct Probe {
    const char *label;    // "playback" or "Capture", as the messages have it
    const char *function; // the logging function's name
    snd_pcm_stream_t direction;
};

constexpr Probe kPlaybackProbe{"playback", "_PlaybackDeviceQueryCallback", SND_PCM_STREAM_PLAYBACK};
constexpr Probe kCaptureProbe{"Capture", "_CaptureDeviceQueryCallback", SND_PCM_STREAM_CAPTURE};

// The direction's format mask and maximum rate; false when the PCM cannot
// be opened or takes no 16-bit samples.
bool ProbeDirection(const Candidate &candidate, const Probe &probe, uint32_t *mask, uint32_t *max_rate)
{
    int err = 0;
    Pcm pcm = OpenPcm(candidate.pcm, probe.direction, &err);
    if (!pcm) {
        char text[512];
        std::snprintf(text, sizeof text, "Failed to probe %s device %s (%s)\n", probe.label, candidate.name.c_str(),
                      Reason(err));
        BLDEBUG_Error(-1, "VELMsound_windows_directsound::%s | %s", probe.function, text);
        return false;
    }
    BLDEBUG_Log(0, "Probing %s device %s\n", probe.direction == SND_PCM_STREAM_PLAYBACK ? "playback" : "capture",
                candidate.name.c_str());
    HwParams hw;
    snd_pcm_t *p = pcm.get();
    if (!hw.params || snd_pcm_hw_params_any(p, hw.params) < 0 ||
        snd_pcm_hw_params_test_format(p, hw.params, SND_PCM_FORMAT_S16) < 0)
        return false;
    *mask = AUDIO_FILTER_16BIT;
    if (snd_pcm_hw_params_test_channels(p, hw.params, 2) == 0) *mask |= AUDIO_FILTER_STEREO;
    if (snd_pcm_hw_params_test_channels(p, hw.params, 1) == 0) *mask |= AUDIO_FILTER_MONO;
    for (const RateBit &r : kRateBits)
        if (snd_pcm_hw_params_test_rate(p, hw.params, r.rate, 0) == 0) *mask |= r.bit;
    unsigned highest = 0;
    if (snd_pcm_hw_params_get_rate_max(hw.params, &highest, nullptr) < 0) highest = 0;
    *max_rate = std::min(highest, kRateCeiling);
    return (*mask & (AUDIO_FILTER_STEREO | AUDIO_FILTER_MONO)) != 0;
}

VELMSOUNDDEVICE ProbeDevice(const Candidate &candidate)
{
    uint32_t out_mask = 0, out_rate = 0, in_mask = 0, in_rate = 0;
    const bool plays = ProbeDirection(candidate, kPlaybackProbe, &out_mask, &out_rate);
    const bool records = ProbeDirection(candidate, kCaptureProbe, &in_mask, &in_rate);
    if (!plays && !records) return nullptr;
    VELMSOUNDDEVICE device = NewDevice(VELMSOUND_KIND_SYSTEM, candidate.pcm.c_str(), candidate.name.c_str(), "");
    VELMSOUNDDEVICEINFO &info = device->info;
    UseDeviceAsHandle(device);
    if (plays) {
        info.playback = 1;
        info.playbackFormats = out_mask;
        info.maxPlaybackRate = out_rate;
        InstallPlaybackRingOps(device);
        device->ops.OpenPlayback = OpenPlayback;
    }
    if (records) {
        info.capture = 1;
        info.captureFormats = in_mask;
        info.maxCaptureRate = in_rate;
        InstallCaptureRingOps(device);
        device->ops.OpenCapture = OpenCapture;
    }
    return device;
}

void AddCandidate(std::vector<Candidate> &out, std::string pcm, std::string name)
{
    if (pcm.empty() || pcm.size() >= VELMSOUND_NAME_SIZE) return;
    for (const Candidate &c : out)
        if (c.pcm == pcm) return;
    char line[VELMSOUND_NAME_SIZE];
    CopyLine(line, name.empty() ? pcm.c_str() : name.c_str());
    out.push_back({std::move(pcm), line});
}

// The default PCM and each card's default, as the hints describe them,
// then the PCMs the settings add.
std::vector<Candidate> Candidates()
{
    std::vector<Candidate> out;
    void **hints = nullptr;
    if (snd_device_name_hint(-1, "pcm", &hints) == 0) {
        for (void **hint = hints; *hint; ++hint) {
            char *pcm = snd_device_name_get_hint(*hint, "NAME");
            char *description = snd_device_name_get_hint(*hint, "DESC");
            const std::string name = pcm ? pcm : "";
            if (name == "default" || name.rfind("sysdefault:CARD=", 0) == 0)
                AddCandidate(out, name, description ? description : "");
            std::free(pcm);
            std::free(description);
        }
        snd_device_name_free_hint(hints);
    }
    const std::string extra = SettingText("libvelm.sound.alsa.devices=[]");
    for (size_t at = 0; at <= extra.size();) {
        size_t end = extra.find(',', at);
        if (end == std::string::npos) end = extra.size();
        AddCandidate(out, extra.substr(at, end - at), "");
        at = end + 1;
    }
    return out;
}

} // namespace

int EnumerateAlsaDevices(VELMSOUNDDEVICE *list, int count)
{
    static std::once_flag quiet;
    std::call_once(quiet, [] { snd_lib_error_set_handler(&QuietErrors); });
    for (const Candidate &candidate : Candidates()) {
        VELMSOUNDDEVICE device = FindDevice(list, count, VELMSOUND_KIND_SYSTEM, candidate.pcm.c_str());
        if (!device) {
            device = ProbeDevice(candidate);
            if (!device) continue;
            const int grown = AppendDevice(list, count, device);
            if (grown == count) continue;
            count = grown;
        }
        device->present = 1;
        const bool preset = candidate.pcm == "default";
        device->info.defaultPlayback = preset && device->info.playback;
        device->info.defaultCapture = preset && device->info.capture;
    }
    return count;
}

} // namespace velmsound
