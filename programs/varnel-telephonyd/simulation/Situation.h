#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// When and where a modem is: what its packets tell of.
struct Situation {
  std::chrono::milliseconds now;
  const Walk& walk;
  const Cell& serving;
};

}  // namespace varnel::simulation
