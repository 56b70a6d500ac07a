// Edit mode: the blink timer, typed text and its reading as a position.
#include <cctype>
#include <optional>
#include <vector>

#include "core/velmnavigation.h"
#include "core/velmtimeconv.h"
#include "widgets/display/display_internal.hpp"

namespace {

constexpr uint32_t kBlinkMs = 500;
constexpr uint32_t kEditOptions = 0x1A; // blank, hours and minutes folded

int blink(void *user)
{
    auto *d = static_cast<_VELMDISPLAY *>(user);
    d->now.options ^= VELMDISPLAY_OPTION_BLANK;
    display_notify(VELMDISPLAY_EVENT_BLINK);
    return 1;
}

// Decimal value of a run of digits; nothing when it does not fit 63 bits.
std::optional<int64_t> decimal(const std::string &digits)
{
    int64_t value = 0;
    for (char c : digits)
        if (__builtin_mul_overflow(value, 10, &value) || __builtin_add_overflow(value, c - '0', &value))
            return std::nullopt;
    return value;
}

struct Reading {
    int64_t value;
    uint32_t options;
};

std::vector<std::string> split(const std::string &text, char separator)
{
    std::vector<std::string> parts(1);
    for (char c : text) {
        if (c == separator)
            parts.emplace_back();
        else
            parts.back() += c;
    }
    return parts;
}

// [[hours:]minutes:]seconds[.fraction], landing one sample after the time.
std::optional<Reading> read_time(const std::string &text, int64_t rate)
{
    const auto dot = text.find('.');
    const std::string whole = text.substr(0, dot);
    std::string fraction = dot == std::string::npos ? "" : text.substr(dot + 1);
    if (fraction.find('.') != std::string::npos || fraction.size() > 3)
        return std::nullopt;
    fraction.resize(3, '0');
    const auto fields = split(whole, ':');
    if (fields.size() > 3)
        return std::nullopt;
    std::vector<int64_t> v;
    for (const auto &f : fields) {
        const auto n = decimal(f);
        if (!n)
            return std::nullopt;
        v.push_back(*n);
    }
    int64_t hours = 0, minutes = 0, seconds = v.back();
    uint32_t options = 0x18;
    if (v.size() == 1 && seconds >= 1000000)
        return std::nullopt;
    if (v.size() >= 2) {
        minutes = v[v.size() - 2];
        options = 0x8;
        if (seconds > 59 || minutes >= 10000)
            return std::nullopt;
    }
    if (v.size() == 3) {
        hours = v[0];
        options = 0;
        if (hours > 999 || minutes > 59)
            return std::nullopt;
    }
    const int64_t ms = *decimal(fraction);
    const int64_t total = hours * 3600 + minutes * 60 + seconds;
    int64_t value = 0;
    if (__builtin_mul_overflow(total, rate, &value) || __builtin_add_overflow(value, ms * rate / 1000 + 1, &value))
        return std::nullopt;
    return Reading{value, options};
}

// frames/offset with the offset below the frame length.
std::optional<Reading> read_frame(const std::string &text, int64_t frame_length)
{
    const auto parts = split(text, '/');
    if (parts.size() > 2 || frame_length <= 0)
        return std::nullopt;
    const auto frames = decimal(parts[0]);
    std::string offset_text = parts.size() == 2 ? parts[1] : "";
    if (!frames || offset_text.size() > 4)
        return std::nullopt;
    const int64_t offset = *decimal(offset_text);
    if (offset >= frame_length)
        return std::nullopt;
    int64_t value = 0;
    if (__builtin_mul_overflow(*frames, frame_length, &value) || __builtin_add_overflow(value, offset, &value))
        return std::nullopt;
    return Reading{value, 0};
}

// The character as it enters the text for the unit, or 0 when refused.
char accepted(int unit, int c)
{
    const bool digit = c >= '0' && c <= '9';
    if (display_is_sample_unit(unit))
        return digit ? static_cast<char>(c) : 0;
    if (display_is_frame_unit(unit))
        return digit ? static_cast<char>(c) : (c == ':' || c == '.' || c == '/' || c == ' ') ? '/' : 0;
    return digit || c == '.' || c == ':' ? static_cast<char>(c) : 0;
}

std::optional<Reading> read_text(const _VELMDISPLAY *d, const std::string &text)
{
    const int unit = d->now.unit;
    if (display_is_sample_unit(unit)) {
        if (text.size() > 10)
            return std::nullopt;
        return Reading{*decimal(text), kEditOptions};
    }
    if (display_is_frame_unit(unit))
        return read_frame(text, VELMAUDIO_ScaleFrameLength(d->doc));
    return read_time(text, d->now.rate);
}

bool type_text(_VELMDISPLAY *d, const std::string &text)
{
    const auto reading = read_text(d, text);
    if (!reading)
        return false;
    d->text = text;
    d->now.edit_value = reading->value;
    const bool blank = d->now.options & VELMDISPLAY_OPTION_BLANK;
    d->now.options = reading->options | (blank ? VELMDISPLAY_OPTION_BLANK : 0);
    if (!text.empty())
        d->now.options &= ~VELMDISPLAY_OPTION_BLANK;
    return true;
}

} // namespace

