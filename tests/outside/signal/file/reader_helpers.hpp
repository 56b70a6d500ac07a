// Helpers of the tests that use the internal reader interface.
#pragma once

#include "outside/signal/file/audiofile_internal.hpp"
#include "tests/outside/signal/file/file_helpers.hpp"

namespace velmtest {

// Every frame of a reader, read in pieces of `chunk` frames.
std::vector<float> read_all(velmsig::FileReader &reader, int64_t chunk = 1000);

}  // namespace velmtest
