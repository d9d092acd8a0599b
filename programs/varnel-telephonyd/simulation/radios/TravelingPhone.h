#pragma once

#include "programs/varnel-telephonyd/simulation/CDMA1xPhone.h"
#include "programs/varnel-telephonyd/simulation/MobilityManagement.h"
#include "programs/varnel-telephonyd/simulation/WalkingModem.h"
#include "programs/varnel-telephonyd/simulation/radios/GSMRadio.h"
#include "programs/varnel-telephonyd/simulation/radios/LTERadio.h"
#include "programs/varnel-telephonyd/simulation/radios/NRRadio.h"
#include "programs/varnel-telephonyd/simulation/radios/UMTSRadio.h"

namespace varnel::simulation {

/// The first subscription of a phone of today. It goes round through LTE with several carriers, NR beside
/// LTE, NR alone, UMTS and GSM. All the while a CDMA receiver listens to the 1x network, as in phones that
/// call over it.
class TravelingPhone final : public WalkingModem {
 public:
  TravelingPhone(Random walk, Random own);

  std::string_view technology() const override;

 private:
  enum class Phase { Idle, Connected, NRBesideLTE, NRAlone, UMTS, GSM };
  struct Stop;
  static const Stop journey[];

  void stepWalked() override;
  void servingCellChanged(const Cell& previous) override;

  PhoneLink link();
  Situation situation() const { return {now(), walk(), servingCell()}; }

  Phase phase() const;
  bool canLeavePhase() const;
  void nextPhase();
  void enterPhase();
  void leavePhase(Phase next);
  void stepRadio();
  void stepMobility();
  void report();
  void sendMobility();
  void sendNetwork();
  void sendCDMA();

  Random _random;
  LTERadio _lte;
  NRRadio _nr;
  UMTSRadio _umts;
  GSMRadio _gsm;
  CDMA1xPhone _cdma;
  MobilityManagement _mobility;
  std::size_t _phase = 0;
  std::chrono::milliseconds _phaseEnd{0};
  bool _wasBusy = false;
  int _reports = 0;
};

}  // namespace varnel::simulation
