// Label text files, as other editors write them, and format texts.
#include <gtest/gtest.h>

#include "outside/signal/region/region_files.hpp"
#include "tests/outside/signal/region/region_test_support.hpp"

using velmsig::Region;
using velmsig::RegionSet;

namespace {

class LabelFiles : public ::testing::Test {
protected:
    TestHost host;   // 8000 Hz, ten seconds
    RegionSet set{&host};
    ScratchDir dir;
    std::vector<std::string> problems;

    int read(const std::string &text, const char *format = "LABELS")
    {
        const std::string path = dir.file("labels.txt");
        write_bytes(path, text);
        return velmsig::read_region_file(set, path.c_str(), format, &problems);
    }

    std::vector<Region *> live() const { return set.track_regions(-1); }
};

TEST_F(LabelFiles, ReadsWhatOtherEditorsWrite)
{
    const std::string text =
        "0.000000\t1.500000\tintro\r\n"
        "2.250000\t2.250000\tpoint \r\n"       // point label, trailing blank
        "\\\t100.000000\t2000.000000\r\n"      // frequency range of the label above
        "3\t4.5\tspaced label here\r\n"
        "\r\n"
        "5.0\t6.0\t\r\n";                      // no text
    ASSERT_EQ(read(text), AUDIO_ERROR_NONE);
    EXPECT_TRUE(problems.empty());
    const auto regions = live();
    ASSERT_EQ(regions.size(), 4u);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(regions[0]), 1.5);
    EXPECT_STREQ(AUDIOREGION_GetLabel(regions[0]), "intro");
    EXPECT_EQ(AUDIOREGION_BeginSample(regions[1]), 18000);
    EXPECT_EQ(AUDIOREGION_NumSamples(regions[1]), 0);
    EXPECT_STREQ(AUDIOREGION_GetLabel(regions[1]), "point");
    EXPECT_STREQ(AUDIOREGION_GetLabel(regions[2]), "spaced label here");
    EXPECT_STREQ(AUDIOREGION_GetLabel(regions[3]), "");
    EXPECT_FALSE(AUDIOREGION_IsChanged(regions[0]));
    EXPECT_EQ(host.changes, 0);
}

TEST_F(LabelFiles, BadLinesAreSkippedAndReported)
{
    const std::string text =
        "\xEF\xBB\xBF" "1.0\t2.0\tgood\n"
        "one\ttwo\tbad\n"
        "1,5\t2,5\tcomma decimals\n"
        "nan\t3\tnot a number\n"
        "7.0\t8.0\talso good";                 // no final line break
    ASSERT_EQ(read(text), AUDIO_ERROR_NONE);
    ASSERT_EQ(problems.size(), 3u);
    EXPECT_NE(problems[0].find("line 2"), std::string::npos);
    const auto regions = live();
    ASSERT_EQ(regions.size(), 2u);
    EXPECT_STREQ(AUDIOREGION_GetLabel(regions[1]), "also good");
}

TEST_F(LabelFiles, BlankSeparatedAndSingleTimeLines)
{
    ASSERT_EQ(read("1.0  2.0   two words\n4.5\tcue\n"), AUDIO_ERROR_NONE);
    const auto regions = live();
    ASSERT_EQ(regions.size(), 2u);
    EXPECT_STREQ(AUDIOREGION_GetLabel(regions[0]), "two words");
    EXPECT_DOUBLE_EQ(AUDIOREGION_Length(regions[0]), 1.0);
    EXPECT_STREQ(AUDIOREGION_GetLabel(regions[1]), "cue");
    EXPECT_DOUBLE_EQ(AUDIOREGION_Length(regions[1]), 0.0);
}

TEST_F(LabelFiles, RegionsOutsideTheSignalAreClamped)
{
    ASSERT_EQ(read("9.5\t20\tlong\n-1\t0.5\tearly\n12\t13\tbeyond\n"), AUDIO_ERROR_NONE);
    const auto regions = live();
    ASSERT_EQ(regions.size(), 3u);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(regions[0]), 0.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(regions[0]), 0.5);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(regions[1]), 10.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(regions[2]), 10.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Length(regions[2]), 0.0);
}

TEST_F(LabelFiles, AFileOfOnlyBadLinesFails)
{
    EXPECT_EQ(read("garbage\n\x01\x02\x03\n"), AUDIO_ERROR_CORRUPT_DATA);
    EXPECT_EQ(read(std::string("1\t2\tx\0y\n", 9)), AUDIO_ERROR_CORRUPT_DATA);
    EXPECT_EQ(read(""), AUDIO_ERROR_NONE);
    EXPECT_TRUE(live().empty());
}

