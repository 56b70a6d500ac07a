// The device list, lookups, device and format selection, and the check
// that a stream's device is still listed.
#include "sound_support.hpp"

#include <gtest/gtest.h>

#include <algorithm>

using namespace soundtest;

namespace {

const char *kTestDevice = "Audio IO Test Device";

struct Events {
    static int Handle(const BLNotifyEvent *event, void *self)
    {
        auto *events = static_cast<Events *>(self);
        if (event->event == VELMSOUND_NOTIFY_DEVICE_ADDED)
            events->added.push_back(static_cast<const VELMSOUNDDEVICEINFO *>(event->data1)->name);
        if (event->event == VELMSOUND_NOTIFY_LIST_CHANGED) events->changed++;
        return 1;
    }
    Events() { BLNOTIFY_AddHandler(nullptr, &Events::Handle, this); }
    ~Events() { BLNOTIFY_DelHandler(nullptr, &Events::Handle, this); }

    std::vector<std::string> added;
    int changed = 0;
};

class SoundDevices : public ::testing::Test {
protected:
    void SetUp() override { VELMSOUND_Initialize(); }
    void TearDown() override
    {
        BLSETTINGS_DeleteEx(nullptr, "libvelm.sound.testdevice");
        VELMSOUND_UpdateDeviceList();
    }

    // Lists the test device, with the given playback mask and maximum rate.
    VELMSOUNDDEVICE PlugTestDevice(uint32_t playback_formats = 0x11FFF00, int max_rate = 96000)
    {
        BLSETTINGS_DeleteEx(nullptr, "libvelm.sound.testdevice");
        VELMSOUND_UpdateDeviceList();
        BLSETTINGS_ChangeEx(nullptr, "libvelm.sound.test.playbackformats=%u", playback_formats);
        BLSETTINGS_ChangeEx(nullptr, "libvelm.sound.test.maxrate=%d", max_rate);
        BLSETTINGS_ChangeEx(nullptr, "libvelm.sound.testdevice=1");
        VELMSOUND_UpdateDeviceList();
        BLSETTINGS_DeleteEx(nullptr, "libvelm.sound.test.playbackformats");
        BLSETTINGS_DeleteEx(nullptr, "libvelm.sound.test.maxrate");
        return VELMSOUND_GetSoundDeviceByName(kTestDevice, 0);
    }

