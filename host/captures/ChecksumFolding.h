#pragma once

#include "base/Bytes.h"

namespace varnel {

/// Whether the processor can do what `isSoundByFolding` does.
bool canFold();

/// What `isSound` tells, in less than half of its time, of a frame of at least 16 bytes. Only where
/// `canFold`.
bool isSoundByFolding(ByteView frame);

inline constexpr std::size_t leastToFold = 16;

}  // namespace varnel
