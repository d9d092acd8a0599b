#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <optional>
#include <utility>

#include "programs/varnel-telephonyd/MessageSource.h"
#include "programs/varnel-telephonyd/simulation/SimulatedModem.h"

namespace varnel {

/// The messages of a simulated modem. Its speed can be changed, and it can start over.
class SimulationSource final : public MessageSource {
 public:
  using ModemMaker = std::function<std::unique_ptr<SimulatedModem>()>;

  /// Calls the function now, and whenever the modem starts over.
  explicit SimulationSource(ModemMaker makeModem) : _makeModem(std::move(makeModem)), _modem(_makeModem()) {}

  std::optional<StreamMessage> next() override;
  std::optional<StreamPosition> position() const override { return _played.value_or(StreamPosition{}); }
  std::chrono::milliseconds setSpeed(double speed, std::chrono::milliseconds now) override;
  Seeking seek(const StreamPlace& place, std::chrono::milliseconds now) override;
  bool isSeeking() const override { return _place.has_value(); }

  /// A modem does not wait.
  Lateness lateness() const override { return Lateness::IsDropped; }

 private:
  using Milliseconds = std::chrono::milliseconds;

  Milliseconds playingTimeOf(Milliseconds modemTime) const;

  const ModemMaker _makeModem;
  std::unique_ptr<SimulatedModem> _modem;
  double _speed = 1;
  // A moment of the modem, and when it is played. From here the distances are measured.
  Milliseconds _modemOrigin{0}, _origin{0};
  std::optional<StreamPosition> _played;    // of the last message that is done with
  std::optional<StreamPosition> _upcoming;  // of the message that `next` returned last
  std::optional<StreamPlace> _place;        // of a seek, until it is reached
};

}  // namespace varnel
