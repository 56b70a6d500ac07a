/*
 * The settings registry: the process-wide registry (null handle), settings
 * objects, the lookup chain of inserted objects, and time stamps.
 */
#include "outside/base/blbase.h"
#include "outside/base/base_internal.h"
#include "outside/base/settings_internal.h"

#include <algorithm>
#include <cstdlib>
#include <mutex>
#include <new>
#include <sys/stat.h>
#include <unordered_set>
#include <vector>

using blbase::SettingEntry;

struct BLSettings {
    blbase::SettingEntries entries;
    uint64_t stamp = 0;
    std::string path;          // the ini file behind the object; empty when none
    bool damaged_file = false; // the file had unreadable lines: keep a copy at the next write
    bool inserted = false;
};

namespace {

struct SettingsState {
    // Recursive: the log sink may read settings while a file is being loaded.
    std::recursive_mutex lock;
    BLSettings global;
    std::vector<BLSettings *> chain; // inserted objects, the last inserted first
    std::unordered_set<BLSettings *> live;
    uint64_t clock = 0;
    uint64_t global_stamp = 0;
};

SettingsState &State()
{
    static auto *state = new SettingsState;
    return *state;
}

BLSettings *Resolve(SettingsState &state, BLSETTINGS settings)
{
    if (!settings) return &state.global;
    return state.live.count(settings) ? settings : nullptr;
}

// What a read through this object sees, in order: for the process-wide
// registry the inserted objects come first.
std::vector<const BLSettings *> LookupChain(const SettingsState &state, const BLSettings *target)
{
    std::vector<const BLSettings *> chain;
    if (target == &state.global) chain.assign(state.chain.begin(), state.chain.end());
    chain.push_back(target);
    return chain;
}

void Touch(SettingsState &state, BLSettings &settings)
{
    settings.stamp = ++state.clock;
    if (&settings == &state.global || settings.inserted) state.global_stamp = settings.stamp;
}

void TouchGlobal(SettingsState &state)
{
    state.global_stamp = ++state.clock;
}

void WriteBack(BLSettings &settings)
{
    if (settings.path.empty()) return;
    if (blbase::SaveIniFile(settings.path, settings.entries, settings.damaged_file))
        settings.damaged_file = false;
}

// "key=value": key and value trimmed.
bool SplitAssignment(std::string_view text, std::string &key, std::string &value)
{
    const size_t equals = text.find('=');
    if (equals == std::string_view::npos) return false;
    key = blbase::Trim(text.substr(0, equals));
    value = blbase::Trim(text.substr(equals + 1));
    return blbase::ValidKey(key);
}

// "key" or "key=[default]" (a default without brackets is taken as it is).
bool SplitQuery(std::string_view text, std::string &key, std::optional<std::string> &fallback)
{
    const size_t equals = text.find('=');
    key = blbase::Trim(text.substr(0, equals));
    if (equals != std::string_view::npos) {
        std::string_view rest = blbase::Trim(text.substr(equals + 1));
        if (rest.size() >= 2 && rest.front() == '[' && rest.back() == ']')
            rest = rest.substr(1, rest.size() - 2);
        fallback = std::string(rest);
    }
    return blbase::ValidKey(key);
}

SettingEntry &EntryFor(BLSettings &settings, const std::string &key)
{
    SettingEntry &entry = settings.entries[blbase::ToLower(key)];
    if (entry.key.empty()) entry.key = key;
    return entry;
}

// Parses "key=value" and lets apply change the key's entry under the lock.
template <typename Apply>
int Assign(BLSETTINGS handle, const std::string &text, const char *caller, Apply apply)
{
    std::string key, value;
    if (!SplitAssignment(text, key, value)) {
        BLDEBUG_Warning(-1, "%s: malformed setting \"%s\"", caller, text.c_str());
        return 0;
    }
    SettingsState &state = State();
    std::lock_guard guard(state.lock);
    BLSettings *settings = Resolve(state, handle);
    return settings ? apply(state, *settings, EntryFor(*settings, key), std::move(value)) : 0;
}

int Change(BLSETTINGS handle, const std::string &text, bool secret)
{
    return Assign(handle, text, "BLSETTINGS_ChangeEx",
                  [secret](SettingsState &state, BLSettings &settings, SettingEntry &entry, std::string value) {
                      if (entry.value == value && entry.secret == secret) return 0;
                      entry.value = std::move(value);
                      entry.secret = secret;
                      Touch(state, settings);
                      WriteBack(settings);
                      return 1;
                  });
}

// The texts a read may answer with, best first: the value (with its secret
// mark), the registered default, the default given with the key.  A key the
// program registered is not missing, so its default wins over the reader's.
struct Candidates {
    std::vector<std::string> texts;
    std::string key;
    bool value_is_secret = false;
};

bool Gather(BLSETTINGS handle, const std::string &query, Candidates &out)
{
    std::optional<std::string> fallback;
    if (!SplitQuery(query, out.key, fallback)) return false;
    const std::string lower = blbase::ToLower(out.key);
    SettingsState &state = State();
    std::lock_guard guard(state.lock);
    const BLSettings *target = Resolve(state, handle);
    if (!target) return false;
    const auto chain = LookupChain(state, target);
    for (const BLSettings *settings : chain) {
        const auto found = settings->entries.find(lower);
        if (found != settings->entries.end() && found->second.value) {
            out.texts.push_back(*found->second.value);
            out.value_is_secret = found->second.secret;
            break;
        }
    }
    for (const BLSettings *settings : chain) {
        const auto found = settings->entries.find(lower);
        if (found != settings->entries.end() && found->second.default_value) {
            out.texts.push_back(*found->second.default_value);
            break;
        }
    }
    if (fallback) out.texts.push_back(*fallback);
    return true;
}

// The first candidate that reads as the wanted type; a value that does not
// (say "abc" for a number) gives way to the defaults.
template <typename T, typename Reader>
T ReadAs(BLSETTINGS handle, const std::string &query, Reader read)
{
    Candidates candidates;
    if (!Gather(handle, query, candidates)) return T{};
    for (const std::string &text : candidates.texts)
        if (const auto value = read(text)) return static_cast<T>(*value);
    return T{};
}

const char *ReadText(BLSETTINGS handle, const std::string &query, bool reveal)
{
    Candidates candidates;
    if (!Gather(handle, query, candidates)) return nullptr;
    if (candidates.texts.empty()) return "";
    const std::string &text = candidates.texts.front();
    if (candidates.value_is_secret && !reveal)
        return blbase::InternText(blbase::ObscureValue(candidates.key, text));
    return blbase::InternText(text);
}

} // namespace

