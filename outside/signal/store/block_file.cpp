#include "outside/signal/store/block_file.hpp"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <string>

#include "outside/signal/store/chunk.hpp"
#include "outside/signal/store/store_config.hpp"

namespace velmsig {

namespace {

constexpr int64_t kSlotBytes = kChunkFrames * int64_t(sizeof(float));

// An unnamed file: nothing is left behind whatever way the process ends.
int open_hidden_file(const std::string &folder)
{
#ifdef O_TMPFILE
    int fd = ::open(folder.c_str(), O_TMPFILE | O_RDWR | O_CLOEXEC, 0600);
    if (fd >= 0) return fd;
#endif
    std::string pattern = folder + "/velm-blocks-XXXXXX";
    int fd2 = ::mkostemp(pattern.data(), O_CLOEXEC);
    if (fd2 >= 0) ::unlink(pattern.c_str());
    return fd2;
}

// Moves all of size bytes with pread or pwrite, going on after short transfers.
template <typename Transfer>
bool transfer_all(Transfer transfer, int fd, char *data, size_t size, off_t at)
{
    while (size > 0) {
        const ssize_t n = transfer(fd, data, size, at);
        if (n < 0 && errno == EINTR) continue;
        if (n <= 0) return false;
        data += n;
        size -= size_t(n);
        at += n;
    }
    return true;
}

}  // namespace

BlockFile *BlockFile::instance()
{
    static BlockFile *file = [] {
        int fd = open_hidden_file(cache_folder());
        return fd >= 0 ? new BlockFile(fd) : nullptr;
    }();
    return file;
}

BlockFile::~BlockFile()
{
    ::close(fd_);
}

int64_t BlockFile::store(const float *samples, int64_t count)
{
    if (count < 0 || count > kChunkFrames) return -1;
    int64_t slot;
    {
        std::lock_guard<std::mutex> guard(lock_);
        if (free_.empty()) {
            slot = slots_++;
        } else {
            slot = free_.back();
            free_.pop_back();
        }
    }
    auto write = [](int fd, const char *data, size_t size, off_t at) { return ::pwrite(fd, data, size, at); };
    if (!transfer_all(write, fd_, reinterpret_cast<char *>(const_cast<float *>(samples)),
                      size_t(count) * sizeof(float), off_t(slot * kSlotBytes))) {
        release(slot);
        return -1;
    }
    return slot;
}

bool BlockFile::load(int64_t slot, int64_t first, int64_t count, float *out) const
{
    return transfer_all(::pread, fd_, reinterpret_cast<char *>(out), size_t(count) * sizeof(float),
                        off_t(slot * kSlotBytes + first * int64_t(sizeof(float))));
}

void BlockFile::release(int64_t slot)
{
    std::lock_guard<std::mutex> guard(lock_);
    free_.push_back(slot);
}

}  // namespace velmsig
