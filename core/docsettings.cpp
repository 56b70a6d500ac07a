// The document settings overlay and its accessors.  Keys are formatted here and
// handed to the settings registry unchanged.
#include <cstdarg>
#include <cstdio>
#include <string>

#include "core/document_internal.hpp"

namespace {

// printf into a string, growing the buffer from 4096 bytes until the text fits.
std::string format_key(const char *format, va_list args)
{
    std::string text(4096, '\0');
    for (;;) {
        va_list copy;
        va_copy(copy, args);
        const int n = std::vsnprintf(text.data(), text.size(), format, copy);
        va_end(copy);
        if (n < 0) {
            if (text.size() > (1u << 24)) return std::string();
            text.resize(text.size() * 2);
            continue;
        }
        if (static_cast<size_t>(n) < text.size()) {
            text.resize(static_cast<size_t>(n));
            return text;
        }
        text.resize(static_cast<size_t>(n) + 1);
    }
}

// The settings a read goes to: the document's when they hold the key (its
// bracketed default aside), else the global ones.
BLSETTINGS source_for(VELMAUDIO doc, const std::string &query)
{
    const std::string key = query.substr(0, query.find('='));
    if (doc->settings && BLSETTINGS_ExistsEx(doc->settings, "%s", key.c_str())) return doc->settings;
    return nullptr;
}

} // namespace

#define VELM_FORMAT_KEY(key)            \
    va_list args;                       \
    va_start(args, format);             \
    const std::string key = format_key(format, args); \
    va_end(args)

int VELMAUDIO_ChangeSetting(VELMAUDIO doc, const char *format, ...)
{
    if (!doc || !format) return 0;
    VELM_FORMAT_KEY(text);
    if (!doc->settings) doc->settings = BLSETTINGS_Create();
    return BLSETTINGS_ChangeEx(doc->settings, "%s", text.c_str());
}

int VELMAUDIO_ChangeSecretSetting(VELMAUDIO doc, const char *format, ...)
{
    if (!doc || !format) return 0;
    VELM_FORMAT_KEY(text);
    if (!doc->settings) doc->settings = BLSETTINGS_Create();
    return BLSETTINGS_ChangeSecretEx(doc->settings, "%s", text.c_str());
}

const char *VELMAUDIO_StringSetting(VELMAUDIO doc, const char *format, ...)
{
    if (!doc || !format) return nullptr;
    VELM_FORMAT_KEY(key);
    return BLSETTINGS_GetStringEx(source_for(doc, key), "%s", key.c_str());
}

const char *VELMAUDIO_SecretStringSetting(VELMAUDIO doc, const char *format, ...)
{
    if (!doc || !format) return nullptr;
    VELM_FORMAT_KEY(key);
    return BLSETTINGS_GetSecretStringEx(source_for(doc, key), "%s", key.c_str());
}

int VELMAUDIO_IntSetting(VELMAUDIO doc, const char *format, ...)
{
    if (!doc || !format) return 0;
    VELM_FORMAT_KEY(key);
    return BLSETTINGS_GetIntEx(source_for(doc, key), "%s", key.c_str());
}

float VELMAUDIO_FloatSetting(VELMAUDIO doc, const char *format, ...)
{
    if (!doc || !format) return 0.0f;
    VELM_FORMAT_KEY(key);
    return static_cast<float>(BLSETTINGS_GetFloatEx(source_for(doc, key), "%s", key.c_str()));
}

int VELMAUDIO_BoolSetting(VELMAUDIO doc, const char *format, ...)
{
    if (!doc || !format) return 0;
    VELM_FORMAT_KEY(key);
    return BLSETTINGS_GetBoolEx(source_for(doc, key), "%s", key.c_str());
}

int VELMAUDIO_ActivateSettings(VELMAUDIO doc)
{
    if (!doc || !doc->settings) return 0;
    if (doc->settingsActive) return 1;
    if (!BLSETTINGS_Insert(doc->settings)) return 0;
    doc->settingsActive = 1;
    return 1;
}

int VELMAUDIO_DeactivateSettings(VELMAUDIO doc)
{
    if (!doc || !doc->settings) return 0;
    if (!doc->settingsActive) return 1;
    BLSETTINGS_Remove(doc->settings);
    doc->settingsActive = 0;
    return 1;
}
