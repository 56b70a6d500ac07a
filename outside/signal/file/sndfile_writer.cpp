// Saving: every file is written beside its target under a temporary name,
// synced, then renamed over the target, so a failed save leaves the old file
// as it was and no temporary file behind.
#include <fcntl.h>
#include <limits.h>
#include <sndfile.h>
#include <strings.h>
#include <stdlib.h>
#include <sys/stat.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <string>

#include "outside/signal/file/audiofile_internal.hpp"
#include "outside/signal/file/formats_internal.hpp"
#include "outside/signal/file/lasterror_internal.hpp"
#include "outside/signal/file/link_internal.hpp"
#include "outside/signal/file/metadata_internal.hpp"
#include "outside/signal/file/sfmap_internal.hpp"
#include "outside/signal/file/unique_fd_internal.hpp"
#include "outside/signal/file/vfile_internal.hpp"

namespace velmsig {

FileWriter::~FileWriter() = default;

namespace {

// New files get the permissions the process's umask allows; reading it from
// /proc avoids umask(), which would change it for every thread meanwhile.
mode_t new_file_mode() {
    std::ifstream status("/proc/self/status");
    std::string line;
    while (std::getline(status, line))
        if (line.rfind("Umask:", 0) == 0) return 0666 & ~static_cast<mode_t>(std::strtoul(line.c_str() + 6, nullptr, 8));
    return 0644;
}

// The format name a file name like "song.flac" asks for: the type listing
// the extension, and within it the entry the extension names ("opus");
// WAVE when nothing matches.
const char *format_name_of_extension(const std::string &path) {
    size_t dot = path.rfind('.'), slash = path.rfind('/');
    if (dot == std::string::npos || (slash != std::string::npos && dot < slash)) return "WAVE";
    std::string ext = path.substr(dot + 1);
    for (int i = 0; i < AUDIO_NumFormatDescrs(); ++i) {
        const AUDIO_FORMAT_DESCR *d = AUDIO_GetFormatDescrByIndex(i);
        if (d->containerKind == AUDIO_CONTAINER_LINK) continue;
        std::string list = std::string(d->extensions) + ",";
        for (size_t at = 0, comma; (comma = list.find(',', at)) != std::string::npos; at = comma + 1) {
            if (strcasecmp(list.substr(at, comma - at).c_str(), ext.c_str()) != 0) continue;
            for (int e = 0; e < d->numEntries; ++e)
                if (strcasecmp(d->entries[e].name, ext.c_str()) == 0) return d->entries[e].name;
            return d->entries[0].name;
        }
    }
    return "WAVE";
}

// The coding a save stores: the one the format name fixes, else the bit depth
// of the format string, else the signal's own.
int choose_coding(const ParsedFormat &f, const _audio_format &signal, int *bits) {
    if (f.coding == AUDIO_FORMAT_FLAC) {  // integers of 8, 16 or 24 bits
        *bits = f.bits ? f.bits : signal.bitsPerSample >= 24 ? 24 : signal.bitsPerSample == 8 ? 8 : 16;
        return (*bits == 8 || *bits == 16 || *bits == 24) ? f.coding : 0;
    }
    bool named_float = f.coding == AUDIO_FORMAT_FLOAT;
    if (f.coding && !named_float) {  // lossy encoders take any depth
        *bits = 16;
        return f.coding;
    }
    bool floating = named_float || (!f.bits && (signal.audioFormatKind == AUDIO_FORMAT_FLOAT ||
                                                signal.audioFormatKind == AUDIO_FORMAT_DOUBLE));
    *bits = f.bits ? f.bits : named_float ? (signal.bitsPerSample == 64 ? 64 : 32) : signal.bitsPerSample;
    int coding = pcm_coding_for_bits(f.container, *bits, floating);
    if (!coding && !f.bits && !named_float) {  // a depth the container lacks: 16-bit
        *bits = 16;
        coding = pcm_coding_for_bits(f.container, 16, false);
    }
    return coding;
}

class SndfileWriter final : public FileWriter {
public:
    SndfileWriter(std::string target, std::string temp, UniqueFd fd)
        : target_(std::move(target)), temp_(std::move(temp)), fd_(std::move(fd)), vfile_(fd_.get(), 0, 0, true) {}

