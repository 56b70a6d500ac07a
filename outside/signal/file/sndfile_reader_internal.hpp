// Readers of every file type libsndfile decodes for us.
#pragma once

#include <memory>

#include "outside/signal/file/audiofile_internal.hpp"
#include "outside/signal/file/unique_fd_internal.hpp"

namespace velmsig {

// Reads the open file `fd` (of `size` bytes) as `format` says ("AUTO",
// "RAW[...]", a named type).  Null on failure with the last error set.
std::unique_ptr<FileReader> open_sndfile_reader(UniqueFd fd, int64_t size, const ParsedFormat &format);

}  // namespace velmsig
