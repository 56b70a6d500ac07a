// Edits as operations on block lists: untouched chunks are shared, new
// samples are made only for the frames an edit computes.
#include <algorithm>
#include <cmath>
#include <vector>

#include "outside/signal/store/signal_internal.hpp"

using namespace velmsig;

namespace {

// One edit under the signal's exclusive access: reads the current lists,
// collects the new ones and installs them all at once, so a failed edit
// leaves the signal untouched.
class Edit {
public:
    explicit Edit(_audio_signal &signal)
        : signal_(signal), writer_(signal.access), current_(all_segments(signal)), next_(current_.size()),
          mask_(AUDIOSIGNAL_GetActiveChannelMask(&signal))
    {
    }

    int64_t length() const { return current_.empty() ? 0 : current_[0]->length(); }
    int channels() const { return int(current_.size()); }
    bool active(int channel) const { return mask_ >> channel & 1u; }
    int active_count() const { return __builtin_popcount(mask_); }
    const Segments &current(int channel) const { return *current_[size_t(channel)]; }
    void set(int channel, SegmentsPtr segments) { next_[size_t(channel)] = std::move(segments); }
    // Timeline moves the regions follow once the edit is in place.
    void removed(int64_t at, int64_t frames) { moves_.push_back({at, -frames}); }
    void inserted(int64_t at, int64_t frames) { moves_.push_back({at, frames}); }

    // Pads every channel shorter than the longest with silence at its end,
    // then installs the new lists and moves the change stamp.
    void commit()
    {
        int64_t longest = 0;
        for (size_t c = 0; c < next_.size(); ++c) longest = std::max(longest, result(c).length());
        for (size_t c = 0; c < next_.size(); ++c) {
            if (result(c).length() == longest) continue;
            SegmentsBuilder builder;
            builder.append_range(result(c), 0, longest);
            builder.append_silence(longest - result(c).length());
            next_[c] = builder.build();
        }
        install_segments(signal_, next_);
        if (!signal_.regions) return;
        for (const auto &[at, frames] : moves_) {
            if (frames < 0) signal_.regions->on_remove(at, -frames);
            if (frames > 0) signal_.regions->on_insert(at, frames);
        }
    }

private:
    const Segments &result(size_t c) const { return next_[c] ? *next_[c] : *current_[c]; }

    _audio_signal &signal_;
    std::unique_lock<std::shared_mutex> writer_;
    std::vector<SegmentsPtr> current_;
    std::vector<SegmentsPtr> next_;
    uint32_t mask_;
    std::vector<std::pair<int64_t, int64_t>> moves_;
};

// [0, begin) + middle + [end, length) of one channel.
template <typename Middle>
SegmentsPtr splice(const Segments &source, int64_t begin, int64_t end, Middle middle)
{
    SegmentsBuilder builder;
    builder.append_range(source, 0, begin);
    if (!middle(builder)) return nullptr;
    builder.append_range(source, end, source.length());
    return builder.build();
}

// Appends count new samples made piece by piece: make(at, n, out) fills the
// n samples from offset at (pieces of at most one chunk).
template <typename Make>
bool append_made(SegmentsBuilder &builder, int64_t count, Make make)
{
    std::vector<float> piece(size_t(std::min(count, kChunkFrames)));
    for (int64_t at = 0; at < count; at += kChunkFrames) {
        const int64_t n = std::min(kChunkFrames, count - at);
        if (!make(at, n, piece.data())) return false;
        builder.append_samples(piece.data(), n);
    }
    return true;
}

bool bad_argument()
{
    set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
    return false;
}

// Gives every active channel the sequence make(channel, index) builds (index
// counts the active channels); a null sequence is a read error that drops
// the whole edit.
template <typename Make>
bool edit_active(Edit &edit, Make make)
{
    int index = 0;
    for (int c = 0; c < edit.channels(); ++c) {
        if (!edit.active(c)) continue;
        SegmentsPtr next = make(c, index++);
        if (!next) {
            set_last_error(AUDIO_ERROR_READ);
            return false;
        }
        edit.set(c, std::move(next));
    }
    return true;
}

// The source channel that feeds the i-th active channel of the target.
int source_channel(int active_index, int source_channels)
{
    return active_index % source_channels;
}

bool paste(_audio_signal &signal, const _audio_signal &source, int64_t begin, int64_t end, int64_t *length)
{
    const std::vector<SegmentsPtr> pasted = all_segments(source);
    Edit edit(signal);
    if (edit.active_count() == 0 || pasted.empty()) return bad_argument();
    clamp_range(edit.length(), begin, end);
    edit_active(edit, [&](int c, int index) {
        const Segments &from = *pasted[size_t(source_channel(index, int(pasted.size())))];
        return splice(edit.current(c), begin, end, [&](SegmentsBuilder &b) {
            b.append_range(from, 0, from.length());
            return true;
        });
    });
    edit.removed(begin, end - begin);
    edit.inserted(begin, pasted[0]->length());
    edit.commit();
    if (length) *length = pasted[0]->length();
    return true;
}

// A new signal of the channels in mask over [begin, end) (clamped).
_audio_signal *copy_range(_audio_signal &signal, uint32_t mask, int64_t begin, int64_t end)
{
    const std::vector<SegmentsPtr> segments = all_segments(signal);
    AUDIO_FORMAT format;
    AUDIOSIGNAL_GetFormat(&signal, &format);
    format.numChannels = int16_t(__builtin_popcount(mask & all_channels_mask(format.numChannels)));
    _audio_signal *copy = create_signal(format);
    if (!copy) return nullptr;
    clamp_range(segments[0]->length(), begin, end);
    std::vector<SegmentsPtr> parts;
    for (size_t c = 0; c < segments.size(); ++c) {
        if (!(mask >> c & 1u)) continue;
        SegmentsBuilder builder;
        builder.append_range(*segments[c], begin, end);
        parts.push_back(builder.build());
    }
    install_segments(*copy, parts);
    return copy;
}

// Puts a finished piece into result: it becomes the result when result is
// null, else it is pasted at result's end and dropped.
AUDIOSIGNAL *deliver(_audio_signal *piece, AUDIOSIGNAL *result)
{
    if (!piece || !result) return piece;
    const bool ok = paste(*result, *piece, AUDIOSIGNAL_END, AUDIOSIGNAL_END, nullptr);
    AUDIOSIGNAL_Destroy(piece);
    return ok ? result : nullptr;
}

uint32_t copy_mask(_audio_signal &signal, int flags)
{
    const bool all = (flags & AUDIOSIGNAL_COPY_OPTION) && (flags & AUDIOSIGNAL_COPY_ALLCHANNELS);
    return all ? all_channels_mask(signal.format.numChannels) : AUDIOSIGNAL_GetActiveChannelMask(&signal);
}

}  // namespace

