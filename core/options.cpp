// Document option flags and the option texts that set them.
#include <cctype>
#include <string>

#include "core/document_internal.hpp"

namespace {

int set_flag(VELMAUDIO doc, uint32_t flag, bool on)
{
    if (!doc) return 0;
    doc->options = on ? (doc->options | flag) : (doc->options & ~flag);
    return 1;
}

// One word of an option text with spaces and underscores dropped, in upper case.
std::string normalised_word(const char *begin, const char *end)
{
    std::string word;
    for (const char *p = begin; p < end; ++p)
        if (*p != ' ' && *p != '_' && *p != '\t') word += static_cast<char>(std::toupper(static_cast<unsigned char>(*p)));
    return word;
}

} // namespace

int VELMAUDIO_Editable(VELMAUDIO doc)
{
    return doc && doc->signal && (doc->options & OPTION_EDITABLE) ? 1 : 0;
}

int VELMAUDIO_SetEditable(VELMAUDIO doc, int editable)
{
    return doc && doc->signal ? set_flag(doc, OPTION_EDITABLE, editable != 0) : 0;
}

int VELMAUDIO_ShowInRecent(VELMAUDIO doc)
{
    return doc && !(doc->options & OPTION_HIDE_FROM_RECENT) ? 1 : 0;
}

int VELMAUDIO_SetShowInRecent(VELMAUDIO doc, int show)
{
    return set_flag(doc, OPTION_HIDE_FROM_RECENT, show == 0);
}

int VELMAUDIO_IsExternalRegionEditorVisible(VELMAUDIO doc)
{
    return doc && (doc->options & OPTION_EXTERNAL_REGION_EDITOR) ? 1 : 0;
}

int VELMAUDIO_SetExternalRegionEditorVisible(VELMAUDIO doc, int visible)
{
    return set_flag(doc, OPTION_EXTERNAL_REGION_EDITOR, visible != 0);
}

uint32_t VELMDEFINES_DecodeVelmOptions(uint32_t flags, const char *text)
{
    if (!text) return flags;
    bool editable = false, not_editable = false;
    for (const char *p = text;;) {
        const char *bar = p;
        while (*bar && *bar != '|') ++bar;
        const std::string word = normalised_word(p, bar);
        if (word == "EDITABLE") editable = true;
        if (word == "NOEDITABLE") not_editable = true;
        if (!*bar) break;
        p = bar + 1;
    }
    if (editable) flags |= OPTION_EDITABLE;
    if (not_editable) flags &= ~OPTION_EDITABLE;
    return flags;
}
