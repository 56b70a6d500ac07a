// Saving: every writable type round-trips and opens in sox; a failed save
// leaves the old file byte for byte and no temporary file behind.
#include <gtest/gtest.h>
#include <signal.h>
#include <sndfile.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cmath>

#include "tests/outside/signal/file/reader_helpers.hpp"

using namespace velmsig;
using namespace velmtest;

namespace {

_audio_format pcm_format(int rate, int channels, int bits) {
    _audio_format f = AUDIO_InitFormat(rate, channels, bits);
    f.audioFormatKind = AUDIO_FORMAT_PCM_16;
    return f;
}

bool save(const std::string &path, const _audio_format &format, const char *text, const std::vector<float> &samples,
          const AUDIOMETADATA *meta = nullptr) {
    auto writer = create_writer(path.c_str(), format, text, meta);
    if (!writer) return false;
    int64_t frames = static_cast<int64_t>(samples.size()) / format.numChannels;
    // Two pieces: writers take frames in any number of calls.
    return writer->write(samples.data(), frames / 2) &&
           writer->write(samples.data() + frames / 2 * format.numChannels, frames - frames / 2) && writer->commit();
}

struct SaveCase {
    const char *name;
    const char *format_text;
    int container;
    int coding;
    int bits;
    bool lossy;
};

class SaveRoundTrip : public ::testing::TestWithParam<SaveCase> {};

TEST_P(SaveRoundTrip, ReopensWithTheSameSamplesAndSoxReadsIt) {
    const SaveCase &c = GetParam();
    TempDir dir;
    std::string path = dir.file(std::string("out.") + c.name);
    int rate = c.coding == AUDIO_FORMAT_OPUS ? 48000 : 44100;
    auto samples = test_signal(2, 20000);
    if (c.lossy)
        for (size_t i = 0; i < samples.size(); ++i)
            samples[i] = 0.4f * static_cast<float>(std::sin(2 * M_PI * 500.0 * static_cast<double>(i / 2) / rate));
    _audio_format format = pcm_format(rate, 2, 16);
    if (!save(path, format, c.format_text, samples)) {
        ASSERT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_UNSUPPORTED_FORMAT);
        GTEST_SKIP() << "the installed libsndfile does not write " << c.format_text;
    }
    EXPECT_EQ(dir.entries().size(), 1u);  // no temporary file left

    auto reader = open_reader(path.c_str(), c.container == AUDIO_CONTAINER_RAW ? "RAW[sr=44100,nc=2]" : "AUTO");
    ASSERT_NE(reader, nullptr) << AUDIOSIGNAL_GetLastError();
    EXPECT_EQ(reader->format().containerKind, c.container);
    EXPECT_EQ(reader->format().audioFormatKind, c.coding);
    EXPECT_EQ(reader->format().bitsPerSample, c.bits);
    EXPECT_EQ(reader->format().sampleRate, rate);
    if (c.container != AUDIO_CONTAINER_RAW) {
        // The detected name, as a document keeps it, opens the file again.
        auto again = open_reader(path.c_str(), reader->format_name());
        ASSERT_NE(again, nullptr) << reader->format_name();
        EXPECT_EQ(again->format().audioFormatKind, c.coding);
    }
    auto got = read_all(*reader, 4096);
    if (!c.lossy) {
        EXPECT_EQ(got, samples);
    } else {
        ASSERT_GE(got.size(), samples.size() / 2);
        double worst = 0;
        for (size_t i = got.size() / 4; i < got.size() / 2; ++i)
            worst = std::max(worst, double(std::fabs(got[i] - samples[i])));
        EXPECT_LT(worst, 0.1);
    }
    if (c.container == AUDIO_CONTAINER_RAW || c.coding == AUDIO_FORMAT_OPUS || c.coding == AUDIO_FORMAT_MP3 ||
        c.container == AUDIO_CONTAINER_RF64)
        return;  // sox reads neither headerless files without options nor these codecs
    std::string info = output_of("sox --i -r " + path) + output_of("sox --i -c " + path);
    EXPECT_NE(info.find(std::to_string(rate)), std::string::npos) << info;
    EXPECT_NE(info.find("\n2"), std::string::npos) << info;
    EXPECT_EQ(run("sox " + path + " -n stat"), 0);
}

