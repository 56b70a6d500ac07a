// The document lifecycle through the public API: creation, open, save, revert,
// unload, references, the close query and the events each step sends.
#include "core/velmaudio.h"
#include "core/velmnavigation.h"
#include "edit/velmregion.h"
#include "edit/velmundo.h"
#include "testaudio.hpp"

#include <gtest/gtest.h>

#include <cstring>
#include <fstream>
#include <string>
#include <vector>

namespace {

// Records every event code that reaches a dispatcher; answers `answer` to
// the close query 0x20009 and 1 to everything else.
struct EventLog {
    std::vector<uint32_t> codes;
    std::vector<void *> data1;
    int answer = 1;
    static int handler(const BLNotifyEvent *event, void *user)
    {
        auto *log = static_cast<EventLog *>(user);
        log->codes.push_back(event->event);
        log->data1.push_back(event->data1);
        return event->event == 0x20009 ? log->answer : 1;
    }
    bool saw(uint32_t code) const
    {
        for (uint32_t c : codes)
            if (c == code) return true;
        return false;
    }
    std::vector<uint32_t> global_only() const
    {
        std::vector<uint32_t> out;
        for (uint32_t c : codes)
            if ((c >= 0x20001 && c <= 0x20008)) out.push_back(c);
        return out;
    }
};

struct GlobalEvents {
    EventLog log;
    GlobalEvents() { BLNOTIFY_AddDefaultHandler(EventLog::handler, &log); }
    ~GlobalEvents() { BLNOTIFY_DelDefaultHandler(EventLog::handler, &log); }
};

_audio_format mono8k()
{
    return AUDIO_InitFormat(8000, 1, 16);
}

// Makes the document's signal differ from its file.
void modify(VELMAUDIO doc)
{
    ASSERT_GT(AUDIOSIGNAL_AppendSilence(VELMAUDIO_GetAudioSignal(doc), 100), 0);
    VELMSTATE_NotifyChanges(doc, 0);
}

} // namespace

TEST(DocumentNew, UntitledNamesCountUpAndAreNeverReused)
{
    const _audio_format f = mono8k();
    VELMAUDIO a = VELMAUDIO_New(&f);
    VELMAUDIO b = VELMAUDIO_New(&f);
    ASSERT_NE(a, nullptr);
    ASSERT_NE(b, nullptr);
    const std::string first = VELMAUDIO_GetFileName(a);
    ASSERT_EQ(first.rfind("untitled", 0), 0u);
    const int n = first == "untitled" ? 1 : std::stoi(first.substr(9));
    EXPECT_EQ(std::string(VELMAUDIO_GetFileName(b)), "untitled " + std::to_string(n + 1));
    VELMAUDIO_Close(b);
    VELMAUDIO c = VELMAUDIO_New(&f);
    EXPECT_EQ(std::string(VELMAUDIO_GetFileName(c)), "untitled " + std::to_string(n + 2));
    EXPECT_FALSE(VELMAUDIO_HasChanges(a));
    EXPECT_TRUE(VELMAUDIO_IsOpen(a));
    EXPECT_TRUE(VELMAUDIO_Editable(a));
    VELMAUDIO_Close(a);
    VELMAUDIO_Close(c);
}

TEST(DocumentNew, FromSignalOwnsOrDuplicates)
{
    const _audio_format f = mono8k();
    AUDIOSIGNAL *mine = AUDIOSIGNAL_CreateSilence(&f, 8000);
    VELMAUDIO dup = VELMAUDIO_NewFromSignal(mine, 1);
    ASSERT_NE(dup, nullptr);
    EXPECT_NE(VELMAUDIO_GetAudioSignal(dup), mine);
    VELMAUDIO_Close(dup);
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(mine), 8000); // still ours

    VELMAUDIO owner = VELMAUDIO_NewFromSignal(mine, 0);
    ASSERT_NE(owner, nullptr);
    EXPECT_EQ(VELMAUDIO_GetAudioSignal(owner), mine);
    // A document made from a signal counts as modified from its first change notification.
    VELMSTATE_NotifyChanges(owner, 0);
    EXPECT_TRUE(VELMAUDIO_HasChanges(owner));
    EXPECT_TRUE(VELMAUDIO_Close(owner)); // no handler refuses: the signal goes with the document
    EXPECT_EQ(VELMAUDIO_NewFromSignal(nullptr, 0), nullptr);
}

