// The document's draw entry point against what event handlers do meanwhile.
#include <gtest/gtest.h>

#include <string>

#include "core/velmaudio.h"
#include "testaudio.hpp"
#include "view_support.hpp"

namespace {

constexpr int kRate = 8000;

// Runs `action` from the handler of the before-draw event.
struct BeforeDraw {
    VELMAUDIO doc = nullptr;
    int (*action)(VELMAUDIO) = nullptr;
    int result = -1;
    static int handler(const BLNotifyEvent *event, void *user)
    {
        auto *self = static_cast<BeforeDraw *>(user);
        if (event->event == 0x2001E && self->action) self->result = self->action(self->doc);
        return 1;
    }
};

} // namespace

TEST(DocumentDraw, TheSignalStaysWhileItIsDrawn)
{
    velmtest::TempDir dir;
    const std::string path = dir.file("speech.wav");
    ASSERT_TRUE(velmtest::write_audio(path, viewtest::speech_like(kRate, 1, 1.0), kRate, 1));
    VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO");
    ASSERT_NE(doc, nullptr);
    ASSERT_GT(AUDIOSIGNAL_AppendSilence(VELMAUDIO_GetAudioSignal(doc), 800), 0);
    VELMSTATE_NotifyChanges(doc, 0);
    AUDIOSIGNAL *drawn = VELMAUDIO_GetAudioSignal(doc);

    BeforeDraw before{doc, VELMAUDIO_RevertToSaved};
    VELMAUDIO_AddEventHandler(doc, BeforeDraw::handler, &before);
    viewtest::Canvas canvas(400, 200);
    EXPECT_TRUE(canvas.draw(doc));
    EXPECT_EQ(before.result, 0);
    EXPECT_EQ(VELMAUDIO_GetAudioSignal(doc), drawn);
    EXPECT_TRUE(VELMAUDIO_HasChanges(doc));

    // Once the draw is over a revert replaces the signal.
    before.action = nullptr;
    EXPECT_TRUE(VELMAUDIO_RevertToSaved(doc));
    EXPECT_FALSE(VELMAUDIO_HasChanges(doc));
    VELMAUDIO_Close(doc);
}

TEST(DocumentDraw, AClosedDocumentGoesOnceTheDrawEnds)
{
    velmtest::TempDir dir;
    const std::string path = dir.file("speech.wav");
    ASSERT_TRUE(velmtest::write_audio(path, viewtest::speech_like(kRate, 1, 1.0), kRate, 1));
    VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO");
    ASSERT_NE(doc, nullptr);
    const int before_count = CountRegisteredObjects();
    BeforeDraw before{doc, VELMAUDIO_Close};
    VELMAUDIO_AddEventHandler(doc, BeforeDraw::handler, &before);
    viewtest::Canvas canvas(400, 200);
    EXPECT_FALSE(canvas.draw(doc)); // nothing is drawn for a document on its way out
    EXPECT_EQ(before.result, 1);
    EXPECT_EQ(CountRegisteredObjects(), before_count - 1);
}

TEST(DocumentDraw, TheDrawLetsGoOfTheSignalItTook)
{
    velmtest::TempDir dir;
    const std::string path = dir.file("speech.wav");
    ASSERT_TRUE(velmtest::write_audio(path, viewtest::speech_like(kRate, 1, 1.0), kRate, 1));
    VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO");
    ASSERT_NE(doc, nullptr);
    AUDIOSIGNAL *taken = VELMAUDIO_GetAudioSignal(doc);
    static AUDIOSIGNAL *replacement = nullptr;
    replacement = AUDIOSIGNAL_DuplicateEx(taken, 0);
    ASSERT_NE(replacement, nullptr);
    // The handler swaps the document's signal while the draw holds the first one.
    BeforeDraw before{doc, [](VELMAUDIO d) { return VELMAUDIO_SetAudioSignal(d, replacement) ? 1 : 0; }};
    VELMAUDIO_AddEventHandler(doc, BeforeDraw::handler, &before);
    viewtest::Canvas canvas(400, 200);
    canvas.draw(doc);
    ASSERT_EQ(before.result, 1);
    EXPECT_FALSE(AUDIOSIGNAL_ReleaseReadAccess(taken)); // nothing left held
    EXPECT_FALSE(AUDIOSIGNAL_ReleaseReadAccess(replacement));
    AUDIOSIGNAL_Destroy(taken);
    VELMAUDIO_Close(doc);
}
