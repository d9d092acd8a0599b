#pragma once

#include <span>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// What the phone and the network know about each other, for circuits and for packets. The phone searches a
/// network when it is switched on, reports when it comes to another area or network, and asks for
/// connections.
class MobilityManagement {
 public:
  /// The condition at one moment, with the numbers of the packets.
  struct Condition {
    int circuitState, circuitSubstate, locationUpdateStatus;
    int packetState, packetSubstate, packetUpdateStatus;
    int registrationState;
    bool operator==(const Condition&) const = default;
  };
  /// A step of a procedure.
  struct Step {
    int duration_ms;
    Condition condition;
  };

  /// The phone is switched on at the start of time.
  MobilityManagement();

  /// Lets time pass. True when something has changed.
  bool update(std::chrono::milliseconds now);

  /// The phone has come to a cell of another area or network. During a call, it reports that after the call.
  void areaChanged(std::chrono::milliseconds now);
  void networkChanged(std::chrono::milliseconds now);

  /// A call over this technology begins or ends. A second beginning has no effect. Meanwhile a GSM phone
  /// transfers no packets.
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
  Procedure _procedure;            // the remaining steps
  std::chrono::milliseconds _end;  // of the current step
  Procedure _afterCall;
  bool _isInCall = false;
  Access _callAccess = Access::UMTS;
};

}  // namespace varnel::simulation
