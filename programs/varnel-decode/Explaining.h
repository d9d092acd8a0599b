#pragma once

#include <string>
#include <vector>

#include "platform/Resources.h"

namespace varnel {

/// Writes what these paths of the display mean to standard output: the path, and what the resource
/// "Explanations" has to say. Paths that nothing explains are told on standard error, with those that may be
/// meant. Returns the exit status.
int explain(const std::vector<std::string>& paths, const Resources& resources);

}  // namespace varnel
