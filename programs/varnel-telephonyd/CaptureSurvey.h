#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "base/Time.h"
#include "host/Subscription.h"
#include "host/captures/Capture.h"
#include "platform/MainQueue.h"
#include "programs/varnel-telephonyd/StreamPlace.h"

namespace varnel {

/// Reads a whole capture to learn how long it plays. It reads a few records per turn of the main queue, so
/// everything else goes on.
class CaptureSurvey final {
 public:
  struct Result {
    std::chrono::milliseconds length{0};  ///< how long playing takes at speed 1
    std::optional<Time> first, last;      ///< times of the first and the last record; absent without records
    LeftOut leftOut;
  };

  /// Takes the records that a replay with these options plays. The queue must outlive the survey.
  CaptureSurvey(MainQueue& queue, std::string path, std::optional<std::uint8_t> subscription, Unasked unasked)
      : _queue(queue), _path(std::move(path)), _filter(subscription, unasked) {}
  CaptureSurvey(const CaptureSurvey&) = delete;
  CaptureSurvey& operator=(const CaptureSurvey&) = delete;
  ~CaptureSurvey() = default;

  /// The result; nothing until the capture is read. The first call begins to read. A capture that is no
  /// regular file is not read, since reading could wait or take its records away.
  const std::optional<Result>& result();

 private:
  void readSome();
  void readLater();

  MainQueue& _queue;
  const std::string _path;
  SubscriptionFilter _filter;
  bool _hasBegun = false;
  std::unique_ptr<Capture> _capture;  // while it is read
  PlayingTime _playingTime;
  Result _sofar;
  std::optional<Result> _result;
  std::shared_ptr<bool> _life = std::make_shared<bool>();  // for tasks that may run after this object
};

}  // namespace varnel
