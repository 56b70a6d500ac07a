// The audio path from the source to the device: the source stage, the
// optional effect and format-conversion stages, the gains and the device
// buffer callback.
#include <algorithm>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <string>

#include "sound/player_internal.hpp"

namespace velm::play {

namespace {

bool same_shape(const _audio_format &a, const _audio_format &b)
{
    return a.sampleRate == b.sampleRate && a.numChannels == b.numChannels;
}

void drop_effect(Stage &stage)
{
    if (stage.effect) AUDIOFX_DestroyPath(stage.effect);
    stage.effect = nullptr;
    stage.valid = false;
    stage.fill = 0;
}

int64_t room_of(const Stage &stage)
{
    return (static_cast<int64_t>(stage.buffer.size()) - stage.fill) / stage.channels();
}

// Runs the samples waiting in one stage through the next stage's effect.
void pass_down(Stage &from, Stage &to)
{
    const int64_t frames = from.fill / from.channels();
    const int64_t made = AUDIOFX_ProcessSamples(to.effect, from.buffer.data(), frames,
                                                to.buffer.data() + to.fill, room_of(to));
    from.fill = 0;
    if (made > 0) to.fill += made * to.channels();
}

// Makes sure the conversion stage turns `input` into the device format.
void place_conversion(Player *p, const _audio_format &input)
{
    Stage &c = p->conversion;
    if (c.effect && same_shape(c.input, input)) return;
    drop_effect(c);
    c.effect = AUDIOFX_CreatePathEx(input, -1, -1, "fmtconv[sr=%d,nc=%d]", p->outputFormat.sampleRate,
                                    p->outputFormat.numChannels);
    c.input = input;
    if (c.effect) c.format = AUDIOFX_GetOutputFormat(c.effect);
}

} // namespace

bool stage_format_fits(const _audio_format &format)
{
    constexpr int64_t kMostSamplesPerSecond = 384000 * 8;
    return format.sampleRate > 0 && format.numChannels > 0 &&
           static_cast<int64_t>(format.sampleRate) * format.numChannels <= kMostSamplesPerSecond;
}

void Stage::reserve()
{
    const int64_t capacity = static_cast<int64_t>(format.sampleRate) * 5000 * channels() / 1000;
    if (capacity > static_cast<int64_t>(buffer.size())) buffer.resize(static_cast<size_t>(capacity));
}

void rebuild_path(Player *p)
{
    Stage *end = &p->source;
    p->source.valid = true;
    _audio_format format = p->source.format;
    if (p->effect.valid && p->effect.effect) {
        end->next = &p->effect;
        end = &p->effect;
        format = p->effect.format;
    }
    if (p->outputFormat.numChannels > 0 && !same_shape(p->outputFormat, format)) {
        place_conversion(p, format);
        p->conversion.valid = p->conversion.effect != nullptr;
        if (p->conversion.valid) {
            end->next = &p->conversion;
            end = &p->conversion;
        }
    } else {
        drop_effect(p->conversion);
    }
    end->next = nullptr;
    p->last = end;
    for (Stage *s = &p->source; s; s = s->next) s->reserve();
}

void destroy_path(Player *p)
{
    drop_effect(p->effect);
    drop_effect(p->conversion);
}

int32_t buffer_callback(void *user, void *buffer, int32_t bytes)
{
    auto *p = static_cast<Player *>(user);
    if (!p || !buffer || bytes <= 0) return 0;
    std::memset(buffer, 0, static_cast<size_t>(bytes));
    const int64_t device_frames = AUDIO_SamplesSize16(&p->outputFormat, bytes);
    if (device_frames <= 0) return 0;
    const int64_t needed = device_frames * p->outputFormat.numChannels;

    std::lock_guard guard(p->lock);
    Stage &source = p->source;
    Stage *last = p->last;
    int64_t frames = device_frames;
    while (last->fill < needed && frames > 0) {
        const int64_t want = std::min(frames, room_of(source));
        const int64_t got = want > 0 ? p->fill(p, source.buffer.data() + source.fill, want) : 0;
        if (got <= 0) {
            if (source.fill == 0 && last->fill == 0) return 0; // the stream has ended
            break;
        }
        float *fresh = source.buffer.data() + source.fill;
        p->framesDelivered += got;
        AUDIO_ChangeGainsWidthFade(fresh, got, p->targetGains, p->currentGains, 20.0 / source.format.sampleRate,
                                   source.channels());
        source.fill += got * source.channels();
        for (Stage *s = &source; s->next; s = s->next) pass_down(*s, *s->next);
        frames -= got;
    }
    const int64_t out = std::min(needed, last->fill);
    AUDIO_IEEEFloatToWord16(last->buffer.data(), static_cast<int16_t *>(buffer), static_cast<int>(out));
    BLMEM_OverlapMemCopy(last->buffer.data(), last->buffer.data() + out,
                         static_cast<size_t>(last->fill - out) * sizeof(float));
    last->fill -= out;
    return static_cast<int32_t>(needed * 2);
}

} // namespace velm::play

using namespace velm::play;

int VELMPLAY_ChangeEffect(VELMPLAYER handle, const char *format, ...)
{
    Player *p = live(handle);
    if (!p || !format) return 0;
    std::string text(4096, '\0');
    for (;;) {
        va_list args;
        va_start(args, format);
        const int n = std::vsnprintf(text.data(), text.size(), format, args);
        va_end(args);
        if (n < 0) return 0;
        if (static_cast<size_t>(n) < text.size()) {
            text.resize(static_cast<size_t>(n));
            break;
        }
        text.resize(text.size() * 2);
    }
    std::lock_guard guard(p->lock);
    Stage &e = p->effect;
    if (e.effect) {
        if (!AUDIOFX_ReconfigurePath(e.effect, "%s", text.c_str())) return 0;
    } else {
        e.effect = AUDIOFX_CreatePathEx(p->source.format, -1, -1, "%s", text.c_str());
        if (!e.effect) return 0;
    }
    const _audio_format produced = AUDIOFX_GetOutputFormat(e.effect);
    if (!stage_format_fits(produced)) {
        // Back to no effect rather than a path the player cannot hold.
        AUDIOFX_DestroyPath(e.effect);
        e = Stage{};
        rebuild_path(p);
        return 0;
    }
    // Samples already made in another shape would be misread: drop them.
    if (!same_shape(produced, e.format)) {
        e.fill = 0;
        p->conversion.fill = 0;
    }
    e.format = produced;
    e.valid = true;
    rebuild_path(p);
    return 1;
}
