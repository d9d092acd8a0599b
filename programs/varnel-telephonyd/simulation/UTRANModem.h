#pragma once

#include "programs/varnel-telephonyd/simulation/UTRANConnection.h"
#include "programs/varnel-telephonyd/simulation/WalkingModem.h"

namespace varnel::simulation {

/// A UTRAN modem of the time-division mode. It tells the state of its connection when that changes, its
/// serving cell when that changes and every few seconds, the cells around, and while it has channels how well
/// they are received.
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
  void sendNeighbours();
  void sendGSMNeighbours();
  void sendChannels();
  std::int64_t signalToInterference_cdb();
  CellSet setOf(const Cell& cell) const;
  bool isHeard(const ReceivedCell& received) const;

  Random _random;
  UTRANConnection _connection;
};

}  // namespace varnel::simulation
