// The process-wide device list: start-up, refresh from the back-ends, the
// exported copy for the shell, lookups.
#include "sound/sound_devices.hpp"

#include "outside/base/blbase.h"

#include <cstring>

VELMSOUNDDEVICEINFO *VelmSoundDeviceInfoList[VELMSOUND_MAX_DEVICES];
int32_t VelmSoundDeviceInfoCount = 0;

namespace velmsound {

namespace {

bool initialised = false;
std::mutex list_lock;

void CloseHandles(VELMSOUNDDEVICE device)
{
    if (device->playbackDevice && device->ops.ClosePlaybackDevice) device->ops.ClosePlaybackDevice(device->playbackDevice);
    if (device->captureDevice && device->ops.CloseCaptureDevice) device->ops.CloseCaptureDevice(device->captureDevice);
    device->playbackDevice = nullptr;
    device->captureDevice = nullptr;
}

// Frees every record that is not present, keeping the others in order.
int RemoveAbsent()
{
    int removed = 0, kept = 0;
    for (int i = 0; i < device_count; ++i) {
        VELMSOUNDDEVICE device = device_list[i];
        if (device->present) {
            device_list[kept++] = device;
            continue;
        }
        CloseHandles(device);
        DeleteDevice(device);
        ++removed;
    }
    for (int i = kept; i < device_count; ++i) device_list[i] = nullptr;
    device_count = kept;
    return removed;
}

void Publish()
{
    for (int i = 0; i < VELMSOUND_MAX_DEVICES; ++i) {
        if (i < device_count) {
            device_list[i]->index = static_cast<uint32_t>(i);
            VelmSoundDeviceInfoList[i] = &device_list[i]->info;
        } else {
            VelmSoundDeviceInfoList[i] = nullptr;
        }
    }
    VelmSoundDeviceInfoCount = device_count;
}

} // namespace

VELMSOUNDDEVICE device_list[VELMSOUND_MAX_DEVICES];
int device_count = 0;

bool IsListed(VELMSOUNDDEVICE device)
{
    if (!device) return false;
    for (int i = 0; i < device_count; ++i)
        if (device_list[i] == device) return true;
    return false;
}

VELMSOUNDDEVICE NewDevice(uint32_t kind, const char *identity, const char *name, const char *description)
{
    auto *device = new _VELMSOUNDDEVICE;
    device->info.handle = device;
    device->info.kind = kind;
    device->info.name = device->info.nameBuffer;
    device->info.description = device->info.descriptionBuffer;
    CopyLine(device->identityBuffer, identity);
    CopyLine(device->info.nameBuffer, name);
    CopyLine(device->info.descriptionBuffer, description);
    return device;
}

void DeleteDevice(VELMSOUNDDEVICE device)
{
    delete device;
}

namespace {

void *PlaybackHandle(VELMSOUNDDEVICE device) { return device->info.playback ? device : nullptr; }
void *CaptureHandle(VELMSOUNDDEVICE device) { return device->info.capture ? device : nullptr; }
void CloseHandle(void *) {}

} // namespace

void UseDeviceAsHandle(VELMSOUNDDEVICE device)
{
    device->ops.OpenPlaybackDevice = PlaybackHandle;
    device->ops.ClosePlaybackDevice = CloseHandle;
    device->ops.OpenCaptureDevice = CaptureHandle;
    device->ops.CloseCaptureDevice = CloseHandle;
}

VELMSOUNDDEVICE FindDevice(VELMSOUNDDEVICE *list, int count, uint32_t kind, const char *identity)
{
    for (int i = 0; i < count; ++i)
        if (list[i]->info.kind == kind && std::strcmp(list[i]->identity, identity) == 0) return list[i];
    return nullptr;
}

int AppendDevice(VELMSOUNDDEVICE *list, int count, VELMSOUNDDEVICE device)
{
    if (count >= VELMSOUND_MAX_DEVICES) {
        BLDEBUG_Warning(-1, "(VELMSOUND)_AppendDevice: Device list full, %s left out!", device->info.name);
        DeleteDevice(device);
        return count;
    }
    device->present = 1;
    device->added = 1;
    list[count] = device;
    return count + 1;
}

void CopyLine(char *buffer, const char *text)
{
    size_t n = 0;
    if (text)
        while (text[n] && text[n] != '\n' && text[n] != '\r' && n + 1 < VELMSOUND_NAME_SIZE) ++n;
    if (n) std::memcpy(buffer, text, n);
    buffer[n] = '\0';
}

bool UsableStreamFormat(const _audio_format *format)
{
    return format && format->bitsPerSample == 16 && (format->numChannels == 1 || format->numChannels == 2) &&
           format->sampleRate > 0 && format->sampleRate <= AUDIO_MAX_SAMPLE_RATE;
}

} // namespace velmsound

