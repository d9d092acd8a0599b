#pragma once

#include <optional>
#include <string>

#include "programs/varnel-decode/Options.h"

namespace varnel {

/// What is wrong with the files that the options name: an output that would take the place of an input or of
/// another output, whatever names they have. Standard output is one of them where it is a file. Nothing when
/// all of them are different.
std::optional<std::string> outputClash(const Options& options);

}  // namespace varnel
