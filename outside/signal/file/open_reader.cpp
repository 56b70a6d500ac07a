// Opening audio files: format strings, link documents, then libsndfile.
#include <fcntl.h>
#include <limits.h>
#include <stdlib.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <string>
#include <vector>

#include "outside/signal/file/audiofile_internal.hpp"
#include "outside/signal/file/convert_reader_internal.hpp"
#include "outside/signal/file/lasterror_internal.hpp"
#include "outside/signal/file/link_internal.hpp"
#include "outside/signal/file/sndfile_reader_internal.hpp"

namespace velmsig {

FileReader::~FileReader() = default;
AUDIOMETADATA *FileReader::metadata() { return nullptr; }
const char *FileReader::format_name() const { return nullptr; }

namespace {

// A link naming a link naming... is followed this deep at most.
constexpr size_t kMaxLinkDepth = 8;

// The audio a link document names, presented as the link itself: its
// container is AUDIO_CONTAINER_LINK so that the document binds its settings
// to the link file.
class LinkReader final : public FileReader {
public:
    explicit LinkReader(std::unique_ptr<FileReader> target) : target_(std::move(target)), format_(target_->format()) {
        format_.containerKind = AUDIO_CONTAINER_LINK;
    }
    const _audio_format &format() const override { return format_; }
    int64_t frames() const override { return target_->frames(); }
    bool random_access() const override { return target_->random_access(); }
    int64_t read(int64_t first, float *out, int64_t count) override { return target_->read(first, out, count); }
    AUDIOMETADATA *metadata() override { return target_->metadata(); }
    const char *format_name() const override { return "LINK"; }

private:
    std::unique_ptr<FileReader> target_;
    _audio_format format_;
};

std::unique_ptr<FileReader> open_at(const char *path, const ParsedFormat &format, std::vector<std::string> &chain);

std::unique_ptr<FileReader> open_link(const char *path, std::vector<std::string> &chain) {
    char canonical[PATH_MAX];
    if (!realpath(path, canonical)) {
        set_last_error(error_of_errno(errno, AUDIO_ERROR_READ));
        return nullptr;
    }
    if (chain.size() >= kMaxLinkDepth || std::find(chain.begin(), chain.end(), canonical) != chain.end()) {
        set_last_error(AUDIO_ERROR_CORRUPT_DATA);  // a link naming itself, a loop
        return nullptr;
    }
    chain.emplace_back(canonical);
    LinkTarget target;
    if (!read_link(path, &target)) return nullptr;
    ParsedFormat target_format;
    if (!parse_format_string(target.format.c_str(), &target_format)) {
        set_last_error(AUDIO_ERROR_BAD_FORMAT_STRING);
        return nullptr;
    }
    auto reader = open_at(target.path.c_str(), target_format, chain);
    if (!reader) return nullptr;
    return std::make_unique<LinkReader>(std::move(reader));
}

std::unique_ptr<FileReader> open_at(const char *path, const ParsedFormat &format, std::vector<std::string> &chain) {
    UniqueFd fd(::open(path, O_RDONLY | O_CLOEXEC));
    struct stat st{};
    if (!fd || fstat(fd.get(), &st) != 0) {
        set_last_error(error_of_errno(errno, AUDIO_ERROR_READ));
        return nullptr;
    }
    if (!S_ISREG(st.st_mode)) {
        set_last_error(AUDIO_ERROR_UNSUPPORTED_FORMAT);
        return nullptr;
    }
    int64_t size = st.st_size;
    bool link = format.container == AUDIO_CONTAINER_LINK || (format.container == 0 && is_link_document(path));
    if (link) return open_link(path, chain);
    if (size == 0 && format.container != AUDIO_CONTAINER_RAW) {
        set_last_error(AUDIO_ERROR_CORRUPT_DATA);
        return nullptr;
    }
    return open_sndfile_reader(std::move(fd), size, format);
}

}  // namespace

std::unique_ptr<FileReader> open_reader(const char *path, const char *format_text) {
    if (!path || !*path) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return nullptr;
    }
    ParsedFormat format;
    if (!parse_format_string(format_text, &format)) {
        set_last_error(AUDIO_ERROR_BAD_FORMAT_STRING);
        return nullptr;
    }
    std::vector<std::string> chain;
    try {
        auto reader = open_at(path, format, chain);
        if (reader && format.conversion.present) reader = convert_reader(std::move(reader), format.conversion);
        return reader;
    } catch (const std::bad_alloc &) {
        set_last_error(AUDIO_ERROR_OUT_OF_MEMORY);
        return nullptr;
    }
}

}  // namespace velmsig

extern "C" {

AUDIO_API int AUDIOSIGNAL_CanOpen(const char *path, const char *format_text, int flags) {
    auto reader = velmsig::open_reader(path, format_text);
    if (!reader) return 0;
    if (flags & AUDIO_CANOPEN_DECODE) {
        // A small buffer: a header claiming many channels cannot inflate it.
        float frames[AUDIO_MAX_CHANNELS * 64];
        if (reader->read(0, frames, 64) < 0) return 0;
    }
    return 1;
}

}  // extern "C"