TEST_F(LabelFiles, RoundTripThroughAFile)
{
    Region *a = set.add(0.125, 1.0, 0, 0, "a\tb", "comments are not kept");
    set.add(2.0, 2.0, 3, 0, "point", nullptr);
    set.add(4.0, 5.0, 1, AUDIOREGION_FLAG_TEMPORARY, "temporary", nullptr);
    Region *gone = set.add(6.0, 7.0, 1, 0, "deleted", nullptr);
    AUDIOREGION_DeleteEx(gone, 0);
    AUDIOREGION_SetChanged(a, 1);
    const std::string path = dir.file("out.txt");
    ASSERT_EQ(velmsig::write_region_file(set, path.c_str(), nullptr), AUDIO_ERROR_NONE);
    EXPECT_EQ(read_bytes(path), "0.125000\t1.000000\ta b\n2.000000\t2.000000\tpoint\n");
    EXPECT_FALSE(AUDIOREGION_IsChanged(a));

    TestHost other_host;
    RegionSet other(&other_host);
    ASSERT_EQ(velmsig::read_region_file(other, path.c_str(), "AUTO", &problems), AUDIO_ERROR_NONE);
    const auto regions = other.track_regions(-1);
    ASSERT_EQ(regions.size(), 2u);
    EXPECT_STREQ(AUDIOREGION_GetLabel(regions[0]), "a b");
    EXPECT_EQ(AUDIOREGION_EndSample(regions[1]), 16000);
}

TEST_F(LabelFiles, ANamedTrackIsAskedForAndUsed)
{
    ASSERT_EQ(read("1\t2\tx\n3\t4\ty\n", "labels[track=words]"), AUDIO_ERROR_NONE);
    ASSERT_EQ(host.tracks.count("words"), 1u);
    const int words = host.tracks["words"];
    EXPECT_EQ(set.track_regions(words).size(), 2u);

    set.add(5.0, 6.0, 0, 0, "other track", nullptr);
    const std::string path = dir.file("words.txt");
    ASSERT_EQ(velmsig::write_region_file(set, path.c_str(), "LABELS[track=words]"),
              AUDIO_ERROR_NONE);
    EXPECT_EQ(read_bytes(path), "1.000000\t2.000000\tx\n3.000000\t4.000000\ty\n");
}

TEST_F(LabelFiles, FormatTexts)
{
    velmsig::RegionFormatText f;
    ASSERT_TRUE(velmsig::parse_region_format(" Wave [ track = a b ] ", &f));
    EXPECT_EQ(f.kind, velmsig::RegionFormat::Wave);
    EXPECT_EQ(f.track, "a b");
    ASSERT_TRUE(velmsig::parse_region_format(nullptr, &f));
    EXPECT_EQ(f.kind, velmsig::RegionFormat::Auto);
    ASSERT_TRUE(velmsig::parse_region_format("vrgn", &f));
    EXPECT_EQ(f.kind, velmsig::RegionFormat::Own);
    EXPECT_FALSE(velmsig::parse_region_format("MP3", &f));
    EXPECT_FALSE(velmsig::parse_region_format("LABELS[track=x", &f));
    EXPECT_FALSE(velmsig::parse_region_format("LABELS[track]", &f));
    EXPECT_EQ(read("1\t2\tx\n", "CSV"), AUDIO_ERROR_BAD_FORMAT_STRING);
    EXPECT_TRUE(live().empty());
}

TEST_F(LabelFiles, MissingFilesAndNamesFail)
{
    EXPECT_EQ(velmsig::read_region_file(set, dir.file("none.txt").c_str(), "LABELS", &problems),
              AUDIO_ERROR_FILE_NOT_FOUND);
    EXPECT_EQ(velmsig::read_region_file(set, nullptr, "LABELS", &problems),
              AUDIO_ERROR_BAD_ARGUMENT);
    EXPECT_EQ(velmsig::write_region_file(set, dir.file("no/such/dir.txt").c_str(), "LABELS"),
              AUDIO_ERROR_FILE_NOT_FOUND);
}

// The longest name a folder allows still takes a save, and gets its contents.
TEST_F(LabelFiles, AFileWithTheLongestNameIsSaved)
{
    set.add(1.0, 2.0, 0, 0, "long", nullptr);
    const std::string path = dir.file(std::string(251, 'n') + ".txt");
    write_bytes(path, "old contents\n");
    ASSERT_EQ(velmsig::write_region_file(set, path.c_str(), "LABELS"), AUDIO_ERROR_NONE);
    EXPECT_EQ(read_bytes(path), "1.000000\t2.000000\tlong\n");
    EXPECT_EQ(dir.names().size(), 1u);
}

TEST_F(LabelFiles, AFailedWriteLeavesNothingBehind)
{
    set.add(1.0, 2.0, 0, 0, "x", nullptr);
    // A folder cannot be replaced by a file: the rename fails.
    const std::string folder = dir.file("folder");
    std::filesystem::create_directory(folder);
    EXPECT_EQ(velmsig::write_region_file(set, folder.c_str(), "LABELS"), AUDIO_ERROR_WRITE);
    EXPECT_TRUE(std::filesystem::is_directory(folder));

    // A track the document cannot add is refused before anything is written.
    const std::string path = dir.file("keep.txt");
    write_bytes(path, "old contents\n");
    for (int i = 0; i < 8; ++i) host.tracks.emplace("t" + std::to_string(i), i + 1);
    EXPECT_EQ(velmsig::write_region_file(set, path.c_str(), "LABELS[track=ninth]"),
              AUDIO_ERROR_BAD_ARGUMENT);
    EXPECT_EQ(read_bytes(path), "old contents\n");
    EXPECT_EQ(dir.names().size(), 2u);   // the folder and keep.txt, no temporary file
}

}  // namespace
