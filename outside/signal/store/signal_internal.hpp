// The signal record and the block-list handles behind the AUDIOSIGNAL_ calls.
#pragma once

#include <atomic>
#include <cstdint>
#include <memory>
#include <mutex>
#include <shared_mutex>
#include <string>
#include <vector>

#include "outside/signal/audiometadata.h"
#include "outside/signal/audiosignal.h"
#include "outside/signal/file/lasterror_internal.hpp"
#include "outside/signal/region/region_internal.hpp"
#include "outside/signal/store/segments.hpp"

// One channel's sequence behind an AUDIOBLOCKSLIST handle.  A handle lives
// while a signal uses it or a saved state holds it (guarded by list_lock()).
struct _audio_blocks_list {
    velmsig::SegmentsPtr segments;
    int holds = 0;
    bool in_use = false;
};

// The signal is its region set's host: regions ask it for rate, length and
// the parent object's answers.
struct _audio_signal final : velmsig::RegionHost {
    _audio_signal() = default;
    ~_audio_signal() override;
    _audio_signal(const _audio_signal &) = delete;
    _audio_signal &operator=(const _audio_signal &) = delete;

    AUDIOSIGNAL *region_signal() override { return this; }
    int region_sample_rate() const override;
    int64_t region_frames() const override;
    int region_request(uint32_t code, void *data1, void *data2) override;
    void regions_changed() override;

    // Guards the fields below against readers on other threads; held only
    // to copy or swap them, never while samples are read or written.
    mutable std::mutex lock;
    // Drawing holds it shared for a frame; edits and pipes hold it exclusive
    // while they work, so one writer at a time.
    std::shared_mutex access;
    std::atomic<int> readers{0};  // read accesses taken through the C API

    AUDIO_FORMAT format{};
    std::vector<_audio_blocks_list *> lists;  // one per channel, all of one length
    uint32_t active_mask = 0;

    uint64_t stamp = 0;          // change stamp
    uint64_t reset_stamp = 0;    // stamp at the last ResetChanges
    uint64_t regions_stamp = 0;
    uint64_t samples_stamp = 0;  // stamp of the last change of samples or format
    uint64_t file_time = 0;      // nanoseconds since the epoch
    uint64_t hash_stamp = 0;     // stamp the cached hash belongs to (0: none)
    AUDIOSIGNAL_HASH hash{};

    bool read_only = false;
    std::string file_name;
    std::string format_text;
    int64_t file_size = 0;
    AUDIOMETADATA *metadata = nullptr;

    // Made on first use; edits move the regions through its hooks.  Region
    // calls run on the document's thread, like the edits that move them.
    std::unique_ptr<velmsig::RegionSet> regions;

    void *parent = nullptr;
    AUDIOSIGNAL_CALLBACK callback = nullptr;
};

namespace velmsig {

// The longest signal that silence may grow (about 18 days at 44.1 kHz).
constexpr int64_t kMaxSilenceFrames = int64_t(1) << 36;

// A process-wide, ever-growing stamp: every change gets a value never used before.
uint64_t next_stamp();

std::mutex &list_lock();
// A handle for a signal's new current list.
_audio_blocks_list *adopt_list(SegmentsPtr segments);
// The signal stops using a list; it goes unless a saved state holds it.
void retire_list(_audio_blocks_list *list);

// The list's share of sample memory, divided among the signal and the
// saved states holding it.
int64_t list_memory_share(const _audio_blocks_list &list);

// Snapshots taken under the signal's lock.
SegmentsPtr channel_segments(const _audio_signal &signal, int channel);
std::vector<SegmentsPtr> all_segments(const _audio_signal &signal);
int64_t signal_length(const _audio_signal &signal);

// Installs new sequences (one per channel, null keeps the channel's list)
// and moves the change stamp unless only the storage changed.  The caller
// holds the signal exclusively.
void install_segments(_audio_signal &signal, const std::vector<SegmentsPtr> &segments,
                      bool samples_changed = true);

// A new signal record of the format with empty channels; null for a bad format.
_audio_signal *create_signal(const AUDIO_FORMAT &format);
bool valid_format(const AUDIO_FORMAT *format);
bool valid_channel(const _audio_signal *signal, int channel);
// The mask of every channel of a signal with this many channels.
uint32_t all_channels_mask(int channels);
// Clamps [begin, end) to the signal; swaps a reversed range.
void clamp_range(int64_t length, int64_t &begin, int64_t &end);

// Asks the signal's parent object through its callback (0 without one).
int signal_callback(_audio_signal *signal, int code, void *data1, void *data2);

}  // namespace velmsig
