#include "LogGenerator/SectionDecoder.h"

#include <algorithm>

#include "LogGenerator/NumberFormats.h"

namespace varnel {

std::vector<std::uint32_t> SectionDecoder::getLogCodeArray() const {
  std::vector<std::uint32_t> codes;
  for (const PacketHandler& handler : _handlers) codes.push_back(handler.logCode);
  return codes;
}

void SectionDecoder::updateWithData_logCode(const Packet& packet, std::uint32_t logCode) {
  const auto handler = std::ranges::find(_handlers, logCode, &PacketHandler::logCode);
  if (handler != _handlers.end()) return decode(packet, *handler);
  logLine(_tracePriority, "%s", _traceLine);
  if (_unknownCodes == UnknownCodes::Logged) logUnknownCode(logCode);
}

void SectionDecoder::decode(const Packet& packet, const PacketHandler& handler) {
  logLine(_tracePriority, "%s", _traceLine);
  if (packet.size() < handler.minimumLength) return;
  if (handler.function) {
    handler.function(sectionRef, packet);
  } else if (handler.method) {
    handler.method(*this, packet);
  } else {
    sectionRef.show(packet, handler.fields);
  }
}

void SectionDecoder::listNumberFormats(SectionFormats& formats) const {
  for (const PacketHandler& handler : _handlers) formats.add(handler.fields);
}

}  // namespace varnel
