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
