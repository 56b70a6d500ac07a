// The platform back-end's entry points: the system devices, then the
// virtual device, matched to known records by the PCM name ("virtual" for
// the virtual one).
#include "platform/sound_backends.hpp"
#include "sound/sound_internal.hpp"

#include <cstring>

int VELMSOUND_WINDOWS_DIRECTSOUND_Initialize(void)
{
    return 1;
}

int VELMSOUND_WINDOWS_DIRECTSOUND_Finalize(void)
{
    return 1;
}

int VELMSOUND_WINDOWS_DIRECTSOUND_EnumerateDevices(VELMSOUNDDEVICE *list, int count)
{
    if (!list || count < 0 || count > VELMSOUND_MAX_DEVICES) return count;
    count = velmsound::EnumerateAlsaDevices(list, count);
    bool system_playback = false, system_capture = false;
    for (int i = 0; i < count; ++i) {
        const VELMSOUNDDEVICEINFO &info = list[i]->info;
        if (!list[i]->present || info.kind != VELMSOUND_KIND_SYSTEM) continue;
        if (std::strcmp(list[i]->identity, velmsound::kVirtualIdentity) == 0) continue;
        system_playback |= info.defaultPlayback != 0;
        system_capture |= info.defaultCapture != 0;
    }
    return velmsound::EnumerateVirtualDevice(list, count, !system_playback, !system_capture);
}
