// Effect scripts: "name[key=value,...]" stages joined by ":".
#ifndef VELMSIG_FX_SCRIPT_HPP
#define VELMSIG_FX_SCRIPT_HPP

#include <cstdint>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace velmsig::fx {

// A script that cannot be run; what() is the message for the log.
class ScriptError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

struct StageText {
    std::string text;  // the stage as written, blanks around it removed
    std::string name;  // lower case
    std::vector<std::pair<std::string, std::string>> params;  // keys lower case
};

// Splits a script into its stages; throws ScriptError on malformed text.
std::vector<StageText> split_script(std::string_view script);

struct Matrix {
    int rows = 0;
    int columns = 0;
    std::vector<double> values;  // row by row
};

// Typed access to one stage's keys.  Every key must be read by the stage's
// builder: finish() refuses the keys nobody asked for.
class StageParams {
public:
    explicit StageParams(const StageText &stage);

    std::optional<double> number(std::string_view key);
    std::optional<int64_t> integer(std::string_view key, int64_t min, int64_t max);
    std::optional<std::string> word(std::string_view key);
    // A number or vector giving one value per channel: one value for all, or exactly channels.
    std::optional<std::vector<double>> per_channel(std::string_view key, int channels);
    std::optional<Matrix> matrix(std::string_view key);
    void finish() const;

    [[noreturn]] void fail(std::string_view key, std::string_view why) const;

private:
    const std::string *find(std::string_view key);

    const StageText &stage_;
    std::vector<bool> used_;
};

}  // namespace velmsig::fx

#endif
