// A file descriptor closed when its owner goes.
#pragma once

#include <unistd.h>

#include <utility>

namespace velmsig {

class UniqueFd {
public:
    UniqueFd() = default;
    explicit UniqueFd(int fd) : fd_(fd) {}
    UniqueFd(UniqueFd &&o) noexcept : fd_(std::exchange(o.fd_, -1)) {}
    UniqueFd &operator=(UniqueFd &&o) noexcept {
        if (this != &o) reset(std::exchange(o.fd_, -1));
        return *this;
    }
    ~UniqueFd() { reset(); }
    int get() const { return fd_; }
    explicit operator bool() const { return fd_ >= 0; }
    // Closes the descriptor now; false when close reports an error.
    bool reset(int fd = -1) {
        bool ok = fd_ < 0 || ::close(fd_) == 0;
        fd_ = fd;
        return ok;
    }

private:
    int fd_ = -1;
};

}  // namespace velmsig