void display_end_edit(_VELMDISPLAY *d, bool apply)
{
    if (!d->now.editing)
        return;
    VELMTIMER_KillTimer(d->blink);
    d->blink = nullptr;
    d->now.editing = 0;
    d->now.options &= VELMDISPLAY_OPTION_REMAINING;
    if (apply && display_has_doc(d)) {
        VELMAUDIO_SetCursorPosition(d->doc, d->now.edit_value);
        VELMAUDIO_ZoomCursor(d->doc);
    }
    d->text.clear();
    display_notify(VELMDISPLAY_EVENT_EDITENDED);
}

int VELMDISPLAY_IsEditing(VELMDISPLAY display)
{
    return display && display->now.editing;
}

int VELMDISPLAY_EnterEdit(VELMDISPLAY display)
{
    if (!display || !display_has_doc(display) || display->now.editing)
        return 0;
    if (BLNOTIFY_SendEvent(VELMAUDIO_Dispatcher(nullptr), nullptr, 0, VELMDISPLAY_EVENT_BEFOREEDIT, nullptr, nullptr) == 0)
        return 0;
    display->blink = VELMTIMER_CreateTimer(kBlinkMs, blink, display);
    if (!display->blink)
        return 0;
    display->now.editing = 1;
    display->now.options = kEditOptions;
    display->now.edit_value = 0;
    display->text.clear();
    display_notify(VELMDISPLAY_EVENT_EDITSTARTED);
    return 1;
}

int VELMDISPLAY_ApplyEdit(VELMDISPLAY display)
{
    if (!display || !display->now.editing)
        return 0;
    display_end_edit(display, true);
    return 1;
}

int VELMDISPLAY_CancelEdit(VELMDISPLAY display)
{
    if (!display || !display->now.editing)
        return 0;
    display_end_edit(display, false);
    return 1;
}

int VELMDISPLAY_KeyPressed(VELMDISPLAY display, int character)
{
    if (!display || !display->now.editing)
        return 0;
    switch (character) {
    case '\n':
    case '\r':
        return VELMDISPLAY_ApplyEdit(display);
    case 27:
        return VELMDISPLAY_CancelEdit(display);
    case '\b':
        if (display->text.empty())
            return 0;
        return type_text(display, display->text.substr(0, display->text.size() - 1));
    default:
        break;
    }
    const char c = accepted(display->now.unit, character);
    if (!c || display->text.size() >= kEditTextMax)
        return 0;
    if (c == '0' && display->text == "0")
        return 0;
    return type_text(display, display->text + c);
}
