#pragma once

#include "programs/varnel-telephonyd/simulation/LTEMeasurement.h"
#include "programs/varnel-telephonyd/simulation/WalkingModem.h"

namespace varnel::simulation {

/// An LTE modem that idles and is connected by turns. It reports its serving cell when it changes and every
/// few seconds. While it idles, it reports the levels of the cells and the candidates for reselection. While
/// it is connected, it reports the cells of its own carrier.
class LTEModem final : public WalkingModem {
 public:
  explicit LTEModem(std::uint64_t seed) : LTEModem(Random(seed)) {}

  std::string_view technology() const override;

 private:
  enum class Phase { Idle, Connected };

  explicit LTEModem(Random random);

  void stepWalked() override;
  void servingCellChanged(const Cell& previous) override;
  void repeatIn(Phase phase, Pace pace, void (LTEModem::*task)());

  void sendServingCell();
  void sendAntennas();
  void sendServingMeasurement();
  void sendNeighbors();
  bool sendNeighborsOn(int channel);
  void sendConnectedMeasurement();
  void sendReselectionCandidate(const Cell& serving, const Cell& candidate);
  void considerReselection();

  Random _random;
  Phase _phase = Phase::Idle;
  std::chrono::milliseconds _phaseEnd;
  std::int64_t _measurementRules = 0;
  std::size_t _nextCarrier = 0;    // the carrier for the next report of neighbors
  std::size_t _nextCandidate = 0;  // index of the technology for the next candidate
};

}  // namespace varnel::simulation
