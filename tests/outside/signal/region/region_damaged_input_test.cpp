// Damaged region files: whatever the bytes, reading ends with an answer and
// leaves only regions that lie inside the signal.
#include <gtest/gtest.h>

#include <random>

#include "outside/signal/region/region_files.hpp"
#include "tests/outside/signal/region/region_test_support.hpp"

using velmsig::Region;
using velmsig::RegionSet;

namespace {

// A valid file of each format, written from one set of regions.
std::vector<std::pair<std::string, std::string>> valid_files(const ScratchDir &dir)
{
    TestHost host;
    host.frames = 8000;
    RegionSet set(&host);
    set.track_number("words");
    Region *a = set.add(0.1, 0.4, 0, 0, "first", "a comment");
    Region *b = set.add(0.2, 0.3, 1, AUDIOREGION_FLAG_SELECTED, "inner", nullptr);
    set.set_parent(b, a);
    set.add(0.6, 0.6, 1, 0, "point", nullptr);

    // A WAV file to carry cues: a format chunk and a little silence.
    const std::string wav = dir.file("seed.wav");
    const std::string fmt("\x10\0\0\0\x01\0\x01\0\x40\x1f\0\0\x80\x3e\0\0\x02\0\x10\0", 20);
    std::string riff = std::string("RIFF") + std::string(4, '\0') + "WAVE" + "fmt " + fmt +
                       "data" + std::string("\x40\0\0\0", 4) + std::string(64, '\0');
    const uint32_t size = uint32_t(riff.size() - 8);
    for (int i = 0; i < 4; ++i) riff[size_t(4 + i)] = char((size >> (8 * i)) & 0xFF);
    write_bytes(wav, riff);

    std::vector<std::pair<std::string, std::string>> files;
    for (const char *format : {"LABELS", "VRGN", "WAVE"}) {
        const std::string path = std::string(format) == "WAVE" ? wav : dir.file("seed");
        EXPECT_EQ(velmsig::write_region_file(set, path.c_str(), format), AUDIO_ERROR_NONE);
        files.emplace_back(format, read_bytes(path));
    }
    return files;
}

std::string damage(std::string bytes, std::mt19937 &random)
{
    std::uniform_int_distribution<int> kind(0, 3), byte(0, 255);
    const int edits = 1 + int(random() % 8);
    for (int e = 0; e < edits && !bytes.empty(); ++e) {
        const size_t at = random() % bytes.size();
        switch (kind(random)) {
        case 0: bytes[at] = char(byte(random)); break;
        case 1: bytes.resize(at); break;
        case 2: bytes.insert(at, 1, char(byte(random))); break;
        default: bytes[at] = "\t\n\\\0-9e."[random() % 8]; break;
        }
    }
    return bytes;
}

TEST(DamagedRegionFiles, ReadingNeverLeavesRegionsOutsideTheSignal)
{
    ScratchDir dir;
    std::mt19937 random(20261206);
    const std::string path = dir.file("damaged");
    for (const auto &[format, bytes] : valid_files(dir)) {
        int with_regions = 0, with_problems = 0;
        for (int round = 0; round < 300; ++round) {
            write_bytes(path, damage(bytes, random));
            TestHost host;
            host.frames = 8000;
            RegionSet set(&host);
            std::vector<std::string> problems;
            const int error =
                velmsig::read_region_file(set, path.c_str(), format.c_str(), &problems);
            if (error) {
                EXPECT_EQ(set.size(), 0u) << format << " round " << round;
            }
            with_regions += set.size() > 0;
            with_problems += !problems.empty() || error;
            for (const Region *r : set.select({})) {
                ASSERT_GE(r->begin, 0.0) << format << " round " << round;
                ASSERT_GE(r->length, 0.0) << format << " round " << round;
                ASSERT_LE(r->begin + r->length, 1.0 + 1e-12) << format << " round " << round;
                if (r->parent) {
                    ASSERT_GE(r->begin, r->parent->begin);
                    ASSERT_LE(r->begin + r->length, r->parent->begin + r->parent->length + 1e-12);
                }
            }
        }
        // The damage both spares files and breaks them.
        EXPECT_GT(with_regions, 0) << format;
        EXPECT_GT(with_problems, 0) << format;
    }
}

}  // namespace
