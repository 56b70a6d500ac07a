#include "tests/outside/signal/file/file_helpers.hpp"

#include <sndfile.h>
#include <stdlib.h>

#include <array>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <sstream>

namespace velmtest {

TempDir::TempDir() {
    std::string templ = std::filesystem::temp_directory_path().string() + "/velm-file-test-XXXXXX";
    path_ = mkdtemp(templ.data()) ? templ : std::string();
}

TempDir::~TempDir() {
    std::error_code ec;
    // A test may leave the folder read-only.
    std::filesystem::permissions(path_, std::filesystem::perms::owner_all, ec);
    std::filesystem::remove_all(path_, ec);
}

std::vector<std::string> TempDir::entries() const {
    std::vector<std::string> names;
    for (const auto &e : std::filesystem::directory_iterator(path_)) names.push_back(e.path().filename().string());
    return names;
}

std::vector<float> test_signal(int channels, int64_t frames) {
    std::vector<float> s(static_cast<size_t>(channels * frames));
    for (int64_t i = 0; i < frames; ++i)
        for (int c = 0; c < channels; ++c)
            s[static_cast<size_t>(i * channels + c)] = static_cast<float>((i * 37 + c * 1000) % 2001 - 1000) * 16 / 32768.0f;
    return s;
}

bool write_sndfile(const std::string &path, int sf_format, int rate, int channels, const std::vector<float> &samples) {
    SF_INFO info{};
    info.samplerate = rate;
    info.channels = channels;
    info.format = sf_format;
    SNDFILE *f = sf_open(path.c_str(), SFM_WRITE, &info);
    if (!f) return false;
    sf_count_t frames = static_cast<sf_count_t>(samples.size()) / channels;
    bool ok = sf_writef_float(f, samples.data(), frames) == frames;
    return sf_close(f) == 0 && ok;
}

int run(const std::string &command) {
    int status = std::system((command + " >/dev/null 2>&1").c_str());
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

std::string output_of(const std::string &command) {
    std::string text;
    FILE *p = popen((command + " 2>&1").c_str(), "r");
    if (!p) return text;
    std::array<char, 256> buf;
    while (size_t n = fread(buf.data(), 1, buf.size(), p)) text.append(buf.data(), n);
    pclose(p);
    return text;
}

std::string slurp(const std::string &path) {
    std::ifstream in(path, std::ios::binary);
    std::ostringstream s;
    s << in.rdbuf();
    return s.str();
}

void write_text(const std::string &path, const std::string &text) {
    std::ofstream(path, std::ios::binary) << text;
}

}  // namespace velmtest
