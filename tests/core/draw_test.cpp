// The document's draw entry point against what event handlers do meanwhile.
#include <gtest/gtest.h>

#include <string>

#include "core/velmaudio.h"
#include "testaudio.hpp"
#include "view_support.hpp"

namespace {

constexpr int kRate = 8000;

// Runs `action` from the handler of the before-draw event of an opened file.
class BeforeDraw : public ::testing::Test {
protected:
    void SetUp() override
    {
        const std::string path = dir.file("speech.wav");
        ASSERT_TRUE(velmtest::write_audio(path, viewtest::speech_like(kRate, 1, 1.0), kRate, 1));
        doc = VELMAUDIO_Open(path.c_str(), "AUTO");
        ASSERT_NE(doc, nullptr);
        VELMAUDIO_AddEventHandler(doc, handler, this);
    }
    void TearDown() override
    {
        if (!closed) VELMAUDIO_Close(doc);
    }
    static int handler(const BLNotifyEvent *event, void *user)
    {
        auto *self = static_cast<BeforeDraw *>(user);
        if (event->event == 0x2001E && self->action) self->result = self->action(self->doc);
        return 1;
    }

    velmtest::TempDir dir;
    VELMAUDIO doc = nullptr;
    int (*action)(VELMAUDIO) = nullptr;
    int result = -1;
    bool closed = false;
    viewtest::Canvas canvas{400, 200};
};

AUDIOSIGNAL *replacement = nullptr;

} // namespace

TEST_F(BeforeDraw, TheSignalStaysWhileItIsDrawn)
{
    ASSERT_GT(AUDIOSIGNAL_AppendSilence(VELMAUDIO_GetAudioSignal(doc), 800), 0);
    VELMSTATE_NotifyChanges(doc, 0);
    AUDIOSIGNAL *drawn = VELMAUDIO_GetAudioSignal(doc);
    action = VELMAUDIO_RevertToSaved;
    EXPECT_TRUE(canvas.draw(doc));
    EXPECT_EQ(result, 0);
    EXPECT_EQ(VELMAUDIO_GetAudioSignal(doc), drawn);
    EXPECT_TRUE(VELMAUDIO_HasChanges(doc));

    // Once the draw is over a revert replaces the signal.
    action = nullptr;
    EXPECT_TRUE(VELMAUDIO_RevertToSaved(doc));
    EXPECT_FALSE(VELMAUDIO_HasChanges(doc));
}

TEST_F(BeforeDraw, AClosedDocumentGoesOnceTheDrawEnds)
{
    const int registered = CountRegisteredObjects();
    // Once closed it can no longer be referenced, though the draw still holds it.
    action = [](VELMAUDIO d) { return VELMAUDIO_Close(d) && !VELMAUDIO_Reference(d) ? 1 : 0; };
    EXPECT_FALSE(canvas.draw(doc)); // nothing is drawn for a document on its way out
    EXPECT_EQ(result, 1);
    EXPECT_EQ(CountRegisteredObjects(), registered - 1);
    closed = true;
}

TEST_F(BeforeDraw, TheDrawLetsGoOfTheSignalItTook)
{
    AUDIOSIGNAL *taken = VELMAUDIO_GetAudioSignal(doc);
    replacement = AUDIOSIGNAL_DuplicateEx(taken, 0);
    ASSERT_NE(replacement, nullptr);
    action = [](VELMAUDIO d) { return VELMAUDIO_SetAudioSignal(d, replacement) ? 1 : 0; };
    canvas.draw(doc);
    ASSERT_EQ(result, 1);
    EXPECT_FALSE(AUDIOSIGNAL_ReleaseReadAccess(taken)); // nothing left held
    EXPECT_FALSE(AUDIOSIGNAL_ReleaseReadAccess(replacement));
    AUDIOSIGNAL_Destroy(taken);
}
