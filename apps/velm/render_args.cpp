// Reading the arguments of velm render.
#include <cstring>
#include <string>

#include "apps/velm/render_args.hpp"
#include "core/velmconfig.h"

namespace {

using velmtool::RenderArgs;

// Three pixmaps of this size are held at once, so the bound keeps a
// mistyped size from asking for gigabytes.
constexpr long kMaxWidth = 8192;
constexpr long kMaxHeight = 4096;
constexpr long kMinSide = 64;

// Draw property numbers of the scale kinds.
constexpr int kVertScaleProperty = 3;
constexpr int kSpecScaleProperty = 4;
constexpr int kHorzScaleProperty = 5;

bool parse_size(const char *text, RenderArgs *args)
{
    const char *x = std::strchr(text, 'x');
    if (!x) return false;
    const std::string width(text, x);
    long w = 0, h = 0;
    if (!velmtool::parse_count(width.c_str(), kMinSide, kMaxWidth, &w) ||
        !velmtool::parse_count(x + 1, kMinSide, kMaxHeight, &h))
        return false;
    args->width = static_cast<int>(w);
    args->height = static_cast<int>(h);
    return true;
}

bool parse_lanes(const char *text, uint32_t *lanes)
{
    const char *names[] = {"waveform", "spectrogram", "both"};
    for (uint32_t kind = 1; kind <= 3; ++kind)
        if (std::strcmp(text, names[kind - 1]) == 0) {
            *lanes = kind;
            return true;
        }
    return false;
}

// A "libvelm." key with a name and a value sign; the value may be empty.
bool is_setting(const char *text)
{
    static const char prefix[] = "libvelm.";
    const size_t n = sizeof prefix - 1;
    const char *equals = std::strchr(text, '=');
    return std::strncmp(text, prefix, n) == 0 && equals && equals > text + n;
}

// A scale kind named as the configuration names it; false for an unknown name.
bool parse_scale(int (*decode)(const char *, int), int property, const char *text, RenderArgs *args)
{
    const int kind = decode(text, -1);
    if (kind < 0) return false;
    args->scales.emplace_back(property, kind);
    return true;
}

bool add_selection(const char *text, RenderArgs *args)
{
    double from = 0, to = 0;
    if (!velmtool::parse_range(text, &from, &to)) return false;
    args->selections.push_back(text);
    return true;
}

} // namespace

namespace velmtool {

Took take_render_argument(RenderArgs *args, const char *option, const char *value)
{
    if (option[0] != '-') return word_into(&args->file, option);
    if (std::strcmp(option, "--verbose") == 0 || std::strcmp(option, "-v") == 0) {
        args->verbose = true;
        return Took::Alone;
    }
    if (!value) return Took::Nothing;
    if (std::strcmp(option, "-o") == 0) {
        args->out = value;
        return Took::Value;
    }
    if (std::strcmp(option, "--size") == 0) return value_if(parse_size(value, args));
    if (std::strcmp(option, "--lanes") == 0) return value_if(parse_lanes(value, &args->lanes));
    if (std::strcmp(option, "--from") == 0) return value_if(parse_seconds(value, &args->from));
    if (std::strcmp(option, "--to") == 0) return value_if(parse_seconds(value, &args->to));
    if (std::strcmp(option, "--select") == 0) return value_if(add_selection(value, args));
    if (std::strcmp(option, "--cursor") == 0) return value_if(parse_seconds(value, &args->cursor));
    if (std::strcmp(option, "--regions") == 0) {
        args->regions = value;
        return value_if(*value != '\0');
    }
    if (std::strcmp(option, "--horz-scale") == 0)
        return value_if(parse_scale(VELMCONFIG_DecodeHorzScaleKind, kHorzScaleProperty, value, args));
    if (std::strcmp(option, "--vert-scale") == 0)
        return value_if(parse_scale(VELMCONFIG_DecodeVertScaleKind, kVertScaleProperty, value, args));
    if (std::strcmp(option, "--spectral-scale") == 0)
        return value_if(parse_scale(VELMCONFIG_DecodeSpecScaleKind, kSpecScaleProperty, value, args));
    if (std::strcmp(option, "--set") == 0) {
        args->settings.push_back(value);
        return value_if(is_setting(value));
    }
    return Took::Nothing;
}

} // namespace velmtool