using namespace velmsound;

int VELMSOUND_Initialize(void)
{
    if (!initialised) {
        std::lock_guard guard(list_lock);
        device_count = 0;
        for (auto &slot : device_list) slot = nullptr;
        Publish();
        VELMSOUND_WINDOWS_DIRECTSOUND_Initialize();
        initialised = true;
    }
    return VELMSOUND_UpdateDeviceList();
}

// Runs last at shut-down, after the base services are gone: plain C++ only.
void VELMSOUND_Finalize(void)
{
    if (!initialised) return;
    std::lock_guard guard(list_lock);
    initialised = false;
    for (int i = 0; i < device_count; ++i) {
        CloseHandles(device_list[i]);
        DeleteDevice(device_list[i]);
        device_list[i] = nullptr;
    }
    device_count = 0;
    Publish();
    VELMSOUND_WINDOWS_DIRECTSOUND_Finalize();
}

int VELMSOUND_UpdateDeviceList(void)
{
    if (!initialised) return 0;
    int added = 0, removed = 0;
    {
        std::lock_guard guard(list_lock);
        for (int i = 0; i < device_count; ++i) device_list[i]->present = device_list[i]->added = 0;
        device_count = VELMSOUND_WINDOWS_DIRECTSOUND_EnumerateDevices(device_list, device_count);
        if (BLSETTINGS_GetIntEx(nullptr, "libvelm.sound.testdevice=[%d]", 0))
            device_count = VELMSOUND_TEST_EnumerateDevices(device_list, device_count);
        removed = RemoveAbsent();
        for (int i = 0; i < device_count; ++i) {
            if (!device_list[i]->added) continue;
            BLNOTIFY_SendEvent(nullptr, nullptr, 0, VELMSOUND_NOTIFY_DEVICE_ADDED, &device_list[i]->info, nullptr);
            device_list[i]->added = 0;
            ++added;
        }
        Publish();
    }
    if (added + removed == 0) return 0;
    BLNOTIFY_SendEvent(nullptr, nullptr, 0, VELMSOUND_NOTIFY_LIST_CHANGED, nullptr, nullptr);
    return 1;
}

VELMSOUNDDEVICE VELMSOUND_GetSoundDeviceByName(const char *name, int capture)
{
    if (!name || std::strcmp(name, "default") == 0) return nullptr;
    for (int i = 0; i < VelmSoundDeviceInfoCount; ++i) {
        const VELMSOUNDDEVICEINFO *info = VelmSoundDeviceInfoList[i];
        if (std::strcmp(info->name, name) == 0 && (capture ? info->capture : info->playback)) return info->handle;
    }
    return nullptr;
}

int VELMSOUND_SupportPlayback(void)
{
    for (int i = 0; i < VelmSoundDeviceInfoCount; ++i)
        if (VelmSoundDeviceInfoList[i]->playback) return 1;
    return 0;
}

int VELMSOUND_SupportCapture(void)
{
    for (int i = 0; i < VelmSoundDeviceInfoCount; ++i)
        if (VelmSoundDeviceInfoList[i]->capture) return 1;
    return 0;
}
