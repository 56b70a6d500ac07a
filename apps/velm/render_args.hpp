// The options of velm render.
#ifndef VELM_TOOL_RENDER_ARGS_HPP
#define VELM_TOOL_RENDER_ARGS_HPP

#include <cstdint>
#include <utility>
#include <vector>

#include "apps/velm/tool.hpp"

namespace velmtool {

// What the arguments of velm render ask for.
struct RenderArgs {
    const char *file = nullptr;
    const char *out = nullptr;
    int width = 1200;
    int height = 400;
    uint32_t lanes = 3;
    double from = -1.0;
    double to = -1.0;
    std::vector<const char *> settings;
    std::vector<const char *> selections;  // checked "FROM:TO" texts
    const char *regions = nullptr;
    double cursor = -1.0;
    // (draw property, kind) pairs, set in the order given.
    std::vector<std::pair<int, int>> scales;
    bool verbose = false;
};

// Takes one argument (with the next one as its possible value) into args.
Took take_render_argument(RenderArgs *args, const char *option, const char *value);

} // namespace velmtool

#endif
