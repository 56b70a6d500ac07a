// The layer's own view of the device list, shared by its source files.
#ifndef VELMSOUND_SOUND_DEVICES_HPP
#define VELMSOUND_SOUND_DEVICES_HPP

#include "sound/sound_internal.hpp"

namespace velmsound {

extern VELMSOUNDDEVICE device_list[VELMSOUND_MAX_DEVICES];
extern int device_count;

// True while device is a member of the list (compared by address only, so a
// removed and freed record is never read).
bool IsListed(VELMSOUNDDEVICE device);

} // namespace velmsound

#endif // VELMSOUND_SOUND_DEVICES_HPP
