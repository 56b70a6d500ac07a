// Reading the tool's option values and time ranges.
#include <algorithm>
#include <cerrno>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>

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

bool parse_count(const char *text, long low, long high, long *out)
{
    char *end = nullptr;
    errno = 0;
    const long value = std::strtol(text, &end, 10);
    if (!text[0] || *end || errno == ERANGE || value < low || value > high) return false;
    *out = value;
    return true;
}

bool wants_help(int argc, char **argv)
{
    for (int i = 0; i < argc; ++i)
        if (std::strcmp(argv[i], "--help") == 0 || std::strcmp(argv[i], "-h") == 0) return true;
    return false;
}

int refuse(const char *bad, const char *usage)
{
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
