// The signal record and the block-list handles behind the AUDIOSIGNAL_ calls.
#pragma once

#include <atomic>
#include <cstdint>
#include <memory>
#include <mutex>
#include <shared_mutex>
#include <string>
#include <vector>

#include "outside/signal/audiosignal.h"
#include "outside/signal/store/segments.hpp"

// One channel's sequence behind an AUDIOBLOCKSLIST handle.  A handle lives
// while a signal uses it or a saved state holds it (guarded by list_lock()).
struct AudioBlocksList {
    velmsig::SegmentsPtr segments;
    int holds = 0;
    bool in_use = false;
};

struct AudioSignal {
    // Guards the fields below against readers on other threads; held only
    // to copy or swap them, never while samples are read or written.
    mutable std::mutex lock;
    // Drawing holds it shared for a frame; edits and pipes hold it exclusive
    // while they work, so one writer at a time.
    std::shared_mutex access;
    std::atomic<int> readers{0};  // read accesses taken through the C API

    AUDIO_FORMAT format{};
    std::vector<AudioBlocksList *> lists;  // one per channel, all of one length
    uint32_t active_mask = 0;

    uint64_t stamp = 0;          // change stamp
    uint64_t reset_stamp = 0;    // stamp at the last ResetChanges
    uint64_t regions_stamp = 0;
    uint64_t file_time = 0;      // nanoseconds since the epoch
    uint64_t hash_stamp = 0;     // stamp the cached hash belongs to (0: none)
    AUDIOSIGNAL_HASH hash{};

    bool read_only = false;
    std::string file_name;
    std::string format_text;
    int64_t file_size = 0;

    void *parent = nullptr;
    AUDIOSIGNAL_CALLBACK callback = nullptr;
};

namespace velmsig {

// A process-wide, ever-growing stamp: every change gets a value never used before.
uint64_t next_stamp();

std::mutex &list_lock();
// A handle for a signal's new current list.
AudioBlocksList *adopt_list(SegmentsPtr segments);
// The signal stops using a list; it goes unless a saved state holds it.
void retire_list(AudioBlocksList *list);

// The list's share of sample memory, divided among the signal and the
// saved states holding it.
int64_t list_memory_share(const AudioBlocksList &list);

// Snapshots taken under the signal's lock.
SegmentsPtr channel_segments(const AudioSignal &signal, int channel);
std::vector<SegmentsPtr> all_segments(const AudioSignal &signal);
int64_t signal_length(const AudioSignal &signal);

// Installs new sequences (one per channel, null keeps the channel's list)
// and moves the change stamp unless only the storage changed.  The caller
// holds the signal exclusively.
void install_segments(AudioSignal &signal, const std::vector<SegmentsPtr> &segments,
                      bool samples_changed = true);

// A new signal record of the format with empty channels; null for a bad format.
AudioSignal *create_signal(const AUDIO_FORMAT &format);
bool valid_format(const AUDIO_FORMAT *format);
bool valid_channel(const AudioSignal *signal, int channel);
// The mask of every channel of a signal with this many channels.
uint32_t all_channels_mask(int channels);
// Clamps [begin, end) to the signal; swaps a reversed range.
void clamp_range(int64_t length, int64_t &begin, int64_t &end);

// Sets the library's last error (AUDIO_ERROR_*) and answers the failure value.
void set_error(int code);

// Asks the signal's parent object through its callback (0 without one).
int signal_callback(AudioSignal *signal, int code, void *data1, void *data2);

}  // namespace velmsig
