/* Text helpers shared inside the library: formatting, interning, case and trimming. */
#include "outside/base/base_internal.h"

#include <cstdio>
#include <cstring>
#include <mutex>
#include <optional>
#include <unordered_set>

namespace blbase {

namespace {

// The 64-bit size prefix "I64" of some platforms ("%I64d") means "ll" here;
// returns the format with it translated, or null when there is none.
std::optional<std::string> Portable(const char *format)
{
    if (!std::strstr(format, "I64")) return std::nullopt;
    std::string out;
    for (const char *p = format; *p; ++p) {
        out += *p;
        if (*p != '%') continue;
        if (p[1] == '%') {
            out += *++p;
            continue;
        }
        const size_t flags = std::strspn(p + 1, "-+ #0123456789.*");
        out.append(p + 1, flags);
        p += flags;
        if (std::strncmp(p + 1, "I64", 3) == 0) {
            out += "ll";
            p += 3;
        }
    }
    return out;
}

} // namespace

bool FormatText(std::string &out, const char *format, va_list args)
{
    if (!format) return false;
    const std::optional<std::string> portable = Portable(format);
    if (portable) format = portable->c_str();
    va_list copy;
    va_copy(copy, args);
    char small[256];
    const int length = std::vsnprintf(small, sizeof small, format, copy);
    va_end(copy);
    if (length < 0) return false;
    if (static_cast<size_t>(length) < sizeof small) {
        out.assign(small, static_cast<size_t>(length));
        return true;
    }
    out.resize(static_cast<size_t>(length));
    std::vsnprintf(out.data(), out.size() + 1, format, args);
    return true;
}

namespace {

struct InternTable {
    std::mutex lock;
    // Node-based set: the characters of an element never move while it lives.
    std::unordered_set<std::string> texts;
};

InternTable &Interned()
{
    // Never destroyed, so texts stay readable by code running during exit.
    static InternTable *table = new InternTable;
    return *table;
}

} // namespace

const char *InternText(std::string_view text)
{
    InternTable &table = Interned();
    std::lock_guard guard(table.lock);
    return table.texts.emplace(text).first->c_str();
}

void ClearInternedTexts()
{
    InternTable &table = Interned();
    std::lock_guard guard(table.lock);
    table.texts.clear();
}

std::string ToLower(std::string_view text)
{
    // ASCII only: the locale must not touch the bytes of UTF-8 keys.
    std::string lower(text);
    for (char &c : lower)
        if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
    return lower;
}

std::string_view Trim(std::string_view text)
{
    const auto space = [](char c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n'; };
    while (!text.empty() && space(text.front())) text.remove_prefix(1);
    while (!text.empty() && space(text.back())) text.remove_suffix(1);
    return text;
}

} // namespace blbase
