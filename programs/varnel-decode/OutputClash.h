#pragma once

#include <optional>
#include <string>

#include "programs/varnel-decode/Options.h"

namespace varnel {

/// What is wrong with the files that the options name: an output that would replace an input or another
/// output, under any name. The captures must be those of all parts, because the outputs of all parts may go
/// to one folder. Standard output counts as an output if it is a file. Nothing when all files are
/// different.
std::optional<std::string> outputClash(const Options& options);

}  // namespace varnel
