#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "base/Bytes.h"

namespace varnel {

/// What the telephony server tells a viewer about the stream, on the viewer's port beside the messages. The
/// numbers count from the start of the log channel on.
struct StreamReport {
  std::string note;           ///< one sentence about where the messages come from; empty when there is none
  std::uint64_t dropped = 0;  ///< messages that the viewer had no room for
  std::uint64_t tooLong = 0;  ///< messages that are longer than the channel takes

  bool operator==(const StreamReport&) const = default;
};

/// The report as a property list; a note that no property list can hold is left out.
Bytes writeStreamReport(const StreamReport& report);
/// Nothing for bytes that are no report. What is missing in one is empty or 0.
std::optional<StreamReport> readStreamReport(ByteView bytes);

}  // namespace varnel
