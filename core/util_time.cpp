// Millisecond and sample texts, and the parser of typed times.
#include "core/velmutil.h"

#include <algorithm>
#include <cinttypes>
#include <climits>
#include <cstdarg>
#include <cstdint>
#include <cmath>
#include <cstdio>
#include <string>
#include <vector>

namespace {

// snprintf that tolerates sizes 0 and 1 and reports whether anything was written.
int write_text(char *buffer, int size, const char *format, ...) __attribute__((format(printf, 3, 4)));
int write_text(char *buffer, int size, const char *format, ...)
{
    if (!buffer || size <= 0) return 0;
    va_list args;
    va_start(args, format);
    std::vsnprintf(buffer, static_cast<size_t>(size), format, args);
    va_end(args);
    return 1;
}

// atoi without its overflow: leading blanks, an optional sign, digits, capped at 10^9.
int leading_number(const char *text)
{
    while (*text == ' ' || *text == '\t') ++text;
    const bool negative = *text == '-';
    if (*text == '-' || *text == '+') ++text;
    int64_t value = 0;
    for (; *text >= '0' && *text <= '9'; ++text) {
        value = value * 10 + (*text - '0');
        if (value > 1000000000) value = 1000000000;
    }
    return static_cast<int>(negative ? -value : value);
}

// Below 1000 Hz the milliseconds of the longest positions leave 64 bits: saturate.
int64_t samples_to_ms(int64_t sample, int32_t rate)
{
    const double ms = std::trunc(static_cast<double>(sample) / (rate / 1000.0) + 0.5);
    return static_cast<int64_t>(std::clamp(ms, -9.2e18, 9.2e18));
}

} // namespace

void VELMUTIL_DecomposeMsTime(int64_t ms, int *hours, int *minutes, int *seconds, int *milliseconds)
{
    const int64_t s = ms / 1000;
    if (milliseconds) *milliseconds = static_cast<int>(ms % 1000);
    if (seconds) *seconds = static_cast<int>(s % 60);
    if (minutes) *minutes = static_cast<int>((s / 60) % 60);
    if (hours) *hours = static_cast<int>(std::clamp<int64_t>(s / 3600, INT_MIN, INT_MAX));
}

int VELMUTIL_MsTimeToBuffer(int64_t ms, int64_t reference_ms, char *buffer, int size)
{
    int h, m, s, f, rh, rm, rs, rf;
    VELMUTIL_DecomposeMsTime(ms, &h, &m, &s, &f);
    VELMUTIL_DecomposeMsTime(reference_ms, &rh, &rm, &rs, &rf);
    if (rh > 0) return write_text(buffer, size, "%02d:%02d:%02d.%03d", h, m, s, f);
    if (rm > 0) return write_text(buffer, size, "%02d:%02d.%03d", m, s, f);
    if (rs > 0) return write_text(buffer, size, "%d.%03d", s, f);
    return write_text(buffer, size, "0.%03d", f);
}

int VELMUTIL_SamplesToTimeString(int64_t sample, int64_t reference, int32_t rate, char *buffer, int size)
{
    if (rate <= 0) return 0;
    return VELMUTIL_MsTimeToBuffer(samples_to_ms(sample, rate), samples_to_ms(reference, rate), buffer, size);
}

int VELMUTIL_DecomposeStringTime(char *text, int *hours, int *minutes, int *seconds, int *milliseconds)
{
    int h = 0, m = 0, s = 0, ms = 0;
    if (text) {
        // Split at every ':' and '.'; the piece after the last '.' is the fraction,
        // every other piece a field.
        std::vector<const char *> pieces;
        size_t fraction_piece = SIZE_MAX;
        const char *start = text;
        for (char *p = text;; ++p) {
            const char c = *p;
            if (c != ':' && c != '.' && c != '\0') continue;
            *p = '\0';
            pieces.push_back(start);
            if (c == '.') fraction_piece = pieces.size();
            start = p + 1;
            if (c == '\0') break;
        }
        const char *fraction = fraction_piece < pieces.size() ? pieces[fraction_piece] : nullptr;
        std::vector<const char *> fields;
        for (size_t i = 0; i < pieces.size(); ++i)
            if (i != fraction_piece) fields.push_back(pieces[i]);
        const size_t n = fields.size();
        if (n >= 1) s = leading_number(fields[n - 1]);
        if (n >= 2) m = leading_number(fields[n - 2]);
        if (n >= 3) h = leading_number(fields[n - 3]);
        if (fraction) {
            size_t digits = 0;
            while (fraction[digits] >= '0' && fraction[digits] <= '9') ++digits;
            ms = leading_number(fraction);
            if (digits == 1) ms *= 100;
            else if (digits == 2) ms *= 10;
        }
        if (ms > 999) { s += ms / 1000; ms %= 1000; }
        if (s > 59) { m += s / 60; s %= 60; }
        if (m > 59) { h += m / 60; m %= 60; }
    }
    if (hours) *hours = h;
    if (minutes) *minutes = m;
    if (seconds) *seconds = s;
    if (milliseconds) *milliseconds = ms;
    return text ? 1 : 0;
}

static bool parse_copy(const char *text, int &h, int &m, int &s, int &ms)
{
    if (!text) return false;
    std::string copy(text);
    return VELMUTIL_DecomposeStringTime(copy.data(), &h, &m, &s, &ms) != 0;
}

int64_t VELMUTIL_TimeStringToMs(const char *text)
{
    int h = 0, m = 0, s = 0, ms = 0;
    if (!parse_copy(text, h, m, s, ms)) return 0;
    return ((static_cast<int64_t>(h) * 60 + m) * 60 + s) * 1000 + ms;
}

int64_t VELMUTIL_TimeStringToSample(const char *text, int32_t rate)
{
    int h = 0, m = 0, s = 0, ms = 0;
    if (!parse_copy(text, h, m, s, ms)) return 0;
    const int64_t seconds = static_cast<int64_t>(h) * 3600 + static_cast<int64_t>(m) * 60 + s;
    const auto fraction = static_cast<int64_t>(static_cast<float>(ms) * static_cast<float>(rate) / 1000.0f);
    // Typed hours run to a billion: at absurd rates the sample saturates instead of wrapping.
    int64_t whole, total;
    if (__builtin_mul_overflow(seconds, int64_t{rate}, &whole))
        return (seconds < 0) != (rate < 0) ? INT64_MIN : INT64_MAX;
    if (__builtin_add_overflow(whole, fraction, &total)) return fraction < 0 ? INT64_MIN : INT64_MAX;
    return total;
}
