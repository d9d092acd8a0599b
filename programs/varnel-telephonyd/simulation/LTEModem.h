#pragma once

#include "programs/varnel-telephonyd/simulation/CellSelection.h"
#include "programs/varnel-telephonyd/simulation/PacketData.h"
#include "programs/varnel-telephonyd/simulation/ScheduledModem.h"
#include "programs/varnel-telephonyd/simulation/SimCard.h"
#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// An LTE modem that idles: it tells its serving cell when that changes and every few seconds, and the
/// telephony server adds the SIM card, the cells around and the packet-data contexts.
class LTEModem final : public ScheduledModem {
 public:
  explicit LTEModem(std::uint64_t seed) : LTEModem(Random(seed)) {}

  std::string_view technology() const override;

 private:
  explicit LTEModem(Random random);

  const Cell& servingCell() const { return _selection.servingCell(); }
  void walk();
  void sendServingCell();
  void sendAntennas();
  void sendSimFiles();
  void sendCellMonitor();
  void sendPacketDataContexts();

  Walk _walk;
  CellSelection _selection;
  SimCard _card;
  PacketData _packetData;
};

}  // namespace varnel::simulation
