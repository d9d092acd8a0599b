#include "LogGenerator/Radios/MessageFeed.h"

#include <algorithm>

namespace varnel {

MessageFeed::Taker MessageFeed::addTaker() {
  const Taker taker = _next;
  _next <<= 1;
  return taker;
}

const AirMessageReading& MessageFeed::read(Taker taker, const Packet& packet, std::uint32_t logCode) {
  const bool isRead = _taken != 0 && (_taken & taker) == 0 && _logCode == logCode &&
                      std::ranges::equal(_packet, packet.bytes());
  if (isRead) {
    _taken |= taker;
    return _reading;
  }
  _packet.assign(packet.bytes().begin(), packet.bytes().end());
  _logCode = logCode;
  _taken = taker;
  _reading = _reader.read(Packet(_packet), logCode);
  return _reading;
}

}  // namespace varnel
