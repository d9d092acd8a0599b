#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

#include "LogGenerator/LogMessage.h"
#include "base/Bytes.h"
#include "base/PropertyList.h"
#include "base/Value.h"

namespace varnel {

/// Builds one log packet. Offsets count from its first byte, header included; a value that does not fit is a
/// mistake of the test and ends it.
class PacketBuilder {
 public:
  /// The header of that log code (type 0xFF from 0xFF0000 on, else 1) and zeros up to the size.
  PacketBuilder(std::uint32_t logCode, std::size_t size) : _bytes(size) {
    u8(0, logCode < LogMessage::extraCodeBase ? LogMessage::modemLogType : LogMessage::extraLogType);
    u16(1, static_cast<std::uint16_t>(size));
    u16(LogMessage::logCodeOffset, static_cast<std::uint16_t>(logCode));
  }

  /// Puts the byte everywhere behind the header.
  PacketBuilder& fill(std::uint8_t byte) {
    for (std::size_t offset = 13; offset < _bytes.size(); ++offset) _bytes[offset] = byte;
    return *this;
  }
  PacketBuilder& u8(std::size_t offset, std::uint8_t value) {
    _bytes.at(offset) = value;
    return *this;
  }
  /// Little-endian, as all the wider ones.
  PacketBuilder& u16(std::size_t offset, std::uint16_t value) {
    return u8(offset, static_cast<std::uint8_t>(value)).u8(offset + 1, static_cast<std::uint8_t>(value >> 8));
  }
  PacketBuilder& u32(std::size_t offset, std::uint32_t value) {
    return u16(offset, static_cast<std::uint16_t>(value))
        .u16(offset + 2, static_cast<std::uint16_t>(value >> 16));
  }

  Bytes bytes() const { return _bytes; }

 private:
  Bytes _bytes;
};

/// A message that the telephony server made: the header of its log code, then the payload.
inline Bytes serverMessageOfBytes(std::uint32_t logCode, ByteView payload) {
  Bytes message = PacketBuilder(logCode, Packet::headerSize).bytes();
  message.insert(message.end(), payload.begin(), payload.end());
  return message;
}
inline Bytes serverMessageOfText(std::uint32_t logCode, std::string_view payload) {
  return serverMessageOfBytes(logCode, Bytes(payload.begin(), payload.end()));
}
/// The payload is the value as a binary property list.
inline Bytes serverMessage(std::uint32_t logCode, const Value& list) {
  return serverMessageOfBytes(logCode, writeBinaryPropertyList(list).value());
}

}  // namespace varnel
