// Zooming to and limiting the view by the selection, and the view's sample density.
#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "edit/velmselection.h"
#include "render/view/velmdraw.h"

int VELMAUDIO_ZoomSelection(VELMAUDIO doc)
{
    if (!VELMAUDIO_HasSelection(doc) || !doc->signal) return 0;
    return VELMAUDIO_Zoom(doc, VELMAUDIO_SelectionBegin(doc), VELMAUDIO_SelectionEnd(doc));
}

int VELMAUDIO_SetZoomLimitsToSelection(VELMAUDIO doc)
{
    if (!doc || !doc->signal || VELMAUDIO_SelectionLength(doc) < 1) return 0;
    return VELMAUDIO_SetZoomLimits(doc, VELMAUDIO_SelectionBegin(doc), VELMAUDIO_SelectionEnd(doc));
}

int32_t VELMAUDIO_SamplesPerPixel(VELMAUDIO doc)
{
    if (!doc) return -1;
    return doc->renderer ? static_cast<int32_t>(VELMDRAW_SamplesPerPixel(doc->renderer)) : 0;
}

int64_t VELMAUDIO_GetAnchorChangedPosition(VELMAUDIO doc)
{
    return VELMAUDIO_GetSelectingAnchor(doc);
}
