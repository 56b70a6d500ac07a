// Spectra of known sines through every window: peak bin, level and leakage.
#include "spectrum_helpers.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

using dsptest::sine;
using dsptest::windowed_db;

namespace {

struct WindowCase {
    int kind;
    const char *name;
    double sidelobe_db;  // highest sidelobe relative to the main lobe
};

const WindowCase kWindows[] = {
    {DSPB_WINDOW_RECTANGULAR, "rectangular", -13.26},
    {DSPB_WINDOW_TRIANGULAR, "triangular", -26.52},
    {DSPB_WINDOW_HANNING, "hanning", -31.47},
    {DSPB_WINDOW_HAMMING, "hamming", -42.68},
    {DSPB_WINDOW_BLACKMAN, "blackman", -58.11},
    {DSPB_WINDOW_BLACKMAN_HARRIS, "blackman-harris", -92.0},
    {DSPB_WINDOW_BLACKMAN_NUTTALL, "blackman-nuttall", -98.17},
};

int peak_bin(const std::vector<float> &db)
{
    return int(std::max_element(db.begin(), db.end()) - db.begin());
}

// Highest level right of the main lobe (which ends at its first minimum),
// within `span` bins of the peak.
double highest_sidelobe(const std::vector<float> &db, int peak, int span)
{
    int k = peak;
    while (k + 1 < int(db.size()) && db[k + 1] < db[k])
        ++k;
    return *std::max_element(db.begin() + k, db.begin() + std::min(peak + span, int(db.size())));
}

}  // namespace

TEST(SignalDspSpectrum, SineOnABinPeaksThereAtItsLevelInEveryWindow)
{
    // Amplitude 0.5 is -6.02 dB of full scale, whatever the window.
    const int n = 1024;
    const auto signal = sine(n, 0.5, 100, n);
    for (const auto &w : kWindows) {
        SCOPED_TRACE(w.name);
        const auto db = windowed_db(signal, w.kind, n, n);
        ASSERT_EQ(db.size(), size_t(n / 2 + 1));
        EXPECT_EQ(peak_bin(db), 100);
        EXPECT_NEAR(db[100], 20.0 * std::log10(0.5), 0.05);
    }
}

TEST(SignalDspSpectrum, SidelobesOfEachWindowMatchTheTextbook)
{
    // A 1024-sample frame padded to 65536 points samples the window's spectrum
    // 64 times per bin of the frame, fine enough to find each sidelobe's top.
    const int length = 1024, fft = 65536, pad = fft / length;
    const auto signal = sine(length, 0.5, fft / 4, fft);
    for (const auto &w : kWindows) {
        SCOPED_TRACE(w.name);
        const auto db = windowed_db(signal, w.kind, length, fft);
        ASSERT_FALSE(db.empty());
        const int peak = peak_bin(db);
        EXPECT_EQ(peak, fft / 4);
        const double sidelobe = highest_sidelobe(db, peak, 40 * pad) - db[peak];
        EXPECT_NEAR(sidelobe, w.sidelobe_db, 1.0);
    }
}

TEST(SignalDspSpectrum, SineBetweenBinsPeaksInTheNearestBin)
{
    const int n = 2048;
    const auto signal = sine(n, 0.25, 300.3, n);
    const auto db = windowed_db(signal, DSPB_WINDOW_HANNING, n, n);
    ASSERT_FALSE(db.empty());
    EXPECT_EQ(peak_bin(db), 300);
    // Off-centre a hann window loses at most its 1.42 dB scalloping.
    EXPECT_LT(db[300], 20.0 * std::log10(0.25));
    EXPECT_GT(db[300], 20.0 * std::log10(0.25) - 1.42);
}

