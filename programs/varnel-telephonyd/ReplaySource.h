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

/// Plays a capture back: its messages in their order and with their distances in time. No wait is longer than
/// five seconds. A message dated before its predecessor comes together with it. When the capture's clock was
/// set back, the messages after that keep their distances.
class ReplaySource final : public MessageSource {
 public:
  enum class AtEnd { Stop, StartOver };

  static constexpr std::chrono::milliseconds longestWait{5000};

  /// Plays the capture `speed` times as fast. When it starts over, the first message comes one second of the
  /// capture's time after the last one. If there are several subscriptions, only one is played: the given
  /// one, else the first.
  ReplaySource(std::string path, double speed, AtEnd atEnd, std::optional<std::uint8_t> subscription = {});

  /// A fault of the capture writes a log line and ends the stream. A log line also tells, once, that a wait
  /// was shortened, and once, that there are other subscriptions.
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
  bool _tellsOthers;  // whether other subscriptions still have to be reported
  bool _hasOthers = false;
  std::unique_ptr<Capture> _capture;  // open while it is played
  std::size_t _recordsRead = 0;       // in this round
  std::optional<Moment> _last;        // absent before the first record
  Moment _origin{};                   // from here the distances are measured
  bool _hasToldShortening = false;
  std::string _endNote;  // empty before the end
};

}  // namespace varnel
