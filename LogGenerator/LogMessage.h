#pragma once

#include <cstdint>
#include <optional>

#include "LogGenerator/Packet.h"
#include "base/Bytes.h"
#include "base/MessagePrefix.h"

namespace varnel {

/// One message of the log channel from a modem that sends packets. A packet is log type (1 byte), record
/// length (2), log code (2), timestamp (8), and payload. A leading 0x81 and the byte after it do not belong
/// to the packet.
class LogMessage {
 public:
  /// The log types: packets of the modem, and packets that the telephony server makes itself.
  static constexpr std::uint8_t modemLogType = 1, extraLogType = 0xFF;
  static constexpr std::size_t logCodeOffset = 3;
  /// Added to the log codes of the telephony server's own packets.
  static constexpr std::uint32_t extraCodeBase = 0xFF0000;

  /// Nothing for a message that is shorter than a header. Kept: this length includes the prefix, so a packet
  /// after a prefix can lack two bytes of its header.
  static std::optional<LogMessage> framed(ByteView message) {
    if (message.size() < Packet::headerSize) return std::nullopt;
    return LogMessage(message[0] == prefixMark ? message.subspan(prefixSize) : message);
  }

  const Packet& packet() const { return _packet; }
  std::uint8_t logType() const { return _logType; }
  bool isOfKnownType() const { return _logType == modemLogType || _logType == extraLogType; }
  /// 32 bits: the 16 bits in the packet. For a packet of the telephony server, `extraCodeBase` is added.
  std::uint32_t logCode() const { return _logCode; }

 private:
  explicit LogMessage(ByteView packet)
      : _packet(packet),
        _logType(_packet.u8(0)),
        _logCode(_packet.u16(logCodeOffset) | (_logType == extraLogType ? extraCodeBase : 0)) {}

  Packet _packet;
  std::uint8_t _logType;
  std::uint32_t _logCode;
};

}  // namespace varnel