    // The rate and channels that selection on the test device settles on, or
    // 0 when it refuses.
    std::pair<int, int> Negotiated(uint32_t rates, int max_rate, int rate, int channels = 2)
    {
        VELMSOUNDDEVICE device = PlugTestDevice(0x1300000 | rates, max_rate);
        _audio_format format = Format(rate, channels);
        if (VELMSOUND_SelectPlaybackDevice(device, &format) != device) return {0, format.sampleRate};
        return {format.sampleRate, format.numChannels};
    }
};

TEST_F(SoundDevices, TheVirtualDeviceIsAlwaysListed)
{
    VELMSOUNDDEVICE device = VELMSOUND_GetSoundDeviceByName("Virtual Device", 0);
    ASSERT_NE(device, nullptr);
    ASSERT_GE(VelmSoundDeviceInfoCount, 1);
    const VELMSOUNDDEVICEINFO *info = nullptr;
    for (int i = 0; i < VelmSoundDeviceInfoCount; ++i)
        if (VelmSoundDeviceInfoList[i]->handle == device) info = VelmSoundDeviceInfoList[i];
    ASSERT_NE(info, nullptr);
    EXPECT_EQ(info->kind, 1u);
    EXPECT_TRUE(info->playback && info->capture);
    EXPECT_EQ(info->playbackFormats, 0x13FFF00u);
    EXPECT_EQ(info->captureFormats, 0x13FFF00u);
    EXPECT_EQ(info->maxPlaybackRate, 96000u);
    EXPECT_STREQ(info->description, "");
    EXPECT_EQ(VELMSOUND_GetSoundDeviceByName("Virtual Device", 1), device);
    EXPECT_TRUE(VELMSOUND_SupportPlayback());
    EXPECT_TRUE(VELMSOUND_SupportCapture());
}

TEST_F(SoundDevices, ARefreshThatFindsTheSameDevicesChangesNothing)
{
    Events events;
    EXPECT_FALSE(VELMSOUND_UpdateDeviceList());
    EXPECT_FALSE(VELMSOUND_Initialize());
    EXPECT_TRUE(events.added.empty());
    EXPECT_EQ(events.changed, 0);
}

TEST_F(SoundDevices, PluggingADeviceInAndOutNotifiesOnce)
{
    const int before = VelmSoundDeviceInfoCount;
    Events events;
    Setting plugged{"libvelm.sound.testdevice", "1"};
    EXPECT_TRUE(VELMSOUND_UpdateDeviceList());
    ASSERT_EQ(events.added, std::vector<std::string>{kTestDevice});
    EXPECT_EQ(events.changed, 1);
    ASSERT_EQ(VelmSoundDeviceInfoCount, before + 1);
    const VELMSOUNDDEVICEINFO *info = VelmSoundDeviceInfoList[before];
    EXPECT_STREQ(info->name, kTestDevice);
    EXPECT_STREQ(info->description, "VelmAudio");
    EXPECT_EQ(info->kind, 0u);
    EXPECT_EQ(info->playbackFormats, 0x11FFF00u);
    EXPECT_EQ(info->captureFormats, 0x13FFF00u);
    EXPECT_FALSE(VELMSOUND_UpdateDeviceList());
    EXPECT_EQ(events.changed, 1);

    BLSETTINGS_DeleteEx(nullptr, "libvelm.sound.testdevice");
    EXPECT_TRUE(VELMSOUND_UpdateDeviceList());
    EXPECT_EQ(events.added.size(), 1u);
    EXPECT_EQ(events.changed, 2);
    EXPECT_EQ(VelmSoundDeviceInfoCount, before);
    EXPECT_EQ(VelmSoundDeviceInfoList[before], nullptr);
    EXPECT_EQ(VELMSOUND_GetSoundDeviceByName(kTestDevice, 0), nullptr);
}

TEST_F(SoundDevices, LookupByNameIsExactAndByDirection)
{
    EXPECT_EQ(VELMSOUND_GetSoundDeviceByName(nullptr, 0), nullptr);
    EXPECT_EQ(VELMSOUND_GetSoundDeviceByName("virtual device", 0), nullptr);
    EXPECT_EQ(VELMSOUND_GetSoundDeviceByName("Virtual", 0), nullptr);
    BLSETTINGS_ChangeEx(nullptr, "libvelm.sound.test.captureformats=0");
    VELMSOUNDDEVICE device = PlugTestDevice();
    BLSETTINGS_DeleteEx(nullptr, "libvelm.sound.test.captureformats");
    ASSERT_NE(device, nullptr);
    EXPECT_EQ(VELMSOUND_GetSoundDeviceByName(kTestDevice, 1), device); // the flag, not the mask, counts
}

TEST_F(SoundDevices, DefaultNeverMatchesADeviceOfThatName)
{
    BLSETTINGS_ChangeEx(nullptr, "libvelm.sound.test.name=default");
    VELMSOUNDDEVICE device = PlugTestDevice();
    BLSETTINGS_DeleteEx(nullptr, "libvelm.sound.test.name");
    EXPECT_EQ(device, nullptr);
    bool listed = false;
    for (int i = 0; i < VelmSoundDeviceInfoCount; ++i)
        listed |= std::strcmp(VelmSoundDeviceInfoList[i]->name, "default") == 0;
    ASSERT_TRUE(listed);
    EXPECT_EQ(VELMSOUND_GetSoundDeviceByName("default", 0), nullptr);
    EXPECT_EQ(VELMSOUND_GetSoundDeviceByName("default", 1), nullptr);
}

TEST_F(SoundDevices, SelectionPrefersTheAskedDeviceThenTheDefault)
{
    VELMSOUNDDEVICE test = PlugTestDevice();
    VELMSOUNDDEVICE virt = VELMSOUND_GetSoundDeviceByName("Virtual Device", 0);
    _audio_format format = Format(44100, 2);
    EXPECT_EQ(VELMSOUND_SelectPlaybackDevice(virt, &format), virt);
    EXPECT_EQ(VELMSOUND_SelectCaptureDevice(virt, &format), virt);
    // Both are defaults here; the last one listed wins.
    EXPECT_EQ(VELMSOUND_SelectPlaybackDevice(nullptr, &format), test);
    EXPECT_EQ(VELMSOUND_SelectCaptureDevice(nullptr, &format), test);
    EXPECT_EQ(VELMSOUND_SelectPlaybackDevice(virt, nullptr), nullptr);
    _audio_format silly = Format(0, 2);
    EXPECT_EQ(VELMSOUND_SelectPlaybackDevice(virt, &silly), nullptr);
    silly = Format(44100, 0);
    EXPECT_EQ(VELMSOUND_SelectCaptureDevice(virt, &silly), nullptr);
}

TEST_F(SoundDevices, ChannelsFollowTheDevice)
{
    EXPECT_EQ(Negotiated(0x400, 96000, 44100, 1), std::make_pair(44100, 1));
    // The test device's own mask has no mono bit.
    VELMSOUNDDEVICE device = PlugTestDevice();
    _audio_format mono = Format(44100, 1);
    EXPECT_EQ(VELMSOUND_SelectPlaybackDevice(device, &mono), device);
    EXPECT_EQ(mono.numChannels, 2);
    _audio_format stereo = Format(44100, 2);
    device = PlugTestDevice(0x1200400);
    EXPECT_EQ(VELMSOUND_SelectPlaybackDevice(device, &stereo), device);
    EXPECT_EQ(stereo.numChannels, 1);
    EXPECT_EQ(stereo.sampleRate, 44100);
}

TEST_F(SoundDevices, RateSearchTriesMultiplesBeforeTheStandardRates)
{
    // 32000 is twice 16000 and comes before 22050, although 22050 is lower.
    EXPECT_EQ(Negotiated(0x800 | 0x1000, 48000, 16000), std::make_pair(32000, 2));
    // 88200 is past a maximum of 48000: the standard rates above 44100 follow.
    EXPECT_EQ(Negotiated(0x200 | 0x100, 48000, 44100), std::make_pair(48000, 2));
    // 64000 and 96000 fail, 128000 passes the maximum; 44100 and 48000 follow.
    EXPECT_EQ(Negotiated(0x8000 | 0x200, 96000, 32000), std::make_pair(48000, 2));
    // A rate above the maximum becomes the maximum.
    EXPECT_EQ(Negotiated(0x400, 44100, 96000), std::make_pair(44100, 2));
    // Standard rates below the request are never tried.
    EXPECT_EQ(Negotiated(0x8000, 96000, 44100), std::make_pair(0, 192000));
}

TEST_F(SoundDevices, AStreamOnARemovedDeviceFailsTheSanityCheck)
{
    VELMSOUNDDEVICE device = PlugTestDevice();
    ASSERT_NE(device, nullptr);
    ToneSource source(Tone(8000, 2, 0.1));
    const _audio_format format = Format(8000, 2);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenPlayback(device, 0.05f, &ToneSource::Fill, &source, &format);
    ASSERT_NE(stream, nullptr);
    EXPECT_TRUE(VELMSOUND_IsPlaying(stream));

    BLSETTINGS_DeleteEx(nullptr, "libvelm.sound.testdevice");
    ASSERT_TRUE(VELMSOUND_UpdateDeviceList());
    LogLines log(BLDEBUG_KIND_ERROR);
    EXPECT_FALSE(VELMSOUND_Start(stream));
    EXPECT_FALSE(VELMSOUND_IsPlaying(stream));
    EXPECT_EQ(VELMSOUND_PlayCursorPosition(stream), 0);
    EXPECT_FALSE(VELMSOUND_Close(stream)); // released all the same
    ASSERT_EQ(log.lines.size(), 4u);
    EXPECT_EQ(log.lines[0], "(VELMSOUND)_CheckDeviceSanity: Device sanity check failed!");
    EXPECT_EQ(source.calls.load(), 0);
}

TEST_F(SoundDevices, AFullListRefusesAnotherDevice)
{
    VELMSOUNDDEVICE full[VELMSOUND_MAX_DEVICES];
    std::fill(std::begin(full), std::end(full), VELMSOUND_GetSoundDeviceByName("Virtual Device", 0));
    ASSERT_NE(full[0], nullptr);
    LogLines warnings(BLDEBUG_KIND_WARNING);
    EXPECT_EQ(VELMSOUND_TEST_EnumerateDevices(full, VELMSOUND_MAX_DEVICES), VELMSOUND_MAX_DEVICES);
    EXPECT_EQ(VELMSOUND_TEST_EnumerateDevices(full, VELMSOUND_MAX_DEVICES + 1), VELMSOUND_MAX_DEVICES + 1);
    EXPECT_EQ(warnings.lines, std::vector<std::string>{
                            "(VELMSOUND)_AppendDevice: Device list full, Audio IO Test Device left out!"});
}

TEST_F(SoundDevices, NullStreamsAndDevicesAreRefused)
{
    EXPECT_FALSE(VELMSOUND_Start(nullptr));
    EXPECT_FALSE(VELMSOUND_Stop(nullptr));
    EXPECT_FALSE(VELMSOUND_Pause(nullptr));
    EXPECT_FALSE(VELMSOUND_Close(nullptr));
    EXPECT_EQ(VELMSOUND_PlayCursorPosition(nullptr), -1);
    EXPECT_EQ(VELMSOUND_CaptureCursorPosition(nullptr), 0);
    EXPECT_FALSE(VELMSOUND_IsPlaying(nullptr));
    EXPECT_FALSE(VELMSOUND_IsCapturing(nullptr));
    EXPECT_EQ(VELMSOUND_WINDOWS_DIRECTSOUND_EnumerateDevices(nullptr, 3), 3);
    EXPECT_EQ(VELMSOUND_TEST_EnumerateDevices(nullptr, 0), 0);
}

} // namespace
