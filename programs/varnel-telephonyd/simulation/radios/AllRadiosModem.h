#pragma once

#include "programs/varnel-telephonyd/simulation/radios/QuietPhone.h"
#include "programs/varnel-telephonyd/simulation/radios/TravelingPhone.h"

namespace varnel::simulation {

/// The modem of a phone of today, with two SIM cards: the messages of two phones that go side by side. Each
/// message names its subscription.
class AllRadiosModem final : public SimulatedModem {
 public:
  explicit AllRadiosModem(std::uint64_t seed) : AllRadiosModem(Random(seed)) {}

  std::string_view technology() const override;
  SimulatedMessage next() override;

 private:
  explicit AllRadiosModem(Random random);

  Random _walk;  // of both phones
  TravelingPhone _first;
  QuietPhone _second;
  SimulatedMessage _nextOfFirst, _nextOfSecond;
};

}  // namespace varnel::simulation
