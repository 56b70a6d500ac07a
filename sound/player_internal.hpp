// The player record, shared by the player's files.  Private to the library.
#ifndef VELM_PLAYER_INTERNAL_HPP
#define VELM_PLAYER_INTERNAL_HPP

#include <array>
#include <cstdint>
#include <mutex>
#include <utility>
#include <vector>

#include "core/velmtimer.h"
#include "outside/base/blbase.h"
#include "outside/signal/audiofx.h"
#include "outside/signal/audiosignal.h"
#include "sound/velmplay.h"
#include "sound/velmsound.h"

namespace velm::play {

constexpr int kGainChannels = AUDIO_GAIN_CHANNELS;
constexpr int64_t kEmptyRangeBegin = 0x07FFFFFFFFFFFFFFLL;

// One stage of the audio path: the source, the effect or the conversion.
// Its buffer holds five seconds of its format so that the device thread
// never allocates while it plays.
struct Stage {
    bool valid = false;
    AUDIOFX *effect = nullptr; // null: the stage passes samples through
    _audio_format format{};    // what the stage holds
    _audio_format input{};     // what its effect takes (the conversion stage)
    std::vector<float> buffer;
    int64_t fill = 0;          // samples waiting
    Stage *next = nullptr;

    void reserve();            // grows the buffer to five seconds of the format
    int channels() const { return format.numChannels > 0 ? format.numChannels : 1; }
};

struct Block {
    int64_t begin, end, current;
    uint32_t flags;
    Block *next;
};

// What the device thread may know of the document.  The shell's thread
// copies it under the lock at the start and at every update, so the reader
// never walks the document's lists while the shell edits them.
struct DocumentView {
    bool visible = false;
    bool selecting = false;
    bool movingCursor = false;
    int64_t viewBegin = 0, viewEnd = 0;
    int64_t limitBegin = 0, limitEnd = 0;
    std::vector<std::pair<int64_t, int64_t>> chunks; // the selections, ascending
    int64_t cursorMove = -1;  // where the user put the cursor, not yet followed
};

// Where the sound heard takes a new course: from `frames` delivered on, the
// position is basePosition + (frames - baseFrames) x speed.  The reader
// queues one at each jump or speed change; the position takes them in
// order as the device gets there.
struct JumpMark {
    int64_t frames;
    int64_t basePosition;
    int64_t baseFrames;
    float speed;
};

// Jumps read but not yet heard.  A full queue merges the newest into the
// last mark, so the display then moves a little early rather than wrong.
class JumpMarks {
public:
    void clear() { count_ = first_ = 0; }
    bool empty() const { return count_ == 0; }
    const JumpMark &front() const { return marks_[first_]; }
    void pop()
    {
        first_ = (first_ + 1) % marks_.size();
        --count_;
    }
    void push(const JumpMark &mark)
    {
        if (count_ == marks_.size()) {
            JumpMark &newest = marks_[(first_ + count_ - 1) % marks_.size()];
            newest = JumpMark{newest.frames, mark.basePosition, mark.baseFrames, mark.speed};
            return;
        }
        marks_[(first_ + count_++) % marks_.size()] = mark;
    }

private:
    std::array<JumpMark, 64> marks_{};
    size_t first_ = 0, count_ = 0;
};

using FillFunction = int64_t (*)(struct Player *, float *destination, int64_t frames);

struct Player {
    BLMEM memory = nullptr;  // "VELMPLAYER MemSpace": the block records
    std::mutex lock;         // what the device thread shares with callers
    bool moveCursorOnStop = false;
    bool loopOnSelection = false;
    bool followCursor = true;
    double deviceBufferTime = 0.05;
    VELMAUDIO doc = nullptr;
    AUDIO_FILE *file = nullptr;
    Stage source, effect, conversion;
    Stage *last = &source;
    int status = VELMPLAY_STATUS_CREATED;
    uint32_t flags = 0;
    int stopMode = 0;
    uint32_t channelMask = 0;
    double masterGain = 1.0;
    double targetGains[kGainChannels];
    double currentGains[kGainChannels];
    VELMSOUNDDEVICE device = nullptr;
    VELMSOUNDSTREAM stream = nullptr;
    _audio_format outputFormat{};
    FillFunction fill = nullptr;
    VELMTIMER updateTimer = nullptr;
    bool updateBusy = false;
    VELMPLAY_UpdateCallback updateCallback = nullptr;
    void *updateUser = nullptr;
    int64_t cursorAtStart = 0;
    int64_t basePosition = 0;
    Block *blocks = nullptr, *blockTail = nullptr, *freeBlocks = nullptr;
    int64_t readPosition = 0;
    int64_t pendingJump = -1;
    int64_t rangeEnd = 0, rangeBegin = kEmptyRangeBegin;
    int64_t playCursor = 0;
    int64_t requestedPosition = -1;
    bool playingRegion = false;
    int64_t regionBegin = 0, regionEnd = 0;
    int64_t framesDelivered = 0;
    JumpMarks jumpMarks;
    int64_t baseFrames = 0;
    int64_t framesAtChange = 0;
    float displaySpeed = 1.0f, currentSpeed = 1.0f, requestedSpeed = 1.0f;
    DocumentView view;

    Player();
    bool fixedRange() const { return (flags & VELMPLAY_FIXED_RANGE) != 0; }
    bool announces() const { return doc && !(flags & VELMPLAY_SILENT); }
    bool notifies() const { return doc && !(flags & (VELMPLAY_SILENT | VELMPLAY_NO_NOTIFY)); }
    bool movesCursors() const { return doc && !(flags & VELMPLAY_KEEP_CURSORS); }
};

inline Player *from_handle(VELMPLAYER handle)
{
    return reinterpret_cast<Player *>(handle);
}

inline VELMPLAYER to_handle(Player *player)
{
    return reinterpret_cast<VELMPLAYER>(player);
}

// A live (created and not yet destroyed) player, or null.
Player *live(VELMPLAYER handle);

// Sends a player event to the document's dispatcher; 1 without a document.
int announce(Player *p, uint32_t event, void *data1, void *data2);

// Destroys every live player that reads from doc (the document is going).
void destroy_players_of(VELMAUDIO doc);
// Sets doc's signal while no device thread reads from the document.
void replace_signal(VELMAUDIO doc, AUDIOSIGNAL *signal);

// Audio path (player_path.cpp).
// Whether a stage may hold this format: five seconds of it stay well under
// a hundred megabytes.
bool stage_format_fits(const _audio_format &format);
void rebuild_path(Player *p);
void destroy_path(Player *p);
int32_t buffer_callback(void *user, void *buffer, int32_t bytes);

// Readers (player_readers.cpp).
int64_t signal_reader(Player *p, float *destination, int64_t frames);
int64_t block_reader(Player *p, float *destination, int64_t frames);
int64_t file_reader(Player *p, float *destination, int64_t frames);
// Copies the document's view, selections and cursor moves for the reader.
void refresh_view(Player *p);
// Where playback starts when nothing fixes it, from the document's state.
int64_t start_position(Player *p);

// Position and update (player_position.cpp).
// The document sample being heard, within the range played.
int64_t position(Player *p);
int update(Player *p, bool *destroyed);
int update_callback(void *user);
bool start_update_timer(Player *p);
void kill_update_timer(Player *p);

} // namespace velm::play

#endif
