// Label text: one "begin<TAB>end<TAB>label" line per region, in seconds.
// Point labels have begin = end; lines starting with a backslash carry a
// frequency range for the label above and are skipped.  Lines without tabs
// are split at blanks.
#include <cctype>

#include "outside/signal/region/region_files.hpp"

namespace velmsig {

namespace {

std::string_view trim_end(std::string_view text)
{
    while (!text.empty() && std::isspace(static_cast<unsigned char>(text.back())))
        text.remove_suffix(1);
    return text;
}

// Splits off the first field: up to a tab, or up to blanks when the line has
// no tab at all.
std::string_view take_field(std::string_view &rest, bool tabs)
{
    if (!tabs)
        while (!rest.empty() && (rest.front() == ' ')) rest.remove_prefix(1);
    const size_t stop = tabs ? rest.find('\t') : rest.find(' ');
    const std::string_view field = rest.substr(0, stop);
    rest = stop == std::string_view::npos ? std::string_view() : rest.substr(stop + 1);
    return field;
}

std::string line_note(size_t number, const char *what)
{
    return "line " + std::to_string(number) + ": " + what;
}

}  // namespace

int read_labels(std::string_view text, RegionFileContent *out)
{
    if (text.substr(0, 3) == "\xEF\xBB\xBF") text.remove_prefix(3);
    size_t number = 0;
    while (!text.empty()) {
        const size_t eol = text.find('\n');
        std::string_view line = text.substr(0, eol);
        text = eol == std::string_view::npos ? std::string_view() : text.substr(eol + 1);
        ++number;
        line = trim_end(line);
        if (line.find_first_not_of(" \t") == std::string_view::npos || line.front() == '\\')
            continue;
        if (line.find('\0') != std::string_view::npos) {
            out->problems.push_back(line_note(number, "not text"));
            continue;
        }
        if (out->regions.size() >= RegionSet::kMaxRegions) {
            out->problems.push_back(line_note(number, "too many regions, the rest is left out"));
            break;
        }
        const bool tabs = line.find('\t') != std::string_view::npos;
        std::string_view rest = line;
        RegionRecord rec;
        if (!parse_seconds(take_field(rest, tabs), &rec.begin)) {
            out->problems.push_back(line_note(number, "no begin time"));
            continue;
        }
        // "begin<TAB>label" is a point label.
        const std::string_view before_end = rest;
        double end = rec.begin;
        if (!parse_seconds(take_field(rest, tabs), &end)) {
            end = rec.begin;
            rest = before_end;
        }
        if (end < rec.begin) std::swap(rec.begin, end);
        rec.length = end - rec.begin;
        if (!tabs)
            while (!rest.empty() && rest.front() == ' ') rest.remove_prefix(1);
        rec.label = std::string(rest);
        out->regions.push_back(std::move(rec));
    }
    return AUDIO_ERROR_NONE;
}

std::string write_labels(const RegionFileContent &content)
{
    std::string out;
    for (const RegionRecord &rec : content.regions) {
        out += format_seconds(rec.begin, 6);
        out += '\t';
        out += format_seconds(rec.begin + rec.length, 6);
        out += '\t';
        if (rec.label)
            for (char c : *rec.label) out += (c == '\t' || c == '\n' || c == '\r') ? ' ' : c;
        out += '\n';
    }
    return out;
}

}  // namespace velmsig
