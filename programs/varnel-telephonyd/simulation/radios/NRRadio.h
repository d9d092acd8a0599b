#pragma once

#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/radios/NRPackets.h"
#include "programs/varnel-telephonyd/simulation/radios/PhoneLink.h"
#include "programs/varnel-telephonyd/simulation/radios/Script.h"

namespace varnel::simulation {

/// The NR part of a phone of today, beside a connection over LTE or alone. Like its LTE part, it changes the
/// versions of its packets.
class NRRadio {
 public:
  NRRadio(PhoneLink link, Random random, Network home);

  /// Does what is due.
  void run() { _script.run(_link.situation().now); }
  /// Reports once per second what there is to report. Beside LTE, the serving cell of the phone is one of
  /// LTE.
  void report();

  /// LTE adds NR to its connection.
  void addToLTE();
  /// The phone registers over NR alone.
  void arrive();
  /// NR alone: the phone has another cell.
  void cellChanged();
  void leave();

 private:
  bool isAlone() const { return _link.situation().serving.access == Access::NR; }
  void after(std::chrono::milliseconds delay, std::function<void()> task);
  void reportCell();
  void reportRegistration();
  const Cell* servingCell(const std::vector<NRMeasurement>& cells) const;

  PhoneLink _link;
  Random _random;
  Script _script;
  TemporaryName _name;
  FiveGMMState _state = FiveGMMState::Deregistered;
  int _reports = 0;
};

}  // namespace varnel::simulation
