// The controller's fields at rest, and the questions the renderer and the
// document ask of them.
#include "control/velmcontrol.h"

#include "core/document_internal.hpp"
#include "edit/velmselection.h"
#include "render/view/drawer_internal.hpp"

using velm::control::Interaction;

namespace {

const Interaction *fields(VELMDRAW drawer)
{
    return drawer && drawer->state ? &drawer->control : nullptr;
}

bool in_state(VELMDRAW drawer, uint32_t state)
{
    const Interaction *c = fields(drawer);
    return c && c->dragState == state;
}

bool slides_handle(VELMDRAW drawer, const VELMSELECTION *selection, uint32_t mask)
{
    const Interaction *c = fields(drawer);
    return c && c->dragState == velm::control::kSlidingSelection && (c->grabbed & mask) == mask &&
           VELMSELECTION_Compare(c->slidSelection, selection);
}

} // namespace

int VELMCONTROL_Reset(VELMDRAW drawer)
{
    if (!drawer) return 0;
    Interaction &c = drawer->control;
    VELMCONTROL_Stop(drawer);
    c = Interaction{};
    c.hoverTime = BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.hovertime=[500]");
    c.pressTime = BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.mousedowntime=[200]");
    c.navigatorScrollFactor = BLSETTINGS_GetFloatEx(nullptr, "libvelm.draw.mousedowntime=[20]") / 100.0;
    c.audioDragActive = BLSETTINGS_GetBoolEx(nullptr, "libvelm.draw.AudioDragActive=[false]") ? 1 : 0;
    return 1;
}

int VELMCONTROL_Stop(VELMDRAW drawer)
{
    if (!drawer) return 0;
    Interaction &c = drawer->control;
    c.busy = 0;
    if (c.repeatTimer) VELMTIMER_KillTimer(c.repeatTimer);
    if (c.hoverTimer) VELMTIMER_KillTimer(c.hoverTimer);
    c.repeatTimer = c.hoverTimer = nullptr;
    return 1;
}

int VELMCONTROL_IsInteracting(VELMDRAW drawer)
{
    const Interaction *c = fields(drawer);
    return c && c->dragState != velm::control::kIdle;
}

int VELMCONTROL_IsSelecting(VELMDRAW drawer) { return in_state(drawer, velm::control::kSelecting); }
int VELMCONTROL_IsMovingCursor(VELMDRAW drawer) { return in_state(drawer, velm::control::kMovingCursor); }
int VELMCONTROL_IsMovingPlayCursor(VELMDRAW drawer) { return in_state(drawer, velm::control::kMovingPlayCursor); }
int VELMCONTROL_IsSlidingSelection(VELMDRAW drawer) { return in_state(drawer, velm::control::kSlidingSelection); }

int VELMCONTROL_IsGrabbingRegion(VELMDRAW drawer)
{
    const Interaction *c = fields(drawer);
    return c && !c->buttonReleased && (c->dragState == velm::control::kMovingRegions || (c->grabbed & 0x70000u));
}

int VELMCONTROL_IsSlidingSelectionBegin(VELMDRAW drawer, const VELMSELECTION *selection)
{
    return slides_handle(drawer, selection, 0x8000900u);
}

int VELMCONTROL_IsSlidingSelectionEnd(VELMDRAW drawer, const VELMSELECTION *selection)
{
    return slides_handle(drawer, selection, 0x8000A00u);
}

int64_t VELMCONTROL_GetSlidingSelectionSample(VELMDRAW drawer)
{
    const Interaction *c = fields(drawer);
    return c && c->dragState == velm::control::kSlidingSelection ? c->lastDragSample : -1;
}

uint32_t VELMCONTROL_GetMouseOverObject(VELMDRAW drawer)
{
    const Interaction *c = fields(drawer);
    return c ? c->mouseOver : 0;
}

int VELMAUDIO_IsInteracting(VELMAUDIO doc) { return doc && VELMCONTROL_IsInteracting(doc->renderer); }
int VELMAUDIO_IsSelecting(VELMAUDIO doc) { return doc && VELMCONTROL_IsSelecting(doc->renderer); }
int VELMAUDIO_IsMovingCursor(VELMAUDIO doc) { return doc && VELMCONTROL_IsMovingCursor(doc->renderer); }
int VELMAUDIO_IsMovingPlayCursor(VELMAUDIO doc) { return doc && VELMCONTROL_IsMovingPlayCursor(doc->renderer); }
