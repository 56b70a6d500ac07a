// The handles at the ends of the committed selections, recorded in drawing
// order for the controller's hit test.
#include <algorithm>

#include "control/velmcontrol.h"
#include "render/view/overlay_internal.hpp"
#include "render/view/velmoverlays.h"
#include "widgets/resources/velmresources.h"

using namespace velm::view;

int VELMDRAW_DrawSelectionsSlider(VELMDRAW drawer, int first, int last)
{
    if (!drawer || !drawer->canvas || !drawer->state || !drawer->laidOut) return 0;
    OverlayLayout &layout = drawer->overlay;
    layout.selectionSliderCount = 0;
    if (drawer->state->viewFlags & 0x800000u) return 1;
    const VELMTIMEBASE *base = &drawer->mainBase;
    int count = 0;
    for (const VELMSELECTION *s = drawer->state->selections; s && s->begin != s->end && count < kMaxSelectionSliders;
         s = s->next) {
        const int b = column_of_time(drawer, base, s->begin), e = column_of_time(drawer, base, s->end);
        const bool next_after = !s->next || s->next->begin == s->next->end ||
                                column_of_time(drawer, base, s->next->begin) > e;
        SelectionSlider &slider = layout.selectionSliders[static_cast<size_t>(count++)];
        slider = SelectionSlider{s, drawer->display, {}, {}};
        if (b > first && b < drawer->columns && !VELMCONTROL_IsSlidingSelectionBegin(drawer, s))
            slider.begin = handle_rect(drawer, Img_TransparentCursorSlider, drawer->display.left + b);
        if (next_after && e <= last && e >= 0 && !VELMCONTROL_IsSlidingSelectionEnd(drawer, s))
            slider.end = handle_rect(drawer, Img_TransparentCursorSlider, drawer->display.left + e);
        paste_handle(drawer, Img_TransparentCursorSlider, slider.begin);
        paste_handle(drawer, Img_TransparentCursorSlider, slider.end);
    }
    layout.selectionSliderCount = count;
    return 1;
}
