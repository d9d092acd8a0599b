#pragma once

#include "programs/varnel-telephonyd/simulation/UTRANConnection.h"
#include "programs/varnel-telephonyd/simulation/WalkingModem.h"

namespace varnel::simulation {

/// A UTRAN modem of the time-division mode. It reports the state of its connection when it changes, its
/// serving cell when it changes and every few seconds, and the cells around it. While it has channels, it
/// reports how well it receives them.
class UTRANModem final : public WalkingModem {
 public:
  explicit UTRANModem(std::uint64_t seed) : UTRANModem(Random(seed)) {}

  std::string_view technology() const override;

 private:
  enum class CellSet { Active, Monitored, Detected };  // numbered as in the packets

  explicit UTRANModem(Random random);

  void stepWalked() override;
  void servingCellChanged(const Cell& previous) override;

  void stateChanged();
  void sendState();
  void sendServingCell();
  void sendNeighbors();
  void sendGSMNeighbors();
  void sendChannels();
  std::int64_t signalToInterference_cdb();
  CellSet setOf(const Cell& cell) const;
  bool isHeard(const ReceivedCell& received) const;

  Random _random;
  UTRANConnection _connection;
};

}  // namespace varnel::simulation
