// Cue points and labelled ranges of WAV files: the "cue " chunk gives the
// positions, the LIST chunk of type "adtl" their labels ("labl"), notes
// ("note", kept as comments) and lengths ("ltxt").  Chunk sizes are never
// trusted: everything is checked against the file's real size.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cmath>
#include <cstring>
#include <map>
#include <vector>

#include "outside/signal/region/region_files.hpp"

namespace velmsig {

namespace {

constexpr uint64_t kMaxMetaChunk = uint64_t(8) << 20;   // cue and adtl chunks we read
constexpr size_t kCopyBuffer = size_t(1) << 20;
constexpr size_t kMaxChunks = 4096;

uint32_t le32(const unsigned char *p)
{
    return uint32_t(p[0]) | uint32_t(p[1]) << 8 | uint32_t(p[2]) << 16 | uint32_t(p[3]) << 24;
}

void put32(std::string &out, uint32_t v)
{
    for (int i = 0; i < 4; ++i) out += char((v >> (8 * i)) & 0xFF);
}

struct Chunk {
    std::string id;
    uint64_t body = 0;   // file offset of the chunk's data
    uint64_t size = 0;   // bytes of data present in the file
    std::string list_type;
};

class WaveFile {
public:
    explicit WaveFile(const char *path) : fd_(::open(path, O_RDONLY | O_CLOEXEC))
    {
        if (fd_ < 0) error_ = open_error(errno, false);
    }
    ~WaveFile()
    {
        if (fd_ >= 0) ::close(fd_);
    }
    WaveFile(const WaveFile &) = delete;
    WaveFile &operator=(const WaveFile &) = delete;

    // Reads the chunk list; AUDIO_ERROR_NONE or a code.
    int scan(std::vector<std::string> *problems)
    {
        if (error_) return error_;
        struct stat st {};
        if (::fstat(fd_, &st) != 0 || !S_ISREG(st.st_mode)) return AUDIO_ERROR_READ;
        const uint64_t file_size = size_ = uint64_t(st.st_size);
        unsigned char head[12];
        if (!read_at(0, head, sizeof head) || std::memcmp(head, "RIFF", 4) != 0 ||
            std::memcmp(head + 8, "WAVE", 4) != 0)
            return AUDIO_ERROR_UNSUPPORTED_FORMAT;
        // No chunk starts after the RIFF body, but one that starts inside
        // runs to its own size: a recording whose RIFF size was never
        // updated keeps its audio.  A RIFF size past the end is not trusted.
        const uint64_t riff_end = uint64_t(le32(head + 4)) + 8;
        const uint64_t chunks_end = riff_end >= 12 && riff_end < file_size ? riff_end : file_size;
        uint64_t at = 12;
        while (at + 8 <= chunks_end) {
            if (chunks_.size() >= kMaxChunks) return AUDIO_ERROR_CORRUPT_DATA;
            unsigned char h[8];
            if (!read_at(at, h, sizeof h)) return AUDIO_ERROR_READ;
            Chunk chunk;
            chunk.id.assign(reinterpret_cast<char *>(h), 4);
            chunk.body = at + 8;
            const uint64_t declared = le32(h + 4);
            chunk.size = std::min(declared, file_size - chunk.body);
            if (chunk.size < declared && chunk.id != "data")
                problems->push_back("chunk '" + chunk.id + "' is cut short");
            if (chunk.id == "LIST" && chunk.size >= 4) {
                char type[4];
                if (!read_at(chunk.body, type, 4)) return AUDIO_ERROR_READ;
                chunk.list_type.assign(type, 4);
            }
            chunks_.push_back(chunk);
            at = chunk.body + chunk.size + (chunk.size & 1);
        }
        return AUDIO_ERROR_NONE;
    }

    const std::vector<Chunk> &chunks() const { return chunks_; }
    uint64_t size() const { return size_; }

