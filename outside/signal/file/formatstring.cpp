// Strict parser and composer of format strings.
#include "outside/signal/file/formatstring_internal.hpp"

#include <cctype>
#include <charconv>
#include <string_view>

#include "outside/signal/audioformat.h"
#include "outside/signal/file/formats_internal.hpp"
#include "outside/signal/file/text_internal.hpp"

namespace velmsig {

namespace {

// Longer texts are not format strings; refusing them bounds the work.
constexpr size_t kMaxFormatText = 4096;

bool parse_int(std::string_view v, long long lo, long long hi, long long *out) {
    long long x = 0;
    auto [end, ec] = std::from_chars(v.data(), v.data() + v.size(), x);
    if (ec != std::errc() || end != v.data() + v.size() || x < lo || x > hi) return false;
    *out = x;
    return true;
}

bool parse_int(std::string_view v, long long lo, long long hi, int *out) {
    long long x = 0;
    if (!parse_int(v, lo, hi, &x)) return false;
    *out = static_cast<int>(x);
    return true;
}

bool parse_quality(std::string_view v, double *out) {
    double x = 0;
    auto [end, ec] = std::from_chars(v.data(), v.data() + v.size(), x);
    if (ec != std::errc() || end != v.data() + v.size() || !(x >= 0.0 && x <= 1.0)) return false;
    *out = x;
    return true;
}

// Splits "NAME[k=v,...]" into name and the text between the brackets.
bool split_section(std::string_view s, std::string_view *name, std::string_view *keys) {
    size_t open = s.find('[');
    if (open == std::string_view::npos) {
        *name = s;
        *keys = {};
    } else {
        if (s.back() != ']' || s.find('[', open + 1) != std::string_view::npos) return false;
        *name = s.substr(0, open);
        *keys = s.substr(open + 1, s.size() - open - 2);
        if (keys->find(']') != std::string_view::npos) return false;
    }
    if (name->empty()) return false;
    for (char c : *name)
        if (!std::isalnum(static_cast<unsigned char>(c))) return false;
    return true;
}

// Calls f(key, value) for each "key=value" of a comma-separated list.
template <typename F>
bool for_each_key(std::string_view keys, F f) {
    if (keys.empty()) return true;
    while (true) {
        size_t comma = keys.find(',');
        std::string_view item = keys.substr(0, comma);
        size_t eq = item.find('=');
        if (eq == std::string_view::npos || eq == 0 || eq + 1 == item.size()) return false;
        if (!f(item.substr(0, eq), item.substr(eq + 1))) return false;
        if (comma == std::string_view::npos) return true;
        keys.remove_prefix(comma + 1);
    }
}

bool parse_main(std::string_view section, ParsedFormat *p) {
    std::string_view name, keys;
    if (!split_section(section, &name, &keys)) return false;
    const FormatName *n = find_format_name(name);
    if (!n) return false;
    p->name = n->name;
    p->container = n->container;
    p->coding = n->coding;
    return for_each_key(keys, [p](std::string_view k, std::string_view v) {
        if (equals_nocase(k, "sr")) return parse_int(v, 1, AUDIO_MAX_SAMPLE_RATE, &p->sample_rate);
        if (equals_nocase(k, "nc")) return parse_int(v, 1, AUDIO_MAX_CHANNELS, &p->channels);
        if (equals_nocase(k, "nbits") || equals_nocase(k, "bps"))
            return parse_int(v, 8, 64, &p->bits) && p->bits % 8 == 0 && p->bits != 40 && p->bits != 48 &&
                   p->bits != 56;
        if (equals_nocase(k, "offset")) {
            long long offset = 0;
            if (!parse_int(v, 0, 1LL << 40, &offset)) return false;
            p->offset = offset;
            return true;
        }
        if (equals_nocase(k, "quality")) return parse_quality(v, &p->quality);
        if (equals_nocase(k, "endian")) {
            p->has_endian = true;
            if (equals_nocase(v, "big")) return p->big_endian = true;
            return equals_nocase(v, "little");
        }
        return false;
    });
}

bool parse_conversion(std::string_view section, FormatConversion *c) {
    std::string_view name, keys;
    if (!split_section(section, &name, &keys) || !equals_nocase(name, "FMTCONV") || c->present) return false;
    c->present = true;
    return for_each_key(keys, [c](std::string_view k, std::string_view v) {
        if (equals_nocase(k, "sr")) return parse_int(v, 1, AUDIO_MAX_SAMPLE_RATE, &c->sample_rate);
        if (equals_nocase(k, "nc")) return parse_int(v, 1, AUDIO_MAX_CHANNELS, &c->channels);
        if (equals_nocase(k, "nbits") || equals_nocase(k, "bps")) return parse_int(v, 8, 64, &c->bits);
        return false;
    });
}

}  // namespace

bool parse_format_string(const char *text, ParsedFormat *out) {
    ParsedFormat p;
    std::string_view s = text ? std::string_view(text) : std::string_view();
    if (s.size() > kMaxFormatText) return false;
    if (s.empty()) s = "AUTO";
    for (char c : s)
        if (std::isspace(static_cast<unsigned char>(c)) || !std::isprint(static_cast<unsigned char>(c))) return false;
    size_t colon = s.find(':');
    if (!parse_main(s.substr(0, colon), &p)) return false;
    while (colon != std::string_view::npos) {
        s.remove_prefix(colon + 1);
        colon = s.find(':');
        if (!parse_conversion(s.substr(0, colon), &p.conversion)) return false;
    }
    *out = std::move(p);
    return true;
}

std::string compose_format_string(const ParsedFormat &f) {
    std::string keys;
    auto add = [&keys](const char *k, const std::string &v) {
        keys += keys.empty() ? "" : ",";
        keys += k;
        keys += '=';
        keys += v;
    };
    if (f.sample_rate) add("sr", std::to_string(f.sample_rate));
    if (f.channels) add("nc", std::to_string(f.channels));
    if (f.bits) add("nbits", std::to_string(f.bits));
    if (f.has_endian) add("endian", f.big_endian ? "big" : "little");
    if (f.offset) add("offset", std::to_string(f.offset));
    if (f.quality >= 0) {
        char q[32];
        auto r = std::to_chars(q, q + sizeof q, f.quality);
        add("quality", std::string(q, r.ptr));
    }
    std::string text = f.name.empty() ? "AUTO" : f.name;
    if (!keys.empty()) text += "[" + keys + "]";
    if (f.conversion.present) {
        ParsedFormat c;
        c.name = "FMTCONV";
        c.sample_rate = f.conversion.sample_rate;
        c.channels = f.conversion.channels;
        c.bits = f.conversion.bits;
        text += ":" + compose_format_string(c);
    }
    return text;
}

}  // namespace velmsig
