#include "outside/signal/file/link_internal.hpp"

#include <fcntl.h>
#include <sys/stat.h>

#include <string_view>

#include "outside/signal/audioformat.h"
#include "outside/signal/file/lasterror_internal.hpp"
#include "outside/signal/file/text_internal.hpp"
#include "outside/signal/file/unique_fd_internal.hpp"

namespace velmsig {

namespace {

constexpr std::string_view kPrefix = "velm.link.";

std::string_view trim(std::string_view s) {
    while (!s.empty() && (s.front() == ' ' || s.front() == '\t' || s.front() == '\r')) s.remove_prefix(1);
    while (!s.empty() && (s.back() == ' ' || s.back() == '\t' || s.back() == '\r')) s.remove_suffix(1);
    return s;
}

// Calls f(full key, value) for each "key=value" line; sections prefix keys.
template <typename F>
void for_each_entry(std::string_view text, F f) {
    std::string section;
    bool readable = true;  // false under a section header settings files refuse
    while (!text.empty()) {
        size_t nl = text.find('\n');
        std::string_view line = trim(text.substr(0, nl));
        text.remove_prefix(nl == std::string_view::npos ? text.size() : nl + 1);
        if (line.empty() || line.front() == ';' || line.front() == '#') continue;
        if (line.front() == '[' && line.back() == ']') {
            section = std::string(trim(line.substr(1, line.size() - 2)));
            readable = !section.empty() && section.find('.') == std::string::npos;
            continue;
        }
        size_t eq = line.find('=');
        if (eq == std::string_view::npos || !readable) continue;
        std::string key = section.empty() ? "" : section + ".";
        key += trim(line.substr(0, eq));
        f(std::string_view(key), trim(line.substr(eq + 1)));
    }
}

}  // namespace

bool looks_like_link(const char *head, size_t size) {
    std::string_view text(head, size);
    bool link = false;
    for_each_entry(text, [&link](std::string_view key, std::string_view) {
        link = link || (key.size() > kPrefix.size() && equals_nocase(key.substr(0, kPrefix.size()), kPrefix));
    });
    return link && text.find('\0') == std::string_view::npos;
}

bool is_link_document(const char *path) {
    UniqueFd fd(::open(path, O_RDONLY | O_CLOEXEC));
    struct stat st{};
    if (!fd || fstat(fd.get(), &st) != 0 || !S_ISREG(st.st_mode) || st.st_size <= 0 ||
        st.st_size > static_cast<off_t>(kMaxLinkSize))
        return false;
    std::string head(static_cast<size_t>(st.st_size), '\0');
    return pread(fd.get(), head.data(), head.size(), 0) == st.st_size && looks_like_link(head.data(), head.size());
}

bool read_link(const char *path, LinkTarget *out) {
    UniqueFd fd(::open(path, O_RDONLY | O_CLOEXEC));
    struct stat st{};
    if (!fd || fstat(fd.get(), &st) != 0) {
        set_last_error(error_of_errno(errno, AUDIO_ERROR_READ));
        return false;
    }
    if (st.st_size > static_cast<off_t>(kMaxLinkSize)) {
        set_last_error(AUDIO_ERROR_CORRUPT_DATA);
        return false;
    }
    std::string text(static_cast<size_t>(st.st_size), '\0');
    if (pread(fd.get(), text.data(), text.size(), 0) != static_cast<ssize_t>(text.size())) {
        set_last_error(AUDIO_ERROR_READ);
        return false;
    }
    std::string file, format = "AUTO";
    for_each_entry(text, [&](std::string_view key, std::string_view value) {
        if (equals_nocase(key, "velm.link.file")) file = value;
        if (equals_nocase(key, "velm.link.format") && !value.empty()) format = value;
    });
    if (file.empty()) {
        set_last_error(AUDIO_ERROR_CORRUPT_DATA);
        return false;
    }
    if (file.front() != '/') {
        std::string_view p(path);
        size_t slash = p.rfind('/');
        if (slash != std::string_view::npos) file = std::string(p.substr(0, slash + 1)) + file;
    }
    out->path = std::move(file);
    out->format = std::move(format);
    return true;
}

}  // namespace velmsig
