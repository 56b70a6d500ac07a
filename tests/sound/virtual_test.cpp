// Playback and capture through the virtual device, at eight times real
// time, checked against the files it writes and reads.
#include "sound_support.hpp"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

using namespace soundtest;

namespace {

class VirtualDevice : public ::testing::Test {
protected:
    void SetUp() override
    {
        VELMSOUND_Initialize();
        playback = VELMSOUND_GetSoundDeviceByName("Virtual Device", 0);
        capture = VELMSOUND_GetSoundDeviceByName("Virtual Device", 1);
        ASSERT_NE(playback, nullptr);
        ASSERT_EQ(capture, playback);
    }

    // Plays source to its end and closes the stream; the played samples.
    std::vector<int16_t> PlayOut(ToneSource &source, const _audio_format &format)
    {
        VELMSOUNDSTREAM stream = VELMSOUND_OpenPlayback(playback, 0.05f, &ToneSource::Fill, &source, &format);
        EXPECT_NE(stream, nullptr);
        if (!stream) return {};
        EXPECT_TRUE(VELMSOUND_Start(stream));
        EXPECT_TRUE(WaitFor([&] { return !VELMSOUND_IsPlaying(stream); }));
        EXPECT_TRUE(VELMSOUND_Close(stream));
        return ReadPcm16(out_path);
    }

    velmtest::TempDir dir;
    std::string out_path = dir.file("played.wav");
    Setting speed{"libvelm.sound.virtual.speed", "8"};
    Setting out{"libvelm.sound.virtual.playbackfile", out_path};
    VELMSOUNDDEVICE playback = nullptr;
    VELMSOUNDDEVICE capture = nullptr;
};

// The leading part is exactly the data, the rest (if any) silence.
void ExpectPlayed(const std::vector<int16_t> &played, const std::vector<int16_t> &data)
{
    ASSERT_GE(played.size(), data.size());
    EXPECT_TRUE(std::equal(data.begin(), data.end(), played.begin()));
    EXPECT_TRUE(std::all_of(played.begin() + static_cast<long>(data.size()), played.end(),
                            [](int16_t s) { return s == 0; }));
}

TEST_F(VirtualDevice, PlaysASineIntoItsFileSampleForSample)
{
    ToneSource source(Tone(44100, 2, 0.3));
    int rate = 0, channels = 0;
    const std::vector<int16_t> played = PlayOut(source, Format(44100, 2));
    ReadPcm16(out_path, &rate, &channels);
    EXPECT_EQ(rate, 44100);
    EXPECT_EQ(channels, 2);
    ExpectPlayed(played, source.samples);
}

TEST_F(VirtualDevice, PlaysMonoAtAnotherRate)
{
    ToneSource source(Tone(8000, 1, 0.25, 1000.0));
    ExpectPlayed(PlayOut(source, Format(8000, 1)), source.samples);
}

TEST_F(VirtualDevice, FramePositionCountsWhatWasHeard)
{
    ToneSource source(Tone(22050, 1, 0.4));
    const _audio_format format = Format(22050, 1);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenPlayback(playback, 0.05f, &ToneSource::Fill, &source, &format);
    ASSERT_NE(stream, nullptr);
    EXPECT_EQ(VELMSOUND_PlayCursorPosition(stream), 0);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return !VELMSOUND_IsPlaying(stream); }));
    const int64_t frames = VELMSOUND_PlayCursorPosition(stream);
    EXPECT_GT(frames, static_cast<int64_t>(source.samples.size()));
    EXPECT_TRUE(VELMSOUND_Close(stream));
    EXPECT_EQ(static_cast<int64_t>(ReadPcm16(out_path).size()), frames);
}

TEST_F(VirtualDevice, PauseKeepsThePositionAndResumeLosesNothing)
{
    ToneSource source(Tone(44100, 2, 4.0));
    const _audio_format format = Format(44100, 2);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenPlayback(playback, 0.05f, &ToneSource::Fill, &source, &format);
    ASSERT_NE(stream, nullptr);
    EXPECT_FALSE(VELMSOUND_Pause(stream)); // not playing yet
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return VELMSOUND_PlayCursorPosition(stream) > 4410; }));
    ASSERT_TRUE(VELMSOUND_Pause(stream));
    const int64_t paused_at = VELMSOUND_PlayCursorPosition(stream);
    std::this_thread::sleep_for(std::chrono::milliseconds(60));
    EXPECT_EQ(VELMSOUND_PlayCursorPosition(stream), paused_at);
    EXPECT_TRUE(VELMSOUND_IsPlaying(stream));
    EXPECT_FALSE(VELMSOUND_Pause(stream));
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return !VELMSOUND_IsPlaying(stream); }));
    EXPECT_GT(VELMSOUND_PlayCursorPosition(stream), paused_at);
    EXPECT_TRUE(VELMSOUND_Close(stream));
    ExpectPlayed(ReadPcm16(out_path), source.samples);
}

