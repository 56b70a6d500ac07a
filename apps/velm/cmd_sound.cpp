// velm devices, play and record: the sound devices as a shell uses them.
#include <chrono>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <thread>
#include <vector>

#include "apps/velm/tool.hpp"
#include "core/velmqueries.h"
#include "core/velmtimeconv.h"
#include "edit/velmedit.h"
#include "edit/velmselection.h"
#include "outside/base/blbase.h"
#include "outside/signal/audiosignal.h"
#include "platform/nativetimer.h"
#include "sound/velmplay.h"
#include "sound/velmrecord.h"
#include "sound/velmsound.h"

namespace {

// Options both play and record take.
struct DeviceArgs {
    const char *device = nullptr;
    std::vector<const char *> settings; // "key=value", applied in order
};

velmtool::Took take_device_option(DeviceArgs *args, const char *option, const char *value)
{
    using velmtool::Took;
    if (std::strcmp(option, "--device") == 0) {
        args->device = value;
        return Took::Value;
    }
    if (std::strcmp(option, "--set") == 0) {
        const char *equals = std::strchr(value, '=');
        if (!equals || equals == value) return Took::BadValue;
        args->settings.push_back(value);
        return Took::Value;
    }
    return Took::Nothing;
}

// Applies --set and --device; false with a message when the named device
// does not exist for the direction.
bool apply_device_args(const DeviceArgs &args, bool capture)
{
    for (const char *setting : args.settings) BLSETTINGS_ChangeEx(nullptr, "%s", setting);
    if (!args.device) return true;
    VELMSOUND_Initialize();
    if (std::strcmp(args.device, "default") != 0 && !VELMSOUND_GetSoundDeviceByName(args.device, capture)) {
        std::fprintf(stderr, "velm: no %s device named '%s' (see velm devices)\n", capture ? "capture" : "playback",
                     args.device);
        return false;
    }
    BLSETTINGS_ChangeEx(nullptr, capture ? "libvelm.record.devicename=%s" : "libvelm.playback.devicename=%s",
                        args.device);
    return true;
}

struct PlayArgs {
    const char *file = nullptr;
    double from = -1.0;
    double to = -1.0;
    DeviceArgs device;
};

velmtool::Took take_play(PlayArgs *args, const char *option, const char *value)
{
    using velmtool::Took;
    using velmtool::value_if;
    if (option[0] != '-') return velmtool::word_into(&args->file, option);
    if (!value) return Took::Nothing;
    if (std::strcmp(option, "--from") == 0) return value_if(velmtool::parse_seconds(value, &args->from));
    if (std::strcmp(option, "--to") == 0) return value_if(velmtool::parse_seconds(value, &args->to));
    return take_device_option(&args->device, option, value);
}

struct RecordArgs {
    const char *out = nullptr;
    const char *format = "AUTO"; // the type from OUT's extension
    double seconds = 0.0;
    long rate = 44100;
    long channels = 2;
    DeviceArgs device;
};

velmtool::Took take_record(RecordArgs *args, const char *option, const char *value)
{
    using velmtool::Took;
    using velmtool::value_if;
    if (option[0] != '-') return velmtool::word_into(&args->out, option);
    if (!value) return Took::Nothing;
    if (std::strcmp(option, "--seconds") == 0)
        return value_if(velmtool::parse_seconds(value, &args->seconds) && args->seconds > 0 && args->seconds <= 86400);
    if (std::strcmp(option, "--rate") == 0) return value_if(velmtool::parse_count(value, 1000, 192000, &args->rate));
    if (std::strcmp(option, "--channels") == 0) return value_if(velmtool::parse_count(value, 1, 2, &args->channels));
    if (std::strcmp(option, "--format") == 0) {
        args->format = value;
        return Took::Value;
    }
    return take_device_option(&args->device, option, value);
}

const char *direction(const VELMSOUNDDEVICEINFO &info)
{
    if (info.playback && info.capture) return "playback, capture";
    return info.playback ? "playback" : "capture";
}

// Cuts the document to its first `frames` samples; a recording stops a
// little after the time asked for.
bool keep_first(VELMAUDIO doc, int64_t frames)
{
    if (VELMAUDIO_NumSamples(doc) <= frames) return true;
    return VELMAUDIO_SelectAudio(doc, 0, frames) && VELMAUDIO_Trim(doc, nullptr);
}

} // namespace

