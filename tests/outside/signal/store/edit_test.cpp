// Edits checked sample by sample against the same edits on plain vectors.
#include <algorithm>

#include "store_test_support.hpp"

using namespace store_test;

namespace {

// The plain model of a signal: channels of one length and an active mask.
struct Reference {
    Channels ch;
    uint32_t mask;

    int64_t length() const { return int64_t(ch[0].size()); }
    void clamp(int64_t &b, int64_t &e) const
    {
        if (b > e) std::swap(b, e);
        b = std::clamp<int64_t>(b, 0, length());
        e = std::clamp<int64_t>(e, 0, length());
    }
    void pad()
    {
        size_t longest = 0;
        for (auto &c : ch) longest = std::max(longest, c.size());
        for (auto &c : ch) c.resize(longest, 0.0f);
    }
    template <typename F>
    void each_active(F f)
    {
        int index = 0;
        for (size_t c = 0; c < ch.size(); ++c) {
            if (mask >> c & 1u) f(ch[c], index++);
        }
    }
    void replace(int64_t b, int64_t e, const Channels &source)
    {
        clamp(b, e);
        each_active([&](std::vector<float> &x, int i) {
            const auto &s = source[size_t(i) % source.size()];
            x.erase(x.begin() + b, x.begin() + e);
            x.insert(x.begin() + b, s.begin(), s.end());
        });
        pad();
    }
    Channels copy(int64_t b, int64_t e) const
    {
        clamp(b, e);
        Channels out;
        for (size_t c = 0; c < ch.size(); ++c) {
            if (mask >> c & 1u) out.emplace_back(ch[c].begin() + b, ch[c].begin() + e);
        }
        return out;
    }
};

class SignalStoreEdit : public ::testing::Test {
protected:
    void SetUp() override
    {
        ref.ch = random_channels(2, 300000, 11);
        ref.mask = 3;
        signal = make_signal(ref.ch);
    }
    void TearDown() override { AUDIOSIGNAL_Destroy(signal); }
    void expect_same() { ASSERT_EQ(read_all(signal), ref.ch); }

