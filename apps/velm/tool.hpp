// The velm tool's commands.
#ifndef VELM_TOOL_HPP
#define VELM_TOOL_HPP

#include "core/velmaudio.h"

namespace velmtool {

// A new document holding the built-in demo sound: a few seconds of a
// stereo chord that swells and fades, with a click track on the right.
VELMAUDIO open_demo_sound();

// Opens FILE, or the demo sound when file is null; prints an error and
// returns null on failure.
VELMAUDIO open_input(const char *file);

int run_info(int argc, char **argv);

} // namespace velmtool

#endif
