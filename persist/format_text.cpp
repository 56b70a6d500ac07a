// Reading the sample rate, channel count and sample size of a format text.
#include "persist/format_text.hpp"

#include <cctype>
#include <charconv>
#include <string_view>

namespace velmlua {

namespace {

bool is_name(std::string_view name)
{
    if (name.empty()) return false;
    for (char ch : name)
        if (!std::isalnum(static_cast<unsigned char>(ch)) && ch != '_') return false;
    return true;
}

bool read_number(std::string_view text, int *out)
{
    const char *end = text.data() + text.size();
    auto [stop, error] = std::from_chars(text.data(), end, *out);
    return error == std::errc() && stop == end;
}

bool read_setting(std::string_view setting, int *rate, int *channels, int *bits)
{
    const size_t equals = setting.find('=');
    if (equals == std::string_view::npos) return false;
    const std::string_view key = setting.substr(0, equals), value = setting.substr(equals + 1);
    if (key == "sr") return read_number(value, rate);
    if (key == "nc") return read_number(value, channels);
    if (key == "nbits") return read_number(value, bits);
    return false;
}

} // namespace

bool read_new_format(const char *text, _audio_format *out)
{
    if (!text || !out) return false;
    const std::string_view whole(text);
    const size_t open = whole.find('[');
    if (!is_name(whole.substr(0, open))) return false;
    int rate = 8000, channels = 1, bits = 16;
    if (open != std::string_view::npos) {
        if (whole.back() != ']') return false;
        std::string_view settings = whole.substr(open + 1, whole.size() - open - 2);
        while (!settings.empty()) {
            const size_t comma = settings.find(',');
            if (!read_setting(settings.substr(0, comma), &rate, &channels, &bits)) return false;
            settings = comma == std::string_view::npos ? std::string_view() : settings.substr(comma + 1);
        }
    }
    // Out-of-range values are refused here, before they are narrowed.
    if (rate <= 0 || rate > AUDIO_MAX_SAMPLE_RATE || channels <= 0 || channels > AUDIO_MAX_CHANNELS || bits <= 0 ||
        bits > 64)
        return false;
    *out = AUDIO_InitFormat(rate, channels, bits);
    return AUDIO_IsValidFormat(out) != 0;
}

} // namespace velmlua
