#pragma once

#include <cstdint>
#include <initializer_list>
#include <string_view>
#include <utility>

#include "tests/support/PacketBuilder.h"

namespace varnel {

/// A text of zeros and ones, with spaces between them, as bytes. Zeros fill the last byte.
inline Bytes bytesOfBits(std::string_view text) {
  Bytes bytes;
  unsigned count = 0;
  for (const char digit : text) {
    if (digit == ' ') continue;
    if (count % 8 == 0) bytes.push_back(0);
    if (digit == '1') bytes.back() |= static_cast<std::uint8_t>(0x80 >> count % 8);
    ++count;
  }
  return bytes;
}

/// Where the fields of a packet with an RRC message stand, from the payload's first byte.
struct RRCHeader {
  unsigned version, size, cellAt, channelNumberAt, channelNumberWidth, frameAt, channelAt, lengthAt;
  unsigned segmentAt = 0;  ///< 0: the version has none
};

inline constexpr RRCHeader lteRRCHeaders[] = {
    {2, 13, 4, 6, 2, 8, 10, 11},       {3, 13, 4, 6, 2, 8, 10, 11},       {4, 13, 4, 6, 2, 8, 10, 11},
    {5, 17, 4, 6, 2, 8, 10, 15},       {6, 17, 4, 6, 2, 8, 10, 15},       {7, 17, 4, 6, 2, 8, 10, 15},
    {8, 19, 4, 6, 4, 10, 12, 17},      {9, 19, 4, 6, 4, 10, 12, 17},      {12, 19, 4, 6, 4, 10, 12, 17},
    {13, 19, 4, 6, 4, 10, 12, 17},     {14, 19, 4, 6, 4, 10, 12, 17},     {15, 19, 4, 6, 4, 10, 12, 17},
    {16, 19, 4, 6, 4, 10, 12, 17},     {19, 19, 4, 6, 4, 10, 12, 17},     {20, 19, 4, 6, 4, 10, 12, 17},
    {22, 19, 4, 6, 4, 10, 12, 17},     {24, 19, 4, 6, 4, 10, 12, 17},     {25, 21, 6, 8, 4, 12, 14, 19},
    {26, 21, 6, 8, 4, 12, 14, 19},     {27, 21, 6, 8, 4, 12, 14, 19},     {29, 21, 6, 8, 4, 12, 14, 19},
    {30, 24, 6, 8, 4, 12, 14, 19, 23}, {31, 24, 6, 8, 4, 12, 14, 19, 23},
};

inline constexpr RRCHeader nrRRCHeaders[] = {
    {8, 24, 7, 9, 4, 13, 17, 22},       {9, 24, 7, 9, 4, 13, 17, 22},
    {12, 23, 7, 9, 4, 13, 16, 21},      {14, 23, 7, 9, 4, 13, 16, 21},
    {17, 31, 7, 17, 4, 21, 24, 29},     {19, 32, 7, 17, 4, 21, 24, 29},
    {20, 32, 7, 17, 4, 21, 24, 29},     {25, 32, 7, 17, 4, 21, 24, 29},
    {23, 35, 7, 17, 4, 21, 24, 29, 34}, {24, 35, 7, 17, 4, 21, 24, 29, 34},
    {26, 35, 7, 17, 4, 21, 24, 29, 34}, {28, 35, 7, 17, 4, 21, 24, 29, 34},
};

/// Builds a packet with an RRC message. All that is not set is 0.
class RRCPacket {
 public:
  RRCPacket(std::uint32_t logCode, const RRCHeader& header)
      : _logCode(logCode), _header(header), _bytes(header.size) {
    number(0, header.version, logCode == 0xB821 ? 4 : 1);
  }

