#include "outside/signal/file/vfile_internal.hpp"

#include <unistd.h>

#include <algorithm>
#include <cerrno>

namespace velmsig {

VirtualFile::VirtualFile(int fd, int64_t base, int64_t length, bool writable)
    : fd_(fd), base_(base), length_(std::max<int64_t>(0, length - base)), writable_(writable) {}

SF_VIRTUAL_IO *VirtualFile::io() {
    static SF_VIRTUAL_IO callbacks = {get_filelen, seek, read, write, tell};
    return &callbacks;
}

sf_count_t VirtualFile::get_filelen(void *self) { return static_cast<VirtualFile *>(self)->length_; }

sf_count_t VirtualFile::seek(sf_count_t offset, int whence, void *self) {
    auto *f = static_cast<VirtualFile *>(self);
    int64_t origin = whence == SEEK_CUR ? f->pos_ : whence == SEEK_END ? f->length_ : 0;
    if (offset > INT64_MAX - origin || origin + offset < 0) return -1;
    f->pos_ = origin + offset;
    return f->pos_;
}

sf_count_t VirtualFile::read(void *ptr, sf_count_t count, void *self) {
    auto *f = static_cast<VirtualFile *>(self);
    if (count <= 0 || f->pos_ >= f->length_) return 0;
    count = std::min<int64_t>(count, f->length_ - f->pos_);
    auto *p = static_cast<char *>(ptr);
    sf_count_t done = 0;
    while (done < count) {
        ssize_t n = pread(f->fd_, p + done, static_cast<size_t>(count - done), f->base_ + f->pos_ + done);
        if (n < 0 && errno == EINTR) continue;
        if (n < 0) f->failed_ = true;
        if (n <= 0) break;
        done += n;
    }
    f->pos_ += done;
    return done;
}

sf_count_t VirtualFile::write(const void *ptr, sf_count_t count, void *self) {
    auto *f = static_cast<VirtualFile *>(self);
    if (!f->writable_ || count <= 0) return 0;
    auto *p = static_cast<const char *>(ptr);
    sf_count_t done = 0;
    while (done < count) {
        ssize_t n = pwrite(f->fd_, p + done, static_cast<size_t>(count - done), f->base_ + f->pos_ + done);
        if (n < 0 && errno == EINTR) continue;
        if (n <= 0) {
            f->failed_ = true;
            break;
        }
        done += n;
    }
    f->pos_ += done;
    f->length_ = std::max(f->length_, f->pos_);
    return done;
}

sf_count_t VirtualFile::tell(void *self) { return static_cast<VirtualFile *>(self)->pos_; }

}  // namespace velmsig
