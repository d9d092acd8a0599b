#pragma once

#include <cstdint>
#include <optional>
#include <set>

#include "base/Bytes.h"

namespace varnel {

/// The log codes that a viewer has asked for, by log type. An absent list asks for nothing. If both lists are
/// absent, the viewer asks for all messages.
struct CodeFilter {
  using Codes = std::set<std::int64_t>;
  std::optional<Codes> modemCodes;   ///< of packets of log type 1
  std::optional<Codes> serverCodes;  ///< of the telephony server's own messages, log type 0xFF

  /// Whether the viewer has asked for the message. True for a message without a log code.
  bool takes(ByteView message) const;
};

}  // namespace varnel
