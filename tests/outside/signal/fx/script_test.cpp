// Script checking, reconfiguration and the argument checks of the exported calls.
#include "fx_test_support.hpp"

using namespace fxtest;

TEST(Script, MalformedTextsAreRefusedWithAMessage)
{
    const char *bad[] = {
        "",
        "   ",
        "nosuch",
        "nosuch[a=1]",
        "fmt-conv[sr=48000]",
        "fmtconv sr=48000",
        "fmtconv[sr=48000",
        "fmtconv[sr=48000]]",
        "fmtconv[sr]",
        "fmtconv[=5]",
        "fmtconv[sr=]",
        "fmtconv[sr=48000,sr=44100]",
        "fmtconv[rate=48000]",
        "fmtconv[sr=0]",
        "fmtconv[sr=-44100]",
        "fmtconv[sr=4.5e4]",
        "fmtconv[sr=abc]",
        "fmtconv[sr=2000000]",
        "fmtconv[sr=100]",
        "fmtconv[nc=0]",
        "fmtconv[nc=-2]",
        "fmtconv[nc=65]",
        "fmtconv[mixergains=[[1,0,0]]]",
        "fmtconv[mixergains=[[1],[0]]]",
        "fmtconv[nc=2,mixergains=[[1,0]]]",
        "fmtconv[mixergains=[[1,0],[1]]]",
        "fmtconv[mixergains=[1,0]]",
        "fmtconv[mixergains=[[1,x]]]",
        "fmtconv[mixergains=[[1e300,0]]]",
        "fmtconv[sr=48000]:",
        ":invert",
        "invert::invert",
        "invert[x=1]",
        "quantizer",
        "quantizer[type=PCM12]",
        "quantizer[type=NOCHANGES ]",
        "quantizer[type=PCM16,dither=pink]",
        "GAIN[offsets=[0.1,0.2,0.3]]",
        "GAIN[offsets=[0.1,x]]",
        "GAIN[offsets=[]]",
        "GAIN[offsets=[0.1,]]",
        "GAIN[gains=[1],db=2]",
        "GAIN[db=nan]",
        "GAIN[db=inf]",
        "GAIN[db=1000]",
        "amplify",
        "amplify[db=1,factor=2]",
        "normalize",
        "normalize[peak=-1]",
        "normalize[peak=1e-320]",
        "fadein",
        "fadein[length=0]",
        "fadeout[length=-5]",
        "fadeout[length=1.5]",
    };
    for (const char *script : bad) {
        LogCapture log;
        EXPECT_EQ(AUDIOFX_CreatePathEx(format(44100, 2), -1, -1, "%s", script), nullptr) << script;
        ASSERT_EQ(log.errors().size(), 1u) << script;
        EXPECT_EQ(log.errors()[0].rfind("AUDIOFX_CreatePathEx: ", 0), 0u) << log.errors()[0];
    }
}

TEST(Script, MessagesNameTheFault)
{
    LogCapture log;
    EXPECT_EQ(AUDIOFX_CreatePathEx(format(44100, 2), -1, -1, "invert:echo[delay=3]"), nullptr);
    EXPECT_EQ(AUDIOFX_CreatePathEx(format(44100, 2), -1, -1, "fmtconv[mixergains=[[1,0,0]]]"), nullptr);
    ASSERT_EQ(log.errors().size(), 2u);
    EXPECT_NE(log.errors()[0].find("unknown stage \"echo\""), std::string::npos) << log.errors()[0];
    EXPECT_NE(log.errors()[1].find("is 1x3 for 2 input channels"), std::string::npos) << log.errors()[1];
}

TEST(Script, BadInputFormatsAndNullScriptsAreRefused)
{
    LogCapture log;
    EXPECT_EQ(AUDIOFX_CreatePathEx(format(0, 2), -1, -1, "invert"), nullptr);
    EXPECT_EQ(AUDIOFX_CreatePathEx(format(-44100, 2), -1, -1, "invert"), nullptr);
    EXPECT_EQ(AUDIOFX_CreatePathEx(format(44100, 0), -1, -1, "invert"), nullptr);
    EXPECT_EQ(AUDIOFX_CreatePathEx(format(44100, 65), -1, -1, "invert"), nullptr);
    EXPECT_EQ(AUDIOFX_CreatePathEx(format(44100, 2), -1, -1, nullptr), nullptr);
    EXPECT_EQ(log.errors().size(), 5u);
}

