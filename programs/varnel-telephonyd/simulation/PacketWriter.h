#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>

#include "base/Bytes.h"

namespace varnel::simulation {

/// Writes one log packet, little-endian. Its header of 13 bytes: log type (u8), record length (u16, the bytes
/// behind the type), log code (u16), timestamp (u64, milliseconds since the modem was started).
///
/// Offsets count from the start of the packet and, once it has records, from the start of the last of them.
/// A number that does not lie inside the packet throws std::out_of_range.
class PacketWriter {
 public:
  enum class LogType : std::uint8_t { Modem = 1, Server = 0xFF };
  static constexpr std::size_t headerSize = 13;

  /// A packet of that many bytes, all 0 behind the header. Records make it longer.
  PacketWriter(std::uint16_t code, std::chrono::milliseconds now, std::size_t size,
               LogType type = LogType::Modem);

  /// The low bytes of the number, of a negative one those of its two's complement.
  PacketWriter& u8(std::size_t offset, std::int64_t number) { return put(offset, 1, number); }
  PacketWriter& u16(std::size_t offset, std::int64_t number) { return put(offset, 2, number); }
  PacketWriter& u32(std::size_t offset, std::int64_t number) { return put(offset, 4, number); }
  PacketWriter& u64(std::size_t offset, std::int64_t number) { return put(offset, 8, number); }

  /// A field that begins at that bit of the byte (0: the least significant) and goes on into the bytes
  /// behind. A number that it cannot hold becomes the nearest that it can, as modems do with what they
  /// measure.
  PacketWriter& bits(std::size_t offset, unsigned firstBit, unsigned width, std::int64_t number);

  /// Appends a record of that many bytes, all 0.
  PacketWriter& record(std::size_t size);
  /// Appends bytes of 0 until the packet has that size, at which the next record begins.
  PacketWriter& padTo(std::size_t size);

  /// The packet, whose record length says now how long it has become.
  Bytes finish();

 private:
  PacketWriter& put(std::size_t offset, std::size_t width, std::int64_t number);

  Bytes _bytes;
  std::size_t _start = 0;  // from which offsets count
};

/// A message that the telephony server makes itself: the header, then the payload.
Bytes serverMessage(std::uint16_t code, std::chrono::milliseconds now, ByteView payload);

}  // namespace varnel::simulation
