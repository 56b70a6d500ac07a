// The velm tool's commands.
#ifndef VELM_TOOL_HPP
#define VELM_TOOL_HPP

#include <cstdint>
#include <functional>
#include <string>

#include "core/velmaudio.h"

namespace velmtool {

// A new document holding the built-in demo sound, synthesised here: four
// seconds of stereo with voice-like formant sweeps, two tones and a noise burst.
VELMAUDIO open_demo_sound();

// Opens FILE, or the demo sound when file is null; prints an error and
// returns null on failure.
VELMAUDIO open_input(const char *file);

// Option values: false unless the whole text is a number in range.
bool parse_seconds(const char *text, double *out);
bool parse_count(const char *text, long low, long high, long *out);
// "FROM:TO" in seconds, FROM before TO.
bool parse_range(const char *text, double *from, double *to);

// What a command made of one argument: an option with its value (the next
// argument), a word standing alone, an option whose value it refused, or
// nothing it knows.
enum class Took { Value, Alone, BadValue, Nothing };
inline Took value_if(bool ok) { return ok ? Took::Value : Took::BadValue; }
// A word for a slot that takes one word.
inline Took word_into(const char **slot, const char *word)
{
    if (*slot) return Took::Nothing;
    *slot = word;
    return Took::Alone;
}

// Hands each argument, with the one after it as a possible value (null at
// the end), to take; false with bad pointing at the refused argument.
bool walk_arguments(int argc, char **argv, const std::function<Took(const char *, const char *)> &take,
                    const char **bad);

// Answers arguments a command could not parse: for "--help" or "-h" the
// usage on standard output and status 0; otherwise which argument was
// refused (bad; null when one is missing) and the usage on standard error,
// and status 2.
int decline(int argc, char **argv, const char *bad, const char *usage);

// The samples [begin, end) from `from` to `to` seconds, clipped to the
// document; a negative time stands for its start or end.  False when the
// range holds no samples.
bool sample_range(VELMAUDIO doc, double from, double to, int64_t *begin, int64_t *end);

// Why the work on path failed, in a few words: what the path itself shows
// (no such file, a folder, no such folder...), else the signal library's
// error bits (AUDIOSIGNAL_GetLastError).
std::string why(const char *path, bool writing, int error);

int run_info(int argc, char **argv);
int run_render(int argc, char **argv);
int run_convert(int argc, char **argv);
int run_edit(int argc, char **argv);
int run_devices(int argc, char **argv);
int run_play(int argc, char **argv);
int run_record(int argc, char **argv);

} // namespace velmtool

#endif
