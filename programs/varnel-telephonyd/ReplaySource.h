#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "base/Time.h"
#include "host/Subscription.h"
#include "host/captures/Capture.h"
#include "programs/varnel-telephonyd/MessageSource.h"

namespace varnel {

/// Plays a capture back: its messages in their order and at their distances in time. None lets one wait for
/// more than five seconds. A message that is dated before its predecessor comes together with that one; when
/// its clock was set back, those that follow keep their distances to it.
class ReplaySource final : public MessageSource {
 public:
  enum class AtEnd { Stop, StartOver };

  static constexpr std::chrono::milliseconds longestWait{5000};

  /// The capture is played that many times as fast. When it starts over, the first message follows the last
  /// one after a second of the capture's time. Of several subscriptions one is played: the one that is named,
  /// else the first.
  ReplaySource(std::string path, double speed, AtEnd atEnd, std::optional<std::uint8_t> subscription = {});

  /// A fault of the capture is logged and ends the stream. So is, once, that a wait was shortened, and that
  /// there are other subscriptions than the one that is played.
  std::optional<StreamMessage> next() override;
  std::string nameOfLast() const override;
  std::string endNote() const override { return _endNote; }

 private:
  /// A moment of the capture, and when it is played.
  struct Moment {
    Time time;
    std::chrono::milliseconds at;  // of the stream
  };

  bool readRecord(CaptureRecord& record);
  bool readTaken(CaptureRecord& record);
  void noteOther(std::uint8_t subscription);
  Moment following(Time time);
  void tellShortening(Time time);
  std::chrono::milliseconds playingTime(std::chrono::nanoseconds duration) const;
  std::unique_ptr<Capture> open() const;

  const std::string _path;
  const double _speed;
  const AtEnd _atEnd;
  SubscriptionFilter _subscriptions;
  bool _tellsOthers;  // than the one that is played, once
  bool _hasOthers = false;
  std::unique_ptr<Capture> _capture;  // open while it is being played
  std::size_t _recordsRead = 0;       // of this round
  std::optional<Moment> _last;        // absent before the first record
  Moment _origin{};                   // from which the distances are measured
  bool _hasToldShortening = false;
  std::string _endNote;  // empty until the end
};

}  // namespace varnel
