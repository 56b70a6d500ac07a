// Format conversion: resampling keeps pitch and length, streams in any block
// size, and channel mixing follows the gain matrix.
#include "fx_test_support.hpp"

using namespace fxtest;

namespace {

AUDIOFX *make(const _audio_format &in, const char *script)
{
    AUDIOFX *path = AUDIOFX_CreatePathEx(in, -1, -1, "%s", script);
    EXPECT_NE(path, nullptr) << script;
    return path;
}

}  // namespace

TEST(Fmtconv, SineKeepsItsFrequencyFrom44100To48000)
{
    const auto in = sine(1000, 44100, 2, 44100);
    AUDIOFX *path = AUDIOFX_CreatePathEx(format(44100, 2), -1, -1, "fmtconv[sr=%d,nc=%d]", 48000, 2);
    ASSERT_NE(path, nullptr);
    const _audio_format out_format = AUDIOFX_GetOutputFormat(path);
    EXPECT_EQ(out_format.sampleRate, 48000);
    EXPECT_EQ(out_format.numChannels, 2);
    const auto out = run_path(path, in, 2);
    EXPECT_NEAR(tone_level(out, 2, 0, 1000, 48000), 0.5, 0.005);
    EXPECT_NEAR(tone_level(out, 2, 1, 1000, 48000), 0.25, 0.0025);
    // A relabelled (unconverted) signal would sound at 1000 * 48000 / 44100 Hz.
    EXPECT_LT(tone_level(out, 2, 0, 1000.0 * 48000 / 44100, 48000), 0.01);

    int crossings = 0;
    for (size_t f = 2 * 1000; f + 1 < out.size() / 2 - 1000; ++f)
        crossings += (out[2 * f] < 0) != (out[2 * f + 2] < 0);
    const double seconds = (out.size() / 2 - 3000) / 48000.0;
    EXPECT_NEAR(crossings / seconds, 2000, 4);
    AUDIOFX_DestroyPath(path);
}

TEST(Fmtconv, LengthFollowsTheRateRatioAfterDrain)
{
    const struct {
        int from, to;
        int64_t frames;
    } cases[] = {
        {44100, 48000, 3 * 44100 + 17}, {48000, 44100, 100003}, {8000, 44100, 8001}, {96000, 22050, 50000}};
    for (const auto &c : cases) {
        AUDIOFX *path = AUDIOFX_CreatePathEx(format(c.from, 1), -1, -1, "fmtconv[sr=%d]", c.to);
        ASSERT_NE(path, nullptr);
        const auto out = run_path(path, sine(440, c.from, 1, c.frames), 1, {1000, 3});
        const double expected = static_cast<double>(c.frames) * c.to / c.from;
        EXPECT_NEAR(static_cast<double>(out.size()), expected, 3) << c.from << " -> " << c.to;
        AUDIOFX_DestroyPath(path);
    }
}

TEST(Fmtconv, OddBlocksGiveTheSameOutputAsOneCall)
{
    const auto in = sine(997, 44100, 2, 30011);
    expect_block_size_does_not_matter(format(44100, 2), "fmtconv[sr=48000,nc=1]", in,
                                      {1, 7, 333, 4099, 64, 2});
    expect_block_size_does_not_matter(format(44100, 2), "fmtconv[sr=22050,nc=3]", in, {5000, 1, 13});
}

TEST(Fmtconv, DrainStartsANewStream)
{
    const auto in = sine(1000, 44100, 1, 5000);
    AUDIOFX *path = make(format(44100, 1), "fmtconv[sr=48000]:fadein[length=1000]");
    const auto first = run_path(path, in, 1);
    const auto second = run_path(path, in, 1);
    EXPECT_EQ(first, second);
    AUDIOFX_DestroyPath(path);
}

TEST(Fmtconv, OutputBeyondTheRoomIsHandedOutLater)
{
    // A capture path: 48 kHz mono device into a 44.1 kHz stereo signal, with little room.
    const auto in = sine(1000, 48000, 1, 9600);
    AUDIOFX *reference = make(format(48000, 1), "fmtconv[sr=44100,nc=2]");
    AUDIOFX *tight = make(format(48000, 1), "fmtconv[sr=44100,nc=2]");
    const auto expected = run_path(reference, in, 1, {9600});

    std::vector<float> out, room(2 * 500);
    for (int64_t done = 0; done < 9600; done += 960) {
        const int64_t got = AUDIOFX_ProcessSamples(tight, in.data() + done, 960, room.data(), 500);
        ASSERT_GE(got, 0);
        EXPECT_LE(got, 500);
        out.insert(out.end(), room.begin(), room.begin() + got * 2);
    }
    for (int64_t got; (got = AUDIOFX_ProcessSamples(tight, nullptr, 0, room.data(), 500)) > 0;)
        out.insert(out.end(), room.begin(), room.begin() + got * 2);
    EXPECT_EQ(out, expected);
    AUDIOFX_DestroyPath(reference);
    AUDIOFX_DestroyPath(tight);
}

