// AUDIO_ file calls: readers and writers behind an opaque handle that keeps
// the frame position.
#include <atomic>
#include <new>

#include "outside/signal/file/audiofile_internal.hpp"
#include "outside/signal/file/lasterror_internal.hpp"

struct _audio_file {
    std::unique_ptr<velmsig::FileReader> reader;
    std::unique_ptr<velmsig::FileWriter> writer;
    _audio_format format{};
    int64_t position = 0;
    bool failed = false;  // a write failed: the close discards the file
};

namespace {
std::atomic<int> start_count{0};
}

using namespace velmsig;

extern "C" {

AUDIO_API int AUDIO_Initialize(void) {
    ++start_count;
    return 1;
}

AUDIO_API int AUDIO_Finalize(void) {
    int n = start_count.load();
    while (n > 0 && !start_count.compare_exchange_weak(n, n - 1)) {
    }
    return n > 0;
}

AUDIO_API AUDIO_FILE *AUDIO_LoadFile(const char *path, const char *format_text) {
    auto reader = open_reader(path, format_text);
    if (!reader) return nullptr;
    auto *file = new (std::nothrow) AUDIO_FILE;
    if (!file) {
        set_last_error(AUDIO_ERROR_OUT_OF_MEMORY);
        return nullptr;
    }
    file->format = reader->format();
    file->reader = std::move(reader);
    return file;
}

AUDIO_API AUDIO_FILE *AUDIO_CreateFileEx(const char *path, const _audio_format *format, const char *format_text) {
    if (!format) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return nullptr;
    }
    auto writer = create_writer(path, *format, format_text, nullptr);
    if (!writer) return nullptr;
    auto *file = new (std::nothrow) AUDIO_FILE;
    if (!file) {
        set_last_error(AUDIO_ERROR_OUT_OF_MEMORY);
        return nullptr;
    }
    file->format = *format;
    file->writer = std::move(writer);
    return file;
}

AUDIO_API int64_t AUDIO_ReadIEEEFloat(AUDIO_FILE *file, float *out, int64_t frames) {
    if (!file || !file->reader || !out || frames < 0) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return -1;
    }
    int64_t n = file->reader->read(file->position, out, frames);
    if (n > 0) file->position += n;
    return n;
}

AUDIO_API int64_t AUDIO_WriteIEEEFloat(AUDIO_FILE *file, const float *in, int64_t frames) {
    if (!file || !file->writer || !in || frames < 0) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return -1;
    }
    if (file->failed || !file->writer->write(in, frames)) {
        file->failed = true;
        set_last_error(AUDIO_ERROR_WRITE);
        return -1;
    }
    file->position += frames;
    return frames;
}

AUDIO_API _audio_format AUDIO_GetAudioFileFormat(const AUDIO_FILE *file) {
    return file ? file->format : _audio_format{};
}

AUDIO_API int AUDIO_CloseFile(AUDIO_FILE *file) {
    if (!file) return 0;
    bool ok = !file->writer || (!file->failed && file->writer->commit());
    delete file;
    return ok;
}

}  // extern "C"
