#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>

#include "base/Bytes.h"

namespace varnel::simulation {

/// Writes one log packet in little-endian form. Its header of 13 bytes is log type (u8), record length (u16,
/// the number of bytes after the type), log code (u16), and timestamp (u64, milliseconds since the modem was
/// started).
///
/// Offsets count from the start of the packet. Once the packet has records, they count from the start of the
/// last record. A number outside the packet throws std::out_of_range.
class PacketWriter {
 public:
  enum class LogType : std::uint8_t { Modem = 1, Server = 0xFF };
  static constexpr std::size_t headerSize = 13;

  /// A packet of this many bytes, which are 0 after the header. Records make it longer.
  PacketWriter(std::uint16_t code, std::chrono::milliseconds now, std::size_t size,
               LogType type = LogType::Modem);

  /// Writes the low bytes of the number. A negative number is written in two's complement.
  PacketWriter& u8(std::size_t offset, std::int64_t number) { return put(offset, 1, number); }
  PacketWriter& u16(std::size_t offset, std::int64_t number) { return put(offset, 2, number); }
  PacketWriter& u32(std::size_t offset, std::int64_t number) { return put(offset, 4, number); }
  PacketWriter& u64(std::size_t offset, std::int64_t number) { return put(offset, 8, number); }

  /// Writes a bit field that begins at this bit of the byte (0 is the least significant) and goes on into the
  /// next bytes. A number that does not fit becomes the nearest one that does. Modems do the same with
  /// measured values.
  PacketWriter& bits(std::size_t offset, unsigned firstBit, unsigned width, std::int64_t number);

  /// Appends a record of this many bytes, which are all 0.
  PacketWriter& record(std::size_t size);
  /// Appends a record of these bytes.
  PacketWriter& append(ByteView bytes);
  /// Appends bytes of 0 until the packet has this size. The next record begins there.
  PacketWriter& padTo(std::size_t size);

  /// Sets the record length and returns the packet.
  Bytes finish();

 private:
  PacketWriter& put(std::size_t offset, std::size_t width, std::int64_t number);

  Bytes _bytes;
  std::size_t _start = 0;  // offsets count from here
};

/// A message of the telephony server itself: the header, then the payload.
Bytes serverMessage(std::uint16_t code, std::chrono::milliseconds now, ByteView payload);

}  // namespace varnel::simulation
