/* File names, file kinds and file times. */
#include "outside/base/blbase.h"

#include <chrono>
#include <cstring>
#include <filesystem>
#include <string>
#include <sys/stat.h>

namespace fs = std::filesystem;

namespace {

uint64_t Nanoseconds(const struct timespec &t)
{
    if (t.tv_sec < 0) return 0;
    return static_cast<uint64_t>(t.tv_sec) * 1000000000u + static_cast<uint64_t>(t.tv_nsec);
}

// Cuts at the buffer's end without splitting a UTF-8 sequence.
void CopyCut(const std::string &text, char *buffer, int size)
{
    size_t length = std::min(text.size(), static_cast<size_t>(size - 1));
    if (length < text.size())
        while (length > 0 && (static_cast<unsigned char>(text[length]) & 0xC0) == 0x80) --length;
    std::memcpy(buffer, text.data(), length);
    buffer[length] = '\0';
}

} // namespace

char *BLIO_ExtractCanonicalFileName(const char *name, char *buffer, int size)
{
    if (!name || !*name || !buffer || size <= 0) return nullptr;
    std::error_code error;
    // Links and ".." are resolved as far as the path exists; the rest is tidied as text.
    fs::path canonical = fs::weakly_canonical(fs::absolute(name, error), error);
    if (error) return nullptr;
    CopyCut(canonical.lexically_normal().string(), buffer, size);
    return buffer;
}

int BLIO_FileExists(const char *name)
{
    struct stat status;
    return name && *name && ::stat(name, &status) == 0;
}

int BLIO_GetHFileKind(const char *name)
{
    struct stat status;
    if (!name || !*name || ::stat(name, &status) != 0) return 0;
    if (S_ISREG(status.st_mode)) return 1;
    if (S_ISDIR(status.st_mode)) return 2;
    return 3;
}

uint64_t BLUTIL_GetFileTime(const char *name, int kind)
{
    struct stat status;
    if (!name || !*name || ::stat(name, &status) != 0) return 0;
    switch (kind) {
    case 0: return Nanoseconds(status.st_ctim);
    case 1: return Nanoseconds(status.st_atim);
    case 2: return Nanoseconds(status.st_mtim);
    default: return 0;
    }
}

uint64_t BLgetgmtime(void)
{
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    return static_cast<uint64_t>(std::chrono::duration_cast<std::chrono::nanoseconds>(now).count());
}

uint64_t BLtimeToBLtimeStamp(uint64_t time)
{
    // Stamps keep the unit of times, so a stamp taken from a file time and the
    // file time read again later compare equal while the file is unchanged.
    return time;
}
