// Metadata as libsndfile carries it: the SF_STR_* strings.
#pragma once

#include <sndfile.h>

#include "outside/signal/audiometadata.h"

namespace velmsig {

// A new metadata object with the file's strings, or null when it has none.
AUDIOMETADATA *metadata_from_sndfile(SNDFILE *file);

// Writes every entry the open file's type can carry; the others are skipped.
void metadata_to_sndfile(SNDFILE *file, const AUDIOMETADATA *meta);

}  // namespace velmsig
