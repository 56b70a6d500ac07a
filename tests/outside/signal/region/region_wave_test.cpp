// Cue points and labelled ranges inside WAV files, written here by hand
// chunk by chunk, and rewritten without touching the audio.
#include <gtest/gtest.h>
#include <sndfile.h>

#include <sys/stat.h>
#include <unistd.h>

#include <cmath>

#include "outside/signal/region/region_files.hpp"
#include "tests/outside/signal/region/region_test_support.hpp"

using velmsig::Region;
using velmsig::RegionSet;

namespace {

void put32(std::string &out, uint32_t v)
{
    for (int i = 0; i < 4; ++i) out += char((v >> (8 * i)) & 0xFF);
}

void put16(std::string &out, uint16_t v)
{
    out += char(v & 0xFF);
    out += char(v >> 8);
}

std::string chunk(const std::string &id, const std::string &body)
{
    std::string out = id;
    put32(out, uint32_t(body.size()));
    out += body;
    if (body.size() & 1) out += '\0';
    return out;
}

std::string text_entry(const std::string &id, uint32_t cue, const std::string &text)
{
    std::string body;
    put32(body, cue);
    return chunk(id, body + text + '\0');
}

// One second of a 440 Hz sine, 16-bit mono at 8000 Hz.
std::string audio_chunks()
{
    std::string fmt;
    put16(fmt, 1);
    put16(fmt, 1);
    put32(fmt, 8000);
    put32(fmt, 16000);
    put16(fmt, 2);
    put16(fmt, 16);
    std::string data;
    for (int i = 0; i < 8000; ++i)
        put16(data, uint16_t(int16_t(std::lround(12000 * std::sin(2 * M_PI * 440 * i / 8000.0)))));
    return chunk("fmt ", fmt) + chunk("data", data);
}

std::string cue_chunk(const std::vector<std::pair<uint32_t, uint32_t>> &points, uint32_t claimed)
{
    std::string body;
    put32(body, claimed);
    for (const auto &[id, offset] : points) {
        put32(body, id);
        put32(body, offset);
        body += "data";
        put32(body, 0);
        put32(body, 0);
        put32(body, offset);
    }
    return chunk("cue ", body);
}

std::string ltxt(uint32_t cue, uint32_t length, const std::string &text)
{
    std::string body;
    put32(body, cue);
    put32(body, length);
    body += "rgn ";
    body.append(8, '\0');
    return chunk("ltxt", body + text);
}

std::string riff(const std::string &chunks)
{
    std::string out = "RIFF";
    put32(out, uint32_t(4 + chunks.size()));
    return out + "WAVE" + chunks;
}

std::vector<short> samples_of(const std::string &path)
{
    SF_INFO info{};
    SNDFILE *f = sf_open(path.c_str(), SFM_READ, &info);
    if (!f) return {};
    std::vector<short> out(size_t(info.frames * info.channels));
    sf_readf_short(f, out.data(), info.frames);
    sf_close(f);
    return out;
}

class WaveCues : public ::testing::Test {
protected:
    TestHost host;
    RegionSet set{&host};
    ScratchDir dir;
    std::vector<std::string> problems;
    std::string path = dir.file("take.wav");

    void SetUp() override { host.frames = 8000; }

    std::string info_chunk() const
    {
        return chunk("LIST", "INFO" + chunk("INAM", std::string("Take one", 9)));
    }