namespace blbase {

void ResetSettings()
{
    SettingsState &state = State();
    std::lock_guard guard(state.lock);
    for (BLSettings *settings : state.chain) settings->inserted = false;
    state.chain.clear();
    state.global.entries.clear();
    state.global.path.clear();
    state.global.damaged_file = false;
    Touch(state, state.global);
}

} // namespace blbase

// The formatted text of a printf-style call, or an early return of failure.
#define BL_FORMAT_OR_RETURN(text, format, failure)                                                 \
    std::string text;                                                                              \
    {                                                                                              \
        va_list args;                                                                              \
        va_start(args, format);                                                                    \
        const bool formatted = blbase::FormatText(text, format, args);                             \
        va_end(args);                                                                              \
        if (!formatted) return failure;                                                            \
    }

BLSETTINGS BLSETTINGS_Create(void)
{
    auto *settings = new (std::nothrow) BLSettings;
    if (!settings) return nullptr;
    SettingsState &state = State();
    std::lock_guard guard(state.lock);
    state.live.insert(settings);
    return settings;
}

int BLSETTINGS_Destroy(BLSETTINGS settings)
{
    if (!settings) return 0;
    SettingsState &state = State();
    std::lock_guard guard(state.lock);
    if (!state.live.erase(settings)) return 0;
    if (settings->inserted) {
        std::erase(state.chain, settings);
        TouchGlobal(state);
    }
    delete settings;
    return 1;
}

int BLSETTINGS_Insert(BLSETTINGS settings)
{
    if (!settings) return 0;
    SettingsState &state = State();
    std::lock_guard guard(state.lock);
    if (!state.live.count(settings)) return 0;
    // Inserting again brings the object back to the front.
    std::erase(state.chain, settings);
    state.chain.insert(state.chain.begin(), settings);
    settings->inserted = true;
    TouchGlobal(state);
    return 1;
}

int BLSETTINGS_Remove(BLSETTINGS settings)
{
    if (!settings) return 0;
    SettingsState &state = State();
    std::lock_guard guard(state.lock);
    if (!state.live.count(settings) || !settings->inserted) return 0;
    std::erase(state.chain, settings);
    settings->inserted = false;
    TouchGlobal(state);
    return 1;
}

