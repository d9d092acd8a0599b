#pragma once

#include <cstdint>

#include "LogGenerator/Radios/AirMessage.h"
#include "base/Bytes.h"

namespace varnel {

/// Reads the messages of one subscription for several sections. All of them get the same packet in turn, and
/// it is read only once.
class MessageFeed {
 public:
  /// What a section takes readings as: a bit of its own.
  using Taker = std::uint32_t;

  /// At most 32 sections may share a feed.
  Taker addTaker();
  /// Reads a packet, unless another section has just had the same one read: bytes at the same place, with the
  /// same log code. A section that comes again with them has another packet. All sections that take a log
  /// code must get each of its packets. The reading is valid until the next call, and while the packet is.
  const AirMessageReading& read(Taker taker, const Packet& packet, std::uint32_t logCode);

 private:
  AirMessageReader _reader;
  AirMessageReading _reading{};
  ByteView _packet;  // the one that was read; it may be gone
  std::uint32_t _logCode = 0;
  Taker _taken = 0;  // the sections that have taken the reading
  Taker _next = 1;
};

}  // namespace varnel
