#pragma once

#include <cstddef>
#include <cstdint>
#include <initializer_list>

#include "LogGenerator/Packet.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {

/// Builds one log packet. Other than those of `PacketBuilder`, sizes and offsets leave out the header.
class PayloadBuilder {
 public:
  PayloadBuilder(std::uint32_t logCode, std::size_t size) : _packet(logCode, Packet::headerSize + size) {}

  PayloadBuilder& fill(std::uint8_t byte) {
    _packet.fill(byte);
    return *this;
  }
  PayloadBuilder& u8(std::size_t offset, std::uint8_t value) {
    _packet.u8(Packet::headerSize + offset, value);
    return *this;
  }
  PayloadBuilder& u16(std::size_t offset, std::uint16_t value) {
    _packet.u16(Packet::headerSize + offset, value);
    return *this;
  }
  PayloadBuilder& u32(std::size_t offset, std::uint32_t value) {
    _packet.u32(Packet::headerSize + offset, value);
    return *this;
  }
  /// Negative numbers in two's complement.
  PayloadBuilder& s32(std::size_t offset, std::int32_t value) {
    return u32(offset, static_cast<std::uint32_t>(value));
  }
  PayloadBuilder& bytes(std::size_t offset, std::initializer_list<std::uint8_t> values) {
    for (const std::uint8_t value : values) u8(offset++, value);
    return *this;
  }

  Bytes bytes() const { return _packet.bytes(); }

 private:
  PacketBuilder _packet;
};

}  // namespace varnel
