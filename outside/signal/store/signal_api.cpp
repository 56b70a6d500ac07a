// Creation, properties, stamps, hash, memory, channels and read access.
#include <cstring>
#include <unordered_map>

#include "outside/signal/store/signal_internal.hpp"

using namespace velmsig;

namespace {

// A 128-bit hash over 32-bit words: two multiply-rotate lanes.
class Hasher {
public:
    void add(uint32_t word)
    {
        a_ = rotl(a_ ^ (word * 0x9E3779B97F4A7C15ull), 29) * 0xBF58476D1CE4E5B9ull;
        b_ = rotl(b_ + (word * 0xC2B2AE3D27D4EB4Full), 31) * 0x94D049BB133111EBull;
    }
    void add(const float *samples, int64_t count)
    {
        for (int64_t i = 0; i < count; ++i) {
            uint32_t word;
            std::memcpy(&word, samples + i, sizeof word);
            add(word);
        }
    }
    AUDIOSIGNAL_HASH result() const
    {
        AUDIOSIGNAL_HASH hash;
        const uint64_t a = finish(a_), b = finish(b_ ^ a_);
        std::memcpy(hash.bytes, &a, 8);
        std::memcpy(hash.bytes + 8, &b, 8);
        return hash;
    }

private:
    static uint64_t rotl(uint64_t x, int r) { return (x << r) | (x >> (64 - r)); }
    static uint64_t finish(uint64_t x)
    {
        x ^= x >> 33;
        x *= 0xFF51AFD7ED558CCDull;
        return x ^ (x >> 33);
    }
    uint64_t a_ = 0x243F6A8885A308D3ull, b_ = 0x13198A2E03707344ull;
};

bool hash_samples(const _audio_signal &signal, AUDIOSIGNAL_HASH &out)
{
    Hasher hasher;
    hasher.add(uint32_t(signal.format.sampleRate));
    hasher.add(uint32_t(signal.format.numChannels));
    std::vector<float> buffer(static_cast<size_t>(kChunkFrames));
    for (const SegmentsPtr &segments : all_segments(signal)) {
        for (int64_t at = 0; at < segments->length(); at += kChunkFrames) {
            const int64_t n = std::min(kChunkFrames, segments->length() - at);
            if (!segments->read(at, n, buffer.data())) return false;
            hasher.add(buffer.data(), n);
        }
    }
    out = hasher.result();
    return true;
}

}  // namespace

extern "C" {

AUDIOSIGNAL *AUDIOSIGNAL_New(const AUDIO_FORMAT *format)
{
    if (!valid_format(format)) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return nullptr;
    }
    return create_signal(*format);
}

AUDIOSIGNAL *AUDIOSIGNAL_NewEx(const AUDIO_FORMAT *format)
{
    return AUDIOSIGNAL_New(format);
}

AUDIOSIGNAL *AUDIOSIGNAL_CreateSilence(const AUDIO_FORMAT *format, int64_t frames)
{
    if (frames < 0) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return nullptr;
    }
    AUDIOSIGNAL *signal = AUDIOSIGNAL_New(format);
    if (signal && AUDIOSIGNAL_AppendSilence(signal, frames) != frames) {
        AUDIOSIGNAL_Destroy(signal);
        return nullptr;
    }
    return signal;
}

AUDIOSIGNAL *AUDIOSIGNAL_DuplicateEx(AUDIOSIGNAL *signal, int flags)
{
    if (!signal) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return nullptr;
    }
    auto *copy = new _audio_signal;
    std::unique_lock<std::mutex> guard(signal->lock);
    copy->format = signal->format;
    // Own sequences (sharing every page) so that each signal counts its share.
    for (const _audio_blocks_list *list : signal->lists) {
        copy->lists.push_back(adopt_list(std::make_shared<const Segments>(list->segments->pages())));
    }
    copy->active_mask = signal->active_mask;
    copy->stamp = signal->stamp;
    copy->reset_stamp = signal->reset_stamp;
    copy->regions_stamp = signal->regions_stamp;
    copy->samples_stamp = signal->samples_stamp;
    copy->file_time = signal->file_time;
    copy->hash_stamp = signal->hash_stamp;
    copy->hash = signal->hash;
    copy->read_only = signal->read_only;
    copy->file_name = signal->file_name;
    copy->format_text = signal->format_text;
    copy->file_size = signal->file_size;
    copy->metadata = signal->metadata ? AUDIOMETADATA_Duplicate(signal->metadata) : nullptr;
    guard.unlock();  // the regions ask their signals for rate and length
    if (signal->regions) signal_regions(copy)->copy_from(*signal->regions);
    return copy;
}

int AUDIOSIGNAL_Destroy(AUDIOSIGNAL *signal)
{
    if (!signal) return 0;
    delete signal;
    return 1;
}

