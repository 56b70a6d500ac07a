// FFT processors: energy, refused lengths, start-up and use from many threads.
#include "spectrum_helpers.hpp"

#include "outside/base/blbase.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <random>
#include <string>
#include <thread>

using dsptest::Proc;

namespace {

std::vector<float> noise(int count, uint32_t seed)
{
    std::mt19937 gen(seed);
    std::uniform_real_distribution<float> dist(-1.0f, 1.0f);
    std::vector<float> x(count);
    for (auto &v : x)
        v = dist(gen);
    return x;
}

// Collects the log messages written while it lives.
class LogCapture {
public:
    LogCapture()
    {
        old_level_ = BLDEBUG_GetLevel();
        BLDEBUG_SetLevel(BLDEBUG_LEVEL_ALL);
        BLDEBUG_SetSink(&LogCapture::sink, this);
    }
    ~LogCapture()
    {
        BLDEBUG_SetSink(nullptr, nullptr);
        BLDEBUG_SetLevel(old_level_);
    }
    const std::string &text() const { return text_; }

private:
    static void sink(int, int, const char *message, void *user)
    {
        static_cast<LogCapture *>(user)->text_ += std::string(message) + "\n";
    }
    std::string text_;
    int old_level_;
};

}  // namespace

TEST(SignalDspFFTProc, PowerSpectrumKeepsTheFrameEnergy)
{
    for (int n : {2, 64, 4096}) {
        SCOPED_TRACE(n);
        const auto x = noise(n, 7u + n);
        Proc proc(DSPB_FFTProcCreate(n));
        ASSERT_TRUE(proc);
        std::vector<float> psd(n / 2 + 1);
        ASSERT_EQ(DSPB_FFTProcExecutePSD(proc.get(), x.data(), psd.data()), n / 2 + 1);
        // Parseval over the one-sided spectrum: inner bins stand for two.
        double spectral = psd.front() + psd.back();
        for (int k = 1; k < n / 2; ++k)
            spectral += 2.0 * psd[k];
        double temporal = 0.0;
        for (float v : x)
            temporal += double(v) * v;
        EXPECT_NEAR(spectral / n, temporal, temporal * 1e-5);
    }
}

TEST(SignalDspFFTProc, InputFrameIsLeftUntouched)
{
    const auto x = noise(512, 3);
    auto copy = x;
    Proc proc(DSPB_FFTProcCreate(512));
    std::vector<float> psd(257);
    ASSERT_EQ(DSPB_FFTProcExecutePSD(proc.get(), copy.data(), psd.data()), 257);
    EXPECT_EQ(copy, x);
}

TEST(SignalDspFFTProc, RefusesLengthsThatAreNotPowersOfTwoOrAbsurd)
{
    LogCapture log;
    for (int n : {0, -8, 1, 3, 1000, 6144, DSPB_MAX_FFT_LENGTH * 2, INT32_MIN}) {
        SCOPED_TRACE(n);
        EXPECT_EQ(DSPB_FFTProcCreate(n), nullptr);
    }
    EXPECT_NE(log.text().find("DSPB_FFTProcCreate: FFT length 1000 is not a power of two"),
              std::string::npos)
        << log.text();
    EXPECT_NE(log.text().find("DSPB_FFTProcCreate: FFT length 2097152 is out of range"),
              std::string::npos)
        << log.text();

    Proc proc(DSPB_FFTProcCreate(16));
    float frame[16] = {}, psd[9];
    EXPECT_EQ(DSPB_FFTProcExecutePSD(nullptr, frame, psd), 0);
    EXPECT_EQ(DSPB_FFTProcExecutePSD(proc.get(), nullptr, psd), 0);
    EXPECT_EQ(DSPB_FFTProcExecutePSD(proc.get(), frame, nullptr), 0);
    DSPB_FFTProcDestroy(nullptr);
}

TEST(SignalDspFFTProc, ThreadsComputingAtOnceGetIdenticalSpectra)
{
    const int n = 2048, frames = 64, threads = 4;
    const auto signal = noise(n * frames, 5);
    auto spectra_of = [&](DSPB_FFTPROC *proc, std::vector<float> &out) {
        out.assign(size_t(frames) * (n / 2 + 1), -1.0f);
        for (int f = 0; f < frames; ++f)
            DSPB_FFTProcExecutePSD(proc, signal.data() + size_t(f) * n,
                                   out.data() + size_t(f) * (n / 2 + 1));
    };
    std::vector<float> reference;
    {
        Proc proc(DSPB_FFTProcCreate(n));
        spectra_of(proc.get(), reference);
    }

    // Half the threads own a processor, the other half share one.
    Proc shared(DSPB_FFTProcCreate(n));
    std::vector<std::vector<float>> results(threads);
    std::vector<std::thread> workers;
    for (int t = 0; t < threads; ++t) {
        workers.emplace_back([&, t] {
            if (t % 2 == 0) {
                Proc own(DSPB_FFTProcCreate(n));
                for (int round = 0; round < 4; ++round)
                    spectra_of(own.get(), results[t]);
            } else {
                for (int round = 0; round < 4; ++round)
                    spectra_of(shared.get(), results[t]);
            }
        });
    }
    for (auto &w : workers)
        w.join();
    for (int t = 0; t < threads; ++t)
        EXPECT_EQ(results[t], reference) << "thread " << t;
}

TEST(SignalDspFFTProc, ThreadsCreatingProcessorsOfNewLengthsAtOnce)
{
    // Plan making is serialised; every thread still gets a working processor.
    std::vector<std::thread> workers;
    std::vector<int> bins(8, 0);
    for (int t = 0; t < 8; ++t) {
        workers.emplace_back([&, t] {
            const int n = 1 << (t + 9);  // 512 .. 65536
            std::vector<float> frame(n, 0.5f), psd(n / 2 + 1);
            Proc proc(DSPB_FFTProcCreate(n));
            bins[t] = proc ? DSPB_FFTProcExecutePSD(proc.get(), frame.data(), psd.data()) : -1;
        });
    }
    for (auto &w : workers)
        w.join();
    for (int t = 0; t < 8; ++t)
        EXPECT_EQ(bins[t], (1 << (t + 9)) / 2 + 1);
}