TEST(Script, NamesAndKeysIgnoreCaseAndBlanks)
{
    AUDIOFX *path = AUDIOFX_CreatePathEx(format(44100, 2), -1, -1,
                                         " FmtConv[ SR = 48000 , NC=1 ] : Quantizer[Type=pcm16] : INVERT[] ");
    ASSERT_NE(path, nullptr);
    const _audio_format out = AUDIOFX_GetOutputFormat(path);
    EXPECT_EQ(out.sampleRate, 48000);
    EXPECT_EQ(out.numChannels, 1);
    EXPECT_EQ(out.bitsPerSample, 16);
    AUDIOFX_DestroyPath(path);
}

TEST(Reconfigure, FailureKeepsThePathAsItWas)
{
    AUDIOFX *path = AUDIOFX_CreatePathEx(format(8000, 1), -1, -1, "amplify[factor=2]");
    ASSERT_NE(path, nullptr);
    {
        LogCapture log;
        EXPECT_EQ(AUDIOFX_ReconfigurePath(path, "amplify[factor=%s]", "x"), 0);
        EXPECT_EQ(AUDIOFX_ReconfigurePath(nullptr, "invert"), 0);
        EXPECT_EQ(AUDIOFX_ReconfigurePath(path, nullptr), 0);
        EXPECT_EQ(log.errors().size(), 3u);
    }
    EXPECT_EQ(run_path(path, {0.25f}, 1), std::vector<float>{0.5f});
    ASSERT_EQ(AUDIOFX_ReconfigurePath(path, "amplify[factor=%d]:fmtconv[nc=2]", 3), 1);
    EXPECT_EQ(AUDIOFX_GetOutputFormat(path).numChannels, 2);
    EXPECT_EQ(run_path(path, {0.25f}, 1), (std::vector<float>{0.75f, 0.75f}));
    AUDIOFX_DestroyPath(path);
}

TEST(Reconfigure, UnchangedLeadingStagesKeepTheirState)
{
    // Changing the gain behind a resampler mid-stream must not restart the
    // resampler: the output continues as the unchanged path's would, scaled.
    const auto in = sine(1000, 44100, 1, 8820);
    AUDIOFX *reference = AUDIOFX_CreatePathEx(format(44100, 1), -1, -1, "fmtconv[sr=48000]");
    AUDIOFX *path = AUDIOFX_CreatePathEx(format(44100, 1), -1, -1, "fmtconv[sr=48000]:amplify[factor=1]");
    ASSERT_TRUE(reference && path);
    std::vector<float> expected(20000), out(20000);
    const int64_t half = 4410;
    const int64_t r1 = AUDIOFX_ProcessSamples(reference, in.data(), half, expected.data(), 20000);
    const int64_t p1 = AUDIOFX_ProcessSamples(path, in.data(), half, out.data(), 20000);
    ASSERT_EQ(r1, p1);
    ASSERT_EQ(AUDIOFX_ReconfigurePath(path, "fmtconv[sr=48000]:amplify[factor=2]"), 1);
    const int64_t r2 =
        AUDIOFX_ProcessSamples(reference, in.data() + half, half, expected.data() + r1, 20000 - r1);
    const int64_t p2 = AUDIOFX_ProcessSamples(path, in.data() + half, half, out.data() + p1, 20000 - p1);
    ASSERT_EQ(r2, p2);
    ASSERT_GT(r2, 4000);
    for (int64_t i = r1; i < r1 + r2; ++i)
        ASSERT_FLOAT_EQ(out[i], 2 * expected[i]) << i;
    AUDIOFX_DestroyPath(reference);
    AUDIOFX_DestroyPath(path);
}

