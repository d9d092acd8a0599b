#include "programs/varnel-telephonyd/simulation/CellSelection.h"

namespace varnel::simulation {

namespace {
constexpr std::int64_t hysteresis_cdb = 3'00;
constexpr int reselectionTime_steps = 10;
}  // namespace

CellSelection::CellSelection(const Walk& walk, Access access)
    : _walk(walk), _access(access), _serving(walk.cells(access).front().cell) {}

bool CellSelection::update() {
  const ReceivedCell strongest = _walk.cells(_access).front();
  const bool isAhead = strongest.level_cdbm > _walk.level_cdbm(*_serving) + hysteresis_cdb;
  if (!isAhead || strongest.cell != _candidate) {
    _candidate = isAhead ? strongest.cell : nullptr;
    _stepsAhead = 0;
    return false;
  }
  if (++_stepsAhead < reselectionTime_steps) return false;
  _serving = _candidate;
  _candidate = nullptr;
  return true;
}

void CellSelection::changeAccess(Access access) {
  _access = access;
  _serving = _walk.cells(access).front().cell;
  _candidate = nullptr;
}

}  // namespace varnel::simulation
