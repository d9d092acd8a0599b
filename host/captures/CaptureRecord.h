#pragma once

#include <cstdint>
#include <optional>
#include <stdexcept>

#include "base/Bytes.h"
#include "base/Time.h"

namespace varnel {

/// A capture that cannot be read or written. The text is one line that says what, which file, and where it
/// helps what to do.
class CaptureError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

/// Whether the clock behind a record's time showed the time of day.
enum class Dating {
  Known,
  Unknown,  ///< it counted from a start of its own, as a modem's does until it has met a network
};

/// One message of a capture.
struct CaptureRecord {
  /// By the capture's own clock: of what a modem sent the modem's, of pcap that of whoever captured. Where
  /// the date is unknown only the distance from other such records means anything.
  Time time{};
  Dating dating = Dating::Known;
  /// As the log channel carries it: log type, then the record; with a leading 0x81 and the subscription where
  /// there is one. Valid until the next record is read.
  ByteView message{};
  /// Which SIM card's modem it is of, as the modem counts them; absent where nothing tells.
  std::optional<std::uint8_t> subscription{};
};

/// What was read and yielded no record, counted by kind.
struct LeftOut {
  std::uint64_t badChecksum = 0;    ///< frames whose checksum is wrong
  std::uint64_t torn = 0;           ///< frames and records that the capture's first or last byte cuts off
  std::uint64_t otherCommands = 0;  ///< sound frames that hold no log record: answers, debug texts, events
  std::uint64_t encrypted = 0;      ///< sound frames that hold an encrypted log record
  std::uint64_t broken = 0;         ///< frames and records whose lengths contradict each other
  std::uint64_t tooLong = 0;        ///< records that are longer than any message may be
  std::uint64_t noiseBytes = 0;     ///< bytes, not frames: those that belong to no frame at all

  /// Those that count as frames: together with the records they are all frames of the capture.
  std::uint64_t frames() const { return badChecksum + torn + otherCommands + encrypted + broken + tooLong; }

  friend bool operator==(const LeftOut&, const LeftOut&) = default;
};

}  // namespace varnel
