/* Start-up counting and the component version table. */
#include "outside/base/blbase.h"
#include "outside/base/base_internal.h"

#include <cstdio>
#include <map>
#include <mutex>
#include <string>

namespace {

// Recursive: disposers run under it and may ask whether the library is up.
std::recursive_mutex start_lock;
int start_count = 0;

struct Version {
    int major, minor, release, build;
};

std::mutex version_lock;
std::map<std::string, Version> &Versions()
{
    static auto *versions = new std::map<std::string, Version>;
    return *versions;
}

} // namespace

namespace blbase {

void ResetVersions()
{
    std::lock_guard guard(version_lock);
    Versions().clear();
}

} // namespace blbase

int BLCORE_Initialize(void)
{
    std::lock_guard guard(start_lock);
    ++start_count;
    return 1;
}

void BLCORE_Finalize(void)
{
    std::lock_guard guard(start_lock);
    if (start_count == 0 || --start_count > 0) return;
    // Objects go first: their disposers may still read settings or send events.
    blbase::DisposeRegisteredObjects();
    blbase::ResetNotifications();
    blbase::ResetSettings();
    blbase::ResetVersions();
    blbase::ClearInternedTexts();
}

int BLCORE_IsInitialized(void)
{
    std::lock_guard guard(start_lock);
    return start_count > 0;
}

int BLVERSION_Register(const char *name, int major, int minor, int release, int build)
{
    if (!name || !*name) return 0;
    std::lock_guard guard(version_lock);
    Versions()[name] = Version{major, minor, release, build};
    return 1;
}

int BLVERSION_String(const char *name, char *buffer, int size)
{
    if (!name || !buffer || size <= 0) return 0;
    std::lock_guard guard(version_lock);
    const auto found = Versions().find(name);
    if (found == Versions().end()) return 0;
    const Version &v = found->second;
    std::snprintf(buffer, static_cast<size_t>(size), "%s %d.%d.%d.%d", name, v.major, v.minor,
                  v.release, v.build);
    return 1;
}
