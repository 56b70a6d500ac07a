#include "tests/outside/signal/file/reader_helpers.hpp"

namespace velmtest {

std::vector<float> read_all(velmsig::FileReader &reader, int64_t chunk) {
    int channels = reader.format().numChannels;
    std::vector<float> all, part(static_cast<size_t>(chunk * channels));
    for (int64_t at = 0;;) {
        int64_t n = reader.read(at, part.data(), chunk);
        if (n <= 0) break;
        all.insert(all.end(), part.begin(), part.begin() + n * channels);
        at += n;
    }
    return all;
}

}  // namespace velmtest
