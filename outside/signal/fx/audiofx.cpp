// The exported AUDIOFX_ calls: argument checks, script formatting and error
// reporting around velmsig::fx::Path.
#include "outside/signal/audiofx.h"

#include "outside/base/blbase.h"
#include "outside/signal/fx/fx_path.hpp"

#include <cstdarg>
#include <cstdio>
#include <new>
#include <optional>
#include <string>

struct AUDIOFX {
    velmsig::fx::Path path;
};

namespace {

// Longest script text accepted after formatting.
constexpr int kMaxScriptLength = 1 << 20;

std::optional<std::string> format_script(const char *call, const char *format, va_list args)
{
    if (!format) {
        BLDEBUG_Error(-1, "%s: no script", call);
        return std::nullopt;
    }
    va_list measure;
    va_copy(measure, args);
    const int length = std::vsnprintf(nullptr, 0, format, measure);
    va_end(measure);
    if (length < 0 || length > kMaxScriptLength) {
        BLDEBUG_Error(-1, "%s: script cannot be formatted or is longer than %d characters", call,
                      kMaxScriptLength);
        return std::nullopt;
    }
    std::string text(static_cast<size_t>(length), '\0');
    std::vsnprintf(text.data(), text.size() + 1, format, args);
    return text;
}

// Runs body, turning every exception into a logged failure value.
template <typename Body, typename Result>
Result guarded(const char *call, Result failure, Body body)
{
    try {
        return body();
    } catch (const std::bad_alloc &) {
        BLDEBUG_Error(-1, "%s: out of memory", call);
    } catch (const std::exception &e) {
        BLDEBUG_Error(-1, "%s: %s", call, e.what());
    }
    return failure;
}

}  // namespace

AUDIOFX *AUDIOFX_CreatePathEx(_audio_format input, int64_t length, int64_t max_block, const char *script, ...)
{
    va_list args;
    va_start(args, script);
    std::optional<std::string> text = format_script("AUDIOFX_CreatePathEx", script, args);
    va_end(args);
    if (!text)
        return nullptr;
    return guarded("AUDIOFX_CreatePathEx", static_cast<AUDIOFX *>(nullptr),
                   [&] { return new AUDIOFX{velmsig::fx::Path(input, length, max_block, *text)}; });
}

int AUDIOFX_ReconfigurePath(AUDIOFX *path, const char *script, ...)
{
    if (!path) {
        BLDEBUG_Error(-1, "AUDIOFX_ReconfigurePath: null path");
        return 0;
    }
    va_list args;
    va_start(args, script);
    std::optional<std::string> text = format_script("AUDIOFX_ReconfigurePath", script, args);
    va_end(args);
    if (!text)
        return 0;
    return guarded("AUDIOFX_ReconfigurePath", 0, [&] {
        path->path.reconfigure(*text);
        return 1;
    });
}

int64_t AUDIOFX_ProcessSamples(AUDIOFX *path, const float *in, int64_t frames, float *out, int64_t room)
{
    if (!path || frames < 0 || room < 0 || (!in && frames > 0) || (!out && room > 0)) {
        BLDEBUG_Error(-1, "AUDIOFX_ProcessSamples: bad arguments");
        return -1;
    }
    return guarded("AUDIOFX_ProcessSamples", int64_t{-1},
                   [&] { return path->path.process(in, frames, out, room); });
}

_audio_format AUDIOFX_GetOutputFormat(const AUDIOFX *path)
{
    return path ? path->path.output() : _audio_format{};
}

int64_t AUDIOFX_MapOutputToInput(const AUDIOFX *path, int64_t frames)
{
    if (!path || frames < 0)
        return -1;
    return path->path.map_output_to_input(frames);
}

int AUDIOFX_DestroyPath(AUDIOFX *path)
{
    if (!path)
        return 0;
    delete path;
    return 1;
}
