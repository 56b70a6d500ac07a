// Small text helpers shared by the format and link parsers.
#pragma once

#include <strings.h>

#include <string_view>

namespace velmsig {

inline bool equals_nocase(std::string_view a, std::string_view b) {
    return a.size() == b.size() && strncasecmp(a.data(), b.data(), a.size()) == 0;
}

}  // namespace velmsig