TEST(SignalDspSpectrum, DecibelsOfKnownPowers)
{
    const int n = 8;  // bins 0 .. 4; 0 and 4 are the edge bins
    const double norm = 100.0, range = 90.0;
    const float full_inner = float(norm * norm / 4.0), full_edge = float(norm * norm);
    const float in[5] = {full_edge, full_inner * 0.01f, 0.0f, full_inner * 10.0f, full_edge * 1e-3f};
    float out[5];
    ASSERT_EQ(DSPB_PSDtoDB(n, in, out, nullptr, norm, range), 5);
    EXPECT_NEAR(out[0], 0.0, 1e-4);
    EXPECT_NEAR(out[1], -20.0, 1e-4);
    EXPECT_EQ(out[2], -90.0f);  // silence sits on the floor
    EXPECT_EQ(out[3], 0.0f);    // above full scale is clamped
    EXPECT_NEAR(out[4], -30.0, 1e-4);

    const float weights[5] = {1.0f, 0.1f, 1.0f, 1e-3f, 1e-9f};
    float again[5];
    std::copy(in, in + 5, again);
    ASSERT_EQ(DSPB_PSDtoDB(n, again, again, weights, norm, range), 5);  // in place
    EXPECT_NEAR(again[1], -30.0, 1e-4);
    EXPECT_NEAR(again[3], -20.0, 1e-4);
    EXPECT_EQ(again[4], -90.0f);
}

TEST(SignalDspSpectrum, DecibelsFollowTheLogarithmOverTheWholeRange)
{
    // Powers from far below the floor to far above full scale, in uneven steps.
    const int n = 2048, bins = n / 2 + 1;
    const double norm = 2.0, range = 300.0;  // inner bins: 0 dB at power 1
    std::vector<float> in(bins), out(bins);
    double p = 1e-35;
    for (int round = 0; round < 40; ++round) {
        for (auto &v : in) {
            v = float(p);
            p *= 1.00173;
        }
        ASSERT_EQ(DSPB_PSDtoDB(n, in.data(), out.data(), nullptr, norm, range), bins);
        for (int k = 1; k < bins - 1; ++k) {
            const double expected = std::clamp(10.0 * std::log10(double(in[k])), -range, 0.0);
            ASSERT_NEAR(out[k], expected, 1e-4) << in[k];
        }
    }
    // Nothing a power spectrum can hold escapes -range .. 0.
    const float odd[] = {0.0f, -1.0f, NAN, INFINITY, 1e-44f /* subnormal */, -INFINITY};
    for (float v : odd) {
        std::fill(in.begin(), in.end(), v);
        ASSERT_EQ(DSPB_PSDtoDB(n, in.data(), out.data(), nullptr, norm, range), bins);
        const float expected = v == INFINITY ? 0.0f : float(-range);
        for (float db : out)
            ASSERT_EQ(db, expected) << v;
    }
}

TEST(SignalDspSpectrum, DecibelsRefuseBadArguments)
{
    float in[5] = {1, 1, 1, 1, 1}, out[5] = {7, 7, 7, 7, 7};
    EXPECT_EQ(DSPB_PSDtoDB(6, in, out, nullptr, 1.0, 90.0), 0);
    EXPECT_EQ(DSPB_PSDtoDB(8, nullptr, out, nullptr, 1.0, 90.0), 0);
    EXPECT_EQ(DSPB_PSDtoDB(8, in, nullptr, nullptr, 1.0, 90.0), 0);
    EXPECT_EQ(DSPB_PSDtoDB(8, in, out, nullptr, 0.0, 90.0), 0);
    EXPECT_EQ(DSPB_PSDtoDB(8, in, out, nullptr, 1.0, -5.0), 0);
    EXPECT_EQ(DSPB_PSDtoDB(8, in, out, nullptr, NAN, 90.0), 0);
    EXPECT_EQ(DSPB_PSDtoDB(8, in, out, nullptr, 1.0, INFINITY), 0);
    EXPECT_EQ(out[0], 7.0f);
}

