// Document event handlers, the translation hook and the callback through
// which a signal talks back to its document.
#include <cstring>

#include "core/document_internal.hpp"
#include "core/startup_internal.hpp"
#include "edit/velmcustomtrack.h"

int VELMAUDIO_AddEventHandler(VELMAUDIO doc, BLNOTIFY_Handler handler, void *user)
{
    if (!doc || !doc->dispatcher) return 0;
    return BLNOTIFY_AddHandler(doc->dispatcher, handler, user);
}

int VELMAUDIO_DelEventHandler(VELMAUDIO doc, BLNOTIFY_Handler handler, void *user)
{
    if (!doc || !doc->dispatcher) return 0;
    return BLNOTIFY_DelHandler(doc->dispatcher, handler, user);
}

BLNOTIFY VELMAUDIO_Dispatcher(VELMAUDIO doc)
{
    return doc ? doc->dispatcher : nullptr;
}

const char *VELM_TranslateString(const char *text)
{
    return text;
}

namespace {

int track_id_request(VELMAUDIO doc, const char *name, int32_t *id)
{
    if (!name || !id) return 0;
    int found = VELMAUDIO_FindCustomTrackId(doc, name);
    if (found < 0) found = VELMAUDIO_AddCustomTrack(doc, name);
    if (found < 0) return 0;
    *id = found;
    return 1;
}

int track_label_changed(VELMAUDIO doc, const char *name, const char *label)
{
    if (!doc->settings || !name) return 0;
    for (const VELMCUSTOMTRACK &t : doc->customTracks) {
        if (t.inUse && std::strncmp(t.name, name, VELM_TRACKNAME_SIZE) == 0)
            return BLSETTINGS_ChangeEx(doc->settings, "libvelm.customtrack.%s.label=%s", name, label ? label : "");
    }
    return 0;
}

} // namespace

namespace velm {

int signal_callback(void *document, int code, void *data1, void *data2)
{
    auto doc = static_cast<VELMAUDIO>(document);
    if (!doc) return 0;
    switch (code) {
    case 0x10025: return track_id_request(doc, static_cast<const char *>(data1), static_cast<int32_t *>(data2));
    case 0x10026: return track_label_changed(doc, static_cast<const char *>(data1), static_cast<const char *>(data2));
    default: return 1;
    }
}

} // namespace velm
