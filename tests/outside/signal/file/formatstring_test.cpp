// Format strings: what parses, what composes back, what is refused.
#include <gtest/gtest.h>

#include "outside/signal/file/formatstring_internal.hpp"
#include "outside/signal/audioformat.h"

using namespace velmsig;

namespace {

TEST(FormatString, ParsesNamesKeysAndConversions) {
    ParsedFormat f;
    ASSERT_TRUE(parse_format_string("AUTO[sr=8000,nc=1]", &f));
    EXPECT_EQ(f.name, "AUTO");
    EXPECT_EQ(f.container, 0);
    EXPECT_EQ(f.sample_rate, 8000);
    EXPECT_EQ(f.channels, 1);

    ASSERT_TRUE(parse_format_string("raw[SR=44100,nc=2,bps=24,endian=big,offset=128]", &f));
    EXPECT_EQ(f.name, "RAW");
    EXPECT_EQ(f.container, AUDIO_CONTAINER_RAW);
    EXPECT_EQ(f.bits, 24);
    EXPECT_TRUE(f.big_endian);
    EXPECT_EQ(f.offset, 128);

    ASSERT_TRUE(parse_format_string("WAVFLOAT", &f));
    EXPECT_EQ(f.container, AUDIO_CONTAINER_WAVE);
    EXPECT_EQ(f.coding, AUDIO_FORMAT_FLOAT);

    ASSERT_TRUE(parse_format_string("AUTO:FMTCONV[sr=22050,nc=2,nbits=16]", &f));
    EXPECT_TRUE(f.conversion.present);
    EXPECT_EQ(f.conversion.sample_rate, 22050);
    EXPECT_EQ(f.conversion.channels, 2);
    EXPECT_EQ(f.conversion.bits, 16);

    ASSERT_TRUE(parse_format_string(nullptr, &f));
    EXPECT_EQ(f.name, "AUTO");
    ASSERT_TRUE(parse_format_string("", &f));
    EXPECT_EQ(f.name, "AUTO");
}

TEST(FormatString, ComposesWhatItParses) {
    for (const char *text : {"AUTO", "WAVE[nbits=24]", "RAW[sr=8000,nc=1,nbits=16,endian=little,offset=44]",
                             "OGG[quality=0.5]", "AUTO:FMTCONV[sr=16000,nc=1,nbits=16]", "FLAC[sr=96000,nc=6]"}) {
        ParsedFormat f;
        ASSERT_TRUE(parse_format_string(text, &f)) << text;
        EXPECT_EQ(compose_format_string(f), text);
    }
}

TEST(FormatString, RefusesMalformedTexts) {
    for (const char *text :
         {"WAVE[", "WAVE]", "WAVE[]x", "[sr=1]", "NOSUCH", "WAVE[sr]", "WAVE[sr=]", "WAVE[=8000]", "WAVE[sr=8000,]",
          "WAVE[,sr=8000]", "WAVE[sr=8000 ]", "WAVE [sr=8000]", "WAVE[sr=0]", "WAVE[sr=-5]", "WAVE[sr=99999999999]",
          "WAVE[sr=12abc]", "WAVE[nc=65]", "WAVE[nc=0]", "WAVE[nbits=12]", "WAVE[nbits=48]", "WAVE[colour=red]",
          "WAVE[sr=8000][nc=1]", "WAVE[sr=[8000]]", "RAW[endian=middle]", "OGG[quality=2]", "OGG[quality=nan]",
          "AUTO:", "AUTO:FMTCONV[sr=1]:FMTCONV[nc=1]", "AUTO:GAIN[x=1]", "AUTO:FMTCONV[nc=x]", "WA-VE",
          "WAVE[sr=8000\n]", "WAVE\x01"}) {
        ParsedFormat f;
        EXPECT_FALSE(parse_format_string(text, &f)) << text;
    }
    std::string huge = "WAVE[sr=" + std::string(5000, '1') + "]";
    ParsedFormat f;
    EXPECT_FALSE(parse_format_string(huge.c_str(), &f));
}

}  // namespace
