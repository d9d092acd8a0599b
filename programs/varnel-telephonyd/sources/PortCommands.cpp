#include "programs/varnel-telephonyd/sources/PortCommands.h"

#include <algorithm>
#include <cstdio>

#include "host/captures/LittleEndian.h"

namespace varnel {

namespace {

namespace layout = logConfiguration;

constexpr std::size_t numberSize = 4;
constexpr std::size_t buildTextOffset = 12;
// Eleven characters of date, then eight of time.
constexpr std::size_t dateOffset = 1, dateSize = 11, timeSize = 8;
// No text of a port is shown longer than this.
constexpr std::size_t longestText = 100;

Bytes configuration(std::uint32_t operation) {
  Bytes contents{portCommand::logConfiguration, 0, 0, 0};
  appendLittleEndian(contents, operation);
  return contents;
}

std::optional<std::uint32_t> numberAt(ByteView contents, std::size_t offset) {
  if (contents.size() < numberSize || offset > contents.size() - numberSize) return std::nullopt;
  return loadLittleEndian<std::uint32_t>(contents, offset);
}

bool isError(ByteView contents) {
  return contents[0] >= portCommand::firstError && contents[0] <= portCommand::lastError;
}

// What follows the error repeats the request, or its beginning.
bool isErrorOf(ByteView contents, ByteView request) {
  const ByteView repeated = contents.subspan(1);
  return std::ranges::equal(repeated.first(std::min(repeated.size(), request.size())),
                            request.first(std::min(repeated.size(), request.size())));
}

// The operation, and for `setCodes` the equipment, must be those of the request.
bool isConfigurationAnswer(ByteView contents, ByteView request) {
  const auto operation = numberAt(request, layout::operationOffset);
  if (!numberAt(contents, layout::statusOffset)) return false;
  if (numberAt(contents, layout::operationOffset) != operation) return false;
  if (operation != layout::setCodes) return true;
  const auto equipment = numberAt(contents, layout::setEquipmentOffset);
  return !equipment || equipment == numberAt(request, layout::equipmentOffset);
}

// The printable characters up to the first zero byte, without spaces around them.
std::string textIn(ByteView bytes) {
  std::string text;
  for (const std::uint8_t byte : bytes.first(std::min(bytes.size(), longestText))) {
    if (byte == 0) break;
    if (byte >= 0x20 && byte < 0x7F) text += static_cast<char>(byte);
  }
  const auto first = text.find_first_not_of(' ');
  if (first == std::string::npos) return {};
  return text.substr(first, text.find_last_not_of(' ') - first + 1);
}

}  // namespace

namespace portRequest {

Bytes version() { return {portCommand::version}; }

Bytes build() { return {portCommand::build}; }

Bytes eventsOff() { return {portCommand::events, 0}; }

Bytes debugTextOff() { return {portCommand::debugText, 5, 0, 0, 0, 0, 0, 0}; }

Bytes allCodesOff() { return configuration(layout::allOff); }

Bytes codeNumbers() { return configuration(layout::numbers); }

Bytes setCodes(std::size_t equipment, const CodeMask& mask) {
  Bytes contents = configuration(layout::setCodes);
  appendLittleEndian(contents, static_cast<std::uint32_t>(equipment));
  appendLittleEndian(contents, mask.count);
  contents.insert(contents.end(), mask.bits.begin(), mask.bits.end());
  return contents;
}

}  // namespace portRequest

bool isAnswer(ByteView contents, ByteView request) {
  if (contents.empty() || request.empty()) return false;
  if (isError(contents)) return isErrorOf(contents, request);
  if (contents[0] != request[0]) return false;
  switch (request[0]) {
    case portCommand::logConfiguration:
      return isConfigurationAnswer(contents, request);
    case portCommand::debugText:
      return contents.size() > 1 && contents[1] == request[1];
    default:
      return contents.size() > 1;
  }
}

std::optional<std::string> refusal(ByteView answer) {
  if (answer.empty()) return std::nullopt;
  if (isError(answer)) {
    char text[16];
    std::snprintf(text, sizeof text, "error 0x%02X", unsigned{answer[0]});
    return text;
  }
  if (answer[0] != portCommand::logConfiguration) return std::nullopt;
  const auto status = numberAt(answer, layout::statusOffset);
  if (status.value_or(0) == 0) return std::nullopt;
  return "status " + std::to_string(*status);
}

std::optional<CodeNumbers> codeNumbersIn(ByteView answer) {
  CodeNumbers numbers{};
  for (std::size_t equipment = 0; equipment < equipments; ++equipment) {
    const auto number = numberAt(answer, layout::numbersOffset + equipment * numberSize);
    if (!number) return std::nullopt;
    numbers[equipment] = std::min(*number, codesOfEquipment);
  }
  return numbers;
}

std::string buildIn(ByteView answer) {
  return answer.size() > buildTextOffset ? textIn(answer.subspan(buildTextOffset)) : std::string();
}

std::string compilationIn(ByteView answer) {
  if (answer.size() < dateOffset + dateSize + timeSize) return {};
  const std::string date = textIn(answer.subspan(dateOffset, dateSize));
  const std::string time = textIn(answer.subspan(dateOffset + dateSize, timeSize));
  return date.empty() || time.empty() ? date + time : date + ' ' + time;
}

}  // namespace varnel
