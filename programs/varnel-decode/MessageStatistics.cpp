#include "programs/varnel-decode/MessageStatistics.h"

#include <cinttypes>
#include <cstdio>

#include "programs/varnel-decode/TreeWriters.h"

namespace varnel {

namespace {

// What was left out, under the names for users. Bytes come last, since they are no frames.
struct LeftOutKind {
  const char* name;
  std::uint64_t LeftOut::*count;
};
constexpr LeftOutKind frameKinds[] = {
    {"Bad checksum", &LeftOut::badChecksum},
    {"Torn", &LeftOut::torn},
    {"Other commands", &LeftOut::otherCommands},
    {"Encrypted", &LeftOut::encrypted},
    {"Broken", &LeftOut::broken},
    {"Too long", &LeftOut::tooLong},
};
constexpr LeftOutKind noise{"Noise bytes", &LeftOut::noiseBytes};

// A capture may name any version of 32 bits. A real one has a few.
constexpr std::size_t mostVersions = 32;
constexpr const char* otherVersions = "other versions";

std::string countLine(const std::string& name, std::uint64_t count) {
  char line[64];
  std::snprintf(line, sizeof line, "%-14s  %8" PRIu64 "\n", name.c_str(), count);
  return line;
}

}  // namespace

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
    case Outcome::UnknownVersion:
      ++unknownVersion;
      break;
  }
}

void MessageStatistics::UnknownVersions::add(const PacketVersion& version) {
  if (const auto found = counts.find(version); found != counts.end()) {
    ++found->second;
  } else if (counts.size() < mostVersions) {
    counts.emplace(version, 1);
  } else {
    ++others;
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
  if (fate.version) _versions[kind].add(*fate.version);
  _total.add(fate.outcome);
}

std::string MessageStatistics::tableLine(const std::string& name, const Counts& counts) {
  char line[200];
  std::snprintf(line, sizeof line,
                "%-11s  %11" PRIu64 "  %11" PRIu64 "  %11" PRIu64 "  %11" PRIu64 "  %11" PRIu64 "  %15" PRIu64
                "\n",
                name.c_str(), counts.received, counts.decoded, counts.tooShort, counts.tooLong,
                counts.unknown, counts.unknownVersion);
  return line;
}

// Only the last column has a number.
std::string MessageStatistics::versionLines(const Kind& kind) const {
  const auto found = _versions.find(kind);
  if (found == _versions.end()) return {};
  std::string lines;
  const auto add = [&](const std::string& version, std::uint64_t count) {
    char line[160];
    std::snprintf(line, sizeof line, "%-30s  %61" PRIu64 "\n", (kind.name() + ' ' + version).c_str(), count);
    lines += line;
  };
  for (const auto& [version, count] : found->second.counts) add('v' + version.text(), count);
  if (found->second.others > 0) add(otherVersions, found->second.others);
  return lines;
}

std::string MessageStatistics::asTable() const {
  std::string table =
      "Log code        Received      Decoded    Too short     Too long      Unknown  Unknown version\n";
  for (const auto& [kind, counts] : _counts) table += tableLine(kind.name(), counts) + versionLines(kind);
  return table + tableLine("Total", _total) + frameLines() + subscriptionLines();
}

void MessageStatistics::setCapture(const Subscriptions::Counts& records, const LeftOut& leftOut) {
  _records = records;
  _leftOut = leftOut;
}

std::uint64_t MessageStatistics::recordCount() const {
  std::uint64_t sum = 0;
  for (const auto& [subscription, count] : _records) sum += count;
  return sum;
}

std::string MessageStatistics::frameLines() const {
  if (_leftOut == LeftOut{}) return {};
  std::string lines = '\n' + countLine("Frames", recordCount() + _leftOut.frames());
  lines += countLine("Records", recordCount());
  for (const LeftOutKind& kind : frameKinds)
    if (_leftOut.*kind.count > 0) lines += countLine(kind.name, _leftOut.*kind.count);
  if (_leftOut.noiseBytes > 0) lines += countLine(noise.name, _leftOut.noiseBytes);
  return lines;
}

std::string MessageStatistics::subscriptionLines() const {
  const bool isAnyNamed = !_records.empty() && _records.rbegin()->first.has_value();
  if (!isAnyNamed) return {};
  std::string lines = "\n";
  for (const auto& [subscription, count] : _records)
    lines += countLine(subscriptionName(subscription), count);
  return lines;
}

std::string MessageStatistics::jsonMembers(const Counts& counts) {
  return "\"Received\":" + std::to_string(counts.received) +
         ",\"Decoded\":" + std::to_string(counts.decoded) +
         ",\"Too Short\":" + std::to_string(counts.tooShort) +
         ",\"Too Long\":" + std::to_string(counts.tooLong) +
         ",\"Unknown\":" + std::to_string(counts.unknown) +
         ",\"Unknown Version\":" + std::to_string(counts.unknownVersion);
}

// Others than those that are listed have the version null.
std::string MessageStatistics::versionsAsJson(const Kind& kind) const {
  std::string json = "\"Unknown Versions\":[";
  const auto found = _versions.find(kind);
  if (found == _versions.end()) return json + ']';
  auto add = [&, separator = std::string_view()](const std::string& version, std::uint64_t count) mutable {
    json.append(separator).append("{\"Version\":" + version + ",\"Messages\":" + std::to_string(count) + '}');
    separator = ",";
  };
  for (const auto& [version, count] : found->second.counts) add(jsonString(version.text()), count);
  if (found->second.others > 0) add("null", found->second.others);
  return json + ']';
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
            jsonMembers(counts) + ',' + versionsAsJson(kind) + '}';
  }
  return json + "]," + framesAsJson() + ',' + subscriptionsAsJson() + ",\"Total\":{" + jsonMembers(_total) +
         "}}\n";
}

