#pragma once

#include <chrono>
#include <cstdint>
#include <vector>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/radios/AllRadiosModem.h"

namespace varnel::simulation {

/// A message of the modem of all radios, read by offsets from the payload's start.
struct RadioMessage {
  std::chrono::milliseconds at;
  unsigned mark, subscription;  // the two bytes before the packet
  Bytes packet;

  unsigned code() const { return packet.at(3) | packet.at(4) << 8; }
  bool isOfModem() const { return packet.at(0) == 1; }
  std::size_t size() const { return packet.size() - 13; }
  unsigned u8(std::size_t offset) const { return packet.at(13 + offset); }
  unsigned u16(std::size_t offset) const { return u8(offset) | u8(offset + 1) << 8; }
  unsigned u32(std::size_t offset) const { return u16(offset) | u16(offset + 2) << 16; }
  std::int32_t i32(std::size_t offset) const { return static_cast<std::int32_t>(u32(offset)); }
  /// Bits of the little-endian number of four bytes.
  unsigned bits(std::size_t offset, unsigned first, unsigned width) const {
    return u32(offset) >> first & ((1u << width) - 1);
  }
};

inline std::vector<RadioMessage> radioMessages(std::uint64_t seed, std::chrono::milliseconds duration) {
  AllRadiosModem modem(seed);
  std::vector<RadioMessage> messages;
  for (SimulatedMessage next = modem.next(); next.at <= duration; next = modem.next())
    messages.push_back(
        {next.at, next.bytes.at(0), next.bytes.at(1), Bytes(next.bytes.begin() + 2, next.bytes.end())});
  return messages;
}

}  // namespace varnel::simulation
