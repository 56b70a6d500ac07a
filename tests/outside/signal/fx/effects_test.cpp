// Sample effects: offsets and gains, amplify, invert, normalize, fades and
// the dithered quantizer.
#include "fx_test_support.hpp"

#include <random>

using namespace fxtest;

namespace {

std::vector<float> apply(const _audio_format &in, const std::vector<float> &samples, const char *script,
                         int64_t length = -1)
{
    AUDIOFX *path = AUDIOFX_CreatePathEx(in, length, -1, "%s", script);
    EXPECT_NE(path, nullptr) << script;
    if (!path)
        return {};
    auto out = run_path(path, samples, in.numChannels);
    AUDIOFX_DestroyPath(path);
    return out;
}

std::vector<float> noise(int64_t samples, double amplitude, unsigned seed)
{
    std::mt19937 generator(seed);
    std::uniform_real_distribution<double> uniform(-amplitude, amplitude);
    std::vector<float> out(static_cast<size_t>(samples));
    for (float &x : out)
        x = static_cast<float>(uniform(generator));
    return out;
}

}  // namespace

TEST(Gain, OffsetsFromTheMeansRemoveTheDC)
{
    auto in = noise(2 * 200000, 0.3, 1);
    for (size_t i = 0; i < in.size(); i += 2) {
        in[i] += 0.25f;
        in[i + 1] -= 0.125f;
    }
    // What a DC removal writes: the negated means in the vector text form.
    const double means[2] = {-channel_mean(in, 2, 0), -channel_mean(in, 2, 1)};
    char offsets[1024];
    ASSERT_GT(BLSTRING_SetDoubleVectorToString(means, 2, offsets, sizeof offsets), 0);
    AUDIOFX *path = AUDIOFX_CreatePathEx(format(44100, 2), -1, -1, "GAIN[offsets=%s]", offsets);
    ASSERT_NE(path, nullptr);
    const auto out = run_path(path, in, 2, {4410, 17});
    ASSERT_EQ(out.size(), in.size());
    EXPECT_LT(std::abs(channel_mean(out, 2, 0)), 1e-6);
    EXPECT_LT(std::abs(channel_mean(out, 2, 1)), 1e-6);
    AUDIOFX_DestroyPath(path);
}

TEST(Gain, GainsInDecibelsPerChannelOrForAll)
{
    const std::vector<float> in = {0.5f, 0.5f, -0.25f, -0.25f};
    auto out = apply(format(8000, 2), in, "GAIN[gains=[-6.020599913279624,0]]");
    EXPECT_NEAR(out[0], 0.25, 1e-6);
    EXPECT_NEAR(out[1], 0.5, 1e-6);
    EXPECT_NEAR(out[2], -0.125, 1e-6);

    out = apply(format(8000, 2), in, "gain[db=6.020599913279624, offsets=0.1]");
    EXPECT_NEAR(out[0], 1.2, 1e-6);
    EXPECT_NEAR(out[3], -0.3, 1e-6);
}

TEST(Gain, AmplifyInvertAndNormalize)
{
    const std::vector<float> in = {0.1f, -0.2f, 0.05f, 0.125f};
    auto out = apply(format(8000, 1), in, "amplify[factor=2]");
    EXPECT_NEAR(out[1], -0.4, 1e-6);
    out = apply(format(8000, 1), in, "amplify[db=-20]");
    EXPECT_NEAR(out[0], 0.01, 1e-7);
    out = apply(format(8000, 1), in, "invert");
    EXPECT_EQ(out, (std::vector<float>{-0.1f, 0.2f, -0.05f, -0.125f}));

    out = apply(format(8000, 1), in, "normalize[peak=0.2]");
    EXPECT_NEAR(out[1], -1.0, 1e-6);
    EXPECT_NEAR(out[0], 0.5, 1e-6);
    out = apply(format(8000, 1), in, "normalize[peak=0.2,level=-6.020599913279624]");
    EXPECT_NEAR(out[1], -0.5, 1e-6);
    // Silence stays silence.
    out = apply(format(8000, 1), {0.0f, 0.0f}, "normalize[peak=0]");
    EXPECT_EQ(out, (std::vector<float>{0.0f, 0.0f}));
    // One peak per channel.
    out = apply(format(8000, 2), {0.5f, 0.25f}, "normalize[peak=[0.5,0.25]]");
    EXPECT_NEAR(out[0], 1.0, 1e-6);
    EXPECT_NEAR(out[1], 1.0, 1e-6);
}

