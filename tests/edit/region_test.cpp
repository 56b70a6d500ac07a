// Regions at the document level: focus, selection, undoable edits and region files.
#include "core/velmaudio.h"
#include "core/velmnavigation.h"
#include "edit/velmcustomtrack.h"
#include "edit/velmregion.h"
#include "edit/velmselection.h"
#include "edit/velmundo.h"
#include "testaudio.hpp"

#include <gtest/gtest.h>

#include <fstream>
#include <string>

namespace {

// A 10 s document at 1 kHz with a "words" track.
struct Regions : ::testing::Test {
    VELMAUDIO doc = nullptr;
    int words = -1;
    void SetUp() override
    {
        const _audio_format f = AUDIO_InitFormat(1000, 1, 16);
        doc = VELMAUDIO_NewFromSignal(AUDIOSIGNAL_CreateSilence(&f, 10000), 0);
        ASSERT_NE(doc, nullptr);
        words = VELMAUDIO_AddCustomTrack(doc, "words");
        ASSERT_GE(words, 0);
    }
    void TearDown() override { VELMAUDIO_Close(doc); }
    AUDIOREGION *create(int64_t b, int64_t e, const char *label, int flags = 0)
    {
        return VELMAUDIO_CreateRegionEx(doc, "words", b, e, label, nullptr, flags);
    }
};

} // namespace

TEST_F(Regions, AddOverSelectionsIsOneUndoStep)
{
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 100, 200));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 400, 500));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 800, 900));
    AUDIOREGION *last = VELMAUDIO_AddRegion(doc, "words", nullptr, nullptr);
    ASSERT_NE(last, nullptr);
    EXPECT_STREQ(VELMAUDIO_GetRegionLabel(doc, last), "undef");
    EXPECT_EQ(VELMAUDIO_GetRegionBeginSample(doc, last), 800);
    EXPECT_EQ(VELMAUDIO_GetRegionTrackId(doc, last), words);
    EXPECT_EQ(VELMUNDO_Count(doc), 1);
    EXPECT_STREQ(VELMAUDIO_NextUndoLabel(doc), "Add Region");
    AUDIOREGION *first = VELMAUDIO_GetFirstRegion(doc, "words");
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_TRUE(VELMAUDIO_IsRegionDeleted(doc, last));
    EXPECT_TRUE(VELMAUDIO_IsRegionDeleted(doc, first));
}

TEST_F(Regions, MergedCreationsShareOneStep)
{
    ASSERT_NE(create(0, 100, "a"), nullptr);
    ASSERT_NE(create(200, 300, "b", VELMREGION_MERGE_UNDO), nullptr);
    ASSERT_NE(create(400, 500, "c", VELMREGION_MERGE_UNDO), nullptr);
    EXPECT_EQ(VELMUNDO_Count(doc), 1);
    ASSERT_NE(create(600, 700, "d", VELMREGION_NO_UNDO), nullptr);
    EXPECT_EQ(VELMUNDO_Count(doc), 1);
    EXPECT_EQ(VELMAUDIO_CreateRegionEx(doc, "nosuchtrack", 0, 10, "x", nullptr, 0), nullptr);
}

TEST_F(Regions, LabelsAndEdgesUndo)
{
    AUDIOREGION *r = create(1000, 2000, "hello");
    ASSERT_TRUE(VELMAUDIO_SetRegionComment(doc, r, "a note"));
    ASSERT_TRUE(VELMAUDIO_SetRegionLabel(doc, r, "bye"));
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_STREQ(VELMAUDIO_GetRegionLabel(doc, r), "hello");
    EXPECT_STREQ(VELMAUDIO_GetRegionComment(doc, r), "a note");

    ASSERT_TRUE(VELMAUDIO_ChangeRegionEnd(doc, r, 3.0, 0));
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetRegionEnd(doc, r), 3.0);
    EXPECT_STREQ(VELMAUDIO_NextUndoLabel(doc), "Change Region End");
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetRegionEnd(doc, r), 2.0);
}

TEST_F(Regions, ReadOnlyTracksRefuseEverything)
{
    AUDIOREGION *r = create(1000, 2000, "fixed");
    ASSERT_TRUE(VELMAUDIO_SetCustomTrackReadOnly(doc, "words", 1));
    const int steps = VELMUNDO_Count(doc);
    EXPECT_FALSE(VELMAUDIO_SetRegionLabel(doc, r, "changed"));
    EXPECT_FALSE(VELMAUDIO_ChangeRegionBegin(doc, r, 0.5, 0));
    EXPECT_FALSE(VELMAUDIO_DeleteRegionEx(doc, r, 0));
    EXPECT_STREQ(VELMAUDIO_GetRegionLabel(doc, r), "fixed");
    EXPECT_EQ(VELMUNDO_Count(doc), steps);
    EXPECT_TRUE(VELMAUDIO_DeleteRegionEx(doc, r, VELMREGION_INTERNAL)); // internal calls pass
    EXPECT_TRUE(VELMAUDIO_IsRegionDeleted(doc, r));
}

