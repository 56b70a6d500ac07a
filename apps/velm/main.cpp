// velm: inspect, convert and draw audio files with libvelm.
#include <cstdio>
#include <cstring>

#include "apps/velm/tool.hpp"
#include "core/velmversion.h"

namespace {

void usage(FILE *out)
{
    std::fprintf(out,
                 "usage: velm COMMAND [ARGS]\n"
                 "\n"
                 "commands:\n"
                 "  info [FILE] [--from SECONDS] [--to SECONDS]\n"
                 "        format, length, metadata and per-channel peak, RMS and DC offset\n"
                 "        of FILE (the built-in demo sound when no file is given)\n"
                 "  version\n"
                 "        the library's version\n");
}

} // namespace

int main(int argc, char **argv)
{
    if (argc < 2) {
        usage(stderr);
        return 2;
    }
    const char *command = argv[1];
    if (std::strcmp(command, "info") == 0) return velmtool::run_info(argc - 2, argv + 2);
    if (std::strcmp(command, "version") == 0) {
        std::printf("%s\n", VELMVERSION_String());
        return 0;
    }
    if (std::strcmp(command, "--help") == 0 || std::strcmp(command, "help") == 0) {
        usage(stdout);
        return 0;
    }
    std::fprintf(stderr, "velm: unknown command '%s'\n", command);
    usage(stderr);
    return 2;
}
