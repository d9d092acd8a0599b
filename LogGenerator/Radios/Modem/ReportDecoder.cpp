#include "LogGenerator/Radios/Modem/ReportDecoder.h"

#include "platform/ModemReport.h"

namespace varnel::modem {

std::vector<std::uint32_t> ReportDecoder::getLogCodeArray() const { return {modemReport::logCode}; }

void ReportDecoder::updateWithData_logCode(const Packet& packet, std::uint32_t /*logCode*/) {
  const auto report = _reader.read(packet);
  if (!report) return;
  noteVersion(*report);
  if (report->isKnown) show(*report->entries);
}

MessageFate ReportDecoder::fateOf(const Packet& packet, std::uint32_t logCode) const {
  using enum MessageFate::Outcome;
  const auto report = _reader.read(packet);
  if (report && !report->isKnown) return {UnknownVersion, logCode, report->version};
  return {Decoded, logCode};
}

}  // namespace varnel::modem
