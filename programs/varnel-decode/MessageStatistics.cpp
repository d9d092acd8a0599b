#include "programs/varnel-decode/MessageStatistics.h"

#include <cinttypes>
#include <cstdio>

#include "programs/varnel-decode/TreeWriters.h"

namespace varnel {

using Outcome = MessageFate::Outcome;

void MessageStatistics::Counts::add(Outcome outcome) {
  ++received;
  switch (outcome) {
    case Outcome::Decoded:
      ++decoded;
      break;
    case Outcome::TooShort:
      ++tooShort;
      break;
    case Outcome::TooLong:
      ++tooLong;
      break;
    case Outcome::Unknown:
      ++unknown;
      break;
  }
}

std::string MessageStatistics::Kind::name() const {
  if (!hasNoLogCode) {
    char text[16];
    std::snprintf(text, sizeof text, "0x%04" PRIX32, number);
    return text;
  }
  switch (static_cast<Outcome>(number)) {
    case Outcome::TooShort:
      return "no header";
    case Outcome::Unknown:
      return "no log type";
    default:
      return "objects";
  }
}

void MessageStatistics::add(const MessageFate& fate) {
  const Kind kind =
      fate.logCode ? Kind{false, *fate.logCode} : Kind{true, static_cast<std::uint32_t>(fate.outcome)};
  _counts[kind].add(fate.outcome);
  _total.add(fate.outcome);
}

std::string MessageStatistics::tableLine(const std::string& name, const Counts& counts) {
  char line[160];
  std::snprintf(
      line, sizeof line, "%-11s  %11" PRIu64 "  %11" PRIu64 "  %11" PRIu64 "  %11" PRIu64 "  %11" PRIu64 "\n",
      name.c_str(), counts.received, counts.decoded, counts.tooShort, counts.tooLong, counts.unknown);
  return line;
}

std::string MessageStatistics::asTable() const {
  std::string table = "Log code        Received      Decoded    Too short     Too long      Unknown\n";
  for (const auto& [kind, counts] : _counts) table += tableLine(kind.name(), counts);
  return table + tableLine("Total", _total);
}

std::string MessageStatistics::jsonMembers(const Counts& counts) {
  return "\"Received\":" + std::to_string(counts.received) +
         ",\"Decoded\":" + std::to_string(counts.decoded) +
         ",\"Too Short\":" + std::to_string(counts.tooShort) +
         ",\"Too Long\":" + std::to_string(counts.tooLong) + ",\"Unknown\":" + std::to_string(counts.unknown);
}

std::string MessageStatistics::asJson(const std::optional<std::string>& captureName) const {
  std::string json = "{";
  if (captureName) json += "\"Capture\":" + jsonString(*captureName) + ',';
  json += "\"Messages\":[";
  std::string_view separator;
  for (const auto& [kind, counts] : _counts) {
    json += separator;
    separator = ",";
    json += "{\"Name\":" + jsonString(kind.name()) +
            ",\"Log Code\":" + (kind.hasNoLogCode ? "null" : std::to_string(kind.number)) + ',' +
            jsonMembers(counts) + '}';
  }
  return json + "],\"Total\":{" + jsonMembers(_total) + "}}\n";
}

}  // namespace varnel
