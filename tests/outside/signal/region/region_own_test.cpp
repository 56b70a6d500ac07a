// The library's own region format keeps everything and reads back losslessly.
#include <gtest/gtest.h>

#include "outside/signal/region/region_files.hpp"
#include "tests/outside/signal/region/region_test_support.hpp"

using velmsig::Region;
using velmsig::RegionSet;

namespace {

class OwnFiles : public ::testing::Test {
protected:
    TestHost host;
    RegionSet set{&host};
    ScratchDir dir;
    std::vector<std::string> problems;

    int read_into(RegionSet &target, const std::string &text)
    {
        const std::string path = dir.file("in.vrgn");
        write_bytes(path, text);
        return velmsig::read_region_file(target, path.c_str(), "AUTO", &problems);
    }
};

TEST_F(OwnFiles, EverythingComesBack)
{
    const int words = set.track_number("words");
    const int phones = set.track_number("phones");
    ASSERT_EQ(words, 1);
    ASSERT_EQ(phones, 2);
    Region *sentence = set.add(1.0 / 3.0, 7.1, 0, AUDIOREGION_FLAG_READONLY, "sentence",
                               "tab\there, line\nbreak, back\\slash and \\N");
    Region *word = set.add(1.0 / 3.0, 2.0, words, AUDIOREGION_FLAG_HIDETEXT, "", nullptr);
    Region *phone = set.add(0.5, 1.0, phones, AUDIOREGION_FLAG_SELECTED, nullptr, "\\N");
    set.add(8.0, 8.0, 5, 0, "point on an unnamed track", nullptr);
    ASSERT_TRUE(AUDIOREGION_SetParent(word, sentence));
    ASSERT_TRUE(AUDIOREGION_SetParent(phone, word));

    const std::string path = dir.file("all.vrgn");
    ASSERT_EQ(velmsig::write_region_file(set, path.c_str(), nullptr), AUDIO_ERROR_NONE);

    // Another document knows the tracks under other numbers.
    TestHost other_host;
    other_host.tracks = {{"default", 0}, {"phones", 1}};
    RegionSet other(&other_host);
    ASSERT_EQ(velmsig::read_region_file(other, path.c_str(), "VRGN", &problems),
              AUDIO_ERROR_NONE);
    EXPECT_TRUE(problems.empty());
    EXPECT_EQ(other_host.tracks["words"], 2);

    const auto on_phones = other.track_regions(1);
    ASSERT_EQ(on_phones.size(), 1u);
    const Region *p = on_phones[0];
    EXPECT_EQ(AUDIOREGION_GetLabel(p), nullptr);
    EXPECT_STREQ(AUDIOREGION_GetComment(p), "\\N");
    EXPECT_TRUE(AUDIOREGION_IsSelected(p));
    const Region *w = static_cast<const Region *>(AUDIOREGION_GetParent(p));
    ASSERT_NE(w, nullptr);
    EXPECT_EQ(AUDIOREGION_GetTrackId(w), 2);
    EXPECT_STREQ(AUDIOREGION_GetLabel(w), "");
    EXPECT_EQ(w->flags & AUDIOREGION_FLAG_HIDETEXT, AUDIOREGION_FLAG_HIDETEXT);
    EXPECT_EQ(AUDIOREGION_Begin(w), 1.0 / 3.0);   // exactly
    const Region *s = static_cast<const Region *>(AUDIOREGION_TopParent(p));
    EXPECT_STREQ(AUDIOREGION_GetComment(s), "tab\there, line\nbreak, back\\slash and \\N");
    EXPECT_FALSE(AUDIOREGION_CanDelete(s));
    EXPECT_EQ(AUDIOREGION_End(s), AUDIOREGION_End(sentence));
    EXPECT_EQ(other.track_regions(5).size(), 1u);

    // Writing the copy again gives the same file, byte for byte, once the
    // track numbers agree.
    TestHost same_host;
    same_host.tracks = host.tracks;
    RegionSet again(&same_host);
    ASSERT_EQ(velmsig::read_region_file(again, path.c_str(), nullptr, &problems), 0);
    const std::string second = dir.file("again.vrgn");
    ASSERT_EQ(velmsig::write_region_file(again, second.c_str(), "VRGN"), AUDIO_ERROR_NONE);
    EXPECT_EQ(read_bytes(second), read_bytes(path));
}

TEST_F(OwnFiles, BadLinesAreSkippedAndTrackLabelsAnnounced)
{
    const std::string text =
        "VELM-REGIONS\t1\r\n"
        "# written by hand\n"
        "track\t1\tnotes\tMy notes\n"
        "track\t99\tbad\t\\N\n"
        "region\t0\t-\t1\t0\t1\t2\tgood\t\\N\n"
        "region\t1\t0\t1\t0\t1.5\t1.8\tchild\t\\N\n"
        "region\t2\t7\t1\t0\t3\t4\torphan\t\\N\n"
        "region\t3\t-\t1\tzz\t3\t4\tbad flags\t\\N\n"
        "region\t4\t-\t1\t0\t3\t4\tbad \\q escape\t\\N\n"
        "region\t0\t-\t1\t0\t3\t4\tsame id\t\\N\n"
        "something\telse\n";
    ASSERT_EQ(read_into(set, text), AUDIO_ERROR_NONE);
    EXPECT_EQ(problems.size(), 6u);
    ASSERT_EQ(host.labels.size(), 1u);
    EXPECT_EQ(host.labels[0], std::make_pair(std::string("notes"), std::string("My notes")));
    const auto regions = set.track_regions(host.tracks["notes"]);
    ASSERT_EQ(regions.size(), 3u);
    EXPECT_STREQ(AUDIOREGION_GetLabel(AUDIOREGION_GetParent(regions[1])), "good");
    EXPECT_EQ(AUDIOREGION_GetParent(regions[2]), nullptr);
}

TEST_F(OwnFiles, HeadersDecide)
{
    const std::string path = dir.file("x.vrgn");
    write_bytes(path, "VELM-REGIONS\t2\nregion\t0\t-\t0\t0\t1\t2\tx\t\\N\n");
    EXPECT_EQ(velmsig::read_region_file(set, path.c_str(), "VRGN", &problems),
              AUDIO_ERROR_UNSUPPORTED_FORMAT);
    write_bytes(path, "1\t2\tplain labels\n");
    EXPECT_EQ(velmsig::read_region_file(set, path.c_str(), "VRGN", &problems),
              AUDIO_ERROR_CORRUPT_DATA);
    EXPECT_EQ(set.size(), 0u);
}

}  // namespace
