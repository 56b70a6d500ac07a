// ALSA devices, through the "null" PCM that exists without a sound card.
#include "sound_support.hpp"

#include <gtest/gtest.h>

using namespace soundtest;

namespace {

const VELMSOUNDDEVICEINFO *Info(VELMSOUNDDEVICE device)
{
    for (int i = 0; i < VelmSoundDeviceInfoCount; ++i)
        if (VelmSoundDeviceInfoList[i]->handle == device) return VelmSoundDeviceInfoList[i];
    return nullptr;
}

// A 44.1 kHz stereo playback stream of the source, or null when the device
// does not take that format as it is.
VELMSOUNDSTREAM OpenStereoPlayback(VELMSOUNDDEVICE device, ToneSource *source)
{
    _audio_format format = Format(44100, 2);
    if (VELMSOUND_SelectPlaybackDevice(device, &format) != device || format.sampleRate != 44100) return nullptr;
    return VELMSOUND_OpenPlayback(device, 0.05f, &ToneSource::Fill, source, &format);
}

class AlsaNull : public ::testing::Test {
protected:
    void SetUp() override
    {
        device = VELMSOUND_GetSoundDeviceByName("null", 0);
        ASSERT_NE(device, nullptr);
    }

    Plugged pcms{"libvelm.sound.alsa.devices", "null"};
    VELMSOUNDDEVICE device = nullptr;
};

TEST_F(AlsaNull, IsListedWithItsCapabilities)
{
    const VELMSOUNDDEVICEINFO *info = Info(device);
    ASSERT_NE(info, nullptr);
    EXPECT_EQ(info->kind, 1u);
    EXPECT_TRUE(info->playback);
    EXPECT_TRUE(info->capture);
    EXPECT_FALSE(info->defaultPlayback);
    EXPECT_EQ(info->playbackFormats & 0x1300400u, 0x1300400u);
    EXPECT_GE(info->maxPlaybackRate, 48000u);
    EXPECT_LE(info->maxPlaybackRate, 192000u);
    EXPECT_EQ(VELMSOUND_GetSoundDeviceByName("null", 1), device);
    EXPECT_FALSE(VELMSOUND_UpdateDeviceList());
}

TEST_F(AlsaNull, PlaysAShortSoundThatEndsByItself)
{
    ToneSource source(Tone(44100, 2, 0.2));
    VELMSOUNDSTREAM stream = OpenStereoPlayback(device, &source);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return !VELMSOUND_IsPlaying(stream); }));
    EXPECT_EQ(source.offered.load(), source.samples.size());
    EXPECT_GE(VELMSOUND_PlayCursorPosition(stream), static_cast<int64_t>(source.samples.size() / 2));
    EXPECT_TRUE(VELMSOUND_Close(stream));
}

TEST_F(AlsaNull, PausesAndResumesRightAfterStart)
{
    ToneSource source(Tone(44100, 2, 0.3));
    VELMSOUNDSTREAM stream = OpenStereoPlayback(device, &source);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(VELMSOUND_Pause(stream));
    const int64_t held = VELMSOUND_PlayCursorPosition(stream);
    EXPECT_TRUE(VELMSOUND_IsPlaying(stream));
    EXPECT_EQ(VELMSOUND_PlayCursorPosition(stream), held);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return !VELMSOUND_IsPlaying(stream); }));
    EXPECT_EQ(source.offered.load(), source.samples.size());
    EXPECT_GE(VELMSOUND_PlayCursorPosition(stream), static_cast<int64_t>(source.samples.size() / 2));
    EXPECT_TRUE(VELMSOUND_Close(stream));
}

TEST_F(AlsaNull, CaptureDeliversSilence)
{
    CaptureSink sink;
    _audio_format format = Format(48000, 1);
    ASSERT_EQ(VELMSOUND_SelectCaptureDevice(device, &format), device);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenCapture(device, 0.02f, &CaptureSink::Take, &sink, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return sink.Size() >= 4800; }));
    EXPECT_TRUE(VELMSOUND_Stop(stream));
    EXPECT_TRUE(VELMSOUND_Close(stream));
    EXPECT_TRUE(std::all_of(sink.samples.begin(), sink.samples.end(), [](int16_t s) { return s == 0; }));
}

TEST_F(AlsaNull, AnUnknownPcmIsDroppedWithTheReason)
{
    LogLines log(BLDEBUG_KIND_ERROR);
    Setting more{"libvelm.sound.alsa.devices", "null,velm_no_such_pcm"};
    VELMSOUND_UpdateDeviceList();
    EXPECT_EQ(VELMSOUND_GetSoundDeviceByName("velm_no_such_pcm", 0), nullptr);
    EXPECT_EQ(VELMSOUND_GetSoundDeviceByName("null", 0), device);
    ASSERT_EQ(log.lines.size(), 2u);
    EXPECT_EQ(log.lines[0], "VELMsound_windows_directsound::_PlaybackDeviceQueryCallback | Failed to probe playback "
                             "device velm_no_such_pcm (NO SUCH DEVICE)");
    EXPECT_EQ(log.lines[1], "VELMsound_windows_directsound::_CaptureDeviceQueryCallback | Failed to probe Capture "
                             "device velm_no_such_pcm (NO SUCH DEVICE)");
}

TEST_F(AlsaNull, LeavesTheListWhenNoLongerNamed)
{
    BLSETTINGS_DeleteEx(nullptr, "libvelm.sound.alsa.devices");
    EXPECT_TRUE(VELMSOUND_UpdateDeviceList());
    EXPECT_EQ(VELMSOUND_GetSoundDeviceByName("null", 0), nullptr);
    EXPECT_NE(VELMSOUND_GetSoundDeviceByName("Virtual Device", 0), nullptr);
}

} // namespace

namespace {

// A PCM whose writes fail now and then: the stream still comes to an end.
TEST(AlsaFailing, AStreamWhoseWritesFailStillEnds)
{
    Plugged pcms{"libvelm.sound.alsa.devices", "null,file:FILE=/dev/full"};
    VELMSOUND_UpdateDeviceList();
    VELMSOUNDDEVICE device = VELMSOUND_GetSoundDeviceByName("file:FILE=/dev/full", 0);
    ASSERT_NE(device, nullptr);
    ToneSource source(Tone(44100, 2, 0.3));
    VELMSOUNDSTREAM stream = OpenStereoPlayback(device, &source);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    EXPECT_TRUE(WaitFor([&] { return !VELMSOUND_IsPlaying(stream); }));
    EXPECT_TRUE(VELMSOUND_Close(stream));
}

} // namespace
