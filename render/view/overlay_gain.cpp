// The gain buttons shown over the channel lanes while the document plays:
// a dark rounded plate with a loudspeaker telling the channel's gain.
#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "render/view/overlay_internal.hpp"
#include "sound/velmplay.h"
#include "widgets/resources/velmresources.h"

using namespace velm::view;

namespace {

VELMCANVASIMAGE loudspeaker(double gain)
{
    if (gain > 0.66) return Img_VolumeOn;
    if (gain > 0.33) return Img_Volume66;
    if (gain > 0.0) return Img_Volume33;
    return Img_VolumeOff;
}

int draw_gain_button(VELMDRAW d, const _VELMRECT &button, int channel)
{
    if (is_empty(button)) return 1;
    VELMCANVAS canvas = d->canvas;
    VELMCANVAS_SaveOverlayRect(canvas, &button);
    mark_dirty_rect(d, button);
    fill_alpha(canvas, button, 0, 0.35f, 20);
    const double gain = VELMPLAY_GetChannelGain(VELMAUDIO_Player(d->document), channel);
    const int side = button.height * 3 / 4;
    return VELMCANVAS_PasteImageScaled(canvas, loudspeaker(gain), button.left + 8, button.top + button.height / 8,
                                       side, side);
}

} // namespace

namespace velm::view {

int draw_gain_buttons(VELMDRAW d)
{
    if (!VELMAUDIO_IsPlaying(d->document)) return 1;
    int ok = 1;
    for (int i = 0; i < d->laneCount; ++i) {
        const Lane &lane = d->lanes[static_cast<size_t>(i)];
        if (!lane.shown || (lane.kind != VELMDRAW_LANE_WAVEFORM && lane.kind != VELMDRAW_LANE_SPECTROGRAM)) continue;
        // The second button speaks for the odd channel of the pair, as the
        // hit test names it.
        if (VELMAUDIO_IsChannelControlVisible(d->document, i, 1)) ok &= draw_gain_button(d, lane.buttons[0], i);
        if (VELMAUDIO_IsChannelControlVisible(d->document, i, 2)) ok &= draw_gain_button(d, lane.buttons[1], i | 1);
    }
    return ok;
}

} // namespace velm::view
