#pragma once

#include <span>
#include <string_view>

#include "base/Bytes.h"

namespace varnel {

/// A message whose decoding is measured, and the technology that decodes it.
struct PacketCase {
  std::string_view name;
  std::string_view technology;
  Bytes (*message)();
  /// Turns a message into the one that follows it, for decoders that compare the two; null where all are
  /// alike.
  void (*advance)(Bytes& message) = nullptr;
};

std::span<const PacketCase> packetCases();

}  // namespace varnel
