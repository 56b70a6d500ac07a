// The slow picture around the lanes: view background, buttons, frame and
// navigator shadows, borders and separators.
#include "core/document_internal.hpp"
#include "render/view/drawer_internal.hpp"

using namespace velm::view;

namespace {

bool on(uint32_t flags, uint32_t bit)
{
    return (flags & bit) != 0;
}

void select_font(VELMCANVAS canvas, const VELMCONFIGFONT &config, uint32_t color)
{
    const _VELMCANVASFONT font = canvas_font(config);
    VELMCANVAS_SelectFont(canvas, &font);
    VELMCANVAS_SelectFontColor(canvas, color);
}

void draw_button(VELMDRAW d, const ViewButton &b)
{
    const _VELMRECT &r = b.rect;
    VELMCANVAS_ShadowRect(d->canvas, r.left, r.top, r.width, r.height, 6, 0x7F155010u);
    const uint32_t border = d->config.outerBorderColor;
    const uint32_t darker = b.selected ? border : border - (b.enabled ? 0x181800u : 0x323200u);
    VELMCANVAS_SelectColor(d->canvas, darker);
    VELMCANVAS_FillRect(d->canvas, r.left, r.top, r.width, r.height, 0x50010u);
    select_font(d->canvas, d->config.selectorFont, b.enabled ? 0xFFFFFFu : 0x505000u);
    VELMCANVAS_TextOutVertical(d->canvas, r.left + 16, r.top + 10, b.label);
}

// Frame corners: only the bottom-right one is round unless the scales or a
// top navigator touch it.
uint32_t frame_corners(uint32_t f)
{
    return on(f, 0x4) || on(f, 0x8) || on(f, 0x4000) ? 0xF0000u : 0x70000u;
}

void fill_border(VELMDRAW d, const _VELMRECT &r)
{
    if (r.width > 0 && r.height > 0) VELMCANVAS_FillRect(d->canvas, r.left - 1, r.top - 1, r.width + 2, r.height + 2, 0);
}

} // namespace

int VELMDRAW_DrawBackground(VELMDRAW d)
{
    if (!d || !d->canvas || !d->state) return 0;
    const uint32_t f = d->state->viewFlags;
    if (on(f, 0x1000000)) {
        clear_rect(d->canvas, make_rect(0, 0, d->state->drawWidth, d->state->drawHeight));
        return 1;
    }
    const VELMDRAWCONFIG &c = d->config;
    VELMCANVAS_SelectColor(d->canvas, VELMDRAW_SelectBGColor(d));
    VELMCANVAS_FillRect(d->canvas, 0, 0, d->state->drawWidth, d->state->drawHeight, 0);
    if (on(f, 0x8000))
        for (const ViewButton &b : d->buttons)
            if (!b.selected) draw_button(d, b);

    const _VELMRECT &fr = d->frame;
    uint32_t corners = frame_corners(f);
    if (d->navigatorPosition == 1) corners |= 0x233000u;
    if (d->navigatorPosition == 2) corners |= 0x8CC000u;
    if (on(f, 0x8000)) corners |= 0x2000u;
    if (!on(f, 0x10) && !on(f, 0x20))
        VELMCANVAS_ShadowRect(d->canvas, fr.left, fr.top, fr.width, fr.height + 1, 6,
                              on(f, 0x40) ? 0x7F000000u : 0x7F000000u | corners | 20u);

    if (d->navigatorPosition) {
        const _VELMRECT &n = d->navigator;
        const bool top = d->navigatorPosition == 1;
        if (!on(f, 0x10) && !on(f, 0x20))
            VELMCANVAS_ShadowRect(d->canvas, n.left, n.top, n.width, n.height, 6,
                                  on(f, 0x40) ? 0x7F000000u : top ? 0x7F8DC014u : 0x7F273014u);
        VELMCANVAS_SelectColor(d->canvas, on(f, 0x100) ? c.scaleBgBrush : c.outerBorderColor);
        VELMCANVAS_FillRect(d->canvas, n.left, n.top, n.width, n.height, (top ? 0xC0000u : 0x30000u) | 20u);
    }
    if (on(f, 0x8000))
        for (const ViewButton &b : d->buttons)
            if (b.selected) draw_button(d, b);
    if (!on(f, 0x40)) {
        VELMCANVAS_SelectColor(d->canvas, c.outerBorderColor);
        VELMCANVAS_FillRect(d->canvas, fr.left, fr.top, fr.width, fr.height + 1, (corners & 0xF0000u) | 20u);
    }
    if (!on(f, 0x80)) {
        VELMCANVAS_SelectColor(d->canvas, c.innerBorderColor);
        for (int i = 0; i < d->laneCount; ++i) {
            const Lane &lane = d->lanes[static_cast<size_t>(i)];
            if (!lane.shown) continue;
            fill_border(d, lane.area);
            if (!on(f, 0x8) && lane.kind != VELMDRAW_LANE_NAVIGATOR) fill_border(d, lane.vertScale);
        }
        for (int t = 0; t < VELM_MAX_CUSTOM_TRACKS; ++t)
            if (d->trackShown[static_cast<size_t>(t)]) {
                fill_border(d, d->trackAreas[static_cast<size_t>(t)]);
                if (!on(f, 0x8)) fill_border(d, d->trackScales[static_cast<size_t>(t)]);
            }
        if (!on(f, 0x4)) fill_border(d, d->horzScale);
    }
    return 1;
}

int VELMDRAW_DrawChannelSeparators(VELMDRAW d)
{
    if (!d || !d->canvas || !d->state) return 0;
    const uint32_t f = d->state->viewFlags;
    if (on(f, 0x1000000)) return 1;
    const VELMDRAWCONFIG &c = d->config;
    const uint32_t color = !on(f, 0x100) ? c.outerBorderColor : on(f, 0x40) ? c.scaleBgBrush : c.roundBorderColor;
    VELMCANVAS_SelectColor(d->canvas, color);
    for (const RectList *list : {&d->separators, &d->dividers, &d->trackSeparators})
        for (int i = 0; i < list->count; ++i) {
            const _VELMRECT &r = list->rect[static_cast<size_t>(i)];
            VELMCANVAS_FillRect(d->canvas, r.left, r.top, r.width, r.height, 0);
        }
    VELMCANVAS_SelectColor(d->canvas, c.kindSeparatorMiddleColor);
    for (int i = 0; i < d->dividers.count; ++i) {
        const _VELMRECT &r = d->dividers.rect[static_cast<size_t>(i)];
        if (r.height > 2)
            VELMCANVAS_FillRect(d->canvas, r.left + r.width * 2 / 100, r.top + 1, r.width * 96 / 100, r.height - 2, 0);
    }
    return 1;
}
