#pragma once

#include <vector>

#include "programs/varnel-telephonyd/simulation/Cell.h"
#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// A town: a street that forms a ring, and the cells along it.
struct Town {
  std::int64_t streetLength_cm;
  std::vector<Cell> cells;

  /// Builds a town that depends on the source of randomness. There are several tracking areas, and LTE sites
  /// with carriers of several bands.
  static Town build(Random random);
};

}  // namespace varnel::simulation
