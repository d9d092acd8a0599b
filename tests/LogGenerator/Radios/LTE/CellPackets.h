#pragma once

#include <cstddef>
#include <cstdint>

#include "base/Bytes.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {

/// Builds the payload of a packet, or one of its subpackets. Offsets count from its first byte.
class BodyBuilder {
 public:
  explicit BodyBuilder(std::size_t size) : _bytes(size) {}

  /// Sets a little-endian run of bits of the bytes from the offset on.
  BodyBuilder& bits(std::size_t offset, unsigned firstBit, unsigned width, std::uint32_t value) {
    for (unsigned i = 0; i < width; ++i) {
      const std::size_t bit = firstBit + i;
      std::uint8_t& byte = _bytes.at(offset + bit / 8);
      byte = static_cast<std::uint8_t>((byte & ~(1u << bit % 8)) | (value >> i & 1) << bit % 8);
    }
    return *this;
  }
  BodyBuilder& u8(std::size_t offset, std::uint32_t value) { return bits(offset, 0, 8, value); }
  BodyBuilder& u16(std::size_t offset, std::uint32_t value) { return bits(offset, 0, 16, value); }
  BodyBuilder& u32(std::size_t offset, std::uint32_t value) { return bits(offset, 0, 32, value); }

  const Bytes& bytes() const { return _bytes; }

 private:
  Bytes _bytes;
};

/// A packet of this payload.
inline Bytes packetOf(std::uint32_t logCode, const BodyBuilder& payload) {
  Bytes packet = PacketBuilder(logCode, 13 + payload.bytes().size()).bytes();
  std::copy(payload.bytes().begin(), payload.bytes().end(), packet.begin() + 13);
  return packet;
}

/// A subpacket: its id, its version and its size, and zeros up to the size.
inline BodyBuilder subpacketOf(std::uint8_t id, std::uint8_t version, std::size_t size) {
  return BodyBuilder(size).u8(0, id).u8(1, version).u16(2, static_cast<std::uint16_t>(size));
}

/// A packet of version 1 with this subpacket.
inline Bytes packetWith(std::uint32_t logCode, const BodyBuilder& subpacket) {
  BodyBuilder payload(4 + subpacket.bytes().size());
  payload.u8(0, 1).u8(1, 1);
  for (std::size_t i = 0; i < subpacket.bytes().size(); ++i) payload.u8(4 + i, subpacket.bytes()[i]);
  return packetOf(logCode, payload);
}

/// A subpacket of version 36 with room for these cells, on channel 1300, which lies in band 3 at 1815 MHz.
inline BodyBuilder carrierOf(std::size_t cells, std::uint32_t earfcn = 1300) {
  return subpacketOf(25, 36, 12 + 128 * cells).u32(4, earfcn).u16(8, static_cast<std::uint16_t>(cells));
}

/// A cell of such a subpacket. Its RSRP is -140 dBm and a sixteenth for each step, its RSRQ and its RSSI are
/// -30 dB and -110 dBm.
struct CarrierCell {
  std::uint32_t physicalCell = 0, rsrp = 0;
  bool isServing = false;
  std::uint32_t servingIndex = 0;
};

inline void putCell(BodyBuilder& carrier, std::size_t index, const CarrierCell& cell) {
  const std::size_t at = 12 + 128 * index;
  carrier.bits(at, 0, 9, cell.physicalCell).bits(at, 9, 3, cell.servingIndex).bits(at, 12, 1, cell.isServing);
  carrier.bits(at + 28, 12, 12, cell.rsrp);
}

}  // namespace varnel
