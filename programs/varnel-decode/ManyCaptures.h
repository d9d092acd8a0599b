#pragma once

#include "programs/varnel-decode/InputDecoding.h"
#include "programs/varnel-decode/Options.h"

namespace varnel {

/// Does everything that the options ask for with all captures, each in its own process, and writes the report
/// about them. Returns the exit status: the worst one of `decodeInput`, or `notWrittenStatus`. Throws
/// std::system_error when no process can be started, or when standard output cannot be written.
int decodeMany(const Options& options, const DecodingServices& services);

}  // namespace varnel
