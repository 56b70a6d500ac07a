// velm convert: saves a sound in another file type, rate or channel count.
#include <cstdio>
#include <cstring>

#include "apps/velm/progress.hpp"
#include "apps/velm/tool.hpp"
#include "core/velmqueries.h"
#include "edit/velmedit.h"

namespace {

const char kUsage[] = "usage: velm convert IN OUT [--format TEXT] [--rate HZ] [--channels N]\n";

// Bounds of what a number on the command line may say; the signal library
// judges the format itself.
constexpr long kMaxRate = 10000000;
constexpr long kMaxChannels = 1024;

struct ConvertArgs {
    const char *in = nullptr;
    const char *out = nullptr;
    const char *format = "AUTO";
    long rate = 0;
    long channels = 0;
};

velmtool::Took take(ConvertArgs *args, const char *option, const char *value)
{
    using velmtool::Took;
    using velmtool::value_if;
    if (option[0] != '-') return velmtool::word_into(args->in ? &args->out : &args->in, option);
    if (!value) return Took::Nothing;
    if (std::strcmp(option, "--format") == 0) {
        args->format = value;
        return value_if(*value != '\0');
    }
    if (std::strcmp(option, "--rate") == 0) return value_if(velmtool::parse_count(value, 1, kMaxRate, &args->rate));
    if (std::strcmp(option, "--channels") == 0)
        return value_if(velmtool::parse_count(value, 1, kMaxChannels, &args->channels));
    return Took::Nothing;
}

// Converts the samples when the rate or the channel count is to change.
bool change_format(VELMAUDIO doc, const ConvertArgs &args)
{
    _audio_format format{};
    if (!VELMAUDIO_GetSignalFormat(&format, doc)) {
        std::fprintf(stderr, "velm: the sound has no format\n");
        return false;
    }
    const int rate = args.rate ? static_cast<int>(args.rate) : format.sampleRate;
    const int channels = args.channels ? static_cast<int>(args.channels) : format.numChannels;
    if (rate == format.sampleRate && channels == format.numChannels) return true;
    format.sampleRate = rate;
    format.numChannels = static_cast<int16_t>(channels);
    if (VELMAUDIO_ChangeAudioFormat(doc, &format, nullptr, nullptr, 0, 0, nullptr)) return true;
    std::fprintf(stderr, "velm: cannot convert to %d Hz with %d channels (error %d)\n", rate, channels,
                 VELMAUDIO_GetLastError());
    return false;
}

} // namespace

namespace velmtool {

int run_convert(int argc, char **argv)
{
    ConvertArgs args;
    const char *bad = nullptr;
    const auto option = [&args](const char *text, const char *value) { return take(&args, text, value); };
    if (!walk_arguments(argc, argv, option, &bad) || !args.out) return decline(argc, argv, bad, kUsage);
    VELMAUDIO doc = open_input(args.in);
    if (!doc) return 1;
    bool ok = change_format(doc, args);
    if (ok && !with_progress([&] { return VELMAUDIO_SaveAs(doc, args.out, args.format); })) {
        std::fprintf(stderr, "velm: cannot write '%s' as %s: %s\n", args.out, args.format,
                     velmtool::why(args.out, true, AUDIOSIGNAL_GetLastError()).c_str());
        ok = false;
    }
    VELMAUDIO_Close(doc);
    return ok ? 0 : 1;
}

} // namespace velmtool