namespace velmtool {

int run_devices(int argc, char **argv)
{
    static const char usage[] = "usage: velm devices\n";
    if (argc > 0) return decline(argc, argv, argv[0], usage);
    VELMSOUND_Initialize();
    for (int i = 0; i < VelmSoundDeviceInfoCount; ++i) {
        const VELMSOUNDDEVICEINFO &info = *VelmSoundDeviceInfoList[i];
        const bool is_default = (info.playback && info.defaultPlayback) || (info.capture && info.defaultCapture);
        std::printf("%-32s %-18s up to %u Hz%s\n", info.name, direction(info),
                    info.playback ? info.maxPlaybackRate : info.maxCaptureRate, is_default ? ", default" : "");
    }
    return 0;
}

int run_play(int argc, char **argv)
{
    static const char usage[] =
        "usage: velm play [FILE] [--from SECONDS] [--to SECONDS] [--device NAME] [--set KEY=VALUE ...]\n"
        "  plays FILE (the built-in demo sound when no file is given) and returns when it has been heard;\n"
        "  --set changes a library setting first, e.g. libvelm.playback.osbuffersize=0.1\n";
    PlayArgs args;
    const char *bad = nullptr;
    const auto option = [&args](const char *text, const char *value) { return take_play(&args, text, value); };
    if (!walk_arguments(argc, argv, option, &bad)) return decline(argc, argv, bad, usage);
    VELMPLAY_Initialize();
    if (!apply_device_args(args.device, false)) return 1;
    VELMAUDIO doc = open_input(args.file);
    if (!doc) return 1;

    int64_t begin = 0, end = VELMAUDIO_NumSamples(doc);
    if ((args.from >= 0 || args.to >= 0) && !sample_range(doc, args.from, args.to, &begin, &end)) {
        std::fprintf(stderr, "velm: the range holds no samples\n");
        VELMAUDIO_Close(doc);
        return 1;
    }
    const bool started = VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_RANGE | VELMPLAY_NO_NOTIFY, begin, end);
    if (!started) std::fprintf(stderr, "velm: cannot play: no playback device takes this sound\n");
    else VELMAUDIO_PlayWait(doc);
    VELMAUDIO_Close(doc);
    return started ? 0 : 1;
}

int run_record(int argc, char **argv)
{
    static const char usage[] =
        "usage: velm record OUT --seconds SECONDS [--rate HZ] [--channels 1|2] [--format TEXT]\n"
        "                   [--device NAME] [--set KEY=VALUE ...]\n"
        "  records SECONDS of sound (44100 Hz stereo unless told) and saves it as OUT\n";
    RecordArgs args;
    const char *bad = nullptr;
    const auto option = [&args](const char *text, const char *value) { return take_record(&args, text, value); };
    if (!walk_arguments(argc, argv, option, &bad)) return decline(argc, argv, bad, usage);
    if (!args.out || args.seconds <= 0) return decline(argc, argv, nullptr, usage);
    VELMRECORD_Initialize();
    if (!apply_device_args(args.device, true)) return 1;

    const _audio_format format = AUDIO_InitFormat(static_cast<int>(args.rate), static_cast<int>(args.channels), 16);
    VELMAUDIO doc = VELMAUDIO_New(&format);
    if (!doc) {
        std::fprintf(stderr, "velm: cannot make a document of %ld Hz, %ld channels\n", args.rate, args.channels);
        return 1;
    }
    const int64_t wanted = static_cast<int64_t>(std::llround(args.seconds * static_cast<double>(args.rate)));
    if (!VELMAUDIO_RecordStart(doc, VELMRECORD_FLAG_QUIET, nullptr)) {
        std::fprintf(stderr, "velm: cannot record: no capture device takes %ld Hz, %ld channels\n", args.rate,
                     args.channels);
        VELMAUDIO_Close(doc);
        return 1;
    }
    // The device delivers in real time, or faster when told; a device that
    // delivers nothing for long is given up on.
    using clock = std::chrono::steady_clock;
    const auto give_up = clock::now() + std::chrono::duration<double>(args.seconds * 2.0 + 5.0);
    while (VELMAUDIO_NumSamples(doc) < wanted && clock::now() < give_up) {
        VELMNATIVE_PumpTimers();
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    VELMAUDIO_RecordStop(doc);
    bool ok = VELMAUDIO_NumSamples(doc) >= wanted;
    if (!ok) std::fprintf(stderr, "velm: the capture device stopped delivering sound\n");
    ok = ok && keep_first(doc, wanted);
    if (ok && !VELMAUDIO_SaveAs(doc, args.out, args.format)) {
        std::fprintf(stderr, "velm: cannot write %s: %s\n", args.out, why(args.out, true, AUDIOSIGNAL_GetLastError()).c_str());
        ok = false;
    }
    VELMAUDIO_Close(doc);
    return ok ? 0 : 1;
}

} // namespace velmtool
