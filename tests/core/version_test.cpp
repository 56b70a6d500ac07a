#include "core/velmversion.h"

#include <gtest/gtest.h>

#include <cstring>

TEST(Version, NumberFillsOnlyGivenParts)
{
    int major = -1, minor = -1, release = -1, build = -1;
    VELMVERSION_Number(&major, &minor, &release, &build);
    EXPECT_EQ(major, 2);
    EXPECT_EQ(minor, 6);
    EXPECT_EQ(release, 0);
    EXPECT_EQ(build, 2985);
    VELMVERSION_Number(nullptr, &minor, nullptr, nullptr);
    EXPECT_EQ(minor, 6);
}

TEST(Version, StringNamesTheVersionAndBuildDate)
{
    const char *text = VELMVERSION_String();
    ASSERT_NE(text, nullptr);
    EXPECT_EQ(std::strncmp(text, "libvelm version 2.6.0.2985 (built in ", 37), 0) << text;
    EXPECT_EQ(text[std::strlen(text) - 1], ')');
}
