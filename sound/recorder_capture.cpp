// The capture side: 16-bit blocks from the device become float frames of the
// signal's format and are inserted through the pipe.
#include <algorithm>

#include "sound/recorder_internal.hpp"

namespace {

// Frames the conversion may write at once, into the buffer's second half.
int64_t output_room(VELMRECORDER r)
{
    return (r->capacity / 2) / r->signalFormat.numChannels;
}

float *output_area(VELMRECORDER r)
{
    return r->buffer + r->capacity / 2;
}

void append(VELMRECORDER r, const float *frames, int64_t count)
{
    if (count <= 0) return;
    const int64_t appended = AUDIOSIGNAL_AppendToPipe(r->pipe, frames, count);
    if (appended > 0) r->position += appended;
}

// Runs frames through the conversion in steps whose output fits the room,
// fetching what a step leaves over before the next one.
void convert_and_append(VELMRECORDER r, const float *in, int64_t frames)
{
    const int64_t room = output_room(r);
    const int64_t step = std::max<int64_t>(1, AUDIOFX_MapOutputToInput(r->conversion, room) / 2);
    const int channels = r->captureFormat.numChannels;
    for (int64_t done = 0; done < frames;) {
        const int64_t n = std::min(step, frames - done);
        int64_t got = AUDIOFX_ProcessSamples(r->conversion, in + done * channels, n, output_area(r), room);
        append(r, output_area(r), got);
        while (got == room) {
            got = AUDIOFX_ProcessSamples(r->conversion, in, 0, output_area(r), room);
            append(r, output_area(r), got);
        }
        done += n;
    }
}

} // namespace

namespace velm {

int32_t recorder_capture(void *user, void *data, int32_t bytes)
{
    auto *r = static_cast<VELMRECORDER>(user);
    if (!r || !data || bytes <= 0) return bytes;
    MutexLock(r->lock);
    const int channels = r->captureFormat.numChannels;
    // Whole frames only, and at most the buffer's first half at a time.
    const int64_t chunk = std::max<int64_t>(channels, (r->capacity / 8) / channels * channels);
    const int64_t samples = bytes / 2 / channels * channels;
    const auto *pcm = static_cast<const int16_t *>(data);
    for (int64_t done = 0; r->pipe && done < samples;) {
        const int64_t n = std::min(chunk, samples - done);
        AUDIO_Word16ToFloatIEEE(pcm + done, r->buffer, static_cast<int>(n));
        if (r->conversion)
            convert_and_append(r, r->buffer, n / channels);
        else
            append(r, r->buffer, n / channels);
        done += n;
    }
    MutexUnlock(r->lock);
    return bytes;
}

void recorder_drain(VELMRECORDER r)
{
    if (!r->conversion) return;
    int64_t got;
    do {
        got = AUDIOFX_ProcessSamples(r->conversion, nullptr, 0, output_area(r), output_room(r));
        if (r->pipe) append(r, output_area(r), got);
    } while (got > 0);
}

void recorder_close_pipe(VELMRECORDER r)
{
    MutexLock(r->lock);
    if (r->pipe) {
        recorder_drain(r);
        AUDIOSIGNAL_ClosePipe(r->pipe);
        r->pipe = nullptr;
    }
    MutexUnlock(r->lock);
}

} // namespace velm
