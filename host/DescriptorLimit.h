#pragma once

#include <cstddef>

namespace varnel {

/// Lets this process have that many files open at a time, or as many of them as the system allows; what it
/// may have already stays.
void raiseDescriptorLimit(std::size_t files);

}  // namespace varnel
