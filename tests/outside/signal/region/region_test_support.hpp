// A stand-in for the signal that holds a region set, and scratch files.
#ifndef REGION_TEST_SUPPORT_HPP
#define REGION_TEST_SUPPORT_HPP

#include <unistd.h>

#include <cmath>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>
#include <string>
#include <vector>

#include "outside/signal/region/region_internal.hpp"

struct TestHost : velmsig::RegionHost {
    int rate = 8000;
    int64_t frames = 80000;   // ten seconds
    std::map<std::string, int> tracks{{"default", 0}};
    std::vector<std::pair<std::string, std::string>> labels;
    int changes = 0;

    AUDIOSIGNAL *region_signal() override { return reinterpret_cast<AUDIOSIGNAL *>(this); }
    int region_sample_rate() const override { return rate; }
    int64_t region_frames() const override { return frames; }
    int region_request(uint32_t code, void *data1, void *data2) override
    {
        const std::string name = static_cast<const char *>(data1);
        if (code == 0x10025) {
            auto it = tracks.find(name);
            if (it == tracks.end()) {
                if (tracks.size() >= 8) return 0;
                it = tracks.emplace(name, int(tracks.size())).first;
            }
            *static_cast<int32_t *>(data2) = it->second;
            return 1;
        }
        if (code == 0x10026) {
            labels.emplace_back(name, static_cast<const char *>(data2));
            return 1;
        }
        return 0;
    }
    void regions_changed() override { ++changes; }
};

// First and end sample of a region.
inline std::pair<int64_t, int64_t> span(const AUDIOREGION *r)
{
    return {AUDIOREGION_BeginSample(r), AUDIOREGION_EndSample(r)};
}

using Span = std::pair<int64_t, int64_t>;

// A folder of its own under the test binary folder, removed afterwards.
class ScratchDir {
public:
    ScratchDir()
    {
        path_ = std::filesystem::path(VELM_TEST_BINARY_DIR) /
                ("scratch-" + std::to_string(::getpid()) + "-" + std::to_string(counter()++));
        std::filesystem::create_directories(path_);
    }
    ~ScratchDir() { std::filesystem::remove_all(path_); }
    std::string file(const std::string &name) const { return (path_ / name).string(); }
    std::vector<std::string> names() const
    {
        std::vector<std::string> out;
        for (const auto &entry : std::filesystem::directory_iterator(path_))
            out.push_back(entry.path().filename().string());
        return out;
    }

private:
    static int &counter()
    {
        static int n = 0;
        return n;
    }
    std::filesystem::path path_;
};

inline void write_bytes(const std::string &path, const std::string &bytes)
{
    std::ofstream(path, std::ios::binary) << bytes;
}

inline std::string read_bytes(const std::string &path)
{
    std::ifstream in(path, std::ios::binary);
    std::ostringstream out;
    out << in.rdbuf();
    return out.str();
}

#endif  // REGION_TEST_SUPPORT_HPP
