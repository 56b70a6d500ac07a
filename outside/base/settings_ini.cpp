/*
 * Ini files behind settings objects.
 *
 * Layout: a key's first dotted part is its section and the rest its name, so
 * "libvelm.draw.hovertime=500" is written as "draw.hovertime=500" under
 * "[libvelm]".  Keys without a dot come first, before any section.  Files
 * written elsewhere may use a longer header: "[velm.link]" then "file=x"
 * reads as the key "velm.link.file".
 * In values a backslash, the line breaks and a leading '{' are escaped with
 * a backslash; secret values are written as "{obscured}" and hex digits.
 */
#include "outside/base/blbase.h"
#include "outside/base/base_internal.h"
#include "outside/base/settings_internal.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fcntl.h>
#include <string>
#include <sys/stat.h>
#include <unistd.h>

namespace blbase {

namespace {

constexpr size_t kMaxLine = 64 * 1024;
constexpr const char *kObscuredMark = "{obscured}";

// Obscuring keeps secrets out of plain sight in the file; it is not encryption.
// The key stream comes from the key's name, so equal values of different keys differ.
std::string Scramble(std::string_view key, std::string_view text)
{
    uint64_t state = 14695981039346656037ull;
    for (unsigned char c : ToLower(key)) state = (state ^ c) * 1099511628211ull;
    std::string out(text);
    for (char &c : out) {
        state ^= state << 13;
        state ^= state >> 7;
        state ^= state << 17;
        c = static_cast<char>(static_cast<unsigned char>(c) ^ (state & 0xFF));
    }
    return out;
}

} // namespace

std::string ObscureValue(std::string_view key, std::string_view value)
{
    static const char digits[] = "0123456789ABCDEF";
    std::string out = kObscuredMark;
    for (unsigned char c : Scramble(key, value)) {
        out += digits[c >> 4];
        out += digits[c & 15];
    }
    return out;
}

namespace {

std::optional<std::string> Reveal(std::string_view key, std::string_view hex)
{
    const auto nibble = [](char c) -> int {
        if (c >= '0' && c <= '9') return c - '0';
        if (c >= 'A' && c <= 'F') return c - 'A' + 10;
        if (c >= 'a' && c <= 'f') return c - 'a' + 10;
        return -1;
    };
    if (hex.size() % 2) return std::nullopt;
    std::string bytes;
    for (size_t i = 0; i < hex.size(); i += 2) {
        const int high = nibble(hex[i]), low = nibble(hex[i + 1]);
        if (high < 0 || low < 0) return std::nullopt;
        bytes += static_cast<char>(high * 16 + low);
    }
    return Scramble(key, bytes);
}

std::string Escape(std::string_view value)
{
    std::string out;
    for (size_t i = 0; i < value.size(); ++i) {
        const char c = value[i];
        if (c == '\\') out += "\\\\";
        else if (c == '\n') out += "\\n";
        else if (c == '\r') out += "\\r";
        else if (c == '{' && i == 0) out += "\\{";
        else out += c;
    }
    return out;
}

std::string Unescape(std::string_view text)
{
    std::string out;
    for (size_t i = 0; i < text.size(); ++i) {
        if (text[i] != '\\' || i + 1 == text.size()) {
            out += text[i];
            continue;
        }
        const char next = text[++i];
        if (next == 'n') out += '\n';
        else if (next == 'r') out += '\r';
        else if (next == '\\' || next == '{') out += next;
        else (out += '\\') += next;
    }
    return out;
}

// Reads one line of at most kMaxLine bytes; longer lines are consumed and flagged.
bool ReadLine(FILE *file, std::string &line, bool &too_long)
{
    line.clear();
    too_long = false;
    int c;
    bool any = false;
    while ((c = std::getc(file)) != EOF) {
        any = true;
        if (c == '\n') break;
        if (line.size() < kMaxLine)
            line += static_cast<char>(c);
        else
            too_long = true;
    }
    return any;
}

// One ini line into entries; false when it cannot be read.
bool ParseLine(std::string_view line, std::string &section, bool &section_ok,
               SettingEntries &entries)
{
    if (line.find('\0') != std::string_view::npos) return false;
    line = Trim(line);
    if (line.empty() || line[0] == ';' || line[0] == '#') return true;
    if (line[0] == '[') {
        const std::string_view name = line.size() > 1 && line.back() == ']'
                                          ? Trim(line.substr(1, line.size() - 2))
                                          : std::string_view();
        // A dotted header names the leading parts of its keys: "[velm.link]"
        // holds the keys that begin with "velm.link.".
        section_ok = !name.empty() && ValidKey(name);
        section = section_ok ? std::string(name) : std::string();
        return section_ok;
    }
    if (!section_ok) return false; // under a header that could not be read
    const size_t equals = line.find('=');
    if (equals == std::string_view::npos) return false;
    const std::string_view name = Trim(line.substr(0, equals));
    const std::string_view raw = Trim(line.substr(equals + 1));
    const std::string key = section.empty() ? std::string(name) : section + "." + std::string(name);
    if (name.empty() || !ValidKey(key)) return false;

    SettingEntry entry;
    entry.key = key;
    if (raw.substr(0, std::strlen(kObscuredMark)) == kObscuredMark) {
        entry.value = Reveal(key, raw.substr(std::strlen(kObscuredMark)));
        if (!entry.value) return false;
        entry.secret = true;
    } else {
        entry.value = Unescape(raw);
    }
    entries[ToLower(key)] = std::move(entry);
    return true;
}

std::string FileValue(const SettingEntry &entry)
{
    return entry.secret ? ObscureValue(entry.key, *entry.value) : Escape(*entry.value);
}

std::string Render(const SettingEntries &entries)
{
    std::string text = "; settings: \"[section]\" holds the keys that begin with \"section.\"\n";
    for (const auto &[lower, entry] : entries)
        if (entry.value && lower.find('.') == std::string::npos)
            text += entry.key + "=" + FileValue(entry) + "\n";
    std::string current;
    for (const auto &[lower, entry] : entries) {
        const size_t dot = lower.find('.');
        if (!entry.value || dot == std::string::npos) continue;
        if (std::string_view(lower).substr(0, dot) != current) {
            current = lower.substr(0, dot);
            text += "\n[" + entry.key.substr(0, dot) + "]\n";
        }
        text += entry.key.substr(dot + 1) + "=" + FileValue(entry) + "\n";
    }
    return text;
}

bool WriteAll(int fd, const std::string &text)
{
    size_t done = 0;
    while (done < text.size()) {
        const ssize_t n = ::write(fd, text.data() + done, text.size() - done);
        if (n < 0 && errno == EINTR) continue;
        if (n <= 0) return false;
        done += static_cast<size_t>(n);
    }
    return true;
}

void SyncFolder(const std::string &path)
{
    const size_t slash = path.rfind('/');
    const std::string folder = slash == std::string::npos ? "." : slash == 0 ? "/" : path.substr(0, slash);
    const int fd = ::open(folder.c_str(), O_RDONLY | O_DIRECTORY);
    if (fd < 0) return;
    ::fsync(fd);
    ::close(fd);
}

} // namespace

bool ValidKey(std::string_view key)
{
    if (key.empty() || key.size() > 1024 || key != Trim(key)) return false;
    if (key[0] == ';' || key[0] == '#') return false;
    for (unsigned char c : key)
        if (c < 0x20 || c == 0x7F || c == '[' || c == ']' || c == '=') return false;
    const size_t dot = key.find('.');
    if (dot == std::string_view::npos) return true;
    // Section and name must come back the same after an ini line is trimmed.
    const std::string_view section = key.substr(0, dot), name = key.substr(dot + 1);
    return !section.empty() && !name.empty() && section == Trim(section) && name == Trim(name) &&
           name[0] != ';' && name[0] != '#';
}

bool LoadIniFile(const std::string &path, SettingEntries &entries, bool *damaged)
{
    FILE *file = std::fopen(path.c_str(), "rbe");
    if (!file) return false;
    std::string line, section;
    bool section_ok = true, too_long = false;
    *damaged = false;
    for (int number = 1; ReadLine(file, line, too_long); ++number) {
        if (number == 1 && line.compare(0, 3, "\xEF\xBB\xBF") == 0) line.erase(0, 3);
        if (too_long) {
            BLDEBUG_Warning(-1, "BLSETTINGS: %s:%d: line too long, skipped", path.c_str(), number);
            *damaged = true;
        } else if (!ParseLine(line, section, section_ok, entries)) {
            BLDEBUG_Warning(-1, "BLSETTINGS: %s:%d: unreadable line skipped", path.c_str(), number);
            *damaged = true;
        }
    }
    const bool read_ok = !std::ferror(file);
    std::fclose(file);
    return read_ok;
}

bool SaveIniFile(const std::string &path, const SettingEntries &entries, bool keep_copy)
{
    std::string temporary = path + ".XXXXXX";
    const int fd = ::mkostemp(temporary.data(), O_CLOEXEC);
    if (fd < 0) {
        BLDEBUG_Error(-1, "BLSETTINGS: cannot write %s: %s", path.c_str(), std::strerror(errno));
        return false;
    }
    struct stat old;
    const bool existed = ::stat(path.c_str(), &old) == 0;
    if (existed) ::fchmod(fd, old.st_mode & 07777);
    const bool written = WriteAll(fd, Render(entries)) && ::fsync(fd) == 0;
    const int saved_errno = errno;
    ::close(fd);
    if (written && existed && keep_copy) {
        const std::string copy = path + ".bak";
        ::unlink(copy.c_str());
        if (::link(path.c_str(), copy.c_str()) != 0)
            BLDEBUG_Warning(-1, "BLSETTINGS: cannot keep %s", copy.c_str());
    }
    if (!written || ::rename(temporary.c_str(), path.c_str()) != 0) {
        BLDEBUG_Error(-1, "BLSETTINGS: cannot write %s: %s", path.c_str(),
                      std::strerror(written ? errno : saved_errno));
        ::unlink(temporary.c_str());
        return false;
    }
    SyncFolder(path);
    return true;
}

} // namespace blbase