    ~SndfileWriter() override {
        if (sf_) sf_close(sf_);
        if (!committed_) unlink(temp_.c_str());
    }

    int open(SF_INFO info, bool rf64, double quality, const AUDIOMETADATA *meta) {
        if (!sf_format_check(&info)) return AUDIO_ERROR_UNSUPPORTED_FORMAT;
        sf_ = sf_open_virtual(VirtualFile::io(), SFM_WRITE, &info, &vfile_);
        if (!sf_) return vfile_.failed() ? AUDIO_ERROR_WRITE : AUDIO_ERROR_UNSUPPORTED_FORMAT;
        sf_command(sf_, SFC_SET_CLIPPING, nullptr, SF_TRUE);
        // Files under 4 GB stay plain WAVE; larger ones become RF64.
        if (rf64) sf_command(sf_, SFC_RF64_AUTO_DOWNGRADE, nullptr, SF_TRUE);
        if (quality >= 0) sf_command(sf_, SFC_SET_VBR_ENCODING_QUALITY, &quality, sizeof quality);
        metadata_to_sndfile(sf_, meta);
        return AUDIO_ERROR_NONE;
    }

    bool write(const float *interleaved, int64_t frames) override {
        if (!sf_ || failed_ || !interleaved || frames < 0) {
            set_last_error(failed_ || !sf_ ? AUDIO_ERROR_WRITE : AUDIO_ERROR_BAD_ARGUMENT);
            return false;
        }
        if (sf_writef_float(sf_, interleaved, frames) != frames || vfile_.failed()) return fail();
        return true;
    }

    bool commit() override {
        if (!sf_ || failed_) return fail();
        int closed = sf_close(sf_);
        sf_ = nullptr;
        if (closed != 0 || vfile_.failed() || fsync(fd_.get()) != 0 || !fd_.reset()) return fail();
        if (rename(temp_.c_str(), target_.c_str()) != 0) {
            int e = errno;
            fail();
            set_last_error(error_of_errno(e, AUDIO_ERROR_WRITE));
            return false;
        }
        committed_ = true;
        sync_folder();
        return true;
    }

private:
    bool fail() {
        failed_ = true;
        set_last_error(AUDIO_ERROR_WRITE);
        return false;
    }