TEST(ProcessSamples, BadArgumentsFailWithoutHarm)
{
    AUDIOFX *path = AUDIOFX_CreatePathEx(format(8000, 1), -1, -1, "invert");
    ASSERT_NE(path, nullptr);
    float in[4] = {0.5f, 0.5f, 0.5f, 0.5f}, out[4] = {};
    LogCapture log;
    EXPECT_EQ(AUDIOFX_ProcessSamples(nullptr, in, 4, out, 4), -1);
    EXPECT_EQ(AUDIOFX_ProcessSamples(path, in, -1, out, 4), -1);
    EXPECT_EQ(AUDIOFX_ProcessSamples(path, nullptr, 4, out, 4), -1);
    EXPECT_EQ(AUDIOFX_ProcessSamples(path, in, 4, nullptr, 4), -1);
    EXPECT_EQ(AUDIOFX_ProcessSamples(path, in, 4, out, -4), -1);
    EXPECT_EQ(log.errors().size(), 5u);
    EXPECT_EQ(AUDIOFX_GetOutputFormat(nullptr).sampleRate, 0);
    EXPECT_EQ(AUDIOFX_DestroyPath(nullptr), 0);
    // Nothing was consumed: the path still answers one frame for one frame.
    EXPECT_EQ(AUDIOFX_ProcessSamples(path, in, 4, out, 4), 4);
    EXPECT_EQ(out[3], -0.5f);
    EXPECT_EQ(AUDIOFX_DestroyPath(path), 1);
}

TEST(ProcessSamples, RefusesToKeepBackUnboundedOutput)
{
    // 8 kHz mono up to 1 MHz on 64 channels: 8000 samples of output per input frame.
    AUDIOFX *path = AUDIOFX_CreatePathEx(format(8000, 1), -1, -1, "fmtconv[sr=1000000,nc=64]");
    ASSERT_NE(path, nullptr);
    const std::vector<float> in(1100, 0.1f);
    {
        LogCapture log;
        EXPECT_EQ(AUDIOFX_ProcessSamples(path, in.data(), 1100, nullptr, 0), -1);
        EXPECT_EQ(AUDIOFX_ProcessSamples(path, in.data(), INT64_MAX, nullptr, 0), -1);
        EXPECT_EQ(log.errors().size(), 2u);
    }
    // Nothing was taken in: a short block with room still comes out whole.
    std::vector<float> out(64 * 20000);
    int64_t total = AUDIOFX_ProcessSamples(path, in.data(), 100, out.data(), 20000);
    EXPECT_GE(total, 0);
    for (int64_t got; (got = AUDIOFX_ProcessSamples(path, nullptr, 0, out.data(), 20000)) > 0;)
        total += got;
    EXPECT_NEAR(static_cast<double>(total), 12500, 3);
    AUDIOFX_DestroyPath(path);
}

TEST(ProcessSamples, EmptyInputHandsOutWhatWaits)
{
    AUDIOFX *path = AUDIOFX_CreatePathEx(format(8000, 1), -1, -1, "amplify[factor=2]");
    ASSERT_NE(path, nullptr);
    const float in[3] = {0.1f, 0.2f, 0.3f};
    float out[3] = {};
    EXPECT_EQ(AUDIOFX_ProcessSamples(path, in, 3, out, 0), 0);
    EXPECT_EQ(AUDIOFX_ProcessSamples(path, in, 0, out, 2), 2);
    EXPECT_FLOAT_EQ(out[1], 0.4f);
    EXPECT_EQ(AUDIOFX_ProcessSamples(path, nullptr, 0, out, 3), 1);
    EXPECT_FLOAT_EQ(out[0], 0.6f);
    EXPECT_EQ(AUDIOFX_ProcessSamples(path, nullptr, 0, out, 3), 0);
    AUDIOFX_DestroyPath(path);
}

TEST(Script, AbsurdLengthAndBlockHintsAreHarmless)
{
    AUDIOFX *path =
        AUDIOFX_CreatePathEx(format(44100, 2), INT64_MAX, INT64_MAX, "fmtconv[sr=48000,nc=8]:fadeout");
    ASSERT_NE(path, nullptr);
    const auto out = run_path(path, std::vector<float>(2 * 4410, 0.5f), 2);
    EXPECT_NEAR(static_cast<double>(out.size()), 8 * 4800, 8 * 3);
    AUDIOFX_DestroyPath(path);
}
