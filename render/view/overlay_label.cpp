// The duration box of the selection being made: the length in the unit of
// the horizontal scale, in a dark rounded box near the selection's begin.
#include <algorithm>
#include <cstdlib>

#include "core/document_internal.hpp"
#include "core/velmtimeconv.h"
#include "render/view/overlay_internal.hpp"
#include "widgets/display/velmdrawcommon.h"

namespace velm::view {
namespace {

constexpr int kBoxHeight = 40;
constexpr int kMargin = 5;

enum class Unit { Samples, Time, Frames };

Unit unit_of(int horz_scale_kind)
{
    switch (horz_scale_kind) {
    case 1: case 4: return Unit::Time;
    case 2: case 5: return Unit::Frames;
    default: return Unit::Samples;
    }
}

int readout_width(VELMCANVAS canvas, const VELMCONFIGFONT *font, Unit unit)
{
    switch (unit) {
    case Unit::Time: return VELMDRAWCOMMON_DrawDisplayTimeWidth(canvas, font, 0);
    case Unit::Frames: return VELMDRAWCOMMON_DrawDisplayFrameWidth(canvas, font, 0);
    default: return VELMDRAWCOMMON_DrawDisplaySampleWidth(canvas, font, 0);
    }
}

int draw_readout(VELMDRAW d, const VELMCONFIGFONT *font, Unit unit, int x, int y, double begin, double end)
{
    const int64_t samples = std::llabs(VELMAUDIO_TimeToSample(d->document, end) -
                                       VELMAUDIO_TimeToSample(d->document, begin));
    switch (unit) {
    case Unit::Time: return VELMDRAWCOMMON_DrawDisplayTime(d->canvas, font, 0, x, y, end - begin);
    case Unit::Frames: {
        const int64_t frame = std::max<int64_t>(1, VELMAUDIO_ScaleFrameLength(d->document));
        return VELMDRAWCOMMON_DrawDisplayFrame(d->canvas, font, 0, x, y, samples / frame, samples % frame);
    }
    default: return VELMDRAWCOMMON_DrawDisplaySample(d->canvas, font, 0, x, y, samples);
    }
}

// Top of the first lane that shows an active channel; the lanes' top when
// none does.
int first_lane_top(VELMDRAW d)
{
    for (int i = 0; i < d->laneCount; ++i)
        if (active_main_lane(d->lanes[static_cast<size_t>(i)])) return d->lanes[static_cast<size_t>(i)].area.top;
    return d->lanesArea.top;
}

} // namespace

int draw_selecting_label(VELMDRAW d, const VELMSTATE *state)
{
    if (!(state->viewFlags & 0x20000u) || state->selecting.begin == state->selecting.end) return 1;
    const double begin = std::min(state->selecting.begin, state->selecting.end);
    const double end = std::max(state->selecting.begin, state->selecting.end);
    const VELMCONFIGFONT *font = &d->config.selectingLabelFont;
    const Unit unit = unit_of(state->horzScaleKind);
    const int width = readout_width(d->canvas, font, unit) + 12;
    if (width <= 12) return 0;

    const VELMTIMEBASE *base = &d->mainBase;
    const int begin_column = column_of_time(d, base, begin);
    int x = begin_column + kMargin;
    const int64_t cursor = state->cursor.position;
    if (cursor == VELMAUDIO_TimeToSample(d->document, end)) {
        const int left_of_cursor = column_of(base, static_cast<double>(cursor)) - width - kMargin;
        if (left_of_cursor > begin_column) x = left_of_cursor;
    }
    x = std::min(std::max(x, kMargin), d->display.width - width - kMargin);
    x += d->display.left;
    const int y = first_lane_top(d) + kMargin;
    const _VELMRECT box = make_rect(x, y, width, kBoxHeight);

    VELMCANVAS canvas = d->canvas;
    VELMCANVAS_SaveOverlayRect(canvas, &box);
    fill_alpha(canvas, box, 0, 0.35f, 20);
    int ok = draw_readout(d, font, unit, x + 6, y + 5, begin, end);
    char label[17] = "";
    VELMAUDIO_HorzScaleLabelKindString(d->document, 0, label, sizeof label);
    const _VELMCANVASFONT info = canvas_font(d->config.selectingLabelInfoFont);
    VELMCANVAS_SelectFont(canvas, &info);
    VELMCANVAS_SelectFontColor(canvas, d->config.selectingLabelInfoFont.color);
    ok &= VELMCANVAS_TextOut(canvas, box.right - 6 - VELMCANVAS_TextWidth(canvas, label), y + 22, label);
    mark_dirty_rect(d, box);
    VELMCANVAS_SetAlphaFactor(canvas, 1.0f);
    return ok ? 1 : 0;
}

} // namespace velm::view
