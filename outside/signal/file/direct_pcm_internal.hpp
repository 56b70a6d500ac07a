// PCM samples read straight from the file with positioned reads and widened
// to floats.  Needs no lock, so any number of threads read at once.
#pragma once

#include <cstdint>

namespace velmsig {

class DirectPcm {
public:
    // Codings this path handles (AUDIO_FORMAT_*): 8-bit, 16, 24 and 32-bit
    // integers and 32-bit floats, on a little-endian host.
    static bool handles(int coding);

    // fd stays owned by the caller; data_offset is the first frame's byte.
    DirectPcm(int fd, int64_t data_offset, int coding, int channels, bool big_endian);

    // Frames read into out (short at the end of the file), or -1 when the
    // read fails.
    int64_t read(int64_t first, float *out, int64_t count) const;

    int64_t bytes_per_frame() const { return bytes_per_frame_; }

private:
    int fd_;
    int64_t data_offset_;
    int coding_;
    int channels_;
    bool big_endian_;
    int64_t bytes_per_frame_;
};

}  // namespace velmsig
