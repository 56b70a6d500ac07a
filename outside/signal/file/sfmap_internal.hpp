// Translation between libsndfile's format codes and ours.
#pragma once

namespace velmsig {

// AUDIO_CONTAINER_* of a libsndfile major format; 0 when unsupported.
int container_of_sf(int sf_format);
// AUDIO_FORMAT_* of a libsndfile format (major and subtype); 0 when unsupported.
int coding_of_sf(int sf_format);
// Bits per stored sample of a libsndfile subtype (16 for compressed ones).
int bits_of_sf(int sf_format);
// The libsndfile format storing `coding` in `container` (for FLAC, `bits`
// picks the integer depth); 0 when none.
int sf_format_of(int container, int coding, int bits);

}  // namespace velmsig
