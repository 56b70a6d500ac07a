// Readers that hand out another rate or channel count than their file's
// ("AUTO:FMTCONV[sr=8000,nc=1]").
#pragma once

#include <memory>

#include "outside/signal/file/audiofile_internal.hpp"

namespace velmsig {

// Wraps `source` so that it reads as `conversion` asks; `source` itself when
// nothing changes.  Null with the last error set when the resampler fails.
std::unique_ptr<FileReader> convert_reader(std::unique_ptr<FileReader> source, const FormatConversion &conversion);

}  // namespace velmsig
