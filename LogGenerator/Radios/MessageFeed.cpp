#include "LogGenerator/Radios/MessageFeed.h"

namespace varnel {

MessageFeed::Taker MessageFeed::addTaker() {
  const Taker taker = _next;
  _next <<= 1;
  return taker;
}

const AirMessageReading& MessageFeed::read(Taker taker, const Packet& packet, std::uint32_t logCode) {
  const ByteView bytes = packet.bytes();
  const bool isRead = _taken != 0 && (_taken & taker) == 0 && _logCode == logCode &&
                      _packet.data() == bytes.data() && _packet.size() == bytes.size();
  if (isRead) {
    _taken |= taker;
    return _reading;
  }
  _packet = bytes;
  _logCode = logCode;
  _taken = taker;
  _reading = _reader.read(packet, logCode);
  return _reading;
}

}  // namespace varnel
