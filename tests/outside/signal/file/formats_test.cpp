// Format records, descriptors, filter masks, labels and time conversions.
#include <gtest/gtest.h>

#include <cmath>
#include <cstring>

#include "outside/signal/audioformat.h"

namespace {

_audio_format stored(int rate, int channels, int bits, int container, int coding) {
    _audio_format f = AUDIO_InitFormat(rate, channels, bits);
    f.containerKind = static_cast<uint16_t>(container);
    f.audioFormatKind = static_cast<uint16_t>(coding);
    return f;
}

TEST(FormatRecord, InitAndNull) {
    _audio_format f = AUDIO_InitFormat(44100, 2, 16);
    EXPECT_EQ(f.sampleRate, 44100);
    EXPECT_EQ(f.numChannels, 2);
    EXPECT_EQ(f.bitsPerSample, 16);
    EXPECT_EQ(f.audioFormatKind, AUDIO_FORMAT_PCM_16);
    EXPECT_EQ(AUDIO_InitFormat(8000, 1, 32).audioFormatKind, AUDIO_FORMAT_FLOAT);
    EXPECT_TRUE(AUDIO_IsValidFormat(&f));
    _audio_format null = AUDIO_NullFormat();
    EXPECT_EQ(null.sampleRate, 0);
    EXPECT_FALSE(AUDIO_IsValidFormat(&null));
    EXPECT_FALSE(AUDIO_IsValidFormat(nullptr));
    _audio_format too_many = AUDIO_InitFormat(8000, AUDIO_MAX_CHANNELS + 1, 16);
    EXPECT_FALSE(AUDIO_IsValidFormat(&too_many));
    EXPECT_EQ(sizeof(_audio_format), 12u);  // three 32-bit words
}

TEST(FormatRecord, ComposesAShortText) {
    _audio_format f = AUDIO_InitFormat(44100, 2, 16);
    EXPECT_STREQ(AUDIO_ComposeFormatString(&f), "sr=44100,nc=2,nbits=16");
    EXPECT_LE(std::strlen(AUDIO_ComposeFormatString(&f)), 32u);
    EXPECT_STREQ(AUDIO_ComposeFormatString(nullptr), "invalid");
}

TEST(Descriptor, FindsTheTypeAndTheEntryOfTheCoding) {
    int index = -1;
    _audio_format wav24 = stored(48000, 2, 24, AUDIO_CONTAINER_WAVE, AUDIO_FORMAT_PCM_24);
    const AUDIO_FORMAT_DESCR *d = AUDIO_GetFormatDescr(&wav24, &index);
    ASSERT_NE(d, nullptr);
    EXPECT_STREQ(d->name, "WAVE");
    ASSERT_GE(index, 0);
    ASSERT_LT(index, d->numEntries);
    EXPECT_STREQ(d->entries[index].name, "WAVE");
    EXPECT_EQ(d->entries[index].audioFormatKind, AUDIO_FORMAT_PCM_24);

    _audio_format wavf = stored(48000, 2, 32, AUDIO_CONTAINER_WAVE, AUDIO_FORMAT_FLOAT);
    d = AUDIO_GetFormatDescr(&wavf, &index);
    EXPECT_STREQ(d->entries[index].name, "WAVFLOAT");

    _audio_format opus = stored(48000, 2, 16, AUDIO_CONTAINER_OGG, AUDIO_FORMAT_OPUS);
    d = AUDIO_GetFormatDescr(&opus, &index);
    EXPECT_STREQ(d->entries[index].name, "OPUS");
    EXPECT_TRUE(d->flags & AUDIO_DESCR_LOSSY);

    _audio_format link = stored(8000, 1, 16, AUDIO_CONTAINER_LINK, AUDIO_FORMAT_PCM_16);
    d = AUDIO_GetFormatDescr(&link, &index);
    ASSERT_NE(d, nullptr);
    EXPECT_STREQ(d->entries[index].name, "LINK");

    _audio_format memory = AUDIO_InitFormat(8000, 1, 16);
    EXPECT_EQ(AUDIO_GetFormatDescr(&memory, &index), nullptr);
    EXPECT_EQ(AUDIO_GetFormatDescr(nullptr, &index), nullptr);

    EXPECT_EQ(AUDIO_GetFormatDescrByName("aiff", &index)->containerKind, AUDIO_CONTAINER_AIFF);
    EXPECT_EQ(AUDIO_GetFormatDescrByName("AUTO", &index), nullptr);
    EXPECT_EQ(AUDIO_GetFormatDescrByName("nonsense", nullptr), nullptr);
    ASSERT_GT(AUDIO_NumFormatDescrs(), 8);
    EXPECT_EQ(AUDIO_GetFormatDescrByIndex(AUDIO_NumFormatDescrs()), nullptr);
    for (int i = 0; i < AUDIO_NumFormatDescrs(); ++i) {
        const AUDIO_FORMAT_DESCR *each = AUDIO_GetFormatDescrByIndex(i);
        EXPECT_GT(each->numEntries, 0);
        EXPECT_TRUE(each->flags & AUDIO_DESCR_READ);
    }
}

TEST(FilterMask, UsesTheSoundDeviceBits) {
    _audio_format f = AUDIO_InitFormat(44100, 2, 16);
    EXPECT_EQ(AUDIO_FormatFilterMaskFromAudioFormat(&f), 0x1100400u);
    f = AUDIO_InitFormat(11025, 1, 16);
    EXPECT_EQ(AUDIO_FormatFilterMaskFromAudioFormat(&f), 0x1204000u);
    f = AUDIO_InitFormat(96000, 1, 16);
    EXPECT_EQ(AUDIO_FormatFilterMaskFromAudioFormat(&f), 0x1200100u);
    // A rate the table lacks does not fit a device that lists rates.
    f = AUDIO_InitFormat(37800, 2, 16);
    uint32_t mask = AUDIO_FormatFilterMaskFromAudioFormat(&f);
    EXPECT_EQ(mask & AUDIO_FILTER_RATE_OTHER, AUDIO_FILTER_RATE_OTHER);
    EXPECT_NE(mask & 0x13FFF00u, mask);
    EXPECT_EQ(AUDIO_FormatFilterMaskFromAudioFormat(nullptr), 0u);
}

TEST(FilterMask, CompatibilityWithFileTypes) {
    auto flags = [](const char *name) { return AUDIO_GetFormatDescrByName(name, nullptr)->flags & AUDIO_FILTER_ALL; };
    _audio_format stereo48 = AUDIO_InitFormat(48000, 2, 16);
    _audio_format six24 = AUDIO_InitFormat(96000, 6, 24);
    _audio_format float32 = AUDIO_InitFormat(37800, 1, 32);
    EXPECT_TRUE(AUDIO_IsCompatible(&stereo48, flags("WAVE")));
    EXPECT_TRUE(AUDIO_IsCompatible(&six24, flags("FLAC")));
    EXPECT_FALSE(AUDIO_IsCompatible(&six24, flags("MP3")));
    EXPECT_FALSE(AUDIO_IsCompatible(&float32, flags("FLAC")));
    EXPECT_FALSE(AUDIO_IsCompatible(&float32, flags("MP3")));
    EXPECT_TRUE(AUDIO_IsCompatible(&float32, flags("WAVE")));
    EXPECT_TRUE(AUDIO_IsCompatible(&six24, AUDIO_FILTER_ALL));
    EXPECT_FALSE(AUDIO_IsCompatible(nullptr, AUDIO_FILTER_ALL));
}

TEST(Labels, ContainerAndCodingTexts) {
    EXPECT_STREQ(AUDIODEF_ContainerString(AUDIO_CONTAINER_WAVE), "Microsoft WAVE");
    EXPECT_STREQ(AUDIODEF_AudioFormatString(AUDIO_FORMAT_PCM_16), "PCM 16-bit");
    EXPECT_STREQ(AUDIODEF_AudioFormatString(AUDIO_FORMAT_VORBIS), "Vorbis");
    EXPECT_EQ(AUDIODEF_ContainerString(AUDIO_CONTAINER_NONE), nullptr);
    EXPECT_EQ(AUDIODEF_ContainerString(999), nullptr);
    EXPECT_EQ(AUDIODEF_AudioFormatString(AUDIO_FORMAT_NONE), nullptr);
}

TEST(Time, SamplesAndSecondsConvertBothWays) {
    _audio_format f = AUDIO_InitFormat(44100, 2, 16);
    EXPECT_EQ(AUDIO_Time2Sample(&f, 1.0), 44100);
    EXPECT_EQ(AUDIO_Time2Sample(&f, 10.0), 441000);
    EXPECT_EQ(AUDIO_Time2Sample(&f, 0.5 / 44100 * 0.99), 0);  // rounds to the nearest frame
    EXPECT_EQ(AUDIO_Time2Sample(&f, 1.5 / 44100), 2);
    EXPECT_DOUBLE_EQ(AUDIO_Sample2Time(&f, 22050), 0.5);
    EXPECT_EQ(AUDIO_Time2Sample(&f, AUDIO_Sample2Time(&f, 123456789012LL)), 123456789012LL);
    EXPECT_EQ(AUDIO_Time2Sample(&f, 1e300), INT64_MAX);
    EXPECT_EQ(AUDIO_Time2Sample(&f, NAN), -1);
    _audio_format null = AUDIO_NullFormat();
    EXPECT_EQ(AUDIO_Time2Sample(&null, 1.0), -1);
    EXPECT_DOUBLE_EQ(AUDIO_Sample2Time(nullptr, 5), -1.0);
}

TEST(Library, StartUpsAreCounted) {
    EXPECT_EQ(AUDIO_Initialize(), 1);
    EXPECT_EQ(AUDIO_Initialize(), 1);
    EXPECT_EQ(AUDIO_Finalize(), 1);
    EXPECT_EQ(AUDIO_Finalize(), 1);
    EXPECT_EQ(AUDIO_Finalize(), 0);  // more shut-downs than start-ups
}

}  // namespace
