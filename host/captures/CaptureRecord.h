#pragma once

#include <cstdint>
#include <optional>
#include <stdexcept>

#include "base/Bytes.h"
#include "base/Time.h"

namespace varnel {

/// A capture that cannot be read or written. The text is one line that says what is wrong, in which file,
/// and, where possible, what to do.
class CaptureError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

/// Whether the clock of a record showed the time of day.
enum class Dating {
  Known,
  Unknown,  ///< it counted from its own start, as a modem does before it has met a network
};

/// One message of a capture.
struct CaptureRecord {
  /// The time by the capture's own clock: the modem's clock, or for pcap the clock of the capturing machine.
  /// If the date is unknown, only the distance to other such records has a meaning.
  Time time{};
  Dating dating = Dating::Known;
  /// The message as the log channel carries it: log type, then the record. If there is a subscription, 0x81
  /// and the subscription come before. Valid until the next record is read.
  ByteView message{};
  /// The number of the SIM card, as the modem counts; absent when nothing tells.
  std::optional<std::uint8_t> subscription{};
};

/// What was read but yielded no record, counted by kind.
struct LeftOut {
  std::uint64_t badChecksum = 0;    ///< frames whose checksum is wrong
  std::uint64_t torn = 0;           ///< frames and records cut off by the beginning or the end of the capture
  std::uint64_t otherCommands = 0;  ///< sound frames that hold no log record: answers, debug texts, events
  std::uint64_t encrypted = 0;      ///< sound frames that hold an encrypted log record
  std::uint64_t broken = 0;         ///< frames and records whose lengths contradict each other
  std::uint64_t tooLong = 0;        ///< records that are longer than any message may be
  std::uint64_t noiseBytes = 0;     ///< bytes, not frames: bytes that belong to no frame

  /// The number of frames among them. Together with the records they are all frames of the capture.
  std::uint64_t frames() const { return badChecksum + torn + otherCommands + encrypted + broken + tooLong; }

  friend bool operator==(const LeftOut&, const LeftOut&) = default;
};

}  // namespace varnel
