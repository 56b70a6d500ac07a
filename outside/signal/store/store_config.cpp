#include "outside/signal/store/store_config.hpp"

namespace velmsig {

// Fixed until the settings registry of the base library is available.
std::string cache_folder()
{
    return "/tmp";
}

int64_t memory_budget_bytes()
{
    return int64_t(512) << 20;
}

}  // namespace velmsig
