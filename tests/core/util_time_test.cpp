#include "core/velmutil.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <string>

namespace {

std::string ms_text(int64_t ms, int64_t reference)
{
    char buffer[64];
    EXPECT_EQ(VELMUTIL_MsTimeToBuffer(ms, reference, buffer, sizeof buffer), 1);
    return buffer;
}

struct Parsed {
    int h, m, s, ms;
};

Parsed parse(const char *text)
{
    std::string copy(text);
    Parsed p{-1, -1, -1, -1};
    VELMUTIL_DecomposeStringTime(copy.data(), &p.h, &p.m, &p.s, &p.ms);
    return p;
}

} // namespace

TEST(UtilTime, ReferenceChoosesThePrecision)
{
    EXPECT_EQ(ms_text(61500, 30000), "1.500");
    EXPECT_EQ(ms_text(61500, 61500), "01:01.500");
    EXPECT_EQ(ms_text(5, 0), "0.005");
    EXPECT_EQ(ms_text(3723004, 3600000), "01:02:03.004");
}

TEST(UtilTime, FormattingNeverWritesPastTheBuffer)
{
    char buffer[8] = "xxxxxxx";
    EXPECT_EQ(VELMUTIL_MsTimeToBuffer(3723004, 3600000, buffer, 0), 0);
    EXPECT_EQ(buffer[0], 'x');
    EXPECT_EQ(VELMUTIL_MsTimeToBuffer(3723004, 3600000, buffer, 1), 1);
    EXPECT_EQ(buffer[0], '\0');
    EXPECT_EQ(buffer[1], 'x');
    EXPECT_EQ(VELMUTIL_MsTimeToBuffer(3723004, 3600000, buffer, 5), 1);
    EXPECT_STREQ(buffer, "01:0");
    EXPECT_EQ(buffer[5], 'x');
}

TEST(UtilTime, SamplesRoundToMilliseconds)
{
    char buffer[32];
    ASSERT_EQ(VELMUTIL_SamplesToTimeString(22050, 22050, 44100, buffer, sizeof buffer), 1);
    EXPECT_STREQ(buffer, "0.500");
    EXPECT_EQ(VELMUTIL_SamplesToTimeString(22050, 22050, 0, buffer, sizeof buffer), 0);
}

TEST(UtilTime, TypedTimesParseEveryForm)
{
    Parsed p = parse("1:02:03.5");
    EXPECT_EQ(p.h, 1);
    EXPECT_EQ(p.m, 2);
    EXPECT_EQ(p.s, 3);
    EXPECT_EQ(p.ms, 500);
    p = parse("75");
    EXPECT_EQ(p.m, 1);
    EXPECT_EQ(p.s, 15);
    p = parse("2.25");
    EXPECT_EQ(p.s, 2);
    EXPECT_EQ(p.ms, 250);
    p = parse(".1234");
    EXPECT_EQ(p.s, 1);
    EXPECT_EQ(p.ms, 234);
    p = parse("9:8:7:6");
    EXPECT_EQ(p.h, 8);
    EXPECT_EQ(p.m, 7);
    EXPECT_EQ(p.s, 6);
}

TEST(UtilTime, GarbageParsesToZeroesWithoutOverflow)
{
    Parsed p = parse("abc:def");
    EXPECT_EQ(p.h, 0);
    EXPECT_EQ(p.m, 0);
    EXPECT_EQ(p.s, 0);
    EXPECT_EQ(p.ms, 0);
    p = parse("99999999999999999999");
    EXPECT_GE(p.h, 0);
    EXPECT_LT(p.m, 60);
    EXPECT_LT(p.s, 60);
    int h = -1;
    EXPECT_EQ(VELMUTIL_DecomposeStringTime(nullptr, &h, nullptr, nullptr, nullptr), 0);
    EXPECT_EQ(h, 0);
}

TEST(UtilTime, TextToMillisecondsAndSamples)
{
    EXPECT_EQ(VELMUTIL_TimeStringToMs("1:02:03.5"), 3723500);
    EXPECT_EQ(VELMUTIL_TimeStringToSample("0:01.5", 8000), 12000);
    EXPECT_EQ(VELMUTIL_TimeStringToSample("1:00:00", 192000), int64_t(3600) * 192000);
    EXPECT_EQ(VELMUTIL_TimeStringToMs(nullptr), 0);
}

TEST(UtilTime, HugeTimesAtHugeRatesSaturate)
{
    constexpr int32_t kRate = std::numeric_limits<int32_t>::max();
    EXPECT_EQ(VELMUTIL_TimeStringToSample("999999999:00:00", kRate), std::numeric_limits<int64_t>::max());
    EXPECT_EQ(VELMUTIL_TimeStringToSample("-999999999:00:00", kRate), std::numeric_limits<int64_t>::min());
    EXPECT_EQ(VELMUTIL_TimeStringToSample("999999999:00:00", 48000), int64_t(999999999) * 3600 * 48000);
}

TEST(UtilTime, TheLongestPositionsNeverTurnNegative)
{
    constexpr int64_t kMax = std::numeric_limits<int64_t>::max();
    char buffer[64];
    ASSERT_TRUE(VELMUTIL_SamplesToTimeString(kMax, kMax, 1, buffer, sizeof buffer));
    EXPECT_EQ(std::string(buffer).find('-'), std::string::npos) << buffer;
    EXPECT_EQ(ms_text(kMax, kMax).find('-'), std::string::npos) << ms_text(kMax, kMax);
    int h = 0;
    VELMUTIL_DecomposeMsTime(kMax, &h, nullptr, nullptr, nullptr);
    EXPECT_EQ(h, std::numeric_limits<int>::max());
}

TEST(UtilTime, DecomposeMsTimeTruncates)
{
    int h, m, s, ms;
    VELMUTIL_DecomposeMsTime(int64_t(25) * 3600000 + 61 * 1000 + 7, &h, &m, &s, &ms);
    EXPECT_EQ(h, 25);
    EXPECT_EQ(m, 1);
    EXPECT_EQ(s, 1);
    EXPECT_EQ(ms, 7);
}
