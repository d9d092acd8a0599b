#pragma once

#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/radios/LTEMessagePackets.h"
#include "programs/varnel-telephonyd/simulation/radios/LTEMessages.h"
#include "programs/varnel-telephonyd/simulation/radios/LTERegistration.h"
#include "programs/varnel-telephonyd/simulation/radios/PhoneLink.h"
#include "programs/varnel-telephonyd/simulation/radios/Script.h"

namespace varnel::simulation {

/// What an LTE phone and its network tell each other, and what becomes of it: connections, the registration,
/// and bearers. Messages come in the order and with about the delays of a real network.
class LTESignaling {
 public:
  LTESignaling(PhoneLink link, Random random, Network home);

  /// Does what is due.
  void run() { _script.run(_link.situation().now); }

  /// The phone is switched on and registers, over a connection.
  void attach();
  /// The phone connects, to report a new area or for data.
  void connect();
  /// A connected phone makes a call: a second bearer for a while.
  void call(std::chrono::milliseconds duration);
  void release();
  /// The network sends the phone to a UMTS channel.
  void releaseToUMTS(int channel);
  /// The phone has come to a cell of another area, or from another radio. It reports that with its next
  /// connection.
  void areaChanged() { _mustTellArea = true; }

  void sendRegistration();
  void sendSystemInformation();
  void sendPaging();
  void sendMeasurementReport(std::int64_t rsrp, std::int64_t rsrq);
  void reconfigure();

  const TemporaryName& name() const { return _name; }

 private:
  using Milliseconds = std::chrono::milliseconds;

  void after(Milliseconds delay, std::function<void()> task);
  void begin(lteMessages::Cause cause, const Bytes& message);
  void send(LTEChannel channel, const Bytes& message, std::uint32_t blocks = 0);
  void sendPlain(NASKind kind, const Bytes& message);
  void toNetwork(const Bytes& message);
  void toPhone(const Bytes& message);
  void enter(EMMState state, int substate);
  void authenticate();
  void finishAttach();
  void finishAreaUpdate();
  void setBearer(const Bearer& bearer, Bearer::State state);

  PhoneLink _link;
  Random _random;
  Script _script;
  TemporaryName _name;
  EMMState _state = EMMState::Deregistered;
  int _substate;
  bool _isRegistered = false, _mustTellArea = false;
  int _sequence = 0;
};

}  // namespace varnel::simulation
