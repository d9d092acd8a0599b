#pragma once

#include <cstdint>

namespace varnel {

/// How often this thread has allocated memory with `new` so far. A program that links this file counts its
/// allocations.
std::uint64_t allocationCount();

}  // namespace varnel
