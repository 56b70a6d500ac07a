/*
 * Audio signal library: every public header.
 */
#ifndef AUDIO_H
#define AUDIO_H

#include "audioformat.h"
#include "audiofx.h"
#include "audiometadata.h"
#include "audioregion.h"
#include "audiosignal.h"
#include "dspb.h"

#endif /* AUDIO_H */
