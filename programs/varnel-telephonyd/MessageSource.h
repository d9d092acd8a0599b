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

/// The messages of a log channel, from the start of its stream.
class MessageSource {
 public:
  virtual ~MessageSource() = default;
  /// The next message, no earlier than the one before; nothing when the stream has ended.
  virtual std::optional<StreamMessage> next() = 0;
  /// The name of the last message for log lines, such as "Record 17 of walk.pcap".
  virtual std::string nameOfLast() const { return "A message"; }

  /// What happens to a message when its receiver has no room at the time when it is due.
  enum class Lateness { Waits, IsDropped };
  /// A stream that is not live waits.
  virtual Lateness lateness() const { return Lateness::Waits; }
  /// One sentence for the user about the end of the stream; empty when there is nothing to tell.
  virtual std::string endNote() const { return {}; }
};

}  // namespace varnel
