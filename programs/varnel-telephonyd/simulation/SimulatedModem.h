#pragma once

#include <chrono>
#include <cstdint>
#include <string_view>

#include "base/Bytes.h"

namespace varnel {

/// One message of a simulated log channel.
struct SimulatedMessage {
  std::chrono::milliseconds at;  ///< since the start of the stream
  Bytes bytes;
};

/// A simulated modem that somebody carries through a town. Its messages never end, and come at the pace of a
/// real modem. The same seed gives the same messages on every machine.
class SimulatedModem {
 public:
  virtual ~SimulatedModem() = default;
  /// The technology, as the telephony service names it.
  virtual std::string_view technology() const = 0;
  /// The next message, no earlier than the one before.
  virtual SimulatedMessage next() = 0;
};

}  // namespace varnel
