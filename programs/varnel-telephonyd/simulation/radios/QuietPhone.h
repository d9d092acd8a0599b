#pragma once

#include "programs/varnel-telephonyd/simulation/WalkingModem.h"
#include "programs/varnel-telephonyd/simulation/radios/GSMRadio.h"
#include "programs/varnel-telephonyd/simulation/radios/LTERegistration.h"

namespace varnel::simulation {

/// The second subscription of a phone of today: on another network, it only listens, to LTE and GSM by turns.
/// Its packets have older versions than those of the first subscription.
class QuietPhone final : public WalkingModem {
 public:
  QuietPhone(Random walk, Random own);

  std::string_view technology() const override;

 private:
  void stepWalked() override;
  void servingCellChanged(const Cell& previous) override;

  Situation situation() const { return {now(), walk(), servingCell()}; }
  bool isOnLTE() const { return servingCell().access == Access::LTE; }

  void report();
  void reportCell();
  void reportLTE();

  Random _random;
  TemporaryName _name;
  GSMRadio _gsm;
  std::chrono::milliseconds _phaseEnd;
  int _reports = 0;
};

}  // namespace varnel::simulation