TEST_F(VirtualDevice, ACallbackWithoutDataEndsTheStreamByItself)
{
    ToneSource source({});
    const std::vector<int16_t> played = PlayOut(source, Format(48000, 2));
    EXPECT_EQ(source.calls.load(), 1);
    EXPECT_FALSE(played.empty());
    EXPECT_TRUE(std::all_of(played.begin(), played.end(), [](int16_t s) { return s == 0; }));
}

TEST_F(VirtualDevice, StopEndsPlaybackEarly)
{
    ToneSource source(Tone(44100, 1, 5.0));
    const _audio_format format = Format(44100, 1);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenPlayback(playback, 0.05f, &ToneSource::Fill, &source, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return VELMSOUND_PlayCursorPosition(stream) > 0; }));
    EXPECT_TRUE(VELMSOUND_Stop(stream));
    EXPECT_FALSE(VELMSOUND_IsPlaying(stream));
    EXPECT_FALSE(VELMSOUND_Stop(stream));
    EXPECT_FALSE(VELMSOUND_Start(stream));
    const int64_t stopped_at = VELMSOUND_PlayCursorPosition(stream);
    EXPECT_LT(stopped_at, static_cast<int64_t>(source.samples.size()));
    EXPECT_TRUE(VELMSOUND_Close(stream));
    const std::vector<int16_t> played = ReadPcm16(out_path);
    ASSERT_EQ(static_cast<int64_t>(played.size()), stopped_at);
    EXPECT_TRUE(std::equal(played.begin(), played.end(), source.samples.begin()));
}

TEST_F(VirtualDevice, ClosingAPausedStreamReturns)
{
    ToneSource source(Tone(44100, 2, 3.0));
    const _audio_format format = Format(44100, 2);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenPlayback(playback, 0.05f, &ToneSource::Fill, &source, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(VELMSOUND_Pause(stream));
    EXPECT_TRUE(VELMSOUND_Close(stream));
}

TEST_F(VirtualDevice, PlaysOnWhenItsFileCannotBeWritten)
{
    const std::string nowhere = dir.file("missing/folder/played.wav");
    Setting out_elsewhere{"libvelm.sound.virtual.playbackfile", nowhere};
    LogLines errors(BLDEBUG_KIND_ERROR);
    ToneSource source(Tone(8000, 1, 0.1));
    const _audio_format format = Format(8000, 1);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenPlayback(playback, 0.05f, &ToneSource::Fill, &source, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return !VELMSOUND_IsPlaying(stream); }));
    EXPECT_GE(VELMSOUND_PlayCursorPosition(stream), 800);
    EXPECT_TRUE(VELMSOUND_Close(stream));
    EXPECT_FALSE(std::filesystem::exists(nowhere));
    ASSERT_EQ(errors.lines.size(), 1u);
    EXPECT_NE(errors.lines[0].find(nowhere), std::string::npos);
}

TEST_F(VirtualDevice, RefusesFormatsOtherThan16Bit)
{
    ToneSource source({});
    _audio_format format = AUDIO_InitFormat(44100, 2, 24);
    EXPECT_EQ(VELMSOUND_OpenPlayback(playback, 0.05f, &ToneSource::Fill, &source, &format), nullptr);
    format = Format(44100, 2);
    EXPECT_EQ(VELMSOUND_OpenPlayback(playback, 0.05f, nullptr, &source, &format), nullptr);
    EXPECT_EQ(VELMSOUND_OpenPlayback(nullptr, 0.05f, &ToneSource::Fill, &source, &format), nullptr);
    EXPECT_EQ(VELMSOUND_OpenPlayback(playback, 0.0f, &ToneSource::Fill, &source, &format), nullptr);
    EXPECT_EQ(VELMSOUND_OpenPlayback(playback, 1e9f, &ToneSource::Fill, &source, &format), nullptr);
    EXPECT_EQ(VELMSOUND_OpenCapture(capture, std::nanf(""), &ToneSource::Fill, &source, &format), nullptr);
}

class VirtualCapture : public VirtualDevice {
protected:
    std::string in_path = dir.file("recorded.wav");
    Setting in{"libvelm.sound.virtual.capturefile", in_path};
};

