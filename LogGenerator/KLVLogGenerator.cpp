#include "LogGenerator/KLVLogGenerator.h"

#include <algorithm>
#include <cstring>
#include <string>
#include <utility>

#include "LogGenerator/LogMessage.h"
#include "base/Log.h"

namespace varnel {

namespace {

// The layout of the version report after the record header of 12 bytes: length, log code, timestamp.
constexpr std::size_t logCodeOffset = 2;
constexpr std::size_t firstWordOffset = 12;
constexpr std::size_t secondWordOffset = 14;
constexpr std::size_t versionOffset = 16;
constexpr std::size_t versionSize = 7;
constexpr std::size_t executableNameOffset = 23;
constexpr std::size_t executableNameSize = 16;
constexpr std::size_t buildDateOffset = 63;
constexpr std::size_t buildDateSize = 18;
constexpr std::size_t secondsOffset = 81;
constexpr std::size_t zoneOffset = 85;
constexpr std::size_t daylightOffset = 87;

constexpr std::uint16_t versionReportLogCode = 0x1FFD;
constexpr std::uint16_t reportWord = 1;
// Kept: the file holds this word, not a name.
constexpr std::string_view executableName = "EXECUTABLE_NAME";

template <class Number>
void put(std::uint8_t* at, Number number) {
  std::memcpy(at, &number, sizeof number);
}

// The last byte of the field stays zero.
void putText(std::uint8_t* at, std::size_t fieldSize, std::string_view text) {
  std::copy_n(text.begin(), std::min(text.size(), fieldSize - 1), at);
}

}  // namespace

DLFStatus DLFAddVersionReport(std::uint8_t* buffer, std::uint32_t capacity, std::uint32_t& written,
                              std::uint16_t firstWord, std::uint16_t secondWord, std::string_view version,
                              std::string_view executable, std::string_view buildDate, const DLFTime& time) {
  written = 0;
  if (capacity < dlfVersionReportLength) return DLFStatus::BufferTooSmall;
  std::fill_n(buffer, dlfVersionReportLength, std::uint8_t{0});
  put(buffer, static_cast<std::uint16_t>(dlfVersionReportLength));
  put(buffer + logCodeOffset, versionReportLogCode);
  put(buffer + firstWordOffset, firstWord);
  put(buffer + secondWordOffset, secondWord);
  putText(buffer + versionOffset, versionSize, version);
  putText(buffer + executableNameOffset, executableNameSize, executable);
  putText(buffer + buildDateOffset, buildDateSize, buildDate);
  put(buffer + secondsOffset, time.seconds);
  put(buffer + zoneOffset, time.zoneMinutes);
  put(buffer + daylightOffset, static_cast<std::uint16_t>(time.daylight));
  written = dlfVersionReportLength;
  return DLFStatus::Success;
}

std::optional<Bytes> KLVLogGenerator::generateDlfFromState(const Dictionary& state) const {
  Bytes dlf(dlfVersionReportLength);
  const ApplicationInfo& application = services().application;
  const std::string version = application.version ? "Varnel " + *application.version : "(none)";
  const Time now = services().clock.now();
  const TimeZone zone = services().clock.zoneAt(now);
  std::uint32_t written = 0;
  const DLFStatus status = DLFAddVersionReport(
      dlf.data(), static_cast<std::uint32_t>(dlf.size()), written, reportWord, reportWord, version,
      executableName, application.buildDate,
      {static_cast<std::uint32_t>(now.seconds), static_cast<std::int16_t>(zone.offsetSeconds / 60),
       static_cast<std::uint8_t>(zone.daylight)});
  if (status != DLFStatus::Success) {
    logLine(logExportFailurePriority, "Could not write DLF header (result=%d)", static_cast<int>(status));
    return std::nullopt;
  }
  const Array* history = state.get(stateKey::history).array();
  if (!history) return dlf;
  for (const Value& record : *history) {
    const Dictionary* entries = record.dictionary();
    const Value& raw = entries ? entries->get(stateKey::displayState) : Value();
    if (raw.isAbsent()) continue;
    const Bytes* bytes = raw.data();
    if (!bytes) {
      logLine(logExportFailurePriority,
              "Got wrong class writing history to DLF; aborting writing the DLF file");
      return std::nullopt;
    }
    if (bytes->size() < 2) continue;
    // Kept: each interval loses its first byte, the log type of its first packet. Later packets keep theirs.
    dlf.insert(dlf.end(), bytes->begin() + 1, bytes->end());
  }
  return dlf;
}

Value KLVLogGenerator::getSaveContentsFromState(const Dictionary& state) const {
  const Array* history = state.get(stateKey::history).array();
  Value items = Value::ofArray(history ? *history : Array());
  if (auto dlf = generateDlfFromState(state)) {
    Value item = Value::ofDictionary();
    item.dictionary()->set("Description", "DLF binary (" + std::to_string(dlf->size()) + " bytes)");
    item.dictionary()->set("DLF", Value::ofData(std::move(*dlf)));
    items.array()->push_back(std::move(item));
  }
  return items;
}

void KLVLogGenerator::keepNoRawBytes() {
  _binData.clear();
  _roomForRawBytes = 0;
}

void KLVLogGenerator::leaveOut() {
  if (_roomForRawBytes > 0) ++_leftOut;
}

Value KLVLogGenerator::startCommandFor(std::span<const std::uint32_t> logCodes) {
  Value modemCodes = Value::ofArray();
  Value extraCodes = Value::ofArray();
  for (const std::uint32_t code : logCodes) {
    const bool isExtra = code >= LogMessage::extraCodeBase;
    (isExtra ? extraCodes : modemCodes)
        .array()
        ->push_back(Value::ofInteger(isExtra ? code - LogMessage::extraCodeBase : code));
  }
  Value command = Value::ofDictionary();
  command.dictionary()->set("SetState", "Streaming");
  command.dictionary()->set("SetKalviLogCodes", modemCodes);
  command.dictionary()->set("SetTkExtraCodes", extraCodes);
  return command;
}

void KLVLogGenerator::storeBinDataInState(Dictionary& state) {
  if (const auto count = _leftOut - std::exchange(_leftOutBefore, _leftOut); count > 0) {
    logWarning("The binary log lacks %ld messages of this interval, which brought more than %ld bytes", count,
               mostRawBytes);
  }
  Bytes next;
  next.reserve(_binData.size());  // the next interval is probably about as large
  state.set(stateKey::displayState, Value::ofData(std::exchange(_binData, std::move(next))));
}

}  // namespace varnel
