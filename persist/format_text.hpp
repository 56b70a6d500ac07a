// The sample format a new document is made with, read from a format text
// such as "AUTO[sr=8000,nc=1]".
#ifndef VELM_FORMAT_TEXT_HPP
#define VELM_FORMAT_TEXT_HPP

#include "outside/signal/audioformat.h"

namespace velmlua {

// Reads "NAME" or "NAME[key=value,...]" with the keys sr, nc and nbits; keys
// left out keep 8000 Hz, one channel and 16 bits.  False for malformed text,
// unknown keys or a format no signal can have.
bool read_new_format(const char *text, _audio_format *out);

} // namespace velmlua

#endif