int AUDIOSIGNAL_GetFormat(const AUDIOSIGNAL *signal, AUDIO_FORMAT *out)
{
    if (!signal || !out) return 0;
    *out = signal->format;
    return 1;
}

int AUDIOSIGNAL_GetActiveFormat(const AUDIOSIGNAL *signal, AUDIO_FORMAT *out)
{
    if (!signal || !out) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    *out = signal->format;
    out->numChannels = int16_t(__builtin_popcount(signal->active_mask));
    return 1;
}

int64_t AUDIOSIGNAL_NumSamples(const AUDIOSIGNAL *signal)
{
    return signal ? signal_length(*signal) : 0;
}

int AUDIOSIGNAL_NumChannels(const AUDIOSIGNAL *signal)
{
    return signal ? signal->format.numChannels : 0;
}

int AUDIOSIGNAL_SampleRate(const AUDIOSIGNAL *signal)
{
    if (!signal) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    return signal->format.sampleRate;
}

int AUDIOSIGNAL_GetFormatString(const AUDIOSIGNAL *signal, char *buffer, int size)
{
    if (!signal || !buffer || size <= 0) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    const size_t n = std::min(signal->format_text.size(), size_t(size) - 1);
    std::memcpy(buffer, signal->format_text.data(), n);
    buffer[n] = '\0';
    return 1;
}

const char *AUDIOSIGNAL_GetFileName(const AUDIOSIGNAL *signal)
{
    return signal && !signal->file_name.empty() ? signal->file_name.c_str() : nullptr;
}

int AUDIOSIGNAL_ReadOnly(const AUDIOSIGNAL *signal)
{
    return signal && signal->read_only ? 1 : 0;
}

int AUDIOSIGNAL_SetReadOnly(AUDIOSIGNAL *signal, int read_only)
{
    if (!signal) return 0;
    signal->read_only = read_only != 0;
    return 1;
}

AUDIOMETADATA *AUDIOSIGNAL_GetMetaData(const AUDIOSIGNAL *signal)
{
    return signal ? signal->metadata : nullptr;
}

int AUDIOSIGNAL_SetMetaData(AUDIOSIGNAL *signal, AUDIOMETADATA *metadata)
{
    if (!signal) return 0;
    if (signal->metadata != metadata) AUDIOMETADATA_Destroy(signal->metadata);
    signal->metadata = metadata;
    return 1;
}

int AUDIOSIGNAL_SetSampleRate(AUDIOSIGNAL *signal, int sample_rate)
{
    if (!signal || sample_rate <= 0) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return 0;
    }
    std::unique_lock<std::shared_mutex> writer(signal->access);
    std::lock_guard<std::mutex> guard(signal->lock);
    if (signal->format.sampleRate != sample_rate) {
        signal->format.sampleRate = sample_rate;
        signal->stamp = signal->samples_stamp = next_stamp();
    }
    return 1;
}

uint64_t AUDIOSIGNAL_GetTimeStamp(const AUDIOSIGNAL *signal, int kind)
{
    if (!signal) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    switch (kind) {
    case AUDIOSIGNAL_STAMP_CHANGES: return signal->stamp;
    case AUDIOSIGNAL_STAMP_REGIONS: return signal->regions_stamp;
    case AUDIOSIGNAL_STAMP_SAMPLES: return signal->samples_stamp;
    case AUDIOSIGNAL_STAMP_FILE: return signal->file_time;
    default: return 0;
    }
}

int AUDIOSIGNAL_ResetChanges(AUDIOSIGNAL *signal)
{
    if (!signal) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    signal->reset_stamp = signal->stamp;
    return 1;
}

int AUDIOSIGNAL_HasChanges(const AUDIOSIGNAL *signal)
{
    if (!signal) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    return signal->stamp != signal->reset_stamp ? 1 : 0;
}

int AUDIOSIGNAL_NotifyChange(AUDIOSIGNAL *signal, int what)
{
    if (!signal || !(what & (AUDIOSIGNAL_CHANGED_REGIONS | AUDIOSIGNAL_CHANGED_SAMPLES))) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    signal->stamp = next_stamp();
    if (what & AUDIOSIGNAL_CHANGED_REGIONS) signal->regions_stamp = signal->stamp;
    if (what & AUDIOSIGNAL_CHANGED_SAMPLES) signal->samples_stamp = signal->stamp;
    return 1;
}

int AUDIOSIGNAL_HasValidHash(const AUDIOSIGNAL *signal)
{
    if (!signal) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    return signal->hash_stamp != 0 && signal->hash_stamp == signal->stamp ? 1 : 0;
}

