#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "host/captures/Capture.h"
#include "programs/varnel-telephonyd/MessageSource.h"
#include "programs/varnel-telephonyd/ReplayPace.h"
#include "programs/varnel-telephonyd/ReplaySubscription.h"

namespace varnel {

/// Plays a capture back: its messages in their order, at the pace of `ReplayPace`.
class ReplaySource final : public MessageSource {
 public:
  enum class AtEnd { Stop, StartOver };

  /// Plays the capture `speed` times as fast. When it starts over, the first message comes one second of the
  /// capture's time after the last one. If there are several subscriptions, the given one is played, else the
  /// first one or all.
  ReplaySource(std::string path, double speed, AtEnd atEnd, std::optional<std::uint8_t> subscription = {},
               Unasked unasked = Unasked::First);

  /// A fault of the capture writes a log line and ends the stream. A log line also tells, once, that a wait
  /// was shortened, and once, that there are other subscriptions.
  std::optional<StreamMessage> next() override;
  std::string nameOfLast() const override;
  std::string endNote() const override { return _endNote; }
  std::optional<StreamPosition> position() const override { return _played.value_or(StreamPosition{}); }
  std::chrono::milliseconds setSpeed(double speed, std::chrono::milliseconds now) override {
    return _pace.setSpeed(speed, now);
  }
  Seeking seek(const StreamPlace& place, std::chrono::milliseconds now) override;
  bool isSeeking() const override { return _seek.has_value(); }

 private:
  struct Seek {
    StreamPlace place;
    std::chrono::milliseconds at;  // when it was asked for
  };

  bool readRecord(CaptureRecord& record);
  std::chrono::milliseconds playingTimeOf(Time time);
  static StreamMessage message(std::chrono::milliseconds at, const CaptureRecord& record);

  const std::string _path;
  const AtEnd _atEnd;
  ReplaySubscription _subscription;
  ReplayPace _pace;
  std::unique_ptr<Capture> _capture;        // open while it is played
  std::size_t _recordsRead = 0;             // in this round
  PlayingTime _playingTime;                 // of this round
  std::optional<StreamPosition> _played;    // of the last message that is done with
  std::optional<StreamPosition> _upcoming;  // of the message that `next` returned last
  std::optional<Seek> _seek;                // until its place is reached
  std::string _endNote;                     // empty before the end
};

}  // namespace varnel
