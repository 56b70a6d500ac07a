/* Reading setting texts as numbers and flags, whatever the locale. */
#include "outside/base/base_internal.h"
#include "outside/base/settings_internal.h"

#include <charconv>
#include <cmath>
#include <limits>

namespace blbase {

namespace {

// A value may carry the brackets of the read form: "[0.1]" reads as 0.1.
std::string_view Unbracket(std::string_view text)
{
    text = Trim(text);
    if (text.size() >= 2 && text.front() == '[' && text.back() == ']')
        text = Trim(text.substr(1, text.size() - 2));
    if (!text.empty() && text.front() == '+') text.remove_prefix(1);
    return text;
}

std::optional<bool> FlagWord(std::string_view text)
{
    const std::string word = ToLower(text);
    if (word == "true" || word == "yes" || word == "on") return true;
    if (word == "false" || word == "no" || word == "off") return false;
    return std::nullopt;
}

// The whole text as one number (extra is the base or the float format).
template <typename T, typename Extra> std::optional<T> Whole(std::string_view text, Extra extra)
{
    T value{};
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value, extra);
    if (error != std::errc() || end != text.data() + text.size()) return std::nullopt;
    return value;
}

// "0x" hex, as colour words are often written.
std::optional<double> Hex(std::string_view text)
{
    const bool negative = !text.empty() && text[0] == '-';
    if (negative) text.remove_prefix(1);
    if (text.size() < 3 || text[0] != '0' || (text[1] != 'x' && text[1] != 'X')) return std::nullopt;
    const auto value = Whole<unsigned long long>(text.substr(2), 16);
    if (!value) return std::nullopt;
    return negative ? -static_cast<double>(*value) : static_cast<double>(*value);
}

} // namespace

std::optional<double> ReadNumber(std::string_view text)
{
    text = Unbracket(text);
    if (const auto hex = Hex(text)) return hex;
    if (const auto number = Whole<double>(text, std::chars_format::general)) return number;
    if (const auto flag = FlagWord(text)) return *flag ? 1.0 : 0.0;
    return std::nullopt;
}

std::optional<int> ReadInteger(std::string_view text)
{
    text = Unbracket(text);
    const auto number = ReadNumber(text);
    if (!number || std::isnan(*number)) return std::nullopt;
    // A hex word above the signed range is a 32-bit pattern (a colour with alpha).
    if (Hex(text) && *number > std::numeric_limits<int>::max() && *number <= 0xFFFFFFFFu)
        return static_cast<int>(static_cast<uint32_t>(*number));
    if (*number >= std::numeric_limits<int>::max()) return std::numeric_limits<int>::max();
    if (*number <= std::numeric_limits<int>::min()) return std::numeric_limits<int>::min();
    return static_cast<int>(*number);
}

std::optional<bool> ReadFlag(std::string_view text)
{
    if (const auto flag = FlagWord(Unbracket(text))) return flag;
    const auto number = ReadNumber(text);
    if (!number) return std::nullopt;
    return *number != 0;
}

} // namespace blbase
