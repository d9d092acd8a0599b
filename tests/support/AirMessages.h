#pragma once

#include <algorithm>
#include <cstdint>
#include <initializer_list>

#include "tests/support/PacketBuilder.h"

namespace varnel {

/// A packet of this header behind that of the log channel, and of a message.
inline Bytes packetOfMessage(std::uint32_t logCode, std::initializer_list<unsigned> header,
                             ByteView message) {
  Bytes packet = PacketBuilder(logCode, Packet::headerSize + header.size() + message.size()).bytes();
  auto next = packet.begin() + Packet::headerSize;
  for (const unsigned byte : header) *next++ = static_cast<std::uint8_t>(byte);
  std::ranges::copy(message, next);
  return packet;
}

/// 0xB0C0 version 26: cell 411, channel 66536, the frame word, and a message on the channel with this number:
/// 3 BCCH-DL-SCH, 7 PCCH, 8 DL-CCCH, 9 DL-DCCH, 10 UL-CCCH, 11 UL-DCCH.
inline Bytes lteRRCPacket(unsigned channel, const Bytes& message, unsigned frameWord = 0) {
  const auto length = static_cast<unsigned>(message.size());
  const unsigned frameLow = frameWord & 0xFF, frameHigh = frameWord >> 8;
  return packetOfMessage(
      0xB0C0, {26,   15,       0x10,      15,      2, 0, 0x9B, 0x01, 0xE8,          0x03,       0x01,
               0x00, frameLow, frameHigh, channel, 0, 0, 0,    0,    length & 0xFF, length >> 8},
      message);
}

/// 0xB0C0 version 30 with a part of a message on DL-DCCH, or on the channel with this number.
inline Bytes lteRRCPart(unsigned segment, const Bytes& part, unsigned channel = 9) {
  const auto length = static_cast<unsigned>(part.size());
  return packetOfMessage(0xB0C0, {30,          16, 0, 16,     0,       0, 1, 0, 0x64, 0,
                                  0,           0,  0, 0,      channel, 0, 0, 0, 0,    length & 0xFF,
                                  length >> 8, 0,  0, segment},
                         part);
}

/// A NAS packet of LTE.
inline Bytes lteNASPacket(std::uint32_t logCode, const Bytes& message) {
  return packetOfMessage(logCode, {1, 9, 5, 0}, message);
}

/// 0x512F on the DCCH, to the phone.
inline Bytes gsmRRPacket(std::uint8_t type) {
  return packetOfMessage(0x512F, {0x80, type, 2}, Bytes{6, type});
}

}  // namespace varnel
