#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "base/Bytes.h"

namespace varnel {

/// What the telephony server tells a viewer about the stream, over the viewer's port. The numbers count from
/// the start of the log channel.
struct StreamReport {
  std::string note;           ///< one sentence about where the messages come from; empty when there is none
  std::uint64_t dropped = 0;  ///< messages for which the viewer had no room
  std::uint64_t tooLong = 0;  ///< messages that are longer than the channel allows

  bool operator==(const StreamReport&) const = default;
};

/// The report as a property list. Leaves out a note that no property list can hold.
Bytes writeStreamReport(const StreamReport& report);
/// Nothing for bytes that are no report. A missing note is empty, a missing number is 0.
std::optional<StreamReport> readStreamReport(ByteView bytes);

}  // namespace varnel
