// The play cursor as the view shows it, and the channel displays' mute
// indicators, which follow the renderer's layout.
#include <gtest/gtest.h>

#include <string>

#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "testaudio.hpp"
#include "view_support.hpp"

namespace {

constexpr int kRate = 8000;

// Control bits of the first seven slots, two bits each, slot 0 lowest.
uint32_t indicators(VELMAUDIO doc)
{
    uint32_t bits = 0;
    for (int slot = 0; slot < 7; ++slot)
        for (uint32_t control = 1; control <= 2; ++control)
            if (VELMAUDIO_IsChannelControlVisible(doc, slot, control)) bits |= control << (2 * slot);
    return bits;
}

class PlayCursor : public ::testing::Test {
protected:
    VELMAUDIO open(int channels)
    {
        const std::string path = dir.file("tone" + std::to_string(channels) + ".wav");
        if (!velmtest::write_audio(path, viewtest::speech_like(kRate, channels, 1.0), kRate, channels)) return nullptr;
        VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO");
        if (doc) docs.push_back(doc);
        return doc;
    }
    void TearDown() override
    {
        for (VELMAUDIO doc : docs) VELMAUDIO_Close(doc);
    }

    velmtest::TempDir dir;
    std::vector<VELMAUDIO> docs;
};

TEST_F(PlayCursor, HiddenUntilPlaybackShowsIt)
{
    VELMAUDIO doc = open(1);
    ASSERT_NE(doc, nullptr);
    EXPECT_EQ(VELMAUDIO_GetPlayCursorPosition(doc), -1);
    EXPECT_EQ(VELMAUDIO_PlayCursorVisible(doc), 0);
    EXPECT_EQ(VELMAUDIO_HidePlayCursor(doc), 1);
    EXPECT_EQ(VELMAUDIO_GetPlayCursorPosition(nullptr), -1);
    EXPECT_EQ(VELMAUDIO_PlayCursorVisible(nullptr), 0);
    EXPECT_EQ(VELMAUDIO_HidePlayCursor(nullptr), 0);
}

TEST_F(PlayCursor, MuteIndicatorsNeedARenderer)
{
    VELMAUDIO doc = open(2);
    ASSERT_NE(doc, nullptr);
    EXPECT_EQ(VELMAUDIO_UpdateMuteChannelControlsVisibility(doc, 1), 0);
    EXPECT_EQ(indicators(doc), 0u);
    EXPECT_EQ(VELMAUDIO_UpdateMuteChannelControlsVisibility(nullptr, 1), 0);
}

TEST_F(PlayCursor, MuteIndicatorsFollowTheWaveformDisplays)
{
    viewtest::ensure_application();
    VELMAUDIO stereo = open(2), mono = open(1);
    ASSERT_NE(stereo, nullptr);
    ASSERT_NE(mono, nullptr);
    viewtest::Canvas canvas(640, 400);
    for (VELMAUDIO doc : {stereo, mono}) {
        ASSERT_TRUE(VELMAUDIO_SetDrawOption(doc, 0x3 | 0x10000));
        ASSERT_TRUE(canvas.draw(doc));
    }

    // Stereo, both kinds: the first channel's display shows indicator 1, the
    // second's indicator 2; spectrogram and navigator displays none.
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(stereo, 1));
    EXPECT_EQ(indicators(stereo), 0x1u | (0x2u << 2));
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(mono, 1));
    EXPECT_EQ(indicators(mono), 0x1u);

    // Nothing plays, so an unforced refresh takes every indicator away.
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(stereo, 0));
    EXPECT_EQ(indicators(stereo), 0u);

    // With one active channel only its display carries indicator 1.
    ASSERT_TRUE(VELMAUDIO_SetChannelMask(stereo, 0x2));
    ASSERT_TRUE(canvas.draw(stereo));
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(stereo, 1));
    EXPECT_EQ(indicators(stereo), 0x1u << 2);

    // Without waveform displays the indicators are left as they are.
    ASSERT_TRUE(VELMAUDIO_ClrDrawOption(stereo, 0x1));
    ASSERT_TRUE(canvas.draw(stereo));
    ASSERT_TRUE(VELMAUDIO_ChangeChannelControlVisibility(stereo, 3, 2, 1));
    ASSERT_TRUE(VELMAUDIO_UpdateMuteChannelControlsVisibility(stereo, 0));
    EXPECT_EQ(indicators(stereo), (0x1u << 2) | (0x2u << 6));
}

} // namespace
