#pragma once

#include <span>
#include <string_view>

#include "base/Bytes.h"

namespace varnel {

/// A message whose decoding is measured, and its technology.
struct PacketCase {
  std::string_view name;
  std::string_view technology;
  Bytes (*message)();
  /// Turns a message into the next one, for decoders that compare two messages. Null when all messages are
  /// the same.
  void (*advance)(Bytes& message) = nullptr;
};

std::span<const PacketCase> packetCases();

}  // namespace varnel
