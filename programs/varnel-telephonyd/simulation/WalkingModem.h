#pragma once

#include "programs/varnel-telephonyd/simulation/CellSelection.h"
#include "programs/varnel-telephonyd/simulation/PacketData.h"
#include "programs/varnel-telephonyd/simulation/ScheduledModem.h"
#include "programs/varnel-telephonyd/simulation/SimCard.h"
#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// A modem that somebody carries through the town. It also sends what the telephony server adds to every
/// modem's packets: the SIM card, the cells around, and the packet-data contexts.
class WalkingModem : public ScheduledModem {
 protected:
  /// Draws from the source what the world needs. The modem starts with this technology.
  WalkingModem(Random& random, Access access);

  /// What sets the phone of one subscription apart.
  struct Phone {
    Town (*town)(Random random);  ///< builds the town with the cells that the phone may use
    Network home;                 ///< of the SIM card
    std::uint8_t subscription;
    Access access;  ///< at the start
  };
  /// Phones that draw their walk from the same source go side by side, if their towns have as many cells.
  WalkingModem(Random walk, Random& random, const Phone& phone);

  const Walk& walk() const { return _walk; }
  const Cell& servingCell() const { return _selection.servingCell(); }

  /// The strongest cell of this technology becomes the serving cell.
  void changeAccess(Access access);

  /// A step was walked. The serving cell may have changed.
  virtual void stepWalked() = 0;
  /// The serving cell has changed.
  virtual void servingCellChanged(const Cell& previous) = 0;

 private:
  void startTasks();
  void step();
  void cellChanged(const Cell& previous);
  void sendSimFiles();
  void sendCellMonitor();
  void sendPacketDataContexts();

  Walk _walk;
  CellSelection _selection;
  SimCard _card;
  PacketData _packetData;
};

}  // namespace varnel::simulation