  RRCPacket& channel(std::uint8_t number) { return byte(_header.channelAt, number); }
  RRCPacket& cell(std::uint16_t cell) { return number(_header.cellAt, cell, 2); }
  RRCPacket& channelNumber(std::uint32_t value) {
    return number(_header.channelNumberAt, value, _header.channelNumberWidth);
  }
  RRCPacket& frameWord(std::uint16_t word) { return number(_header.frameAt, word, 2); }
  RRCPacket& segment(std::uint8_t segment) { return byte(_header.segmentAt, segment); }
  RRCPacket& byte(unsigned offset, std::uint8_t value) {
    _bytes.at(offset) = value;
    return *this;
  }
  RRCPacket& number(unsigned offset, std::uint32_t value, unsigned width) {
    for (unsigned i = 0; i < width; ++i) byte(offset + i, static_cast<std::uint8_t>(value >> 8 * i));
    return *this;
  }
  /// Sets the length too.
  RRCPacket& message(Bytes message) {
    _message = std::move(message);
    return number(_header.lengthAt, static_cast<std::uint32_t>(_message.size()), 2);
  }

  Bytes packet() const {
    Bytes payload = _bytes;
    payload.insert(payload.end(), _message.begin(), _message.end());
    Bytes packet = PacketBuilder(_logCode, Packet::headerSize + payload.size()).bytes();
    for (std::size_t i = 0; i < payload.size(); ++i) packet[Packet::headerSize + i] = payload[i];
    return packet;
  }

 private:
  std::uint32_t _logCode;
  RRCHeader _header;
  Bytes _bytes, _message;
};

inline RRCPacket lteRRC(unsigned version) {
  for (const RRCHeader& header : lteRRCHeaders) {
    if (header.version == version) return {0xB0C0, header};
  }
  return {0xB0C0, {}};
}

inline RRCPacket nrRRC(unsigned version) {
  for (const RRCHeader& header : nrRRCHeaders) {
    if (header.version == version) return {0xB821, header};
  }
  return {0xB821, {}};
}

/// The payload's first bytes, and the message behind them.
inline Bytes containerOf(std::uint32_t logCode, std::initializer_list<unsigned> first, const Bytes& message) {
  Bytes packet = PacketBuilder(logCode, Packet::headerSize + first.size() + message.size()).bytes();
  std::size_t offset = Packet::headerSize;
  for (const unsigned value : first) packet[offset++] = static_cast<std::uint8_t>(value);
  for (const std::uint8_t value : message) packet[offset++] = value;
  return packet;
}

inline Bytes lteNAS(std::uint32_t logCode, const Bytes& message) {
  return containerOf(logCode, {1, 9, 5, 0}, message);
}
inline Bytes nrNAS(std::uint32_t logCode, const Bytes& message) {
  return containerOf(logCode, {1, 0, 0, 0, 15, 4, 0}, message);
}
inline unsigned sizeOf(const Bytes& message) { return static_cast<unsigned>(message.size()); }
inline Bytes umtsRRC(unsigned channel, const Bytes& message) {
  return containerOf(0x412F, {channel, 1, sizeOf(message) & 0xFF, sizeOf(message) >> 8}, message);
}
inline Bytes umtsRRCWithCell(unsigned channel, unsigned channelNumber, unsigned scramblingCode,
                             const Bytes& message) {
  return containerOf(0x412F,
                     {channel, 1, sizeOf(message) & 0xFF, sizeOf(message) >> 8, channelNumber & 0xFF,
                      channelNumber >> 8, scramblingCode & 0xFF, scramblingCode >> 8},
                     message);
}
/// A block of system information; the length is that of the message.
inline Bytes umtsBlockWithCell(unsigned channel, unsigned channelNumber, unsigned scramblingCode,
                               unsigned type, const Bytes& message) {
  return containerOf(0x412F,
                     {channel, 1, sizeOf(message) & 0xFF, sizeOf(message) >> 8, channelNumber & 0xFF,
                      channelNumber >> 8, scramblingCode & 0xFF, scramblingCode >> 8, type},
                     message);
}
inline Bytes gsmRR(unsigned channel, unsigned type, const Bytes& message) {
  return containerOf(0x512F, {channel, type, sizeOf(message)}, message);
}
inline Bytes circuitNAS(unsigned fromPhone, const Bytes& message) {
  return containerOf(0x713A, {fromPhone, sizeOf(message), 0, 0, 0}, message);
}

}  // namespace varnel
