#pragma once

#include "programs/varnel-telephonyd/simulation/CDMA1xPhone.h"
#include "programs/varnel-telephonyd/simulation/HRPDPhone.h"
#include "programs/varnel-telephonyd/simulation/ScheduledModem.h"

namespace varnel::simulation {

/// A CDMA modem with a 1x half for voice and an HRPD half for data. Both tell how they are when that changes
/// and every second as long as they are awake; of a call, every frame of 20 ms; of the data, every second how
/// much there has been; and every few seconds the system that the phone is in.
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