extern "C" {

AUDIOSIGNAL *AUDIOSIGNAL_CopyEx(AUDIOSIGNAL *signal, AUDIOSIGNAL *result, int flags, int64_t begin, int64_t end)
{
    if (!signal || result == signal) {
        bad_argument();
        return nullptr;
    }
    const uint32_t mask = copy_mask(*signal, flags);
    if (mask == 0) {
        bad_argument();
        return nullptr;
    }
    return deliver(copy_range(*signal, mask, begin, end), result);
}

AUDIOSIGNAL *AUDIOSIGNAL_CutEx(AUDIOSIGNAL *signal, AUDIOSIGNAL *result, int flags, int64_t begin, int64_t end)
{
    AUDIOSIGNAL *copy = AUDIOSIGNAL_CopyEx(signal, result, flags, begin, end);
    if (copy) AUDIOSIGNAL_ClearEx(signal, flags, begin, end);
    return copy;
}

int AUDIOSIGNAL_ClearEx(AUDIOSIGNAL *signal, int flags, int64_t begin, int64_t end)
{
    if (!signal) return bad_argument();
    Edit edit(*signal);
    // Without a channel nothing is removed, so the regions must not move.
    if (edit.active_count() == 0) return bad_argument();
    clamp_range(edit.length(), begin, end);
    edit_active(edit, [&](int c, int) {
        return splice(edit.current(c), begin, end, [](SegmentsBuilder &) { return true; });
    });
    edit.removed(begin, end - begin);
    edit.commit();
    return 1;
}

int AUDIOSIGNAL_PasteEx(AUDIOSIGNAL *signal, AUDIOSIGNAL *source, int flags, int64_t begin, int64_t end,
                        int64_t *length)
{
    if (!signal || !source) return bad_argument();
    return paste(*signal, *source, begin, end, length) ? 1 : 0;
}

int AUDIOSIGNAL_MixPasteEx(AUDIOSIGNAL *signal, AUDIOSIGNAL *source, int flags, int64_t begin, int64_t end,
                           double gain, int64_t *length)
{
    if (!signal || !source || !std::isfinite(gain)) return bad_argument();
    const std::vector<SegmentsPtr> mixed = all_segments(*source);
    Edit edit(*signal);
    if (edit.active_count() == 0) return bad_argument();
    clamp_range(edit.length(), begin, end);
    const int64_t frames = end > begin ? std::min(end - begin, mixed[0]->length()) : mixed[0]->length();
    std::vector<float> under(size_t(std::min(frames, kChunkFrames)));
    const bool ok = edit_active(edit, [&](int c, int index) {
        const Segments &target = edit.current(c);
        const Segments &from = *mixed[size_t(source_channel(index, int(mixed.size())))];
        return splice(target, begin, begin + frames, [&](SegmentsBuilder &b) {
            return append_made(b, frames, [&](int64_t at, int64_t n, float *out) {
                if (!from.read(at, n, out)) return false;
                // The part of the piece still over the signal's samples.
                const int64_t over = std::clamp<int64_t>(target.length() - (begin + at), 0, n);
                if (over > 0 && !target.read(begin + at, over, under.data())) return false;
                for (int64_t i = 0; i < n; ++i) {
                    out[i] = float(gain * out[i]) + (i < over ? under[size_t(i)] : 0.0f);
                }
                return true;
            });
        });
    });
    if (!ok) return 0;
    edit.commit();
    if (length) *length = frames;
    return 1;
}

int AUDIOSIGNAL_SilenceEx(AUDIOSIGNAL *signal, int flags, int64_t begin, int64_t end)
{
    if (!signal) return bad_argument();
    Edit edit(*signal);
    if (edit.active_count() == 0) return bad_argument();  // nothing to change
    clamp_range(edit.length(), begin, end);
    edit_active(edit, [&](int c, int) {
        return splice(edit.current(c), begin, end, [&](SegmentsBuilder &b) {
            b.append_silence(end - begin);
            return true;
        });
    });
    edit.commit();
    return 1;
}

int AUDIOSIGNAL_ReverseEx(AUDIOSIGNAL *signal, int flags, int64_t begin, int64_t end)
{
    if (!signal) return bad_argument();
    Edit edit(*signal);
    if (edit.active_count() == 0) return bad_argument();  // nothing to change
    clamp_range(edit.length(), begin, end);
    const bool ok = edit_active(edit, [&](int c, int) {
        const Segments &source = edit.current(c);
        return splice(source, begin, end, [&](SegmentsBuilder &b) {
            return append_made(b, end - begin, [&](int64_t at, int64_t n, float *out) {
                if (!source.read(end - at - n, n, out)) return false;
                std::reverse(out, out + n);
                return true;
            });
        });
    });
    if (!ok) return 0;
    edit.commit();
    return 1;
}

int64_t AUDIOSIGNAL_AppendSilence(AUDIOSIGNAL *signal, int64_t frames)
{
    if (!signal || frames < 0) {
        bad_argument();
        return -1;
    }
    Edit edit(*signal);
    // Silence costs one slice per chunk of frames: an absurd length would
    // take unbounded memory (and overflow the positions).
    if (frames > kMaxSilenceFrames - edit.length()) {
        bad_argument();
        return -1;
    }
    for (int c = 0; c < edit.channels(); ++c) {
        const Segments &source = edit.current(c);
        edit.set(c, splice(source, source.length(), source.length(), [&](SegmentsBuilder &b) {
                     b.append_silence(frames);
                     return true;
                 }));
    }
    edit.commit();
    return frames;
}

int AUDIOSIGNAL_SwapChannels(AUDIOSIGNAL *signal)
{
    if (!signal || signal->format.numChannels != 2) return bad_argument();
    std::unique_lock<std::shared_mutex> writer(signal->access);
    std::lock_guard<std::mutex> guard(signal->lock);
    std::swap(signal->lists[0], signal->lists[1]);
    signal->stamp = signal->samples_stamp = next_stamp();
    return 1;
}

AUDIOSIGNAL *AUDIOSIGNAL_CopyChannelEx(AUDIOSIGNAL *signal, AUDIOSIGNAL *result, int channel)
{
    if (!valid_channel(signal, channel) || result == signal) {
        bad_argument();
        return nullptr;
    }
    return deliver(copy_range(*signal, 1u << channel, 0, AUDIOSIGNAL_END), result);
}

AUDIOSIGNAL *AUDIOSIGNAL_CombineToStereoEx(AUDIOSIGNAL *left, AUDIOSIGNAL *right, AUDIOSIGNAL *result)
{
    if (!left || !right || result == left || result == right ||
        AUDIOSIGNAL_SampleRate(left) != AUDIOSIGNAL_SampleRate(right)) {
        bad_argument();
        return nullptr;
    }
    AUDIO_FORMAT format;
    AUDIOSIGNAL_GetFormat(left, &format);
    format.numChannels = 2;
    _audio_signal *stereo = create_signal(format);
    const SegmentsPtr l = channel_segments(*left, 0), r = channel_segments(*right, 0);
    const int64_t longest = std::max(l->length(), r->length());
    std::vector<SegmentsPtr> parts;
    for (const SegmentsPtr &side : {l, r}) {
        SegmentsBuilder builder;
        builder.append_range(*side, 0, side->length());
        builder.append_silence(longest - side->length());
        parts.push_back(builder.build());
    }
    install_segments(*stereo, parts);
    return deliver(stereo, result);
}

}  // extern "C"