TEST(Fade, InRisesFromSilenceAndOutFallsToIt)
{
    const std::vector<float> ones(2 * 150, 1.0f);
    auto in = apply(format(8000, 2), ones, "fadein[length=100]");
    ASSERT_EQ(in.size(), ones.size());
    for (int f = 0; f < 150; ++f) {
        const double expected = f < 100 ? f / 100.0 : 1.0;
        ASSERT_NEAR(in[2 * f], expected, 1e-6) << f;
        ASSERT_EQ(in[2 * f], in[2 * f + 1]);
    }
    auto out = apply(format(8000, 2), ones, "fadeout[length=100]");
    for (int f = 0; f < 150; ++f) {
        const double expected = f < 100 ? (99 - f) / 100.0 : 0.0;
        ASSERT_NEAR(out[2 * f], expected, 1e-6) << f;
    }
}

TEST(Fade, LengthDefaultsToTheStreamLength)
{
    const std::vector<float> ones(1000, 1.0f);
    auto out = apply(format(8000, 1), ones, "fadeout", 1000);
    EXPECT_NEAR(out.front(), 0.999, 1e-6);
    EXPECT_EQ(out.back(), 0.0f);
    // After a rate change the stage counts its own frames.
    out = apply(format(8000, 1), ones, "fmtconv[sr=16000]:fadeout", 1000);
    EXPECT_NEAR(static_cast<double>(out.size()), 2000, 3);
    EXPECT_LT(std::abs(out[out.size() - 3]), 0.01);
    EXPECT_NEAR(out[1000], 0.5, 0.01);
}

TEST(Fade, StreamsAcrossBlocks)
{
    const auto in = sine(300, 8000, 2, 4000);
    expect_block_size_does_not_matter(format(8000, 2), "fadein[length=3000]", in, {1, 13, 999});
    expect_block_size_does_not_matter(format(8000, 2), "fadeout[length=3000]:quantizer[type=PCM8]", in, {77});
}

namespace {

struct ErrorStats {
    double mean = 0, variance = 0;
};

// Error of the quantized output against the input, in steps of the grid; every
// output must lie on the grid.
ErrorStats quantize_error(const char *script, int bits, const std::vector<float> &in)
{
    const auto out = apply(format(44100, 1), in, script);
    EXPECT_EQ(out.size(), in.size());
    const double steps = std::ldexp(1.0, bits - 1);
    double sum = 0, squares = 0;
    for (size_t i = 0; i < out.size(); ++i) {
        const double level = out[i] * steps;
        EXPECT_EQ(level, std::round(level)) << "sample " << i << " is off the grid";
        const double e = level - in[i] * steps;
        sum += e;
        squares += e * e;
    }
    const double n = static_cast<double>(out.size());
    return {sum / n, squares / n - (sum / n) * (sum / n)};
}

}  // namespace

TEST(Quantizer, TriangularDitherAddsAQuarterStepSquaredOfNoise)
{
    // Total error of rounding plus TPDF dither: q^2/12 + q^2/6 = q^2/4.
    const auto in = noise(400000, 0.9, 7);
    for (const auto &[script, bits] : {std::pair{"quantizer[type=PCM16]", 16}, {"quantizer[type=pcm8]", 8}}) {
        const ErrorStats e = quantize_error(script, bits, in);
        EXPECT_NEAR(e.variance, 0.25, 0.01) << script;
        EXPECT_NEAR(e.mean, 0.0, 0.005) << script;
    }
    // Plain rounding leaves q^2/12.
    const ErrorStats plain = quantize_error("quantizer[type=PCM16,dither=none]", 16, in);
    EXPECT_NEAR(plain.variance, 1.0 / 12, 0.004);
}

TEST(Quantizer, SetsTheBitsAndClipsToFullScale)
{
    AUDIOFX *path = AUDIOFX_CreatePathEx(format(44100, 1, 32), -1, -1, "quantizer[type=%s]", "PCM24");
    ASSERT_NE(path, nullptr);
    EXPECT_EQ(AUDIOFX_GetOutputFormat(path).bitsPerSample, 24);
    AUDIOFX_DestroyPath(path);

    const auto out = apply(format(44100, 1), {1.5f, -3.0f}, "quantizer[type=PCM16,dither=none]");
    EXPECT_EQ(out, (std::vector<float>{32767.0f / 32768.0f, -1.0f}));
}
