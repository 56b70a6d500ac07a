/*
 * Shared pieces of the base services library that never leave it: the
 * hooks BLCORE_Finalize runs, the interned-text table and text helpers.
 */
#ifndef BLBASE_INTERNAL_H
#define BLBASE_INTERNAL_H

#include <cstdarg>
#include <string>
#include <string_view>

namespace blbase {

/* printf-style formatting into a std::string; false when the format is bad. */
bool FormatText(std::string &out, const char *format, va_list args);

/* Interned copies of texts handed out by the library; they stay valid until
 * ClearInternedTexts (run by the last BLCORE_Finalize). */
const char *InternText(std::string_view text);
void ClearInternedTexts();

std::string ToLower(std::string_view text);
std::string_view Trim(std::string_view text);

/* Released by the last BLCORE_Finalize, after the registered objects are disposed. */
void ResetNotifications();
void ResetSettings();
void ResetVersions();
void DisposeRegisteredObjects();

} // namespace blbase

#endif
