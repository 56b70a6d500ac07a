// Shared helpers of the file tests: a scratch folder, known test signals and
// files written with libsndfile directly.
#pragma once

#include <cstdint>
#include <string>
#include <vector>


namespace velmtest {

// A fresh folder, removed with everything in it at the end of the test.
class TempDir {
public:
    TempDir();
    ~TempDir();
    std::string file(const std::string &name) const { return path_ + "/" + name; }
    const std::string &path() const { return path_; }
    std::vector<std::string> entries() const;  // names in the folder

private:
    std::string path_;
};

// Interleaved samples that 16-bit files store exactly: a different ramp on
// each channel.
std::vector<float> test_signal(int channels, int64_t frames);

// Writes samples with libsndfile; false when it refuses the format.
bool write_sndfile(const std::string &path, int sf_format, int rate, int channels, const std::vector<float> &samples);

// Runs a shell command quietly; its exit status.
int run(const std::string &command);
// The output of a shell command.
std::string output_of(const std::string &command);

std::string slurp(const std::string &path);
void write_text(const std::string &path, const std::string &text);

}  // namespace velmtest
