// The block file: a hidden temporary file of fixed-size slots holding chunks
// that do not stay in memory.
#pragma once

#include <cstdint>
#include <mutex>
#include <vector>

namespace velmsig {

class BlockFile {
public:
    // The process's block file, made on first use in the cache folder; null
    // when it cannot be made.
    static BlockFile *instance();

    ~BlockFile();
    BlockFile(const BlockFile &) = delete;
    BlockFile &operator=(const BlockFile &) = delete;

    // Stores count floats (at most one chunk) in a free slot; -1 on failure.
    int64_t store(const float *samples, int64_t count);
    // Reads count floats from first inside a slot; false on a read error.
    bool load(int64_t slot, int64_t first, int64_t count, float *out) const;
    void release(int64_t slot);

private:
    explicit BlockFile(int fd) : fd_(fd) {}

    int fd_;
    std::mutex lock_;
    int64_t slots_ = 0;
    std::vector<int64_t> free_;
};

}  // namespace velmsig
