// Shared by the player tests: documents over short tones, the virtual
// device's output file, and a recorder of document events that can refuse.
#ifndef VELM_TESTS_PLAYER_SUPPORT_HPP
#define VELM_TESTS_PLAYER_SUPPORT_HPP

#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <vector>

#include "core/velmaudio.h"
#include "core/velmqueries.h"
#include "outside/signal/audiosignal.h"
#include "sound/velmplay.h"
#include "sound_support.hpp"

namespace playtest {

constexpr int kRate = 8000;

// Every document event, in order; answers 0 to the one code it should refuse.
struct Events {
    static int Handle(const BLNotifyEvent *event, void *self)
    {
        auto *events = static_cast<Events *>(self);
        events->codes.push_back(event->event);
        if (event->event == 0x2001D) events->playCursor.push_back(*static_cast<const int64_t *>(event->data1));
        if (event->event == VELMPLAY_NOTIFY_POSITION)
            events->positions.push_back(*static_cast<const int64_t *>(event->data1));
        return event->event == events->refuse ? 0 : 1;
    }
    int Count(uint32_t code) const
    {
        int n = 0;
        for (uint32_t c : codes) n += c == code;
        return n;
    }
    std::vector<uint32_t> codes;
    std::vector<int64_t> playCursor;
    std::vector<int64_t> positions; // of the position updates
    uint32_t refuse = 0;
};

// Plays through the virtual device into a file, eight times faster than
// real time, with the playback settings at their defaults.
class PlayerTest : public ::testing::Test {
protected:
    static void SetUpTestSuite() { VELMPLAY_Initialize(); }

    // A document over a 16-bit WAV of a tone; closed at the end of the test.
    VELMAUDIO Open(int channels, double seconds, double hz = 440.0)
    {
        const std::string path = dir.file("tone" + std::to_string(docs.size()) + ".wav");
        const auto frames = static_cast<int64_t>(kRate * seconds);
        if (!velmtest::write_audio(path, velmtest::sine(kRate, channels, frames, hz, 0.5), kRate, channels))
            return nullptr;
        VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO");
        if (doc) {
            docs.push_back(doc);
            BLNOTIFY_AddHandler(VELMAUDIO_Dispatcher(doc), Events::Handle, &events);
        }
        return doc;
    }
    void TearDown() override
    {
        for (VELMAUDIO doc : docs) VELMAUDIO_Close(doc);
    }

    // Interleaved samples [first, first + frames) of the active channels.
    static std::vector<float> Samples(VELMAUDIO doc, int64_t first, int64_t frames)
    {
        std::vector<float> out(static_cast<size_t>(frames * VELMAUDIO_NumActiveChannels(doc)));
        AUDIOSIGNAL_GetMaskedSamples(VELMAUDIO_GetAudioSignal(doc), VELMAUDIO_ActiveChannelsMask(doc), first,
                                     out.data(), frames);
        return out;
    }

    // What the device played, as floats; readable once the stream closed.
    std::vector<float> Played() const { return velmtest::read_audio(playedFile); }

    // Whether played[at ...] holds the expected samples (16-bit rounding).
    static ::testing::AssertionResult Holds(const std::vector<float> &played, size_t at,
                                            const std::vector<float> &expected)
    {
        if (played.size() < at + expected.size())
            return ::testing::AssertionFailure() << "only " << played.size() << " samples played";
        for (size_t i = 0; i < expected.size(); ++i)
            if (std::fabs(played[at + i] - expected[i]) > 1.5 / 32768.0)
                return ::testing::AssertionFailure()
                       << "sample " << at + i << " is " << played[at + i] << ", not " << expected[i];
        return ::testing::AssertionSuccess();
    }

    static bool Gone(VELMAUDIO doc)
    {
        return soundtest::WaitFor([&] { return VELMAUDIO_Player(doc) == nullptr; });
    }

    velmtest::TempDir dir;
    const std::string playedFile = dir.file("played.wav");
    soundtest::Setting device{"libvelm.playback.devicename", "Virtual Device"};
    soundtest::Setting speed{"libvelm.sound.virtual.speed", "8"};
    soundtest::Setting output{"libvelm.sound.virtual.playbackfile", playedFile};
    Events events;
    std::vector<VELMAUDIO> docs;
};

} // namespace playtest

#endif