TEST(SignalDspSpectrum, PreEmphasisWeightsMatchFilteringTheSignal)
{
    const int n = 1024;
    const double c = 0.9;
    std::vector<float> weights(n);
    ASSERT_EQ(DSPB_CreatePreEmphAdjust(weights.data(), n, c), 1);
    EXPECT_NEAR(weights[0], (1 - c) * (1 - c), 1e-6);
    EXPECT_NEAR(weights[n / 2], (1 + c) * (1 + c), 1e-6);
    EXPECT_NEAR(weights[100], weights[n - 100], 1e-6);

    // A whole number of periods filtered circularly by y[n] = x[n] - c x[n-1]
    // has exactly the weighted spectrum of the original.
    for (int bin : {5, 100, 400}) {
        SCOPED_TRACE(bin);
        const auto x = sine(n, 0.5, bin, n);
        std::vector<float> y(n);
        for (int i = 0; i < n; ++i)
            y[i] = float(x[i] - c * x[(i + n - 1) % n]);
        dsptest::Proc proc(DSPB_FFTProcCreate(n));
        std::vector<float> px(n / 2 + 1), py(n / 2 + 1);
        ASSERT_TRUE(DSPB_FFTProcExecutePSD(proc.get(), x.data(), px.data()));
        ASSERT_TRUE(DSPB_FFTProcExecutePSD(proc.get(), y.data(), py.data()));
        DSPB_PSDtoDB(n, px.data(), px.data(), weights.data(), n, 200.0);
        DSPB_PSDtoDB(n, py.data(), py.data(), nullptr, n, 200.0);
        EXPECT_NEAR(px[bin], py[bin], 0.01);
    }

    std::vector<float> flat(n);
    ASSERT_EQ(DSPB_CreatePreEmphAdjust(flat.data(), n, 0.0), 1);
    EXPECT_TRUE(std::all_of(flat.begin(), flat.end(), [](float w) { return w == 1.0f; }));
    EXPECT_EQ(DSPB_CreatePreEmphAdjust(flat.data(), 1000, 0.9), 0);
    EXPECT_EQ(DSPB_CreatePreEmphAdjust(nullptr, n, 0.9), 0);
    EXPECT_EQ(DSPB_CreatePreEmphAdjust(flat.data(), n, NAN), 0);
}

TEST(SignalDspSpectrum, SpectrogramLevelsOfSilenceAndFullScaleStayInRange)
{
    // A spectrogram column as the "wide" preset makes it: a 40-sample
    // blackman frame in a 256-point FFT with pre-emphasis, shown over 110 dB
    // as 16-bit levels 65535 dB / D + 65535.
    const int n = 256, length = 40;
    const double range = 110.0;
    std::vector<float> window(length), weights(n);
    ASSERT_EQ(DSPB_CreateWindow(DSPB_WINDOW_BLACKMAN, window.data(), length), 1);
    ASSERT_EQ(DSPB_CreatePreEmphAdjust(weights.data(), n, 0.9), 1);
    const double norm = DSPB_GetWindowNormFactor(window.data(), length);
    dsptest::Proc proc(DSPB_FFTProcCreate(n));

    auto levels = [&](std::vector<float> frame) {
        frame.resize(n, 0.0f);
        DSPB_ApplyWindow(window.data(), frame.data(), length);
        std::vector<float> db(n / 2 + 1);
        EXPECT_EQ(DSPB_FFTProcExecutePSD(proc.get(), frame.data(), db.data()), n / 2 + 1);
        EXPECT_EQ(DSPB_PSDtoDB(n, db.data(), db.data(), weights.data(), norm, range), n / 2 + 1);
        std::vector<double> out;
        for (float v : db)
            out.push_back(65535.0 * v / range + 65535.0);
        return out;
    };
    for (double level : levels(std::vector<float>(length, 0.0f)))
        EXPECT_EQ(level, 0.0);
    const auto loud = levels(sine(length, 1.0, 32, n));  // bin 32 is 5.5 kHz at 44.1 kHz
    for (double level : loud) {
        EXPECT_GE(level, 0.0);
        EXPECT_LE(level, 65535.0);
    }
    EXPECT_GT(*std::max_element(loud.begin(), loud.end()), 65535.0 * (1.0 - 3.0 / range));
}
