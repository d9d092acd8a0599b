#pragma once

#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// Chooses the serving cell. A neighbor becomes the serving cell after it was clearly stronger for a while.
class CellSelection {
 public:
  /// Starts with the strongest cell of the technology.
  CellSelection(const Walk& walk, Access access);

  /// Compares the levels. Call it once per step of the walk. True when the serving cell has changed.
  bool update();

  /// Changes to the strongest cell of a technology.
  void changeAccess(Access access);

  const Cell& servingCell() const { return *_serving; }

 private:
  const Walk& _walk;
  Access _access;
  const Cell* _serving;
  const Cell* _candidate = nullptr;
  int _stepsAhead = 0;  // how long the candidate has been stronger
};

}  // namespace varnel::simulation
