/*
 * The settings objects and the ini files behind them, shared by the settings
 * calls and the ini reader and writer.
 */
#ifndef BLSETTINGS_INTERNAL_H
#define BLSETTINGS_INTERNAL_H

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>

namespace blbase {

struct SettingEntry {
    std::string key; // spelled as first written; files keep that spelling
    std::optional<std::string> value;
    std::optional<std::string> default_value;
    bool secret = false; // the value is obscured in files
};

// Entries by lower-case key: keys are compared without regard to case.
using SettingEntries = std::map<std::string, SettingEntry>;

// Keys must survive a trip through an ini file unchanged.
bool ValidKey(std::string_view key);

// The form a secret value takes in files and in plain reads.
std::string ObscureValue(std::string_view key, std::string_view value);

// Setting texts read as numbers and flags; null when the text is neither.
std::optional<double> ReadNumber(std::string_view text);
std::optional<int> ReadInteger(std::string_view text);
std::optional<bool> ReadFlag(std::string_view text);

// Reads an ini file into entries (values only).  Lines that cannot be read
// are reported through the log and skipped; *damaged tells whether there
// were any.  False when the file cannot be read at all.
bool LoadIniFile(const std::string &path, SettingEntries &entries, bool *damaged);

// Replaces the file with the values of entries: a temporary file beside it is
// written and synced, then renamed over it, so a crash never leaves a cut
// file.  With keep_copy the old file stays reachable as path + ".bak".
bool SaveIniFile(const std::string &path, const SettingEntries &entries, bool keep_copy);

} // namespace blbase

#endif
