// Reading and writing a region set's regions by format text.
#include "outside/signal/region/region_files.hpp"

namespace velmsig {

namespace {

// The track a format text names, -1 for none; false when it names one that
// cannot be had.
bool named_track(RegionSet &set, const RegionFormatText &format, int *track)
{
    *track = format.track.empty() ? -1 : set.track_number(format.track);
    return format.track.empty() || *track >= 0;
}

int read_content(const char *path, RegionFormat kind, RegionFileContent *content)
{
    if (kind == RegionFormat::Auto) {
        std::string head;
        if (const int error = read_head(path, 16, &head)) return error;
        kind = format_from_contents(head);
    }
    if (kind == RegionFormat::Wave) return read_wave_cues(path, content);
    std::string text;
    if (const int error = read_text_file(path, &text)) return error;
    return kind == RegionFormat::Own ? read_own(text, content) : read_labels(text, content);
}

}  // namespace

int read_region_file(RegionSet &set, const char *path, const char *format,
                     std::vector<std::string> *problems)
{
    RegionFormatText parsed;
    if (!path || !*path) return AUDIO_ERROR_BAD_ARGUMENT;
    if (!parse_region_format(format, &parsed)) return AUDIO_ERROR_BAD_FORMAT_STRING;
    int track = -1;
    if (!named_track(set, parsed, &track)) return AUDIO_ERROR_BAD_ARGUMENT;

    RegionFileContent content;
    const int error = read_content(path, parsed.kind, &content);
    problems->insert(problems->end(), content.problems.begin(), content.problems.end());
    if (error) return error;
    // Nothing usable at all is a broken file, not an empty one.
    if (content.regions.empty() && !content.problems.empty()) return AUDIO_ERROR_CORRUPT_DATA;
    set.import_content(content, track, problems);
    return AUDIO_ERROR_NONE;
}

int write_region_file(RegionSet &set, const char *path, const char *format)
{
    RegionFormatText parsed;
    if (!path || !*path) return AUDIO_ERROR_BAD_ARGUMENT;
    if (!parse_region_format(format, &parsed)) return AUDIO_ERROR_BAD_FORMAT_STRING;
    int track = -1;
    if (!named_track(set, parsed, &track)) return AUDIO_ERROR_BAD_ARGUMENT;

    const RegionFileContent content = set.export_content(track);
    const RegionFormat kind =
        parsed.kind == RegionFormat::Auto ? format_from_name(path) : parsed.kind;
    int error;
    if (kind == RegionFormat::Wave)
        error = write_wave_cues(path, content);
    else if (kind == RegionFormat::Own)
        error = write_file_atomically(path, write_own(content));
    else
        error = write_file_atomically(path, write_labels(content));
    if (!error) set.clear_changed(track);
    return error;
}

}  // namespace velmsig
