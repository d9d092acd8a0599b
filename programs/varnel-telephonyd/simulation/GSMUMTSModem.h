#pragma once

#include "programs/varnel-telephonyd/simulation/GSMConnection.h"
#include "programs/varnel-telephonyd/simulation/MobilityManagement.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"
#include "programs/varnel-telephonyd/simulation/UMTSChannels.h"
#include "programs/varnel-telephonyd/simulation/UTRANConnection.h"
#include "programs/varnel-telephonyd/simulation/WalkingModem.h"

namespace varnel::simulation {

/// A modem that uses UMTS and GSM by turns. The GSM network is a different network. For the technology in
/// use, the modem reports its connection, the serving cell, and the cells around it. For both, it reports the
/// registration of the phone.
class GSMUMTSModem final : public WalkingModem {
 public:
  explicit GSMUMTSModem(std::uint64_t seed) : GSMUMTSModem(Random(seed)) {}

  std::string_view technology() const override;

 private:
  explicit GSMUMTSModem(Random random);

  void stepWalked() override;
  void servingCellChanged(const Cell& previous) override;

  void repeatOn(Access access, Pace pace, void (GSMUMTSModem::*task)());
  Situation situation() const { return {now(), walk(), servingCell()}; }

  void stepUMTS();
  void stepGSM();
  void umtsStateChanged();
  void gsmStateChanged();
  void registrationChanged(bool wasRegistered);
  void changePhase(Access access);

  void sendUMTSServingCell();
  void sendUMTSState();
  void sendCiphering();
  void sendUMTSCells();
  void sendRanking();
  void sendChannels();
  void sendHighSpeed();
  void sendGSMServingCell();
  void sendGSMState();
  void sendGSMMeasurements();
  void sendBroadcast();
  void sendCall();
  void sendMobility();
  void sendServingNetwork();
  void sendEquivalentNetworks();

  Random _random;
  UTRANConnection _umts;
  UMTSChannels _channels;
  GSMConnection _gsm;
  MobilityManagement _mobility;
  std::chrono::milliseconds _phaseEnd;  // then the other technology is used
  bool _ranksGSM = false;               // whether the next ranking is that of GSM
};

}  // namespace varnel::simulation
