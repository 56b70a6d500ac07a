#include "outside/signal/store/store_config.hpp"

#include "outside/base/blbase.h"

namespace velmsig {

std::string cache_folder()
{
    const char *folder = BLSETTINGS_GetStringEx(nullptr, "audiosignal.cache.folder=[/tmp]");
    return folder && *folder ? folder : "/tmp";
}

int64_t memory_budget_bytes()
{
    const int megabytes = BLSETTINGS_GetIntEx(nullptr, "audiosignal.cache.memorylimit=[512]");
    return megabytes < 0 ? 0 : int64_t(megabytes) << 20;
}

}  // namespace velmsig