TEST(DocumentOpen, MissingFileFailsWithTheMappedError)
{
    GlobalEvents events;
    velmtest::TempDir dir;
    VELMAUDIO_ResetLastError();
    EXPECT_EQ(VELMAUDIO_Open(dir.file("missing.wav").c_str(), "AUTO"), nullptr);
    EXPECT_EQ(VELMAUDIO_GetLastError(), VELM_ERROR_FILE_NOT_FOUND);
    EXPECT_TRUE(events.log.saw(0x20004));
    EXPECT_FALSE(events.log.saw(0x20003));
    EXPECT_EQ(VELMAUDIO_CreateLink("x.wav", nullptr), nullptr);
    EXPECT_EQ(VELMAUDIO_CreateLink(nullptr, "AUTO"), nullptr);
    VELMAUDIO_ResetLastError();
    EXPECT_EQ(VELMAUDIO_GetLastError(), VELM_ERROR_NONE);
}

TEST(DocumentOpen, GarbageFileFailsCleanly)
{
    velmtest::TempDir dir;
    const std::string path = dir.file("noise.wav");
    std::ofstream(path) << "this is not audio at all, just some words\n";
    EXPECT_EQ(VELMAUDIO_Open(path.c_str(), "AUTO"), nullptr);
    const int error = VELMAUDIO_GetLastError();
    EXPECT_NE(error, VELM_ERROR_NONE);
    EXPECT_NE(error, 4);
    EXPECT_FALSE(VELMAUDIO_CanOpen(path.c_str(), "AUTO", 0));
}

TEST(DocumentOpen, OpenSaveRevertSendTheirEvents)
{
    velmtest::TempDir dir;
    const std::string path = dir.file("tone.wav");
    ASSERT_TRUE(velmtest::write_audio(path, velmtest::sine(8000, 2, 4000), 8000, 2));

    GlobalEvents events;
    VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO");
    ASSERT_NE(doc, nullptr);
    EXPECT_EQ(events.log.global_only(), (std::vector<uint32_t>{0x20001, 0x20003, 0x20005, 0x20007}));
    EXPECT_EQ(events.log.data1.front(), doc);
    EXPECT_EQ(std::strstr(VELMAUDIO_GetFileFormatString(doc), "AUTO"), nullptr) << VELMAUDIO_GetFileFormatString(doc);
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(VELMAUDIO_GetAudioSignal(doc)), 4000);
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 0);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 4000);
    EXPECT_EQ(VELMAUDIO_GetStatus(doc) & (STATUS_HAS_FILE | STATUS_NOT_LOADED | STATUS_BUSY), STATUS_HAS_FILE);

    EventLog doc_events;
    VELMAUDIO_AddEventHandler(doc, EventLog::handler, &doc_events);
    modify(doc);
    EXPECT_TRUE(VELMAUDIO_HasChanges(doc));
    EXPECT_TRUE(doc_events.saw(0x20023));
    EXPECT_TRUE(doc_events.saw(0x20024));

    events.log.codes.clear();
    ASSERT_TRUE(VELMAUDIO_Save(doc));
    EXPECT_FALSE(VELMAUDIO_HasChanges(doc));
    EXPECT_TRUE(doc_events.saw(0x2002C));
    EXPECT_EQ(events.log.global_only(), (std::vector<uint32_t>{0x20006, 0x20008}));
    EXPECT_EQ(velmtest::read_audio(path).size(), 2u * 4100);

    modify(doc);
    events.log.codes.clear();
    ASSERT_TRUE(VELMAUDIO_RevertToSaved(doc));
    EXPECT_FALSE(VELMAUDIO_HasChanges(doc));
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(VELMAUDIO_GetAudioSignal(doc)), 4100);
    EXPECT_EQ(events.log.global_only(), (std::vector<uint32_t>{0x20005}));

    VELMAUDIO_SetShowInRecent(doc, 0);
    events.log.codes.clear();
    ASSERT_TRUE(VELMAUDIO_SaveAs(doc, dir.file("copy.wav").c_str(), "WAVE"));
    EXPECT_EQ(events.log.global_only(), (std::vector<uint32_t>{0x20006}));
    EXPECT_STREQ(VELMAUDIO_GetFileName(doc), dir.file("copy.wav").c_str());
    EXPECT_TRUE(VELMAUDIO_Close(doc));
}

