// Recording pipes: inserted frames, visible to readers while they arrive.
#include <atomic>
#include <thread>

#include "store_test_support.hpp"

using namespace store_test;

namespace {

TEST(SignalStorePipe, FramesAreInsertedAtThePosition)
{
    const Channels start = random_channels(2, 10000, 31);
    AUDIOSIGNAL *signal = make_signal(start);
    const Channels recorded = random_channels(2, 150000, 32);
    AUDIOSIGNAL_PIPE *pipe = AUDIOSIGNAL_CreatePipe(signal, 4000);
    ASSERT_NE(pipe, nullptr);
    std::vector<float> interleaved;
    for (int64_t at = 0, n = 0; at < 150000; at += n) {
        n = std::min<int64_t>(4410, 150000 - at);
        interleaved.clear();
        for (int64_t i = 0; i < n; ++i) {
            for (int c = 0; c < 2; ++c) interleaved.push_back(recorded[size_t(c)][size_t(at + i)]);
        }
        ASSERT_EQ(AUDIOSIGNAL_AppendToPipe(pipe, interleaved.data(), n), n);
        ASSERT_EQ(AUDIOSIGNAL_NumSamples(signal), 10000 + at + n);
    }
    EXPECT_EQ(AUDIOSIGNAL_ClosePipe(pipe), 1);
    Channels expected = start;
    for (int c = 0; c < 2; ++c) {
        expected[size_t(c)].insert(expected[size_t(c)].begin() + 4000, recorded[size_t(c)].begin(),
                                   recorded[size_t(c)].end());
    }
    EXPECT_EQ(read_all(signal), expected);
    // Full chunks plus one short one hold the recording: nothing is kept twice.
    EXPECT_LT(AUDIOSIGNAL_SizeInMemory(signal), (160000 * 2 * 4) * 11 / 10);
    EXPECT_EQ(AUDIOSIGNAL_AppendToPipe(nullptr, interleaved.data(), 1), -1);
    EXPECT_EQ(AUDIOSIGNAL_ClosePipe(nullptr), 0);
    EXPECT_EQ(AUDIOSIGNAL_CreatePipe(nullptr, 0), nullptr);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStorePipe, AnEditWhileRecordingIsNotUndoneByTheNextAppend)
{
    const Channels start = random_channels(1, 5000, 33);
    AUDIOSIGNAL *signal = make_signal(start);
    const Channels first = random_channels(1, 1000, 34), second = random_channels(1, 700, 35);
    AUDIOSIGNAL_PIPE *pipe = AUDIOSIGNAL_CreatePipe(signal, 100);
    ASSERT_EQ(AUDIOSIGNAL_AppendToPipe(pipe, first[0].data(), 1000), 1000);
    // The edit shifts and partly removes what was just recorded.
    ASSERT_EQ(AUDIOSIGNAL_ClearEx(signal, 0, 50, 150), 1);
    const Channels edited = read_all(signal);
    ASSERT_EQ(AUDIOSIGNAL_AppendToPipe(pipe, second[0].data(), 700), 700);
    EXPECT_EQ(AUDIOSIGNAL_ClosePipe(pipe), 1);
    // The edited samples stay; the new frames go in at the pipe's position.
    Channels expected = edited;
    expected[0].insert(expected[0].begin() + 1100, second[0].begin(), second[0].end());
    EXPECT_EQ(read_all(signal), expected);
    AUDIOSIGNAL_Destroy(signal);
}

TEST(SignalStorePipe, ReadersSeeAConsistentSignalWhileRecording)
{
    const AUDIO_FORMAT format = format_of(1);
    AUDIOSIGNAL *signal = AUDIOSIGNAL_New(&format);
    AUDIOSIGNAL_PIPE *pipe = AUDIOSIGNAL_CreatePipe(signal, 0);
    std::atomic<bool> done{false};
    std::atomic<int> checks{0};
    // Sample i holds the value i, so any snapshot must read 0, 1, 2, ...
    std::atomic<bool> stopped{false};
    auto look = [&] {
        std::vector<float> out;
        while (!done) {
            const int64_t n = AUDIOSIGNAL_NumSamples(signal);
            if (n == 0) continue;
            float lo, hi;
            ASSERT_EQ(AUDIOSIGNAL_GetChannelMinMax(signal, 0, 0, n, &lo, &hi), 1);
            ASSERT_EQ(lo, 0.0f);
            ASSERT_GE(hi, float(n - 1));
            out.resize(size_t(std::min<int64_t>(n, 1000)));
            ASSERT_EQ(AUDIOSIGNAL_GetChannelSamples(signal, 0, n - int64_t(out.size()), out.data(), int64_t(out.size())),
                      int64_t(out.size()));
            for (size_t i = 1; i < out.size(); ++i) ASSERT_EQ(out[i], out[i - 1] + 1.0f);
            ++checks;
        }
    };
    std::thread reader([&] {
        look();
        stopped = true;  // also when a check failed
    });
    std::vector<float> piece(1024);
    for (int64_t at = 0; at < 1 << 18; at += 1024) {
        for (int i = 0; i < 1024; ++i) piece[size_t(i)] = float(at + i);
        ASSERT_EQ(AUDIOSIGNAL_AppendToPipe(pipe, piece.data(), 1024), 1024);
        // Let the reader look between appends now and then.
        if (at % (32 * 1024) == 0) {
            for (const int seen = checks; checks == seen && !stopped;) std::this_thread::yield();
        }
    }
    done = true;
    reader.join();
    EXPECT_GT(checks.load(), 0);
    AUDIOSIGNAL_ClosePipe(pipe);
    float lo, hi;
    AUDIOSIGNAL_GetChannelMinMax(signal, 0, 0, AUDIOSIGNAL_END, &lo, &hi);
    EXPECT_EQ(hi, float((1 << 18) - 1));
    AUDIOSIGNAL_Destroy(signal);
}

}  // namespace
