#include "core/velmaudio.h"
#include "edit/velmcustomtrack.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>

TEST(CustomTrackOptions, DecodeTokensNumbersAndCentres)
{
    EXPECT_EQ(VELMDEFINES_DecodeCustomTrackOption("no horz grid|Show_Rgn_Label"), 0x81u);
    EXPECT_EQ(VELMDEFINES_DecodeCustomTrackOption("17"), 17u);
    EXPECT_EQ(VELMDEFINES_DecodeCustomTrackOption("ALIGNLABELCENTER"), 0u);
    EXPECT_EQ(VELMDEFINES_DecodeCustomTrackOption(nullptr), 0u);
}

TEST(CustomTrackOptions, EncodeRoundTripsAndStaysInsideTheBuffer)
{
    const uint32_t flags = VELMTRACK_NOHORZGRID | VELMTRACK_SHOWRGNCOMMENT | VELMTRACK_ALLOWPARTIALTEXT;
    char text[128];
    ASSERT_EQ(VELMDEFINES_EncodeCustomTrackOption(flags | VELMTRACK_FIRST_VISIBLE, text, sizeof text), 1);
    EXPECT_STREQ(text, "|NOHORZGRID||SHOWRGNCOMMENT||ALLOWPARTIALTEXT|");
    EXPECT_EQ(VELMDEFINES_DecodeCustomTrackOption(text), flags);

    char small[10];
    std::memset(small, 'x', sizeof small);
    ASSERT_EQ(VELMDEFINES_EncodeCustomTrackOption(flags, small, 6), 1);
    EXPECT_STREQ(small, "|NOHO");
    EXPECT_EQ(small[6], 'x');
    EXPECT_EQ(VELMDEFINES_EncodeCustomTrackOption(flags, nullptr, 6), 0);
}

TEST(CustomTrackTable, AddFindRemove)
{
    _audio_format format = AUDIO_InitFormat(8000, 1, 16);
    VELMAUDIO doc = VELMAUDIO_New(&format);
    ASSERT_NE(doc, nullptr);
    EXPECT_EQ(VELMAUDIO_NumCustomTracks(doc), 1);
    EXPECT_STREQ(VELMAUDIO_CustomTrackIdentifierInPosition(doc, 0), "default");

    EXPECT_EQ(VELMAUDIO_AddCustomTrack(doc, "words"), 1);
    EXPECT_EQ(VELMAUDIO_AddCustomTrack(doc, "phones"), 2);
    EXPECT_EQ(VELMAUDIO_AddCustomTrack(doc, "words"), 1);
    EXPECT_EQ(VELMAUDIO_NumCustomTracks(doc), 3);

    // Removing the first moves the last into its place; its number is reused next.
    EXPECT_EQ(VELMAUDIO_RemoveCustomTrack(doc, "default"), 1);
    EXPECT_STREQ(VELMAUDIO_CustomTrackIdentifierInPosition(doc, 0), "phones");
    EXPECT_EQ(VELMAUDIO_FindCustomTrackId(doc, "phones"), 2);
    EXPECT_EQ(VELMAUDIO_FindCustomTrackId(doc, "default"), -1);
    EXPECT_EQ(VELMAUDIO_AddCustomTrack(doc, "notes"), 0);
    EXPECT_STREQ(VELMAUDIO_GetCustomTrackUniqId(doc, 0), "notes");
    EXPECT_EQ(VELMAUDIO_GetCustomTrackUniqId(doc, 5), nullptr);

    for (int i = 0; i < 5; ++i) EXPECT_GE(VELMAUDIO_AddCustomTrack(doc, ("t" + std::to_string(i)).c_str()), 0);
    EXPECT_EQ(VELMAUDIO_NumCustomTracks(doc), 8);
    EXPECT_EQ(VELMAUDIO_AddCustomTrack(doc, "ninth"), -1);
    EXPECT_EQ(VELMAUDIO_CustomTrackInPosition(doc, 8), nullptr);
    EXPECT_EQ(VELMAUDIO_AddCustomTrack(nullptr, "x"), -1);
    EXPECT_TRUE(VELMAUDIO_Close(doc));
}

TEST(CustomTrackTable, LongIdentifiersAreCut)
{
    _audio_format format = AUDIO_InitFormat(8000, 1, 16);
    VELMAUDIO doc = VELMAUDIO_New(&format);
    const std::string longname(600, 'a');
    const int id = VELMAUDIO_AddCustomTrack(doc, longname.c_str());
    ASSERT_GE(id, 0);
    EXPECT_EQ(std::strlen(VELMAUDIO_GetCustomTrackUniqId(doc, id)), 255u);
    VELMAUDIO_Close(doc);
}

TEST(CustomTrackSwitches, SettingsPerIdentifier)
{
    _audio_format format = AUDIO_InitFormat(8000, 1, 16);
    VELMAUDIO doc = VELMAUDIO_New(&format);
    ASSERT_EQ(VELMAUDIO_AddCustomTrack(doc, "words"), 1);
    EXPECT_STREQ(VELMAUDIO_CustomTrackLabel(doc, "words"), "words"); // the identifier by default
    ASSERT_TRUE(VELMAUDIO_SetCustomTrackLabel(doc, "words", "Words"));
    EXPECT_STREQ(VELMAUDIO_CustomTrackLabel(doc, "words"), "Words");
    EXPECT_TRUE(VELMAUDIO_CustomTrackNotifyChanges(doc, "words"));
    ASSERT_TRUE(VELMAUDIO_SetCustomTrackNotifyChanges(doc, "words", 0x100)); // only the low byte counts
    EXPECT_FALSE(VELMAUDIO_CustomTrackNotifyChanges(doc, "words"));
    EXPECT_TRUE(VELMAUDIO_EditableCustomTrack(doc, "words"));
    ASSERT_TRUE(VELMAUDIO_SetCustomTrackReadOnly(doc, "words", 1));
    EXPECT_FALSE(VELMAUDIO_EditableCustomTrack(doc, "words"));
    EXPECT_TRUE(VELMAUDIO_EditableCustomTrack(doc, "nosuchtrack"));
    EXPECT_TRUE(VELMAUDIO_EditableCustomTrack(doc, nullptr));

    EXPECT_FALSE(VELMAUDIO_VisibleCustomTrack(doc, "words"));
    ASSERT_TRUE(VELMAUDIO_ShowCustomTrack(doc, "words"));
    EXPECT_TRUE(VELMAUDIO_VisibleCustomTrack(doc, "words"));
    ASSERT_TRUE(VELMAUDIO_HideCustomTrack(doc, "words"));
    EXPECT_FALSE(VELMAUDIO_VisibleCustomTrack(doc, "words"));

    EXPECT_EQ(VELMAUDIO_GetCustomTrackProperty(doc, 1, 1), 24);
    EXPECT_EQ(VELMAUDIO_GetCustomTrackProperty(doc, 5, 2), 0); // no track holds number 5
    EXPECT_EQ(VELMAUDIO_GetCustomTrackProperty(doc, 1, 42), 0);
    EXPECT_STREQ(VELMAUDIO_CustomTrackLabelInPosition(doc, 1), "words"); // from the global settings
    EXPECT_EQ(VELMAUDIO_CustomTrackLabelInPosition(doc, 7), nullptr);
    VELMAUDIO_Close(doc);
}
