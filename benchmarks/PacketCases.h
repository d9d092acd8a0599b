#pragma once

#include <functional>
#include <span>
#include <string>
#include <string_view>

#include "base/Bytes.h"

namespace varnel {

/// A message whose decoding is measured, and its technology.
struct PacketCase {
  std::string name;
  std::string_view technology;
  std::function<Bytes()> message;
  /// Turns a message into the next one, for decoders that compare two messages. Null when all messages are
  /// the same.
  void (*advance)(Bytes& message) = nullptr;
};

/// Packets with much content; then, for each other log code that a class index has handlers for, the shortest
/// packet that a decoder takes, of zeros; then a packet of each log code and version that the simulated modem
/// of all radios sends.
std::span<const PacketCase> packetCases();

}  // namespace varnel
