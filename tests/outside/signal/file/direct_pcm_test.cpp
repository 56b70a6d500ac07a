// Samples read straight from the file equal libsndfile's own conversion, for
// every coding and byte order the direct path takes.
#include <gtest/gtest.h>
#include <fcntl.h>
#include <sndfile.h>

#include "outside/signal/audioformat.h"
#include "outside/signal/file/direct_pcm_internal.hpp"
#include "outside/signal/file/unique_fd_internal.hpp"
#include "tests/outside/signal/file/file_helpers.hpp"

using namespace velmsig;
using namespace velmtest;

namespace {

struct Coding {
    int sf;
    int ours;
};

TEST(DirectPcm, MatchesLibsndfileInBothByteOrders) {
    TempDir dir;
    auto samples = test_signal(3, 5000);
    samples[0] = -1.0f;  // full scale both ways
    samples[1] = 0.999f;
    for (const Coding c : {Coding{SF_FORMAT_PCM_S8, AUDIO_FORMAT_PCM_S8}, Coding{SF_FORMAT_PCM_U8, AUDIO_FORMAT_PCM_U8},
                           Coding{SF_FORMAT_PCM_16, AUDIO_FORMAT_PCM_16}, Coding{SF_FORMAT_PCM_24, AUDIO_FORMAT_PCM_24},
                           Coding{SF_FORMAT_PCM_32, AUDIO_FORMAT_PCM_32}, Coding{SF_FORMAT_FLOAT, AUDIO_FORMAT_FLOAT}})
        for (int order : {SF_ENDIAN_LITTLE, SF_ENDIAN_BIG}) {
            std::string path = dir.file("x.raw");
            ASSERT_TRUE(write_sndfile(path, SF_FORMAT_RAW | c.sf | order, 8000, 3, samples));
            SF_INFO info{};
            info.samplerate = 8000;
            info.channels = 3;
            info.format = SF_FORMAT_RAW | c.sf | order;
            SNDFILE *f = sf_open(path.c_str(), SFM_READ, &info);
            ASSERT_NE(f, nullptr);
            std::vector<float> theirs(samples.size());
            ASSERT_EQ(sf_readf_float(f, theirs.data(), 5000), 5000);
            sf_close(f);

            UniqueFd fd(open(path.c_str(), O_RDONLY));
            DirectPcm direct(fd.get(), 0, c.ours, 3, order == SF_ENDIAN_BIG);
            ASSERT_TRUE(DirectPcm::handles(c.ours));
            std::vector<float> ours(samples.size());
            // Two pieces, the second running past the end.
            ASSERT_EQ(direct.read(0, ours.data(), 1234), 1234);
            ASSERT_EQ(direct.read(1234, ours.data() + 3 * 1234, 9999), 5000 - 1234);
            EXPECT_EQ(ours, theirs) << c.sf << " " << order;
        }
}

}  // namespace
