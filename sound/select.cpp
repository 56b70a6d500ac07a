// Device choice and format negotiation for a requested audio format.
#include "sound/sound_devices.hpp"

#include "outside/base/blbase.h"

#include <cstdint>

namespace {

struct Direction {
    bool capture;
    const char *no_device;      // warning when the list is empty
    const char *no_direction;   // warning when no device serves the direction
};

const Direction kPlayback{false, "VELMSOUND_SelectPlaybackDevice: No device sound found!",
                          "VELMSOUND_SelectPlaybackDevice: No playback device found!"};
const Direction kCapture{true, "VELMSOUND_SelectCaptureDevice: No device sound found!",
                         "VELMSOUND_SelectCaptureDevice: No capture device found!"};

const int32_t kStandardRates[] = {5512,  8000,  9600,  11025, 16000,  22050, 32000,
                                  44100, 48000, 88200, 96000, 176400, 192000};

bool Serves(const VELMSOUNDDEVICEINFO *info, const Direction &d) { return d.capture ? info->capture : info->playback; }
bool IsDefault(const VELMSOUNDDEVICEINFO *info, const Direction &d)
{
    return d.capture ? info->defaultCapture : info->defaultPlayback;
}

// The last device serving the direction that is the asked one, else the last
// default, else the last at all.
const VELMSOUNDDEVICEINFO *PickDevice(VELMSOUNDDEVICE wanted, const Direction &d)
{
    const VELMSOUNDDEVICEINFO *asked = nullptr, *preset = nullptr, *any = nullptr;
    for (int i = 0; i < VelmSoundDeviceInfoCount; ++i) {
        const VELMSOUNDDEVICEINFO *info = VelmSoundDeviceInfoList[i];
        if (!Serves(info, d)) continue;
        if (info->handle == wanted) asked = info;
        if (IsDefault(info, d)) preset = info;
        any = info;
    }
    return asked ? asked : preset ? preset : any;
}

bool Fits(uint32_t mask, const _audio_format *format)
{
    const uint32_t wanted = AUDIO_FormatFilterMaskFromAudioFormat(format);
    return (mask & wanted) == wanted;
}

// Adjusts channels, then the rate, until the device's mask accepts the
// format.  Rates are tried as multiples of the requested one up to the
// device's maximum, then the standard rates above the requested one.
bool Negotiate(_audio_format *format, uint32_t mask, uint32_t max_rate)
{
    if (Fits(mask, format)) return true;
    const int64_t requested = format->sampleRate;
    if (format->numChannels == 1 && !(mask & AUDIO_FILTER_MONO)) {
        format->numChannels = 2;
        if (Fits(mask, format)) return true;
    }
    if (format->numChannels == 2 && !(mask & AUDIO_FILTER_STEREO)) {
        format->numChannels = 1;
        if (Fits(mask, format)) return true;
    }
    if (format->sampleRate > static_cast<int64_t>(max_rate)) {
        format->sampleRate = static_cast<int32_t>(max_rate);
        if (max_rate > 0 && Fits(mask, format)) return true;
    } else {
        for (int64_t rate = requested + requested; rate <= max_rate; rate += requested) {
            format->sampleRate = static_cast<int32_t>(rate);
            if (Fits(mask, format)) return true;
        }
    }
    for (int32_t rate : kStandardRates) {
        if (rate <= requested) continue;
        format->sampleRate = rate;
        if (Fits(mask, format)) return true;
    }
    return false;
}

VELMSOUNDDEVICE Select(VELMSOUNDDEVICE wanted, _audio_format *format, const Direction &d)
{
    if (!format || format->sampleRate <= 0 || format->numChannels <= 0) return nullptr;
    VELMSOUND_Initialize();
    if (VelmSoundDeviceInfoCount == 0) {
        BLDEBUG_Warning(-1, "%s", d.no_device);
        return nullptr;
    }
    const VELMSOUNDDEVICEINFO *info = PickDevice(wanted, d);
    if (!info) {
        BLDEBUG_Warning(-1, "%s", d.no_direction);
        return nullptr;
    }
    const uint32_t mask = d.capture ? info->captureFormats : info->playbackFormats;
    const uint32_t max_rate = d.capture ? info->maxCaptureRate : info->maxPlaybackRate;
    return Negotiate(format, mask, max_rate) ? info->handle : nullptr;
}

} // namespace

VELMSOUNDDEVICE VELMSOUND_SelectPlaybackDevice(VELMSOUNDDEVICE device, _audio_format *format)
{
    return Select(device, format, kPlayback);
}

VELMSOUNDDEVICE VELMSOUND_SelectCaptureDevice(VELMSOUNDDEVICE device, _audio_format *format)
{
    return Select(device, format, kCapture);
}