// The undo history holds region records and block lists of the signal it
// was written against; after a revert to the saved file it must not reach
// into the signal that was dropped, nor keep a focus on its regions.
TEST(DocumentOpen, RevertLeavesNoStepsIntoTheDroppedSignal)
{
    velmtest::TempDir dir;
    const std::string path = dir.file("tone.wav");
    ASSERT_TRUE(velmtest::write_audio(path, velmtest::sine(8000, 1, 8000), 8000, 1));
    VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO");
    ASSERT_NE(doc, nullptr);
    AUDIOREGION *region = VELMAUDIO_CreateRegionEx(doc, "default", 1000, 2000, "word", nullptr, 0);
    ASSERT_NE(region, nullptr);
    ASSERT_TRUE(VELMAUDIO_SetFocusOnRegion(doc, region));
    ASSERT_TRUE(VELMAUDIO_SetRegionLabel(doc, region, "other"));
    modify(doc);
    ASSERT_GT(VELMUNDO_Count(doc), 0);

    ASSERT_TRUE(VELMAUDIO_RevertToSaved(doc));
    EXPECT_EQ(VELMUNDO_Count(doc), 0);
    EXPECT_EQ(VELMAUDIO_Undo(doc), 0);
    EXPECT_EQ(VELMAUDIO_GetRegionOnFocus(doc), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(VELMAUDIO_GetAudioSignal(doc)), 8000);
    EventLog accept;
    VELMAUDIO_AddEventHandler(doc, EventLog::handler, &accept);
    EXPECT_TRUE(VELMAUDIO_Close(doc));
}

TEST(DocumentOpen, FailedSaveChangesNothing)
{
    velmtest::TempDir dir;
    const std::string path = dir.file("tone.wav");
    ASSERT_TRUE(velmtest::write_audio(path, velmtest::sine(8000, 1, 800), 8000, 1));
    VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO");
    ASSERT_NE(doc, nullptr);
    modify(doc);
    EXPECT_FALSE(VELMAUDIO_SaveAs(doc, dir.file("no/such/folder/x.wav").c_str(), "WAVE"));
    EXPECT_STREQ(VELMAUDIO_GetFileName(doc), path.c_str());
    EXPECT_TRUE(VELMAUDIO_HasChanges(doc));
    EXPECT_EQ(velmtest::read_audio(path).size(), 800u);
    EventLog accept;
    VELMAUDIO_AddEventHandler(doc, EventLog::handler, &accept);
    EXPECT_TRUE(VELMAUDIO_Close(doc));
}

TEST(DocumentClose, UnloadAndReloadKeepTheView)
{
    velmtest::TempDir dir;
    const std::string path = dir.file("tone.wav");
    ASSERT_TRUE(velmtest::write_audio(path, velmtest::sine(8000, 1, 8000), 8000, 1));
    VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO");
    ASSERT_NE(doc, nullptr);
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 1000, 3000));

    modify(doc);
    EXPECT_EQ(VELMAUDIO_CloseEx(doc, 1), 0);
    EXPECT_TRUE(VELMAUDIO_IsOpen(doc)); // modified documents are not unloaded
    ASSERT_TRUE(VELMAUDIO_RevertToSaved(doc));
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 1000, 3000));

    EXPECT_EQ(VELMAUDIO_CloseEx(doc, 1), 0);
    EXPECT_FALSE(VELMAUDIO_IsOpen(doc));
    EXPECT_EQ(VELMAUDIO_GetStatus(doc), STATUS_HAS_FILE | STATUS_NOT_LOADED);
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 1000);
    EXPECT_EQ(VELMAUDIO_Zoom(doc, 0, 10), 0); // no signal, nothing to zoom
    ASSERT_TRUE(VELMAUDIO_OpenLink(doc));
    EXPECT_TRUE(VELMAUDIO_IsOpen(doc));
    EXPECT_FALSE(VELMAUDIO_OpenLink(doc)); // already loaded
    EXPECT_EQ(VELMAUDIO_CloseEx(doc, 7), 0);
    EXPECT_TRUE(VELMAUDIO_Close(doc));
}

TEST(DocumentClose, ReferencesAndTheCloseQuery)
{
    const _audio_format f = mono8k();
    VELMAUDIO doc = VELMAUDIO_New(&f);
    ASSERT_EQ(VELMAUDIO_Reference(doc), doc);
    EXPECT_FALSE(VELMAUDIO_Close(doc));
    EXPECT_TRUE(VELMAUDIO_IsOpen(doc));

    modify(doc);
    EventLog query;
    query.answer = 0;
    VELMAUDIO_AddEventHandler(doc, EventLog::handler, &query);
    EXPECT_FALSE(VELMAUDIO_Close(doc));
    EXPECT_TRUE(query.saw(0x20009));
    EXPECT_TRUE(VELMAUDIO_IsOpen(doc)); // fully alive
    EXPECT_TRUE(VELMAUDIO_Zoom(doc, 0, 50));
    query.answer = 2; // anything but 1 refuses
    EXPECT_FALSE(VELMAUDIO_Close(doc));
    query.answer = 1;
    EXPECT_TRUE(VELMAUDIO_Close(doc));
}

