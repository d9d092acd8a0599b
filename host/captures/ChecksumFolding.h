#pragma once

#include <cstddef>

#include "base/Bytes.h"

namespace varnel {

/// The shortest frame that can be folded, in bytes.
inline constexpr std::size_t leastToFold = 16;

/// Whether the processor has the instructions that `isSoundByFolding` needs.
bool canFold();

/// The same as `isSound` in less than half of the time, for a frame of at least `leastToFold` bytes. Call it
/// only if `canFold` returns true.
bool isSoundByFolding(ByteView frame);

}  // namespace varnel
