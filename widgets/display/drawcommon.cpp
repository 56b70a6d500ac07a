// Digit read-outs: a position printed into a fixed pattern and drawn one
// character per cell, so the digits never shift while the value changes.
#include <cinttypes>
#include <cmath>
#include <cstdio>
#include <string>

#include "core/velmutil.h"
#include "widgets/display/velmdrawcommon.h"

namespace {

constexpr uint32_t kRemaining = 0x1;
constexpr uint32_t kBlank = 0x2;
constexpr uint32_t kNoSign = 0x4;
constexpr uint32_t kHoursFolded = 0x8;
constexpr uint32_t kMinutesFolded = 0x10;

// Larger times would overflow the pattern's int fields; no signal is that long.
constexpr double kMaxMilliseconds = 1e12;

// Cell widths of one font: digits, separators and the sign.
struct Cells {
    int digit = 0;
    int separator = 0;
    int sign = 0;
};

void select_font(VELMCANVAS canvas, const VELMCONFIGFONT &config, float size)
{
    _VELMCANVASFONT font{};
    // The caller's name need not end inside its array.
    std::snprintf(font.name, sizeof font.name, "%.*s", static_cast<int>(sizeof config.familyName), config.familyName);
    font.size = size;
    font.style = static_cast<uint32_t>(config.properties);
    VELMCANVAS_SelectFont(canvas, &font);
}

Cells measure(VELMCANVAS canvas, const VELMCONFIGFONT &font, float size)
{
    select_font(canvas, font, size);
    return {VELMCANVAS_TextWidth(canvas, "0"), VELMCANVAS_TextWidth(canvas, ":"), VELMCANVAS_TextWidth(canvas, "-")};
}

bool usable(VELMCANVAS canvas, const VELMCONFIGFONT *font)
{
    return canvas && font;
}

int sign_width(const Cells &cells, uint32_t options)
{
    return options & kNoSign ? 0 : cells.sign;
}

bool is_digit(char c)
{
    return c >= '0' && c <= '9';
}

// The first significant digit: a non-zero digit, or a zero directly before
// "." or at the end of the text.  Everything before it is drawn dim.
size_t first_significant(const std::string &text)
{
    for (size_t i = 0; i < text.size(); ++i) {
        const char c = text[i];
        if (c >= '1' && c <= '9') return i;
        if (c == '0' && (i + 1 == text.size() || text[i + 1] == '.')) return i;
    }
    return text.size();
}

// Draws the sign cell and the text; characters from `small_from` on use a
// font three quarters the size, one pixel lower.  Returns the width drawn.
int draw_cells(VELMCANVAS canvas, const VELMCONFIGFONT &font, uint32_t options, int x, int y, const std::string &text,
               size_t small_from)
{
    const Cells normal = measure(canvas, font, font.size);
    int pen = x;
    if (!(options & kNoSign)) {
        VELMCANVAS_SelectFontColor(canvas, (options & 7) == kRemaining ? font.color : font.inactiveColor);
        VELMCANVAS_DrawChar(canvas, pen, y, '-', normal.sign);
        pen += normal.sign;
    }
    const size_t bright_from = first_significant(text);
    Cells cells = normal;
    int top = y;
    for (size_t i = 0; i < text.size(); ++i) {
        if (i == small_from) {
            cells = measure(canvas, font, font.size * 0.75f);
            top = y + 1;
        }
        const int cell = is_digit(text[i]) ? cells.digit : cells.separator;
        VELMCANVAS_SelectFontColor(canvas, i < bright_from ? font.inactiveColor : font.color);
        VELMCANVAS_DrawChar(canvas, pen, top, text[i], cell);
        pen += cell;
    }
    return pen - x;
}

// Magnitude of a count; the sign has its own cell.
unsigned long long magnitude(int64_t value)
{
    return value < 0 ? 0ull - static_cast<unsigned long long>(value) : static_cast<unsigned long long>(value);
}

std::string time_text(uint32_t options, double seconds)
{
    double ms = std::floor(std::fabs(seconds) * 1000.0 + 0.5);
    if (!(ms < kMaxMilliseconds)) ms = std::isnan(ms) ? 0.0 : kMaxMilliseconds;
    if (options & kBlank) ms = 0.0;
    int h = 0, m = 0, s = 0, f = 0;
    VELMUTIL_DecomposeMsTime(static_cast<int64_t>(ms), &h, &m, &s, &f);
    char text[64];
    if (options & kMinutesFolded)
        std::snprintf(text, sizeof text, "  %06d.%03d", (h * 60 + m) * 60 + s, f);
    else if (options & kHoursFolded)
        std::snprintf(text, sizeof text, " %04d:%02d.%03d", h * 60 + m, s, f);
    else
        std::snprintf(text, sizeof text, "%02d:%02d:%02d.%03d", h, m, s, f);
    return text;
}

} // namespace

int VELMDRAWCOMMON_DrawDisplayTime(VELMCANVAS canvas, const VELMCONFIGFONT *font, uint32_t options, int x, int y,
                                   double seconds)
{
    if (!usable(canvas, font)) return 0;
    return draw_cells(canvas, *font, options, x, y, time_text(options, seconds), std::string::npos);
}

int VELMDRAWCOMMON_DrawDisplaySample(VELMCANVAS canvas, const VELMCONFIGFONT *font, uint32_t options, int x, int y,
                                     int64_t sample)
{
    if (!usable(canvas, font)) return 0;
    char text[32];
    std::snprintf(text, sizeof text, "%010llu", options & kBlank ? 0ull : magnitude(sample));
    return draw_cells(canvas, *font, options, x, y, text, std::string::npos);
}

int VELMDRAWCOMMON_DrawDisplayFrame(VELMCANVAS canvas, const VELMCONFIGFONT *font, uint32_t options, int x, int y,
                                    int64_t frame, int64_t offset)
{
    if (!usable(canvas, font)) return 0;
    const bool blank = (options & kBlank) != 0;
    char text[64];
    const int small_from = std::snprintf(text, sizeof text, "%07llu ", blank ? 0ull : magnitude(frame));
    std::snprintf(text + small_from, sizeof text - small_from, "%04llu", blank ? 0ull : magnitude(offset));
    return draw_cells(canvas, *font, options, x, y, text, static_cast<size_t>(small_from));
}

int VELMDRAWCOMMON_DrawDisplayTimeWidth(VELMCANVAS canvas, const VELMCONFIGFONT *font, uint32_t options)
{
    if (!usable(canvas, font)) return 0;
    const Cells c = measure(canvas, *font, font->size);
    return 9 * c.digit + 3 * c.separator + sign_width(c, options);
}

int VELMDRAWCOMMON_DrawDisplaySampleWidth(VELMCANVAS canvas, const VELMCONFIGFONT *font, uint32_t options)
{
    if (!usable(canvas, font)) return 0;
    const Cells c = measure(canvas, *font, font->size);
    return 10 * c.digit + sign_width(c, options);
}

int VELMDRAWCOMMON_DrawDisplayFrameWidth(VELMCANVAS canvas, const VELMCONFIGFONT *font, uint32_t options)
{
    if (!usable(canvas, font)) return 0;
    const Cells c = measure(canvas, *font, font->size);
    return 10 * c.digit + VELMCANVAS_TextWidth(canvas, ".") + sign_width(c, options);
}
