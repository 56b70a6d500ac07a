// The library's own region text, which keeps everything regions carry:
//
//   VELM-REGIONS<TAB>1
//   track<TAB>number<TAB>name<TAB>label
//   region<TAB>id<TAB>parent id or -<TAB>track<TAB>flags (hex)<TAB>begin<TAB>length
//         <TAB>label<TAB>comment          (one line)
//
// Times are seconds written exactly.  Texts escape backslash, tab, line
// feed and carriage return as \\ \t \n \r; a field of only \N is no text.
// A parent comes before its children.  Lines starting with # are comments.
#include <charconv>
#include <unordered_map>
#include <vector>

#include "outside/signal/region/region_files.hpp"

namespace velmsig {

namespace {

constexpr int kVersion = 1;

std::string escape(const std::optional<std::string> &text)
{
    if (!text) return "\\N";
    std::string out;
    for (char c : *text) {
        switch (c) {
        case '\\': out += "\\\\"; break;
        case '\t': out += "\\t"; break;
        case '\n': out += "\\n"; break;
        case '\r': out += "\\r"; break;
        default: out += c;
        }
    }
    return out;
}

bool unescape(std::string_view field, std::optional<std::string> *out)
{
    if (field == "\\N") {
        out->reset();
        return true;
    }
    std::string text;
    for (size_t i = 0; i < field.size(); ++i) {
        if (field[i] != '\\') {
            text += field[i];
            continue;
        }
        if (++i == field.size()) return false;
        switch (field[i]) {
        case '\\': text += '\\'; break;
        case 't': text += '\t'; break;
        case 'n': text += '\n'; break;
        case 'r': text += '\r'; break;
        default: return false;
        }
    }
    *out = std::move(text);
    return true;
}

std::vector<std::string_view> split_tabs(std::string_view line)
{
    std::vector<std::string_view> fields;
    for (;;) {
        const size_t tab = line.find('\t');
        fields.push_back(line.substr(0, tab));
        if (tab == std::string_view::npos) return fields;
        line.remove_prefix(tab + 1);
    }
}

template <typename T>
bool parse_int(std::string_view text, T *out, int base = 10)
{
    const auto [end, ec] = std::from_chars(text.data(), text.data() + text.size(), *out, base);
    return ec == std::errc() && end == text.data() + text.size() && !text.empty();
}

}  // namespace

std::string write_own(const RegionFileContent &content)
{
    std::string out(kOwnMagic);
    out += '\t' + std::to_string(kVersion) + '\n';
    for (const TrackRecord &track : content.tracks) {
        out += "track\t" + std::to_string(track.number) + '\t' +
               escape(std::optional<std::string>(track.name)) + '\t' + escape(track.label) + '\n';
    }
    for (size_t i = 0; i < content.regions.size(); ++i) {
        const RegionRecord &rec = content.regions[i];
        char flags[16];
        const auto hex = std::to_chars(flags, flags + sizeof flags, rec.flags, 16);
        out += "region\t" + std::to_string(i) + '\t' +
               (rec.parent >= 0 ? std::to_string(rec.parent) : std::string("-")) + '\t' +
               std::to_string(rec.track) + '\t' + std::string(flags, hex.ptr) + '\t' +
               format_seconds(rec.begin, -1) + '\t' + format_seconds(rec.length, -1) + '\t' +
               escape(rec.label) + '\t' + escape(rec.comment) + '\n';
    }
    return out;
}

int read_own(std::string_view text, RegionFileContent *out)
{
    const size_t first_end = text.find('\n');
    std::string_view header = text.substr(0, first_end);
    if (!header.empty() && header.back() == '\r') header.remove_suffix(1);
    const std::vector<std::string_view> head = split_tabs(header);
    int version = 0;
    if (head.size() != 2 || head[0] != kOwnMagic || !parse_int(head[1], &version))
        return AUDIO_ERROR_CORRUPT_DATA;
    if (version > kVersion) return AUDIO_ERROR_UNSUPPORTED_FORMAT;
    text = first_end == std::string_view::npos ? std::string_view() : text.substr(first_end + 1);

    std::unordered_map<uint64_t, int> by_id;   // file id -> index in out->regions
    size_t number = 1;
    auto note = [&](const char *what) {
        out->problems.push_back("line " + std::to_string(number) + ": " + what);
    };
    while (!text.empty()) {
        const size_t eol = text.find('\n');
        std::string_view line = text.substr(0, eol);
        text = eol == std::string_view::npos ? std::string_view() : text.substr(eol + 1);
        ++number;
        if (!line.empty() && line.back() == '\r') line.remove_suffix(1);
        if (line.empty() || line.front() == '#') continue;
        const std::vector<std::string_view> f = split_tabs(line);
        if (f[0] == "track") {
            TrackRecord track;
            std::optional<std::string> name;
            if (f.size() != 4 || !parse_int(f[1], &track.number) || track.number < 0 ||
                track.number >= AUDIOREGION_MAX_TRACKS || !unescape(f[2], &name) ||
                !unescape(f[3], &track.label)) {
                note("bad track line");
                continue;
            }
            track.name = name.value_or("");
            out->tracks.push_back(std::move(track));
        } else if (f[0] == "region") {
            if (out->regions.size() >= RegionSet::kMaxRegions) {
                note("too many regions, the rest is left out");
                break;
            }
            RegionRecord rec;
            uint64_t id = 0, parent = 0;
            if (f.size() != 9 || !parse_int(f[1], &id) || by_id.count(id) ||
                !parse_int(f[3], &rec.track) || rec.track < 0 ||
                rec.track >= AUDIOREGION_MAX_TRACKS || !parse_int(f[4], &rec.flags, 16) ||
                !parse_seconds(f[5], &rec.begin) || !parse_seconds(f[6], &rec.length) ||
                rec.length < 0.0 ||
                !unescape(f[7], &rec.label) || !unescape(f[8], &rec.comment)) {
                note("bad region line");
                continue;
            }
            if (f[2] != "-") {
                auto it = parse_int(f[2], &parent) ? by_id.find(parent) : by_id.end();
                if (it == by_id.end())
                    note("unknown parent, region kept at the top");
                else
                    rec.parent = it->second;
            }
            by_id[id] = int(out->regions.size());
            out->regions.push_back(std::move(rec));
        } else {
            note("unknown record");
        }
    }
    return AUDIO_ERROR_NONE;
}

}  // namespace velmsig
