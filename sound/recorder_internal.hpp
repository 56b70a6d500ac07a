// The recorder record behind a VELMRECORDER handle.  Private to the library.
#ifndef VELM_RECORDER_INTERNAL_HPP
#define VELM_RECORDER_INTERNAL_HPP

#include <cstdint>

#include "outside/base/blbase.h"
#include "outside/signal/audiofx.h"
#include "outside/signal/audiosignal.h"
#include "sound/velmrecord.h"
#include "sound/velmsound.h"

struct _VELMRECORDER {
    BLMEM         pool;          // "VELMRECORDER MemSpace": the record and its buffer
    uint32_t      target;        // 0: into the document's signal
    VELMAUDIO     doc;
    AUDIOSIGNAL  *signal;        // the signal the pipe writes into
    BLMUTEX       lock;          // guards pipe, conversion and position against the capture thread
    AUDIOSIGNAL_PIPE *pipe;
    int64_t       position;      // next signal frame to be written
    float         viewWindow;    // seconds shown behind the record position
    float         bufferTime;    // device latency in seconds
    uint32_t      flags;         // VELMRECORD_FLAG_*
    int32_t       status;        // VELMRECORD_STATUS_*
    _audio_format signalFormat;
    AUDIOFX      *conversion;    // capture format to signal format; null when they agree
    VELMSOUNDDEVICE device;
    VELMSOUNDSTREAM stream;
    _audio_format captureFormat; // as negotiated with the device, 16 bits
    VELMTIMER     timer;
    uint8_t       updateBusy;
    float        *buffer;        // converted samples, then the conversion's output
    uint32_t      capacity;      // samples in buffer
    VELMTIMER_Callback updateCallback;
    void         *updateUser;
    int64_t       lastShown;     // record position at the last view update
};

namespace velm {

constexpr uint32_t kRecordBufferSamples = 0x200000;
constexpr uint32_t kRecordUpdateMs = 500;

// The stream callback: converts captured 16-bit samples and appends them.
int32_t recorder_capture(void *user, void *data, int32_t bytes);
// Whether recorder is still a live recorder.
bool recorder_alive(VELMRECORDER recorder);
// The default 500 ms update: the view follows the recording.
int recorder_update(void *user);
// Appends what the conversion still holds and starts it afresh; under the lock.
void recorder_drain(VELMRECORDER recorder);
// Ends the insertion: the conversion's tail goes in, then no more frames.
void recorder_close_pipe(VELMRECORDER recorder);
// A "fmtconv" path from the capture format to the signal format when they differ.
bool recorder_make_conversion(VELMRECORDER recorder);

} // namespace velm

#endif
