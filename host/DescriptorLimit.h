#pragma once

#include <cstddef>

namespace varnel {

/// Lets this process have this many open files, or as many of them as the system allows. A higher limit
/// stays.
void raiseDescriptorLimit(std::size_t files);

}  // namespace varnel
