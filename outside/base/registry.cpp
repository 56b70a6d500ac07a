/* Registry of live objects; the last BLCORE_Finalize disposes what is left. */
#include "outside/base/blbase.h"
#include "outside/base/base_internal.h"

#include <mutex>
#include <unordered_map>
#include <utility>
#include <vector>

namespace {

struct Registry {
    std::mutex lock;
    std::unordered_map<void *, BLOBJECT_Disposer> objects; // object -> its disposer
};

Registry &Objects()
{
    static auto *registry = new Registry;
    return *registry;
}

// Disposers may register new objects; after this many rounds the rest is dropped.
constexpr int kDisposeRounds = 8;

} // namespace

namespace blbase {

void DisposeRegisteredObjects()
{
    Registry &registry = Objects();
    for (int round = 0; round < kDisposeRounds; ++round) {
        std::vector<std::pair<void *, BLOBJECT_Disposer>> left;
        {
            std::lock_guard guard(registry.lock);
            if (registry.objects.empty()) return;
            left.assign(registry.objects.begin(), registry.objects.end());
            registry.objects.clear();
        }
        // Unlocked: a disposer usually unregisters its object itself.
        for (auto &[object, disposer] : left)
            if (disposer) disposer(object);
    }
    size_t forgotten;
    {
        std::lock_guard guard(registry.lock);
        forgotten = registry.objects.size();
        registry.objects.clear();
    }
    BLDEBUG_Error(-1, "BLCORE_Finalize: %zu objects keep registering more; forgotten", forgotten);
}

} // namespace blbase

int RegisterObject(void *object, int kind, BLOBJECT_Disposer disposer)
{
    if (!object) return 0;
    std::lock_guard guard(Objects().lock);
    return Objects().objects.emplace(object, disposer).second ? 1 : 0;
}

int UnRegisterObject(void *object)
{
    if (!object) return 0;
    std::lock_guard guard(Objects().lock);
    return Objects().objects.erase(object) ? 1 : 0;
}

int IsRegisteredObject(void *object)
{
    if (!object) return 0;
    std::lock_guard guard(Objects().lock);
    return Objects().objects.count(object) ? 1 : 0;
}

int CountRegisteredObjects(void)
{
    std::lock_guard guard(Objects().lock);
    return static_cast<int>(Objects().objects.size());
}
