// The player record: creation, destruction, the live set, gains, speed and
// the simple queries.
#include <algorithm>
#include <cmath>
#include <mutex>
#include <vector>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "outside/signal/audiosignal.h"
#include "sound/player_internal.hpp"
#include "sound/sound_internal.hpp"

namespace velm::play {

namespace {

// Players not yet destroyed, so that a handle can be checked before it is
// used and a closing document can take its players with it.
std::mutex live_lock;
std::vector<Player *> live_players;

void add_live(Player *p)
{
    std::lock_guard guard(live_lock);
    live_players.push_back(p);
}

void remove_live(Player *p)
{
    std::lock_guard guard(live_lock);
    std::erase(live_players, p);
}

int dispose_player(void *object)
{
    return VELMPLAY_DestroyPlayer(static_cast<VELMPLAYER>(object));
}


void read_settings(Player *p)
{
    p->moveCursorOnStop = BLSETTINGS_GetIntEx(nullptr, "libvelm.playback.movecursoronstop=[%d]", 0) != 0;
    p->deviceBufferTime = velmsound::BufferTimeSetting("libvelm.playback.osbuffersize=[%f]");
    p->loopOnSelection = BLSETTINGS_GetIntEx(nullptr, "libvelm.playback.looponaudioselection=[%d]", 0) != 0;
    p->followCursor = BLSETTINGS_GetIntEx(nullptr, "libvelm.playback.followcursor=[%d]", 1) != 0;
}

Player *create(VELMAUDIO doc, AUDIO_FILE *file, const _audio_format &format, uint32_t flags)
{
    auto *p = new Player;
    p->memory = BLMEM_CreateMemDescrEx("VELMPLAYER MemSpace", 1024, 0);
    read_settings(p);
    p->doc = doc;
    p->file = file;
    p->source.format = format;
    p->flags = flags;
    const uint32_t mode = flags & VELMPLAY_MODE_MASK;
    p->stopMode = mode == VELMPLAY_MODE_FROM_VIEW ? 1 : mode == VELMPLAY_MODE_LIMITS ? 2 : 0;
    p->channelMask = doc ? VELMAUDIO_ActiveChannelsMask(doc) : 0;
    p->fill = doc ? signal_reader : file_reader;
    p->updateCallback = update_callback;
    p->updateUser = p;
    rebuild_path(p);
    add_live(p);
    RegisterObject(p, 0, dispose_player);
    return p;
}

} // namespace

Player::Player()
{
    std::fill(std::begin(targetGains), std::end(targetGains), 1.0);
    std::fill(std::begin(currentGains), std::end(currentGains), 1.0);
}

Player *live(VELMPLAYER handle)
{
    if (!handle) return nullptr;
    std::lock_guard guard(live_lock);
    Player *p = from_handle(handle);
    return std::find(live_players.begin(), live_players.end(), p) != live_players.end() ? p : nullptr;
}

int announce(Player *p, uint32_t event, void *data1, void *data2)
{
    return p->doc ? BLNOTIFY_SendEvent(p->doc->dispatcher, nullptr, 0, event, data1, data2) : 1;
}

void destroy_players_of(VELMAUDIO doc)
{
    for (;;) {
        Player *found = nullptr;
        {
            std::lock_guard guard(live_lock);
            for (Player *p : live_players)
                if (p->doc == doc) found = p;
        }
        if (!found) return;
        VELMPLAY_DestroyPlayer(to_handle(found));
    }
}

void replace_signal(VELMAUDIO doc, AUDIOSIGNAL *signal)
{
    std::lock_guard guard(live_lock);
    std::vector<std::unique_lock<std::mutex>> readers;
    for (Player *p : live_players)
        if (p->doc == doc) readers.emplace_back(p->lock);
    doc->signal = signal;
}

} // namespace velm::play

using namespace velm::play;

int VELMPLAY_Initialize(void)
{
    const int ok = VELMSOUND_Initialize();
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.playback.movecursoronstop=%d", 0);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.playback.looponaudioselection=%d", 0);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.playback.followcursor=%d", 1);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.playback.osbuffersize=%f", 0.05);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.playback.channelgainfadetime=[%f]", 0.1);
    return ok;
}

void VELMPLAY_Finalize(void)
{
    VELMSOUND_Finalize();
}

VELMPLAYER VELMPLAY_CreatePlayer(VELMAUDIO doc, uint32_t flags)
{
    if (!doc || !doc->signal) return nullptr;
    _audio_format format{};
    if (!AUDIOSIGNAL_GetActiveFormat(doc->signal, &format) || !stage_format_fits(format)) return nullptr;
    return to_handle(create(doc, nullptr, format, flags));
}

VELMPLAYER VELMPLAY_CreateFilePlayer(const char *file_name, const char *format_text, uint32_t flags)
{
    if (!file_name || !format_text) return nullptr;
    AUDIO_FILE *file = AUDIO_LoadFile(file_name, format_text);
    if (!file) return nullptr;
    const _audio_format format = AUDIO_GetAudioFileFormat(file);
    if (!AUDIO_IsValidFormat(&format) || !stage_format_fits(format)) {
        AUDIO_CloseFile(file);
        return nullptr;
    }
    return to_handle(create(nullptr, file, format, flags));
}

