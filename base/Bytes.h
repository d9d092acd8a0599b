#pragma once

#include <cstdint>
#include <span>
#include <vector>

namespace varnel {

/// Bytes with an owner.
using Bytes = std::vector<std::uint8_t>;

/// Bytes that somebody else owns. Valid for the length of a call.
using ByteView = std::span<const std::uint8_t>;

}  // namespace varnel
