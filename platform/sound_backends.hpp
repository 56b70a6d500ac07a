// The device families the platform back-end enumerates.  Each marks its
// known records present (refreshing their default flags) and appends new
// ones; the result is the new count.
#ifndef VELMPLATFORM_SOUND_BACKENDS_HPP
#define VELMPLATFORM_SOUND_BACKENDS_HPP

#include "sound/velmsound.h"

namespace velmsound {

inline constexpr const char *kVirtualIdentity = "virtual";

int EnumerateAlsaDevices(VELMSOUNDDEVICE *list, int count);

// The virtual device is the default for a direction only when no system
// device is.
int EnumerateVirtualDevice(VELMSOUNDDEVICE *list, int count, bool default_playback, bool default_capture);

} // namespace velmsound

#endif // VELMPLATFORM_SOUND_BACKENDS_HPP
