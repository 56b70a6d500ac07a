// Link documents: opening one opens the audio it names.
#include <gtest/gtest.h>
#include <sndfile.h>

#include "outside/base/blbase.h"

#include "tests/outside/signal/file/reader_helpers.hpp"

using namespace velmsig;
using namespace velmtest;

namespace {

class Link : public ::testing::Test {
protected:
    void SetUp() override {
        samples_ = test_signal(2, 2000);
        ASSERT_TRUE(write_sndfile(dir_.file("take.wav"), SF_FORMAT_WAV | SF_FORMAT_PCM_16, 48000, 2, samples_));
    }
    TempDir dir_;
    std::vector<float> samples_;
};

TEST_F(Link, OpensTheNamedAudioRelativeToTheLinkFolder) {
    write_text(dir_.file("take.velmlink"), "; a comment\n[velm]\nlink.file = take.wav\nlink.options=NOEDITABLE\n");
    for (const char *text : {"AUTO", "LINK"}) {
        auto reader = open_reader(dir_.file("take.velmlink").c_str(), text);
        ASSERT_NE(reader, nullptr) << text << " " << AUDIOSIGNAL_GetLastError();
        EXPECT_EQ(reader->format().containerKind, AUDIO_CONTAINER_LINK);
        EXPECT_EQ(reader->format().audioFormatKind, AUDIO_FORMAT_PCM_16);
        EXPECT_EQ(reader->format().sampleRate, 48000);
        EXPECT_STREQ(reader->format_name(), "LINK");
        EXPECT_TRUE(reader->random_access());
        EXPECT_EQ(read_all(*reader), samples_);
    }
}

TEST_F(Link, TakesWholeKeysAndAFormatString) {
    ASSERT_TRUE(write_sndfile(dir_.file("take.pcm"), SF_FORMAT_RAW | SF_FORMAT_PCM_16, 8000, 2, samples_));
    write_text(dir_.file("raw.ini"), "velm.link.file=" + dir_.file("take.pcm") +
                                         "\nvelm.link.format=RAW[sr=8000,nc=2]\n");
    auto reader = open_reader(dir_.file("raw.ini").c_str(), "AUTO");
    ASSERT_NE(reader, nullptr) << AUDIOSIGNAL_GetLastError();
    EXPECT_EQ(reader->format().sampleRate, 8000);
    EXPECT_EQ(read_all(*reader), samples_);
}

TEST_F(Link, RefusesLoopsMissingTargetsAndBadFormats) {
    write_text(dir_.file("self.velmlink"), "[velm]\nlink.file=self.velmlink\n");
    EXPECT_EQ(open_reader(dir_.file("self.velmlink").c_str(), "AUTO"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_CORRUPT_DATA);

    write_text(dir_.file("a.velmlink"), "[velm]\nlink.file=b.velmlink\n");
    write_text(dir_.file("b.velmlink"), "[velm]\nlink.file=./a.velmlink\n");
    EXPECT_EQ(open_reader(dir_.file("a.velmlink").c_str(), "AUTO"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_CORRUPT_DATA);

    write_text(dir_.file("gone.velmlink"), "[velm]\nlink.file=gone.wav\n");
    EXPECT_EQ(open_reader(dir_.file("gone.velmlink").c_str(), "AUTO"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_FILE_NOT_FOUND);

    write_text(dir_.file("nofile.velmlink"), "[velm]\nlink.options=EDITABLE\n");
    EXPECT_EQ(open_reader(dir_.file("nofile.velmlink").c_str(), "LINK"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_CORRUPT_DATA);

    write_text(dir_.file("badfmt.velmlink"), "[velm]\nlink.file=take.wav\nlink.format=WAVE[sr=oops]\n");
    EXPECT_EQ(open_reader(dir_.file("badfmt.velmlink").c_str(), "AUTO"), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_BAD_FORMAT_STRING);

    // Chains of links are followed, but not endlessly.
    for (int i = 0; i < 12; ++i)
        write_text(dir_.file("c" + std::to_string(i) + ".velmlink"),
                   "[velm]\nlink.file=c" + std::to_string(i + 1) + ".velmlink\n");
    write_text(dir_.file("c12.velmlink"), "[velm]\nlink.file=take.wav\n");
    EXPECT_NE(open_reader(dir_.file("c6.velmlink").c_str(), "AUTO"), nullptr);
    EXPECT_EQ(open_reader(dir_.file("c0.velmlink").c_str(), "AUTO"), nullptr);
}

// The document keeps its settings in the link file through the settings
// library: what one writes, the other reads.
TEST_F(Link, SharesItsFileWithTheSettingsLibrary) {
    BLCORE_Initialize();
    std::string path = dir_.file("shared.velmlink");
    BLSETTINGS settings = BLSETTINGS_Create();
    ASSERT_EQ(BLSETTINGS_SetConfigFileEx(settings, path.c_str(), "ini"), 1);
    ASSERT_EQ(BLSETTINGS_ChangeEx(settings, "velm.link.file=take.wav"), 1);
    ASSERT_EQ(BLSETTINGS_ChangeEx(settings, "velm.link.options=NOEDITABLE"), 1);
    BLSETTINGS_Destroy(settings);
    auto reader = open_reader(path.c_str(), "AUTO");
    ASSERT_NE(reader, nullptr) << slurp(path);
    EXPECT_EQ(read_all(*reader), samples_);

    write_text(path, "[velm]\nlink.file=take.wav\nlink.options=NOEDITABLE\n");
    settings = BLSETTINGS_Create();
    ASSERT_EQ(BLSETTINGS_SetConfigFileEx(settings, path.c_str(), "ini"), 1);
    EXPECT_STREQ(BLSETTINGS_GetStringEx(settings, "velm.link.options"), "NOEDITABLE");
    BLSETTINGS_Destroy(settings);
    BLCORE_Finalize();

    // A dotted section is not one the settings library reads: neither do we.
    write_text(path, "[velm.link]\nfile=take.wav\n");
    EXPECT_EQ(open_reader(path.c_str(), "AUTO"), nullptr);
}

TEST_F(Link, SavingThroughALinkWritesTheNamedAudio) {
    std::string link_text = "[velm]\nlink.file=take.wav\n";
    write_text(dir_.file("take.velmlink"), link_text);
    auto louder = test_signal(2, 300);
    _audio_format f = AUDIO_InitFormat(48000, 2, 16);
    auto writer = create_writer(dir_.file("take.velmlink").c_str(), f, "LINK", nullptr);
    ASSERT_NE(writer, nullptr) << AUDIOSIGNAL_GetLastError();
    ASSERT_TRUE(writer->write(louder.data(), 300));
    ASSERT_TRUE(writer->commit());
    EXPECT_EQ(slurp(dir_.file("take.velmlink")), link_text);
    auto reader = open_reader(dir_.file("take.wav").c_str(), "AUTO");
    ASSERT_NE(reader, nullptr);
    EXPECT_STREQ(reader->format_name(), "WAVE");
    EXPECT_EQ(read_all(*reader), louder);
}

}  // namespace
