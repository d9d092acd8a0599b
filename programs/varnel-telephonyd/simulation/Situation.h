#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// The time and the place that a modem's packets report on.
struct Situation {
  std::chrono::milliseconds now;
  const Walk& walk;
  const Cell& serving;
};

}  // namespace varnel::simulation
