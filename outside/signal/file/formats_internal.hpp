// The table of format names used in format strings, and the codings each
// container can store.
#pragma once

#include <string_view>

namespace velmsig {

struct FormatName {
    const char *name;
    int container;  // AUDIO_CONTAINER_*; 0 for "AUTO"
    int coding;     // AUDIO_FORMAT_*; 0: chosen from the bit depth
};

// Case-insensitive lookup; null for an unknown name.
const FormatName *find_format_name(std::string_view name);

// The coding a PCM-style container uses for `bits` (8/16/24/32; 64 with
// floating point), or 0 when it cannot store them.
int pcm_coding_for_bits(int container, int bits, bool floating);

// Bits per sample of a coding (16 for compressed codings).
int bits_of_coding(int coding);

// 1 for codings read in place (fixed-size frames), 0 for compressed ones.
bool coding_is_random_access(int coding);

// The format name that saves a file like one of `container` and `coding`
// ("WAVE", "WAVFLOAT", "FLAC"...); null when none.
const char *format_name_for(int container, int coding);

}  // namespace velmsig