AUDIOSIGNAL_HASH *AUDIOSIGNAL_GetSignalHash(AUDIOSIGNAL_HASH *out, AUDIOSIGNAL *signal)
{
    if (!out || !signal) return nullptr;
    if (AUDIOSIGNAL_HasValidHash(signal)) {
        std::lock_guard<std::mutex> guard(signal->lock);
        *out = signal->hash;
        return out;
    }
    // Under shared access no edit runs, so the stamp read here is the
    // stamp of the samples hashed.
    std::shared_lock<std::shared_mutex> reader(signal->access);
    const uint64_t stamp = AUDIOSIGNAL_GetTimeStamp(signal, AUDIOSIGNAL_STAMP_CHANGES);
    AUDIOSIGNAL_HASH hash;
    if (!hash_samples(*signal, hash)) {
        set_last_error(AUDIO_ERROR_READ);
        return nullptr;
    }
    std::lock_guard<std::mutex> guard(signal->lock);
    signal->hash = hash;
    signal->hash_stamp = stamp;
    *out = hash;
    return out;
}

int64_t AUDIOSIGNAL_SizeInMemory(const AUDIOSIGNAL *signal)
{
    if (!signal) return 0;
    int64_t bytes = int64_t(sizeof(_audio_signal));
    std::lock_guard<std::mutex> guard(signal->lock);
    for (const _audio_blocks_list *list : signal->lists) bytes += list_memory_share(*list);
    return bytes;
}

int64_t AUDIOSIGNAL_SizeInDisk(const AUDIOSIGNAL *signal)
{
    return signal ? signal->file_size : 0;
}

int AUDIOSIGNAL_FreeDataMemory(AUDIOSIGNAL *signal)
{
    if (!signal) return 0;
    std::unique_lock<std::shared_mutex> writer(signal->access);
    std::unordered_map<const Chunk *, ChunkPtr> moved;
    std::vector<SegmentsPtr> result;
    bool complete = true;
    for (const SegmentsPtr &segments : all_segments(*signal)) {
        SegmentsBuilder builder;
        for (const Segment &s : segments->parts()) {
            if (!s.chunk->samples()) {
                builder.append(s);
                continue;
            }
            ChunkPtr &stored = moved[s.chunk.get()];
            if (!stored) stored = move_to_block_file(*s.chunk);
            if (!stored) complete = false;
            builder.append({stored ? stored : s.chunk, s.offset, s.length});
        }
        result.push_back(builder.build());
    }
    install_segments(*signal, result, false);
    return complete ? 1 : 0;
}

int AUDIOSIGNAL_SetParentObject(AUDIOSIGNAL *signal, void *parent, AUDIOSIGNAL_CALLBACK callback)
{
    if (!signal) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    signal->parent = parent;
    signal->callback = callback;
    return 1;
}

void *AUDIOSIGNAL_GetParentObject(const AUDIOSIGNAL *signal)
{
    if (!signal) return nullptr;
    std::lock_guard<std::mutex> guard(signal->lock);
    return signal->parent;
}

int AUDIOSIGNAL_EnableChannel(AUDIOSIGNAL *signal, int channel)
{
    if (!valid_channel(signal, channel)) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    const uint32_t bit = 1u << channel;
    if (signal->active_mask & bit) return 0;
    signal->active_mask |= bit;
    return 1;
}

int AUDIOSIGNAL_DisableChannel(AUDIOSIGNAL *signal, int channel)
{
    if (!valid_channel(signal, channel)) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    const uint32_t bit = 1u << channel;
    if (!(signal->active_mask & bit)) return 0;
    signal->active_mask &= ~bit;
    return 1;
}

int AUDIOSIGNAL_ChannelActive(const AUDIOSIGNAL *signal, int channel)
{
    return valid_channel(signal, channel) && (AUDIOSIGNAL_GetActiveChannelMask(signal) >> channel & 1u) ? 1 : 0;
}

int AUDIOSIGNAL_NumActiveChannels(const AUDIOSIGNAL *signal)
{
    return __builtin_popcount(AUDIOSIGNAL_GetActiveChannelMask(signal));
}

uint32_t AUDIOSIGNAL_GetActiveChannelMask(const AUDIOSIGNAL *signal)
{
    if (!signal) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    return signal->active_mask;
}

uint32_t AUDIOSIGNAL_GetDisabledChannelMask(const AUDIOSIGNAL *signal)
{
    if (!signal) return 0;
    std::lock_guard<std::mutex> guard(signal->lock);
    return ~signal->active_mask & all_channels_mask(signal->format.numChannels);
}

int AUDIOSIGNAL_TryReadAccess(AUDIOSIGNAL *signal)
{
    if (!signal || !signal->access.try_lock_shared()) return 0;
    ++signal->readers;
    return 1;
}

int AUDIOSIGNAL_ReleaseReadAccess(AUDIOSIGNAL *signal)
{
    if (!signal) return 0;
    int held = signal->readers.load();
    do {
        if (held <= 0) return 0;  // nothing taken: unlocking would break the lock
    } while (!signal->readers.compare_exchange_weak(held, held - 1));
    signal->access.unlock_shared();
    return 1;
}

}  // extern "C"
