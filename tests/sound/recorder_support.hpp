// Recording tests: a capture file played by the virtual device at eight
// times real time, and documents to record into.
#ifndef VELM_TESTS_RECORDER_SUPPORT_HPP
#define VELM_TESTS_RECORDER_SUPPORT_HPP

#include <gtest/gtest.h>

#include <chrono>
#include <cmath>
#include <functional>
#include <string>
#include <thread>
#include <vector>

#include "core/velmqueries.h"
#include "platform/nativetimer.h"
#include "sound/velmrecord.h"
#include "testaudio.hpp"

namespace rectest {

constexpr int kRate = 8000;
constexpr int64_t kCaptureFrames = 4000; // half a second
// The capture file holds 16-bit samples: what comes back may differ from the
// frames written by the rounding plus the writer's scale, never by more.
constexpr double kPcm16Tolerance = 2.0 / 32768.0;

// A 440 Hz sine whose amplitude grows across the file, so that frames
// shifted by whole periods do not match.
inline std::vector<float> swelling_sine(int rate, int channels, int64_t frames)
{
    std::vector<float> out = velmtest::sine(rate, channels, frames, 440.0, 1.0);
    for (int64_t i = 0; i < frames; ++i)
        for (int c = 0; c < channels; ++c)
            out[static_cast<size_t>(i * channels + c)] *= static_cast<float>(0.1 + 0.8 * i / frames);
    return out;
}

// One channel of a signal.
inline std::vector<float> channel(VELMAUDIO doc, int c, int64_t first, int64_t count)
{
    std::vector<float> out(static_cast<size_t>(count));
    AUDIOSIGNAL_GetChannelSamples(VELMAUDIO_GetAudioSignal(doc), c, first, out.data(), count);
    return out;
}

// The largest difference between a stretch of one channel of the signal and
// the expected frames.
inline double max_difference(VELMAUDIO doc, int64_t first, const std::vector<float> &expected, int c = 0)
{
    const std::vector<float> got = channel(doc, c, first, static_cast<int64_t>(expected.size()));
    double worst = 0;
    for (size_t i = 0; i < expected.size(); ++i) worst = std::max(worst, std::fabs(double(got[i]) - expected[i]));
    return worst;
}

class Recording : public ::testing::Test {
protected:
    static void SetUpTestSuite() { VELMRECORD_Initialize(); }
    static void TearDownTestSuite() { VELMRECORD_Finalize(); }

    void SetUp() override
    {
        captured = swelling_sine(kRate, 1, kCaptureFrames);
        use_capture_file(captured, kRate, 1);
        BLSETTINGS_ChangeEx(nullptr, "libvelm.sound.virtual.speed=%d", 8);
        BLSETTINGS_ChangeEx(nullptr, "libvelm.record.devicename=Virtual Device");
    }

    void TearDown() override
    {
        for (VELMAUDIO doc : docs) VELMAUDIO_Close(doc);
    }

    void use_capture_file(const std::vector<float> &frames, int rate, int channels)
    {
        const std::string path = dir.file("capture" + std::to_string(++files) + ".wav");
        ASSERT_TRUE(velmtest::write_audio(path, frames, rate, channels));
        BLSETTINGS_ChangeEx(nullptr, "libvelm.sound.virtual.capturefile=%s", path.c_str());
    }

    // An empty document, or one holding the given frames.
    VELMAUDIO document(int rate, int channels, const std::vector<float> &frames = {})
    {
        VELMAUDIO doc = nullptr;
        if (frames.empty()) {
            _audio_format format{rate, static_cast<int16_t>(channels), 16, 0, 0};
            doc = VELMAUDIO_New(&format);
        } else {
            const std::string path = dir.file("doc" + std::to_string(++files) + ".wav");
            if (velmtest::write_audio(path, frames, rate, channels)) doc = VELMAUDIO_Open(path.c_str(), "AUTO");
        }
        if (doc) docs.push_back(doc);
        return doc;
    }

    // Delivers timer ticks every 2 ms until done() holds, at most rounds
    // times (a generous bound); false when it never did.
    static bool pump_until(const std::function<bool()> &done, int rounds = 5000)
    {
        for (int i = 0; i < rounds; ++i) {
            VELMNATIVE_PumpTimers();
            if (done()) return true;
            std::this_thread::sleep_for(std::chrono::milliseconds(2));
        }
        return false;
    }

    // Lets the devices and timers run for about fifty milliseconds.
    static void pump() { pump_until([] { return false; }, 25); }

    static bool record_until(VELMRECORDER r, int64_t position)
    {
        return pump_until([r, position] { return VELMRECORD_RecordPosition(r) >= position; });
    }

    velmtest::TempDir dir;
    std::vector<float> captured;
    std::vector<VELMAUDIO> docs;
    int files = 0;
};

// Counts the events of one code on a document's dispatcher and answers them.
struct EventProbe {
    EventProbe(VELMAUDIO doc, uint32_t code, int answer = 1) : doc(doc), code(code), answer(answer)
    {
        BLNOTIFY_AddHandler(VELMAUDIO_Dispatcher(doc), handle, this);
    }
    ~EventProbe() { BLNOTIFY_DelHandler(VELMAUDIO_Dispatcher(doc), handle, this); }

    static int handle(const BLNotifyEvent *event, void *user)
    {
        auto *self = static_cast<EventProbe *>(user);
        if (event->event != self->code) return 1;
        ++self->count;
        self->data1.push_back(event->data1);
        self->data2.push_back(event->data2);
        if (event->data1 && self->code == VELMRECORD_NOTIFY_POSITION)
            self->positions.push_back(*static_cast<const int64_t *>(event->data1));
        return self->answer;
    }

    VELMAUDIO doc;
    uint32_t code;
    int answer;
    int count = 0;
    std::vector<void *> data1, data2;
    std::vector<int64_t> positions;
};

} // namespace rectest

#endif
