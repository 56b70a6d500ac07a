// Settings the store reads from the base services registry.
#pragma once

#include <cstdint>
#include <string>

namespace velmsig {

// "audiosignal.cache.folder": where the block file is made (default /tmp).
std::string cache_folder();
// "audiosignal.cache.memorylimit": megabytes of new and edited samples kept
// in memory before they go to the block file (default 512).
int64_t memory_budget_bytes();

}  // namespace velmsig
