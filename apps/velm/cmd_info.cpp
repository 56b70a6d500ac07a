// velm info: what a sound is and how loud each channel is.
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "apps/velm/tool.hpp"
#include "core/velmqueries.h"
#include "core/velmtimeconv.h"
#include "edit/velmselection.h"

namespace {

struct InfoArgs {
    const char *file = nullptr;
    double from = -1.0;
    double to = -1.0;
};

velmtool::Took take(InfoArgs *args, const char *option, const char *value)
{
    using velmtool::Took;
    using velmtool::value_if;
    if (option[0] != '-') return velmtool::word_into(&args->file, option);
    if (!value) return Took::Nothing;
    if (std::strcmp(option, "--from") == 0) return value_if(velmtool::parse_seconds(value, &args->from));
    if (std::strcmp(option, "--to") == 0) return value_if(velmtool::parse_seconds(value, &args->to));
    return Took::Nothing;
}

void print_tag(const char *name, const char *value)
{
    if (value && *value) std::printf("%-10s %s\n", name, value);
}

void print_channels(const AUDIOSIGNAL_STATISTICS &stats)
{
    for (int c = 0; c < stats.numChannels; ++c) {
        const AUDIOSIGNAL_CHANNELSTATS &s = stats.channel[c];
        const double peak = std::fmax(std::fabs(s.min), std::fabs(s.max));
        std::printf("channel %d: peak %.4f (%.2f dBFS), RMS %.4f (%.2f dBFS), DC offset %+.6f\n", c + 1, peak,
                    static_cast<double>(s.peak_db), s.rms, static_cast<double>(s.rms_db), s.mean);
    }
}

} // namespace

namespace velmtool {

int run_info(int argc, char **argv)
{
    static const char usage[] = "usage: velm info [FILE] [--from SECONDS] [--to SECONDS]\n";
    InfoArgs args;
    const char *bad = nullptr;
    const auto option = [&args](const char *text, const char *value) { return take(&args, text, value); };
    if (!walk_arguments(argc, argv, option, &bad)) return decline(argc, argv, bad, usage);
    VELMAUDIO doc = open_input(args.file);
    if (!doc) return 1;

    const int64_t samples = VELMAUDIO_NumSamples(doc);
    print_tag("file", args.file ? args.file : "(built-in demo sound)");
    print_tag("format", VELMAUDIO_GetFileFormatLabel(doc));
    std::printf("%-10s %d Hz\n", "rate", VELMAUDIO_SampleRate(doc));
    std::printf("%-10s %d\n", "channels", VELMAUDIO_NumChannels(doc));
    std::printf("%-10s %lld samples (%.3f s)\n", "length", static_cast<long long>(samples), VELMAUDIO_Duration(doc));
    print_tag("title", VELMAUDIO_GetTitle(doc));
    print_tag("artist", VELMAUDIO_GetArtist(doc));
    print_tag("album", VELMAUDIO_GetAlbumName(doc));
    print_tag("genre", VELMAUDIO_GetGenre(doc));

    if (args.from >= 0 || args.to >= 0) {
        int64_t begin = 0, end = 0;
        if (!sample_range(doc, args.from, args.to, &begin, &end) || !VELMAUDIO_SelectAudio(doc, begin, end)) {
            std::fprintf(stderr, "velm: the range holds no samples\n");
            VELMAUDIO_Close(doc);
            return 1;
        }
        std::printf("%-10s %.3f s .. %.3f s\n", "range", VELMAUDIO_SampleToTime(doc, begin), VELMAUDIO_SampleToTime(doc, end));
    }
    AUDIOSIGNAL_STATISTICS stats{};
    const int ok = VELMAUDIO_GetSignalStats(doc, &stats, 0.05, 0);
    if (ok) print_channels(stats);
    VELMAUDIO_Close(doc);
    return ok ? 0 : 1;
}

} // namespace velmtool