TEST(DocumentClose, AClosedDocumentCannotBeClosedOrReferencedAgain)
{
    const _audio_format f = mono8k();
    VELMAUDIO doc = VELMAUDIO_New(&f);
    ASSERT_NE(doc, nullptr);
    EXPECT_TRUE(VELMAUDIO_Close(doc));
    EXPECT_FALSE(VELMAUDIO_Close(doc));
    EXPECT_FALSE(VELMAUDIO_CloseEx(doc, 1));
    EXPECT_EQ(VELMAUDIO_Reference(doc), nullptr);
}

TEST(DocumentClose, CloseOrReferenceFromTheCloseQuery)
{
    // A handler that closes the document again while it is asked, then agrees:
    // the document goes exactly once.
    struct Reentrant {
        VELMAUDIO doc;
        int nested = -1;
        bool reference = false;
        static int handler(const BLNotifyEvent *event, void *user)
        {
            auto *self = static_cast<Reentrant *>(user);
            if (event->event != 0x20009) return 1;
            if (self->reference)
                VELMAUDIO_Reference(self->doc);
            else
                self->nested = VELMAUDIO_Close(self->doc);
            return 1;
        }
    };
    const _audio_format f = mono8k();
    Reentrant closing{VELMAUDIO_New(&f)};
    modify(closing.doc);
    VELMAUDIO_AddEventHandler(closing.doc, Reentrant::handler, &closing);
    EXPECT_TRUE(VELMAUDIO_Close(closing.doc));
    EXPECT_EQ(closing.nested, 0);

    // A handler that takes a reference while asked keeps the document alive.
    Reentrant keeping{VELMAUDIO_New(&f)};
    keeping.reference = true;
    modify(keeping.doc);
    VELMAUDIO_AddEventHandler(keeping.doc, Reentrant::handler, &keeping);
    EXPECT_FALSE(VELMAUDIO_Close(keeping.doc));
    EXPECT_TRUE(VELMAUDIO_IsOpen(keeping.doc));
    keeping.reference = false;
    VELMAUDIO_DelEventHandler(keeping.doc, Reentrant::handler, &keeping);
    EventLog agree;
    VELMAUDIO_AddEventHandler(keeping.doc, EventLog::handler, &agree);
    EXPECT_TRUE(VELMAUDIO_Close(keeping.doc));
}

TEST(DocumentOptions, OptionTexts)
{
    EXPECT_EQ(VELMDEFINES_DecodeVelmOptions(0, "editable"), OPTION_EDITABLE);
    EXPECT_EQ(VELMDEFINES_DecodeVelmOptions(OPTION_EDITABLE | 4u, " No_Editable "), 4u);
    EXPECT_EQ(VELMDEFINES_DecodeVelmOptions(0, "EDITABLE|noeditable"), 0u);
    EXPECT_EQ(VELMDEFINES_DecodeVelmOptions(6u, nullptr), 6u);
    EXPECT_EQ(VELMDEFINES_DecodeVelmOptions(0, "something|else"), 0u);
}

TEST(DocumentOptions, LinkDocumentBacksTheSettings)
{
    velmtest::TempDir dir;
    ASSERT_TRUE(velmtest::write_audio(dir.file("take.wav"), velmtest::sine(8000, 1, 800), 8000, 1));
    const std::string link = dir.file("take.velm");
    std::ofstream(link) << "[velm]\nlink.file=take.wav\nlink.options=NOEDITABLE\n";
    VELMAUDIO doc = VELMAUDIO_Open(link.c_str(), "AUTO");
    ASSERT_NE(doc, nullptr);
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(VELMAUDIO_GetAudioSignal(doc)), 800);
    EXPECT_FALSE(VELMAUDIO_Editable(doc));
    ASSERT_TRUE(VELMAUDIO_ChangeSetting(doc, "libvelm.customtrack.%s.label=%s", "default", "Words"));
    EXPECT_TRUE(VELMAUDIO_Close(doc));
    std::ifstream in(link);
    const std::string text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
    EXPECT_NE(text.find("Words"), std::string::npos) << text;
    EXPECT_NE(text.find("take.wav"), std::string::npos) << text;
}

