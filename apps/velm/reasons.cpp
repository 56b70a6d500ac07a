// Why a file could not be read or written, in words.
#include <sys/stat.h>
#include <unistd.h>

#include <string>
#include <utility>

#include "outside/signal/audioformat.h"

#include "apps/velm/tool.hpp"

namespace velmtool {

namespace {

bool is_folder(const std::string &path)
{
    struct stat info{};
    return ::stat(path.c_str(), &info) == 0 && S_ISDIR(info.st_mode);
}

std::string folder_of(const char *path)
{
    const std::string text(path);
    const size_t slash = text.find_last_of('/');
    if (slash == std::string::npos) return ".";
    return slash == 0 ? "/" : text.substr(0, slash);
}

// What the path itself says against the work; empty when it looks fine.
const char *path_reason(const char *path, bool writing)
{
    if (is_folder(path)) return "it is a folder";
    if (!writing) return ::access(path, F_OK) == 0 ? (::access(path, R_OK) == 0 ? "" : "permission denied") : "no such file";
    const std::string folder = folder_of(path);
    if (!is_folder(folder)) return "no such folder";
    return ::access(folder.c_str(), W_OK) == 0 ? "" : "the folder is not writable";
}

} // namespace

std::string why(const char *path, bool writing, int error)
{
    const char *reason = path_reason(path, writing);
    if (*reason) return reason;
    // The most telling bit first.
    const std::pair<int, const char *> reasons[] = {
        {AUDIO_ERROR_FILE_NOT_FOUND, "no such file"},
        {AUDIO_ERROR_ACCESS_DENIED, "permission denied"},
        {AUDIO_ERROR_BAD_FORMAT_STRING, "not a format text it knows"},
        {AUDIO_ERROR_UNSUPPORTED_FORMAT, writing ? "the format cannot hold this sound" : "not a sound file of a known format"},
        {AUDIO_ERROR_CORRUPT_DATA, "the data is damaged"},
        {AUDIO_ERROR_OUT_OF_MEMORY, "out of memory"},
        {AUDIO_ERROR_WRITE, "write error"},
        {AUDIO_ERROR_READ, "read error"},
    };
    for (const auto &[bit, text] : reasons)
        if (error & bit) return text;
    return "failed";
}

} // namespace velmtool
