// What the stream rings need from a device: a cursor that moves through the
// sound as the device plays or records it.  The rings own the timing, the
// callbacks and the states; an endpoint only moves bytes.
#ifndef VELMPLATFORM_SOUND_ENDPOINT_HPP
#define VELMPLATFORM_SOUND_ENDPOINT_HPP

#include <cstdint>

namespace velmsound {

class PlaybackEndpoint {
public:
    virtual ~PlaybackEndpoint() = default;
    // Bytes the device buffers ahead of its cursor.
    virtual uint32_t RingBytes() const = 0;
    // How many times faster than real time the cursor moves.
    virtual double Speed() const { return 1.0; }
    // Start or resume moving the cursor; Pause keeps its place; Stop is final.
    virtual bool Start() = 0;
    virtual bool Pause() = 0;
    virtual void Stop() = 0;
    // Bytes heard since the endpoint was made; never more than written.
    virtual int64_t Played() = 0;
    // Queues bytes after those written before; the caller never queues more
    // than RingBytes() ahead of Played().
    virtual bool Write(const uint8_t *data, uint32_t bytes) = 0;
};

class CaptureEndpoint {
public:
    virtual ~CaptureEndpoint() = default;
    virtual uint32_t RingBytes() const = 0;
    virtual double Speed() const { return 1.0; }
    virtual bool Start() = 0;
    virtual void Stop() = 0;
    // Copies up to max bytes recorded since the last call, whole frames
    // only; the count, or -1 when the device failed.
    virtual int64_t Read(uint8_t *buffer, uint32_t max) = 0;
};

} // namespace velmsound

#endif // VELMPLATFORM_SOUND_ENDPOINT_HPP
