#pragma once

#include "programs/varnel-telephonyd/simulation/LTEMeasurement.h"
#include "programs/varnel-telephonyd/simulation/WalkingModem.h"

namespace varnel::simulation {

/// An LTE modem that idles and is connected in turn. It tells its serving cell when that changes and every
/// few seconds; while it idles, how strong the cells are and what it might reselect; while it is connected,
/// the cells of its own carrier.
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
  void sendNeighbours();
  bool sendNeighboursOn(int channel);
  void sendConnectedMeasurement();
  void sendReselectionCandidate(const Cell& serving, const Cell& candidate);
  void considerReselection();

  Random _random;
  Phase _phase = Phase::Idle;
  std::chrono::milliseconds _phaseEnd;
  std::int64_t _measurementRules = 0;
  std::size_t _nextCarrier = 0;    // on which neighbours are looked for
  std::size_t _nextCandidate = 0;  // of the technologies that are considered in turn
};

}  // namespace varnel::simulation
