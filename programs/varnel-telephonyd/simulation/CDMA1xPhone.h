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
  /// The walk has gone a step.
  Changes step(std::chrono::milliseconds now);

  const CDMA1xConnection& connection() const { return _connection; }

  CDMA1xStatus status();
  /// How the next frame of a call arrives: the weaker the active set is in all, the more of them are erased.
  Frame nextFrame();
  /// The system of the serving cell; two thirds of the town are home.
  CDMASystem system() const;

 private:
  void chooseChannel();
  void updateActiveSet();

  const Walk& _walk;
  Random _random;
  CellSelection _selection;
  CDMA1xConnection _connection;
  PilotSet _activeSet;
  const int _commonChannel;  // where all phones idle
  int _channel;
};

}  // namespace varnel::simulation
