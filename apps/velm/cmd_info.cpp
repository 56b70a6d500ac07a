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

// Silence is -200 dB, as in the statistics record.
double to_dbfs(double amplitude)
{
    return amplitude > 1e-10 ? 20.0 * std::log10(amplitude) : -200.0;
}

void print_channel(int channel, double peak, double rms, double mean)
{
    std::printf("channel %d: peak %.4f (%.2f dBFS), RMS %.4f (%.2f dBFS), DC offset %+.6f\n", channel + 1, peak,
                to_dbfs(peak), rms, to_dbfs(rms), mean);
}

// Peak, RMS and DC offset of every channel over the `count` frames measured.
// The statistics record holds the first channels only; the others are read
// one by one.
bool print_channels(VELMAUDIO doc, int64_t count)
{
    AUDIOSIGNAL_STATISTICS stats{};
    if (!VELMAUDIO_GetSignalStats(doc, &stats, 0.05, 0)) return false;
    for (int c = 0; c < stats.numChannels; ++c) {
        const AUDIOSIGNAL_CHANNELSTATS &s = stats.channel[c];
        print_channel(c, std::fmax(std::fabs(s.min), std::fabs(s.max)), s.rms, s.mean);
    }
    const double n = count > 0 ? static_cast<double>(count) : 1.0;
    for (int c = stats.numChannels; c < VELMAUDIO_NumChannels(doc); ++c) {
        float min = 0.0f, max = 0.0f;
        if (count > 0 && !VELMAUDIO_GetChannelMinMax(doc, c, &min, &max)) return false;
        print_channel(c, std::fmax(std::fabs(min), std::fabs(max)), std::sqrt(VELMAUDIO_GetChannelSamplesSum2(doc, c) / n),
                      VELMAUDIO_GetChannelSamplesSum(doc, c) / n);
    }
    return true;
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

    int64_t begin = 0, end = samples;
    if (args.from >= 0 || args.to >= 0) {
        if (!sample_range(doc, args.from, args.to, &begin, &end) || !VELMAUDIO_SelectAudio(doc, begin, end)) {
            std::fprintf(stderr, "velm: the range holds no samples\n");
            VELMAUDIO_Close(doc);
            return 1;
        }
        std::printf("%-10s %.3f s .. %.3f s\n", "range", VELMAUDIO_SampleToTime(doc, begin), VELMAUDIO_SampleToTime(doc, end));
    }
    const bool ok = print_channels(doc, end - begin);
    VELMAUDIO_Close(doc);
    return ok ? 0 : 1;
}

} // namespace velmtool
