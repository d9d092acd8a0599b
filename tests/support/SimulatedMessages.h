#pragma once

#include <chrono>
#include <cstdint>
#include <string>
#include <vector>

#include "LogGenerator/LogMessage.h"
#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"

namespace varnel {

/// One message of a simulated modem without the prefix that some have. Offsets count from the packet's start.
struct SimulatedPacket {
  std::chrono::milliseconds at;
  bool hasPrefix;
  Bytes packet;

  unsigned u8(std::size_t offset) const { return packet.at(offset); }
  unsigned u16(std::size_t offset) const { return u8(offset) | u8(offset + 1) << 8; }
  unsigned u32(std::size_t offset) const { return u16(offset) | u16(offset + 2) << 16; }
  unsigned code() const { return LogMessage::framed(packet)->logCode(); }
  Value payload() const {
    return readPropertyList(LogMessage::framed(packet)->packet().payload()).value_or(Value());
  }
};

/// What a modem sends in that time.
inline std::vector<SimulatedPacket> simulatedMessages(std::string_view technology, std::uint64_t seed,
                                                      std::chrono::milliseconds duration) {
  const auto modem = simulatedModem(technology, seed);
  std::vector<SimulatedPacket> messages;
  for (SimulatedMessage next = modem->next(); next.at <= duration; next = modem->next()) {
    const bool hasPrefix = next.bytes.at(0) == 0x81;
    if (hasPrefix) next.bytes.erase(next.bytes.begin(), next.bytes.begin() + 2);
    messages.push_back({next.at, hasPrefix, next.bytes});
  }
  return messages;
}

/// The messages of that log code among them.
inline std::vector<SimulatedPacket> simulatedMessagesOf(unsigned code, std::string_view technology,
                                                        std::uint64_t seed,
                                                        std::chrono::milliseconds duration) {
  std::vector<SimulatedPacket> messages = simulatedMessages(technology, seed, duration);
  std::erase_if(messages, [code](const SimulatedPacket& message) { return message.code() != code; });
  return messages;
}

/// The text of that key in a dictionary.
inline std::string textOf(const Value& dictionary, std::string_view key) {
  const std::string* found = dictionary.dictionary()->get(key).string();
  return found ? *found : "(none)";
}

/// The number of that key in a dictionary.
inline std::int64_t numberOf(const Value& dictionary, std::string_view key) {
  return dictionary.dictionary()->get(key).integer().value_or(-999);
}

}  // namespace varnel
