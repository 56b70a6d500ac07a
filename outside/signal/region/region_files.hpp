// Region file formats.  Each reader fills a RegionFileContent, noting the
// lines or chunks it skipped; each answers AUDIO_ERROR_NONE or an
// AUDIO_ERROR_* code.
#ifndef VELMSIG_REGION_FILES_HPP
#define VELMSIG_REGION_FILES_HPP

#include <string>
#include <string_view>

#include "outside/signal/region/region_internal.hpp"

namespace velmsig {

enum class RegionFormat { Auto, Labels, Wave, Own };

struct RegionFormatText {
    RegionFormat kind = RegionFormat::Auto;
    std::string track;   // "track=NAME", empty when not given
};

// "LABELS", "WAVE[track=x]", "AUTO", null...; false for a malformed text.
bool parse_region_format(const char *text, RegionFormatText *out);
RegionFormat format_from_name(std::string_view path);
RegionFormat format_from_contents(std::string_view head);

// Tab-separated label text.
int read_labels(std::string_view text, RegionFileContent *out);
std::string write_labels(const RegionFileContent &content);

// The library's own format.
inline constexpr std::string_view kOwnMagic = "VELM-REGIONS";
int read_own(std::string_view text, RegionFileContent *out);
std::string write_own(const RegionFileContent &content);

// Cue points and labelled ranges of a WAV file.  Writing rewrites the
// existing file at path with new cue and LIST/adtl chunks.
int read_wave_cues(const char *path, RegionFileContent *out);
int write_wave_cues(const char *path, const RegionFileContent &content);

// A file written beside its target and renamed over it by commit(); without
// commit() the temporary file is removed and the target is untouched.
class AtomicWriter {
public:
    explicit AtomicWriter(const char *path);
    ~AtomicWriter();
    AtomicWriter(const AtomicWriter &) = delete;
    AtomicWriter &operator=(const AtomicWriter &) = delete;
    int error() const { return error_; }   // AUDIO_ERROR_NONE while all went well
    bool write(const void *data, size_t size);
    int commit();                          // flush, sync, rename; an error code

private:
    std::string target_, temp_;
    int fd_ = -1;
    int error_;
};

// Reading into and writing from a region set, by format text (see
// AUDIOSIGNAL_ReadRegions); problems met while reading are added to
// *problems.  AUDIO_ERROR_NONE or a code.
int read_region_file(RegionSet &set, const char *path, const char *format,
                     std::vector<std::string> *problems);
int write_region_file(RegionSet &set, const char *path, const char *format);

// The first bytes of a file (fewer when it is shorter).
int read_head(const char *path, size_t size, std::string *out);
// Whole text files, size-capped.
inline constexpr size_t kMaxRegionTextFile = size_t(16) << 20;
int read_text_file(const char *path, std::string *out);
int write_file_atomically(const char *path, std::string_view data);
// An AUDIO_ERROR_* code for an errno value of a failed open.
int open_error(int err, bool writing);

// Number texts independent of the C locale.
bool parse_seconds(std::string_view text, double *out);
std::string format_seconds(double seconds, int decimals);   // decimals < 0: exact

}  // namespace velmsig

#endif  // VELMSIG_REGION_FILES_HPP
