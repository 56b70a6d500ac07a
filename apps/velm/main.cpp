// velm: inspect, convert, edit and draw audio files with libvelm.
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
                 "  render [FILE] -o OUT.png [--size WxH] [--lanes waveform|spectrogram|both]\n"
                 "         [--from SECONDS] [--to SECONDS] [--select FROM:TO ...] [--regions FILE] ...\n"
                 "        draws the waveform and spectrogram of FILE (or the demo sound)\n"
                 "        into a PNG picture, 1200x400 and both lanes unless told;\n"
                 "        see velm render --help\n"
                 "  convert IN OUT [--format TEXT] [--rate HZ] [--channels N]\n"
                 "        saves IN as OUT, its type from OUT's extension unless --format\n"
                 "        names one, resampled and remixed when a rate or channel count is given\n"
                 "  edit IN OUT [--format TEXT] OPERATION...\n"
                 "        runs edits in order (--select FROM:TO, --cut, --paste, --clear, --trim,\n"
                 "        --silence, --reverse, --effect SCRIPT, --remove-dc, --append FILE, ...)\n"
                 "        and saves the result as OUT; see velm edit --help\n"
                 "  devices\n"
                 "        the sound devices that can play or record\n"
                 "  play [FILE] [--from SECONDS] [--to SECONDS] [--device NAME]\n"
                 "        plays FILE (or the demo sound) and returns when it has been heard\n"
                 "  record OUT --seconds SECONDS [--rate HZ] [--channels 1|2] [--device NAME]\n"
                 "        records from a capture device and saves the sound as OUT\n"
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
    if (std::strcmp(command, "render") == 0) return velmtool::run_render(argc - 2, argv + 2);
    if (std::strcmp(command, "convert") == 0) return velmtool::run_convert(argc - 2, argv + 2);
    if (std::strcmp(command, "edit") == 0) return velmtool::run_edit(argc - 2, argv + 2);
    if (std::strcmp(command, "devices") == 0) return velmtool::run_devices(argc - 2, argv + 2);
    if (std::strcmp(command, "play") == 0) return velmtool::run_play(argc - 2, argv + 2);
    if (std::strcmp(command, "record") == 0) return velmtool::run_record(argc - 2, argv + 2);
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
