#pragma once

#include "programs/varnel-telephonyd/simulation/CDMA1xPhone.h"
#include "programs/varnel-telephonyd/simulation/HRPDPhone.h"
#include "programs/varnel-telephonyd/simulation/ScheduledModem.h"

namespace varnel::simulation {

/// A CDMA modem with a 1x half for voice and an HRPD half for data. Each half reports its state when it
/// changes, and every second while it is awake. During a call the modem reports every frame of 20 ms. It
/// reports the amount of data every second, and the system of the phone every few seconds.
class CDMAModem final : public ScheduledModem {
 public:
  explicit CDMAModem(std::uint64_t seed) : CDMAModem(Random(seed)) {}

  std::string_view technology() const override;

 private:
  explicit CDMAModem(Random random);

  void step();
  void send1xStatus();
  void sendFrame();
  void sendSystem();
  void sendDataStatus();
  void sendPilots();
  void sendTraffic();

  Walk _walk;
  CDMA1xPhone _voice;
  HRPDPhone _data;
  std::uint32_t _second = 0;
};

}  // namespace varnel::simulation
