#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <list>
#include <memory>
#include <optional>
#include <string>

#include "platform/MainQueue.h"
#include "programs/varnel-telephonyd/MessageSource.h"
#include "programs/varnel-telephonyd/RecordReader.h"
#include "programs/varnel-telephonyd/ReplayPace.h"
#include "programs/varnel-telephonyd/ReplaySubscription.h"

namespace varnel {

/// Plays a capture that can be read only once. One viewer at a time has its stream; the others wait. When it
/// leaves, the next one goes on with the message that the first one did not get. Nothing is read while there
/// is no viewer.
///
/// A record that had to be waited for is live and is played when it comes. A record that was there already
/// is played at the pace of `ReplayPace`.
class PipedReplay final {
 public:
  struct Setup {
    std::unique_ptr<RecordReader> reader;
    MainQueue& queue;
    std::function<std::chrono::milliseconds()> uptime;
    std::string name;  ///< of the capture, for users
    double speed = 1;
    std::optional<std::uint8_t> subscription{};
    Unasked unasked = Unasked::First;
  };

  explicit PipedReplay(Setup setup);
  PipedReplay(const PipedReplay&) = delete;
  PipedReplay& operator=(const PipedReplay&) = delete;
  /// The sources must be gone.
  ~PipedReplay() = default;

  /// The stream for one more viewer, which starts now.
  std::unique_ptr<MessageSource> makeSource();
  /// To be called on the main queue when the reader has something to take.
  void recordArrived();

 private:
  class Source;
  struct HeldRecord {
    std::chrono::milliseconds due;
    Bytes message;
    bool wasEarly;  // whether it came before it was due
  };

  void enter(Source& source);
  void leave(Source& source);
  bool hasStream(const Source& source) const { return _sources.front() == &source; }
  std::optional<StreamMessage> nextOf(Source& source);
  void hold(RecordReading reading);
  void end(const std::string& error);
  void wakeFirst();

  const Setup _setup;
  ReplaySubscription _subscription;
  ReplayPace _pace;
  std::list<Source*> _sources;  // of all viewers; the first one has the stream
  std::optional<HeldRecord> _held;
  bool _isRequested = false;                           // whether the reader reads
  std::size_t _recordsRead = 0;                        // until the record that is held
  std::optional<std::chrono::milliseconds> _pausedAt;  // without a viewer, unless the stream is live
  std::string _endNote;                                // empty before the end
  bool _isEndTold = false;
  std::shared_ptr<bool> _life = std::make_shared<bool>();  // for tasks that may run after this object
};

}  // namespace varnel