    // Makes the rename itself durable.
    void sync_folder() const {
        size_t slash = target_.rfind('/');
        std::string dir = slash == std::string::npos ? "." : slash == 0 ? "/" : target_.substr(0, slash);
        UniqueFd d(::open(dir.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
        if (d) fsync(d.get());
    }

    std::string target_, temp_;
    UniqueFd fd_;
    VirtualFile vfile_;
    SNDFILE *sf_ = nullptr;
    bool failed_ = false;
    bool committed_ = false;
};

std::unique_ptr<FileWriter> create_at(const std::string &path, const _audio_format &format, const ParsedFormat &f,
                                      const AUDIOMETADATA *meta, int depth);

// Saving through a link writes the audio it names; the link stays as it is.
std::unique_ptr<FileWriter> create_through_link(const std::string &path, const _audio_format &format,
                                                const AUDIOMETADATA *meta, int depth) {
    LinkTarget target;
    if (depth >= 8) {
        set_last_error(AUDIO_ERROR_CORRUPT_DATA);
        return nullptr;
    }
    if (!read_link(path.c_str(), &target)) return nullptr;
    ParsedFormat tf;
    if (!parse_format_string(target.format.c_str(), &tf)) {
        set_last_error(AUDIO_ERROR_BAD_FORMAT_STRING);
        return nullptr;
    }
    if (tf.container == 0) {
        // Keep the type of the audio that is there.
        if (auto existing = open_reader(target.path.c_str(), "AUTO"); existing && existing->format_name())
            parse_format_string(existing->format_name(), &tf);
    }
    return create_at(target.path, format, tf, meta, depth + 1);
}

std::unique_ptr<FileWriter> create_at(const std::string &named, const _audio_format &format, const ParsedFormat &f,
                                      const AUDIOMETADATA *meta, int depth) {
    // Saving over a symbolic link replaces the file it points at, not the link.
    char real[PATH_MAX];
    const std::string path = realpath(named.c_str(), real) ? std::string(real) : named;
    struct stat st{};
    bool exists = stat(path.c_str(), &st) == 0;
    if (exists && !S_ISREG(st.st_mode)) {
        set_last_error(AUDIO_ERROR_ACCESS_DENIED);
        return nullptr;
    }
    if (f.container == AUDIO_CONTAINER_LINK || (f.container == 0 && exists && is_link_document(path.c_str())))
        return create_through_link(path, format, meta, depth);
    // Rate and channel keys describe files being read ("AUTO[sr=8000,nc=1]"
    // becomes "WAVE[sr=8000,nc=1]" once detected); a save always writes the
    // signal's own rate and channels.
    if (f.conversion.present) {
        set_last_error(AUDIO_ERROR_BAD_FORMAT_STRING);
        return nullptr;
    }
    ParsedFormat chosen = f;
    if (!f.container) {
        const FormatName *name = find_format_name(format_name_of_extension(path));
        chosen.container = name->container;
        chosen.coding = name->coding;
    }
    int container = chosen.container;
    int bits = 0;
    int coding = choose_coding(chosen, format, &bits);
    bool wave = container == AUDIO_CONTAINER_WAVE;
    int sf = coding ? sf_format_of(wave ? AUDIO_CONTAINER_RF64 : container, coding, bits) : 0;
    if (!sf) {
        set_last_error(AUDIO_ERROR_UNSUPPORTED_FORMAT);
        return nullptr;
    }
    if (container == AUDIO_CONTAINER_RAW && f.has_endian) sf |= f.big_endian ? SF_ENDIAN_BIG : SF_ENDIAN_LITTLE;

    size_t slash = path.rfind('/');
    size_t name_at = slash == std::string::npos ? 0 : slash + 1;
    // The temporary name must fit where the target's did (255 bytes).
    std::string temp = path.substr(0, name_at) + "." + path.substr(name_at, 200) + ".velmtmp-XXXXXX";
    UniqueFd fd(mkostemp(temp.data(), O_CLOEXEC));
    if (!fd) {
        set_last_error(error_of_errno(errno, AUDIO_ERROR_WRITE));
        return nullptr;
    }
    // The saved file keeps the owner and permissions of the one it replaces;
    // where the process may not give files away, it becomes ours.
    if (exists) {
        [[maybe_unused]] int kept_owner = fchown(fd.get(), st.st_uid, st.st_gid);
    }
    fchmod(fd.get(), exists ? (st.st_mode & 07777) : new_file_mode());
    auto writer = std::make_unique<SndfileWriter>(path, temp, std::move(fd));
    SF_INFO info{};
    info.samplerate = format.sampleRate;
    info.channels = format.numChannels;
    info.format = sf;
    if (int error = writer->open(info, wave, f.quality, meta); error != AUDIO_ERROR_NONE) {
        set_last_error(error);
        return nullptr;
    }
    return writer;
}

}  // namespace

std::unique_ptr<FileWriter> create_writer(const char *path, const _audio_format &format, const char *format_text,
                                          const AUDIOMETADATA *meta) {
    if (!path || !*path || !AUDIO_IsValidFormat(&format)) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return nullptr;
    }
    ParsedFormat parsed;
    if (!parse_format_string(format_text, &parsed)) {
        set_last_error(AUDIO_ERROR_BAD_FORMAT_STRING);
        return nullptr;
    }
    try {
        return create_at(path, format, parsed, meta, 0);
    } catch (const std::bad_alloc &) {
        set_last_error(AUDIO_ERROR_OUT_OF_MEMORY);
        return nullptr;
    }
}

}  // namespace velmsig