TEST_F(VirtualCapture, DeliversTheFileInOrderThenSilence)
{
    const std::vector<int16_t> tone = Tone(22050, 1, 0.5, 300.0);
    ASSERT_TRUE(WritePcm16(in_path, tone, 22050, 1));
    CaptureSink sink;
    const _audio_format format = Format(22050, 1);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenCapture(capture, 0.05f, &CaptureSink::Take, &sink, &format);
    ASSERT_NE(stream, nullptr);
    EXPECT_TRUE(VELMSOUND_IsCapturing(stream));
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return sink.Size() > tone.size() + 1000; }));
    EXPECT_TRUE(VELMSOUND_Stop(stream));
    EXPECT_FALSE(VELMSOUND_IsCapturing(stream));
    EXPECT_TRUE(VELMSOUND_Close(stream));
    ASSERT_TRUE(std::equal(tone.begin(), tone.end(), sink.samples.begin()));
    EXPECT_TRUE(std::all_of(sink.samples.begin() + static_cast<long>(tone.size()), sink.samples.end(),
                            [](int16_t s) { return s == 0; }));
}

TEST_F(VirtualCapture, ConvertsTheFileToTheStreamFormat)
{
    ASSERT_TRUE(WritePcm16(in_path, Tone(44100, 1, 0.2), 44100, 1));
    CaptureSink sink;
    const _audio_format format = Format(22050, 2);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenCapture(capture, 0.05f, &CaptureSink::Take, &sink, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return sink.Size() >= 2 * 4410; }));
    EXPECT_TRUE(VELMSOUND_Close(stream));
    // Both channels carry the mono file; half as many frames as the file has.
    int loud = 0;
    for (size_t i = 0; i + 1 < 2 * 4410; i += 2) {
        EXPECT_EQ(sink.samples[i], sink.samples[i + 1]);
        loud += std::abs(sink.samples[i]) > 8000;
    }
    EXPECT_GT(loud, 1000);
}

TEST_F(VirtualCapture, ARefusingConsumerEndsCapture)
{
    ASSERT_TRUE(WritePcm16(in_path, Tone(44100, 2, 0.5), 44100, 2));
    CaptureSink sink;
    sink.refuse = true;
    const _audio_format format = Format(44100, 2);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenCapture(capture, 0.05f, &CaptureSink::Take, &sink, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return !VELMSOUND_IsCapturing(stream); }));
    EXPECT_EQ(sink.calls.load(), 1);
    EXPECT_FALSE(VELMSOUND_Stop(stream));
    EXPECT_TRUE(VELMSOUND_Close(stream));
}

TEST_F(VirtualCapture, ALongBufferTimeStillCaptures)
{
    const std::vector<int16_t> tone = Tone(96000, 2, 0.1);
    ASSERT_TRUE(WritePcm16(in_path, tone, 96000, 2));
    CaptureSink sink;
    const _audio_format format = Format(96000, 2);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenCapture(capture, 10.0f, &CaptureSink::Take, &sink, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return sink.Size() >= tone.size(); }));
    EXPECT_TRUE(VELMSOUND_Close(stream));
    EXPECT_TRUE(std::equal(tone.begin(), tone.end(), sink.samples.begin()));
}

TEST_F(VirtualCapture, AFileThatIsNoAudioGivesSilence)
{
    {
        std::ofstream junk(in_path, std::ios::binary);
        junk << "RIFF\x10\0\0\0WAVEfmt this is not audio at all";
    }
    CaptureSink sink;
    const _audio_format format = Format(8000, 1);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenCapture(capture, 0.05f, &CaptureSink::Take, &sink, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    ASSERT_TRUE(WaitFor([&] { return sink.Size() >= 800; }));
    EXPECT_TRUE(VELMSOUND_Close(stream));
    EXPECT_TRUE(std::all_of(sink.samples.begin(), sink.samples.end(), [](int16_t s) { return s == 0; }));
}

TEST_F(VirtualCapture, WithoutAFileDeliversSilenceAndCannotPause)
{
    Setting none{"libvelm.sound.virtual.capturefile", ""};
    CaptureSink sink;
    const _audio_format format = Format(16000, 1);
    VELMSOUNDSTREAM stream = VELMSOUND_OpenCapture(capture, 0.05f, &CaptureSink::Take, &sink, &format);
    ASSERT_NE(stream, nullptr);
    ASSERT_TRUE(VELMSOUND_Start(stream));
    EXPECT_FALSE(VELMSOUND_Pause(stream));
    EXPECT_EQ(VELMSOUND_PlayCursorPosition(stream), 0);
    ASSERT_TRUE(WaitFor([&] { return sink.Size() >= 1600; }));
    EXPECT_TRUE(VELMSOUND_IsCapturing(stream));
    EXPECT_TRUE(VELMSOUND_Close(stream));
    EXPECT_TRUE(std::all_of(sink.samples.begin(), sink.samples.end(), [](int16_t s) { return s == 0; }));
}

} // namespace