TEST_F(Regions, MovingTheFocusedRegionScrollsTheView)
{
    AUDIOREGION *r = create(1800, 1900, "moving");
    ASSERT_TRUE(VELMAUDIO_Zoom(doc, 1000, 2000));
    ASSERT_TRUE(VELMAUDIO_SetFocusOnRegion(doc, r));
    EXPECT_EQ(VELMAUDIO_GetRegionOnFocus(doc), r);
    ASSERT_TRUE(VELMAUDIO_OffsetRegions(doc, 300));
    EXPECT_EQ(VELMAUDIO_GetRegionBeginSample(doc, r), 2100);
    EXPECT_EQ(VELMAUDIO_ViewEnd(doc), 2200);
    EXPECT_EQ(VELMAUDIO_ViewBegin(doc), 1200);
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_EQ(VELMAUDIO_GetRegionBeginSample(doc, r), 1800);
    ASSERT_TRUE(VELMAUDIO_SetFocusOnRegion(doc, nullptr));
    EXPECT_EQ(VELMAUDIO_GetRegionOnFocus(doc), nullptr);
}

TEST_F(Regions, SelectingWalksAndDeletesOnlyEditableVisibleTracks)
{
    AUDIOREGION *a = create(100, 200, "a");
    AUDIOREGION *b = create(300, 400, "b");
    AUDIOREGION *c = create(500, 600, "c");
    EXPECT_FALSE(VELMAUDIO_SelectRegions(doc, c, VELMAUDIO_GetLastRegion(doc, "words"))); // nothing after c
    ASSERT_TRUE(VELMAUDIO_SelectRegion(doc, a));
    ASSERT_TRUE(VELMAUDIO_SelectToLastRegion(doc, nullptr));
    EXPECT_EQ(VELMAUDIO_CountSelectedRegions(doc, words), 3);
    EXPECT_EQ(VELMAUDIO_GetCurrentRegion(doc), c);

    // The track is hidden: nothing may be deleted from it, and that is no failure.
    EXPECT_TRUE(VELMAUDIO_DelSelectedRegions(doc));
    EXPECT_FALSE(VELMAUDIO_IsRegionDeleted(doc, b));
    ASSERT_TRUE(VELMAUDIO_ShowCustomTrack(doc, "words"));
    EXPECT_TRUE(VELMAUDIO_DelSelectedRegions(doc));
    EXPECT_TRUE(VELMAUDIO_IsRegionDeleted(doc, b));
    EXPECT_EQ(VELMAUDIO_GetCurrentRegion(doc), nullptr);
    ASSERT_TRUE(VELMAUDIO_Undo(doc));
    EXPECT_FALSE(VELMAUDIO_IsRegionDeleted(doc, b));
}

TEST_F(Regions, RegionFilesRoundTrip)
{
    velmtest::TempDir dir;
    const std::string labels = dir.file("marks.txt");
    std::ofstream(labels) << "1.000000\t2.000000\tfirst\n3.5\t4\tsecond\n";
    ASSERT_TRUE(VELMAUDIO_ReadRegions(doc, labels.c_str(), "LABELS"));
    EXPECT_TRUE(VELMAUDIO_GetStatus(doc) & STATUS_HAS_REGIONS_FILE);
    ASSERT_EQ(AUDIOSIGNAL_CountRegions(VELMAUDIO_GetAudioSignal(doc), 0, 0, 0, 0, nullptr), 2);
    AUDIOREGION *first = AUDIOSIGNAL_FindFirstRegion(VELMAUDIO_GetAudioSignal(doc), -1);
    ASSERT_NE(first, nullptr);
    EXPECT_STREQ(VELMAUDIO_GetRegionLabel(doc, first), "first");
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetRegionEnd(doc, first), 2.0);
    const std::string copy = dir.file("copy.txt");
    ASSERT_TRUE(VELMAUDIO_SaveRegionsAs(doc, copy.c_str(), "LABELS"));
    std::ifstream in(copy);
    const std::string text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
    EXPECT_NE(text.find("first"), std::string::npos) << text;
    EXPECT_NE(text.find("second"), std::string::npos) << text;
}

TEST(RegionNulls, FailureValues)
{
    EXPECT_EQ(VELMAUDIO_GetRegionTrackId(nullptr, nullptr), -1);
    EXPECT_EQ(VELMAUDIO_GetRegionBegin(nullptr, nullptr), -1.0);
    EXPECT_EQ(VELMAUDIO_SelectRegion(nullptr, nullptr), 0);
    EXPECT_EQ(VELMAUDIO_AddRegion(nullptr, "x", nullptr, nullptr), nullptr);
    EXPECT_EQ(VELMAUDIO_SaveRegions(nullptr), 0);
    EXPECT_EQ(VELMAUDIO_OffsetRegions(nullptr, 5), 0);
}