int VELMPLAY_DestroyPlayer(VELMPLAYER handle)
{
    Player *p = live(handle);
    if (!p) return 0;
    kill_update_timer(p);
    // Out of the live set first: nothing reached from here may use it again.
    remove_live(p);
    UnRegisterObject(p);
    if (p->doc) VELMAUDIO_UnlinkPlayer(p->doc, handle);
    if (p->movesCursors()) {
        if (p->status == VELMPLAY_STATUS_PLAYING && p->moveCursorOnStop &&
            VELMAUDIO_GetCursorPosition(p->doc) == p->cursorAtStart)
            VELMAUDIO_SetCursorPosition(p->doc, 0);
        VELMAUDIO_HidePlayCursor(p->doc);
    }
    if (p->stream && VELMSOUND_IsPlaying(p->stream)) VELMSOUND_Stop(p->stream);
    if (p->notifies()) announce(p, VELMPLAY_NOTIFY_DESTROYED, handle, nullptr);
    // Closing the stream ends the device thread: nothing calls back after
    // it, so only then may the file it reads from go.
    const int closed = p->stream ? VELMSOUND_Close(p->stream) : 0;
    p->stream = nullptr;
    if (p->file) AUDIO_CloseFile(p->file);
    p->status = VELMPLAY_STATUS_CLOSED;
    destroy_path(p);
    BLMEM_DisposeMemDescr(p->memory);
    delete p;
    return closed;
}

int VELMPLAY_IsPlaying(VELMPLAYER handle)
{
    Player *p = live(handle);
    if (!p) return 0;
    return p->status == VELMPLAY_STATUS_OPENED || VELMSOUND_IsPlaying(p->stream);
}

int VELMPLAY_IsPaused(VELMPLAYER handle)
{
    Player *p = live(handle);
    return p && p->status == VELMPLAY_STATUS_OPENED;
}

int VELMPLAY_GetStatus(VELMPLAYER handle)
{
    Player *p = live(handle);
    return p ? p->status : 0;
}

int VELMPLAY_ChangeSpeed(VELMPLAYER handle, float speed)
{
    Player *p = live(handle);
    if (!p || !std::isfinite(speed)) return 0;
    float whole = std::trunc(speed);
    whole = speed >= 0.0f ? std::clamp(whole, 1.0f, 32.0f) : std::clamp(whole, -32.0f, -1.0f);
    std::lock_guard guard(p->lock);
    p->requestedSpeed = whole;
    return 1;
}

float VELMPLAY_GetSpeed(VELMPLAYER handle)
{
    Player *p = live(handle);
    if (!p) return 0.0f;
    std::lock_guard guard(p->lock);
    return p->currentSpeed;
}

int VELMPLAY_SetMasterGain(VELMPLAYER handle, double gain)
{
    Player *p = live(handle);
    if (!p || !std::isfinite(gain)) return 0;
    std::lock_guard guard(p->lock);
    p->masterGain = gain;
    std::fill(std::begin(p->targetGains), std::end(p->targetGains), gain);
    if (p->status != VELMPLAY_STATUS_PLAYING)
        std::fill(std::begin(p->currentGains), std::end(p->currentGains), gain);
    return 1;
}

int VELMPLAY_SetChannelGain(VELMPLAYER handle, int channel, double gain)
{
    Player *p = live(handle);
    if (!p || channel < 0 || channel >= kGainChannels || !std::isfinite(gain)) return 0;
    std::lock_guard guard(p->lock);
    p->targetGains[channel] = std::min(gain, p->masterGain);
    return 1;
}

double VELMPLAY_GetChannelGain(VELMPLAYER handle, int channel)
{
    Player *p = live(handle);
    if (!p || !p->doc || channel < 0 || channel >= kGainChannels) return 0.0;
    std::lock_guard guard(p->lock);
    return p->targetGains[channel];
}

int VELMPLAY_SetGUITimer(VELMPLAYER handle, VELMPLAY_UpdateCallback callback, void *user)
{
    Player *p = live(handle);
    if (!p || p->updateTimer) return 0;
    p->updateCallback = callback;
    p->updateUser = user;
    return 1;
}

int VELMPLAY_SetChannelMask(VELMPLAYER, uint32_t)
{
    BLDEBUG_Error(-1, "VELMPLAY_SetChannelMask: Channel mask change no longer supported!");
    return 0;
}

_audio_format VELMPLAY_GetInputFormat(VELMPLAYER handle)
{
    Player *p = live(handle);
    return p ? p->source.format : AUDIO_NullFormat();
}

_audio_format VELMPLAY_GetOutputFormat(VELMPLAYER handle)
{
    Player *p = live(handle);
    if (!p) return AUDIO_NullFormat();
    std::lock_guard guard(p->lock);
    return p->last->format;
}