INSTANTIATE_TEST_SUITE_P(
    Formats, SaveRoundTrip,
    ::testing::Values(SaveCase{"wav", "WAVE", AUDIO_CONTAINER_WAVE, AUDIO_FORMAT_PCM_16, 16, false},
                      SaveCase{"wav24", "WAVE[nbits=24]", AUDIO_CONTAINER_WAVE, AUDIO_FORMAT_PCM_24, 24, false},
                      SaveCase{"wav32", "WAVPCM[nbits=32]", AUDIO_CONTAINER_WAVE, AUDIO_FORMAT_PCM_32, 32, false},
                      SaveCase{"wavf", "WAVFLOAT", AUDIO_CONTAINER_WAVE, AUDIO_FORMAT_FLOAT, 32, false},
                      SaveCase{"rf64", "RF64", AUDIO_CONTAINER_RF64, AUDIO_FORMAT_PCM_16, 16, false},
                      SaveCase{"w64", "W64[nbits=24]", AUDIO_CONTAINER_W64, AUDIO_FORMAT_PCM_24, 24, false},
                      SaveCase{"aiff", "AIFF", AUDIO_CONTAINER_AIFF, AUDIO_FORMAT_PCM_16, 16, false},
                      SaveCase{"caf", "CAF[nbits=24]", AUDIO_CONTAINER_CAF, AUDIO_FORMAT_PCM_24, 24, false},
                      SaveCase{"raw", "RAW", AUDIO_CONTAINER_RAW, AUDIO_FORMAT_PCM_16, 16, false},
                      SaveCase{"flac", "FLAC", AUDIO_CONTAINER_FLAC, AUDIO_FORMAT_FLAC, 16, false},
                      SaveCase{"flac24", "FLAC[nbits=24]", AUDIO_CONTAINER_FLAC, AUDIO_FORMAT_FLAC, 24, false},
                      SaveCase{"ogg", "OGG[quality=0.6]", AUDIO_CONTAINER_OGG, AUDIO_FORMAT_VORBIS, 16, true},
                      SaveCase{"opus", "OPUS", AUDIO_CONTAINER_OGG, AUDIO_FORMAT_OPUS, 16, true},
                      SaveCase{"mp3", "MP3", AUDIO_CONTAINER_MPEG, AUDIO_FORMAT_MP3, 16, true}),
    [](const auto &info) { return std::string(info.param.name); });

TEST(Save, AutoPicksTheTypeFromTheExtensionAndKeepsFloatSignalsFloat) {
    TempDir dir;
    auto samples = test_signal(1, 500);
    ASSERT_TRUE(save(dir.file("a.aif"), pcm_format(8000, 1, 16), "AUTO", samples));
    ASSERT_TRUE(save(dir.file("b.unknown"), pcm_format(8000, 1, 24), "", samples));
    _audio_format floating = AUDIO_InitFormat(8000, 1, 32);  // 32 bits: float samples
    ASSERT_TRUE(save(dir.file("c.wav"), floating, "WAVE", samples));
    ASSERT_TRUE(save(dir.file("d.flac"), AUDIO_InitFormat(8000, 1, 0), "AUTO", samples));  // depth unspecified
    ASSERT_TRUE(save(dir.file("e.flac"), floating, "AUTO", samples));  // floats: FLAC's deepest
    ASSERT_TRUE(save(dir.file("f.opus"), pcm_format(48000, 1, 16), "AUTO", test_signal(1, 4800)));

    auto a = open_reader(dir.file("a.aif").c_str(), "AUTO");
    auto b = open_reader(dir.file("b.unknown").c_str(), "AUTO");
    auto c = open_reader(dir.file("c.wav").c_str(), "AUTO");
    ASSERT_TRUE(a && b && c);
    EXPECT_EQ(a->format().containerKind, AUDIO_CONTAINER_AIFF);
    EXPECT_EQ(b->format().containerKind, AUDIO_CONTAINER_WAVE);
    EXPECT_EQ(b->format().audioFormatKind, AUDIO_FORMAT_PCM_24);
    EXPECT_EQ(c->format().audioFormatKind, AUDIO_FORMAT_FLOAT);
    EXPECT_STREQ(c->format_name(), "WAVFLOAT");
    auto d = open_reader(dir.file("d.flac").c_str(), "AUTO");
    ASSERT_NE(d, nullptr);
    EXPECT_EQ(d->format().bitsPerSample, 16);
    EXPECT_EQ(read_all(*d), samples);
    auto e = open_reader(dir.file("e.flac").c_str(), "AUTO");
    ASSERT_NE(e, nullptr);
    EXPECT_EQ(e->format().bitsPerSample, 24);
    auto opus = open_reader(dir.file("f.opus").c_str(), "AUTO");
    ASSERT_NE(opus, nullptr);
    EXPECT_EQ(opus->format().audioFormatKind, AUDIO_FORMAT_OPUS);
}

