// Real signals for the region tests, and a document-like parent that
// answers the signal's track requests.
#ifndef REGION_SIGNAL_SUPPORT_HPP
#define REGION_SIGNAL_SUPPORT_HPP

#include <gtest/gtest.h>

#include <map>
#include <string>

#include "outside/signal/audio.h"
#include "tests/outside/signal/region/region_test_support.hpp"

inline AUDIO_FORMAT mono(int rate)
{
    AUDIO_FORMAT format{};
    format.sampleRate = rate;
    format.numChannels = 1;
    format.bitsPerSample = 16;
    return format;
}

// Answers 0x10025 (the number of a track name, adding it while fewer than
// eight exist) and 0x10026 (a track's label).
struct Document {
    std::map<std::string, int> tracks{{"default", 0}};
    std::map<std::string, std::string> labels;

    static int callback(void *parent, int code, void *data1, void *data2)
    {
        auto *doc = static_cast<Document *>(parent);
        const std::string name = static_cast<const char *>(data1);
        if (code == 0x10025) {
            auto it = doc->tracks.find(name);
            if (it == doc->tracks.end()) {
                if (doc->tracks.size() >= 8) return 0;
                it = doc->tracks.emplace(name, int(doc->tracks.size())).first;
            }
            *static_cast<int32_t *>(data2) = it->second;
            return 1;
        }
        if (code == 0x10026) doc->labels[name] = static_cast<const char *>(data2);
        return 1;
    }
};

// Ten seconds of silence at 8000 Hz, its parent a Document.
class SignalTest : public ::testing::Test {
protected:
    AUDIO_FORMAT format = mono(8000);
    AUDIOSIGNAL *signal = AUDIOSIGNAL_CreateSilence(&format, 80000);
    Document doc;
    ScratchDir dir;

    void SetUp() override
    {
        ASSERT_NE(signal, nullptr);
        ASSERT_TRUE(AUDIOSIGNAL_SetParentObject(signal, &doc, Document::callback));
        AUDIOSIGNAL_ResetLastError();
    }
    void TearDown() override { AUDIOSIGNAL_Destroy(signal); }

    AUDIOREGION *add(double begin, double end, int track = 0, const char *label = nullptr)
    {
        return AUDIOSIGNAL_AddRegionToTrackEx(signal, 0, begin, end, label, nullptr, track);
    }
};

#endif  // REGION_SIGNAL_SUPPORT_HPP
