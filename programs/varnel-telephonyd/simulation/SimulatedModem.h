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

/// A modem that exists on paper only, carried through a town by somebody who walks. Its messages go on
/// without end, at the pace of a real one; the same seed gives the same messages on every machine.
class SimulatedModem {
 public:
  virtual ~SimulatedModem() = default;
  /// The identifier under which the telephony service publishes it.
  virtual std::string_view technology() const = 0;
  /// The next message, no earlier than the one before.
  virtual SimulatedMessage next() = 0;
};

}  // namespace varnel
