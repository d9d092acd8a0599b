#pragma once

#include <span>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// What the phone and the network know of each other, for circuits and for packets: the phone searches a
/// network when it is switched on, tells when it comes to another area or network, and asks for connections.
class MobilityManagement {
 public:
  /// Everything at one moment, as the packets number it.
  struct Condition {
    int circuitState, circuitSubstate, locationUpdateStatus;
    int packetState, packetSubstate, packetUpdateStatus;
    int registrationState;
    bool operator==(const Condition&) const = default;
  };
  /// A part of a procedure.
  struct Step {
    int duration_ms;
    Condition condition;
  };

  /// Switched on at the start of time.
  MobilityManagement();

  /// Time passes; true when something is another from now on.
  bool update(std::chrono::milliseconds now);

  /// The phone has gone to a cell of another area, or of another network. During a call it tells that when
  /// the call has ended.
  void areaChanged(std::chrono::milliseconds now);
  void networkChanged(std::chrono::milliseconds now);

  /// A call over that technology begins or ends; beginning twice is beginning once. GSM phones do not
  /// transfer packets meanwhile.
  void callBegan(std::chrono::milliseconds now, Access access);
  void callEnded(std::chrono::milliseconds now);

  bool isRegistered() const;
  bool isSearching() const;

  Bytes circuitState(const Situation& situation) const;
  Bytes packetState(const Situation& situation) const;
  Bytes registrationState(const Situation& situation) const;

 private:
  using Procedure = std::span<const Step>;

  void begin(Procedure procedure, std::chrono::milliseconds now);
  void tellMove(Procedure procedure, std::chrono::milliseconds now);
  const Condition& lasting() const;

  Condition _condition;
  Procedure _procedure;            // what is left of it
  std::chrono::milliseconds _end;  // of its step
  Procedure _afterCall;
  bool _isInCall = false;
  Access _callAccess = Access::UMTS;
};

}  // namespace varnel::simulation
