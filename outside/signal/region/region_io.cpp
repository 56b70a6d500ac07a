// File plumbing of the region formats: format texts, whole-file reads,
// atomic writes and locale-independent numbers.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <charconv>
#include <climits>
#include <cmath>
#include <cstdio>
#include <cstdlib>

#include "outside/signal/region/region_files.hpp"

namespace velmsig {

namespace {

constexpr size_t kMaxTrackName = 255;

std::string upper(std::string_view text)
{
    std::string out(text);
    for (char &c : out) c = char(std::toupper(static_cast<unsigned char>(c)));
    return out;
}

std::string_view trim(std::string_view text)
{
    while (!text.empty() && std::isspace(static_cast<unsigned char>(text.front())))
        text.remove_prefix(1);
    while (!text.empty() && std::isspace(static_cast<unsigned char>(text.back())))
        text.remove_suffix(1);
    return text;
}

bool ends_with_nocase(std::string_view text, std::string_view suffix)
{
    return text.size() >= suffix.size() &&
           upper(text.substr(text.size() - suffix.size())) == upper(suffix);
}

}  // namespace

bool parse_region_format(const char *text, RegionFormatText *out)
{
    *out = RegionFormatText();
    std::string_view t = trim(text ? std::string_view(text) : std::string_view());
    std::string_view params;
    if (auto open = t.find('['); open != std::string_view::npos) {
        if (t.back() != ']') return false;
        params = t.substr(open + 1, t.size() - open - 2);
        t = trim(t.substr(0, open));
    }
    const std::string name = upper(t);
    if (name.empty() || name == "AUTO")
        out->kind = RegionFormat::Auto;
    else if (name == "LABELS" || name == "TXT")
        out->kind = RegionFormat::Labels;
    else if (name == "WAVE" || name == "WAV")
        out->kind = RegionFormat::Wave;
    else if (name == "VRGN")
        out->kind = RegionFormat::Own;
    else
        return false;

    while (!params.empty()) {
        const size_t comma = std::min(params.find(','), params.size());
        const std::string_view item = params.substr(0, comma);
        params.remove_prefix(std::min(comma + 1, params.size()));
        const size_t eq = item.find('=');
        if (eq == std::string_view::npos) return false;
        const std::string key = upper(trim(item.substr(0, eq)));
        const std::string_view value = trim(item.substr(eq + 1));
        if (key == "TRACK") {
            if (value.empty() || value.size() > kMaxTrackName) return false;
            out->track = std::string(value);
        }
    }
    return true;
}

RegionFormat format_from_name(std::string_view path)
{
    if (ends_with_nocase(path, ".wav")) return RegionFormat::Wave;
    if (ends_with_nocase(path, ".vrgn")) return RegionFormat::Own;
    return RegionFormat::Labels;
}

RegionFormat format_from_contents(std::string_view head)
{
    if (head.size() >= 12 && head.substr(0, 4) == "RIFF" && head.substr(8, 4) == "WAVE")
        return RegionFormat::Wave;
    if (head.substr(0, kOwnMagic.size()) == kOwnMagic) return RegionFormat::Own;
    return RegionFormat::Labels;
}

int open_error(int err, bool writing)
{
    if (err == ENOENT || err == ENOTDIR) return AUDIO_ERROR_FILE_NOT_FOUND;
    if (err == EACCES || err == EPERM || err == EROFS) return AUDIO_ERROR_ACCESS_DENIED;
    return writing ? AUDIO_ERROR_WRITE : AUDIO_ERROR_READ;
}

int read_head(const char *path, size_t size, std::string *out)
{
    const int fd = ::open(path, O_RDONLY | O_CLOEXEC);
    if (fd < 0) return open_error(errno, false);
    out->resize(size);
    ssize_t n;
    do n = ::pread(fd, out->data(), size, 0);
    while (n < 0 && errno == EINTR);
    ::close(fd);
    if (n < 0) return AUDIO_ERROR_READ;
    out->resize(size_t(n));
    return AUDIO_ERROR_NONE;
}

int read_text_file(const char *path, std::string *out)
{
    const int fd = ::open(path, O_RDONLY | O_CLOEXEC);
    if (fd < 0) return open_error(errno, false);
    struct stat st {};
    int error = AUDIO_ERROR_NONE;
    if (::fstat(fd, &st) != 0 || !S_ISREG(st.st_mode))
        error = AUDIO_ERROR_READ;
    else if (size_t(st.st_size) > kMaxRegionTextFile)
        error = AUDIO_ERROR_CORRUPT_DATA;
    else {
        out->resize(size_t(st.st_size));
        size_t done = 0;
        while (done < out->size()) {
            const ssize_t n = ::read(fd, out->data() + done, out->size() - done);
            if (n < 0 && errno == EINTR) continue;
            if (n <= 0) break;
            done += size_t(n);
        }
        out->resize(done);   // a file that shrank while read
    }
    ::close(fd);
    return error;
}

AtomicWriter::AtomicWriter(const char *path) : target_(path ? path : ""), error_(AUDIO_ERROR_NONE)
{
    if (target_.empty()) {
        error_ = AUDIO_ERROR_BAD_ARGUMENT;
        return;
    }
    // Writing over a symbolic link replaces the file it points at, not the link.
    char real[PATH_MAX];
    if (::realpath(target_.c_str(), real)) target_ = real;
    // The temporary name must fit where the target's did (255 bytes).
    const size_t slash = target_.rfind('/');
    const size_t name_at = slash == std::string::npos ? 0 : slash + 1;
    temp_ = target_.substr(0, name_at) + "." + target_.substr(name_at, 200) + ".XXXXXX";
    fd_ = ::mkostemp(temp_.data(), O_CLOEXEC);
    if (fd_ < 0) {
        error_ = open_error(errno, true);
        temp_.clear();
        return;
    }
    // The new file takes the permissions of the one it replaces.
    struct stat st {};
    ::fchmod(fd_, ::stat(target_.c_str(), &st) == 0 ? (st.st_mode & 07777) : 0644);
}

AtomicWriter::~AtomicWriter()
{
    if (fd_ >= 0) ::close(fd_);
    if (!temp_.empty()) ::unlink(temp_.c_str());
}

bool AtomicWriter::write(const void *data, size_t size)
{
    const char *p = static_cast<const char *>(data);
    while (error_ == AUDIO_ERROR_NONE && size > 0) {
        const ssize_t n = ::write(fd_, p, size);
        if (n < 0 && errno == EINTR) continue;
        if (n <= 0) {
            error_ = AUDIO_ERROR_WRITE;
            break;
        }
        p += n;
        size -= size_t(n);
    }
    return error_ == AUDIO_ERROR_NONE;
}

int AtomicWriter::commit()
{
    if (error_ != AUDIO_ERROR_NONE) return error_;
    const bool synced = ::fsync(fd_) == 0;
    const bool closed = ::close(fd_) == 0;
    fd_ = -1;
    if (!synced || !closed || ::rename(temp_.c_str(), target_.c_str()) != 0) {
        error_ = AUDIO_ERROR_WRITE;
        return error_;
    }
    temp_.clear();
    return AUDIO_ERROR_NONE;
}

int write_file_atomically(const char *path, std::string_view data)
{
    AtomicWriter writer(path);
    writer.write(data.data(), data.size());
    return writer.commit();
}

bool parse_seconds(std::string_view text, double *out)
{
    text = trim(text);
    if (!text.empty() && text.front() == '+') text.remove_prefix(1);
    double value = 0.0;
    const auto [end, ec] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (ec != std::errc() || end != text.data() + text.size() || !std::isfinite(value))
        return false;
    *out = value;
    return true;
}

std::string format_seconds(double seconds, int decimals)
{
    char buffer[64];
    char *const end = buffer + sizeof buffer;
    const auto result = decimals < 0
        ? std::to_chars(buffer, end, seconds)
        : std::to_chars(buffer, end, seconds, std::chars_format::fixed, decimals);
    return std::string(buffer, result.ptr);
}

}  // namespace velmsig