TEST(DocumentSettings, OverrideThenGlobalThenDefault)
{
    const _audio_format f = mono8k();
    VELMAUDIO doc = VELMAUDIO_New(&f);
    EXPECT_EQ(VELMAUDIO_IntSetting(doc, "test.doc.%s=[5]", "value"), 5);
    BLSETTINGS_ChangeEx(nullptr, "test.doc.value=7");
    EXPECT_EQ(VELMAUDIO_IntSetting(doc, "test.doc.%s=[5]", "value"), 7);
    ASSERT_TRUE(VELMAUDIO_ChangeSetting(doc, "test.doc.value=%d", 9));
    EXPECT_EQ(VELMAUDIO_IntSetting(doc, "test.doc.%s=[5]", "value"), 9);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "test.doc.value"), 7);

    // While the document draws its settings overlay the global ones.
    ASSERT_TRUE(VELMAUDIO_ActivateSettings(doc));
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "test.doc.value"), 9);
    ASSERT_TRUE(VELMAUDIO_DeactivateSettings(doc));
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "test.doc.value"), 7);

    const std::string longvalue(6000, 'v'); // longer than the first formatting buffer
    ASSERT_TRUE(VELMAUDIO_ChangeSetting(doc, "test.doc.long=%s", longvalue.c_str()));
    EXPECT_EQ(std::string(VELMAUDIO_StringSetting(doc, "test.doc.long")), longvalue);
    EXPECT_EQ(VELMAUDIO_IntSetting(nullptr, "test.doc.value"), 0);
    EXPECT_EQ(VELMAUDIO_StringSetting(nullptr, "x"), nullptr);
    BLSETTINGS_DeleteEx(nullptr, "test.doc.value");
    VELMAUDIO_Close(doc);
}

TEST(DocumentNulls, EveryCallToleratesNull)
{
    EXPECT_EQ(VELMAUDIO_New(nullptr), nullptr);
    EXPECT_EQ(VELMAUDIO_Link(nullptr, "a", "b"), 0);
    EXPECT_EQ(VELMAUDIO_OpenLink(nullptr), 0);
    EXPECT_EQ(VELMAUDIO_Reference(nullptr), nullptr);
    EXPECT_EQ(VELMAUDIO_Close(nullptr), 0);
    EXPECT_EQ(VELMAUDIO_Save(nullptr), 0);
    EXPECT_EQ(VELMAUDIO_SaveAs(nullptr, "a", "b"), 0);
    EXPECT_EQ(VELMAUDIO_RevertToSaved(nullptr), 0);
    EXPECT_EQ(VELMAUDIO_GetAudioSignal(nullptr), nullptr);
    EXPECT_EQ(VELMAUDIO_AddEventHandler(nullptr, EventLog::handler, nullptr), 0);
    EXPECT_EQ(VELMAUDIO_Dispatcher(nullptr), nullptr);
    EXPECT_EQ(VELMAUDIO_ActivateSettings(nullptr), 0);
    EXPECT_EQ(VELMAUDIO_Editable(nullptr), 0);

    VELMAUDIO link = VELMAUDIO_CreateUnresolvedLink();
    ASSERT_NE(link, nullptr);
    EXPECT_EQ(VELMAUDIO_GetStatus(link) & ~STATUS_VISUAL_CHANGED, STATUS_UNRESOLVED_LINK);
    EXPECT_EQ(VELMAUDIO_Save(link), 0);
    EXPECT_EQ(VELMAUDIO_OpenLink(link), 0);
    EXPECT_EQ(VELMSTATE_NotifyChanges(link, 0), 0);
    const std::string longname(5000, 'n');
    ASSERT_TRUE(VELMAUDIO_Link(link, longname.c_str(), "AUTO"));
    EXPECT_EQ(std::strlen(VELMAUDIO_GetFileName(link)), 1023u);
    EXPECT_FALSE(VELMAUDIO_Link(link, "again.wav", "AUTO"));
    EXPECT_TRUE(VELMAUDIO_Close(link));
}

TEST(DocumentStress, HundredsOfDocumentsOpenAndClose)
{
    velmtest::TempDir dir;
    const std::string path = dir.file("tone.wav");
    ASSERT_TRUE(velmtest::write_audio(path, velmtest::sine(8000, 2, 2000), 8000, 2));
    for (int i = 0; i < 300; ++i) {
        VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO");
        ASSERT_NE(doc, nullptr);
        ASSERT_TRUE(VELMAUDIO_Close(doc));
    }
}
