#pragma once

#include "programs/varnel-telephonyd/simulation/CDMA1xConnection.h"
#include "programs/varnel-telephonyd/simulation/CDMA1xPackets.h"
#include "programs/varnel-telephonyd/simulation/CellSelection.h"
#include "programs/varnel-telephonyd/simulation/PilotSet.h"

namespace varnel::simulation {

/// The 1x half of a CDMA phone on its walk.
class CDMA1xPhone {
 public:
  CDMA1xPhone(const Walk& walk, Random random);

  struct Changes {
    bool state = false, cell = false;
  };
  /// The phone has walked one step.
  Changes step(std::chrono::milliseconds now);

  const CDMA1xConnection& connection() const { return _connection; }

  CDMA1xStatus status();
  /// How the next frame of a call arrives. The weaker the whole active set is, the more frames are erased.
  Frame nextFrame();
  /// The system of the serving cell. Two thirds of the town belong to the home system.
  CDMASystem system() const;

 private:
  void chooseChannel();
  void updateActiveSet();

  const Walk& _walk;
  Random _random;
  CellSelection _selection;
  CDMA1xConnection _connection;
  PilotSet _activeSet;
  const int _commonChannel;  // where all phones are while they idle
  int _channel;
};

}  // namespace varnel::simulation
