#pragma once

#include <chrono>
#include <cstdint>
#include <vector>

#include "programs/varnel-telephonyd/simulation/Cell.h"
#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/Town.h"

namespace varnel::simulation {

/// A cell and its received level, in hundredths of a decibel above one milliwatt.
struct ReceivedCell {
  const Cell* cell;
  std::int64_t level_cdbm;
};

/// A person who walks through the town with a phone, and what the phone receives. Levels fall with the
/// distance and behind antennas, change slowly with the houses on the way, and also change quickly.
class Walk {
 public:
  /// The time per step.
  static constexpr std::chrono::milliseconds stepTime{100};

  Walk(Town town, Random random);
  Walk(const Walk&) = delete;
  Walk& operator=(const Walk&) = delete;

  void step();

  /// The cells of a technology, the strongest first. Every technology has some.
  std::vector<ReceivedCell> cells(Access access) const;
  std::int64_t level_cdbm(const Cell& cell) const { return stateOf(cell).level_cdbm; }
  /// The distance between two cells along the street.
  std::int64_t distance_cm(const Cell& one, const Cell& other) const;

 private:
  struct CellState {
    std::int64_t shadow_cdb = 0;  // of the houses between cell and phone
    std::int64_t level_cdbm = 0;
  };

  void walk();
  void measure(const Cell& cell, CellState& state);
  std::int64_t distanceUpTheStreet_cm(std::int64_t from_cm, std::int64_t to_cm) const;
  std::int64_t meanLevel_cdbm(const Cell& cell) const;
  const CellState& stateOf(const Cell& cell) const {
    return _states[static_cast<std::size_t>(&cell - _town.cells.data())];
  }

  const Town _town;
  Random _random;
  std::int64_t _position_cm;
  std::int64_t _speed_cm;  // per second
  std::vector<CellState> _states;
};

}  // namespace varnel::simulation
