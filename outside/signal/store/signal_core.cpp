// Signal records, block-list handles and the helpers every signal call shares.
#include <algorithm>
#include <atomic>

#include "outside/signal/store/signal_internal.hpp"

_audio_signal::~_audio_signal()
{
    regions.reset();  // the set may still ask its host while it goes
    for (_audio_blocks_list *list : lists) velmsig::retire_list(list);
    AUDIOMETADATA_Destroy(metadata);
}

int _audio_signal::region_sample_rate() const
{
    return AUDIOSIGNAL_SampleRate(this);
}

int64_t _audio_signal::region_frames() const
{
    return velmsig::signal_length(*this);
}

int _audio_signal::region_request(uint32_t code, void *data1, void *data2)
{
    return velmsig::signal_callback(this, int(code), data1, data2);
}

void _audio_signal::regions_changed()
{
    AUDIOSIGNAL_NotifyChange(this, AUDIOSIGNAL_CHANGED_REGIONS);
}

namespace velmsig {

RegionSet *signal_regions(AUDIOSIGNAL *signal)
{
    if (!signal) return nullptr;
    if (!signal->regions) signal->regions = std::make_unique<RegionSet>(signal);
    return signal->regions.get();
}

uint64_t next_stamp()
{
    static std::atomic<uint64_t> counter{0};
    return ++counter;
}

std::mutex &list_lock()
{
    static std::mutex lock;
    return lock;
}

_audio_blocks_list *adopt_list(SegmentsPtr segments)
{
    auto *list = new _audio_blocks_list;
    list->segments = std::move(segments);
    list->in_use = true;
    return list;
}

void retire_list(_audio_blocks_list *list)
{
    std::lock_guard<std::mutex> guard(list_lock());
    list->in_use = false;
    if (list->holds == 0) delete list;
}

int64_t list_memory_share(const _audio_blocks_list &list)
{
    std::lock_guard<std::mutex> guard(list_lock());
    const int64_t holders = std::max(1, list.holds + (list.in_use ? 1 : 0));
    return (list.segments->memory_share() + list.segments->table_bytes()) / holders;
}

SegmentsPtr channel_segments(const _audio_signal &signal, int channel)
{
    std::lock_guard<std::mutex> guard(signal.lock);
    return signal.lists[size_t(channel)]->segments;
}

std::vector<SegmentsPtr> all_segments(const _audio_signal &signal)
{
    std::lock_guard<std::mutex> guard(signal.lock);
    std::vector<SegmentsPtr> result;
    for (const _audio_blocks_list *list : signal.lists) result.push_back(list->segments);
    return result;
}

int64_t signal_length(const _audio_signal &signal)
{
    std::lock_guard<std::mutex> guard(signal.lock);
    return signal.lists.empty() ? 0 : signal.lists[0]->segments->length();
}

void install_segments(_audio_signal &signal, const std::vector<SegmentsPtr> &segments, bool samples_changed)
{
    std::vector<_audio_blocks_list *> retired;
    {
        std::lock_guard<std::mutex> guard(signal.lock);
        for (size_t c = 0; c < segments.size() && c < signal.lists.size(); ++c) {
            if (!segments[c]) continue;
            retired.push_back(signal.lists[c]);
            signal.lists[c] = adopt_list(segments[c]);
        }
        if (samples_changed) signal.stamp = signal.samples_stamp = next_stamp();
    }
    for (_audio_blocks_list *list : retired) retire_list(list);
}

bool valid_format(const AUDIO_FORMAT *format)
{
    return format && format->sampleRate > 0 && format->numChannels > 0 &&
           format->numChannels <= AUDIOSIGNAL_MAX_CHANNELS;
}

bool valid_channel(const _audio_signal *signal, int channel)
{
    return signal && channel >= 0 && channel < signal->format.numChannels;
}

uint32_t all_channels_mask(int channels)
{
    return channels >= 32 ? 0xFFFFFFFFu : (1u << channels) - 1u;
}

_audio_signal *create_signal(const AUDIO_FORMAT &format)
{
    if (!valid_format(&format)) return nullptr;
    auto *signal = new _audio_signal;
    signal->format = format;
    auto empty = std::make_shared<const Segments>();
    for (int c = 0; c < format.numChannels; ++c) signal->lists.push_back(adopt_list(empty));
    signal->active_mask = all_channels_mask(format.numChannels);
    signal->stamp = next_stamp();
    signal->reset_stamp = signal->stamp;
    signal->regions_stamp = signal->samples_stamp = signal->stamp;
    return signal;
}

void clamp_range(int64_t length, int64_t &begin, int64_t &end)
{
    if (begin > end) std::swap(begin, end);
    begin = std::clamp<int64_t>(begin, 0, length);
    end = std::clamp<int64_t>(end, 0, length);
}

int signal_callback(_audio_signal *signal, int code, void *data1, void *data2)
{
    AUDIOSIGNAL_CALLBACK callback;
    void *parent;
    {
        std::lock_guard<std::mutex> guard(signal->lock);
        callback = signal->callback;
        parent = signal->parent;
    }
    return callback ? callback(parent, code, data1, data2) : 0;
}

}  // namespace velmsig