    // Cue 1: a point at 0.25 s labelled "start"; cue 2: a range from
    // 0.5 s lasting 0.125 s with a label and a note.
    std::string marked_file() const
    {
        const std::string adtl = "adtl" + text_entry("labl", 1, "start") +
                                 text_entry("labl", 2, "range") + ltxt(2, 1000, "") +
                                 text_entry("note", 2, "a note");
        return riff(audio_chunks() + info_chunk() + cue_chunk({{1, 2000}, {2, 4000}}, 2) +
                    chunk("LIST", adtl));
    }
};

TEST_F(WaveCues, ReadsPointsAndRanges)
{
    write_bytes(path, marked_file());
    ASSERT_EQ(velmsig::read_region_file(set, path.c_str(), "AUTO", &problems), AUDIO_ERROR_NONE);
    EXPECT_TRUE(problems.empty());
    const auto regions = set.track_regions(-1);
    ASSERT_EQ(regions.size(), 2u);
    EXPECT_EQ(AUDIOREGION_BeginSample(regions[0]), 2000);
    EXPECT_EQ(AUDIOREGION_NumSamples(regions[0]), 0);
    EXPECT_STREQ(AUDIOREGION_GetLabel(regions[0]), "start");
    EXPECT_EQ(AUDIOREGION_GetComment(regions[0]), nullptr);
    EXPECT_EQ(AUDIOREGION_BeginSample(regions[1]), 4000);
    EXPECT_EQ(AUDIOREGION_EndSample(regions[1]), 5000);
    EXPECT_STREQ(AUDIOREGION_GetLabel(regions[1]), "range");
    EXPECT_STREQ(AUDIOREGION_GetComment(regions[1]), "a note");
}

TEST_F(WaveCues, RewritingKeepsTheAudioAndOtherChunks)
{
    write_bytes(path, marked_file());
    const std::vector<short> before = samples_of(path);
    ASSERT_EQ(before.size(), 8000u);

    set.add(0.1, 0.1, 0, 0, "first", nullptr);
    set.add(0.3, 0.7, 0, 0, "odd", "comment");   // odd text lengths need pad bytes
    set.add(2.0, 3.0, 0, 0, "clamped away", nullptr);
    ASSERT_EQ(velmsig::write_region_file(set, path.c_str(), nullptr), AUDIO_ERROR_NONE);

    EXPECT_EQ(samples_of(path), before);
    const std::string bytes = read_bytes(path);
    EXPECT_NE(bytes.find("Take one"), std::string::npos);
    EXPECT_EQ(bytes.find("start"), std::string::npos);   // the old cues are gone

    TestHost other_host;
    other_host.frames = 8000;
    RegionSet other(&other_host);
    ASSERT_EQ(velmsig::read_region_file(other, path.c_str(), "WAVE", &problems),
              AUDIO_ERROR_NONE);
    EXPECT_TRUE(problems.empty());
    const auto regions = other.track_regions(-1);
    ASSERT_EQ(regions.size(), 3u);
    EXPECT_EQ(AUDIOREGION_BeginSample(regions[0]), 800);
    EXPECT_EQ(AUDIOREGION_NumSamples(regions[0]), 0);
    EXPECT_EQ(AUDIOREGION_BeginSample(regions[1]), 2400);
    EXPECT_EQ(AUDIOREGION_EndSample(regions[1]), 5600);
    EXPECT_STREQ(AUDIOREGION_GetComment(regions[1]), "comment");
    EXPECT_EQ(AUDIOREGION_BeginSample(regions[2]), 8000);
    EXPECT_EQ(dir.names().size(), 1u);
}

// Regions saved through a symbolic link land in the file it points at; the
// link stays a link.
TEST_F(WaveCues, SavingThroughASymbolicLinkUpdatesTheRealFile)
{
    write_bytes(path, marked_file());
    const std::string link = dir.file("link.wav");
    ASSERT_EQ(symlink("take.wav", link.c_str()), 0);

    set.add(0.1, 0.1, 0, 0, "through the link", nullptr);
    ASSERT_EQ(velmsig::write_region_file(set, link.c_str(), nullptr), AUDIO_ERROR_NONE);

    struct stat st {};
    ASSERT_EQ(lstat(link.c_str(), &st), 0);
    EXPECT_TRUE(S_ISLNK(st.st_mode));
    EXPECT_NE(read_bytes(path).find("through the link"), std::string::npos);
    EXPECT_EQ(samples_of(path).size(), 8000u);
    EXPECT_EQ(dir.names().size(), 2u);
}

// A recording whose RIFF size was never updated from its header-only start
// still plays; adding cues to it keeps all of its audio.
TEST_F(WaveCues, AStaleRiffSizeDoesNotCutTheAudio)
{
    std::string bytes = riff(audio_chunks());
    bytes.replace(4, 4, std::string("\x24\0\0\0", 4));   // 36: the header chunks only
    write_bytes(path, bytes);
    const std::vector<short> before = samples_of(path);
    ASSERT_EQ(before.size(), 8000u);

    set.add(0.5, 0.5, 0, 0, "kept", nullptr);
    ASSERT_EQ(velmsig::write_region_file(set, path.c_str(), nullptr), AUDIO_ERROR_NONE);
    EXPECT_EQ(samples_of(path), before);
    EXPECT_NE(read_bytes(path).find("kept"), std::string::npos);
}

// Past 4 GB a RIFF file's 32-bit sizes have wrapped: cues cannot be written
// into it, and the refusal leaves the file as it was (sparse here).
TEST_F(WaveCues, AFileTooBigForRiffSizesIsLeftAlone)
{
    write_bytes(path, marked_file());
    const off_t big = off_t(1) << 32 | 4096;
    ASSERT_EQ(truncate(path.c_str(), big), 0);
    set.add(0.5, 0.5, 0, 0, "refused", nullptr);
    EXPECT_EQ(velmsig::write_region_file(set, path.c_str(), nullptr), AUDIO_ERROR_WRITE);
    struct stat st {};
    ASSERT_EQ(stat(path.c_str(), &st), 0);
    EXPECT_EQ(st.st_size, big);
    EXPECT_EQ(dir.names().size(), 1u);
}

TEST_F(WaveCues, DamagedChunksLoadWhatTheyCan)
{
    // The cue chunk claims five points but holds two; an adtl entry runs
    // past its list.
    std::string adtl = "adtl" + text_entry("labl", 1, "kept");
    std::string broken = "labl";
    put32(broken, 5000);
    adtl += broken + "xx";
    write_bytes(path, riff(audio_chunks() + cue_chunk({{1, 100}, {2, 200}}, 5) +
                           chunk("LIST", adtl)));
    ASSERT_EQ(velmsig::read_region_file(set, path.c_str(), "WAVE", &problems), AUDIO_ERROR_NONE);
    EXPECT_EQ(problems.size(), 2u);
    const auto regions = set.track_regions(-1);
    ASSERT_EQ(regions.size(), 2u);
    EXPECT_STREQ(AUDIOREGION_GetLabel(regions[0]), "kept");
}

TEST_F(WaveCues, SizesBeyondTheFileAreNotTrusted)
{
    std::string file = riff(audio_chunks() + cue_chunk({{1, 100}}, 1));
    file.resize(file.size() - 10);   // the cue chunk is cut short
    write_bytes(path, file);
    EXPECT_EQ(velmsig::read_region_file(set, path.c_str(), "WAVE", &problems),
              AUDIO_ERROR_CORRUPT_DATA);
    EXPECT_FALSE(problems.empty());
    EXPECT_TRUE(set.track_regions(-1).empty());

    // No format chunk: cue positions mean nothing.
    write_bytes(path, riff(cue_chunk({{1, 100}}, 1)));
    EXPECT_EQ(velmsig::read_region_file(set, path.c_str(), "WAVE", &problems),
              AUDIO_ERROR_CORRUPT_DATA);
}

TEST_F(WaveCues, OtherFilesAreRefused)
{
    write_bytes(path, "RIFX....WAVE");
    EXPECT_EQ(velmsig::read_region_file(set, path.c_str(), "WAVE", &problems),
              AUDIO_ERROR_UNSUPPORTED_FORMAT);
    write_bytes(path, "RIF");
    EXPECT_EQ(velmsig::read_region_file(set, path.c_str(), "WAVE", &problems),
              AUDIO_ERROR_UNSUPPORTED_FORMAT);
    const std::string text = dir.file("plain.txt");
    write_bytes(text, "1\t2\tx\n");
    EXPECT_EQ(velmsig::write_region_file(set, text.c_str(), "WAVE"),
              AUDIO_ERROR_UNSUPPORTED_FORMAT);
    EXPECT_EQ(read_bytes(text), "1\t2\tx\n");
    EXPECT_EQ(velmsig::write_region_file(set, dir.file("missing.wav").c_str(), nullptr),
              AUDIO_ERROR_FILE_NOT_FOUND);
}

}  // namespace
