#pragma once

#include <bit>
#include <cstdint>
#include <cstring>

#include "base/Bytes.h"

namespace varnel {

static_assert(std::endian::native == std::endian::little, "numbers are loaded and stored as they are");

/// The little-endian number at an offset. It must lie within the bytes.
template <class Number>
Number loadLittleEndian(ByteView bytes, std::size_t offset) {
  Number number{};
  std::memcpy(&number, bytes.data() + offset, sizeof number);
  return number;
}

/// Appends numbers, each in as many bytes as its type has.
template <class... Numbers>
void appendLittleEndian(Bytes& bytes, Numbers... numbers) {
  const auto append = [&bytes](const auto& number) {
    const auto* const first = reinterpret_cast<const std::uint8_t*>(&number);
    bytes.insert(bytes.end(), first, first + sizeof number);
  };
  (append(numbers), ...);
}

}  // namespace varnel
