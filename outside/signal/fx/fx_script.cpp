#include "outside/signal/fx/fx_script.hpp"

#include "outside/base/blbase.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <cmath>

namespace velmsig::fx {
namespace {

std::string_view trim(std::string_view text)
{
    while (!text.empty() && std::isspace(static_cast<unsigned char>(text.front())))
        text.remove_prefix(1);
    while (!text.empty() && std::isspace(static_cast<unsigned char>(text.back())))
        text.remove_suffix(1);
    return text;
}

std::string lower(std::string_view text)
{
    std::string out(text);
    std::transform(out.begin(), out.end(), out.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return out;
}

std::string quoted(std::string_view text)
{
    return "\"" + std::string(text) + "\"";
}

// Cuts text at every separator outside brackets; throws on unbalanced brackets.
std::vector<std::string_view> split_outside_brackets(std::string_view text, char separator,
                                                     std::string_view whole)
{
    std::vector<std::string_view> parts;
    int depth = 0;
    size_t start = 0;
    for (size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '[') {
            ++depth;
        } else if (text[i] == ']') {
            if (--depth < 0)
                throw ScriptError("unbalanced \"]\" in " + quoted(whole));
        } else if (text[i] == separator && depth == 0) {
            parts.push_back(text.substr(start, i - start));
            start = i + 1;
        }
    }
    if (depth != 0)
        throw ScriptError("unbalanced \"[\" in " + quoted(whole));
    parts.push_back(text.substr(start));
    return parts;
}

bool is_name_char(char c)
{
    return std::isalnum(static_cast<unsigned char>(c)) || c == '_';
}

StageText parse_stage(std::string_view text)
{
    StageText stage;
    stage.text = std::string(trim(text));
    std::string_view rest = stage.text;
    if (rest.empty())
        throw ScriptError("empty stage");
    size_t n = 0;
    while (n < rest.size() && is_name_char(rest[n]))
        ++n;
    if (n == 0)
        throw ScriptError("stage without a name: " + quoted(rest));
    stage.name = lower(rest.substr(0, n));
    rest = trim(rest.substr(n));
    if (rest.empty())
        return stage;
    if (rest.front() != '[' || rest.back() != ']')
        throw ScriptError("expected \"[key=value,...]\" after the stage name in " + quoted(stage.text));
    std::string_view inside = trim(rest.substr(1, rest.size() - 2));
    if (inside.empty())
        return stage;
    for (std::string_view item : split_outside_brackets(inside, ',', stage.text)) {
        size_t eq = item.find('=');
        std::string key = lower(trim(item.substr(0, eq)));
        if (eq == std::string_view::npos || key.empty() || !std::all_of(key.begin(), key.end(), is_name_char))
            throw ScriptError("malformed key " + quoted(trim(item)) + " in " + quoted(stage.text));
        std::string_view value = trim(item.substr(eq + 1));
        if (value.empty())
            throw ScriptError("key \"" + key + "\" without a value in " + quoted(stage.text));
        for (const auto &[k, v] : stage.params)
            if (k == key)
                throw ScriptError("key \"" + key + "\" given twice in " + quoted(stage.text));
        stage.params.emplace_back(std::move(key), std::string(value));
    }
    return stage;
}

// A finite number written in full ("1", "-0.5", "+3", "1e-3").
std::optional<double> parse_number(std::string_view text)
{
    text = trim(text);
    if (!text.empty() && text.front() == '+')
        text.remove_prefix(1);
    double value = 0;
    auto [end, ec] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (ec != std::errc() || end != text.data() + text.size() || text.empty() || !std::isfinite(value))
        return std::nullopt;
    return value;
}

bool all_finite(const std::vector<double> &values)
{
    return std::all_of(values.begin(), values.end(), [](double v) { return std::isfinite(v); });
}

// "[a,b,...]" with at least one finite number.
std::optional<std::vector<double>> parse_vector(const std::string &text)
{
    const int count = BLSTRING_GetDoubleVectorFromString(text.c_str(), nullptr, 0);
    if (count <= 0)
        return std::nullopt;
    std::vector<double> values(static_cast<size_t>(count));
    if (BLSTRING_GetDoubleVectorFromString(text.c_str(), values.data(), count) != count ||
        !all_finite(values))
        return std::nullopt;
    return values;
}

// "[[a,b],[c,d]]" with at least one finite number.
std::optional<Matrix> parse_matrix(const std::string &text)
{
    Matrix m;
    const int count = BLSTRING_GetDoubleMatrixFromString(text.c_str(), nullptr, 0, &m.rows, &m.columns);
    if (count <= 0)
        return std::nullopt;
    m.values.resize(static_cast<size_t>(count));
    if (BLSTRING_GetDoubleMatrixFromString(text.c_str(), m.values.data(), count, &m.rows, &m.columns) !=
            count ||
        !all_finite(m.values))
        return std::nullopt;
    return m;
}

}  // namespace

std::vector<StageText> split_script(std::string_view script)
{
    if (trim(script).empty())
        throw ScriptError("empty script");
    std::vector<StageText> stages;
    for (std::string_view text : split_outside_brackets(script, ':', script))
        stages.push_back(parse_stage(text));
    return stages;
}

StageParams::StageParams(const StageText &stage) : stage_(stage), used_(stage.params.size(), false) {}

const std::string *StageParams::find(std::string_view key)
{
    for (size_t i = 0; i < stage_.params.size(); ++i) {
        if (stage_.params[i].first == key) {
            used_[i] = true;
            return &stage_.params[i].second;
        }
    }
    return nullptr;
}

void StageParams::fail(std::string_view key, std::string_view why) const
{
    throw ScriptError("\"" + std::string(key) + "\" " + std::string(why) + " in " + quoted(stage_.text));
}

std::optional<double> StageParams::number(std::string_view key)
{
    const std::string *text = find(key);
    if (!text)
        return std::nullopt;
    auto value = parse_number(*text);
    if (!value)
        fail(key, "is not a number");
    return value;
}

std::optional<int64_t> StageParams::integer(std::string_view key, int64_t min, int64_t max)
{
    const std::string *text = find(key);
    if (!text)
        return std::nullopt;
    std::string_view digits = trim(*text);
    if (!digits.empty() && digits.front() == '+')
        digits.remove_prefix(1);
    int64_t value = 0;
    auto [end, ec] = std::from_chars(digits.data(), digits.data() + digits.size(), value);
    if (ec != std::errc() || end != digits.data() + digits.size() || digits.empty())
        fail(key, "is not a whole number");
    if (value < min || value > max)
        fail(key, "must lie in " + std::to_string(min) + " .. " + std::to_string(max));
    return value;
}

std::optional<std::string> StageParams::word(std::string_view key)
{
    const std::string *text = find(key);
    if (!text)
        return std::nullopt;
    return lower(*text);
}

std::optional<std::vector<double>> StageParams::per_channel(std::string_view key, int channels)
{
    const std::string *text = find(key);
    if (!text)
        return std::nullopt;
    std::optional<std::vector<double>> values;
    if (auto single = parse_number(*text))
        values = std::vector<double>{*single};
    else
        values = parse_vector(*text);
    if (!values)
        fail(key, "is not a number or a vector \"[a,b,...]\"");
    if (values->size() == 1)
        values->assign(channels, values->front());
    else if (values->size() != static_cast<size_t>(channels))
        fail(key, "has " + std::to_string(values->size()) + " values for " + std::to_string(channels) +
                      " channels");
    return values;
}

std::optional<Matrix> StageParams::matrix(std::string_view key)
{
    const std::string *text = find(key);
    if (!text)
        return std::nullopt;
    auto m = parse_matrix(*text);
    if (!m)
        fail(key, "is not a matrix \"[[a,b],[c,d]]\" of numbers");
    return m;
}

void StageParams::finish() const
{
    for (size_t i = 0; i < used_.size(); ++i)
        if (!used_[i])
            throw ScriptError("unknown key \"" + stage_.params[i].first + "\" in " + quoted(stage_.text));
}

}  // namespace velmsig::fx
