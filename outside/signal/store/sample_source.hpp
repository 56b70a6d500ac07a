// A source of interleaved float frames read in place (an open PCM file).
#pragma once

#include <cstdint>

namespace velmsig {

class SampleSource {
public:
    virtual ~SampleSource() = default;
    virtual int channels() const = 0;
    virtual int64_t frames() const = 0;
    // Reads count frames from first into out (interleaved); thread-safe.
    // Returns the frames read, or -1 on a read error.
    virtual int64_t read(int64_t first, float *out, int64_t count) = 0;
};

}  // namespace velmsig
