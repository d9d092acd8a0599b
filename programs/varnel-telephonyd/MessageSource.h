#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/CodeFilter.h"
#include "programs/varnel-telephonyd/StreamPlace.h"

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
  /// Gets what the viewer has asked for, before the first `next` and whenever it changes. The source may
  /// still have other messages.
  virtual void setFilter(const CodeFilter& /*filter*/) {}
  /// The next message, no earlier than the one before; nothing when there is none now. Calling this means
  /// that the message before is done with.
  virtual std::optional<StreamMessage> next() = 0;
  /// After `next` has returned nothing: whether more messages may come. Else the stream has ended.
  virtual bool isWaiting() const { return false; }
  /// Gets the function that the source calls, from the main queue, when waiting is over and `next` has news.
  // NOLINTNEXTLINE(performance-unnecessary-value-param): sources that have news keep it
  virtual void setNewsHandler(std::function<void()> /*handler*/) {}
  /// One sentence for the viewer that waits for something else than the next message; else empty.
  virtual std::string waitNote() const { return {}; }
  /// The name of the last message for log lines, such as "Record 17 of walk.pcap".
  virtual std::string nameOfLast() const { return "A message"; }

  /// Where the stream is, by the last message that is done with. Absent for a live stream.
  virtual std::optional<StreamPosition> position() const { return std::nullopt; }
  /// Plays what comes after this time of the stream this many times as fast as at speed 1. Returns when the
  /// message that `next` returned last is due now. Does nothing for a live stream.
  virtual std::chrono::milliseconds setSpeed(double /*speed*/, std::chrono::milliseconds now) { return now; }
  /// What `seek` did.
  enum class Seeking {
    GoesOn,      ///< the message that `next` returned last is due now
    StartsOver,  ///< that message is no longer the next one; `next` begins at the start of the stream
  };
  /// Makes all messages before this place due at once, from the start of the stream if the place has been
  /// passed. The first message at the place is the next one that is not. Does nothing for a live stream.
  virtual Seeking seek(const StreamPlace& /*place*/, std::chrono::milliseconds /*now*/) {
    return Seeking::GoesOn;
  }
  /// Whether the message that `next` returned last is due at once because it is before the place of a seek.
  virtual bool isSeeking() const { return false; }

  /// What happens to a message when its receiver has no room at the time when it is due.
  enum class Lateness {
    Waits,
    IsDropped,
    IsHandedOn,  ///< it waits, and when the viewer goes, the next one gets it
  };
  /// A stream that is not live waits.
  virtual Lateness lateness() const { return Lateness::Waits; }
  /// How many messages were lost since the last call because the receiver took too few.
  virtual std::uint64_t takeLost() { return 0; }
  /// How many messages wait in a source that is live.
  virtual std::size_t waiting() const { return 0; }
  /// One sentence for the user about the end of the stream; empty when there is nothing to tell.
  virtual std::string endNote() const { return {}; }
  /// Whether the server's user knows about the end from another viewer's stream.
  virtual bool isEndTold() const { return false; }
};

}  // namespace varnel
