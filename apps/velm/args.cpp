// Reading the tool's option values and time ranges.
#include <algorithm>
#include <cerrno>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>

#include "apps/velm/tool.hpp"
#include "core/velmqueries.h"
#include "core/velmtimeconv.h"

namespace velmtool {

bool parse_seconds(const char *text, double *out)
{
    char *end = nullptr;
    const double value = std::strtod(text, &end);
    if (!text[0] || *end || !std::isfinite(value) || value < 0) return false;
    *out = value;
    return true;
}

bool parse_range(const char *text, double *from, double *to)
{
    const char *colon = std::strchr(text, ':');
    if (!colon) return false;
    const std::string first(text, static_cast<size_t>(colon - text));
    return parse_seconds(first.c_str(), from) && parse_seconds(colon + 1, to) && *from < *to;
}

bool parse_count(const char *text, long low, long high, long *out)
{
    char *end = nullptr;
    errno = 0;
    const long value = std::strtol(text, &end, 10);
    if (!text[0] || *end || errno == ERANGE || value < low || value > high) return false;
    *out = value;
    return true;
}

bool walk_arguments(int argc, char **argv, const std::function<Took(const char *, const char *)> &take,
                    const char **bad)
{
    for (int i = 0; i < argc; ++i) {
        const char *value = i + 1 < argc ? argv[i + 1] : nullptr;
        switch (take(argv[i], value)) {
        case Took::Value:
            ++i;
            break;
        case Took::Alone:
            break;
        case Took::BadValue:
            *bad = value;
            return false;
        case Took::Nothing:
            *bad = argv[i];
            return false;
        }
    }
    *bad = nullptr;
    return true;
}

int decline(int argc, char **argv, const char *bad, const char *usage)
{
    for (int i = 0; i < argc; ++i)
        if (std::strcmp(argv[i], "--help") == 0 || std::strcmp(argv[i], "-h") == 0) {
            std::fputs(usage, stdout);
            return 0;
        }
    if (bad)
        std::fprintf(stderr, "velm: cannot use the argument '%s'\n", bad);
    else
        std::fprintf(stderr, "velm: an argument is missing\n");
    std::fputs(usage, stderr);
    return 2;
}

bool sample_range(VELMAUDIO doc, double from, double to, int64_t *begin, int64_t *end)
{
    const int64_t samples = VELMAUDIO_NumSamples(doc);
    *begin = from >= 0 ? VELMAUDIO_TimeToSample(doc, from) : 0;
    *end = to >= 0 ? std::min(VELMAUDIO_TimeToSample(doc, to), samples) : samples;
    return *begin >= 0 && *begin < *end;
}

} // namespace velmtool
