// Metadata objects: named fields, free texts and binary entries.
#include <gtest/gtest.h>

#include <cstring>
#include <vector>

#include "outside/signal/audiometadata.h"

namespace {

TEST(Metadata, NamedFieldsAreFreeTextsUnderFixedKeys) {
    AUDIOMETADATA *m = AUDIOMETADATA_Create();
    ASSERT_NE(m, nullptr);
    EXPECT_TRUE(AUDIOMETADATA_IsEmpty(m));
    EXPECT_EQ(AUDIOMETADATA_GetTitle(m), nullptr);
    EXPECT_EQ(AUDIOMETADATA_SetTitle(m, "Song"), 1);
    EXPECT_EQ(AUDIOMETADATA_SetArtist(m, "Artist"), 1);
    EXPECT_EQ(AUDIOMETADATA_SetAlbumArtist(m, "Various"), 1);
    EXPECT_EQ(AUDIOMETADATA_SetAlbumName(m, "Album"), 1);
    EXPECT_EQ(AUDIOMETADATA_SetComposer(m, "Composer"), 1);
    EXPECT_EQ(AUDIOMETADATA_SetTrackNum(m, "3"), 1);
    EXPECT_EQ(AUDIOMETADATA_SetTotalAlbumTracks(m, "12"), 1);
    EXPECT_EQ(AUDIOMETADATA_SetDiscNum(m, "1"), 1);
    EXPECT_EQ(AUDIOMETADATA_SetTotalAlbumDiscs(m, "2"), 1);
    EXPECT_EQ(AUDIOMETADATA_SetGenre(m, "Folk"), 1);
    EXPECT_STREQ(AUDIOMETADATA_GetTitle(m), "Song");
    EXPECT_STREQ(AUDIOMETADATA_GetArtist(m), "Artist");
    EXPECT_STREQ(AUDIOMETADATA_GetAlbumArtist(m), "Various");
    EXPECT_STREQ(AUDIOMETADATA_GetAlbumName(m), "Album");
    EXPECT_STREQ(AUDIOMETADATA_GetComposer(m), "Composer");
    EXPECT_STREQ(AUDIOMETADATA_GetTrackNum(m), "3");
    EXPECT_STREQ(AUDIOMETADATA_GetTotalAlbumTracks(m), "12");
    EXPECT_STREQ(AUDIOMETADATA_GetDiscNum(m), "1");
    EXPECT_STREQ(AUDIOMETADATA_GetTotalAlbumDiscs(m), "2");
    EXPECT_STREQ(AUDIOMETADATA_GetGenre(m), "Folk");
    EXPECT_STREQ(AUDIOMETADATA_GetMetaData(m, "TITLE"), "Song");
    EXPECT_FALSE(AUDIOMETADATA_IsEmpty(m));

    EXPECT_EQ(AUDIOMETADATA_SetMetaData(m, "Comment", "take two"), 1);
    EXPECT_STREQ(AUDIOMETADATA_GetMetaData(m, "comment"), "take two");
    EXPECT_EQ(AUDIOMETADATA_SetMetaData(m, "comment", nullptr), 1);
    EXPECT_EQ(AUDIOMETADATA_GetMetaData(m, "comment"), nullptr);

    AUDIOMETADATA *copy = AUDIOMETADATA_Duplicate(m);
    AUDIOMETADATA_SetTitle(m, "Changed");
    EXPECT_STREQ(AUDIOMETADATA_GetTitle(copy), "Song");
    EXPECT_EQ(AUDIOMETADATA_Destroy(copy), 1);
    EXPECT_EQ(AUDIOMETADATA_Destroy(m), 1);
}

TEST(Metadata, BinaryEntries) {
    AUDIOMETADATA *m = AUDIOMETADATA_Create();
    const unsigned char cover[] = {0x89, 'P', 'N', 'G', 0, 1, 2};
    EXPECT_EQ(AUDIOMETADATA_SetBinaryMetaData(m, "cover", cover, sizeof cover), 1);
    int size = -1;
    const void *got = AUDIOMETADATA_GetBinaryMetaData(m, "COVER", &size);
    ASSERT_NE(got, nullptr);
    ASSERT_EQ(size, 7);
    EXPECT_EQ(std::memcmp(got, cover, 7), 0);
    EXPECT_EQ(AUDIOMETADATA_SetBinaryMetaData(m, "empty", cover, 0), 1);
    EXPECT_NE(AUDIOMETADATA_GetBinaryMetaData(m, "empty", &size), nullptr);
    EXPECT_EQ(size, 0);
    EXPECT_EQ(AUDIOMETADATA_SetBinaryMetaData(m, "cover", nullptr, 0), 1);
    EXPECT_EQ(AUDIOMETADATA_GetBinaryMetaData(m, "cover", &size), nullptr);
    EXPECT_EQ(size, 0);
    EXPECT_EQ(AUDIOMETADATA_SetBinaryMetaData(m, "x", cover, -1), 0);
    EXPECT_EQ(AUDIOMETADATA_SetBinaryMetaData(m, "x", cover, AUDIOMETADATA_MAX_BINARY_SIZE + 1), 0);
    AUDIOMETADATA_Destroy(m);
}

TEST(Metadata, NullHandlesAndKeys) {
    EXPECT_EQ(AUDIOMETADATA_SetTitle(nullptr, "x"), 0);
    EXPECT_EQ(AUDIOMETADATA_GetTitle(nullptr), nullptr);
    EXPECT_EQ(AUDIOMETADATA_Destroy(nullptr), 0);
    EXPECT_EQ(AUDIOMETADATA_Duplicate(nullptr), nullptr);
    AUDIOMETADATA *m = AUDIOMETADATA_Create();
    EXPECT_EQ(AUDIOMETADATA_SetTitle(m, nullptr), 0);
    EXPECT_EQ(AUDIOMETADATA_SetMetaData(m, nullptr, "x"), 0);
    EXPECT_EQ(AUDIOMETADATA_SetMetaData(m, "", "x"), 0);
    EXPECT_EQ(AUDIOMETADATA_GetMetaData(m, nullptr), nullptr);
    AUDIOMETADATA_Destroy(m);
}

}  // namespace
