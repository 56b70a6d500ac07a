// Format strings: "NAME[key=value,...]" optionally followed by conversion
// stages ":STAGE[key=value,...]".
#pragma once

#include <cstdint>
#include <string>

namespace velmsig {

// A conversion applied while a file is read ("AUTO:FMTCONV[sr=8000,nc=1]").
struct FormatConversion {
    bool present = false;
    int sample_rate = 0;  // 0: unchanged
    int channels = 0;     // 0: unchanged
    int bits = 0;         // 0: unchanged (only labels the resulting format)
};

struct ParsedFormat {
    std::string name;        // upper-case, e.g. "AUTO", "WAVE", "RAW"
    int container = 0;       // AUDIO_CONTAINER_*; 0 for "AUTO"
    int coding = 0;          // AUDIO_FORMAT_*; 0: follows bits / the signal
    int sample_rate = 0;     // sr; 0: unset
    int channels = 0;        // nc
    int bits = 0;            // nbits (alias bps)
    bool big_endian = false; // endian=big (headerless files only)
    bool has_endian = false;
    int64_t offset = 0;      // offset: header bytes skipped in headerless files
    double quality = -1.0;   // quality 0..1 for lossy codings; <0: default
    FormatConversion conversion;
};

// Strict: unknown names or keys, malformed or out-of-range values fail.
// A null or empty text reads as "AUTO".
bool parse_format_string(const char *text, ParsedFormat *out);

// "NAME[sr=..,nc=..,nbits=..]" with only the keys that are set.
std::string compose_format_string(const ParsedFormat &format);

}  // namespace velmsig
