#include "fuzz/MessageRules.h"

#include <algorithm>
#include <cstdint>
#include <string>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "base/PropertyListGuard.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::size_t headerSize = 13;
constexpr std::uint16_t cdmaLogCodes[] = {0x108A, 0x1183, 0x1192, 0x12B6, 0x119C, 0x119D, 0x127E, 0x134F};

// The packet in a message that is long enough to hold one: the message without its prefix.
ByteView packetOf(ByteView message) { return message[0] == 0x81 ? message.subspan(2) : message; }

unsigned logCodeOf(ByteView packet) { return packet[3] | packet[4] << 8U; }

bool hasDisplayForm(const Value& object) {
  if (object.string()) return true;
  if (const Dictionary* entries = object.dictionary())
    return std::ranges::all_of(*entries, [](const auto& entry) { return hasDisplayForm(entry.value); });
  const Array* elements = object.array();
  if (!elements) return false;
  // The generator ignores the first element.
  return elements->empty() || std::all_of(elements->begin() + 1, elements->end(), hasDisplayForm);
}

Outcome outcomeOfObject(ByteView message) {
  const auto object = readPropertyList(message);
  if (!object) return Outcome::NoPropertyList;
  return hasDisplayForm(*object) ? Outcome::Accepted : Outcome::UnknownObject;
}

bool isXmlCharacter(unsigned char character) {
  return character >= 0x20 || character == '\t' || character == '\n' || character == '\r';
}

bool isStrangeToXml(const std::string& text) {
  return !std::ranges::all_of(text, isXmlCharacter) || text.find("\xEF\xBF\xBE") != std::string::npos ||
         text.find("\xEF\xBF\xBF") != std::string::npos;
}

}  // namespace

Outcome requiredOutcome(std::string_view technology, ByteView message) {
  if (technology == technology::ifxGSM) return outcomeOfObject(message);
  const bool takesAnyFiles = technology == technology::kalviCDMA || technology == technology::allRadios;
  if (takesAnyFiles || message.size() < headerSize) return Outcome::Accepted;
  const ByteView packet = packetOf(message);
  if (packet[0] != 0xFF || logCodeOf(packet) != 0) return Outcome::Accepted;
  const auto files = readPropertyList(packet.subspan(std::min(headerSize, packet.size())));
  return files && files->dictionary() ? Outcome::Accepted : Outcome::UnreadableSimFiles;
}

ByteView loggedBytes(std::string_view technology, ByteView message) {
  if (technology != technology::kalviCDMA) return message;
  if (message.size() < headerSize) return {};
  const ByteView packet = packetOf(message);
  const bool isKnown = packet[0] != 0xFF && std::ranges::count(cdmaLogCodes, logCodeOf(packet)) > 0;
  return isKnown ? packet : ByteView();
}

bool isLaborious(ByteView bytes, const PropertyListLimits& limits) {
  constexpr std::size_t manyNodes = 1000, manyBytes = 1 << 16;
  PropertyListLimits easy = limits;
  easy.expandedNodes = std::min(easy.expandedNodes, manyNodes);
  easy.expandedBytes = std::min(easy.expandedBytes, manyBytes);
  easy.pathBytes = std::min(easy.pathBytes, manyBytes);
  return isSafeToParse(bytes, limits) && !isSafeToParse(bytes, easy);
}

bool holdsTextStrangeToXml(const Value& value) {
  if (const std::string* text = value.string()) return isStrangeToXml(*text);
  if (const Array* elements = value.array()) return std::ranges::any_of(*elements, holdsTextStrangeToXml);
  const Dictionary* entries = value.dictionary();
  return entries && std::ranges::any_of(*entries, [](const auto& entry) {
           return isStrangeToXml(entry.key) || holdsTextStrangeToXml(entry.value);
         });
}

}  // namespace varnel
