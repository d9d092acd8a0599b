#pragma once

#include <chrono>
#include <cstdint>
#include <vector>

#include "programs/varnel-telephonyd/simulation/Cell.h"
#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/Town.h"

namespace varnel::simulation {

/// A cell and how strongly it is received, in hundredths of a decibel above one milliwatt.
struct ReceivedCell {
  const Cell* cell;
  std::int64_t level_cdbm;
};

/// Somebody who walks through the town with a phone, and what the phone receives on the way: levels fall with
/// the distance and behind the aerials, drift as houses pass by, and tremble.
class Walk {
 public:
  /// How long one step takes.
  static constexpr std::chrono::milliseconds stepTime{100};

  Walk(Town town, Random random);
  Walk(const Walk&) = delete;
  Walk& operator=(const Walk&) = delete;

  void step();

  /// The cells of a technology, the strongest first. Every technology has some.
  std::vector<ReceivedCell> cells(Access access) const;
  std::int64_t level_cdbm(const Cell& cell) const { return stateOf(cell).level_cdbm; }
  /// How far apart two cells are along the street.
  std::int64_t distance_cm(const Cell& one, const Cell& other) const;

 private:
  struct CellState {
    std::int64_t shadow_cdb = 0;  // of the houses between
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
  std::int64_t _speed_cm;  // a second
  std::vector<CellState> _states;
};

}  // namespace varnel::simulation
