// Process attach and detach: the library starts its services when it is loaded
// and stops them when it is unloaded, sharing one counter with VELM_Initialize.
#include "core/startup_internal.hpp"

namespace {

__attribute__((constructor)) void on_library_load()
{
    velm::process_attach();
}

__attribute__((destructor)) void on_library_unload()
{
    velm::process_detach();
}

} // namespace
