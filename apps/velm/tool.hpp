// The velm tool's commands.
#ifndef VELM_TOOL_HPP
#define VELM_TOOL_HPP

#include <cstdint>

#include "core/velmaudio.h"

namespace velmtool {

// A new document holding the built-in demo sound: a few seconds of a
// stereo chord that swells and fades, with a click track on the right.
VELMAUDIO open_demo_sound();

// Opens FILE, or the demo sound when file is null; prints an error and
// returns null on failure.
VELMAUDIO open_input(const char *file);

// Option values: false unless the whole text is a number in range.
bool parse_seconds(const char *text, double *out);
bool parse_count(const char *text, long low, long high, long *out);

// Whether "--help" or "-h" is among the arguments.
bool wants_help(int argc, char **argv);

// Says which argument was refused (or, for null, that one is missing) and
// how the command is used, on standard error; returns the exit status 2.
int refuse(const char *bad, const char *usage);

// The samples [begin, end) from `from` to `to` seconds, clipped to the
// document; a negative time stands for its start or end.  False when the
// range holds no samples.
bool sample_range(VELMAUDIO doc, double from, double to, int64_t *begin, int64_t *end);

int run_info(int argc, char **argv);
int run_render(int argc, char **argv);
int run_convert(int argc, char **argv);

} // namespace velmtool

#endif