TEST(Fmtconv, MapOutputToInputUndoesEveryRateChange)
{
    AUDIOFX *path = make(format(44100, 2), "fmtconv[sr=48000]:invert:fmtconv[sr=96000]");
    EXPECT_EQ(AUDIOFX_MapOutputToInput(path, 96000), 44100);
    EXPECT_EQ(AUDIOFX_MapOutputToInput(path, 0), 0);
    EXPECT_EQ(AUDIOFX_MapOutputToInput(path, 960), 441);
    EXPECT_EQ(AUDIOFX_MapOutputToInput(path, -1), -1);
    EXPECT_EQ(AUDIOFX_MapOutputToInput(nullptr, 10), -1);
    AUDIOFX_DestroyPath(path);

    AUDIOFX *same_rate = make(format(44100, 2), "fmtconv[nc=1]");
    EXPECT_EQ(AUDIOFX_MapOutputToInput(same_rate, 12345), 12345);
    AUDIOFX_DestroyPath(same_rate);
}

TEST(Fmtconv, DefaultMixesAverageDownAndRepeatUp)
{
    // Frames of distinct constants per channel make every mix visible.
    const std::vector<float> six = {0.1f, 0.2f, 0.3f, 0.4f, 0.5f, 0.6f};
    AUDIOFX *to_stereo = make(format(44100, 6), "fmtconv[nc=2]");
    auto out = run_path(to_stereo, six, 6);
    ASSERT_EQ(out.size(), 2u);
    EXPECT_NEAR(out[0], (0.1 + 0.3 + 0.5) / 3, 1e-6);
    EXPECT_NEAR(out[1], (0.2 + 0.4 + 0.6) / 3, 1e-6);
    AUDIOFX_DestroyPath(to_stereo);

    AUDIOFX *to_mono = make(format(44100, 2), "fmtconv[nc=1]");
    out = run_path(to_mono, {0.2f, 0.6f}, 2);
    ASSERT_EQ(out.size(), 1u);
    EXPECT_NEAR(out[0], 0.4, 1e-6);
    AUDIOFX_DestroyPath(to_mono);

    AUDIOFX *to_five = make(format(44100, 2), "fmtconv[nc=5]");
    out = run_path(to_five, {0.2f, 0.6f}, 2);
    EXPECT_EQ(out, (std::vector<float>{0.2f, 0.6f, 0.2f, 0.6f, 0.2f}));
    AUDIOFX_DestroyPath(to_five);
}

TEST(Fmtconv, MixerGainsHaveOneRowPerOutputChannel)
{
    AUDIOFX *path = make(format(44100, 2), "fmtconv[nc=3,mixergains=[[1,0],[0,0.5],[0.5,0.5]]]");
    EXPECT_EQ(AUDIOFX_GetOutputFormat(path).numChannels, 3);
    const auto out = run_path(path, {0.2f, 0.6f, -0.4f, 0.8f}, 2);
    const std::vector<float> expected = {0.2f, 0.3f, 0.4f, -0.4f, 0.4f, 0.2f};
    ASSERT_EQ(out.size(), expected.size());
    for (size_t i = 0; i < out.size(); ++i)
        EXPECT_NEAR(out[i], expected[i], 1e-6) << i;
    AUDIOFX_DestroyPath(path);

    // The text a format change writes for its mixer gains.
    const double downmix[2 * 3] = {0.5, 0.25, 0.25, 0.0, 0.5, 0.5};
    char gains[256];
    ASSERT_GT(BLSTRING_SetDoubleMatrixToString(downmix, 2, 3, gains, sizeof gains), 0);
    AUDIOFX *to_stereo =
        AUDIOFX_CreatePathEx(format(44100, 3), -1, -1, "fmtconv[sr=%d,nc=%d,mixergains=%s]", 48000, 2, gains);
    ASSERT_NE(to_stereo, nullptr);
    EXPECT_EQ(AUDIOFX_GetOutputFormat(to_stereo).numChannels, 2);
    AUDIOFX_DestroyPath(to_stereo);

    // Without nc the rows give the channel count.
    AUDIOFX *swap = make(format(44100, 2), "fmtconv[mixergains=[[0,1],[1,0]]]");
    EXPECT_EQ(run_path(swap, {0.25f, 0.75f}, 2), (std::vector<float>{0.75f, 0.25f}));
    AUDIOFX_DestroyPath(swap);
}

TEST(Fmtconv, MixingAndResamplingTogetherKeepThePitch)
{
    for (const char *script : {"fmtconv[sr=48000,nc=1]", "fmtconv[sr=48000,nc=4]"}) {
        AUDIOFX *path = make(format(44100, 2), script);
        const int channels = AUDIOFX_GetOutputFormat(path).numChannels;
        const auto out = run_path(path, sine(1000, 44100, 2, 22050), 2, {555});
        const double expected = channels == 1 ? (0.5 + 0.25) / 2 : 0.5;
        EXPECT_NEAR(tone_level(out, channels, 0, 1000, 48000), expected, 0.005) << script;
        AUDIOFX_DestroyPath(path);
    }
}

TEST(Fmtconv, TheSameFormatPassesSamplesUnchanged)
{
    const auto in = sine(1000, 44100, 2, 3000);
    AUDIOFX *path = make(format(44100, 2), "fmtconv[sr=44100,nc=2]");
    EXPECT_EQ(run_path(path, in, 2, {1000, 7}), in);
    EXPECT_EQ(AUDIOFX_MapOutputToInput(path, 777), 777);
    AUDIOFX_DestroyPath(path);
}