int BLSETTINGS_SetConfigFileEx(BLSETTINGS handle, const char *path, const char *kind)
{
    if (!path || !*path || !kind || blbase::ToLower(kind) != "ini") return 0;
    SettingsState &state = State();
    std::lock_guard guard(state.lock);
    BLSettings *settings = Resolve(state, handle);
    if (!settings) return 0;

    std::string file = path;
    struct stat status;
    bool damaged = false;
    blbase::SettingEntries loaded;
    if (::stat(path, &status) == 0) {
        if (!S_ISREG(status.st_mode) || status.st_size > BLSETTINGS_MAX_FILE_SIZE) {
            BLDEBUG_Error(-1, "BLSETTINGS_SetConfigFileEx: %s is not a settings file", path);
            return 0;
        }
        // Writes go to the file a link points to, not over the link.
        if (char *real = ::realpath(path, nullptr)) {
            file = real;
            std::free(real);
        }
        if (!blbase::LoadIniFile(file, loaded, &damaged)) {
            BLDEBUG_Error(-1, "BLSETTINGS_SetConfigFileEx: cannot read %s", path);
            return 0;
        }
    }
    for (auto &[lower, entry] : loaded) {
        SettingEntry &target = EntryFor(*settings, entry.key);
        target.value = std::move(entry.value);
        target.secret = entry.secret;
    }
    settings->path = std::move(file);
    settings->damaged_file = damaged;
    Touch(state, *settings);
    return 1;
}

int BLSETTINGS_ChangeEx(BLSETTINGS settings, const char *format, ...)
{
    BL_FORMAT_OR_RETURN(text, format, 0);
    return Change(settings, text, false);
}

int BLSETTINGS_ChangeSecretEx(BLSETTINGS settings, const char *format, ...)
{
    BL_FORMAT_OR_RETURN(text, format, 0);
    return Change(settings, text, true);
}

int BLSETTINGS_SetDefaultEx(BLSETTINGS handle, const char *format, ...)
{
    BL_FORMAT_OR_RETURN(text, format, 0);
    return Assign(handle, text, "BLSETTINGS_SetDefaultEx",
                  [](SettingsState &state, BLSettings &settings, SettingEntry &entry, std::string value) {
                      if (entry.default_value != value) {
                          entry.default_value = std::move(value);
                          Touch(state, settings);
                      }
                      return 1;
                  });
}

int BLSETTINGS_ExistsEx(BLSETTINGS handle, const char *format, ...)
{
    BL_FORMAT_OR_RETURN(key, format, 0);
    SettingsState &state = State();
    std::lock_guard guard(state.lock);
    const BLSettings *settings = Resolve(state, handle);
    if (!settings) return 0;
    const auto found = settings->entries.find(blbase::ToLower(blbase::Trim(key)));
    return found != settings->entries.end() && (found->second.value || found->second.default_value);
}

int BLSETTINGS_DeleteEx(BLSETTINGS handle, const char *format, ...)
{
    BL_FORMAT_OR_RETURN(key, format, 0);
    SettingsState &state = State();
    std::lock_guard guard(state.lock);
    BLSettings *settings = Resolve(state, handle);
    if (!settings) return 0;
    const auto found = settings->entries.find(blbase::ToLower(blbase::Trim(key)));
    if (found == settings->entries.end() || !found->second.value) return 0;
    if (found->second.default_value) {
        found->second.value.reset();
        found->second.secret = false;
    } else {
        settings->entries.erase(found);
    }
    Touch(state, *settings);
    WriteBack(*settings);
    return 1;
}

int BLSETTINGS_GetIntEx(BLSETTINGS settings, const char *format, ...)
{
    BL_FORMAT_OR_RETURN(query, format, 0);
    return ReadAs<int>(settings, query, blbase::ReadInteger);
}

double BLSETTINGS_GetFloatEx(BLSETTINGS settings, const char *format, ...)
{
    BL_FORMAT_OR_RETURN(query, format, 0.0);
    return ReadAs<double>(settings, query, blbase::ReadNumber);
}

int BLSETTINGS_GetBoolEx(BLSETTINGS settings, const char *format, ...)
{
    BL_FORMAT_OR_RETURN(query, format, 0);
    return ReadAs<int>(settings, query, blbase::ReadFlag);
}

const char *BLSETTINGS_GetStringEx(BLSETTINGS settings, const char *format, ...)
{
    BL_FORMAT_OR_RETURN(query, format, nullptr);
    return ReadText(settings, query, false);
}

const char *BLSETTINGS_GetSecretStringEx(BLSETTINGS settings, const char *format, ...)
{
    BL_FORMAT_OR_RETURN(query, format, nullptr);
    return ReadText(settings, query, true);
}

uint64_t BLSETTINGS_GetTimeStampEx(BLSETTINGS handle)
{
    SettingsState &state = State();
    std::lock_guard guard(state.lock);
    if (!handle) return state.global_stamp;
    const BLSettings *settings = Resolve(state, handle);
    return settings ? settings->stamp : 0;
}
