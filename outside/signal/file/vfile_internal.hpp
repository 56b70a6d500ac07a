// A file descriptor presented to libsndfile through its virtual I/O, with
// positioned reads and writes, so that the descriptor stays ours: readers
// keep it for their life, writers fsync it before the rename.
#pragma once

#include <sndfile.h>

#include <cstdint>

namespace velmsig {

class VirtualFile {
public:
    // fd stays owned by the caller.  `base` hides a leading header of that
    // many bytes (headerless files with an offset).
    VirtualFile(int fd, int64_t base, int64_t length, bool writable);
    static SF_VIRTUAL_IO *io();  // the callbacks; user data is the VirtualFile
    bool failed() const { return failed_; }  // a read or write error happened
    int64_t file_offset() const { return base_ + pos_; }  // where libsndfile is in the file
    int64_t file_size() const { return base_ + length_; }

private:
    static sf_count_t get_filelen(void *self);
    static sf_count_t seek(sf_count_t offset, int whence, void *self);
    static sf_count_t read(void *ptr, sf_count_t count, void *self);
    static sf_count_t write(const void *ptr, sf_count_t count, void *self);
    static sf_count_t tell(void *self);

    int fd_;
    int64_t base_;
    int64_t length_;
    int64_t pos_ = 0;
    bool writable_;
    bool failed_ = false;
};

}  // namespace velmsig
