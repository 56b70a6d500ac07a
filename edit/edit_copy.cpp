// Copies: new signals made from the selections; the document does not change.
#include "edit/edit_internal.hpp"

namespace {

int copy_flags(int option)
{
    return option == 0 ? 0 : (0x100 | (option & 0xFF));
}

} // namespace

AUDIOSIGNAL *VELMAUDIO_CopySelectionsEx(VELMAUDIO doc, const VELMSELECTION *list, int option)
{
    if (!doc || !doc->signal || !list) return nullptr;
    const int flags = copy_flags(option);
    AUDIOSIGNAL *result = nullptr;
    for (const VELMSELECTION *s = list; s; s = s->next) {
        AUDIOSIGNAL *grown = AUDIOSIGNAL_CopyEx(doc->signal, result, flags, VELMSELECTION_GetBegin(doc, s),
                                                VELMSELECTION_GetEnd(doc, s));
        if (!grown) {
            AUDIOSIGNAL_Destroy(result);
            return nullptr;
        }
        result = grown;
    }
    return result;
}

AUDIOSIGNAL *VELMAUDIO_Copy(VELMAUDIO doc)
{
    if (!doc || !doc->state) return nullptr;
    return VELMAUDIO_CopySelectionsEx(doc, doc->state->selections, 0);
}

AUDIOSIGNAL *VELMAUDIO_CopyAll(VELMAUDIO doc)
{
    if (!doc || !doc->signal) return nullptr;
    return AUDIOSIGNAL_CopyEx(doc->signal, nullptr, 0, 0, velm::kWholeSignal);
}

AUDIOSIGNAL *VELMAUDIO_CopyChannel(VELMAUDIO doc, int channel)
{
    if (!doc || !doc->signal) return nullptr;
    return AUDIOSIGNAL_CopyChannelEx(doc->signal, nullptr, channel);
}

AUDIOSIGNAL *VELMAUDIO_CombineToStereo(VELMAUDIO doc, VELMAUDIO other)
{
    if (!doc || !doc->signal || !other || !other->signal) return nullptr;
    return AUDIOSIGNAL_CombineToStereoEx(doc->signal, other->signal, nullptr);
}

int VELMAUDIO_SaveSelectionAs(VELMAUDIO doc, const char *file_name, const char *format)
{
    if (!file_name || !format) return 0;
    AUDIOSIGNAL *copy = VELMAUDIO_Copy(doc);
    if (!copy) return 0;
    const int saved = AUDIOSIGNAL_Save(copy, file_name, format);
    const int destroyed = AUDIOSIGNAL_Destroy(copy);
    return saved && destroyed ? 1 : 0;
}
