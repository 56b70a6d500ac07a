// Audio files as seen by the rest of the signal library: readers that hand
// out interleaved float frames, writers that replace a file atomically.
#pragma once

#include <cstdint>
#include <memory>

#include "outside/signal/audioformat.h"
#include "outside/signal/audiometadata.h"
#include "outside/signal/file/formatstring_internal.hpp"

namespace velmsig {

class FileReader {  // one open audio file, frames as interleaved float32
public:
    virtual ~FileReader();
    virtual const _audio_format &format() const = 0;  // rate, channels, bits, container, coding
    // Random-access readers: the exact frame count (a read inside it is short
    // only when the file shrank since it was opened).  Others: the header's
    // claim (bounded by the file size); reading until a short read is exact.
    virtual int64_t frames() const = 0;
    virtual bool random_access() const = 0;  // true: PCM read in place, seekable at any frame
    // Reads count frames from first into out (interleaved); thread-safe
    // (little-endian PCM reads run in parallel, other readers take a lock);
    // returns frames read (short at the end) or -1 with the last error set.
    virtual int64_t read(int64_t first, float *out, int64_t count) = 0;
    virtual AUDIOMETADATA *metadata();        // read from the file; owned by the reader, may be null
    virtual const char *format_name() const;  // e.g. "WAVE" for the "AUTO" replacement
};

// Null on failure with the last error set (file not found, access denied,
// unsupported format, corrupt data, bad format string...).  Readers of PCM
// files keep their descriptor open for their whole life, so a file renamed
// over or deleted later still reads.
std::unique_ptr<FileReader> open_reader(const char *path, const char *format_text);

class FileWriter {  // writes to a temporary file beside the target
public:
    virtual ~FileWriter();  // without commit(): removes the temporary file, target untouched
    virtual bool write(const float *interleaved, int64_t frames) = 0;
    virtual bool commit() = 0;  // flush, fsync, rename over the target
};

// Null on failure with the last error set.  format gives rate, channels and
// (when the format text does not say) the bit depth and coding to store.
std::unique_ptr<FileWriter> create_writer(const char *path, const _audio_format &format,
                                          const char *format_text, const AUDIOMETADATA *meta);

}  // namespace velmsig
