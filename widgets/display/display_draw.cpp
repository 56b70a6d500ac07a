// Drawing the display: gradients, the digit read-out in the current unit,
// the unit labels and the signal's rate and channel layout.
#include <cstdio>

#include "core/velmtimeconv.h"
#include "widgets/display/display_internal.hpp"
#include "widgets/display/velmdrawcommon.h"

namespace {

constexpr int kDigitLeft = 6, kDigitTop = 2, kDigitHeight = 26, kLabelHeight = 10;

_VELMRECT rect(int left, int top, int width, int height)
{
    return _VELMRECT{left, top, width, height, left + width - 1, top + height - 1};
}

void select_font(VELMCANVAS canvas, const VELMCONFIGFONT &config, uint32_t colour)
{
    _VELMCANVASFONT font{};
    std::snprintf(font.name, sizeof font.name, "%.*s", static_cast<int>(sizeof config.familyName), config.familyName);
    font.size = config.size;
    font.style = static_cast<uint32_t>(config.properties);
    VELMCANVAS_SelectFont(canvas, &font);
    VELMCANVAS_SelectFontColor(canvas, colour);
}

void label(VELMCANVAS canvas, const VELMCONFIGFONT &font, const _VELMRECT &cell, const char *text, bool bright,
           bool right_aligned = false)
{
    select_font(canvas, font, bright ? font.color : font.inactiveColor);
    const int width = VELMCANVAS_TextWidth(canvas, text);
    const int x = right_aligned ? cell.left + cell.width - width : cell.left + (cell.width - width) / 2;
    VELMCANVAS_TextOut(canvas, x, cell.top, text);
}

void draw_labels(VELMCANVAS canvas, const _VELMDISPLAY *d)
{
    const Layout &l = d->layout;
    const VELMCONFIGFONT &font = d->config.infoFont;
    const int y = l.labels.top;
    auto under = [&](const _VELMRECT &cell) { return rect(cell.left, y, cell.width, kLabelHeight); };
    const int unit = d->now.unit;
    const uint32_t options = d->now.options;
    const bool time = !display_is_sample_unit(unit) && !display_is_frame_unit(unit);
    if (display_is_frame_unit(unit)) {
        label(canvas, font, under(l.samples), "f r a m e", true);
        label(canvas, font, under(l.millis), "s m p l", true, true);
        return;
    }
    label(canvas, font, under(l.hours), "h r", time && !(options & 0x18));
    label(canvas, font, under(l.minutes), "m i n", time && !(options & 0x10));
    label(canvas, font, under(l.seconds), "s e c", time);
    label(canvas, font, under(l.millis), "s m p l", true, true);
}

void draw_digits(VELMCANVAS canvas, const _VELMDISPLAY *d)
{
    const Shown &s = d->now;
    const VELMCONFIGFONT &font = s.editing ? d->config.editFont : d->config.mainFont;
    const int64_t position = s.editing ? s.edit_value : s.position;
    const int x = d->layout.digits.left, y = d->layout.digits.top;
    if (display_is_sample_unit(s.unit)) {
        VELMDRAWCOMMON_DrawDisplaySample(canvas, &font, s.options, x, y, position);
    } else if (display_is_frame_unit(s.unit)) {
        const int64_t length = display_has_doc(d) ? VELMAUDIO_ScaleFrameLength(d->doc) : 0;
        const int64_t frame = length > 0 ? position / length : 0;
        const int64_t offset = length > 0 ? position % length : 0;
        VELMDRAWCOMMON_DrawDisplayFrame(canvas, &font, s.options, x, y, frame, offset);
    } else {
        const double seconds = display_has_doc(d) ? VELMAUDIO_SampleToTime(d->doc, position)
                                                  : static_cast<double>(position) / s.rate;
        VELMDRAWCOMMON_DrawDisplayTime(canvas, &font, s.options, x, y, seconds);
    }
}

void draw_format(VELMCANVAS canvas, const _VELMDISPLAY *d)
{
    const VELMCONFIGFONT &font = d->config.audioFormatFont;
    const int right = d->layout.widget.width - 8;
    char text[32];
    auto right_text = [&](int y) {
        select_font(canvas, font, font.color);
        VELMCANVAS_TextOut(canvas, right - VELMCANVAS_TextWidth(canvas, text), y, text);
    };
    std::snprintf(text, sizeof text, "%d Hz", static_cast<int>(d->now.rate));
    right_text(4);
    if (d->now.channels == 1)
        std::snprintf(text, sizeof text, "mono");
    else if (d->now.channels == 2)
        std::snprintf(text, sizeof text, "stereo");
    else
        std::snprintf(text, sizeof text, "%d channels", static_cast<int>(d->now.channels));
    right_text(15);
}

} // namespace

void display_layout(VELMCANVAS canvas, _VELMDISPLAY *d, int width, int height)
{
    select_font(canvas, d->config.mainFont, d->config.mainFont.color);
    const int digit = VELMCANVAS_TextWidth(canvas, "0");
    const int colon = VELMCANVAS_TextWidth(canvas, ":");
    const int sign = VELMCANVAS_TextWidth(canvas, "-");
    Layout &l = d->layout;
    l.widget = rect(0, 0, width, height);
    l.digits = rect(kDigitLeft, kDigitTop, sign + 2 + 10 * digit, kDigitHeight);
    int x = kDigitLeft;
    l.sign = rect(x, kDigitTop, sign, kDigitHeight);
    x += sign;
    auto cell = [&](int cells) {
        const _VELMRECT r = rect(x, kDigitTop, cells * digit, kDigitHeight);
        x += cells * digit + colon + 1;
        return r;
    };
    l.hours = cell(2);
    l.minutes = cell(2);
    l.seconds = cell(2);
    l.millis = cell(3);
    l.samples = rect(kDigitLeft + sign, kDigitTop, 10 * digit, kDigitHeight + kLabelHeight);
    l.labels = rect(kDigitLeft, kDigitTop + kDigitHeight, l.digits.width, kLabelHeight);
    const int format_left = l.digits.left + l.digits.width + 8;
    l.format = rect(format_left, 0, width - 10 - format_left, height);
}

int VELMDISPLAY_Draw(VELMCANVAS canvas, VELMDISPLAY display, _VELMRECT *out)
{
    if (!canvas || !display)
        return 0;
    int width = 0, height = 0;
    VELMCANVAS_GetDimension(canvas, &width, &height);
    VELMCANVAS_SelectTarget(canvas, VELMCANVASTARGET_OUTPUT);
    display_layout(canvas, display, width, height);
    VELMCANVAS_Clear(canvas);
    const uint32_t *g = display->now.status ? display->config.gradientOn : display->config.gradientOff;
    VELMCANVAS_SelectGradient(canvas, g[0], g[1]);
    VELMCANVAS_FillVertGradientRect(canvas, 0, 0, width, height / 2, 0);
    VELMCANVAS_SelectGradient(canvas, g[1], g[2]);
    VELMCANVAS_FillVertGradientRect(canvas, 0, height / 2, width, height - height / 2, 0);
    draw_digits(canvas, display);
    draw_labels(canvas, display);
    draw_format(canvas, display);
    display->drawn = display->now;
    display->ever_drawn = true;
    if (out)
        *out = display->layout.widget;
    return 1;
}
