#pragma once

#include <array>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "base/Bytes.h"

namespace varnel {

static_assert(std::endian::native == std::endian::little,
              "packets are little-endian and are loaded as they are");

/// A view of one log packet, or of one record in it. Bytes past its end read as 0, so no read is out of
/// bounds. A caller that has to know calls `holds` first. Offsets count from the first byte, header included.
class Packet {
 public:
  /// Log type 1, record length 2, log code 2, timestamp 8.
  static constexpr std::size_t headerSize = 13;

  explicit Packet(ByteView bytes) : _bytes(bytes) {}

  std::size_t size() const { return _bytes.size(); }
  /// True when this many bytes from the offset lie inside the packet.
  bool holds(std::size_t offset, std::size_t length) const {
    return offset <= size() && size() - offset >= length;
  }

  std::uint8_t u8(std::size_t offset) const { return offset < size() ? _bytes[offset] : 0; }
  std::uint16_t u16(std::size_t offset) const { return load<std::uint16_t>(offset); }
  std::uint32_t u32(std::size_t offset) const { return load<std::uint32_t>(offset); }
  /// This many 32-bit numbers, one after the other.
  template <std::size_t count>
  std::array<std::uint32_t, count> numbers(std::size_t offset) const {
    return load<std::array<std::uint32_t, count>>(offset);
  }
  /// A little-endian run of up to 32 bits that starts at a bit (0 is the least significant) of a byte.
  std::uint32_t bits(std::size_t offset, unsigned firstBit, unsigned width) const {
    return static_cast<std::uint32_t>(load<std::uint64_t>(offset) >> firstBit &
                                      ((std::uint64_t{1} << width) - 1));
  }

  ByteView bytes() const { return _bytes; }
  /// The bytes from the offset on, as a view whose offsets count from there. Empty past the end.
  Packet from(std::size_t offset) const { return Packet(_bytes.subspan(offset < size() ? offset : size())); }
  /// The bytes after the header; empty for a packet that is shorter than a header.
  ByteView payload() const { return from(headerSize)._bytes; }

 private:
  // Little-endian, like the machine.
  template <class Number>
  Number load(std::size_t offset) const {
    Number value{};
    if (holds(offset, sizeof value)) {
      std::memcpy(&value, _bytes.data() + offset, sizeof value);
    } else if (offset < size()) {
      std::memcpy(&value, _bytes.data() + offset, size() - offset);
    }
    return value;
  }

  ByteView _bytes;
};

}  // namespace varnel
