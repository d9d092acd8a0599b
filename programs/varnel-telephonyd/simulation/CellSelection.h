#pragma once

#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// Chooses the serving cell: a neighbour takes over once it has been clearly stronger for a while.
class CellSelection {
 public:
  /// Starts on the strongest cell of the technology.
  CellSelection(const Walk& walk, Access access);

  /// Looks at the levels, once a step of the walk; true when another cell serves from now on.
  bool update();

  /// Goes over to the strongest cell of a technology.
  void changeAccess(Access access);

  const Cell& servingCell() const { return *_serving; }

 private:
  const Walk& _walk;
  Access _access;
  const Cell* _serving;
  const Cell* _candidate = nullptr;
  int _stepsAhead = 0;  // for how long the candidate has been stronger
};

}  // namespace varnel::simulation
