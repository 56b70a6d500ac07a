// Text conversion: Latin-1 bytes, with two-character backslash escapes for
// the symbols and combining marks of phonetic transcriptions.
#include "render/canvas/qt/qtcanvas_internal.h"

#include <algorithm>
#include <array>

namespace velm::canvas::qt {
namespace {

struct Escape {
    char first;
    char second;
    char16_t symbol;

    constexpr bool operator<(const Escape &other) const
    {
        return first != other.first ? first < other.first : second < other.second;
    }
};

// Sorted by code, for the binary search below.
constexpr std::array<Escape, 115> kEscapes = {{
    {'\'', '1', 0x02C8},
    {'\'', '2', 0x02CC},
    {'\'', '^', 0x0301},
    {'+', 'v', 0x031F},
    {'-', '^', 0x0304},
    {'-', 'v', 0x0331},
    {'0', '^', 0x030A},
    {'0', 'v', 0x0325},
    {'3', 'v', 0x0339},
    {'9', '-', 0x02A2},
    {'9', 'e', 0x0295},
    {':', '^', 0x0308},
    {':', 'f', 0x02D0},
    {':', 'v', 0x0324},
    {'?', '-', 0x02A1},
    {'?', 'g', 0x0294},
    {'D', 'v', 0x033B},
    {'G', '^', 0x029B},
    {'N', '^', 0x0306},
    {'N', 'v', 0x032A},
    {'O', '.', 0x0298},
    {'O', 'e', 0x0152},
    {'T', '(', 0x0318},
    {'T', ')', 0x0319},
    {'T', '^', 0x031D},
    {'T', 'v', 0x031E},
    {'U', 'v', 0x033A},
    {'^', '^', 0x0302},
    {'`', '^', 0x0300},
    {'a', 'b', 0x0252},
    {'a', 'e', 0x00E6},
    {'a', 's', 0x0251},
    {'a', 't', 0x0250},
    {'b', '^', 0x0253},
    {'b', 'c', 0x0299},
    {'b', 'f', 0x03B2},
    {'b', 's', 0x005C},
    {'c', ',', 0x00E7},
    {'c', 'c', 0x0255},
    {'c', 'f', 0x03C7},
    {'c', 'n', 0x031A},
    {'c', 't', 0x0254},
    {'c', 'v', 0x031C},
    {'d', '.', 0x0256},
    {'d', '^', 0x0257},
    {'d', 'h', 0x00F0},
    {'e', '-', 0x0258},
    {'e', 'f', 0x025B},
    {'e', 'r', 0x025C},
    {'f', '.', 0x027E},
    {'f', 'f', 0x0278},
    {'f', 'h', 0x027E},
    {'g', '^', 0x0260},
    {'g', 'c', 0x0262},
    {'g', 'f', 0x0263},
    {'g', 's', 0x0261},
    {'h', '-', 0x0127},
    {'h', '.', 0x2027},
    {'h', '^', 0x0266},
    {'h', 'c', 0x029C},
    {'h', 'j', 0x0267},
    {'h', 'r', 0x02DE},
    {'h', 's', 0x028A},
    {'h', 't', 0x0265},
    {'i', '-', 0x0268},
    {'j', '-', 0x025F},
    {'j', '^', 0x0284},
    {'j', 'c', 0x029D},
    {'k', 'b', 0x025E},
    {'l', '-', 0x026C},
    {'l', '.', 0x026D},
    {'l', 'c', 0x029F},
    {'l', 'i', 0x0361},
    {'l', 'z', 0x026E},
    {'l', '~', 0x026B},
    {'m', 'j', 0x0271},
    {'m', 'l', 0x0270},
    {'m', 't', 0x026F},
    {'n', '.', 0x0273},
    {'n', 'c', 0x0274},
    {'n', 'g', 0x014A},
    {'n', 'j', 0x0272},
    {'n', 'v', 0x032F},
    {'o', '-', 0x0275},
    {'o', '/', 0x00F8},
    {'o', 'e', 0x0276},
    {'r', '.', 0x027B},
    {'r', 'c', 0x0280},
    {'r', 'h', 0x0264},
    {'r', 'i', 0x0281},
    {'r', 'l', 0x027A},
    {'r', 't', 0x0279},
    {'s', '.', 0x0282},
    {'s', 'h', 0x0283},
    {'s', 'r', 0x025A},
    {'s', 'w', 0x0259},
    {'t', '.', 0x0288},
    {'t', 'f', 0x03B8},
    {'u', '-', 0x0289},
    {'v', '^', 0x030C},
    {'v', 's', 0x028B},
    {'v', 't', 0x028C},
    {'w', 't', 0x028D},
    {'y', 'c', 0x028F},
    {'y', 't', 0x028E},
    {'z', '.', 0x0290},
    {'z', 'c', 0x0291},
    {'z', 'h', 0x0292},
    {'|', '-', 0x01C2},
    {'|', '1', 0x01C0},
    {'|', '2', 0x01C1},
    {'|', 'f', 0x007C},
    {'|', 'v', 0x0329},
    {'~', '^', 0x0303},
    {'~', 'v', 0x0330},
}};

static_assert(std::is_sorted(kEscapes.begin(), kEscapes.end()));

QChar EscapedSymbol(char first, char second)
{
    const Escape key{first, second, 0};
    const auto found = std::lower_bound(kEscapes.begin(), kEscapes.end(), key);
    if (found == kEscapes.end() || found->first != first || found->second != second) return QChar('?');
    return QChar(found->symbol);
}

bool EndsWord(char c)
{
    return c == ' ' || c == '\n' || c == '\0';
}

} // namespace

QString _Convert2QString(const char *text)
{
    QString result;
    for (const char *p = text; *p;) {
        if (*p != '\\') {
            result += QChar(static_cast<unsigned char>(*p++));
        } else if (p[1] == '\0') {
            ++p; // a lone backslash at the end is dropped
        } else if (p[1] == '\'' && EndsWord(p[2])) {
            result += QChar(0x02BC); // modifier apostrophe; the blank after it stays
            p += 2;
        } else if (p[2] == '\0') {
            result += QChar('?');
            p += 2;
        } else {
            result += EscapedSymbol(p[1], p[2]);
            p += 3;
        }
    }
    return result;
}

} // namespace velm::canvas::qt