// A document opened with "AUTO[sr=8000,nc=1]" keeps that text with the
// detected name; saving writes the signal as it is, whatever the keys say.
TEST(Save, WritesTheSignalsOwnRateAndChannels) {
    TempDir dir;
    std::string path = dir.file("doc.wav");
    auto samples = test_signal(2, 1000);
    ASSERT_TRUE(save(path, pcm_format(44100, 2, 16), "WAVE[sr=8000,nc=1]", samples));
    auto reader = open_reader(path.c_str(), "WAVE[sr=8000,nc=1]");
    ASSERT_NE(reader, nullptr);
    EXPECT_EQ(reader->format().sampleRate, 44100);
    EXPECT_EQ(reader->format().numChannels, 2);
    EXPECT_EQ(read_all(*reader), samples);
}

TEST(Save, RefusesWhatTheTypeCannotHold) {
    TempDir dir;
    std::string path = dir.file("x.flac");
    _audio_format f = pcm_format(8000, 2, 16);
    EXPECT_EQ(create_writer(path.c_str(), f, "FLAC[nbits=32]", nullptr), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_UNSUPPORTED_FORMAT);
    EXPECT_EQ(create_writer(path.c_str(), f, "WAVE:FMTCONV[sr=8000]", nullptr), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_BAD_FORMAT_STRING);
    EXPECT_EQ(create_writer(path.c_str(), f, "WAVE[", nullptr), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_BAD_FORMAT_STRING);
    EXPECT_EQ(create_writer(path.c_str(), AUDIO_NullFormat(), "WAVE", nullptr), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_BAD_ARGUMENT);
    EXPECT_EQ(create_writer(dir.path().c_str(), f, "WAVE", nullptr), nullptr);  // a folder
    EXPECT_EQ(create_writer(dir.file("missing/x.wav").c_str(), f, "WAVE", nullptr), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_FILE_NOT_FOUND);
    EXPECT_TRUE(dir.entries().empty());
}

// Old file, a save attempt in a forked child (which may change its limits or
// identity), then the checks.
class FailedSave : public ::testing::Test {
protected:
    void SetUp() override {
        path_ = dir_.file("old.wav");
        ASSERT_TRUE(write_sndfile(path_, SF_FORMAT_WAV | SF_FORMAT_PCM_16, 8000, 1, test_signal(1, 4000)));
        before_ = slurp(path_);
    }

    // Runs `prepare` then a save of a large file in a child; the child's
    // exit status is 0 when the save failed as it should.
    template <typename F>
    int save_in_child(F prepare) {
        pid_t pid = fork();
        if (pid == 0) {
            prepare();
            auto samples = test_signal(2, 200000);
            bool saved = save(path_, pcm_format(8000, 2, 16), "WAVE", samples);
            _exit(saved ? 1 : AUDIOSIGNAL_GetLastError() == expected_error_ ? 0 : 2);
        }
        int status = 0;
        waitpid(pid, &status, 0);
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }

    void expect_old_file_intact() {
        EXPECT_EQ(slurp(path_), before_);
        EXPECT_EQ(dir_.entries(), std::vector<std::string>{"old.wav"});
    }

    TempDir dir_;
    std::string path_;
    std::string before_;
    int expected_error_ = AUDIO_ERROR_WRITE;
};

TEST_F(FailedSave, FullDiskLeavesTheOldFile) {
    EXPECT_EQ(save_in_child([] {
                  signal(SIGXFSZ, SIG_IGN);  // writes past the limit fail instead of killing
                  struct rlimit limit = {64 * 1024, 64 * 1024};
                  setrlimit(RLIMIT_FSIZE, &limit);
              }),
              0);
    expect_old_file_intact();
}

TEST_F(FailedSave, ReadOnlyFolderLeavesTheOldFile) {
    ASSERT_EQ(chmod(dir_.path().c_str(), 0555), 0);
    expected_error_ = AUDIO_ERROR_ACCESS_DENIED;
    EXPECT_EQ(save_in_child([] {
                  // Superusers write anywhere: save as an ordinary user.
                  if (geteuid() == 0 && (setgid(65534) != 0 || setuid(65534) != 0)) _exit(3);
              }),
              0);
    chmod(dir_.path().c_str(), 0755);
    expect_old_file_intact();
}

TEST_F(FailedSave, AbandonedWriterLeavesTheOldFile) {
    {
        auto writer = create_writer(path_.c_str(), pcm_format(8000, 1, 16), "WAVE", nullptr);
        ASSERT_NE(writer, nullptr);
        auto samples = test_signal(1, 100);
        ASSERT_TRUE(writer->write(samples.data(), 100));
        EXPECT_EQ(dir_.entries().size(), 2u);  // the temporary file beside it
    }
    expect_old_file_intact();
}

