#include "LogGenerator/Radios/MessageSection.h"

namespace varnel {

MessageSection::MessageSection(std::string_view sectionName)
    : _sectionName(sectionName), _ownFeed(std::in_place), _feed(*_ownFeed), _taker(_feed.addTaker()) {}

MessageSection::MessageSection(std::string_view sectionName, MessageFeed& feed)
    : _sectionName(sectionName), _feed(feed), _taker(_feed.addTaker()) {}

std::vector<std::uint32_t> MessageSection::getLogCodeArray() const {
  const auto codes = airMessageLogCodes();
  return {codes.begin(), codes.end()};
}

MessageFate MessageSection::fateOf(const Packet& packet, std::uint32_t logCode) const {
  return AirMessageReader::fateOf(packet, logCode);
}

void MessageSection::updateWithData_logCode(const Packet& packet, std::uint32_t logCode) {
  const AirMessageReading& reading = _feed.read(_taker, packet, logCode);
  using enum MessageFate::Outcome;
  _hasDecodedLast = reading.fate.outcome == Decoded;
  if (reading.fate.outcome == Decoded || reading.fate.outcome == UnknownVersion) take(reading);
}

}  // namespace varnel
