#pragma once

#include <cstdint>
#include <optional>
#include <set>

#include "base/Bytes.h"

namespace varnel {

/// The log codes that a viewer has asked for, by log type. A list that is absent asks for nothing, but
/// without any list everything is asked for.
struct CodeFilter {
  using Codes = std::set<std::int64_t>;
  std::optional<Codes> modemCodes;   ///< of packets of log type 1
  std::optional<Codes> serverCodes;  ///< of the telephony server's own messages, log type 0xFF

  /// Whether the message is wanted. What bears no log code is not for the filter to judge: it is.
  bool takes(ByteView message) const;
};

}  // namespace varnel