TEST(Save, ReplacesTheOldFileKeepingItsPermissions) {
    TempDir dir;
    std::string path = dir.file("keep.wav");
    ASSERT_TRUE(write_sndfile(path, SF_FORMAT_WAV | SF_FORMAT_PCM_16, 8000, 1, test_signal(1, 10)));
    ASSERT_EQ(chmod(path.c_str(), 0640), 0);
    auto samples = test_signal(1, 3000);
    ASSERT_TRUE(save(path, pcm_format(8000, 1, 16), "WAVE", samples));
    struct stat st{};
    ASSERT_EQ(stat(path.c_str(), &st), 0);
    EXPECT_EQ(st.st_mode & 0777, 0640u);
    auto reader = open_reader(path.c_str(), "AUTO");
    ASSERT_NE(reader, nullptr);
    EXPECT_EQ(read_all(*reader), samples);
}

TEST(Save, TakesTheLongestFileNames) {
    TempDir dir;
    std::string path = dir.file(std::string(251, 'n') + ".wav");  // 255 bytes, the most a name holds
    auto samples = test_signal(1, 100);
    ASSERT_TRUE(save(path, pcm_format(8000, 1, 16), "AUTO", samples)) << AUDIOSIGNAL_GetLastError();
    EXPECT_EQ(dir.entries().size(), 1u);
}

TEST(Save, ThroughASymbolicLinkReplacesTheFileItNames) {
    TempDir dir;
    std::string real = dir.file("real.wav"), link = dir.file("link.wav");
    ASSERT_TRUE(write_sndfile(real, SF_FORMAT_WAV | SF_FORMAT_PCM_16, 8000, 1, test_signal(1, 10)));
    ASSERT_EQ(symlink("real.wav", link.c_str()), 0);
    auto samples = test_signal(1, 700);
    ASSERT_TRUE(save(link, pcm_format(8000, 1, 16), "WAVE", samples));
    struct stat st{};
    ASSERT_EQ(lstat(link.c_str(), &st), 0);
    EXPECT_TRUE(S_ISLNK(st.st_mode));
    auto reader = open_reader(real.c_str(), "AUTO");
    ASSERT_NE(reader, nullptr);
    EXPECT_EQ(read_all(*reader), samples);
}

// Which metadata fields each type carries (libsndfile's strings).
TEST(Save, MetadataSurvivesWhereTheTypeCarriesIt) {
    TempDir dir;
    AUDIOMETADATA *meta = AUDIOMETADATA_Create();
    AUDIOMETADATA_SetTitle(meta, "Night Take");
    AUDIOMETADATA_SetArtist(meta, "The Band");
    AUDIOMETADATA_SetAlbumName(meta, "Live");
    AUDIOMETADATA_SetTrackNum(meta, "7");
    AUDIOMETADATA_SetGenre(meta, "Jazz");
    AUDIOMETADATA_SetComposer(meta, "nobody keeps this");
    AUDIOMETADATA_SetMetaData(meta, "comment", "first pass");
    auto samples = test_signal(1, 1000);
    for (const char *name : {"m.wav", "m.flac", "m.caf", "m.aiff"}) {
        std::string path = dir.file(name);
        ASSERT_TRUE(save(path, pcm_format(44100, 1, 16), "AUTO", samples, meta)) << name;
        auto reader = open_reader(path.c_str(), "AUTO");
        ASSERT_NE(reader, nullptr);
        AUDIOMETADATA *got = reader->metadata();
        ASSERT_NE(got, nullptr) << name;
        EXPECT_STREQ(AUDIOMETADATA_GetTitle(got), "Night Take") << name;
        EXPECT_STREQ(AUDIOMETADATA_GetArtist(got), "The Band") << name;
        EXPECT_STREQ(AUDIOMETADATA_GetMetaData(got, "comment"), "first pass") << name;
        EXPECT_EQ(AUDIOMETADATA_GetComposer(got), nullptr) << name;
        if (std::string(name) != "m.aiff") {  // AIFF keeps only title, artist, comment
            EXPECT_STREQ(AUDIOMETADATA_GetAlbumName(got), "Live") << name;
            EXPECT_STREQ(AUDIOMETADATA_GetTrackNum(got), "7") << name;
            EXPECT_STREQ(AUDIOMETADATA_GetGenre(got), "Jazz") << name;
        }
    }
    AUDIOMETADATA_Destroy(meta);
}

}  // namespace
