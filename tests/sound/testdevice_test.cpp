// The timer-driven test device: streams move one buffer per timer tick,
// delivered here by pumping this thread's timers.
#include "sound_support.hpp"

#include <gtest/gtest.h>

using namespace soundtest;

namespace {

class TestDevice : public ::testing::Test {
protected:
    void SetUp() override
    {
        device = VELMSOUND_GetSoundDeviceByName("Audio IO Test Device", 0);
        ASSERT_NE(device, nullptr);
    }

    // Delivers this thread's timer ticks for a few rounds.
    static void Pump(int rounds)
    {
        for (int i = 0; i < rounds; ++i) {
            VELMNATIVE_PumpTimers();
            std::this_thread::sleep_for(std::chrono::milliseconds(3));
        }
    }

    velmtest::TempDir dir;
    std::string out_path = dir.file("test-played.wav");
    std::string in_path = dir.file("test-recorded.wav");
    Plugged enabled{"libvelm.sound.testdevice", "1"};
    Setting out{"libvelm.sound.test.playbackfile", out_path};
    Setting in{"libvelm.sound.test.capturefile", in_path};
    VELMSOUNDDEVICE device = nullptr;
};

TEST_F(TestDevice, KeepsEveryBufferTheCallbackFilled)
{
    ToneSource source(Tone(8000, 2, 0.1));
    _audio_format format = Format(8000, 2);
    ASSERT_EQ(VELMSOUND_SelectPlaybackDevice(device, &format), device);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenPlayback(device, 0.01f, &ToneSource::Fill, &source, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return !VELMSOUND_IsPlaying(stream); }));
    EXPECT_EQ(VELMSOUND_PlayCursorPosition(stream), 800);
    // Ten buffers of 80 frames, then the one that found no more data.
    EXPECT_EQ(source.calls.load(), 11);
    EXPECT_TRUE(VELMSOUND_Close(stream));
    int rate = 0, channels = 0;
    EXPECT_EQ(ReadPcm16(out_path, &rate, &channels), source.samples);
    EXPECT_EQ(rate, 8000);
    EXPECT_EQ(channels, 2);
}

TEST_F(TestDevice, PausedStreamsDoNotMove)
{
    ToneSource source(Tone(8000, 2, 1.0));
    const _audio_format format = Format(8000, 2);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenPlayback(device, 0.01f, &ToneSource::Fill, &source, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return VELMSOUND_PlayCursorPosition(stream) >= 160; }));
    ASSERT_TRUE(VELMSOUND_Pause(stream));
    const int64_t paused_at = VELMSOUND_PlayCursorPosition(stream);
    EXPECT_EQ(paused_at % 80, 0);
    Pump(10);
    EXPECT_EQ(VELMSOUND_PlayCursorPosition(stream), paused_at);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return VELMSOUND_PlayCursorPosition(stream) > paused_at; }));
    EXPECT_TRUE(VELMSOUND_Stop(stream));
    EXPECT_FALSE(VELMSOUND_IsPlaying(stream));
    EXPECT_TRUE(VELMSOUND_Close(stream));
    const std::vector<int16_t> played = ReadPcm16(out_path);
    ASSERT_GT(played.size(), static_cast<size_t>(paused_at * 2));
    EXPECT_TRUE(std::equal(played.begin(), played.end(), source.samples.begin()));
}

TEST_F(TestDevice, CaptureReadsTheFileThenSilence)
{
    const std::vector<int16_t> tone = Tone(11025, 1, 0.05, 700.0);
    ASSERT_TRUE(WritePcm16(in_path, tone, 11025, 1));
    CaptureSink sink;
    _audio_format format = Format(11025, 1);
    ASSERT_EQ(VELMSOUND_SelectCaptureDevice(device, &format), device);
    EXPECT_EQ(format.numChannels, 1);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenCapture(device, 0.01f, &CaptureSink::Take, &sink, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    EXPECT_FALSE(VELMSOUND_Pause(stream));
    ASSERT_TRUE(WaitFor([&] { return sink.Size() > tone.size() + 110; }));
    EXPECT_TRUE(VELMSOUND_IsCapturing(stream));
    EXPECT_TRUE(VELMSOUND_Stop(stream));
    EXPECT_TRUE(VELMSOUND_Close(stream));
    EXPECT_EQ(sink.samples.size() % 110, 0u); // whole buffers of 10 ms
    ASSERT_TRUE(std::equal(tone.begin(), tone.end(), sink.samples.begin()));
    EXPECT_TRUE(std::all_of(sink.samples.begin() + static_cast<long>(tone.size()), sink.samples.end(),
                            [](int16_t s) { return s == 0; }));
}

TEST_F(TestDevice, ARefusingConsumerEndsCapture)
{
    CaptureSink sink;
    sink.refuse = true;
    const _audio_format format = Format(8000, 2);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenCapture(device, 0.01f, &CaptureSink::Take, &sink, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return !VELMSOUND_IsCapturing(stream); }));
    Pump(5);
    EXPECT_EQ(sink.calls.load(), 1);
    EXPECT_TRUE(VELMSOUND_Close(stream));
}

} // namespace