    Reference ref;
    AUDIOSIGNAL *signal = nullptr;
};

TEST_F(SignalStoreEdit, CutAndPasteBackRestoresTheSamples)
{
    const Channels original = ref.ch;
    AUDIOSIGNAL *cut = AUDIOSIGNAL_CutEx(signal, nullptr, AUDIOSIGNAL_FLAG_SERIES, 70000, 200001);
    ASSERT_NE(cut, nullptr);
    EXPECT_EQ(read_all(cut), ref.copy(70000, 200001));
    ref.replace(70000, 200001, {{}});
    expect_same();
    int64_t length = 0;
    ASSERT_EQ(AUDIOSIGNAL_PasteEx(signal, cut, AUDIOSIGNAL_FLAG_SERIES, 70000, 70000, &length), 1);
    EXPECT_EQ(length, 130001);
    EXPECT_EQ(read_all(signal), original);
    AUDIOSIGNAL_Destroy(cut);
}

TEST_F(SignalStoreEdit, CopyAppendsToAResult)
{
    AUDIOSIGNAL *result = AUDIOSIGNAL_CopyEx(signal, nullptr, 0, 10, 20);
    ASSERT_EQ(AUDIOSIGNAL_CopyEx(signal, result, 0, 299990, AUDIOSIGNAL_END), result);
    Channels expected = ref.copy(10, 20);
    const Channels tail = ref.copy(299990, 300000);
    for (size_t c = 0; c < 2; ++c) expected[c].insert(expected[c].end(), tail[c].begin(), tail[c].end());
    EXPECT_EQ(read_all(result), expected);
    EXPECT_EQ(AUDIOSIGNAL_CopyEx(signal, signal, 0, 0, 5), nullptr);
    AUDIOSIGNAL_Destroy(result);
}

TEST_F(SignalStoreEdit, RandomEditsMatchTheReference)
{
    std::mt19937 rng(12);
    auto position = [&] { return int64_t(rng() % uint32_t(ref.length() + 1)); };
    const Channels extra = random_channels(1, 5000, 13);
    AUDIOSIGNAL *mono = make_signal(extra);
    for (int step = 0; step < 60; ++step) {
        // Now and then only one channel is active.
        const uint32_t mask = step % 5 == 4 ? 1u << (rng() % 2) : 3u;
        ref.mask = mask;
        AUDIOSIGNAL_EnableChannel(signal, 0);
        AUDIOSIGNAL_EnableChannel(signal, 1);
        for (int c = 0; c < 2; ++c) {
            if (!(mask >> c & 1u)) AUDIOSIGNAL_DisableChannel(signal, c);
        }
        int64_t b = position(), e = position();
        const uint64_t stamp = AUDIOSIGNAL_GetTimeStamp(signal, 0);
        switch (rng() % 7) {
        case 0:
            ASSERT_EQ(AUDIOSIGNAL_ClearEx(signal, 0, b, e), 1);
            ref.replace(b, e, {{}});
            break;
        case 1: {
            int64_t length = 0;
            ASSERT_EQ(AUDIOSIGNAL_PasteEx(signal, mono, 0, b, e, &length), 1);
            EXPECT_EQ(length, 5000);
            ref.replace(b, e, extra);
            break;
        }
        case 2: {
            ref.clamp(b, e);
            ASSERT_EQ(AUDIOSIGNAL_SilenceEx(signal, 0, b, e), 1);
            ref.replace(b, e, {std::vector<float>(size_t(e - b), 0.0f)});
            break;
        }
        case 3:
            ASSERT_EQ(AUDIOSIGNAL_ReverseEx(signal, 0, b, e), 1);
            ref.clamp(b, e);
            ref.each_active([&](std::vector<float> &x, int) { std::reverse(x.begin() + b, x.begin() + e); });
            break;
        case 4: {
            int64_t length = 0;
            const bool whole = rng() % 2;
            ref.clamp(b, e);
            if (whole) e = b;
            ASSERT_EQ(AUDIOSIGNAL_MixPasteEx(signal, mono, 0, b, e, 0.5, &length), 1);
            const int64_t n = whole ? 5000 : std::min<int64_t>(e - b, 5000);
            EXPECT_EQ(length, n);
            ref.each_active([&](std::vector<float> &x, int) {
                if (int64_t(x.size()) < b + n) x.resize(size_t(b + n), 0.0f);
                for (int64_t i = 0; i < n; ++i) x[size_t(b + i)] += float(0.5 * extra[0][size_t(i)]);
            });
            ref.pad();
            break;
        }
        case 5: {
            AUDIOSIGNAL *cut = AUDIOSIGNAL_CutEx(signal, nullptr, 0, b, e);
            ASSERT_NE(cut, nullptr);
            EXPECT_EQ(read_all(cut), ref.copy(b, e));
            ref.replace(b, e, {{}});
            AUDIOSIGNAL_Destroy(cut);
            break;
        }
        default:
            ASSERT_EQ(AUDIOSIGNAL_AppendSilence(signal, 777), 777);
            for (auto &x : ref.ch) x.resize(x.size() + 777, 0.0f);
            break;
        }
        EXPECT_NE(AUDIOSIGNAL_GetTimeStamp(signal, 0), stamp);
        ASSERT_NO_FATAL_FAILURE(expect_same()) << "step " << step;
    }
    AUDIOSIGNAL_Destroy(mono);
}

TEST_F(SignalStoreEdit, FailedEditsChangeNothing)
{
    const uint64_t stamp = AUDIOSIGNAL_GetTimeStamp(signal, 0);
    EXPECT_EQ(AUDIOSIGNAL_PasteEx(signal, nullptr, 0, 0, 0, nullptr), 0);
    EXPECT_EQ(AUDIOSIGNAL_MixPasteEx(signal, signal, 0, 0, 0, std::nan(""), nullptr), 0);
    EXPECT_EQ(AUDIOSIGNAL_AppendSilence(signal, -1), -1);
    EXPECT_EQ(AUDIOSIGNAL_SwapChannels(nullptr), 0);
    AUDIOSIGNAL_DisableChannel(signal, 0);
    AUDIOSIGNAL_DisableChannel(signal, 1);
    EXPECT_EQ(AUDIOSIGNAL_CopyEx(signal, nullptr, 0, 0, 10), nullptr);  // no active channel
    EXPECT_EQ(AUDIOSIGNAL_PasteEx(signal, signal, 0, 0, 0, nullptr), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetTimeStamp(signal, 0), stamp);
    expect_same();
}

TEST_F(SignalStoreEdit, EditsOutsideTheSignalAreClamped)
{
    ASSERT_EQ(AUDIOSIGNAL_ClearEx(signal, 0, -500, 10), 1);
    ASSERT_EQ(AUDIOSIGNAL_SilenceEx(signal, 0, 299000, AUDIOSIGNAL_END), 1);
    ref.replace(0, 10, {{}});
    ref.replace(299000, 300000, {std::vector<float>(990, 0.0f)});
    expect_same();
    int64_t length = 0;
    AUDIOSIGNAL *piece = AUDIOSIGNAL_CopyEx(signal, nullptr, 0, 0, 100);
    ASSERT_EQ(AUDIOSIGNAL_PasteEx(signal, piece, 0, AUDIOSIGNAL_END, AUDIOSIGNAL_END, &length), 1);
    ref.replace(ref.length(), ref.length(), ref.copy(0, 100));
    expect_same();
    AUDIOSIGNAL_Destroy(piece);
}

TEST_F(SignalStoreEdit, CopyOptionsChooseTheChannels)
{
    AUDIOSIGNAL_DisableChannel(signal, 0);
    AUDIOSIGNAL *active = AUDIOSIGNAL_CopyEx(signal, nullptr, 0, 0, 50);
    EXPECT_EQ(AUDIOSIGNAL_NumChannels(active), 1);
    EXPECT_EQ(read_all(active)[0], std::vector<float>(ref.ch[1].begin(), ref.ch[1].begin() + 50));
    AUDIOSIGNAL *all = AUDIOSIGNAL_CopyEx(signal, nullptr, AUDIOSIGNAL_COPY_OPTION | AUDIOSIGNAL_COPY_ALLCHANNELS, 0, 50);
    EXPECT_EQ(AUDIOSIGNAL_NumChannels(all), 2);
    AUDIOSIGNAL_Destroy(active);
    AUDIOSIGNAL_Destroy(all);
}

TEST_F(SignalStoreEdit, ChannelOperations)
{
    ASSERT_EQ(AUDIOSIGNAL_SwapChannels(signal), 1);
    std::swap(ref.ch[0], ref.ch[1]);
    expect_same();

    AUDIOSIGNAL *right = AUDIOSIGNAL_CopyChannelEx(signal, nullptr, 1);
    ASSERT_NE(right, nullptr);
    EXPECT_EQ(read_all(right), Channels{ref.ch[1]});
    EXPECT_EQ(AUDIOSIGNAL_CopyChannelEx(signal, nullptr, 2), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_SwapChannels(right), 0);  // mono

    const Channels shortSamples = random_channels(1, 1000, 14);
    AUDIOSIGNAL *left = make_signal(shortSamples);
    AUDIOSIGNAL *stereo = AUDIOSIGNAL_CombineToStereoEx(left, right, nullptr);
    ASSERT_NE(stereo, nullptr);
    Channels expected{shortSamples[0], ref.ch[1]};
    expected[0].resize(expected[1].size(), 0.0f);
    EXPECT_EQ(read_all(stereo), expected);

    AUDIOSIGNAL *other = make_signal(shortSamples, 8000);
    EXPECT_EQ(AUDIOSIGNAL_CombineToStereoEx(left, other, nullptr), nullptr);  // rates differ
    for (AUDIOSIGNAL *s : {right, left, stereo, other}) AUDIOSIGNAL_Destroy(s);
}

}  // namespace
