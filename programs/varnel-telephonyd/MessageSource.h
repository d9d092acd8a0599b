#pragma once

#include <chrono>
#include <optional>
#include <string>

#include "base/Bytes.h"

namespace varnel {

/// One message of a stream.
struct StreamMessage {
  std::chrono::milliseconds at;  ///< since the start of the stream
  Bytes bytes;
};

/// The messages of a log channel, from the start of its stream on.
class MessageSource {
 public:
  virtual ~MessageSource() = default;
  /// The next message, no earlier than the one before; nothing when the stream has ended.
  virtual std::optional<StreamMessage> next() = 0;
  /// What log lines call the message that came last, as "Record 17 of walk.pcap".
  virtual std::string nameOfLast() const { return "A message"; }

  /// What becomes of messages whose receiver has no room when they are due.
  enum class Lateness { Waits, IsDropped };
  /// A stream that is not of this moment waits.
  virtual Lateness lateness() const { return Lateness::Waits; }
  /// One sentence for the user about a stream that has ended; empty when there is nothing to tell.
  virtual std::string endNote() const { return {}; }
};

}  // namespace varnel
