// The document's draw entry points: when to render, and the locking and
// re-entrancy rules around the renderer.
#include <cstring>

#include "core/document_internal.hpp"
#include "core/startup_internal.hpp"
#include "core/velmconfig.h"
#include "render/view/velmdraw.h"

namespace {

// The signal's read access and the drawing mark for the length of one draw.
class DrawSession {
public:
    explicit DrawSession(VELMAUDIO doc)
        : doc_(doc), signal_(doc->signal), held_(AUDIOSIGNAL_TryReadAccess(signal_) != 0)
    {
        if (held_) doc_->drawing = 1;
    }
    ~DrawSession()
    {
        if (!held_) return;
        VELMAUDIO_DeactivateSettings(doc_);
        doc_->drawing = 0;
        // The one taken: a handler may have given the document another signal meanwhile.
        AUDIOSIGNAL_ReleaseReadAccess(signal_);
        if (doc_->closeAfterDraw) velm::close_document(doc_);
    }
    DrawSession(const DrawSession &) = delete;
    DrawSession &operator=(const DrawSession &) = delete;
    bool held() const { return held_; }

private:
    VELMAUDIO doc_;
    AUDIOSIGNAL *signal_;
    bool held_;
};

} // namespace

int VELMAUDIO_Draw(VELMCANVAS canvas, VELMAUDIO doc, _VELMRECT *changed)
{
    if (!doc || !doc->signal || !canvas) return 0;
    if (!doc->renderer) doc->renderer = VELMDRAW_Create(doc);
    if (!doc->renderer) return 0;
    if (doc->drawing) {
        BLDEBUG_Warning(-1, "VELMAUDIO_Draw: Recursive call to VELMAUDIO_Draw!");
        return 0;
    }
    DrawSession session(doc);
    if (!session.held()) {
        BLDEBUG_Log(0, "VELMAUDIO_Draw: Audio Signal Object locked ... re-scheduling draw!");
        return 0;
    }
    int width = 0, height = 0;
    VELMCANVAS_GetDimension(canvas, &width, &height);
    VELMAUDIO_SetDrawProperty(doc, 0, width);
    VELMAUDIO_SetDrawProperty(doc, 1, height);
    if (VELMAUDIO_ActivateSettings(doc)) VELMDRAW_UpdateConfig(doc->renderer);
    VELMCONFIG_ApplyStateConfiguration(doc, doc->state);

    if (!(doc->state->status & STATUS_VISUAL_CHANGED)) {
        if (changed) std::memset(changed, 0, sizeof *changed);
        return 1;
    }
    if (!BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x2001E, nullptr, nullptr) || doc->closeAfterDraw) return 0;
    const int result = VELMDRAW_UpdateDraw(doc->renderer, canvas, doc->state, changed);
    if (result) VELMSTATE_ResetVisualChanges(doc);
    BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, 0x2001F, nullptr, nullptr);
    return result;
}

int VELMAUDIO_RedrawNeeded(VELMCANVAS canvas, VELMAUDIO doc)
{
    if (!doc) return 0;
    const bool pending = doc->state && (doc->state->status & STATUS_VISUAL_CHANGED);
    _VELMRECT frame;
    if (!doc->renderer || !VELMDRAW_GetDrawAreaRect(doc->renderer, VELMDRAW_AREA_FRAME, &frame) || pending) return 1;
    if (!canvas) return 0;
    int width = 0, height = 0;
    VELMCANVAS_GetDimension(canvas, &width, &height);
    return width != doc->state->drawWidth || height != doc->state->drawHeight;
}

int VELMAUDIO_UpdateConfig(VELMAUDIO doc)
{
    if (!doc || !doc->renderer || !VELMDRAW_UpdateConfig(doc->renderer)) return 0;
    return VELMSTATE_NotifyChanges(doc, VELMSTATE_CHANGE_EVERYTHING);
}

int VELMAUDIO_GetDrawAreaRect(VELMAUDIO doc, int area, _VELMRECT *out)
{
    return doc && doc->renderer ? VELMDRAW_GetDrawAreaRect(doc->renderer, area, out) : 0;
}