std::string MessageStatistics::framesAsJson() const {
  const std::uint64_t records = recordCount();
  std::string json = "\"Frames\":{\"Received\":" + std::to_string(records + _leftOut.frames()) +
                     ",\"Records\":" + std::to_string(records);
  for (const LeftOutKind& kind : frameKinds)
    json += ',' + jsonString(kind.name) + ':' + std::to_string(_leftOut.*kind.count);
  return json + "},\"Noise Bytes\":" + std::to_string(_leftOut.noiseBytes);
}

std::string MessageStatistics::asReportMembers() const {
  std::string json = "\"Records\":" + std::to_string(recordCount()) + ",\"Left Out\":{";
  for (const LeftOutKind& kind : frameKinds)
    json += jsonString(kind.name) + ':' + std::to_string(_leftOut.*kind.count) + ',';
  json += jsonString(noise.name) + ':' + std::to_string(_leftOut.noiseBytes) + "},\"Unknown Versions\":[";
  auto add = [&, separator = std::string_view()](const Kind& kind, const std::string& version,
                                                 std::uint64_t count) mutable {
    json.append(separator).append("{\"Name\":" + jsonString(kind.name()) + ",\"Version\":" + version);
    json.append(",\"Messages\":" + std::to_string(count) + '}');
    separator = ",";
  };
  for (const auto& [kind, versions] : _versions) {
    for (const auto& [version, count] : versions.counts) add(kind, jsonString(version.text()), count);
    if (versions.others > 0) add(kind, "null", versions.others);
  }
  return json + ']';
}

std::vector<MessageStatistics::Row> MessageStatistics::rows() const {
  std::vector<Row> rows;
  for (const auto& [kind, counts] : _counts) {
    Row row{.name = kind.name(),
            .counts = {counts.received, counts.decoded, counts.tooShort, counts.tooLong, counts.unknown,
                       counts.unknownVersion}};
    if (const auto found = _versions.find(kind); found != _versions.end()) {
      for (const auto& [version, count] : found->second.counts)
        row.unknownVersions.emplace_back(version.text(), count);
      if (found->second.others > 0) row.unknownVersions.emplace_back(otherVersions, found->second.others);
    }
    rows.push_back(std::move(row));
  }
  return rows;
}

std::vector<std::pair<std::string, std::uint64_t>> MessageStatistics::leftOut() const {
  std::vector<std::pair<std::string, std::uint64_t>> counts;
  for (const LeftOutKind& kind : frameKinds) counts.emplace_back(kind.name, _leftOut.*kind.count);
  counts.emplace_back(noise.name, _leftOut.noiseBytes);
  return counts;
}

std::string MessageStatistics::subscriptionsAsJson() const {
  std::string json = "\"SIM\":[";
  std::string_view separator;
  for (const auto& [subscription, count] : _records) {
    json += separator;
    separator = ",";
    json += "{\"Number\":" + (subscription ? std::to_string(*subscription) : "null") +
            ",\"Records\":" + std::to_string(count) + '}';
  }
  return json + ']';
}

}  // namespace varnel