    bool read_at(uint64_t offset, void *out, size_t size) const
    {
        auto *p = static_cast<char *>(out);
        while (size > 0) {
            const ssize_t n = ::pread(fd_, p, size, off_t(offset));
            if (n < 0 && errno == EINTR) continue;
            if (n <= 0) return false;
            p += n;
            size -= size_t(n);
            offset += uint64_t(n);
        }
        return true;
    }

    bool body(const Chunk &chunk, std::string *out) const
    {
        if (chunk.size > kMaxMetaChunk) return false;
        out->resize(size_t(chunk.size));
        return read_at(chunk.body, out->data(), out->size());
    }

    // The sample rate of the "fmt " chunk, 0 when missing.
    uint32_t sample_rate() const
    {
        for (const Chunk &c : chunks_) {
            unsigned char fmt[8];
            if (c.id == "fmt " && c.size >= 16 && read_at(c.body, fmt, sizeof fmt))
                return le32(fmt + 4);
        }
        return 0;
    }

private:
    int fd_;
    int error_ = AUDIO_ERROR_NONE;
    std::vector<Chunk> chunks_;
    uint64_t size_ = 0;
};

bool is_region_chunk(const Chunk &c)
{
    return c.id == "cue " || (c.id == "LIST" && c.list_type == "adtl");
}

std::string zstring(const std::string &data, size_t from)
{
    if (from >= data.size()) return std::string();
    const size_t end = data.find('\0', from);
    return data.substr(from, end == std::string::npos ? std::string::npos : end - from);
}

struct CueText {
    std::optional<std::string> label, note, text;
    uint32_t length = 0;
};

void parse_adtl(const std::string &list, std::map<uint32_t, CueText> *texts,
                std::vector<std::string> *problems)
{
    size_t at = 4;   // after the list type
    while (at + 8 <= list.size()) {
        const auto *p = reinterpret_cast<const unsigned char *>(list.data() + at);
        const std::string id = list.substr(at, 4);
        const size_t size = le32(p + 4);
        const size_t body = at + 8;
        if (size > list.size() - body || size < 4) {
            problems->push_back("adtl entry '" + id + "' is malformed");
            return;
        }
        const std::string data = list.substr(body, size);
        const auto *d = reinterpret_cast<const unsigned char *>(data.data());
        CueText &t = (*texts)[le32(d)];
        if (id == "labl")
            t.label = zstring(data, 4);
        else if (id == "note")
            t.note = zstring(data, 4);
        else if (id == "ltxt" && size >= 20) {
            t.length = le32(d + 4);
            if (size > 20) t.text = zstring(data, 20);
        }
        at = body + size + (size & 1);
    }
}

std::string chunk(const char *id, const std::string &body)
{
    std::string out(id, 4);
    put32(out, uint32_t(body.size()));
    out += body;
    if (body.size() & 1) out += '\0';
    return out;
}

std::string text_entry(const char *id, uint32_t cue, const std::string &text)
{
    std::string body;
    put32(body, cue);
    body += text;
    body += '\0';
    return chunk(id, body);
}

// The new cue and LIST/adtl chunks, positions at the file's rate.
std::string region_chunks(const RegionFileContent &content, uint32_t rate)
{
    std::string cues, adtl("adtl");
    uint32_t count = 0;
    for (const RegionRecord &rec : content.regions) {
        const double first = std::round(rec.begin * rate);
        const double last = std::round((rec.begin + rec.length) * rate);
        if (first < 0 || last > double(UINT32_MAX)) continue;   // beyond what cues can hold
        const uint32_t id = ++count;
        put32(cues, id);
        put32(cues, uint32_t(first));
        cues += "data";
        put32(cues, 0);
        put32(cues, 0);
        put32(cues, uint32_t(first));
        if (rec.label) adtl += text_entry("labl", id, *rec.label);
        if (rec.comment) adtl += text_entry("note", id, *rec.comment);
        if (last > first) {
            std::string ltxt;
            put32(ltxt, id);
            put32(ltxt, uint32_t(last - first));
            ltxt += "rgn ";
            ltxt.append(8, '\0');   // country, language, dialect, code page
            adtl += chunk("ltxt", ltxt);
        }
    }
    if (count == 0) return std::string();
    std::string head;
    put32(head, count);
    return chunk("cue ", head + cues) + chunk("LIST", adtl);
}

}  // namespace

int read_wave_cues(const char *path, RegionFileContent *out)
{
    WaveFile file(path);
    if (const int error = file.scan(&out->problems)) return error;
    const uint32_t rate = file.sample_rate();

    std::vector<std::pair<uint32_t, uint32_t>> cues;   // id, sample offset
    std::map<uint32_t, CueText> texts;
    for (const Chunk &c : file.chunks()) {
        if (!is_region_chunk(c)) continue;
        std::string data;
        if (!file.body(c, &data)) {
            out->problems.push_back("chunk '" + c.id + "' is too large or unreadable");
            continue;
        }
        if (c.id == "LIST") {
            parse_adtl(data, &texts, &out->problems);
            continue;
        }
        const auto *d = reinterpret_cast<const unsigned char *>(data.data());
        const size_t declared = data.size() >= 4 ? le32(d) : 0;
        const size_t present = data.size() >= 4 ? (data.size() - 4) / 24 : 0;
        if (declared > present)
            out->problems.push_back("cue chunk holds fewer points than it says");
        for (size_t i = 0; i < std::min(declared, present); ++i) {
            const unsigned char *e = d + 4 + 24 * i;
            cues.emplace_back(le32(e), le32(e + 20));
        }
    }
    if (!cues.empty() && rate == 0) return AUDIO_ERROR_CORRUPT_DATA;

    for (const auto &[id, offset] : cues) {
        if (out->regions.size() >= RegionSet::kMaxRegions) {
            out->problems.push_back("too many cue points, the rest is left out");
            break;
        }
        RegionRecord rec;
        rec.begin = double(offset) / rate;
        if (auto it = texts.find(id); it != texts.end()) {
            rec.length = double(it->second.length) / rate;
            rec.label = it->second.label;
            rec.comment = it->second.note ? it->second.note : it->second.text;
        }
        out->regions.push_back(std::move(rec));
    }
    return AUDIO_ERROR_NONE;
}

int write_wave_cues(const char *path, const RegionFileContent &content)
{
    WaveFile file(path);
    std::vector<std::string> problems;
    if (const int error = file.scan(&problems)) return error;
    // Its sizes have wrapped: the chunks found do not describe all of it.
    if (file.size() > UINT32_MAX) return AUDIO_ERROR_WRITE;
    const uint32_t rate = file.sample_rate();
    if (rate == 0) return AUDIO_ERROR_CORRUPT_DATA;

    const std::string added = region_chunks(content, rate);
    uint64_t total = 4 + added.size();
    for (const Chunk &c : file.chunks())
        if (!is_region_chunk(c)) total += 8 + c.size + (c.size & 1);
    if (total > UINT32_MAX) return AUDIO_ERROR_WRITE;

    AtomicWriter writer(path);
    std::string head("RIFF");
    put32(head, uint32_t(total));
    head += "WAVE";
    writer.write(head.data(), head.size());
    std::vector<char> buffer(kCopyBuffer);
    for (const Chunk &c : file.chunks()) {
        if (is_region_chunk(c)) continue;
        std::string h = c.id;
        put32(h, uint32_t(c.size));
        writer.write(h.data(), h.size());
        for (uint64_t done = 0; done < c.size && !writer.error();) {
            const size_t n = size_t(std::min<uint64_t>(buffer.size(), c.size - done));
            if (!file.read_at(c.body + done, buffer.data(), n)) return AUDIO_ERROR_READ;
            writer.write(buffer.data(), n);
            done += n;
        }
        if (c.size & 1) writer.write("", 1);
    }
    writer.write(added.data(), added.size());
    return writer.commit();
}

}  // namespace velmsig
